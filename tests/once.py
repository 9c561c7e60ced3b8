#!/usr/bin/env python3
"""Runs a script of tests, unless it has passed with all that it depends on as it is now: once.py SCRIPT BINARY [ARGUMENT...]

A script that passes leaves a stamp beside the binary. What it is skipped for is told, with status 77. With QREX_ANEW in the
environment it runs anyway."""

import hashlib
import os
import shutil
import subprocess
import sys
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent
# What scripts read, and the tools that they build with.
READ = ("CHANGELOG.md", "CMakeLists.txt", "HACKING.md", "README.md", "cmake", "docs", "examples", "runtime", "src", "templates",
        "tests/endtoend", "tests/faults", "tests/generators", "tests/once.py")
TOOLS = ("g++", "gcc", "cc", "ld", "ar", "make", "clang", "clang++", "lld-link", "llvm-lib", "setarch", "unshare", "python3",
         "cmake", "ninja", "meson", "cpack", "lintian", "man", "bash", "zsh", "chromium", "gdb", "openssl", "ccache", "distcc", "icecc", "sccache")
SKIPPED = 77


def state(binary):
    """A digest of the binary, of each file that scripts read, and of the tools' identities."""
    digest = hashlib.sha256()
    files = [file for name in READ for file in sorted((ROOT / name).rglob("*") if (ROOT / name).is_dir() else [ROOT / name])]
    for file in [Path(binary), *files]:
        if file.is_file() and "__pycache__" not in file.parts:
            content = file.read_bytes()
            digest.update(f"{file} {file.stat().st_mode} {len(content)}\n".encode() + content)
    for tool in TOOLS:
        path = os.path.realpath(shutil.which(tool) or tool)
        found = os.stat(path) if os.path.exists(path) else None
        digest.update(f"{path} {found and (found.st_size, found.st_mtime_ns)}\n".encode())
    return digest.hexdigest()


def main():
    script, binary, *arguments = sys.argv[1:]
    stamp = Path(binary).parent / "passed" / Path(script).stem
    now = " ".join([state(binary), *arguments])
    if stamp.exists() and stamp.read_text() == now and "QREX_ANEW" not in os.environ:
        print("Not run: it has passed, and nothing that it depends on has changed since")
        return SKIPPED
    stamp.unlink(missing_ok=True)
    status = subprocess.run([sys.executable, script, binary, *arguments]).returncode
    if status == 0 and state(binary) == now.partition(" ")[0]:
        stamp.parent.mkdir(exist_ok=True)
        stamp.write_text(now)
    return status


if __name__ == "__main__":
    sys.exit(main())
