"""A telephony service that lies: lying_telephony.py STEP:KIND [TIMES]

It serves the log channel in $VENTRIK_RUNTIME_DIR as a good service would, with LTE cells whose
physical cell identity is 300 and the number of the attempt, and misbehaves in the way of that name,
TIMES times (once by default). Steps are its "port", the answers to a channel's "request" and to the
question for the "technology", the "start" command and the "stream". It prints "listening" when it is
ready and "lied" each time that it has misbehaved. "die" and "stop" are signals to itself; whoever
stopped it lets it go on.
"""
import os
import plistlib
import signal
import socket
import struct
import sys
import threading
import time

DIRECTORY = os.environ["VENTRIK_RUNTIME_DIR"]
SERVICE = "org.ventrik.TelephonyService"
CHANNEL = "org.ventrik.LyingTelephony.LogChannel"
WANTS_REPLY, IS_REPLY = 1, 2
LARGE = 64 << 20
ANSWERS = ["silent", "close", "garbage", "half", "dribble", "large", "too-large", "bad-flags",
           "bad-header", "die", "stop"]
KINDS = {
    "request": ANSWERS + ["refuse", "no-name", "empty-name", "dead-name"],
    "technology": ANSWERS + ["unknown", "number"],
    "stream": ["close", "close-at-once", "half-close", "bad-flags", "bad-header", "too-large",
               "stall-in-header", "stall-in-message", "silent", "none", "odd-messages", "flood",
               "large-messages", "close-commands", "close-service", "die", "stop"],
    "start": ["die", "stop"],
    "port": ["foreign"],
}


def frame(data, flags=0, serial=0, length=None):
    return struct.pack("<IiII", len(data) if length is None else length, 0, flags, serial) + data


def packet(code, size, fields):
    record = bytearray(size)
    record[0] = 1
    struct.pack_into("<HH", record, 1, size, code)
    for offset, value in fields:
        struct.pack_into("<H", record, offset, value)
    return bytes(record)


def cell_info(identity):
    return packet(0xB0C2, 38, [(14, identity)])


def read_exactly(connection, count):
    data = b""
    while len(data) < count:
        more = connection.recv(count - len(data))
        if not more:
            raise ConnectionError
        data += more
    return data


def read_message(connection):
    length, _, flags, serial = struct.unpack("<IiII", read_exactly(connection, 16))
    return plistlib.loads(read_exactly(connection, length)), flags, serial


class LyingService:
    def __init__(self, step, kind, times):
        self.step, self.kind, self.times = step, kind, times
        self.attempt = 0
        self.client = None
        self.stream = None
        self.commands = []
        self.listeners = {}

    def lies(self, step):
        return self.step == step and self.times > 0

    def lied(self):
        self.times -= 1
        print("lied", flush=True)

    def end_or_stop(self):
        print("lied", flush=True)
        self.times -= 1
        os.kill(os.getpid(), signal.SIGKILL if self.kind == "die" else signal.SIGSTOP)
        time.sleep(0.05)  # the signal may come a little later than its call returns

    def listen(self, name):
        path = os.path.join(DIRECTORY, name)
        if os.path.exists(path):
            os.unlink(path)
        listener = socket.socket(socket.AF_UNIX, socket.SOCK_STREAM)
        listener.bind(path)
        # The kernel notes who listens.
        if self.lies("port"):
            os.seteuid(65534)
        listener.listen(16)
        os.seteuid(os.getuid())
        self.listeners[name] = listener
        return listener

    def serve(self, name, handle):
        listener = self.listen(name)

        def accept():
            while True:
                try:
                    connection = listener.accept()[0]
                except OSError:
                    return
                threading.Thread(target=self.talk, args=(connection, handle), daemon=True).start()

        threading.Thread(target=accept, daemon=True).start()

    @staticmethod
    def talk(connection, handle):
        try:
            while True:
                handle(connection, *read_message(connection))
        except (OSError, ConnectionError):
            pass

    def answer(self, connection, serial, value, step):
        """Sends a property list, or what the lie puts in its place."""
        good = frame(plistlib.dumps(value), IS_REPLY, serial)
        if not self.lies(step) or self.kind not in ANSWERS:
            connection.sendall(good)
            return
        kind = self.kind
        if kind in ("die", "stop"):
            self.end_or_stop()
            connection.sendall(good)
            return
        self.lied()
        if kind == "close":
            connection.shutdown(socket.SHUT_RDWR)
        elif kind == "garbage":
            connection.sendall(frame(b"garbage\x00\xff", IS_REPLY, serial))
        elif kind == "half":
            connection.sendall(good[: len(good) // 2])
        elif kind == "dribble":
            for byte in good:
                connection.sendall(bytes([byte]))
                time.sleep(0.1)
        elif kind == "large":
            connection.sendall(frame(bytes(LARGE), IS_REPLY, serial))
        elif kind == "too-large":
            connection.sendall(frame(b"", IS_REPLY, serial, LARGE + 1))
        elif kind == "bad-flags":
            connection.sendall(frame(b"", 0x80, serial))
        elif kind == "bad-header":
            connection.sendall(b"\xee" * 64)

    def handle_request(self, connection, request, flags, serial):
        self.attempt += 1
        self.client = request["LocalPort"]
        self.stream = socket.socket(socket.AF_UNIX, socket.SOCK_STREAM)
        self.stream.connect(os.path.join(DIRECTORY, self.client))
        answer = {"ErrorDomain": 0, "ErrorCode": 0, "RemotePort": CHANNEL}
        if self.lies("request") and self.kind not in ANSWERS:
            answer = {
                "refuse": {"ErrorDomain": 2, "ErrorCode": 13},
                "no-name": {"ErrorDomain": 0, "ErrorCode": 0},
                "empty-name": {"ErrorDomain": 0, "ErrorCode": 0, "RemotePort": ""},
                "dead-name": {"ErrorDomain": 0, "ErrorCode": 0, "RemotePort": "org.ventrik.Nobody"},
            }[self.kind]
            self.lied()
        self.answer(connection, serial, answer, "request")

    def handle_command(self, connection, command, flags, serial):
        self.commands.append(connection)
        if "GetTechnology" in command:
            answer = "kQXLogChannelTechnology_Orbel_LTE"
            if self.lies("technology") and self.kind not in ANSWERS:
                answer = {"unknown": "Semaphore", "number": 5}[self.kind]
                self.lied()
            self.answer(connection, serial, {"GetTechnology": answer}, "technology")
            return
        if self.lies("start"):
            self.end_or_stop()
        if not (self.lies("stream") and self.kind == "none"):
            threading.Thread(target=self.run_stream, args=(self.stream, self.attempt),
                             daemon=True).start()
        else:
            self.lied()

    def run_stream(self, stream, attempt):
        try:
            if self.lies("stream"):
                self.lie_in_stream(stream, attempt)
            while True:
                stream.sendall(frame(cell_info(300 + attempt)))
                time.sleep(0.1)
        except OSError:
            pass

    def lie_in_stream(self, stream, attempt):
        kind = self.kind
        if kind == "close-at-once":
            stream.shutdown(socket.SHUT_RDWR)
            self.lied()
            return
        for _ in range(30):
            stream.sendall(frame(cell_info(300 + attempt)))
            time.sleep(0.1)
        if kind in ("die", "stop"):
            self.end_or_stop()
            return
        self.lied()
        if kind == "close":
            stream.shutdown(socket.SHUT_RDWR)
        elif kind == "half-close":
            stream.shutdown(socket.SHUT_WR)
        elif kind == "bad-flags":
            stream.sendall(frame(b"", 0x80))
        elif kind == "bad-header":
            stream.sendall(b"\xee" * 64)
        elif kind == "too-large":
            stream.sendall(frame(b"", 0, 0, LARGE + 1))
        elif kind == "stall-in-header":
            stream.sendall(b"\x01\x00\x00")
        elif kind == "stall-in-message":
            stream.sendall(frame(b"begun", 0, 0, 1000))
        elif kind == "odd-messages":
            for size in range(200):
                stream.sendall(frame(os.urandom(size)))
            stream.sendall(frame(packet(0xB0C2, 38, [])[1:]))
            return
        elif kind == "flood":
            burst = frame(cell_info(300 + attempt)) * 1000
            end = time.monotonic() + 8
            while time.monotonic() < end:
                stream.sendall(burst)
            return
        elif kind == "large-messages":
            large = frame(packet(0xB0C2, 60000, [(14, 300 + attempt)]) + bytes(940000))
            end = time.monotonic() + 8
            while time.monotonic() < end:
                stream.sendall(large)
            return
        elif kind == "close-commands":
            for connection in self.commands:
                connection.shutdown(socket.SHUT_RDWR)
            return
        elif kind == "close-service":
            self.listeners[SERVICE].shutdown(socket.SHUT_RDWR)
            self.serve(SERVICE, self.handle_request)
            return
        time.sleep(3600)

    def run(self):
        self.serve(SERVICE, self.handle_request)
        self.serve(CHANNEL, self.handle_command)
        if self.lies("port"):
            self.lied()
        print("listening", flush=True)
        threading.Event().wait()


def main():
    step, _, kind = sys.argv[1].partition(":")
    if kind not in KINDS.get(step, []):
        sys.exit(f"{sys.argv[0]}: there is no '{sys.argv[1]}'")
    os.makedirs(DIRECTORY, 0o700, exist_ok=True)
    LyingService(step, kind, int(sys.argv[2]) if len(sys.argv) > 2 else 1).run()


if __name__ == "__main__":
    main()
