"""A workspace in a temporary folder, runs of the tool in it, and the closing line of an end-to-end test."""

import functools
import os
import re
import shutil
import stat
import subprocess
import sys
import tempfile
import time
import traceback
from pathlib import Path

ROOT = Path(__file__).resolve().parents[2]
# A configuration for the tools of the gcc family; what is added behind it overrides.
SETTINGS = """virtualTree = { "tree" }
$EXPORT_LIB = "out/lib"
$EXPORT_TRANSLATED_INCLUDE = "out/include"
$EXPORT_UNTRANSLATED_INCLUDE = "out/source"
workspaces = { "all.qrws" }
compiler = gcc
systemName = "Linux"
config = "Debug"
platform = "x64"
PATH("x64") = { "tools" "/usr/local/bin" "/usr/bin" "/bin" }
INCLUDE("x64") = { "/usr/include" }
LIB("x64") = { "/usr/lib" }
"""

# A line of settings: the runtime is found.
RUNTIME = f'virtualTree += {{ "{ROOT / "runtime"}" }}\n'

# Compilers that keep what they made, where they are installed: no script compiles what another one has compiled.
CACHE = "/usr/lib/ccache"
if os.path.isdir(CACHE):
    os.environ.update(PATH=f"{CACHE}:{os.environ['PATH']}", CCACHE_BASEDIR=tempfile.gettempdir(), CCACHE_NOHASHDIR="1")
# A line of the command line: these compilers also where the settings name others.
CACHED = f'PATH("x64") = {{ "{CACHE}" "/usr/bin" "/bin" }}'

# The drive of all paths, where the tool of another system runs (tests/windows).
DRIVE = os.environ.get("QREX_DRIVE", "")
SENTENCES = {"Path not found.": "The system cannot find the path specified.", "Access denied.": "Access is denied.", f"{DRIVE}/": "/", "\r\n": "\n"}


def plain(text):
    """What the tool of any system has told, in the words of this one."""
    if not DRIVE:
        return text
    for theirs, ours in SENTENCES.items():
        text = text.replace(theirs, ours)
    text = re.sub(r"exception 0xC0DE00(\w\w)", lambda found: f"signal {int(found[1], 16)}", text)
    return re.sub(r"Return code : -(\d+)", lambda found: f"Return code : {128 + (-int(found[1]) & 0xFF)}", text)

def project(kind, root, files, statements=""):
    """The text of a project that is translated, with one configuration."""
    return f'$TARGET_TYPE = "{kind}"\n$ROOT_TO_PROJDIR = "{root}"\nconfig {{ "Debug|x64" }}\n{statements}\nqrex\n{{ {files} }}\n'


def workspace_of(*names, settings=""):
    """The files of a workspace of these projects but for their own."""
    listed = " ".join(f'"{name}"' for name in names)
    return {"all.qrex": SETTINGS + settings, "tree/.qrwsroot": "", "tree/all.qrws": f'"all" {{ {listed} }}\n'}


def stand_ins(compiling="", linking="", archiving=""):
    """Tools of the gcc family: an object is its source, a library or program what went into it. What runs ahead of a compilation
    has $object and $source, ahead of the others $target."""
    return {"tools/gcc-4": f"""#!/bin/bash
text=$(tr -d '\\r' < "${{2#@}}"); object=${{text#*-o \\"}}; object=${{object%%\\"*}}
source=${{text##* \\"}}; source=${{source%\\"*}}
{compiling}
cat "$source" > "$object"
""", "tools/ar": f"""#!/bin/sh
target=$2
{archiving}
cat $(tr -d '"\\r' < "${{3#@}}") > "$target"
""", "tools/g++": f"""#!/bin/sh
text=$(tr -d '"\\r' < "${{1#@}}"); set -- $text; target=$2; shift 2
{linking}
{{ echo "$text"; for word; do case $word in -*|*ORIGIN*) ;; *) [ -f "$word" ] && cat "$word" || exit 1;; esac; done; }} > "$target"
"""}


# The words of `compiler`, in their order.
COMPILERS = ["vc6", "vc8", "vc9", "vc10", "vc11", "vc12", "vc14", "gcc", "winegcc", "clang"]

# A program, a dynamic and a static library, which print "a $ debug 1 2".
PROJECT_HEAD = '$TARGET_TYPE = "{}"\n$ROOT_TO_PROJDIR = "{}"\n@import "common.inc"\n'
PROGRAM_FILES = {
    "all.qrex": SETTINGS,
    "tree/all.qrws": '"all" { "lib" "dll" "app" }\n',
    "tree/common.inc": 'config { "Debug|x64" "Release|x64" }\n+cpp { -std=c++17 -Wall -MMD -fPIC }\n',
    "tree/app/src/app.qrpj": PROJECT_HEAD.format("Console Application", "app") + 'subproj { "dll" "lib" }\nqrex\n'
                             '+cpp ("Debug") { -DKIND="a $ debug" }\n+cpp ("Release") { -O2 -DKIND="release" }\n'
                             '+link { -Wl,-z,now }\n{ "src" { "*.h" "*.cpp" } }\n',
    "tree/app/src/app.cpp": '@import "lib/lib.h"\n@import "dll/dll.h"\n@import "the kind.h"\n#include <cstdio>\n#define TEXT(x) #x\n'
                            '#define TEXT_OF(x) TEXT(x)\n'
                            'int main() { std::printf("%s %d %d\\n", TEXT_OF(KIND), lib(), dll()); }\n',
    "tree/app/src/the kind.h": "int kind();\n",
    "tree/app/src/the kind.cpp": '@import "the kind.h"\nint kind() { return 0; }\n',
    "tree/lib/src/lib.qrpj": PROJECT_HEAD.format("Static Library", "lib") + 'qrex\n{ "*.h" "src" { "*.cpp" } }\n',
    "tree/lib/lib.h": "int lib();\n",
    "tree/lib/src/lib.cpp": '@import "lib/lib.h"\nint lib() { return 1; }\n',
    "tree/dll/src/dll.qrpj": PROJECT_HEAD.format("Dynamic-Link Library", "dll") + 'qrex\n{ "*.h" "src" { "*.cpp" } }\n',
    "tree/dll/dll.h": "int dll();\n",
    "tree/dll/src/dll.cpp": '@import "dll/dll.h"\nint dll() { return 2; }\n',
}


def data(name):
    """A source that a test translates."""
    return (ROOT / "tests/endtoend/data" / name).read_text()


class Skipped(Exception):
    """A test needs a tool that is not installed; the text names it."""


class Workspace:
    def __init__(self, binary, files):
        self.binary = binary
        self.folder = Path(tempfile.mkdtemp(prefix="qrex-"))
        for name, text in files.items():
            self.write(name, text)

    def __enter__(self):
        return self

    def __exit__(self, *_):
        shutil.rmtree(self.folder, ignore_errors=True)

    def path(self, name):
        return self.folder / name

    def write(self, name, text):
        path = self.path(name)
        path.parent.mkdir(parents=True, exist_ok=True)
        path.write_bytes(text if isinstance(text, bytes) else text.encode())
        if text[:2] == "#!":
            path.chmod(path.stat().st_mode | stat.S_IXUSR)

    def append(self, name, text):
        with open(self.path(name), "a") as file:
            file.write(text)

    def replace(self, name, old, new):
        text = self.path(name).read_text()
        assert old in text, f"{old!r} does not stand in {name}"
        self.path(name).write_text(text.replace(old, new))

    def edit(self, name, old, new):
        """Replaces a text, later than all that was written before."""
        time.sleep(0.02)
        self.replace(name, old, new)

    def rewrite(self, name, text):
        """Writes a text, later than all that was written before."""
        time.sleep(0.02)
        self.write(name, text)

    def clean(self):
        """Removes all that builds have made."""
        self.shell("rm -rf x64 out qrexsource")

    def run(self, *arguments, status=0, **environment):
        """Runs the tool; its standard output. Fails on another exit status."""
        done = subprocess.run([self.binary, *arguments], cwd=self.folder, capture_output=True, text=True, timeout=900,
                              env={**os.environ, **environment})
        self.output = plain(done.stdout)
        assert done.returncode == status, f"status {done.returncode}, not {status}:\n{done.stdout}{done.stderr}"
        return self.output

    def shell(self, command, status=0, **environment):
        """Runs a shell command with the tool on PATH as `Qrex`; its output."""
        path = f"{Path(self.binary).parent}:{os.environ['PATH']}"
        done = subprocess.run(command, shell=True, cwd=self.folder, stdout=subprocess.PIPE, stderr=subprocess.STDOUT,
                              text=True, timeout=900, env={**os.environ, "PATH": path, **environment})
        assert done.returncode == status, f"{command}: status {done.returncode}:\n{done.stdout}"
        return plain(done.stdout)

    def times(self, pattern):
        """Name to modification time, of the files that the pattern matches."""
        return {str(path.relative_to(self.folder)): path.stat().st_mtime_ns for path in self.folder.glob(pattern)}

    def changed(self, before, pattern):
        """The files of the pattern that are new or younger than in `before`."""
        return sorted(name for name, time in self.times(pattern).items() if before.get(name) != time)


def contents(folder, *patterns):
    """Name to bytes, of the files that one of the patterns matches."""
    return {str(path.relative_to(folder)): path.read_bytes() for pattern in patterns for path in folder.glob(pattern)
            if path.is_file()}


def comparable(log):
    """A log without what differs from run to run."""
    return re.sub(r"\.{3,} *[\d.]+ ms|    hint: .*\n|argv\[\d+\] = .*\n", "", log)


def equal(got, expected):
    assert got == expected, f"got\n{got}\nnot\n{expected}"


def holds(text, *parts):
    """The parts stand in the text, in this order."""
    at = 0
    for part in parts:
        found = text.find(part, at)
        assert found >= 0, f"{part!r} does not stand (in this order) in\n{text}"
        at = found + len(part)


def lacks(text, part):
    assert part not in text, f"{part!r} stands in\n{text}"


def indented(page):
    """The indented blocks of a page, each with the line of text ahead of it."""
    found = re.findall(r"^(\S.*)\n\n((?:    .*\n|\n+(?=    ))+)", page, re.MULTILINE)
    return [(ahead, re.sub(r"^    ", "", block, flags=re.MULTILINE)) for ahead, block in found]


def install(binary, prefix):
    """The tool and its runtime, below a prefix."""
    command = ["cmake", "--install", os.path.dirname(os.path.abspath(binary)), "--prefix", prefix, "--component"]
    for component in ("tool", "runtime"):
        subprocess.run([*command, component], check=True, stdout=subprocess.DEVNULL)


def need(*tools):
    for tool in tools:
        if not shutil.which(tool):
            raise Skipped(tool)


def in_workspace(files, *tools):
    """Makes a test of a function of a workspace with these files (or what a call gives), and with the tools at hand."""
    def decorate(test):
        @functools.wraps(test)
        def run(binary):
            need(*tools)
            with Workspace(binary, files() if callable(files) else files) as workspace:
                test(workspace)
        return run
    return decorate


def run_tests(tests):
    """Calls with the binary each test, of a module's names those that begin with test_, or those that the command line names
    (numbers are a script's own); prints failures, skips and the closing line; ends the process."""
    if isinstance(tests, dict):
        tests = [test for name, test in tests.items() if name.startswith("test_")]
    binary = os.path.abspath(sys.argv[1])
    names = [argument for argument in sys.argv[2:] if not argument.isdigit()]
    passed = failed = skipped = 0
    for test in tests:
        if names and test.__name__ not in names:
            continue
        try:
            test(binary)
            passed += 1
        except Skipped as missing:
            print(f"skipped: {test.__name__}: {missing} is not installed")
            skipped += 1
        except Exception:
            print(f"FAILED: {test.__name__}")
            traceback.print_exc(file=sys.stdout)
            failed += 1
    print(f"{passed} passed, {failed} failed" + (f", {skipped} skipped" if skipped else ""))
    sys.exit(1 if failed else 0)
