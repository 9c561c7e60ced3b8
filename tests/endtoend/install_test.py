#!/usr/bin/env python3
"""The tool as it is installed: found by PATH alone, with its manual page and the completions of shells, as they are typed."""

import os
import pty
import re
import select
import shutil
import signal
import subprocess
import sys
import tempfile
import time
from pathlib import Path

from workspace_fixture import DRIVE, ROOT, equal, holds, install, lacks, need, run_tests

INSTALLED = ["bin/Qrex", "share/qrex/templates/workspace/NAME.qrex", "share/qrex/editors/vim/ftdetect/qrex.vim", "share/doc/qrex/docs/tutorial.md", "share/man/man1/Qrex.1",
             "share/bash-completion/completions/Qrex", "share/zsh/vendor-completions/_Qrex",
             "lib/cmake/Qrex/QrexConfig.cmake"]
RUNTIME = ["share/qrex/runtime/Vesk/vxObject/IObject.h", "lib/qrex/include/Vesk/vxObject/IObject.h",
           "share/qrex/runtime/debug/vesk_gdb.py", "share/qrex/runtime/debug/vesk.natvis",
           "lib/qrex/runtime/x64/Debug/libvxObject.a", "lib/qrex/runtime/x64/Release/libvxObject.a"]


def installed(test):
    """Runs it with the prefix of an installation and an empty folder."""
    def run(binary):
        need("cmake")
        with tempfile.TemporaryDirectory(prefix="qrex-install-") as folder:
            prefix, work = Path(folder) / "usr", Path(folder) / "work"
            work.mkdir()
            install(binary, prefix)
            test(prefix, work)
    run.__name__ = test.__name__
    return run


@installed
def test_components(prefix, work):
    equal([name for name in INSTALLED + RUNTIME if not (prefix / name).is_file()], [])
    logs = [path.read_text() for path in Path(sys.argv[1]).absolute().parent.glob("built/*/log")]
    equal((len(logs), [log for log in logs if "warning" in log]), (2, []))


PAGE = ROOT / "docs/install.md"


def alone(prefix):
    """An environment in which the installed tool is found, and little more."""
    bridges = {name: os.environ[name] for name in os.environ if DRIVE and name.startswith(("QREX_", "WINE"))}
    return {"PATH": f"{prefix}/bin:/usr/bin:/bin", **bridges}


def qrex(prefix, folder, *arguments, status=0):
    done = subprocess.run(["Qrex", *arguments], cwd=folder, env=alone(prefix), stdin=subprocess.DEVNULL,
                          capture_output=True, text=True)
    equal((done.returncode, done.stderr), (status, ""))
    return done.stdout


@installed
def test_first_workspace(prefix, work):
    """The steps of the page. The runtime comes built, for clang++ and make as well."""
    steps = re.search(r"\n\n((?:    .*\n)*    Qrex --init zoo\n(?:    .*\n)*)", PAGE.read_text()).group(1)
    environment = alone(prefix)
    output = subprocess.run(["bash", "-ec", steps], cwd=work, env=environment, check=True, capture_output=True, text=True).stdout
    holds(output, "[prepackaged - only processing headers]", "Completed....", "Leo had 4.5 kg, as release 1 tells\n")
    workspace, program = work / "zoo", work / "zoo/out/lib/x64/Debug/zoo_app"
    if shutil.which("clang++"):
        program.unlink()
        holds(qrex(prefix, workspace, "zoo.qrex", "compiler=clang", "rebuildAll=true"), "Completed....")
        subprocess.run(program, check=True, stdout=subprocess.DEVNULL)
    if shutil.which("make"):
        qrex(prefix, workspace, "zoo.qrex", "mode=gen")
        program.unlink()
        subprocess.run(["make", "d"], cwd=workspace, env=environment, check=True, stdout=subprocess.DEVNULL)
        subprocess.run(program, check=True, stdout=subprocess.DEVNULL)
    equal([str(path) for path in (workspace / "x64/Debug/vxObject").glob("*.o")], [])
    # An upgrade whose files are older than what was translated.
    (prefix / "lib/qrex/runtime/Vesk/vxObject/library.inc").write_text("#define VESK_LIBRARY_HEADERS 1\n")
    with open(workspace / "tree/zoo_core/src/zoo_core.cpp", "a") as source:
        source.write("int more;\n")
    holds(qrex(prefix, workspace, "zoo.qrex"), "These headers were translated for another build of the runtime", " errors")


@installed
def test_moved(prefix, work):
    """A workspace is translated by a tool elsewhere, and the runtime is that of this tool, built or not."""
    qrex(prefix, work, "--init", "zoo")
    lacks((work / "zoo/settings.inc").read_text(), str(work.parent))
    tool, checkout = work / "tools", work / "checked out/here"
    shutil.move(prefix, tool)
    shutil.copytree(work / "zoo", checkout)
    shutil.rmtree(work / "zoo")
    for argument, compiled in (("runtime=built", False), ("runtime=source", True), ('config="Profile"', True)):
        status = 1 if "Profile" in argument else 0  # a configuration that neither has
        output = qrex(tool, checkout, "zoo.qrex", "translateOnly=true", argument, status=status)
        equal("[prepackaged" in output, not compiled)
        equal(any(checkout.glob("qrexsource/x64/*/Vesk/vxObject/src/values.cpp")), compiled)
    (tool / "lib/qrex/runtime/release").write_text("1.0")
    holds(qrex(tool, checkout, "zoo.qrex", status=1), "ERROR:  The runtime in ", " is of release 1.0, this tool of ")
    shutil.rmtree(tool / "lib/qrex")
    lacks(qrex(tool, checkout, "zoo.qrex", "translateOnly=true"), "[prepackaged")


# What the built runtime says when it is compiled by these; nothing: that it fits.
MODES = [("g++ -std=c++17", ""), ("g++ -std=c++20 -O2", ""), ("clang++ -std=c++17", ""),
         ("g++ -std=c++17 -D_GLIBCXX_DEBUG", "The built runtime is not for _GLIBCXX_DEBUG: set runtime = source"),
         ("g++ -std=c++17 -D_GLIBCXX_USE_CXX11_ABI=0", "The built runtime is for _GLIBCXX_USE_CXX11_ABI=1: set runtime = source"),
         ("clang++ -std=c++17 -stdlib=libc++", "The built runtime is for libstdc++: set runtime = source")]


@installed
def test_what_does_not_fit_does_not_compile(prefix, work):
    def said(command):
        done = subprocess.run([*command.split(), "-fsyntax-only", "-x", "c++", "-I", prefix / "lib/qrex/include", "-"],
                              input="#include <Vesk/vxObject/Platform.h>\n", capture_output=True, text=True)
        error = re.search(r'#error "(.*?)"', done.stderr)
        return error.group(1) if error else done.stderr

    there = [(command, text) for command, text in MODES
             if subprocess.run([*command.split(), "-fsyntax-only", "-x", "c++", "-include", "set", "/dev/null"],
                               capture_output=True).returncode == 0]
    equal([(command, said(command)) for command, _ in there], there)
    header = prefix / "lib/qrex/include/Vesk/vxObject/Platform.h"
    header.write_text(re.sub("(#define VESK_VERSION) .*", r"\1 90000", header.read_text()))
    holds(said("g++ -std=c++17"), "The built runtime is of version ")


@installed
def test_manual_page(prefix, work):
    need("man")
    done = subprocess.run(["man", "-l", "--warnings=w", prefix / "share/man/man1/Qrex.1"], capture_output=True, text=True,
                          env={**os.environ, "MANWIDTH": "120", "LC_ALL": "C.UTF-8"})
    equal((done.returncode, done.stderr), (0, ""))
    holds(done.stdout, "Qrex --init NAME [FOLDER]", "modernCpp = false", "EXIT STATUS")


def test_debian_package(binary):
    need("cpack", "lintian", "dpkg-deb", "dpkg-shlibdeps")
    with tempfile.TemporaryDirectory(prefix="qrex-package-") as folder:
        subprocess.run(["cpack", "-G", "DEB", "-B", folder], cwd=os.path.dirname(os.path.abspath(binary)), check=True,
                       stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
        package, = Path(folder).glob("qrex_*.deb")
        checked = subprocess.run(["lintian", "--allow-root", "--fail-on", "error,warning", package], capture_output=True, text=True)
        equal((checked.returncode, checked.stdout), (0, ""))
        subprocess.run(["dpkg-deb", "-x", package, folder + "/root"], check=True)
        there = {str(path.relative_to(folder + "/root/usr")) for path in Path(folder + "/root").rglob("*")}
        equal([name for name in INSTALLED + RUNTIME if not {name, name + ".gz"} & there], [])


def typed(shell, setup, keys, work):
    """What a call of Qrex gets when this is typed into a shell on a terminal."""
    pid, terminal = pty.fork()
    if pid == 0:
        os.chdir(work)
        os.execvpe(shell[0], shell, {"PATH": os.environ["PATH"], "TERM": "dumb", "HOME": str(work), "PS1": "ready> "})
    output = b""

    def until(text):
        nonlocal output
        end = time.monotonic() + 60
        while text not in output:
            if time.monotonic() > end or not select.select([terminal], [], [], 60)[0]:
                raise AssertionError(f"no {text} in {output}")
            output += os.read(terminal, 4096)

    try:
        os.write(terminal, (setup + "; Qrex() { printf 'G''OT'; printf '<%s>' \"$@\"; }; printf 'be''gin'\n").encode())
        until(b"begin")
        for part in keys.split("\t"):
            os.write(terminal, part.encode())
            time.sleep(0.3)  # a shell that reads ahead takes a tabulator for a text that was pasted
            if part != keys.split("\t")[-1]:
                os.write(terminal, b"\t")
                time.sleep(0.3)
        os.write(terminal, b"; printf 'th''ere'\n")
        until(b"there")
        return output.split(b"GOT")[-1].split(b"there")[0].decode()
    finally:
        os.kill(pid, signal.SIGKILL)
        os.close(terminal)
        os.waitpid(pid, 0)


TYPED = [("--ve\t", "<--version>"), ("zo\t", "<zoo.qrex>"), ("zoo.qrex mode=ge\t", "<zoo.qrex><mode=gen>"),
         ("zoo.qrex trans\tt\t", "<zoo.qrex><translateOnly=true>"), ("fol\tin\t", "<folder/inner.qrex>")]


def completions(shell, setup, work):
    for name in ("zoo.qrex", "notes.txt", "folder/inner.qrex"):
        path = work / name
        path.parent.mkdir(exist_ok=True)
        path.touch()
    equal([(keys, typed(shell, setup, "Qrex " + keys, work)) for keys, _ in TYPED], TYPED)


@installed
def test_bash_completion(prefix, work):
    need("bash")
    completions(["bash", "--norc", "--noprofile", "-i"], f"source {prefix}/share/bash-completion/completions/Qrex", work)


@installed
def test_zsh_completion(prefix, work):
    need("zsh")
    folder = prefix / "share/zsh/vendor-completions"
    completions(["zsh", "-f", "-i"], f"fpath=({folder} $fpath); autoload -U compinit; compinit -u -D", work)


run_tests(globals())
