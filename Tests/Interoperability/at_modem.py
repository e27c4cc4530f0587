# SPDX-License-Identifier: MIT
"""A modem that answers AT commands, behind an abstract socket, as ModemManager's tests take one."""

import socket
import threading

IMEI = "490154203237518"
IMSI = "001010123456789"

_ANSWERS = {
    "AT": "",
    "ATE0": "",
    "AT+CGMI": "Example",
    "AT+CGMM": "Model X",
    "AT+CGMR": "1.0",
    "AT+CGSN": IMEI,
    "AT+CIMI": IMSI,
    "AT+GCAP": "+GCAP: +CGSM,+DS",
    "ATI": "Example Model X",
    "AT+CFUN?": "+CFUN: 1",
    "AT+CSQ": "+CSQ: 20,99",
    "AT+CESQ=?": "+CESQ: (0-63,99),(0-7,99),(0-96,255),(0-49,255),(0-34,255),(0-97,255)",
    "AT+CRSM=176,12258,0,0,10": "+CRSM: 144,0,\"98990009000000000031\"",
    "AT+WS46=?": "+WS46: (12,22,25,28,29)",
    "AT+CIND=?": "",
    "AT+CLCK=?": "+CLCK: (\"SC\")",
    "AT+CSCS=?": "+CSCS: (\"IRA\",\"UCS2\",\"GSM\")",
    "AT+CGDCONT=?": "+CGDCONT: (1-16),\"IP\",,,(0-2),(0-4)",
    "AT+CGDCONT?": "+CGDCONT: 1,\"IP\",\"internet\",\"\",0,0",
    "AT+CGACT?": "+CGACT: 1,0",
    "AT+CNUM": "+CNUM: ,\"+9990100000001\",145",
}


class AtModem:
    """Serves connections on the abstract socket of that name until it is closed."""

    def __init__(self, name):
        self.name = name
        self.pin = "READY"
        self.level = 55  # of +CESQ: RSRP = level - 141 dBm
        self.quality = 20  # RSRQ = quality / 2 - 20 dB
        self.is_registered = True
        self._has_names = False  # of +COPS: names, not codes
        self._connections = []
        self._listener = socket.socket(socket.AF_UNIX, socket.SOCK_STREAM)
        self._listener.bind("\0abstract:" + name)
        self._listener.listen(8)
        threading.Thread(target=self._accept, daemon=True).start()

    def close(self):
        self._listener.close()

    def _registration(self, name):
        return f"+{name}: 2,1,\"0259\",\"001003AB\",7" if self.is_registered else f"+{name}: 2,2"

    def _answer(self, command):
        if command == "AT+CPIN?":
            return f"+CPIN: {self.pin}"
        if command == "AT+CESQ":
            return f"+CESQ: 99,99,255,255,{self.quality},{self.level}"
        if command in ("AT+CREG?", "AT+CGREG?", "AT+CEREG?"):
            return self._registration(command[3:-1])
        if command.startswith("AT+COPS=3,"):
            self._has_names = command.startswith("AT+COPS=3,0")
            return self._operator() if command.endswith("+COPS?") else ""
        if command == "AT+COPS?":
            return self._operator()
        return _ANSWERS.get(command)

    def _operator(self):
        if not self.is_registered:
            return "+COPS: 0"
        return "+COPS: 0,0,\"Kestro Test\",7" if self._has_names else "+COPS: 0,2,\"00101\",7"

    def _accept(self):
        while True:
            try:
                connection, _ = self._listener.accept()
            except OSError:
                return
            self._connections.append(connection)
            threading.Thread(target=self._serve, args=(connection,), daemon=True).start()

    def _serve(self, connection):
        waiting = b""
        try:
            while received := connection.recv(4096):
                waiting += received
                while b"\r" in waiting:
                    line, waiting = waiting.split(b"\r", 1)
                    connection.sendall(self._reply(line.decode(errors="replace").strip()))
        except OSError:
            pass

    def _reply(self, command):
        answer = self._answer(command)
        if answer is None and command.endswith("?"):
            return b"\r\nERROR\r\n"
        text = f"\r\n{answer}\r\n" if answer else ""
        return f"{text}\r\nOK\r\n".encode()

    def register(self, is_registered):
        """Gains or loses the network and says so unasked, as ModemManager expects."""
        self.is_registered = is_registered
        state = "1,\"0259\",\"001003AB\",7" if is_registered else "2"
        for connection in self._connections:
            for name in ("CREG", "CGREG", "CEREG"):
                try:
                    connection.sendall(f"\r\n+{name}: {state}\r\n".encode())
                except OSError:
                    pass
