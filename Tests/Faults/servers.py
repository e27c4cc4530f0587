# SPDX-License-Identifier: MIT
"""The server dies, and the server stands still, in the middle of the stream."""

import random
import time

from promises import Use, in_lanes, pause, require, spread, wait_until, waits_of_all
from world import World

# A client connects within its next look (2 s), or 5 s after an attempt that failed; the rest is
# what a busy machine adds.
LONGEST_RECONNECTION = 20.0
INTERVAL = 0.01
# What two clients of one server may differ by when it dies between its writes to them.
LONGEST_TURN = 0.25


def server_killed(options):
    """the server is killed and started again"""

    def one_round(world, server, clients, life, is_odd):
        recorders, watch = clients[:2], clients[2]
        pause(random.uniform(0.05, 0.5))
        if is_odd:  # what a client has not read yet when the server dies is not lost either
            recorders[1].stop()
            pause(2 * LONGEST_TURN)
        server.kill()
        world.forget(server)
        pause(random.choice([0, random.uniform(0, 3)]))
        if is_odd:
            recorders[1].go_on()
        world.write_source(life + 1, 4000, INTERVAL)
        server = world.start_server()
        waits = waits_of_all(
            [lambda it=it: it.has(life + 1) for it in recorders], "a client is connected again"
        )
        wait_until(lambda: watch.life() == life + 1, "the display goes on")
        check_life(recorders, life)
        return server, waits

    def check_life(recorders, life):
        tails = [recorder.recording.last_of(life) for recorder in recorders]
        require(
            abs(tails[0] - tails[1]) <= LONGEST_TURN / INTERVAL,
            f"everything that had arrived is recorded (up to {tails[0]}, {tails[1]})",
        )
        for recorder in recorders:
            require(recorder.recording.stretches_of(life) == 1, "nothing is missing in between")

    def lane(rounds):
        with World(options.programs) as world:
            world.write_source(1, 4000, INTERVAL)
            server = world.start_server()
            clients = [world.record("recorder-1"), world.record("recorder-2"), world.watch()]
            for recorder in clients[:2]:
                wait_until(lambda it=recorder: it.has(1), "a client connects")
            waits, use = [], Use()
            for number in range(rounds):
                server, more = one_round(world, server, clients, number + 1, number % 2 == 1)
                waits += more
                use.look(*clients)
            use.check()
            return waits, finish(clients), use

    def finish(clients):
        """Ends the clients; how many messages they recorded."""
        for client in clients:
            status = client.end()
            require(status == (0 if client is clients[2] else 3), f"a client ends as asked ({status})")
        for recorder in clients[:2]:
            count = recorder.read().count
            require(recorder.recording.unread_bytes == 0, "a recording ends with a whole message")
            said = recorder.errors()
            require(f"recorded {count} messages" in said, f"the count is true ({count}: {said})")
            require("lost the connection" in said, "a recording tells of lost connections")
        return sum(recorder.recording.count for recorder in clients[:2])

    results = in_lanes(options.lanes, options.rounds, lane)
    waits = [wait for result in results for wait in result[0]]
    require(max(waits) <= LONGEST_RECONNECTION, "nobody waits longer than its attempts are apart")
    count = sum(result[1] for result in results)
    return (
        f"{len(waits) // 2} times; {count} messages recorded, each once and in order; "
        f"connected again after {spread(waits)}; clients {results[0][2]}"
    )


def server_stopped(options):
    """the server stands still and goes on"""
    interval = 0.02

    def one_round(world, server, steady, number):
        server.stop()
        visitor = world.record(f"visitor-{number}")
        pause(random.uniform(0.2, 2.5))
        if number % 4 == 3:  # one that has to wait can be ended meanwhile
            start = time.monotonic()
            status = visitor.end("a client of a server that stands still ends")
            ended = time.monotonic() - start
            require(status == 1, "a client that recorded nothing says so")
            server.go_on()
            waited = None
        else:
            server.go_on()
            waited = wait_until(lambda: visitor.has(1), "who comes meanwhile is served")
            require(visitor.end() == 0, "a client ends as asked")
            require(len(visitor.read().stretches) == 1, "who comes meanwhile misses nothing then")
            ended = None
        world.forget(visitor)
        before = steady.read().count
        wait_until(lambda: steady.read().count > before, "the stream goes on")
        require(len(steady.recording.stretches) == 1, "a client keeps its channel")
        return waited, ended

    def lane(rounds):
        with World(options.programs) as world:
            world.write_source(1, round((rounds * 14 + 20) / interval), interval)
            server = world.start_server()
            steady = world.record("steady")
            wait_until(lambda: steady.has(1), "a client connects")
            use, outcomes = Use(), []
            for number in range(rounds):
                outcomes.append(one_round(world, server, steady, number))
                if number > 0:
                    wait_until(
                        lambda: server.descriptors() <= use.first["server"][1],
                        "the server forgets who has gone",
                    )
                use.look(server, steady)
            use.check()
            require(steady.end() == 0, "a client ends as asked")
            return outcomes, steady.read().count, use

    results = in_lanes(options.lanes, options.rounds, lane)
    outcomes = [outcome for result in results for outcome in result[0]]
    served = [waited for waited, _ in outcomes if waited is not None]
    ended = [seconds for _, seconds in outcomes if seconds is not None]
    require(max(served) <= LONGEST_RECONNECTION, "nobody waits longer than its attempts are apart")
    count = sum(result[1] for result in results)
    return (
        f"{len(outcomes)} times; {count} messages recorded without a gap; who came meanwhile was "
        f"served after {spread(served)}, or ended as asked after {spread(ended)}; "
        f"server and client {results[0][2]}"
    )
