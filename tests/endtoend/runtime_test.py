#!/usr/bin/env python3
"""Translates a source of every kind and variation, builds it with g++ against the runtime, and runs what comes of it;
the same for the tour. clang++ compiles the same text without a complaint."""

import shutil
import sys
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import SETTINGS, Workspace, equal, holds, lacks, need, run_tests  # noqa: E402

HERE = Path(__file__).resolve().parent
ROOT = HERE.parent.parent
TOUR = ROOT / "examples" / "tour"


def build(binary, tree, workspace_file):
    """A workspace with a copy of the tree, built without a warning."""
    need("g++")
    workspace = Workspace(binary, {"all.qrex": SETTINGS + f'virtualTree += {{ "{ROOT / "runtime"}" }} '
                                              f'workspaces = {{ "{workspace_file}" }}'})
    shutil.copytree(tree, workspace.path("tree"))
    holds(workspace.run("all.qrex"), "\nCompleted..")
    for word in (" : warning ", " warning: ", " error: ", " : error "):
        lacks(workspace.output, word)
    return workspace


def compile_with_clang(workspace, projects, flags):
    """Checks the translated sources of the projects, all warnings being errors."""
    need("clang++")
    root = "qrexsource/x64/Debug"
    for project in projects:
        include = f"-I{root} -I{root}/{project} -I{root}/{project}/src"
        for source in sorted(workspace.path(f"{root}/{project}/src").glob("*.cpp")):
            workspace.shell(f"clang++ -std=c++17 -fsyntax-only -Wall -Werror {flags} {include} {source}")


def test_every_kind(binary):
    with build(binary, HERE / "runtime" / "tree", "all.qrws") as workspace:
        output = workspace.shell("out/lib/x64/Debug/check")
        holds(output, " checks, 0 failures\n")
        assert int(output.split()[-4]) > 150, output
        # What generated text is warned of: the comparison of structs in variants, what is passed by [copy].
        compile_with_clang(workspace, ["Vesk/vxObject", "shapes", "kinds", "check"],
                           "-Dshapes_API= -Wno-logical-op-parentheses -Wno-deprecated-declarations")


def test_tour(binary):
    with build(binary, TOUR / "tree", "tour.qrws") as workspace:
        equal(workspace.shell("out/lib/x64/Debug/app"), (TOUR / "expected.txt").read_text())
        compile_with_clang(workspace, ["orders1", "orders", "app"], "-Wno-deprecated-declarations")


if __name__ == "__main__":
    run_tests([test_every_kind, test_tour])
