"""The workspaces of the campaign, with scripts that stand for compilers and linkers: an object is its source, a library or
program is what went into it; and how the tool runs in them."""

import os
import subprocess
from pathlib import Path

from signals import PAUSE
from workspace_fixture import SETTINGS


def run(binary, folder, *arguments, **environment):
    return subprocess.run([binary, *arguments], cwd=folder, stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                          stderr=subprocess.STDOUT, timeout=60, env={**os.environ, **environment})


def build_library(folder, name):
    """A library to be preloaded, of a source beside this one."""
    library = folder / f"{name}.so"
    subprocess.run(["cc", "-shared", "-fPIC", "-O1", "-o", library, Path(__file__).resolve().parent / f"{name}.c", "-ldl"], check=True)
    return str(library)


# --- The gcc family

COMPILER = """#!/bin/sh
eval set -- $(tr -d '\\r' < "${2#@}")
while [ $# -gt 1 ]; do [ "$1" = -o ] && out=$2; shift; done
""" + PAUSE + """cp "$1" "$out" && chmod u+w "$out"
"""
LIBRARIAN = """#!/bin/sh
eval set -- "$2" $(tr -d '\\r' < "${3#@}")
out=$1; shift
""" + PAUSE + """cat "$@" > "$out"
"""
LINKER = """#!/bin/sh
eval set -- $(tr -d '\\r' < "${1#@}")
while [ $# -gt 0 ]; do case "$1" in -o) out=$2; shift;; -Xlinker) shift;; -*) ;; *) in="$in $1";; esac; shift; done
""" + PAUSE + """cat $in > "$out"
"""
CLASSES = "".join(f"$struct+ S{i} {{ $int32 a; $int32 b; $int32 c; }};\n" for i in range(700))  # above 256 KiB of text


def project(target, files, extra=""):
    return (f'$TARGET_TYPE = "{target}"\n$ROOT_TO_PROJDIR = "@dirname"\nqrex\nconfig {{ "Debug|x64" }}\n'
            f"{extra}{files}\n")


def gcc():
    library = project("Static Library", '{ "zoo.h" "big.h" "notes.txt" "src" { "zoo.cpp" "big.cpp" } }')
    program = project("Console Application", '{ "src" { "app.cpp" "more.cpp" } }', 'subproj { "zoo" }\n')
    return {
        "all.qrex": SETTINGS + 'makeExportedHeaderFilesReadOnly = true\nmakeTranslatedFilesReadOnly = true\n',
        "tree/.qrwsroot": "",
        "tree/all.qrws": '"all" { "Vesk/vxObject" "zoo" "app" }\n',
        "tree/Vesk/vxObject/IObject.h": "namespace vesk { $interface+ IObject { }; $interface+ IPersistable : IObject { }; }\n",
        "tree/Vesk/vxObject/src/vxObject.cpp": '@import "Vesk/vxObject/IObject.h"\n',
        "tree/Vesk/vxObject/src/vxObject.qrpj": project("Static Library", '{ "IObject.h" "src" { "vxObject.cpp" } }')
        .replace("@dirname", "Vesk/vxObject"),
        "tree/zoo/src/zoo.qrpj": library.replace("@dirname", "zoo"),
        "tree/zoo/zoo.h": '@import "Vesk/vxObject/IObject.h"\n@def legs = 4\n$enum+ Food { hay, fish };\n',
        "tree/zoo/big.h": '@import "Vesk/vxObject/IObject.h"\n' + CLASSES,
        "tree/zoo/notes.txt": "plain\n" * 3000,
        "tree/zoo/src/zoo.cpp": '@import "zoo/zoo.h"\nint legsOfAll = legs;\n',
        "tree/zoo/src/big.cpp": '@import "zoo/big.h"\n',
        "tree/app/src/app.qrpj": program.replace("@dirname", "app"),
        "tree/app/src/app.cpp": '@import "zoo/zoo.h"\n$init { }\nint main() { return legs; }\n',
        "tree/app/src/more.cpp": "int more;\n",
        "tools/lead": '#!/bin/sh\n"$@"\n',
        "tools/gcc-4": COMPILER,
        "tools/gcc": COMPILER,  # where the other is not found because of a fault
        "tools/ar": LIBRARIAN,
        "tools/g++": LINKER,
    }


# --- The Visual C++ family, with a resource, an assembler's source and a manifest

# A compiler that cannot write says so, and takes away what it began.
WRITES = """cp "%s" "$out" && chmod u+w "$out" || { rm -f "$out"; echo "x(1) : fatal error C1085: cannot write $out"; exit 2; }
"""
RESPONSE = 'eval set -- $(tr -d "\\r" < "${RSP#@}" | tr ";#" "  ")\n'
VISUAL_TOOLS = {
    "cl": 'RSP=$2\n' + RESPONSE + """while [ $# -gt 1 ]; do case "$1" in /Fo*) out=${1#/Fo};; esac; shift; done
out=$out$(basename "$1" .cpp).obj
""" + PAUSE + WRITES % "$1",
    "ml64": 'for RSP; do :; done\n' + RESPONSE + """out=${1#/Fo}$(basename "$2" .asm).obj
""" + PAUSE + WRITES % "$2",
    "rc.exe": """for in; do case "$in" in /fo*) out=${in#/fo};; esac; done
""" + PAUSE + """cp "$in" "$out" && chmod u+w "$out"
""",
    "lib.exe": 'RSP=$1\n' + RESPONSE + """for in; do case "$in" in /OUT:*) out=${in#/OUT:};; /*) ;; *) all="$all $in";; esac; done
""" + PAUSE + """cat $all > "$out"
""",
    "link.exe": 'RSP=$1\n' + RESPONSE + """for in; do case "$in" in
  /OUT:*) out=${in#/OUT:};; /MANIFESTFILE:*) manifest=${in#/MANIFESTFILE:};; /*) ;; *) all="$all $in";;
esac; done
""" + PAUSE + """echo manifest > "$manifest" && cat $all > "$out"
""",
    "mt.exe": 'RSP=$1\n' + RESPONSE + """out=${1#/outputresource:}
""" + PAUSE + """for manifest; do :; done
cat "$manifest" >> "$out"
""",
}


def visual():
    result = gcc()
    del result["tools/gcc-4"], result["tools/gcc"], result["tools/ar"], result["tools/g++"]
    result.update({f"tools/{name}": "#!/bin/sh\n" + script for name, script in VISUAL_TOOLS.items()})
    result["all.qrex"] += 'PATH("Win64") = { "tools" "/usr/bin" "/bin" } INCLUDE("Win64") = { "inc" } LIB("Win64") = { "lib" }\n'
    out = '/OUT:"$(EXPORT_LIB)/$(PLATFORM)/$(CONFIG)/$(PROJNAME).'
    manifest = '/MANIFEST /MANIFESTFILE:"$(PLATFORM)/$(CONFIG)/$(PROJNAME)/$(PROJNAME).exe.intermediate.manifest"'
    for path in [path for path in result if path.endswith(".qrpj")]:
        switches = f'{out}lib"' if "Static Library" in result[path] else f'{out}exe" {manifest}'
        result[path] = (result[path].replace('config { "Debug|x64" }', f'config {{ "Debug|Win64" }}\n+link {{ {switches} }}')
                        .replace('"more.cpp"', '"more.cpp" "app.rc" "twice.asm"'))
    result["tree/app/src/app.rc"] = "1 VERSIONINFO\n"
    result["tree/app/src/twice.asm"] = "END\n"
    return result
