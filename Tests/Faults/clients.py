# SPDX-License-Identifier: MIT
"""Clients die, stand still and come in crowds."""

import resource
import signal
import time

from promises import MEBIBYTE, Use, in_lanes, pause, require, spread, wait_until, waits_of_all
from world import World

# What a queue of 4 MiB takes while it grows, what all queues may hold together and each of many,
# what the allocator may keep of each, and what memory may vary by besides.
LONGEST_QUEUE = 8 * MEBIBYTE
ALL_QUEUES = 64 * MEBIBYTE
CROWDED_QUEUE = MEBIBYTE // 4
KEPT_FOR_CLIENT = MEBIBYTE // 16
SLACK = 4 * MEBIBYTE
# The interval and the filling of messages that fill such a queue in 3 s.
FULL_IN_3_SECONDS = (0.01, 16_000)
# What a session lets a program open, unless it asks for more.
USUAL_LIMIT = 1024


def read_for(steady, seconds):
    """Goes on reading what is recorded, so that the recorder need not wait."""
    end = time.monotonic() + seconds
    while time.monotonic() < end:
        steady.read()
        pause(0.02)


def kill(_server, _steady, client):
    client.kill()


def stop_and_kill(_server, steady, client):
    client.stop()
    read_for(steady, 1)
    client.kill()


def stop_shortly(_server, steady, client):
    client.stop()
    read_for(steady, 0.3)
    client.go_on()
    count = client.recording.count
    wait_until(lambda: steady.read() and client.read().count > count, "the stream goes on")
    require(len(client.recording.stretches) == 1, "who stops for a moment misses nothing")


def stop_long(server, steady, client):
    """Until its channel is closed; the most memory that the server used for it."""
    held, memory = server.descriptors(), []
    client.stop()

    def is_left_behind():
        steady.read()
        memory.append(server.memory())
        return server.descriptors() < held

    wait_until(is_left_behind, "who does not read is left behind")
    client.go_on()
    life = client.read().stretches[0][0]
    wait_until(
        lambda: steady.read() and client.read().stretches_of(life) == 2,
        "who was left behind connects again",
    )
    check_loss(steady, client)
    return max(memory)


def check_loss(steady, client):
    """Ends a client that lost its channel once; it must tell how many messages that cost."""
    client.signal(signal.SIGTERM)

    def has_ended():
        steady.read()
        client.read()
        return not client.is_running()

    wait_until(has_ended, "a client ends as asked")
    require(client.wait("a client ends") == 3, "a client that missed messages says so")
    before, after = client.read().stretches
    missed = after[1] - before[2] - 1
    said = client.errors()
    require(f", and {missed} messages" in said, f"what is missing is told ({missed}: {said})")


KINDS = [kill, stop_shortly, stop_and_kill, stop_long] + [kill, stop_shortly] * 2 + [kill] * 2


def lose_client(world, server, steady, number):
    """One client comes and fails; how long it took to connect, and the server's memory."""
    held = server.descriptors()
    client = world.record(f"client-{number}", pipe=True)
    waited = wait_until(lambda: steady.read() and client.has(1), "a client connects")
    memory = KINDS[number % len(KINDS)](server, steady, client) or server.memory()
    world.forget(client)
    wait_until(
        lambda: steady.read() and server.descriptors() <= held, "the server forgets who has gone"
    )
    require(len(steady.recording.stretches) == 1, "nobody else misses anything")
    return waited, memory


def clients_killed(options):
    """clients are killed, or stopped until they lose their channel"""

    def lane(rounds):
        with World(options.programs) as world:
            server = world.start_fed_server(*FULL_IN_3_SECONDS)
            steady = world.record("steady", pipe=True)
            wait_until(lambda: steady.has(1), "a client connects")
            use, outcomes = Use(), []
            for number in range(rounds):
                use.look(server, steady)
                outcomes.append(lose_client(world, server, steady, number))
            read_for(steady, 0.5)
            use.look(server, steady)
            use.check(SLACK)
            return outcomes, steady.read().count, use

    results = in_lanes(max(1, options.lanes // 3), options.rounds, lane)
    outcomes, counts, uses = zip(*results)
    waits, memories = zip(*sum(outcomes, []))
    first = max(use.first["server"][0] for use in uses)
    require(
        max(memories) <= first + 2 * LONGEST_QUEUE + SLACK,
        "no more waits for a client than its queue holds",
    )
    return (
        f"{len(waits)} times; {sum(counts)} messages recorded by the others without a gap; "
        f"connected after {spread(waits)}; server and client {uses[0]}, "
        f"the server at most {max(memories) / MEBIBYTE:.1f} MiB"
    )


def clients_stopped(options):
    """many clients stop reading at the same time"""
    count = max(24, options.crowd // 5)
    with World(options.programs) as world:
        server = world.start_fed_server(*FULL_IN_3_SECONDS)
        steady = world.record("steady")
        wait_until(lambda: steady.has(1), "a client connects")
        memory, held = [server.memory()], server.descriptors()
        clients = [world.record(f"client-{number}") for number in range(count)]
        for client in clients:
            wait_until(lambda it=client: it.has(1), "a client connects")
            client.stop()

        def are_left_behind():
            memory.append(server.memory())
            return server.descriptors() <= held + count  # they stay registered for notifications

        waited = wait_until(are_left_behind, "who does not read is left behind")
        recorded = steady.read().count
        wait_until(lambda: steady.read().count > recorded, "the stream goes on")
        require(len(steady.recording.stretches) == 1, "nobody else misses anything")
        allowed = 2 * (ALL_QUEUES + count * CROWDED_QUEUE) + SLACK
        require(max(memory) <= memory[0] + allowed, "all queues together are bounded")
        kept = SLACK + count * KEPT_FOR_CLIENT
        wait_until(lambda: server.memory() <= memory[0] + kept, "what they held up is free")
        figures = (value / MEBIBYTE for value in (memory[0], max(memory), server.memory()))
        return (
            f"{count} clients, left behind after {waited:.1f} s; server "
            "{:.1f}, at most {:.1f}, then {:.1f} MiB".format(*figures)
        )


def crowd(options):
    """many clients at one server"""
    interval = 0.02
    limits = (USUAL_LIMIT, resource.getrlimit(resource.RLIMIT_NOFILE)[1])
    with World(options.programs) as world:
        world.write_source(1, round(240 / interval), interval)
        server = world.start_server(limits=limits)
        uses = [(server.memory() / MEBIBYTE, server.descriptors())]
        clients = [world.record(f"client-{number}") for number in range(options.crowd)]
        conditions = [lambda it=it: it.has(1) for it in clients]
        waits = waits_of_all(conditions, "everybody is served", 120)
        goal = max(it.recording.last_of(1) for it in clients) + options.crowd_seconds / interval
        start, cpu = time.monotonic(), server.cpu_seconds()
        waits_of_all([lambda it=it: it.has(1, goal) for it in clients], "everybody goes on", 120)
        share = (server.cpu_seconds() - cpu) / (time.monotonic() - start)
        for client in clients:
            require(len(client.recording.stretches) == 1, "nobody misses a message")
        uses.append((server.memory() / MEBIBYTE, server.descriptors()))
        memory = max(client.memory() for client in clients) / MEBIBYTE
        for client in clients:
            client.end()
        wait_until(
            lambda: server.descriptors() <= uses[0][1], "the server forgets who has gone"
        )
        uses.append((server.memory() / MEBIBYTE, server.descriptors()))
        count = sum(client.read().count for client in clients)
        held = "{:.1f} MiB and {} descriptors, then {:.1f} and {}, then {:.1f} and {}"
        return (
            f"{len(clients)} clients, connected after {spread(waits)}; {count} messages without a "
            f"gap; server {held.format(*sum(uses, ()))}, {share:.0%} of a processor; "
            f"a client at most {memory:.1f} MiB"
        )


def descriptors_exhausted(options):
    """a server without descriptors for all its clients"""
    interval, limit, surplus = 0.02, 64, 30
    with World(options.programs) as world:
        world.write_source(1, round(120 / interval), interval)
        server = world.start_server(limits=(limit, limit))
        first = world.record("first")
        wait_until(lambda: first.has(1), "a client connects")
        clients = [world.record(f"client-{number}") for number in range(surplus)]
        pause(options.exhausted_seconds)
        cpu = server.cpu_seconds()
        pause(options.exhausted_seconds)
        share = (server.cpu_seconds() - cpu) / options.exhausted_seconds
        require(server.is_running(), "the server stays")
        require(share < 0.5, f"the server does not spin ({share:.0%} of a processor)")
        served = [client for client in clients if client.read().count > 0]
        refused = [client for client in clients if client.recording.count == 0]
        require(served and refused, "some are served, some are not")
        for client in [first, *served]:
            count = client.recording.count
            wait_until(lambda it=client, n=count: it.read().count > n, "who is served stays so")
            require(len(client.recording.stretches) == 1, "who is served misses nothing")
        for client in served:
            require(client.end() == 0, "a client ends as asked")
        # Not all: who is half connected keeps what it has, and a place takes several descriptors.
        taken = (len(served) + 1) // 2
        waited = wait_until(
            lambda: sum(it.read().count > 0 for it in refused) >= taken,
            "half of the places that become free are taken",
        )
        return (
            f"{limit} descriptors, {1 + surplus} clients: {1 + len(served)} served, "
            f"{len(refused)} refused, {share:.1%} of a processor meanwhile; of {len(served)} "
            f"places that became free {taken} were taken within {waited:.1f} s"
        )
