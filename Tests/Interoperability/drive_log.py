# SPDX-License-Identifier: MIT
"""Drive-test logs, read with nothing but Documentation/recordings.md, against what `decode` shows of
them, row for row. By hand: drive_log.py LOG [RECORDING OF IT]; the program is $KESTRO_CLI."""

import csv
import datetime
import json
import os
import subprocess
import sys

LTE, UMTS, GSM = "LTE", "UMTS", "GSM"
FAMILY = {
    "LTE": LTE, "LTE_CA": LTE, "5G": LTE,
    "UMTS": UMTS, "HSDPA": UMTS, "HSUPA": UMTS, "HSPA": UMTS, "HSPA+": UMTS, "DC-HSPA": UMTS,
    "GSM": GSM, "GPRS": GSM, "EDGE": GSM,
}
TECHNOLOGY = {LTE: "LTE", UMTS: "Ondrel_GSM", GSM: "Ondrel_GSM"}


def rows_of(path):
    """Each row as (microseconds since 1970, family, values); "-" keeps the family's last value."""
    with open(path, newline="", encoding="utf-8") as file:
        rows = list(csv.DictReader(file))
    last = {LTE: {}, UMTS: {}, GSM: {}}
    mode = None
    found = []
    for row in rows:
        mode = row["NetworkMode"] if row["NetworkMode"] != "-" else mode
        values = last[FAMILY[mode]]
        values.update({name: text for name, text in row.items() if text not in ("-", "")})
        time = datetime.datetime.strptime(row["Timestamp"], "%Y.%m.%d_%H.%M.%S")
        second = int(time.replace(tzinfo=datetime.timezone.utc).timestamp())
        found.append((second, FAMILY[mode], dict(values)))
    begin = 0
    while begin < len(found):  # the rows of one second are spread evenly over it
        end = begin
        while end < len(found) and found[end][0] == found[begin][0]:
            end += 1
        for i in range(begin, end):
            second, *rest = found[i]
            yield (second * 1_000_000 + (i - begin) * 1_000_000 // (end - begin), *rest)
        begin = end


def refreshes(path, *options):
    """What `decode` shows after every message: (microseconds, technology, display)."""
    command = [os.environ["KESTRO_CLI"], "decode", path, "--format=ndjson", "--refresh-every=0",
               *options]
    with subprocess.Popen(command, stdout=subprocess.PIPE, text=True) as process:
        for line in process.stdout:
            shown = json.loads(line)
            time = datetime.datetime.strptime(shown["time"], "%Y-%m-%dT%H:%M:%S.%fZ")
            time = time.replace(tzinfo=datetime.timezone.utc)
            microseconds = round(time.timestamp() * 1_000_000)
            yield microseconds, shown.get("technology"), shown["display"]


def number(text):
    """The number in front of a unit; None where nothing is shown."""
    return None if text is None else float(text.split()[0])


def shown_values(family, display):
    """What a display of packets has of a row."""
    if family == LTE:
        cell = display["Serving Cell"]
        info, measured = cell["Serving Cell Info"], cell["Serving Cell Measurements"]
        return {
            "RSRP": number(measured.get("Measured RSRP")),
            "RSRQ": number(measured.get("Measured RSRQ")),
            "RSSI": number(measured.get("Measured RSSI")),
            "cell": number(info.get("Cell Identity")),
            "area": number(info.get("Tracking Area Code")),
        }
    area = number(display["Network"]["Serving PLMN"].get("Location Area Code"))
    if family == UMTS:
        active = display["UMTS Cells"]["Active Set"][0]
        return {
            "RSRP": number(active["RSCP"]),
            "RSRQ": number(active["Energy Per Chip"]),
            "cell": number(active["Scrambling Code"]),
            "area": area,
        }
    cell = display["GSM Cells"]["GSM Serving Cell"]
    level = display["GSM Link"]["GSM RR Info"]["Serving Rx Level"]
    return {"level": number(level), "cell": number(cell.get("Cell ID")), "area": area}


def expected_values(family, values):
    area = float(int(values["LACHEX"], 16))
    if family == LTE:
        names = [name for name in ("RSRP", "RSRQ", "RSSI") if name in values]
        measured = {name: float(values[name]) for name in names}
        return {**measured, "cell": float(values["RAWCELLID"]), "area": area}
    if family == UMTS:
        return {"RSRP": float(values["RSRP"]), "RSRQ": float(values["RSRQ"]),
                "cell": float(int(values["RAWCELLID"]) % 512), "area": area}
    level = min(max(float(values["RSRP"]) + 110, 0), 63)
    return {"level": level, "cell": float(int(values["CELLHEX"], 16)), "area": area}


IFX_LEVEL = {LTE: ("RSRP", "RSRQ"), UMTS: ("RSCP", "Ec/N0"), GSM: ("RxLev", None)}


def shown_texts(family, display):
    level, quality = IFX_LEVEL[family]
    radio = display["Radio Quality"]
    texts = {"RSRP": radio.get(level), "mode": display["Mode"].get("Network Mode")}
    if quality is not None:
        texts["RSRQ"] = radio.get(quality)
    return texts


def expected_texts(family, values):
    texts = {"RSRP": values["RSRP"] + " dBm", "mode": values["NetworkMode"]}
    if IFX_LEVEL[family][1] is not None and "RSRQ" in values:
        texts["RSRQ"] = values["RSRQ"] + " dB"
    return texts


def compare(log, recording, is_ifx=False, options=()):
    """How many rows there are, and what is shown otherwise than the log has it."""
    shown = refreshes(recording, *options)
    following = next(shown, None)
    count = 0
    faults = []
    for time, family, values in rows_of(log):
        count += 1
        last = None
        while following is not None and following[0] == time:
            last = following
            following = next(shown, None)
        if last is None:
            faults.append((count, "nothing is shown of it at its time"))
            continue
        found = (shown_texts if is_ifx else shown_values)(family, last[2])
        expected = (expected_texts if is_ifx else expected_values)(family, values)
        if not is_ifx and last[1] not in (None, TECHNOLOGY[family]):
            faults.append((count, last[1]))
        differing = {name for name in expected if found.get(name) != expected[name]}
        if differing:
            faults.append((count, {name: (expected[name], found.get(name)) for name in differing}))
    if following is not None:
        faults.append((count, "more is shown than the log has"))
    return count, faults


def main():
    log, recording = sys.argv[1], sys.argv[-1]
    runs = [(recording, False, ())]
    if recording == log:
        runs.append((log, True, ("--technology=IFX",)))
    for path, is_ifx, options in runs:
        count, faults = compare(log, path, is_ifx, options)
        print(f"{path} {' '.join(options)}: {count} rows, {len(faults)} differ", *faults[:5], sep="\n  ")


if __name__ == "__main__":
    main()
