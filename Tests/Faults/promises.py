# SPDX-License-Identifier: MIT
"""What must hold, how long anybody waits for it, and the figures that show it."""

import statistics
import threading
import time

# The model looks every 2 s and tries again every 5 s; on a busy machine it may take longer, but
# whoever takes longer than this waits for ever.
PATIENCE = 30.0
MEBIBYTE = 1024 * 1024


class BrokenPromise(Exception):
    pass


class Cancelled(Exception):
    """Something else has failed, or somebody wants no more of it."""


class Impossible(Exception):
    """This machine does not let the fault be made."""


CANCELLED = threading.Event()


def pause(seconds):
    if CANCELLED.wait(seconds):
        raise Cancelled


def require(holds, promise):
    if not holds:
        raise BrokenPromise(promise)


def wait_until(condition, promise, patience=PATIENCE, interval=0.02):
    """Waits until the condition holds; the seconds that it took."""
    start = time.monotonic()
    while not condition():
        require(time.monotonic() - start < patience, f"{promise} within {patience:.0f} s")
        pause(interval)
    return time.monotonic() - start


def waits_of_all(conditions, promise, patience=PATIENCE):
    """Waits until all conditions hold; the seconds that each took, from now on."""
    start = time.monotonic()
    seconds = [None] * len(conditions)

    def look():
        for index, condition in enumerate(conditions):
            if seconds[index] is None and condition():
                seconds[index] = time.monotonic() - start
        return None not in seconds

    wait_until(look, promise, patience)
    return seconds


def spread(seconds):
    """Minimum, median and maximum of some durations."""
    if not seconds:
        return "-"
    figures = (min(seconds), statistics.median(seconds), max(seconds))
    return "{:.2f} / {:.2f} / {:.2f} s".format(*figures)


class Use:
    """What processes hold of the machine: memory and descriptors at the first look and the last."""

    def __init__(self):
        self.first = {}
        self.last = {}

    def look(self, *processes):
        for process in processes:
            held = (process.memory(), process.descriptors())
            self.first.setdefault(process.name, held)
            self.last[process.name] = held

    def check(self, growth=3 * MEBIBYTE):
        for name, (memory, descriptors) in self.first.items():
            require(self.last[name][0] <= memory + growth, f"the memory of {name} stays flat")
            require(self.last[name][1] <= descriptors, f"the descriptors of {name} stay as many")

    def __str__(self):
        def most(held, index):
            return max((values[index] for values in held.values()), default=0)

        memory = [most(held, 0) / MEBIBYTE for held in (self.first, self.last)]
        descriptors = [most(held, 1) for held in (self.first, self.last)]
        return "{:.1f} then {:.1f} MiB, {} then {} descriptors".format(*memory, *descriptors)


def in_lanes(lanes, rounds, body):
    """Runs `body(rounds)` in so many threads at once, which share the rounds; the results. The
    first failure ends all of them."""
    shares = [rounds // lanes + (lane < rounds % lanes) for lane in range(lanes)]
    results, failures = [], []

    def run(share):
        try:
            results.append(body(share))
        except Exception as failure:  # raised below, in the thread that waits
            failures.append(failure)
            CANCELLED.set()

    threads = [threading.Thread(target=run, args=[share]) for share in shares if share]
    for thread in threads:
        thread.start()
    try:
        for thread in threads:
            thread.join()
    except KeyboardInterrupt:
        CANCELLED.set()
        raise
    if failures:
        raise failures[0]
    return results
