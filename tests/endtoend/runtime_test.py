#!/usr/bin/env python3
"""Translates a source of every kind and variation, builds it with g++ against the runtime, and runs what comes of it;
the same for the tour. clang++ compiles the same text without a complaint."""

import os
import re
import shutil
import subprocess
import sys
from concurrent.futures import ThreadPoolExecutor
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import SETTINGS, Skipped, Workspace, equal, holds, lacks, need, run_tests  # noqa: E402

HERE = Path(__file__).resolve().parent
ROOT = HERE.parent.parent
TOUR = ROOT / "examples" / "tour"


def build(binary, tree, workspace_file, keys=""):
    """A workspace with a copy of the tree, built without a warning."""
    need("g++")
    workspace = Workspace(binary, {"all.qrex": SETTINGS + f'virtualTree += {{ "{ROOT / "runtime"}" }} '
                                              f'workspaces = {{ "{workspace_file}" }} {keys}'})
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


def translate(binary, workspace_file, keys="", tree=HERE / "runtime" / "tree"):
    """A workspace with a copy of the tree, translated; the folder of what comes of it."""
    settings = SETTINGS + (f'virtualTree += {{ "{ROOT / "runtime"}" }} workspaces = {{ "{workspace_file}" }} '
                           f'translateOnly = true {keys}')
    workspace = Workspace(binary, {"all.qrex": settings})
    shutil.copytree(tree, workspace.path("tree"))
    workspace.run("all.qrex")
    write_library(workspace)
    return workspace, "qrexsource/x64/Debug"


# What every program needs of the library; the rest is for values by name and JSON.
LIBRARY = ("byte_code", "graph", "layout", "models", "objects", "registry", "releases", "remote", "sources", "stack", "vxObject")
VALUES = ("access", "containers", "json_reader", "json_scalars", "json_scanner", "json_text", "json_writer", "value_types")


def write_library(workspace, sources=LIBRARY):
    """The library as one source, whose compilation takes the time of one."""
    workspace.write("library.cpp", "".join(f'#include "Vesk/vxObject/src/{name}.cpp"\n' for name in sources))


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

# Loads plug-ins and unloads them. "own": the program holds a copy of their project itself.
HOST = """#include "twice/twice.h"
#include <dlfcn.h>
#include <cstdio>

void Register_Project_twice();

template <typename Function>
Function* Symbol(void* module, const char* name) { return reinterpret_cast<Function*>(dlsym(module, name)); }

const char* Found()
{
    vesk::ReflectedClass const* record = vesk::Find<vesk::ReflectedClass>("Twice");
    return record ? record->m_name : "none";
}

int main()
{
#ifdef OWN
    Register_Project_twice();
#endif
    void* modules[2];
    for (int i = 0; i < 2; ++i)
    {
        modules[i] = dlopen(i == 0 ? "./a.so" : "./b.so", RTLD_NOW | RTLD_LOCAL);
        if (!modules[i]) return std::puts(dlerror());
        Symbol<void()>(modules[i], "Load")();
        vesk::AnyInterface any;
        Symbol<void(vesk::AnyInterface*)>(modules[i], "Make")(&any);
        const vesk::ptr<vesk::IObject> object(any);
#ifdef OWN
        const vesk::ptr<ITwice> twice = vesk::QueryInterface<ITwice>(object);
        std::printf("%d ", twice ? twice->Number() : 0);
#endif
        object->DestroyObject();
    }
    std::printf("%s", Found());
    dlclose(modules[0]);
    std::printf(" %s", Found());
    Symbol<void()>(modules[1], "Unload")();
    std::printf(" %s\\n", Found());
    dlclose(modules[1]);
}
"""


def test_every_kind(binary):
    with build(binary, HERE / "runtime" / "tree", "all.qrws") as workspace:
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
    with build(binary, HERE / "runtime" / "tree", "compilable.qrws", "compilableText = true modernCpp = true") as workspace:
        holds(workspace.shell("out/lib/x64/Debug/compilable"), " checks, 0 failures\n")
        compile_with_clang(workspace, ["compilable"], "-Wno-logical-op-parentheses -Wno-deprecated-declarations")
        read_as_visual_cpp(workspace, "compilable")


def test_tour(binary):
    with build(binary, TOUR / "tree", "tour.qrws") as workspace:
        equal(workspace.shell("out/lib/x64/Debug/app"), (TOUR / "expected.txt").read_text())
        compile_with_clang(workspace, ["orders1", "orders", "app"], "-Wno-deprecated-declarations")


def run_tour(binary, compiler):
    workspace, root = translate(binary, "tour.qrws", tree=TOUR / "tree")
    with workspace:
        for project in ("orders1", "orders", "app"):
            workspace.shell(f"{compiler} -c -I{root} -I{root}/{project} -I{root}/{project}/src {root}/{project}/src/*.cpp")
        workspace.shell(f"{compiler} -I{root} *.o library.cpp -o tour")
        equal(workspace.shell("./tour 2>&1"), (TOUR / "expected.txt").read_text())


def test_undefined_behaviour(binary):
    """A $dep bool is copied ahead of its first value (docs/runtime.md), which -fsanitize=bool would tell."""
    need("g++")
    run_tour(binary, "g++ -std=c++17 -g1 -fsanitize=address,undefined -fno-sanitize=bool -Wall -Werror "
                     "-Wno-deprecated-declarations")


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
        for source in ("kinds/src/kinds.cpp", "check/src/bare.cpp"):
            workspace.shell(f"{compiler} -Dshapes_API= -I{root} -fsyntax-only {root}/{source}")


def test_byte_order(binary):
    """Scalars are little-endian in archives; the forced switch turns them around, both ways."""
    need("g++")
    workspace, root = translate(binary, "order.qrws")
    with workspace:
        compiler = f"g++ -std=c++17 -Wall -Werror -I{root} {root}/order/src/order.cpp library.cpp"
        plain = workspace.shell(f"{compiler} -o plain && ./plain").splitlines()
        swapped = workspace.shell(f"{compiler} -DVESK_SWAP_SCALARS -o swapped && ./swapped").splitlines()
        one = ",".join(["0"] * 15)
        equal(plain, ["[254]", "[1]", "[2,1]", "[4,3,2,1]", "[254,255,255,255,255,255,255,255]", f"[1,{one}]",
                      "[0,0,0,0,0,0,240,63]", "[2,97,98]", "[2,97,0,97,0]", "[2,1,0,2,0]", "[2,1,0,2,0]", "[1,1,0,0,0]",
                      "[1,3,0,1,99]", "numbers[300]", "nested[k][300]"])
        equal(swapped, ["[254]", "[1]", "[1,2]", "[1,2,3,4]", "[255,255,255,255,255,255,255,254]", f"[{one},1]",
                        "[63,240,0,0,0,0,0,0]", "[2,97,98]", "[2,0,97,0,97]", "[2,0,1,0,2]", "[2,0,1,0,2]", "[1,0,0,0,1]",
                        "[1,0,3,1,99]", "numbers[300]", "nested[k][300]"])


def test_ipc(binary):
    """Scions: results, errors, and bytes behind the arguments."""
    workspace, root = translate(binary, "ipc.qrws", "compilableText = true")
    with workspace:
        source = f"{root}/ipc/src/ipc.cpp"
        for compiler in ("g++", "clang++"):
            need(compiler)
            workspace.shell(f"{compiler} -std=c++17 -O2 -Wall -Werror -I{root} {source} library.cpp -o ipc")
            equal(workspace.shell("./ipc"), "12 a!\ntimes\ncaught times\nread beyond the end of an archive\n"
                                            "bytes behind the arguments\nno such remote method\n9\n")


def run_with_thread_sanitizer(binary, name, output, more_library=()):
    need("g++", "setarch")
    workspace, root = translate(binary, f"{name}.qrws")
    with workspace:
        write_library(workspace, (*LIBRARY, *more_library))
        workspace.shell(f"g++ -std=c++17 -g1 -O1 -fsanitize=thread -Wno-tsan -I{root} -I{root}/Vesk/vxObject/src "
                        f"{root}/{name}/src/{name}.cpp library.cpp -o {name} -lpthread")
        # Some kernels place the program where the sanitizer wants its own memory.
        equal(re.sub(r"(?m)^ +a", "a", workspace.shell(f"setarch -R ./{name}")), output)


def test_threads(binary):
    """A graph, archives, a connection and JSON in each thread do not meet those of others; all print whole lines, if
    with an indentation of another one's."""
    run_with_thread_sanitizer(binary, "threads", "a line\n" * 80 + "flush left\n0 0 0 0 0\n", VALUES)


def has_asio():
    command = ["g++", "-E", "-x", "c++", "-include", "boost/asio.hpp", "/dev/null"]
    return subprocess.run(command, capture_output=True).returncode == 0


def test_headers(binary):
    """Each public header of the library can be the first and only one."""
    need("g++")
    workspace, root = translate(binary, "order.qrws")
    with workspace:
        headers = sorted(path.name for path in workspace.path(f"{root}/Vesk/vxObject").glob("*.h"))
        assert len(headers) > 30, headers
        if not has_asio():
            headers.remove("SocketChannel.h")

        def errors_of(header):
            done = subprocess.run(["g++", "-std=c++17", "-fsyntax-only", "-w", f"-I{root}", "-xc++", "-"], cwd=workspace.folder,
                                  input=f'#include "Vesk/vxObject/{header}"\n', capture_output=True, text=True)
            return "" if done.returncode == 0 else f"{header}: {done.stderr[:500]}\n"
        with ThreadPoolExecutor(os.cpu_count()) as pool:
            equal("".join(pool.map(errors_of, headers)), "")


def test_sockets(binary):
    """A server in one thread, stopped by another, and its clients in threads of their own; clients that leave or flood,
    no descriptors, methods that serve or call while they are called."""
    need("g++")
    if not has_asio():
        raise Skipped("boost/asio.hpp")
    run_with_thread_sanitizer(binary, "sockets", "100\n")


def test_memory(binary):
    """Each allocation of a scenario fails in turn: nothing is lost, destroyed twice or left wrong."""
    need("g++")
    workspace, root = translate(binary, "memory.qrws", "compilableText = true")
    with workspace:
        write_library(workspace, (*LIBRARY, *VALUES))
        sources = sorted(workspace.path(f"{root}/memory/src").glob("*.cpp"))
        workspace.write("all.cpp", "".join(f'#include "{source}"\n' for source in [*sources, "library.cpp"]))
        workspace.shell(f"g++ -std=c++17 -g1 -fsanitize=address,undefined -I. -I{root} all.cpp -o memory")
        holds(workspace.shell("./memory"), " runs, 0 failures\n")


def test_modules(binary):
    """Two plug-ins and a program that hold copies of one project."""
    need("g++")
    workspace, root = translate(binary, "twice.qrws")
    with workspace:
        compiler = f"g++ -std=c++17 -Wall -Werror -fPIC -fno-gnu-unique -I{root}"
        objects = f"{root}/twice/src/twice.cpp library.o"
        workspace.shell(f"{compiler} -c library.cpp")
        workspace.write("host.cpp", HOST)
        workspace.shell(f"{compiler} -shared {objects} -o a.so && cp a.so b.so")
        # A program that exports nothing has a registry of its own; its records and those of the plug-ins are copies.
        workspace.shell(f"{compiler} -DOWN host.cpp {objects} -o own")
        equal(workspace.shell("./own"), "7 7 Twice Twice Twice\n")
        # One that exports its symbols has the registry of all.
        workspace.shell(f"{compiler} -rdynamic host.cpp library.o -o host")
        equal(workspace.shell("./host"), "Twice Twice none\n")


if __name__ == "__main__":
    run_tests([test_every_kind, test_compilable_text, test_tour, test_undefined_behaviour, test_libcxx, test_byte_order, test_ipc,
               test_headers, test_threads, test_sockets, test_memory, test_modules])
