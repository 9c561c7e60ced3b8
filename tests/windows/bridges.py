#!/usr/bin/env python3
"""Tools of this system for the Windows program: bridges.py BUILD_FOLDER COMMAND... runs a command, below which they can be called.

Drive Z: becomes a view of this system in which a bridge (bridge.cpp) stands for each program in the folders of PATH; `Qrex` and
`wine` beside this file run the Windows program and others there. The bridges talk to the server here, which runs the programs."""

import fcntl
import os
import re
import secrets
import selectors
import shutil
import signal
import socket
import struct
import subprocess
import sys
import tempfile
import threading
from pathlib import Path

DRIVE = "Z:"
CACHES = ["/usr/lib/ccache"]
# What Windows programs have in their environment, which says nothing to others.
OF_WINDOWS = re.compile(r"(?i)(all_?users|app_?data|common_?program|computername|comspec|driverdata|home|localappdata|number_of_processors"
                        r"|os$|path$|pathext|processor_|program(data|files|w6432)|public$|pwd|system(drive|root)|te?mp$|user(domain|name|profile)"
                        r"|win(dir|e)|=)")
ENDED_BY_SIGNAL, INTERRUPTED = 0xC0DE0000, 0xC000013A  # the former, with the number of the signal, is for tests alone


def plain(text):
    """Without the drive."""
    return re.sub(rf"(?i)\bz:(?=[/\\])", "", text)


def unix_path(path):
    return re.sub(r"^[A-Za-z]:", "", path).replace("\\", "/")


class View:
    """A root like that of this system, but with bridges in the given folders."""

    def __init__(self, folder, bridge, tool_folders):
        self.root, self.bridge = folder, bridge
        self.mirror(Path("/"), {Path(path) for each in tool_folders for path in (each, os.path.realpath(each))})

    def mirror(self, place, folders):
        target = self.root / str(place)[1:]
        target.mkdir(parents=True)
        above = {parent for each in folders for parent in each.parents}
        for entry in os.scandir(place):
            path = Path(entry.path)
            if path in folders or path in above:
                self.mirror(path, folders)
            else:
                os.symlink(entry.path, target / entry.name)
                if place in folders and entry.is_file() and os.access(entry.path, os.X_OK):
                    os.symlink(self.bridge, target / f"{entry.name}.exe")


def current_view(prefix, bridge):
    """The one of this prefix; made anew when programs have come, unless somebody else does so."""
    view, drive, stamp = prefix / "view", prefix / "dosdevices" / DRIVE.lower(), prefix / "view.stamp"
    folders = [each for each in [*os.environ["PATH"].split(":"), *CACHES] if os.path.isdir(each)]
    with open(prefix / "view.lock", "w") as lock:
        fcntl.flock(lock, fcntl.LOCK_EX)
        since = os.path.getmtime(stamp) if stamp.exists() else 0
        if any(os.path.getmtime(each) > since for each in [bridge, *folders]):
            shutil.rmtree(view, ignore_errors=True)
            View(view, bridge, folders)
            stamp.touch()
        drive.unlink(missing_ok=True)
        drive.symlink_to(view)
    return view


class Request:
    def __init__(self, texts, key):
        isOurs = secrets.compare_digest(texts[0].encode(), key.encode())
        assert isOurs, "a call of somebody else"
        self.program, self.folder = self.behind(unix_path(texts[1])), unix_path(texts[2])
        count = int(texts[3])
        self.words, environment = texts[4:4 + count], dict(text.split("=", 1) for text in texts[4 + count:] if not text.startswith("="))
        self.environment = {**os.environ, **{name: value for name, value in environment.items() if not OF_WINDOWS.match(name)}}
        path = next((value for name, value in environment.items() if name.upper() == "PATH"), "")
        self.environment["PATH"] = ":".join(unix_path(each) for each in path.split(";"))
        self.temporary = []

    @staticmethod
    def behind(path):
        """The program that a bridge stands for."""
        return path + ".sh" if os.path.exists(path + ".sh") else re.sub(r"(?i)\.exe$", "", path)

    def word(self, text):
        """With the paths of this system; a response file that has others is copied."""
        if text.startswith("@"):
            path = os.path.join(self.folder, unix_path(text[1:]))
            if os.path.exists(path):
                content = Path(path).read_text(errors="surrogateescape")
                if plain(content) != content:
                    copy = tempfile.NamedTemporaryFile("w", errors="surrogateescape", newline="", delete=False)
                    with copy:
                        copy.write(plain(content))
                    self.temporary.append(copy.name)
                    return f"@{copy.name}"
        return plain(text)

    def start(self):
        return subprocess.Popen([self.program, *map(self.word, self.words)], cwd=self.folder, env=self.environment, stdin=subprocess.DEVNULL,
                                stdout=subprocess.PIPE, stderr=subprocess.PIPE, start_new_session=True)


def status_of(code):
    return code if code >= 0 else INTERRUPTED if code == -signal.SIGINT else ENDED_BY_SIGNAL - code


class Call:
    """A program that runs for a bridge."""

    def __init__(self, connection, process):
        self.connection, self.process = connection, process

    def give(self, stream, file):
        part = os.read(file.fileno(), 65536)
        if part:
            self.connection.sendall(struct.pack("<II", stream, len(part)) + part)
        return part

    def serve(self):
        streams = {self.process.stdout: 1, self.process.stderr: 2}
        end = os.pidfd_open(self.process.pid)
        with selectors.DefaultSelector() as waits:
            for each in [*streams, end, self.connection]:
                waits.register(each, selectors.EVENT_READ)
            hasEnded = False
            while not hasEnded:
                for key, _ in waits.select():
                    if key.fileobj is self.connection:
                        os.killpg(self.process.pid, signal.SIGKILL)
                        waits.unregister(self.connection)
                    elif key.fileobj == end:
                        hasEnded = True
                    elif not self.give(streams[key.fileobj], key.fileobj):
                        waits.unregister(key.fileobj)
        os.close(end)
        for file, stream in streams.items():  # what is still there: something may go on with the streams
            os.set_blocking(file.fileno(), False)
            try:
                while self.give(stream, file):
                    pass
            except BlockingIOError:
                pass
            file.close()
        self.connection.sendall(struct.pack("<II", 0, status_of(self.process.wait())))


class Server:
    def __init__(self):
        self.key = secrets.token_hex(16)
        self.listener = socket.create_server(("127.0.0.1", 0), backlog=256)
        self.address = f"{self.listener.getsockname()[1]}:{self.key}"
        threading.Thread(target=self.accept, daemon=True).start()

    def accept(self):
        while True:
            connection, _ = self.listener.accept()
            threading.Thread(target=self.answer, args=[connection], daemon=True).start()

    def read(self, connection):
        with connection.makefile("rb") as file:
            data = file.read(struct.unpack("<I", file.read(4))[0])
        texts, at = [], 0
        while at < len(data):
            size = struct.unpack_from("<I", data, at)[0]
            texts.append(data[at + 4:at + 4 + size].decode())
            at += 4 + size
        return Request(texts, self.key)

    def answer(self, connection):
        with connection:
            request = self.read(connection)
            try:
                Call(connection, request.start()).serve()
            except (FileNotFoundError, PermissionError) as error:
                told = f"{error}\n".encode()
                connection.sendall(struct.pack("<II", 2, len(told)) + told + struct.pack("<II", 0, 127))
            except BrokenPipeError:
                pass
            finally:
                for path in request.temporary:
                    os.unlink(path)


# Ahead of what this system's program is installed with its own, the Windows program and what calls it.
INSTALL = """file(LOCK "{lock}")  # the runtime is gathered in one place
include("{linux}/cmake_install.cmake")
if(NOT CMAKE_INSTALL_COMPONENT OR CMAKE_INSTALL_COMPONENT STREQUAL "tool")
  file(INSTALL DESTINATION "${{CMAKE_INSTALL_PREFIX}}/bin" TYPE PROGRAM FILES "{wrapper}" "{windows}/Qrex.exe")
endif()
"""


def build_folder(folder, windows, linux):
    """As the build folder of this system, as far as tests ask for that, but with the Windows program in its place."""
    wrapper = Path(__file__).with_name("Qrex")
    folder.mkdir()
    (folder / "cmake_install.cmake").write_text(INSTALL.format(lock=folder / "lock", linux=linux, windows=windows, wrapper=wrapper))
    (folder / "qrex-lsp").symlink_to(wrapper)
    of_windows = [Path(windows) / name for name in ("Qrex.exe", "qrex-lsp.exe")]
    for path in [wrapper, *of_windows, *(Path(linux) / name for name in ("built", "CPackConfig.cmake"))]:
        (folder / path.name).symlink_to(path)
    return folder / "Qrex"


class Bridges:
    """A view, and the server; what runs below has them in its environment."""

    def __init__(self, windows, linux):
        self.windows, self.linux, self.bridge = windows, linux, windows / "bridge.exe"

    def __enter__(self):
        view = current_view(Path(os.environ["WINEPREFIX"]), self.bridge)
        self.folder = Path(tempfile.mkdtemp(prefix="bridges-"))
        self.program = build_folder(self.folder / "build", self.windows, self.linux)
        os.environ.update(QREX_BRIDGES=Server().address, QREX_BRIDGE=str(self.bridge), QREX_VIEW=str(view), QREX_DRIVE=DRIVE,
                          QREX_PROGRAM=str(self.program),
                          QREX_WINE=str(Path(__file__).with_name("wine")))
        return self

    def __exit__(self, *_):
        shutil.rmtree(self.folder, ignore_errors=True)


def main():
    os.environ.setdefault("WINEPREFIX", os.path.abspath(f"{sys.argv[1]}/wine"))
    with Bridges(Path(sys.argv[1]).resolve(), Path(__file__).resolve().parents[2] / "build"):
        sys.exit(subprocess.run(sys.argv[2:]).returncode)


if __name__ == "__main__":
    main()
