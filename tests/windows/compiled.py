"""What `Qrex.exe` has translated, compiled for Windows by the g++ of mingw-w64, and run."""

import contextlib
import re
import shutil
import subprocess
import sys
import tempfile
from concurrent.futures import ThreadPoolExecutor
from pathlib import Path

from common import ROOT, WINE, WRAPPER, Count, run, text_of

sys.path.insert(0, str(ROOT / "tests/endtoend"))
from runtime_fixture import link, translate  # noqa: E402

COMPILER = [*(["ccache"] if shutil.which("ccache") else []), "x86_64-w64-mingw32-g++-posix", "-std=c++17", "-w", "-D_WIN32_WINNT=0x0A00"]
LIBRARIES = ["-static", "-lws2_32", "-lmswsock"]


@contextlib.contextmanager
def example(name):
    """A copy of it, with the runtime where it looks for that."""
    folder = Path(tempfile.mkdtemp(prefix=f"{name}-"))
    try:
        shutil.copytree(ROOT / "examples" / name, folder / "examples" / name)
        shutil.copytree(ROOT / "runtime", folder / "runtime")
        yield folder / "examples" / name
    finally:
        shutil.rmtree(folder, ignore_errors=True)


def must(command, place):
    done = run(command, cwd=place)
    assert done.returncode == 0, f"{command}\n{text_of(done)[-3000:]}"
    return text_of(done)


def with_boost(place):
    """Of Boost the headers are all that is needed, but none of their neighbours."""
    (place / "headers").mkdir()
    (place / "headers/boost").symlink_to("/usr/include/boost")
    return "-Iheaders"


def compile_all(place, configuration, program):
    must([WRAPPER, configuration, "translateOnly=true"], place)
    translated = place / "qrexsource/x64/Debug"
    includes = [with_boost(place), *(f"-I{folder}" for folder in [translated, *sorted(path for path in translated.rglob("*") if path.is_dir())])]
    sources = sorted(translated.rglob("*.cpp"))
    with ThreadPoolExecutor(2) as pool:
        list(pool.map(lambda source: must([*COMPILER, *includes, "-c", str(source), "-o", f"{source}.o"], place), sources))
    must([*COMPILER, *(f"{source}.o" for source in sources), *LIBRARIES, "-o", program], place)


def equal(got, expected):
    assert got == expected, f"got\n{got}\nnot\n{expected}"


def tour():
    with example("tour") as place:
        compile_all(place, "tour.qrex", "app.exe")
        equal(must([WINE, "app.exe"], place), (place / "expected.txt").read_text())


def remote():
    """A server and two clients, each a process of its own, over Winsock."""
    with example("remote") as place:
        compile_all(place, "remote.qrex", "board.exe")
        server = subprocess.Popen([WINE, "board.exe", "serve", "port", "2"], cwd=place, stdin=subprocess.DEVNULL, stdout=subprocess.PIPE)
        try:
            told = [must([WINE, "board.exe", "post", "port", *words], place) for words in (["Ada", "the tide is in"], ["Ben", "", "so are the boats"])]
            equal(told, ["Ada has 1 notes on the board\n", "Ben was refused: an empty note\nBen has 1 notes on the board\n"])
            board = server.communicate(timeout=90)[0].decode()
            assert '"text": "so are the boats"' in board and server.returncode == 0, board
        finally:
            server.kill()


def cmake():
    """The example of docs/cmake.md with the tool chain file: the tool of this system translates, the program is one of Windows."""
    with example("cmake") as place:
        must(["cmake", "-S", ".", "-B", "w", "-G", "Ninja", "-DCMAKE_BUILD_TYPE=Debug", f"-DCMAKE_TOOLCHAIN_FILE={ROOT}/cmake/mingw-w64.cmake",
              f"-DQrex_DIR={ROOT}/build", f"-DCMAKE_CROSSCOMPILING_EMULATOR={WINE}", "-DCMAKE_EXE_LINKER_FLAGS=-static"], place)
        must(["cmake", "--build", "w", "-j2"], place)
        must(["ctest", "--test-dir", "w", "--output-on-failure"], place)


def runtime_program(name, output, keys):
    workspace, root = translate(WRAPPER, f"{name}.qrws", keys)
    with workspace:
        sources = [path.relative_to(workspace.folder) for path in sorted(workspace.path(root).rglob("*.cpp")) if "vxObject" not in path.parts]
        link(workspace, " ".join([*COMPILER, "-Dshapes_API=", with_boost(workspace.folder)]), sources, "program.exe", " ".join(LIBRARIES))
        done = run([WINE, "program.exe"], cwd=workspace.folder)
        assert re.search(output, text_of(done)), f"status {done.returncode}, not {output}:\n{text_of(done)[-3000:]}"


# The programs of the tests of the runtime: what they are to print, and the keys that they are translated with.
RUNTIME = {
    "all": (r"(?s)^[1-9]\d\d checks, 0 failures\n.*last\n", ""),
    "compilable": (r" checks, 0 failures\n", "compilableText = true modernCpp = true"),
    "memory": (r" runs, 0 failures\n", "compilableText = true"),
    "order": (r"(?s)^\[254\]\n\[1\]\n\[2,1\]\n\[4,3,2,1\]\n.*\nnested\[k\]\[300\]\n$", ""),
    "threads": (r"(?s)^( *a line\n){80}flush left\n0 0 0 0 0\n$", ""),
}


def failure_of(test):
    try:
        test()
    except (AssertionError, subprocess.TimeoutExpired) as failure:
        return str(failure)[-3000:]


def counted(name, tests):
    count = Count(name)
    for label, test in tests:
        count.take_or_try_again(label, failure_of(test), lambda test=test: failure_of(test))
    return count


def examples():
    return counted("examples compiled for Windows", [(test.__name__, test) for test in (tour, remote, cmake)])


def runtime():
    count = counted("the runtime, compiled for Windows", [(name, lambda name=name: runtime_program(name, *RUNTIME[name])) for name in RUNTIME])
    count.skip("sockets", "its attacks need limits of descriptors, forks and Unix sockets; examples/remote calls over Winsock")
    count.skip("twice", "plug-ins there share nothing that is not exported")
    return count
