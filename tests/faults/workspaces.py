"""The workspaces of the campaign, with scripts that stand for compilers and linkers: an object is its source, a library or
program is what went into it; and how the tool runs in them."""

import os
import subprocess
from pathlib import Path

from signals import PAUSE
from workspace_fixture import project, stand_ins, workspace_of


def run(binary, folder, *arguments, **environment):
    return subprocess.run([binary, *arguments], cwd=folder, stdin=subprocess.DEVNULL, stdout=subprocess.PIPE,
                          stderr=subprocess.STDOUT, timeout=60, env={**os.environ, **environment})


def build_library(folder, name):
    """A library to be preloaded, of a source beside this one."""
    library, source = folder / f"{name}.so", Path(__file__).resolve().parent / f"{name}.c"
    subprocess.run(["cc", "-shared", "-fPIC", "-O1", "-o", library, source, "-ldl"], check=True)
    return str(library)


# --- The gcc family

CLASSES = "".join(f"$struct+ S{i} {{ $int32 a; $int32 b; $int32 c; }};\n" for i in range(700))  # above 256 KiB of text


def gcc():
    tools = stand_ins("out=$object\n" + PAUSE, *["out=$target\n" + PAUSE] * 2)
    return {
        **workspace_of("Vesk/vxObject", "zoo", "app",
                       settings="makeExportedHeaderFilesReadOnly = true\nmakeTranslatedFilesReadOnly = true\n"),
        "tree/Vesk/vxObject/IObject.h": "namespace vesk { $interface+ IObject { }; $interface+ IPersistable : IObject { }; }\n",
        "tree/Vesk/vxObject/src/vxObject.cpp": '@import "Vesk/vxObject/IObject.h"\n',
        "tree/Vesk/vxObject/src/vxObject.qrpj": project("Static Library", "Vesk/vxObject", '"IObject.h" "src" { "vxObject.cpp" }'),
        "tree/zoo/src/zoo.qrpj": project("Static Library", "zoo", '"zoo.h" "big.h" "notes.txt" "src" { "zoo.cpp" "big.cpp" }'),
        "tree/zoo/zoo.h": '@import "Vesk/vxObject/IObject.h"\n@def legs = 4\n$enum+ Food { hay, fish };\n',
        "tree/zoo/big.h": '@import "Vesk/vxObject/IObject.h"\n' + CLASSES,
        "tree/zoo/notes.txt": "plain\n" * 3000,
        "tree/zoo/src/zoo.cpp": '@import "zoo/zoo.h"\nint legsOfAll = legs;\n',
        "tree/zoo/src/big.cpp": '@import "zoo/big.h"\n',
        "tree/app/src/app.qrpj": project("Console Application", "app", '"src" { "app.cpp" "more.cpp" }', 'subproj { "zoo" }'),
        "tree/app/src/app.cpp": '@import "zoo/zoo.h"\n$init { }\nint main() { return legs; }\n',
        "tree/app/src/more.cpp": "int more;\n",
        "tools/lead": '#!/bin/sh\n"$@"\n',
        **tools,
        "tools/gcc": tools["tools/gcc-4"],  # where the other is not found because of a fault
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
