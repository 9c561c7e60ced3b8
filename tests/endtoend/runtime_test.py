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


# An object whose class only inherits being one.
INHERITED = """#include "check/src/nodes.h"
struct More : Kept { std::string text; };
vesk::ptr<vesk::IObject> More() { return new struct More(); }
"""

# Names that a C header may have, and warnings that are the user's.
NEIGHBOUR = """extern "C" { typedef long long int64; typedef unsigned char uint8; }
#include "check/src/nodes.h"
vesk::int64 Sum(vesk::int64 a, ::vesk::uint8 b) { return a + b; }
"""


def test_every_kind(binary):
    with build(binary, HERE / "runtime" / "tree", "all.qrws") as workspace:
        output = workspace.shell("out/lib/x64/Debug/check")
        holds(output, " checks, 0 failures\n", "last\n")
        assert int(output.split()[-5]) > 250, output
        for compiler in ("g++", "clang++"):
            need(compiler)
            compile_one = f"{compiler} -std=c++17 -fsyntax-only -Dshapes_API= -Iqrexsource/x64/Debug -Wno-deprecated-declarations "
            workspace.write("inherited.cpp", INHERITED)
            holds(workspace.shell(compile_one + "inherited.cpp", status=1), "archived, collected and destroyed as that base")
            workspace.write("neighbour.cpp", NEIGHBOUR)
            workspace.shell(compile_one + "-Wall -Werror neighbour.cpp")
        # What generated text is warned of: the comparison of structs in variants, what is passed by [copy].
        compile_with_clang(workspace, ["Vesk/vxObject", "shapes", "kinds", "check"],
                           "-Dshapes_API= -Wno-logical-op-parentheses -Wno-deprecated-declarations")


def test_tour(binary):
    with build(binary, TOUR / "tree", "tour.qrws") as workspace:
        equal(workspace.shell("out/lib/x64/Debug/app"), (TOUR / "expected.txt").read_text())
        compile_with_clang(workspace, ["orders1", "orders", "app"], "-Wno-deprecated-declarations")


def test_byte_order(binary):
    """Scalars are little-endian in archives; the forced switch turns them around, both ways."""
    need("g++")
    settings = SETTINGS + (f'virtualTree += {{ "{ROOT / "runtime"}" }} workspaces = {{ "order.qrws" }} '
                           'translateOnly = true')
    with Workspace(binary, {"all.qrex": settings}) as workspace:
        shutil.copytree(HERE / "runtime" / "tree", workspace.path("tree"))
        workspace.run("all.qrex")
        root = "qrexsource/x64/Debug"
        compiler = f"g++ -std=c++17 -Wall -Werror -I{root} {root}/order/src/order.cpp {root}/Vesk/vxObject/src/vxObject.cpp"
        plain = workspace.shell(f"{compiler} -o plain && ./plain").splitlines()
        swapped = workspace.shell(f"{compiler} -DVESK_SWAP_SCALARS -o swapped && ./swapped").splitlines()
        one = ",".join(["0"] * 15)
        equal(plain, ["[254]", "[1]", "[2,1]", "[4,3,2,1]", "[254,255,255,255,255,255,255,255]", f"[1,{one}]",
                      "[0,0,0,0,0,0,240,63]", "[2,97,98]", "[2,97,0,97,0]", "[2,1,0,2,0]", "[2,1,0,2,0]", "[1,1,0,0,0]",
                      "[1,3,0,1,99]", "numbers[300]", "nested[k][300]"])
        equal(swapped, ["[254]", "[1]", "[1,2]", "[1,2,3,4]", "[255,255,255,255,255,255,255,254]", f"[{one},1]",
                        "[63,240,0,0,0,0,0,0]", "[2,97,98]", "[2,0,97,0,97]", "[2,0,1,0,2]", "[2,0,1,0,2]", "[1,0,0,0,1]",
                        "[1,0,3,1,99]", "numbers[300]", "nested[k][300]"])


if __name__ == "__main__":
    run_tests([test_every_kind, test_tour, test_byte_order])
