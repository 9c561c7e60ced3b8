"""A program that can be looked into (tests/endtoend/inspector), and a page of it without a browser."""

import base64
import json
import os
import select
import socket
import struct
import subprocess
import time

from runtime_fixture import has_header, link, translated_shop, write_library
from workspace_fixture import ROOT, Skipped, need

SOURCES = ROOT / "tests/endtoend/inspector"
PLAIN = "g++ -std=c++17 -Wall -Werror -fPIC -fno-gnu-unique -pthread"
ADDRESSES = "g++ -std=c++17 -g1 -O1 -fsanitize=address,undefined -fno-sanitize-recover=undefined -fno-sanitize=bool,alignment -pthread"
THREADS = "g++ -std=c++17 -g1 -O1 -fsanitize=thread -Wno-tsan -pthread"


def built(binary, compiler=PLAIN):
    """A workspace with the program `app`."""
    need("g++", "setarch")
    if not has_header("boost/beast.hpp"):
        raise Skipped("boost/beast.hpp")
    workspace = translated_shop(binary, "", (SOURCES / "shop.cpp").read_text(), (SOURCES / "shop.h").read_text())
    write_library(workspace)
    link(workspace, compiler, ["qrexsource/x64/Debug/app/src/app.cpp"], "app")
    return workspace


class Program:
    """Runs until it is told to end, which it must do well."""

    def __init__(self, command, folder):
        self.process = subprocess.Popen(["setarch", "-R", *command], cwd=folder, stdin=subprocess.PIPE, stdout=subprocess.PIPE,
                                        stderr=subprocess.PIPE, text=True)
        self.address = self.process.stdout.readline().split()[-1]
        self.host = self.address.split("/")[2]

    def __enter__(self):
        return self

    def __exit__(self, kind, *_):
        if self.process.poll() is None:
            self.process.kill() if kind else self.end()

    def end(self):
        """What it printed at last."""
        output, errors = self.process.communicate("\n", timeout=60)
        assert self.process.returncode == 0, f"status {self.process.returncode}:\n{output}{errors}"
        assert not errors, errors
        return output

    def request(self, text):
        """The first line of the answer to these bytes; empty where the connection is closed without one."""
        with self.connect() as client:
            try:
                client.sendall(text.encode("latin-1"))
                return client.recv(4096).decode("latin-1").split("\r\n")[0]
            except ConnectionResetError:
                return ""

    def connect(self):
        host, port = self.host.split(":")
        return socket.create_connection((host, int(port)), timeout=30)

    def page(self, **heads):
        return Page(self, **heads)


class Page:
    """A WebSocket as a page has it."""

    def __init__(self, program, path=None, **heads):
        self.socket = program.connect()
        path = path or "/" + program.address.split("/", 3)[3] + "live"
        heads = {"Host": program.host, "Origin": f"http://{program.host}", "Upgrade": "websocket", "Connection": "Upgrade",
                 "Sec-WebSocket-Version": "13", "Sec-WebSocket-Key": base64.b64encode(os.urandom(16)).decode(), **heads}
        lines = "".join(f"{name}: {value}\r\n" for name, value in heads.items() if value is not None)
        self.socket.sendall(f"GET {path} HTTP/1.1\r\n{lines}\r\n".encode())
        self.buffer = b""
        while b"\r\n\r\n" not in self.buffer:
            self.buffer += self.socket.recv(4096)
        head, self.buffer = self.buffer.split(b"\r\n\r\n", 1)
        self.status = int(head.split()[1])
        self.last = 0
        self.pushed = []

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self.socket.close()

    def send(self, data, opcode=1):
        size = len(data)
        if size < 126:
            mark = bytes([0x80 | size])
        else:
            mark = bytes([0xFE]) + struct.pack(">H", size) if size < 65536 else bytes([0xFF]) + struct.pack(">Q", size)
        self.socket.sendall(bytes([0x80 | opcode]) + mark + bytes(4) + data)  # a mask of zeros

    def take(self, size):
        while len(self.buffer) < size:
            data = self.socket.recv(65536)
            if not data:
                raise EOFError
            self.buffer += data
        taken, self.buffer = self.buffer[:size], self.buffer[size:]
        return taken

    def receive(self):
        opcode, size = self.take(2)
        size = struct.unpack(">H", self.take(2))[0] if size == 126 else struct.unpack(">Q", self.take(8))[0] if size == 127 else size
        data = self.take(size)
        if opcode & 15 == 8:
            raise EOFError(data)
        return json.loads(data)

    def ask(self, do, data=None, **members):
        """What is answered: the value, or the text of the error."""
        self.last += 1
        text = json.dumps({"id": self.last, "do": do, **members}).encode()
        self.send(text) if data is None else self.send(text + b"\n" + data, 2)
        while True:
            message = self.receive()
            if message.get("id") == self.last:
                return message.get("ok", message.get("error"))
            self.pushed.append(message)

    def arrives(self, seconds):
        """What comes within a time by itself."""
        end = time.monotonic() + seconds
        messages, self.pushed = self.pushed, []
        while self.buffer or select.select([self.socket], [], [], max(end - time.monotonic(), 0))[0]:
            messages.append(self.receive())
        return messages

    def text(self, *path):
        """Of the row at a path."""
        rows = self.ask("rows", path=list(path[:-1]))["rows"]
        return next(row["text"] for row in rows if row["step"] == path[-1] or row["name"] == path[-1])
