# SPDX-License-Identifier: MIT
"""The wall clock jumps, back and forth by hours."""

import datetime
import mmap
import pathlib
import struct
import time

from promises import Impossible, require, spread, wait_until
from world import World

JUMPS = (3 * 3600, -5 * 3600, 24 * 3600, -48 * 3600, 1, -1, 0)
INTERVAL = 0.01
# How far a tick may be from its time on a busy machine.
LATENESS = 1.5


class WallClock:
    """The wall clock of the programs that are preloaded with it."""

    def __init__(self, library, folder):
        path = folder / "clock-offset"
        path.write_bytes(bytes(8))
        with open(path, "r+b") as file:
            self._bytes = mmap.mmap(file.fileno(), 8)
        self.preload = {"LD_PRELOAD": str(library), "KESTRO_CLOCK_OFFSET_FILE": str(path)}
        self.offset = 0

    def jump(self, seconds):
        """Sets it so many seconds off the machine's."""
        self.offset = seconds
        self._bytes[:] = struct.pack("<q", seconds)

    def now(self):
        return time.time() + self.offset


def seconds_of(line):
    moment = datetime.datetime.strptime(line["time"], "%Y-%m-%dT%H:%M:%S.%fZ")
    return moment.replace(tzinfo=datetime.timezone.utc).timestamp()


def clock_jumps(options):
    """the wall clock is set"""
    library = pathlib.Path(options.programs) / "libkestro-clock-offset.so"
    if not library.exists():
        raise Impossible(f"{library} is not there")
    with World(options.programs) as world:
        clock = WallClock(library, world.folder)
        world.write_source(1, 30_000, INTERVAL)
        world.environment.update(clock.preload)
        world.start_server()
        recorder, watch = world.record("recorder"), world.watch()
        recorder.recording.keeps_times = True
        wait_until(lambda: recorder.has(1) and len(watch.lines()) >= 1, "clients connect")
        ticks, offsets = [], []

        def next_tick():
            seen = len(watch.lines())
            wait_until(lambda: len(watch.lines()) > seen, "the display is refreshed", 10)
            ticks.append(time.monotonic())
            off = abs(seconds_of(watch.lines()[-1]) - clock.now())
            require(off < 1, f"a display has the time of its refresh, not {off:.1f} s off")

        next_tick()
        paces = []
        for jump in JUMPS[: options.jumps]:
            clock.jump(jump)
            start, serial = time.monotonic(), recorder.read().last_of(1)
            next_tick()
            passed = (recorder.read().last_of(1) - serial) * INTERVAL
            paces.append(passed - (time.monotonic() - start))
            offsets.append(recorder.recording.times[-1] - clock.now())
        periods = [after - before for before, after in zip(ticks, ticks[1:])]
        lateness = max(abs(period - 2) for period in periods)
        require(lateness < LATENESS, f"a tick every 2 s: {periods}")
        require(max(map(abs, offsets)) < 1, f"a message has the time of its arrival: {offsets}")
        require(len(recorder.recording.stretches) == 1, "nothing is missing")
        require(min(paces) > -2, f"the drive goes on: {paces}")
        require(max(paces) < 11, f"a jump moves the drive by 10 s at most: {paces}")
        return (
            f"{len(paces)} times by up to 48 hours: ticks after {spread(periods)}, times right, "
            f"{recorder.recording.count} messages without a gap; the drive at most "
            f"{max(paces):.1f} s ahead"
        )
