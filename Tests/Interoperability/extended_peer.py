# SPDX-License-Identifier: MIT
"""A client of a telephony server on $KESTRO_PORT_DIR that asks for what the channel does not tell,
made from Documentation/message-ports.md alone. "lose" loses its channel by not reading it and
asks for another in its place; "follow" reads to the message "last" and the source's end. Prints what it learns."""
import plistlib, queue, struct, sys, threading, time

import peer
from peer import CHANNEL, CREATE_LOG_CHANNEL, MESSAGE, REGISTER

NOTIFICATION, SOURCE_TIME = 3, 4


class Client:
    def __init__(self):
        self.log = queue.Queue()
        self.notifications = queue.Queue()
        self.reading = threading.Event()
        self.reading.set()
        peer.own("TelephonyClient.Peer", self.notified)
        self.server = peer.connect("TelephonyServer")
        peer.send(self.server, MESSAGE, REGISTER, 0,
                  peer.xml({"NotificationPort": "TelephonyClient.Peer"}))
        self.requests = 0

    def notified(self, message_id, body):
        assert message_id == NOTIFICATION
        self.notifications.put(plistlib.loads(body))

    def received(self, message_id, body):
        self.reading.wait()
        self.log.put((message_id, body))

    def ask(self, **entries):
        self.requests += 1
        local_port = f"KestroApp.Peer{self.requests}"
        peer.own(local_port, self.received)
        return peer.request(self.server, CREATE_LOG_CHANNEL, self.requests,
                            {"LocalPort": local_port, **entries})

    def start(self, port, **entries):
        self.channel = peer.connect(port)
        peer.send(self.channel, MESSAGE, CHANNEL, 0, peer.xml({"SetState": "Streaming", **entries}))


def serial(body):
    return int(plistlib.loads(body)["Serial"])


def lose():
    """Numbered messages: what was read and what was lost make up all of them."""
    client = Client()
    reply = client.ask()
    assert "Lost" not in reply, reply
    client.start(reply["Port"])
    first = serial(client.log.get(timeout=10)[1])
    client.reading.clear()
    while client.channel.recv(1):  # until the server has closed the channel
        pass
    client.reading.set()
    time.sleep(0.5)  # what the system holds is read
    time.sleep(1)  # and this is missed besides
    following = client.ask(Previous=reply["Port"])
    time.sleep(0.2)  # nothing falls in between
    client.start(following["Port"])
    last, gaps, more = first, [], 500
    while not gaps or (more := more - 1) > 0:
        number = serial(client.log.get(timeout=10)[1])
        if number != last + 1:
            gaps.append(number - last - 1)
        last = number
    print(len(gaps), gaps[0] - following["Lost"], following["Lost"] > 0)
    again = client.ask(Previous=reply["Port"])
    print("Lost" in again)


def follow():
    """Reads times and messages to the source's end."""
    client = Client()
    reply = client.ask()
    print(reply["Source"]["Kind"], reply["Source"].get("Name"), reply["Simulated"], reply["Ended"])
    client.start(reply["Port"], Times=True)
    while True:
        message_id, body = client.log.get(timeout=10)
        assert message_id == SOURCE_TIME and len(body) == 8, (message_id, body)
        microseconds = struct.unpack("<q", body)[0]
        message_id, body = client.log.get(timeout=10)
        assert message_id == CHANNEL
        print(microseconds, body.decode())
        if body == b"last":
            break
    notification = client.notifications.get(timeout=10)
    print(notification["Notification"], notification["Source"]["Kind"], notification["Ended"])
    print(client.ask()["Ended"])


if __name__ == "__main__":
    {"lose": lose, "follow": follow}[sys.argv[1]]()
