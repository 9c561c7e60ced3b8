#!/usr/bin/env python3
"""Builds the examples with the tools of the gcc family, those with reflection against the runtime, and runs their
programs: by the tool itself and by make. The same sources and descriptions serve every compiler."""

import shutil
import xml.etree.ElementTree as XmlTree

from runtime_fixture import has_header
from workspace_fixture import COMPILERS, ROOT, Skipped, Workspace, equal, holds, lacks, need, run_tests

# Folder, name of the workspace, program. What it writes stands in expected.txt.
EXAMPLES = [("first", "first", "app"), ("evolution", "evolution", "notes"), ("shapes", "geometry", "app"), ("tour", "tour", "app")]


def expected(folder):
    return (ROOT / "examples" / folder / "expected.txt").read_text()


def copy(binary, folder):
    """A workspace with a copy of the example."""
    workspace = Workspace(binary, {})
    shutil.copytree(ROOT / "examples" / folder, workspace.folder, dirs_exist_ok=True,
                    ignore=shutil.ignore_patterns("out", "qrexsource", "x64", "*.guids"))
    for settings in workspace.folder.glob("*.qrex"):
        settings.write_text(settings.read_text().replace("../../runtime", str(ROOT / "runtime")))
    return workspace


def test_a_run_builds_them(binary):
    need("g++")
    for folder, name, program in EXAMPLES[:-1]:  # that of the tour stands in runtime_test.py
        with copy(binary, folder) as workspace:
            holds(workspace.run(f"{name}.qrex"), "Completed.")
            equal(workspace.shell(f"out/lib/x64/Debug/{program}"), expected(folder))


def test_make_builds_them(binary):
    need("g++", "make")
    for folder, name, program in EXAMPLES:
        with copy(binary, folder) as workspace:
            workspace.run(f"{name}.qrex", "mode=gen")
            for command in ("make", "make -j2") if folder == "first" else ("make -j2",):
                workspace.shell(command)
                equal(workspace.shell(f"out/lib/x64/Debug/{program}"), expected(folder))
                before = {**workspace.times("x64/**/*"), **workspace.times("out/lib/**/*")}
                lacks(workspace.shell("make"), "g++")
                equal(workspace.changed(before, "x64/**/*") + workspace.changed(before, "out/lib/**/*"), [])
                workspace.shell("make clean")
                equal([path for top in ("x64", "out/lib") for path in workspace.path(top).rglob("*") if path.is_file()], [])


def test_processes_call_each_other(binary):
    """A server and two clients, each a process of its own."""
    need("g++")
    if not has_header("boost/asio.hpp"):
        raise Skipped("boost/asio.hpp")
    with copy(binary, "remote") as workspace:
        holds(workspace.run("remote.qrex"), "Completed.")
        output = workspace.shell("""
            board=out/lib/x64/Debug/board
            $board serve port 2 > server.txt & server=$!
            $board post port Ada hello again > ada.txt & ada=$!
            $board post port Ben "" bye > ben.txt & ben=$!
            wait $ada && wait $ben && wait $server && cat ada.txt ben.txt server.txt""")
        holds(output, "Ada has 2 notes on the board\n",
              "Ben was refused: an empty note\nBen has 1 notes on the board\nrefused: an empty note\n",
              '"author": "Ben",\n      "text": "bye"\n')
        equal(output.count('"author": "Ada"'), 2)
        # Nobody listens any more.
        holds(workspace.shell("out/lib/x64/Debug/board post port Cy late", status=1), "board: cannot connect to 127.0.0.1: ")


def test_one_description_serves_every_compiler(binary):
    for folder, name, program in EXAMPLES + [("remote", "remote", "board")]:
        with copy(binary, folder) as workspace:
            for compiler in COMPILERS:
                for arguments in (["mode=gen"], ["translateOnly=true", "rebuildAll=true"]):
                    output = workspace.run(f"{name}.qrex", f"compiler={compiler}", *arguments)
                    holds(output, "\nCompleted.")
                    for word in ("Error", "ERROR", "arning"):
                        lacks(output, word)
                lacks(workspace.run(f"{name}.qrex", f"compiler={compiler}", "mode=gen"), "\nWriting ")
            generated = list(workspace.folder.iterdir())
            for path in generated:
                if path.suffix in (".vcproj", ".vcxproj", ".filters", ".cbp", ".workspace"):
                    XmlTree.parse(path)
            equal(len({path.suffix for path in generated} & {".dsp", ".vcproj", ".vcxproj", ".sln", ".cbp"}), 5)
            # Each has its own switches and none of another's.
            for suffix, own in ((".dsp", "/EHsc"), (".vcproj", 'ExceptionHandling="1"'), (".vcxproj", ">Sync<"),
                                (".cbp", '"-std=c++17"')):
                text = workspace.path(program + suffix).read_text(encoding="utf-8-sig")
                holds(text, own)
                assert suffix == ".cbp" or "-std" not in text and "ar rcs" not in text, text


run_tests(globals())
