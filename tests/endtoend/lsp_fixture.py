"""A scripted client of the language server."""

import json
import queue
import subprocess
import threading
from pathlib import Path
from urllib.parse import quote, unquote

from workspace_fixture import DRIVE

TIMEOUT = 120


def uri_of(path):
    return f"file://{'/' if DRIVE else ''}{quote(DRIVE + str(path))}"


def path_of(uri):
    return unquote(uri).removeprefix("file://").removeprefix(f"/{DRIVE}" if DRIVE else "")


class Client:
    """Starts the server for a folder, and keeps what it tells. `place(name, text, within=0)` finds positions by the text that
    stands there, so that tests speak of names."""

    def __init__(self, server, folder, encoding="utf-16", snippets=False, **options):
        self.folder, self.encoding = Path(folder).resolve(), encoding
        self.process = subprocess.Popen([server], stdin=subprocess.PIPE, stdout=subprocess.PIPE, cwd=folder)
        self.arrived, self.answers, self.notes, self.diagnostics, self.texts = queue.Queue(), {}, [], {}, {}
        self.next_id = 0
        threading.Thread(target=self._read, daemon=True).start()
        self.capabilities = self.ask("initialize", {
            "processId": None, "rootUri": uri_of(self.folder), "initializationOptions": options,
            "capabilities": {"general": {"positionEncodings": [encoding]},
                             "textDocument": {"completion": {"completionItem": {"snippetSupport": snippets}}}}})["capabilities"]
        self.tell("initialized", {})

    def __enter__(self):
        return self

    def __exit__(self, *_):
        if self.process.poll() is None:
            self.process.kill()
        self.process.wait()
        self.process.stdin.close()

    def _read(self):
        stream = self.process.stdout
        while True:
            length = None
            while (line := stream.readline()) not in (b"\r\n", b""):
                if line.lower().startswith(b"content-length:"):
                    length = int(line.split(b":")[1])
            if length is None:
                return self.arrived.put(None)
            self.arrived.put(json.loads(stream.read(length)))

    def send_bytes(self, data):
        self.process.stdin.write(data)
        self.process.stdin.flush()

    def send(self, message):
        body = json.dumps({"jsonrpc": "2.0", **message}).encode()
        self.send_bytes(b"Content-Length: %d\r\n\r\n" % len(body) + body)

    def tell(self, method, params):
        self.send({"method": method, "params": params})

    def take(self, timeout=TIMEOUT):
        message = self.arrived.get(timeout=timeout)
        assert message is not None, "the server has ended"
        if "method" not in message:
            self.answers[message["id"]] = message
        elif message["method"] == "textDocument/publishDiagnostics":
            self.diagnostics[path_of(message["params"]["uri"])] = message["params"]["diagnostics"]
        else:
            self.notes.append(message)
        return message

    def start(self, method, params):
        self.next_id += 1
        self.send({"id": self.next_id, "method": method, "params": params})
        return self.next_id

    def wait(self, number):
        while number not in self.answers:
            self.take()
        return self.answers.pop(number)

    def ask(self, method, params):
        answer = self.wait(self.start(method, params))
        assert "error" not in answer, answer
        return answer["result"]

    def fail(self, method, params):
        return self.wait(self.start(method, params))["error"]["message"]

    # --- Documents

    def path(self, name):
        return self.folder / name

    def open(self, name, text=None):
        self.texts[name] = self.path(name).read_text() if text is None else text
        language = "cpp" if name.endswith((".h", ".cpp")) else "qrex"
        self.tell("textDocument/didOpen", {"textDocument": {
            "uri": uri_of(self.path(name)), "languageId": language, "version": 1, "text": self.texts[name]}})

    def close(self, name):
        self.tell("textDocument/didClose", {"textDocument": {"uri": uri_of(self.path(name))}})

    def units(self, text):
        return len(text.encode("utf-16-le")) // 2 if self.encoding == "utf-16" else len(text.encode())

    def position(self, name, offset):
        ahead = self.texts[name][:offset]
        return {"line": ahead.count("\n"), "character": self.units(ahead[ahead.rfind("\n") + 1:])}

    def place(self, name, text, within=0, index=0):
        at = -1
        for _ in range(index + 1):
            at = self.texts[name].index(text, at + 1)
        return {"textDocument": {"uri": uri_of(self.path(name))}, "position": self.position(name, at + within)}

    def tell_change(self, name, **change):
        document = {"uri": uri_of(self.path(name)), "version": 2}
        self.tell("textDocument/didChange", {"textDocument": document, "contentChanges": [change]})

    def change(self, name, begin, end, new):
        """Replaces a part of a text, as an editor tells it."""
        place = {"start": self.position(name, begin), "end": self.position(name, end)}
        self.texts[name] = self.texts[name][:begin] + new + self.texts[name][end:]
        self.tell_change(name, range=place, text=new)

    def edit(self, name, old, new):
        """Replaces the first `old`."""
        at = self.texts[name].index(old)
        self.change(name, at, at + len(old), new)

    def rewrite(self, name, text):
        self.texts[name] = text
        self.tell_change(name, text=text)

    def apply(self, action):
        """An action with one edit of an open text, as an editor does it."""
        [(uri, [edit])] = action["edit"]["changes"].items()
        name = self.name_of(uri)
        self.change(name, *self.offsets(self.texts[name], edit["range"]), edit["newText"])

    def name_of(self, uri):
        return str(Path(path_of(uri)).relative_to(self.folder))

    def offsets(self, text, place):
        lines = text.split("\n")
        for position in (place["start"], place["end"]):
            line = lines[position["line"]]
            column = next(n for n in range(len(line) + 1) if self.units(line[:n]) >= position["character"])
            yield sum(len(ahead) + 1 for ahead in lines[:position["line"]]) + column

    def text_at(self, location):
        """(name, text, its line) of a location or range in a file of the folder, from the text of the editor or of the disk."""
        name = self.name_of(location["uri"])
        text = self.texts.get(name) or self.path(name).read_text()
        begin, end = self.offsets(text, location["range"])
        return name, text[begin:end], text.split("\n")[location["range"]["start"]["line"]]

    def text_of(self, name, place):
        return self.text_at({"uri": uri_of(self.path(name)), "range": place})[1]

    def until(self, name, holds):
        """Diagnostics of the file, once they are as wanted."""
        key = str(self.path(name))
        while not holds(self.diagnostics.get(key, [])):
            self.take()
        return self.diagnostics[key]


def server_beside(binary):
    server = Path(binary).parent / "qrex-lsp"
    return str(server) if server.exists() else None


