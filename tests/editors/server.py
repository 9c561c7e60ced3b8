#!/usr/bin/env python3
"""Stands in for qrex-lsp: keeps open documents, calls `wrong` in one an error, answers the commands on generated text (upper
case, so that it tells what it was made of), and tells back how it was started."""

import json
import os
import re
import sys

documents, shown, started = {}, [], {}


def send(**message):
    text = json.dumps({"jsonrpc": "2.0", **message}).encode()
    sys.stdout.buffer.write(b"Content-Length: %d\r\n\r\n" % len(text) + text)
    sys.stdout.buffer.flush()


def generated(uri):
    return "// " + documents.get(uri, "from disk").upper()


def initialize(params):
    started.update(options=params.get("initializationOptions"), arguments=sys.argv[1:], folder=os.getcwd())
    commands = ["qrex.showGenerated", "qrex.hideGenerated", "test.state"]
    return {"capabilities": {  # more than it answers: so many features a client has to cope with
        "textDocumentSync": 1, "executeCommandProvider": {"commands": commands}, "codeActionProvider": True,
        "completionProvider": {"triggerCharacters": ["@", "$"]}, "definitionProvider": True, "documentSymbolProvider": True,
        "foldingRangeProvider": True, "hoverProvider": True, "inlayHintProvider": True, "referencesProvider": True,
        "renameProvider": {"prepareProvider": True}, "signatureHelpProvider": {"triggerCharacters": ["("]},
        "semanticTokensProvider": {"full": True, "legend": {"tokenModifiers": [], "tokenTypes": ["macro", "keyword"]}},
        "workspaceSymbolProvider": True}}


def execute(params):
    command, given = params["command"], params.get("arguments", [])
    if command == "test.state":
        return {"started": started, "shown": shown, "documents": list(documents)}
    uri = given[0]
    if uri in shown:
        shown.remove(uri)
    if command == "qrex.hideGenerated" or uri.endswith("none.cpp"):
        return None
    shown.append(uri)
    return {"uri": uri, "languageId": "cpp", "text": generated(uri)}


def change(uri, text, language=""):
    documents[uri] = text
    place = {"start": {"line": 0, "character": 0}, "end": {"line": 0, "character": 1}}
    errors = [{"range": place, "severity": 1, "source": "qrex", "message": f"wrong {language}".strip()}] if "wrong" in text else []
    send(method="textDocument/publishDiagnostics", params={"uri": uri, "diagnostics": errors})
    if uri in shown:
        send(method="qrex/generatedChanged", params={"uri": uri, "text": generated(uri)})


def opened(params):
    change(params["textDocument"]["uri"], params["textDocument"]["text"], params["textDocument"]["languageId"])


def changed(params):
    change(params["textDocument"]["uri"], params["contentChanges"][-1]["text"])


METHODS = {"initialize": initialize, "workspace/executeCommand": execute, "textDocument/didOpen": opened,
           "textDocument/didChange": changed}

while True:
    length = 0
    while (line := sys.stdin.buffer.readline().strip()):
        if match := re.fullmatch(rb"Content-Length: (\d+)", line, re.IGNORECASE):
            length = int(match[1])
    if not length:
        break
    message = json.loads(sys.stdin.buffer.read(length))
    if message.get("method") == "exit":
        break
    result = METHODS.get(message.get("method"), lambda _: None)(message.get("params"))
    if "id" in message and "method" in message:
        send(id=message["id"], result=result)
