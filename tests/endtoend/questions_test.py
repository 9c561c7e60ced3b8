#!/usr/bin/env python3
"""Questions to a workspace (--graph, --why, --reflect), asked as their users ask: answers go to Graphviz, to Python's json and to
the script of examples/reflect, and what --why foretells is compared with what the build then does."""

import json
import os
import subprocess
import sys
import time
from pathlib import Path

from workspace_fixture import ROOT, RUNTIME, data, equal, holds, in_workspace, lacks, project, run_tests, workspace_of

APP_FILES = '"src" { "a.h" "\u00e4 b.h" "b.cpp" "c.cpp" "app.cpp" }'
FILES = {
    **workspace_of("core", "app"),
    "tree/core/src/core.qrpj": project("Static Library", "core", '"core.h" "src" { "core.cpp" }'),
    "tree/core/core.h": "inline int core() { return 0; }\n",
    "tree/core/src/core.cpp": '@import "../core.h"\n',
    "tree/app/src/app.qrpj": project("Console Application", "app", APP_FILES, 'subproj { "core" }'),
    "tree/app/src/a.h": '@import "core/core.h"\n@import "\u00e4 b.h"\n',
    "tree/app/src/\u00e4 b.h": "inline int b() { return 0; }\n",
    "tree/app/src/b.cpp": '@import "\u00e4 b.h"\nint use_b() { return b(); }\n',
    "tree/app/src/c.cpp": "int c() { return 0; }\n",
    "tree/app/src/app.cpp": '@import "a.h"\nint main() { return core() + b(); }\n',
}
SOURCES = ("core/core.h", "core/src/core.cpp", "app/src/a.h", "app/src/\u00e4 b.h", "app/src/b.cpp", "app/src/c.cpp", "app/src/app.cpp")


def drawn(text):
    """Names and edges as Graphviz understands them."""
    graph = json.loads(subprocess.run(["dot", "-Tjson"], input=text, capture_output=True, text=True, check=True, timeout=60).stdout)
    names = [thing["name"] for thing in graph.get("objects", [])]
    nodes = {name for name in names if not name.startswith("cluster_")}
    return nodes, sorted((names[edge["tail"]], names[edge["head"]], edge.get("label", "")) for edge in graph.get("edges", []))


@in_workspace(FILES, "dot")
def test_graphs(workspace):
    """Graphviz draws what the JSON says; a file is found by each of its paths, and --depth ends the way."""
    before = workspace.times("**/*")
    b, a, app, core = "app/src/\u00e4 b.h", "app/src/a.h", "app/src/app.cpp", "core/core.h"
    imports = sorted([(app, a, ""), (a, core, ""), (a, b, ""), ("app/src/b.cpp", b, ""), ("core/src/core.cpp", core, "")])
    everything = set(SOURCES)
    for arguments, nodes, edges in [
            ([], {"core", "app"}, [("app", "core", "")]),
            (["projects", "--of", "tree/core/core.h"], {"core", "app"}, [("app", "core", "")]),
            (["imports"], everything, imports),
            (["imports", "--of", core], {core, "core/src/core.cpp", a, app}, [e for e in imports if b not in e]),
            (["imports", "--of", "tree/" + b, "--depth", "1"], {b, a, "app/src/b.cpp"}, [(a, b, ""), ("app/src/b.cpp", b, "")]),
            (["--depth", "0", "imports", "--of", str(workspace.folder.resolve() / "tree" / b)], {b}, []),
            (["imports", "--of", "qrexsource/x64/Debug/" + a, "--depth", "1"], {a, app, core, b},
             [e for e in imports if a in e])]:
        text = workspace.run("--graph", "all.qrex", *arguments)
        equal(drawn(text), (nodes, edges))
        told = json.loads(workspace.run("--graph", "X='y'", "all.qrex", *arguments, "--json", "jobs=2"))
        equal({node["id"] for node in told["nodes"]}, nodes)
        equal(sorted((edge["from"], edge["to"], edge.get("label", "")) for edge in told["edges"]), edges)
    holds(workspace.run("--graph", "all.qrex", "imports", "--of", b), f'"{b}" [penwidth=3]')
    equal(workspace.times("**/*"), before)


MODELS = {
    **FILES, **workspace_of("core", "app", settings=RUNTIME + 'workspaces += { "Vesk/vxObject" }\n'),
    "tree/app/src/app.qrpj": project("Console Application", "app", APP_FILES, 'subproj { "core" "Vesk/vxObject" }'),
    "tree/app/src/a.h": '@import "Vesk/vxObject/IObject.h"\nnamespace n {\n$enum Kind { low, high };\n'
                        '$struct Plain { $Kind kind; };\n$variant Either { Kind; int32; };\n}\n'
                        '$model Inner { n::Plain plain; };\n',
    "tree/app/src/app.cpp": '@import "a.h"\n$model Note\n{\n  xmap<int32,Inner> parts;\n  n::Either either;\n'
                            '  $dropped { int32 old; }\n  $schema { 1: +old 2: -old +parts +either }\n};\n'
                            '$class Page : model Note { };\nint main() { return 0; }\n',
}


@in_workspace(MODELS, "dot")
def test_models(workspace):
    edges = [("Inner", "n::Plain", "plain"), ("Note", "Inner", "parts"), ("Note", "n::Either", "either"), ("Page", "Note", "model"),
             ("n::Either", "n::Kind", "n::Kind"), ("n::Plain", "n::Kind", "kind")]
    equal(drawn(workspace.run("--graph", "all.qrex", "models")), ({e for edge in edges for e in edge[:2]}, edges))
    equal(drawn(workspace.run("--graph", "all.qrex", "models", "--of", "Inner", "--depth", "1")),
          ({"Inner", "Note", "n::Plain"}, edges[:2]))


REFLECTED = data("questions/reflected.h")


@in_workspace({**MODELS, "tree/app/src/a.h": REFLECTED, "tree/app/src/app.cpp": '@import "a.h"\nint main() { return 0; }\n'})
def test_declarations(workspace):
    before = workspace.times("**/*")
    text = workspace.run("--reflect", "all.qrex", "--json")
    told = json.loads(text)
    own = {}
    for thing in told["declarations"]:
        if thing["project"] == "app":
            own.setdefault(thing["name"], []).append(thing)
    places = {name: [(thing["kind"], thing["line"]) for thing in things] for name, things in own.items()}
    equal(places, {"geo::Side": [("enum", 4)], "geo::Point": [("struct", 9)], "geo::Move": [("function", 10), ("function", 11)],
                   "Note": [("model", 13)], "vesk::xvector<vesk::xvector<vesk::int32> >": [("type", 20)]})
    file = "tree/app/src/a.h"
    equal({thing["file"] for things in own.values() for thing in things}, {file})
    side, point, note = own["geo::Side"][0], own["geo::Point"][0], own["Note"][0]
    equal(side["metadata"], ["of a box", [1, -2.5, True], {"call": "Unit", "arguments": ["m", 3]}])
    equal([(label["name"], label["value"]) for label in side["labels"]], [("left", 3), ("right", 4)])
    equal(point["fields"][0]["metadata"], ['low < "high" \\ \t'])
    equal(point["fields"][1]["shape"], {"kind": "xmap", "key": {"kind": "string8"}, "of": {"kind": "enum", "name": "geo::Side"}})
    equal(point["fields"][2]["shape"], {"kind": "Array", "count": 3, "of": {"kind": "int32"}})
    equal([(a["name"], a["type"], a.get("default")) for a in own["geo::Move"][0]["arguments"]],
          [("from", "geo::Point const&", None), ("by", "vesk::int32", "1 + 2")])
    equal([thing.get("undefined") for thing in own["geo::Move"]], [True, True])
    equal(note["model"]["releases"], [{"release": 1, "drops": [], "adds": ["seconds"]}, {"release": 4, "drops": ["seconds"], "adds": ["text"]}])
    equal([(f["name"], f["added"], f.get("dropped")) for f in note["model"]["fields"]], [("seconds", 1, 4), ("text", 4, None)])
    equal(note["model"]["fields"][1]["evolve"], {"reads": ["seconds"], "code": 'text = seconds > 0 ? "late" : "";'})
    page = subprocess.run([sys.executable, ROOT / "examples/reflect/page.py"], input=text, capture_output=True, text=True, check=True).stdout
    holds(page, "## app", "### geo::Side", "| left | 3 |", "`geo::Point Move(geo::Point const& from, vesk::int32 by = 1 + 2)`",
          "| seconds | `vesk::int32` | 1 | 4 |", "| 4 | seconds | text |")
    holds(workspace.run("--reflect", "all.qrex"), file + ":4: $enum+ geo::Side\n", file + ":13: $model+ Note\n    1: +seconds\n    4: -seconds +text\n")
    equal(workspace.times("**/*"), before)


def answers(workspace, *lines):
    return {name: workspace.run("--why", f"tree/{name}", "all.qrex", *lines) for name in SOURCES}


def touch(workspace, name):
    time.sleep(0.02)
    os.utime(workspace.path(name))


@in_workspace(FILES, "g++")
def test_why_foretells_the_build(workspace):
    """What it calls stale is what the build then makes, and nothing else, edit by edit; the chain leads to the edit."""
    workspace.append("all.qrex", "diagnostics = true\n")
    out = "qrexsource/x64/Debug/"
    chain = "tree/app/src/app.cpp -> tree/app/src/a.h -> tree/core/core.h"
    edits = [
        ("nothing is built", lambda: None, [], ["no earlier build of it is known"]),
        ("nothing has changed", lambda: None, [], ["is up to date"]),
        ("a header of another project", lambda: touch(workspace, "tree/core/core.h"), [], ["tree/core/core.h is newer than", "\n    " + chain]),
        ("a translation is gone", lambda: workspace.path(out + "app/src/a.h").unlink(), [], ["would be compiled", "is missing", "app.cpp -> tree/app/src/a.h\n"]),
        ("an object is gone", lambda: workspace.path("x64/Debug/app/app.o").unlink(), [], ["compiled: x64/Debug/app/app.o is missing\n"]),
        ("a translation is newer", lambda: touch(workspace, out + "core/core.h"), [], ["the translation of tree/core/core.h is newer than x64", chain]),
        ("all is asked for", lambda: None, ["rebuildAll=true"], ["rebuildAll is set"]),
        ("prints are kept", lambda: None, ["fingerprints=true"], ["nothing is noted of what it was made from"]),
        ("a key has changed", lambda: None, ["fingerprints=true", "modernCpp=true"], ["with modernCpp=false, now there is modernCpp=true"]),
        ("an older file", lambda: os.utime(workspace.path("tree/app/src/a.h"), (1000, 1000)), ["fingerprints=true", "modernCpp=true"],
         ["tree/app/src/a.h is not the one that", "\n    tree/app/src/app.cpp -> tree/app/src/a.h\n"]),
    ]
    for name, edit, lines, expected in edits:
        edit()
        before = workspace.times("**/*")
        foretold = answers(workspace, *lines)
        equal(workspace.times("**/*"), before)
        holds(foretold["app/src/app.cpp"], *expected)
        log = workspace.run("all.qrex", *lines)
        translated = {line[2:] for line in log.splitlines() if line.startswith("* ")}
        objects = workspace.changed(before, "x64/**/*.o")
        compiled = {source for source in SOURCES if source.endswith(".cpp")
                    and f"x64/Debug/{source.split('/')[0]}/{Path(source).stem}.o" in objects}
        for source, answer in foretold.items():
            assert answer.startswith(f"tree/{source} would be translated") == (Path(source).name in translated), f"{name}: {answer}{log}"
            assert ("compiled" in answer) == (source in compiled), f"{name}: {answer}{log}"


@in_workspace({**MODELS, "tree/app/src/a.h": '@import "Vesk/vxObject/IObject.h"\n$enum+ Kind { one };\n', "tree/app/src/b.cpp": "\n",
               "tree/app/src/app.cpp": "int main() { return 0; }\n", "tree/app/src/c.cpp": '@import "a.h"\n'})
def test_why_records_move(workspace):
    """A source that is current by itself, and follows from what others declare."""
    workspace.run("all.qrex", "translateOnly=true")
    def why(name):
        return workspace.run("--why", name, "all.qrex", "translateOnly=true")
    holds(why("tree/app/src/app.cpp"), "up to date")
    workspace.rewrite("tree/app/src/b.cpp", '@import "a.h"\n$enum+ More { two };\n')
    holds(why("app/src/c.cpp"), "translated: records of a header come to it or leave it")
    holds(why("app/src/app.cpp"), "translated: what the other sources register has changed")
    workspace.run("all.qrex", "translateOnly=true")
    holds(why("app/src/app.cpp"), "up to date")


@in_workspace(FILES)
def test_what_cannot_be_answered(workspace):
    """Bad calls are told with their usage; errors of the workspace as a run tells them; nothing is written."""
    before = workspace.times("**/*")
    for arguments, told in [
            (["--graph", "all.qrex", "--of"], "FILE behind --of is missing\nUsage: Qrex --graph "),
            (["--graph", "all.qrex", "--of", "app", "--depth", "x"], "--depth takes a number, not x"),
            (["--graph", "all.qrex", "--depth", "1"], "--depth goes with --of FILE"),
            (["--graph", "all.qrex", "--frob"], "Unknown option --frob of --graph"),
            (["--reflect", "all.qrex", "--of", "app"], "Unknown option --of of --reflect"),
            (["--why"], "FILE is missing\nUsage: Qrex --why FILE "),
            (["--why", "none.h", "all.qrex"], "Error: none.h is no file that a build of this workspace translates"),
            (["--why", "tree/app/src/a.h", "all.qrex", 'config="Fast"'], "Error: There is no configuration Fast|x64 in project app"),
            (["--graph", "all.qrex", "--of", "none.h"], "Error: none.h is no file and no name in the graph of projects"),
            (["--graph", "all.qrex", "frobs"], "Syntax error"),
            (["--graph", "none.qrex"], "Couldn't open file none.qrex")]:
        lacks(workspace.run(*arguments, status=1).replace(told, "", 1), told)
        holds(workspace.output, told)
    workspace.append("tree/app/src/a.h", "@fail(\"no\")\n")
    run = workspace.run("all.qrex", "translateOnly=true", status=1)
    error = next(line for line in run.splitlines() if "a.h(3) : error" in line)
    before = workspace.times("**/*")
    for question in (["--graph", "all.qrex", "imports"], ["--graph", "all.qrex", "models"], ["--reflect", "all.qrex", "--json"]):
        holds(workspace.run(*question, status=1), error)
        holds(workspace.run(*question, "keepGoing=true", status=1), error)
    holds(workspace.run("--graph", "all.qrex"), '"app" -> "core"')  # which no source is asked for
    workspace.write("tree/core/src/core.qrpj", "what\n")
    holds(workspace.run("--graph", "all.qrex", status=1), "core.qrpj")
    equal(workspace.changed(before, "**/*"), ["tree/core/src/core.qrpj"])


run_tests(globals())
