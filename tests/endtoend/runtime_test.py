#!/usr/bin/env python3
"""Translates a source of every kind and variation, builds it with g++ against the runtime, and runs what comes of it;
the same for the tour. clang++ compiles the same text without a complaint."""

import os
import re
import subprocess
from concurrent.futures import ThreadPoolExecutor

from runtime_fixture import TOUR, TREE, build, has_header, run_tour, translate
from workspace_fixture import Skipped, equal, holds, need, run_tests


def compile_with_clang(workspace, projects, flags):
    """Checks the translated sources of the projects, all warnings being errors."""
    need("clang++")
    root = "qrexsource/x64/Debug"
    for project in projects:
        include = f"-I{root} -I{root}/{project} -I{root}/{project}/src"
        for source in sorted(workspace.path(f"{root}/{project}/src").glob("*.cpp")):
            workspace.shell(f"clang++ -std=c++17 -fsyntax-only -Wall -Werror {flags} {include} {source}")


def read_as_visual_cpp(workspace, project):
    """Parses the translated sources as Visual C++ does. The headers of the system are not made for that target: what is
    found in them does not count."""
    listing = subprocess.run(["g++", "-xc++", "-E", "-v", "/dev/null"], capture_output=True, text=True).stderr
    system = [f"-isystem{folder}" for folder in re.findall(r"^ (/\S*include\S*)$", listing, re.MULTILINE)]
    root = workspace.path("qrexsource/x64/Debug")
    for source in sorted((root / project / "src").glob("*.cpp")):
        command = ["clang++", "-std=c++17", "-fsyntax-only", "-w", "-ferror-limit=0", "-D_GNU_SOURCE", f"-I{root}", *system,
                   "--target=x86_64-pc-windows-msvc", "-fms-compatibility", "-fdelayed-template-parsing", source]
        errors = subprocess.run(command, capture_output=True, text=True).stderr
        ours = re.findall(rf"^{root}/.* error: .*$", errors, re.MULTILINE)
        assert not ours, "\n".join(ours[:20])


# An object whose class only inherits being one.
INHERITED = """#include "check/src/nodes.h"
struct More : Kept { std::string text; };
vesk::ptr<vesk::IObject> More() { return new struct More(); }
"""

# Names that a C header may have.
NEIGHBOUR = """extern "C" { typedef long long int64; typedef unsigned char uint8; }
#include "check/src/nodes.h"
vesk::int64 Sum(vesk::int64 a, ::vesk::uint8 b) { return a + b; }
"""

def test_every_kind(binary):
    with build(binary, TREE, "all.qrws") as workspace:
        output = workspace.shell("out/lib/x64/Debug/check")
        holds(output, " checks, 0 failures\n", "last\n")
        assert int(output.split()[-5]) > 250, output
        for compiler in ("g++", "clang++"):
            need(compiler)
            compile_one = (f"{compiler} -std=c++17 -fsyntax-only -Dshapes_API= -Iqrexsource/x64/Debug "
                           "-Wno-deprecated-declarations ")
            workspace.write("inherited.cpp", INHERITED)
            holds(workspace.shell(compile_one + "inherited.cpp", status=1),
                  "archived, collected and destroyed as that base")
            workspace.write("neighbour.cpp", NEIGHBOUR)
            workspace.shell(compile_one + "-Wall -Werror neighbour.cpp")
        # What generated text is warned of: the comparison of structs in variants, what is passed by [copy].
        compile_with_clang(workspace, ["Vesk/vxObject", "shapes", "kinds", "check"],
                           "-Dshapes_API= -Wno-logical-op-parentheses -Wno-deprecated-declarations")


def test_compilable_text(binary):
    """What does not compile without the key: with g++, with clang++, and with clang++ as Visual C++ reads it."""
    with build(binary, TREE, "compilable.qrws", "compilableText = true modernCpp = true") as workspace:
        holds(workspace.shell("out/lib/x64/Debug/compilable"), " checks, 0 failures\n")
        compile_with_clang(workspace, ["compilable"], "-Wno-logical-op-parentheses -Wno-deprecated-declarations")
        read_as_visual_cpp(workspace, "compilable")


def test_tour(binary):
    with build(binary, TOUR / "tree", "tour.qrws") as workspace:
        equal(workspace.shell("out/lib/x64/Debug/app"), (TOUR / "expected.txt").read_text())
        compile_with_clang(workspace, ["orders1", "orders", "app"], "-Wno-deprecated-declarations")


def test_libcxx(binary):
    """Another standard library: the tour runs, and each kind of type is registered."""
    need("clang++")
    compiler = "clang++ -stdlib=libc++ -std=c++17 -Wall -Werror -Wno-logical-op-parentheses -Wno-deprecated-declarations"
    if subprocess.run([*compiler.split(), "-xc++", "-include", "set", "/dev/null", "-o", "/dev/null", "-shared"],
                      capture_output=True).returncode != 0:
        raise Skipped("libc++")
    run_tour(binary, compiler)
    workspace, root = translate(binary, "all.qrws")
    with workspace:
        for source in ("kinds/src/kinds.cpp", "check/src/reflection.cpp"):
            workspace.shell(f"{compiler} -Dshapes_API= -I{root} -fsyntax-only {root}/{source}")


def test_headers(binary):
    """Each public header of the library can be the first and only one."""
    need("g++")
    workspace, root = translate(binary, "order.qrws")
    with workspace:
        headers = sorted(path.name for path in workspace.path(f"{root}/Vesk/vxObject").glob("*.h"))
        assert len(headers) > 30, headers
        over_streams = {"SocketChannel.h", "StreamChannel.h", "StreamServer.h", "LocalSocketChannel.h", "TlsChannel.h", "Inspector.h",
                        "InspectorServer.h"}
        if not has_header("boost/asio.hpp"):
            headers = [header for header in headers if header not in over_streams]
        elif not has_header("openssl/ssl.h"):
            headers.remove("TlsChannel.h")

        def errors_of(header):
            done = subprocess.run(["g++", "-std=c++17", "-fsyntax-only", "-w", f"-I{root}", "-xc++", "-"], cwd=workspace.folder,
                                  input=f'#include "Vesk/vxObject/{header}"\n', capture_output=True, text=True)
            return "" if done.returncode == 0 else f"{header}: {done.stderr[:500]}\n"
        with ThreadPoolExecutor(os.cpu_count()) as pool:
            equal("".join(pool.map(errors_of, headers)), "")


run_tests(globals())
