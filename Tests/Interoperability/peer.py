# SPDX-License-Identifier: MIT
"""A telephony server ("server") or a client of one ("client COUNT"), on $KESTRO_PORT_DIR, made
from Documentation/message-ports.md alone."""
import fcntl, itertools, os, plistlib, queue, socket, socketserver, struct, sys, threading, time

MESSAGE, REQUEST, REPLY, REPLY_WITHOUT_DATA = 1, 2, 3, 4
CHANNEL, REGISTER, CREATE_LOG_CHANNEL = 0, 1, 2
PATH = os.path.join(os.environ["KESTRO_PORT_DIR"], "{}").format

class Connection(socketserver.BaseRequestHandler):
    def handle(self):
        while frame := receive(self.request):
            kind, message_id, sequence, body = frame
            reply = self.server.handler(message_id, body)
            if kind == REQUEST:
                kind = REPLY_WITHOUT_DATA if reply is None else REPLY
                send(self.request, kind, message_id, sequence, reply or b"")

def own(name, handler):
    with open(PATH("lock~"), "a") as lock:
        fcntl.flock(lock, fcntl.LOCK_EX)
        port = socketserver.ThreadingUnixStreamServer(PATH(name), Connection)
    port.daemon_threads, port.handler = True, handler
    threading.Thread(target=port.serve_forever, daemon=True).start()

def connect(name):
    connection = socket.socket(socket.AF_UNIX)
    connection.connect(PATH(name))
    return connection

def send(connection, kind, message_id, sequence, body):
    header = struct.pack("<B3xiII", kind, message_id, sequence, len(body))
    connection.sendall(header + body)

def receive(connection):
    header = connection.recv(16, socket.MSG_WAITALL)
    if len(header) == 16:
        kind, message_id, sequence, length = struct.unpack("<B3xiII", header)
        body = connection.recv(length, socket.MSG_WAITALL) if length else b""
        return kind, message_id, sequence, body

def xml(entries):
    lines = plistlib.dumps(entries).splitlines()
    return b"\n".join(line for line in lines if not line.startswith(b"<!DOCTYPE"))

def request(connection, message_id, sequence, entries):
    send(connection, REQUEST, message_id, sequence, xml(entries))
    *answered, body = receive(connection)
    assert answered == [REPLY, message_id, sequence], answered
    return plistlib.loads(body)

def serve():
    started, local = threading.Event(), []
    def answer(message_id, body):
        command = plistlib.loads(body)
        if message_id == CREATE_LOG_CHANNEL:
            local.append(connect(command["LocalPort"]))
            return xml({"Error": 0, "Port": "PeerChannel"})
        if "GetTechnology" in command:
            return xml({"GetTechnology": "IFX"})
        if command.get("SetState") == "Streaming":
            started.set()
    own("PeerChannel", answer)
    own("TelephonyServer", answer)
    started.wait()
    for level in itertools.count(-90):
        cell = {"ARFCN": "62", "RxLev": str(level)}
        send(local[0], MESSAGE, CHANNEL, 0, xml({"Cell": cell, "State": "Idle"}))
        time.sleep(0.1)

def watch(count):
    log = queue.Queue()
    own("TelephonyClient.Peer", lambda message_id, body: None)
    own("KestroApp.Peer", lambda message_id, body: log.put((message_id, plistlib.loads(body))))
    server = connect("TelephonyServer")
    send(server, MESSAGE, REGISTER, 0, xml({"NotificationPort": "TelephonyClient.Peer"}))
    print(request(server, CREATE_LOG_CHANNEL, 1, {"LocalPort": "Nobody"})["Error"])
    channel = connect(request(server, CREATE_LOG_CHANNEL, 2, {"LocalPort": "KestroApp.Peer"})["Port"])
    print(request(channel, CHANNEL, 1, {"GetTechnology": "GetTechnology"})["GetTechnology"])
    send(channel, MESSAGE, CHANNEL, 0, xml({"SetState": "Streaming"}))
    for message_id, display in (log.get(timeout=10) for _ in range(count)):
        print(message_id, type(display).__name__)

if __name__ == "__main__":
    serve() if sys.argv[1] == "server" else watch(int(sys.argv[2]))
