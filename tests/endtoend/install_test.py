#!/usr/bin/env python3
"""The tool as it is installed: found by PATH alone, with its manual page and the completions of shells, as they are typed."""

import os
import pty
import select
import signal
import subprocess
import sys
import tempfile
import time
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import equal, holds, need, run_tests  # noqa: E402

INSTALLED = ["bin/Qrex", "share/qrex/templates/workspace/NAME.qrex", "share/doc/qrex/docs/tutorial.md", "share/man/man1/Qrex.1",
             "share/bash-completion/completions/Qrex", "share/zsh/vendor-completions/_Qrex"]
RUNTIME = ["share/qrex/runtime/Vesk/vxObject/IObject.h"]


def installed(test):
    """Runs it with the prefix of an installation and an empty folder."""
    def run(binary):
        need("cmake")
        with tempfile.TemporaryDirectory(prefix="qrex-install-") as folder:
            prefix, work = Path(folder) / "usr", Path(folder) / "work"
            work.mkdir()
            for component in ("tool", "runtime"):
                subprocess.run(["cmake", "--install", os.path.dirname(os.path.abspath(binary)), "--prefix", prefix, "--component",
                                component], check=True, stdout=subprocess.DEVNULL)
            test(prefix, work)
    run.__name__ = test.__name__
    return run


@installed
def components(prefix, work):
    equal([name for name in INSTALLED + RUNTIME if not (prefix / name).is_file()], [])


@installed
def first_workspace(prefix, work):
    environment = {"PATH": f"{prefix}/bin:/usr/bin:/bin"}
    for command in (["Qrex", "--init", "zoo"], ["Qrex", "zoo.qrex"]):
        folder = work / "zoo" if command[1] == "zoo.qrex" else work
        done = subprocess.run(command, cwd=folder, env=environment, stdin=subprocess.DEVNULL, capture_output=True, text=True)
        equal((done.returncode, done.stderr), (0, ""))
    programs = [path for path in (work / "zoo/out/lib").rglob("zoo_app") if path.is_file()]
    equal(len(programs), 1)
    equal(subprocess.run(programs, stdout=subprocess.DEVNULL).returncode, 0)


@installed
def manual_page(prefix, work):
    need("man")
    done = subprocess.run(["man", "-l", "--warnings=w", prefix / "share/man/man1/Qrex.1"], capture_output=True, text=True,
                          env={**os.environ, "MANWIDTH": "120", "LC_ALL": "C.UTF-8"})
    equal((done.returncode, done.stderr), (0, ""))
    holds(done.stdout, "Qrex --init NAME [FOLDER]", "modernCpp = false", "EXIT STATUS")


def debian_package(binary):
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
def bash_completion(prefix, work):
    need("bash")
    completions(["bash", "--norc", "--noprofile", "-i"], f"source {prefix}/share/bash-completion/completions/Qrex", work)


@installed
def zsh_completion(prefix, work):
    need("zsh")
    folder = prefix / "share/zsh/vendor-completions"
    completions(["zsh", "-f", "-i"], f"fpath=({folder} $fpath); autoload -U compinit; compinit -u -D", work)


run_tests([components, first_workspace, manual_page, debian_package, bash_completion, zsh_completion])
