# SPDX-License-Identifier: MIT
"""What tshark with Kestro's dissector says of a capture, against what `kestro-cli explain` says."""

import re
import xml.etree.ElementTree

PAST_END = " (past the end)"


def packets(stream):
    """Yields the dissector's protocol element of every packet; None for one without."""
    for _, element in xml.etree.ElementTree.iterparse(stream):
        if element.tag == "packet":
            yield next(
                (proto for proto in element if proto.get("name").startswith("kestro.")), None
            )
            element.clear()


def part(text):
    """A part of a field's name."""
    return re.sub("[^a-z0-9]+", "_", text.lower())


class Kinds:
    """How values are shown ("hidden", "named"), by what `codes --format=json` says."""

    def __init__(self, technology):
        self._known = {}
        for code in technology["codes"]:
            for readings in code["takers"]:
                for reading in readings:
                    for value in reading["parts"]:
                        self._add(code["code"], value)

    def _add(self, code, value):
        section = value["section"]
        if value["part"] == "value":
            self._known[code, section, value["key"]] = value["shown"]["kind"]
            return
        self._known[code, section, "count"] = "hidden"
        for field in value["fields"]:
            self._known[code, section, field["key"]] = field["shown"]["kind"]

    def of(self, code, value):
        return self._known[code, value["section"], value["key"]]


class Comparison:
    """Of one technology, whose fields are called by `word`."""

    def __init__(self, word, technology):
        self.word = word
        self.kinds = Kinds(technology)
        self.values = 0  # that were compared

    def faults(self, proto, message):
        """Yields what differs between the tree and the explained message."""
        if "code" not in message:  # too short for a header
            yield from self._remark_faults(proto, message)
            return
        code = message["code"]
        if not code.startswith("0xFF"):
            yield from self._remark_faults(proto, message)
        title = "Log code: " + code + (" " + message["name"] if "name" in message else "")
        field = f"kestro.{self.word}.header.log_code"
        if [item.get("showname") for item in proto.iter("field") if item.get("name") == field] != [title]:
            yield f"the header lacks {title!r}"
        sections = {item.get("showname"): item for item in proto if not item.get("name").startswith("kestro.")}
        for name, values in self._shown(message).items():
            if name not in sections:
                yield f"no section {name!r}"
                continue
            yield from self._section_faults(sections.pop(name), values, message)
        surplus = set(sections) - {"Header", "Property list, XML", "Property list, binary"}
        if surplus:
            yield f"surplus sections {surplus}"

    def _remark_faults(self, proto, message):
        field = f"kestro.{self.word}.header.remark"
        found = [item.get("show") for item in proto if item.get("name") == field]
        expected = [message["remark"]] if "remark" in message else []
        if found != expected:
            yield f"remark {found}, not {expected}"

    def _shown(self, message):
        """The values that have items, by section."""
        sections = {}
        for value in message["values"]:
            is_place = value["sources"] and "offset" in value["sources"][0]
            is_hidden = is_place and self.kinds.of(message["code"], value) == "hidden"
            if is_place and ("text" in value or is_hidden):
                sections.setdefault(value["section"], []).append(value)
        return sections

    def _section_faults(self, section, values, message):
        """The items of the section, and of the records in it, one after the other."""
        items = []
        for item in section:
            if item.get("name").startswith("kestro."):
                items.append((section, None, item))
            else:
                items += [(item, item.get("showname"), inner) for inner in item]
        if len(items) != len(values):
            yield f"{section.get('showname')}: {len(items)} items, not {len(values)}"
            return
        for (parent, record, item), value in zip(items, values):
            self.values += 1
            expected = f"{value['list']} {value['row']}" if "row" in value else None
            if record != expected:
                yield f"record {record}, not {expected}"
            for fault in self._value_faults(parent, item, value, message):
                yield f"{value['section']}: {value['key']}: {fault}"

    def _value_faults(self, parent, item, value, message):
        sources = value["sources"]
        mark = PAST_END if any(source["pastEnd"] for source in sources) else ""
        text = value.get("text", str(sources[0]["raw"]))
        joined = ", ".join(text) if isinstance(text, list) else text
        if item.get("showname") != f"{value['key']}: {joined}{mark}":
            yield f"shown is {item.get('showname')!r}, not {joined + mark!r}"
        name = f"kestro.{self.word}.{part(value['section'])}.{part(value['key'])}"
        if item.get("name") not in (name, name + ".text"):
            yield f"the name is {item.get('name')}, not {name}"
        elif item.get("name") == name:
            kind = self.kinds.of(message["code"], value)
            yield from number_faults(item, kind, joined, sources[0]["raw"])
        elif NUMBER.match(joined):
            yield f"{joined!r} is no number of its field"
        yield from place_faults(parent, item, sources, message)


NUMBER = re.compile(r"(\(ref pilot\) )?([-+]?(\d+(\.\d+)?|inf))($|[ ,])")


def number_faults(item, kind, text, raw):
    """The field's own value: the number that the text begins with, or the one that has a name."""
    show = item.get("show")
    if kind in ("named", "hidden"):
        if show not in (text, str(raw)):
            yield f"the number is {show}, not {raw}"
    elif text.startswith("0x"):
        if int(text, 16) != int(show):
            yield f"the number is {show}, the text {text!r}"
    elif show != text:
        decimal = NUMBER.match(text)
        shown = float(decimal[2])
        digits = len(decimal[4] or ".") - 1
        if not (shown == float(show) or abs(float(show) - shown) <= 0.5001 * 10**-digits):
            yield f"the number is {show}, the text {text!r}"


def extent(places, message):
    """The first byte, from the message's, and the number of bytes from it to the last there is."""
    begin = min(first for first, _ in places)
    end = max(last for _, last in places)
    length, prefix = message["length"], message.get("prefixLength", 0)
    return min(begin, length) + prefix, min(end, length) - min(begin, length)


def bounds_faults(outer, item, expected):
    """`outer` is where the item around this one begins: tshark adds that to an item before it."""
    position = expected[0] if expected[0] >= outer else expected[0] + outer
    found = (int(item.get("pos")), int(item.get("size")))
    if found != (position, expected[1]):
        yield f"bytes {found}, not {(position, expected[1])}"


def bytes_of(source, message):
    """Where the place begins, and where it ends as far as there are bytes."""
    if source["pastEnd"]:
        return source["offset"], max(source["offset"], message["length"])
    return source["offset"], source["offset"] + len(source["bytes"]) // 2


def place_faults(parent, item, sources, message):
    places = [bytes_of(source, message) for source in sources]
    whole = extent(places, message)
    yield from bounds_faults(int(parent.get("pos")), item, whole)
    if len(sources) == 1 and item.get("size") != "0" and item.get("value") != sources[0]["bytes"]:
        yield f"holds {item.get('value')}, not {sources[0]['bytes']}"
    if len(item) != len(sources) - 1:
        yield f"{len(item)} further places, not {len(sources) - 1}"
        return
    for number, (inner, source, place) in enumerate(zip(item, sources[1:], places[1:]), 2):
        label = f"Place {number}: {source['raw']}" + (PAST_END if source["pastEnd"] else "")
        if inner.get("showname") != label:
            yield f"{inner.get('showname')!r}, not {label!r}"
        yield from bounds_faults(whole[0], inner, extent([place], message))
