#!/usr/bin/env python3
"""The language server, by a scripted editor, with the real clangd. Places are found by names."""

import os
import signal
import subprocess
from pathlib import Path
from random import Random

from lsp_fixture import Client, server_beside, uri_of
from workspace_fixture import DRIVE, RUNTIME, Skipped, Workspace, data, equal, holds, lacks, need, project, run_tests, workspace_of

HEADER = data("server/shape.h")
MAIN = data("server/app.cpp")
CODES = "namespace codes\n{\n$enum+ Code { fine, lost };\n}\n"
PLAIN = "tree/plain/src/plain.qrpj"
SHAPE, APP, PROJECT = "tree/app/src/shape.h", "tree/app/src/app.cpp", "tree/app/src/app.qrpj"
FILES = {
    **workspace_of("Vesk/vxObject", "codes", "plain", "app",
                   settings=RUNTIME + "translateOnly = true compilableText = true modernCpp = true\n"),
    SHAPE: HEADER, APP: MAIN, "tree/codes/api/codes.h": CODES, "tree/app/src/beside.h": "$enum+ Other { one };\n",
    "tree/codes/src/codes.qrpj": project("Static Library", "codes", '"api" { "codes.h" }'),
    PLAIN: project("Static Library", "plain", '"api" { "plain.h" }').replace("qrex\n", ""),
    "tree/plain/api/plain.h": "$enum+ Plain { yes };\n",
    PROJECT: project("Application", "app", '"src" { "shape.h" "app.cpp" }', 'subproj { "Vesk/vxObject" }')}


def session(*tools, **options):
    """Makes a test of a function of a client whose server works on FILES, of which nothing has been translated."""
    def decorate(test):
        def run(binary):
            need(*tools)
            if not server_beside(binary):
                raise Skipped("qrex-lsp")
            with Workspace(binary, FILES) as workspace:
                os.environ["XDG_CACHE_HOME"] = DRIVE + str(workspace.path("cache"))
                def there():
                    return sorted(p for p in workspace.folder.rglob("*") if "cache" not in p.parts)
                before = there()
                with Client(server_beside(binary), workspace.folder, **({} if tools else {"clangd": ""}), **options) as client:
                    test(client)
                    client.ask("shutdown", None)
                    client.tell("exit", None)
                    equal(client.process.wait(30), 0)
                equal(there(), before)
        run.__name__ = test.__name__
        return run
    return decorate


def errors(diagnostics):
    return [d["message"] for d in diagnostics if d["severity"] == 1]


@session()
def test_own_errors(client):
    """Errors of our languages at their words, while typing; they go when they are mended, also in what imports the file."""
    client.open(SHAPE)
    client.open(APP)
    client.edit(SHAPE, "$float64 width;", "$float46 width;")
    found = client.until(SHAPE, errors)
    equal(len(found), 1)
    holds(found[0]["message"], "float46")
    equal(client.text_of(SHAPE, found[0]["range"]), "float46")
    client.until(APP, lambda d: "shape.h" in str(d))  # it says which import has the error
    client.edit(SHAPE, "$float46", "$float64")
    client.until(SHAPE, lambda d: not d)
    client.until(APP, lambda d: not d)
    client.open(PROJECT)
    for name, right, wrong in ((APP, "twice(count)", "twice(count"), (PROJECT, '"app.cpp"', '"app.cpp')):
        client.edit(name, right, wrong)
        client.until(name, errors)
        client.edit(name, wrong, right)
        client.until(name, lambda d: not d)


@session()
def test_own_language(client):
    client.open(SHAPE)
    client.open(APP)
    at = client.ask("textDocument/definition", client.place(APP, "twice(count)", 2))
    equal([client.text_at(location)[:2] for location in at], [(SHAPE, "twice")])
    holds(client.ask("textDocument/hover", client.place(APP, "twice(count)"))["contents"]["value"], "here it gives", "((count) + (count))")
    at = client.ask("textDocument/definition", client.place(APP, '"shape.h"', 2))
    equal([location["uri"] for location in at], [uri_of(client.path(SHAPE))])
    at = client.ask("textDocument/definition", client.place(APP, "Circle"))
    holds(client.text_at(at[0])[2], "$class+ Circle")
    names = {s["name"] for s in client.ask("textDocument/documentSymbol", {"textDocument": {"uri": uri_of(client.path(SHAPE))}})}
    assert {"Shape", "Circle"} <= names, names
    equal({s["name"] for s in client.ask("workspace/symbol", {"query": "circ"})} & {"Shape", "Circle"}, {"Circle"})
    for typed, expected in (("@im", "import"), ("$cl", "class"), ("$struct X <<", "compare")):
        client.edit(SHAPE, "namespace geo", typed + "\nnamespace geo")
        words = {i["label"] for i in client.ask("textDocument/completion", client.place(SHAPE, typed, len(typed)))}
        assert expected in words, words
        client.edit(SHAPE, typed + "\n", "")
    client.open("all.qrex")
    words = {i["label"] for i in client.ask("textDocument/completion", client.place("all.qrex", "virtualTree", 3))}
    assert {"virtualTree", "lineDirectives"} <= words
    holds(client.ask("textDocument/hover", client.place("all.qrex", "virtualTree"))["contents"]["value"], "`virtualTree`: ")
    tokens = client.ask("textDocument/semanticTokens/full", {"textDocument": {"uri": uri_of(client.path(SHAPE))}})["data"]
    equal(tokens[:10], [0, 0, 7, 0, 0, 1, 0, 4, 0, 0])  # @import, @def
    folds = client.ask("textDocument/foldingRange", {"textDocument": {"uri": uri_of(client.path(SHAPE))}})
    assert {"startLine": 4, "endLine": HEADER.count("\n") - 2} in folds, folds
    shown = client.ask("workspace/executeCommand", {"command": "qrex.showGenerated", "arguments": [uri_of(client.path(APP))]})
    holds(shown["text"], '#include "shape.h"', "((count) + (count))")
    client.edit(APP, "count = 1", "count = 7")
    while not any(n["method"] == "qrex/generatedChanged" and "count = 7" in n["params"]["text"] for n in client.notes):
        client.take()


def fix(client, name, message, title):
    """Waits for an error with this text, and lets the server mend it as the title says."""
    found = next(d for d in client.until(name, lambda d: message in str(errors(d))) if message in d["message"])
    actions = client.ask("textDocument/codeAction", {"textDocument": {"uri": uri_of(client.path(name))}, "range": found["range"],
                                                     "context": {"diagnostics": [found]}})
    fits = [action for action in actions if action["title"] == title]
    assert fits, [action["title"] for action in actions]
    client.apply(fits[0])


@session()
def test_quick_fixes(client):
    """What messages name as a cure is an edit, of the source or of its project."""
    for name in (SHAPE, APP, PROJECT, PLAIN):
        client.open(name)
    client.edit(SHAPE, "$float64 width;", "$codes::Code code; $float64 width;")
    fix(client, SHAPE, "Unrecognised identifier : codes", 'add @import "codes/api/codes.h"')
    holds(client.texts[SHAPE], 'vxObject/IObject.h"\n@import "codes/api/codes.h"\n@def')
    for right, wrong in (("class", "clas"), ("float64", "flaot64"), ("compare", "comparr")):
        client.edit(SHAPE, right, wrong)
        fix(client, SHAPE, wrong, f"write {right}")
    client.until(SHAPE, lambda d: not d)
    client.edit(APP, '"shape.h"', '"shape.h"\n@import "beside.h"')
    fix(client, APP, "no project lists", f"list app/src/beside.h in {PROJECT}")
    holds(client.texts[PROJECT], '"src" { "beside.h" "shape.h"')
    client.until(APP, lambda d: not d)
    client.edit(APP, '@import "beside.h"', '@import "plain/api/plain.h"')
    fix(client, APP, "write qrex in", f"write qrex in {PLAIN}")
    holds(client.texts[PLAIN], '"plain"\nqrex\nconfig')
    client.until(APP, lambda d: not d)
    client.edit(PLAIN, "qrex\n", "")
    fix(client, APP, "subproj", f'write "plain" in {PROJECT}')
    holds(client.texts[PROJECT], 'subproj { "plain" "Vesk/vxObject" }')
    client.edit(PLAIN, "config", "qrex\nconfig")
    client.edit(APP, '@import "plain/api/plain.h"', '#include "beside.h"')
    fix(client, APP, "replaced by @import", "write @import")
    client.until(APP, lambda d: not d)
    client.open("all.qrex")
    client.edit("all.qrex", "translateOnly", "translateOnyl")
    fix(client, "all.qrex", "translateOnyl", "write translateOnly")
    client.until("all.qrex", lambda d: not d)


def cpp(client):
    """What clangd knows, at the places of the sources, behind characters of several bytes."""
    client.open(APP)
    client.open(SHAPE)
    at = client.ask("textDocument/definition", client.place(APP, "Getradius"))
    equal([client.text_at(location)[:2] for location in at], [(SHAPE, "radius")])
    holds(client.text_at(at[0])[2], "float64 radius;")
    at = client.ask("textDocument/definition", client.place(APP, "Area"))
    equal([client.text_at(location)[:2] for location in at], [(SHAPE, "Area")])
    hover = client.ask("textDocument/hover", client.place(APP, "size ="))
    holds(hover["contents"]["value"], "double")
    equal(client.text_of(APP, hover["range"]), "size")
    holds(client.ask("textDocument/hover", client.place(SHAPE, "result ="))["contents"]["value"], "float64", "result")
    client.edit(APP, "int count", "circle.\n    int count")
    found = client.ask("textDocument/completion", client.place(APP, "circle.\n", 7))["items"]
    assert any(i["label"].strip().startswith("Getradius") for i in found), [i["label"] for i in found][:20]
    # An editor that knows no snippets gets none: it would write what they hold.
    assert not any("(" in i["textEdit"]["newText"] for i in found), found
    client.edit(APP, "circle.\n    int count", "int count")
    changes = client.ask("textDocument/rename", {**client.place(APP, "count = 1"), "newName": "total"})["changes"]
    equal({client.text_of(APP, edit["range"]) for edit in changes[uri_of(client.path(APP))]}, {"count"})
    places = [client.text_at(location) for location in client.ask(
        "textDocument/references", {**client.place(APP, "size ="), "context": {"includeDeclaration": True}})]
    equal([text for _, text, _ in places], ["size", "size"])
    changes = client.ask("textDocument/rename", {**client.place(SHAPE, "result ="), "newName": "sum"})["changes"]
    equal(len(changes[uri_of(client.path(SHAPE))]), 2)
    holds(client.fail("textDocument/rename", {**client.place(SHAPE, "radius;"), "newName": "r"}), "generated")
    client.edit(APP, "size > 3", "size > undeclared_name")
    found = client.until(APP, errors)
    holds(found[0]["message"], "undeclared_name")
    equal(client.text_of(APP, found[0]["range"]), "undeclared_name")
    client.edit(APP, "undeclared_name", "3")
    client.until(APP, lambda d: not errors(d))
    # An edit of the header is known to its user at once, though nothing is saved.
    client.edit(SHAPE, "float64 radius;", "float64 radius; int32 corners;")
    client.edit(APP, "circle.Getradius()", "circle.Getcorners()")
    while not client.ask("textDocument/hover", client.place(APP, "Getcorners")):
        client.take()  # clangd works on it


@session("clangd-19")
def test_cpp_in_utf16(client):
    cpp(client)


@session("clangd-19", encoding="utf-8")
def test_cpp_in_utf8(client):
    equal(client.capabilities["positionEncoding"], "utf-8")
    cpp(client)


@session("clangd-19")
def test_dying_clangd(client):
    """It dies every 50 edits: it is started again, and knows what is open; who had asked is answered; errors go on."""
    client.open(APP)
    for turn in range(1, 201):
        client.edit(APP, f"count = {turn};", f"count = {turn + 1};")
        if turn % 50 > 0:
            continue
        holds(client.ask("textDocument/hover", client.place(APP, "size ="))["contents"]["value"], "double")
        children = subprocess.run(["pgrep", "-P", str(client.process.pid)], capture_output=True, text=True).stdout.split()
        equal(len(children), 1)
        waiting = client.start("textDocument/hover", client.place(APP, "size ="))
        os.kill(int(children[0]), signal.SIGKILL)
        client.wait(waiting)
        client.edit(APP, "size > 3", "size > lost")
        client.until(APP, lambda d: "lost" in str(errors(d)))
        client.edit(APP, "size > lost", "size > 3")
        client.until(APP, lambda d: not errors(d))
    holds(client.ask("textDocument/hover", client.place(APP, "size ="))["contents"]["value"], "double")


@session()
def test_rough_client(client):
    """Whatever comes, in whatever order: an answer or nothing, and it goes on."""
    client.open(APP)
    client.send_bytes(b"Content-Length: x\r\n\r\nContent-Length: 3\r\n\r\n{]}Content-Type: y\r\n\r\n" + b"junk" * 3000 + b"\r\n\r\n")
    for params in (None, [], 5, {"textDocument": 3}, {"textDocument": {"uri": 5}}, {"textDocument": {"uri": "untitled:x"}}):
        for method in ("hover", "definition", "completion", "rename", "documentSymbol", "semanticTokens/full", "codeAction", "inlayHint"):
            client.start(f"textDocument/{method}", params)
        for method in ("didOpen", "didChange", "didClose", "didSave"):
            client.tell(f"textDocument/{method}", params)
    for line, column in ((-5, -5), (10**9, 10**9), (2, 10**15), (0.5, "x")):
        client.start("textDocument/hover", {"textDocument": {"uri": uri_of(client.path(APP))}, "position": {"line": line, "character": column}})
    holds(client.fail("no/such", {}), "no/such")
    for text in ("", "\0\xff\n@def(", "$class A : model {", "@import \"", "/*", 'R"(', "@if(", "$" * 5000, "{" * 5000):
        client.rewrite(APP, text)
        client.ask("textDocument/documentSymbol", {"textDocument": {"uri": uri_of(client.path(APP))}})
    client.rewrite(APP, MAIN)
    at = client.ask("textDocument/definition", client.place(APP, "twice(count)", 2))
    equal(len(at), 1)
    lacks(str(client.diagnostics.get(str(client.path(APP)))), "'severity': 1")


PIECES = ["\n", " ", "{", "}", ";", "$", "@", '"', "*/", "/*", "$struct+ S { $int32 n; };\n", "$enum+ E { one, two };\n", "@def m(x) = x + 1\n",
          "int i = m(2);\n", '@import "shape.h"\n', "// ü😀\n", "geo::Shape other;\n", "$float64 depth;\n", "twice(1)", "$$", "@if (1)\n{\n}\n"]


def state(client):
    """What the server makes of the open texts."""
    made = {}
    for name in (SHAPE, APP):
        shown = client.ask("workspace/executeCommand", {"command": "qrex.showGenerated", "arguments": [uri_of(client.path(name))]})
        client.ask("workspace/executeCommand", {"command": "qrex.hideGenerated", "arguments": [uri_of(client.path(name))]})
        told = [d["message"] for d in client.diagnostics.get(str(client.path(name)), []) if d["source"] == "qrex"]
        made[name] = (told, None if told else shown["text"])  # with errors, the last good one
    return made


@session()
def test_random_edits(client):
    """Whatever the way to them, texts give what they give to a fresh server; and the server does not grow."""
    random = Random(4711)
    client.open(SHAPE)
    client.open(APP)
    sizes, compared = [], 0
    for turn in range(1, 3001):
        name = random.choice((SHAPE, APP))
        text = client.texts[name]
        if turn % 3 == 0 or len(text) > 3000:
            text = {SHAPE: HEADER, APP: MAIN}[name]
        at = random.randrange(len(text) + 1)
        cut = random.choice((0, 0, 0, 1, 5, 40))
        client.rewrite(name, text[:at] + random.choice(PIECES) + text[at + cut:])
        if turn % 20 == 0:
            made = state(client)
            with Client(client.process.args[0], client.folder, clangd="") as fresh:
                for other in (SHAPE, APP):
                    fresh.open(other, client.texts[other])
                expected = state(fresh)
            for other in (SHAPE, APP):
                equal(made[other], expected[other])
                compared += made[other][1] is not None
        if turn in (1000, 3000):
            status = Path(f"/proc/{client.process.pid}/status").read_text()
            sizes.append(int(status[status.index("VmRSS:") + 6:].split()[0]))
    assert compared > 10, compared
    keeps_what_is_freed = b"__asan_init" in Path(client.process.args[0]).read_bytes()
    assert keeps_what_is_freed or sizes[1] < sizes[0] + 10_000, sizes


run_tests(globals())
