"""The world of tests on whole runs: a tree of one project, runs in it, and what stands there afterwards."""

import functools
import os
import shutil
import stat
import subprocess
import sys
import tempfile
import time
from pathlib import Path

from workspace_fixture import plain, run_tests

BINARY = os.path.abspath(sys.argv[1])
CONFIG = '''virtualTree = { "tree" }
$EXPORT_LIB = "out/lib"
$EXPORT_TRANSLATED_INCLUDE = "out/tinc"
$EXPORT_UNTRANSLATED_INCLUDE = "out/uinc"
workspaces = { "ws/all.qrws" }
config = "Debug"
platform = "x64"
translateOnly = true
compiler = gcc
PATH("x64") = { "/usr/bin" "/bin" }
INCLUDE("x64") = { "inc" }
LIB("x64") = { "lib" }
'''
HEAD = '$TARGET_TYPE = "Static Library"\n$ROOT_TO_PROJDIR = "app"\n'
PROJECT = HEAD + 'config { "Debug|x64" }\nqrex\n'
FILES = {
    'main.qrex': CONFIG,
    'tree/.qrwsroot': '',
    'tree/ws/all.qrws': '"all" { "app" }\n',
    'tree/app/src/app.qrpj': PROJECT + '{ "a.h" "b.h" "c.h" "n.txt" "src" { "x.cpp" "y.cpp" "app.cpp" } }\n',
    'tree/app/a.h': '$enum+ A { a1 };\n',
    'tree/app/b.h': '@import "a.h"\nint b;\n',
    'tree/app/c.h': 'int c;\n',
    'tree/app/n.txt': 'n\n',
    'tree/app/src/x.cpp': '@import "app/b.h"\n@import "app/a.h"\n$init { }\nint x;\n',
    'tree/app/src/y.cpp': '@import "app/c.h"\nint y;\n',
    'tree/app/src/app.cpp': 'int app;\n',
}
DEPENDENCIES = 'qrexsource/x64/Debug/app.qrexdep'
TRANSLATED = 'qrexsource/x64/Debug/app/'
EACH_RUN = {DEPENDENCIES, 'projects.guids'}  # written by every run
JUNK = bytes(range(256)) * 8


def write(path, content):
    Path(path).parent.mkdir(parents=True, exist_ok=True)
    Path(path).write_bytes(content if isinstance(content, bytes) else content.encode())


def read(path):
    return Path(path).read_bytes()


def write_tree(changes={}, age=3600):
    """The standard tree with changes (None: left out), all of it written some time ago."""
    for path, content in {**FILES, **changes}.items():
        if content is not None:
            write(path, content)
    then = time.time() - age
    for path in files_of('.'):
        os.utime(path, (then, then))


def run(*arguments, status=0):
    """Runs the tool; what it printed."""
    done = subprocess.run([BINARY, *(arguments or ['main.qrex'])], stdout=subprocess.PIPE, stderr=subprocess.STDOUT, timeout=60)
    text = plain(done.stdout.decode(errors='replace'))
    assert done.returncode == status, f'status {done.returncode}, not {status}, of {arguments}:\n{text}'
    return text


def expect(condition, what):
    assert condition, what


def files_of(*folders):
    return sorted(os.path.relpath(os.path.join(folder, name)) for top in folders
                  for folder, _, names in os.walk(top) for name in names)


def leftovers():
    return [path for path in files_of('.') if path.endswith('.part')]


def contents(*folders):
    return {path: read(path) for path in files_of(*folders)}


def times(*folders):
    return {path: os.stat(path).st_mtime_ns for path in files_of(*folders)}


def changed(before, after):
    return sorted(path for path in {**before, **after} if before.get(path) != after.get(path))


def is_read_only(path):
    return not os.stat(path).st_mode & (stat.S_IWUSR | stat.S_IWGRP | stat.S_IWOTH)


def edit(path, content=None):
    """Changes a source, later than all that was written before."""
    time.sleep(0.02)
    write(path, read(path) + b'// edited\n' if content is None else content)


def in_folder(test):
    """The test as a function that works in a temporary folder."""
    @functools.wraps(test)
    def run_there(_):
        home, folder = os.getcwd(), tempfile.mkdtemp(prefix='qrex-')
        os.chdir(folder)
        try:
            test()
        finally:
            os.chdir(home)
            shutil.rmtree(folder, ignore_errors=True)
    return run_there


def run_named(tests):
    """Runs the functions of a module whose names begin with test_."""
    run_tests({name: in_folder(test) for name, test in tests.items() if name.startswith('test_')})
