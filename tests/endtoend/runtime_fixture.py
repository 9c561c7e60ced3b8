"""Trees that are translated and built against the runtime: what the tests of the runtime share."""

import shutil
import subprocess
from pathlib import Path

from workspace_fixture import CACHE, ROOT, RUNTIME, SETTINGS, Workspace, equal, holds, lacks, need, project, workspace_of

TREE = ROOT / "tests/endtoend/runtime/tree"
TOUR = ROOT / "examples" / "tour"
# Tests that need no other command use this one: the first of them leaves the library's object in the cache.
PLAIN = "g++ -std=c++17 -Wall -Werror -fPIC -fno-gnu-unique"
# The sources of the library.
LIBRARY = ("vxObject", "values")


def copy(binary, tree, workspace_file, keys):
    settings = SETTINGS.replace('"tools"', f'"{CACHE}"') + RUNTIME + f'workspaces = {{ "{workspace_file}" }} {keys}'
    workspace = Workspace(binary, {"all.qrex": settings})
    shutil.copytree(tree, workspace.path("tree"))
    return workspace


def build(binary, tree, workspace_file, keys=""):
    """A workspace with a copy of the tree, built without a warning."""
    need("g++")
    workspace = copy(binary, tree, workspace_file, keys)
    holds(workspace.run("all.qrex"), "\nCompleted..")
    for word in (" : warning ", " warning: ", " error: ", " : error "):
        lacks(workspace.output, word)
    return workspace


def translate(binary, workspace_file, keys="", tree=TREE):
    """A workspace with a copy of the tree, translated; the folder of what comes of it."""
    workspace = copy(binary, tree, workspace_file, "translateOnly = true " + keys)
    workspace.run("all.qrex")
    write_library(workspace)
    return workspace, "qrexsource/x64/Debug"


def translated_shop(binary, keys, main, header):
    """A workspace with the translated project `app`, of a source and `shop.h`, and the library."""
    described = project("Application", "app", '"src" { "shop.h" "app.cpp" }', 'subproj { "Vesk/vxObject" }')
    files = {**workspace_of("Vesk/vxObject", "app", settings=f"{RUNTIME}translateOnly = true compilableText = true {keys}"),
             "tree/app/src/shop.h": header, "tree/app/src/app.cpp": main, "tree/app/src/app.qrpj": described}
    workspace = Workspace(binary, files)
    workspace.run("all.qrex")
    return workspace


def write_library(workspace):
    """The library as one source, whose compilation takes the time of one."""
    workspace.write("library.cpp", "".join(f'#include "Vesk/vxObject/src/{name}.cpp"\n' for name in LIBRARY))


def link(workspace, compiler, sources, program, switches=""):
    """The program of these sources, which get the switches as well, and of the library. Each is compiled by a command of its
    own, as the cache wants it."""
    root = "qrexsource/x64/Debug"
    objects = []
    for source in [*sources, "library.cpp"]:
        project = Path(source).parts[len(Path(root).parts):-2]
        include = "".join(f"-I{Path(root, *folder)} " for folder in ([], project, [*project, "src"]))
        objects.append(f"{len(objects)}.o")
        workspace.shell(f"{compiler} {include} -c {source} -o {objects[-1]} {switches if source != 'library.cpp' else ''}")
    workspace.shell(f"{compiler} {' '.join(objects)} -o {program} {switches}")


def run_tour(binary, compiler):
    workspace, root = translate(binary, "tour.qrws", tree=TOUR / "tree")
    with workspace:
        sources = [source for project in ("orders1", "orders", "app")
                   for source in sorted(workspace.path(f"{root}/{project}/src").glob("*.cpp"))]
        link(workspace, compiler, [source.relative_to(workspace.folder) for source in sources], "tour")
        equal(workspace.shell("./tour 2>&1"), (TOUR / "expected.txt").read_text())


def has_header(name):
    return subprocess.run(["g++", "-E", "-x", "c++", "-include", name, "/dev/null"], capture_output=True).returncode == 0
