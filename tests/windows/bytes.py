#!/usr/bin/env python3
"""Whether the Windows program writes what the one of this system writes, to the byte: bytes.py LINUX_BINARY WINDOWS_BINARY

Each example is translated, and its project files are made for several compilers, by both: in a folder with a plain name and in
one whose name is not. The text that they print and all files are compared; paths of the two folders, times, and the program's own
path are left out, and identifiers are those of the first run."""

import os
import re
import shutil
import subprocess
import sys
import tempfile
from pathlib import Path

ROOT = Path(__file__).resolve().parents[2]
EXAMPLES = ["first/first", "evolution/evolution", "shapes/geometry", "tour/tour", "remote/remote"]
RUNS = [["CONFIG", "mode=build", "translateOnly=true"], ["--list", "CONFIG"]] + [
    ["CONFIG", "mode=gen", f"compiler={compiler}"] for compiler in ("vc6", "vc9", "vc14", "gcc")]
FOLDERS = ["plain", "trée ü"]
TIMES = re.compile(rb"\.{3,} *[0-9.]+ ms|\d+\.\d+ ms|argv\[0\] = .*")


def files(folder):
    """All of them but those that hold times."""
    return {str(path.relative_to(folder)): path for path in sorted(folder.rglob("*"))
            if path.is_file() and ".qrexdep" not in path.name}


def masked(data, folder):
    data = re.sub(rb"([A-Z]:)?" + re.escape(str(folder).encode()), b"ROOT", data)
    return TIMES.sub(b"TIME", data)


def run(binary, example, arguments, folder):
    words = [Path(example).name + ".qrex" if word == "CONFIG" else word for word in arguments]
    done = subprocess.run([binary, *words], cwd=folder / "examples" / Path(example).parent,
                          stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, timeout=300)
    return done.returncode, masked(done.stdout, folder)


def differences(example, name, binaries):
    parent = Path(tempfile.mkdtemp(prefix="bytes-"))
    try:
        places = [parent / str(i) / name for i in range(2)]
        for place in places:
            shutil.copytree(ROOT / "examples" / Path(example).parent, place / "examples" / Path(example).parent)
            shutil.copytree(ROOT / "runtime", place / "runtime")
        for arguments in RUNS:
            told = []
            for place, binary in zip(places, binaries):
                told.append(run(binary, example, arguments, place))
                if place == places[0]:
                    for path in place.rglob("projects.guids"):
                        target = places[1] / path.relative_to(place)
                        if not target.exists():
                            shutil.copy(path, target)
            label = f"{example} in {name}, {' '.join(arguments).replace('CONFIG ', '')}"
            if [status for status, _ in told] != [0, 0]:
                yield f"{label}: status {told[0][0]} and {told[1][0]}"
            for ours, theirs in zip(told[0][1].splitlines(), told[1][1].splitlines()):
                if ours != theirs:
                    yield f"{label}: {ours.decode(errors='replace')!r} and {theirs.decode(errors='replace')!r}"
                    break
            ours, theirs = files(places[0]), files(places[1])
            yield from (f"{label}: {path} is there once" for path in sorted(set(ours) ^ set(theirs)))
            yield from (f"{label}: {path} differs" for path in sorted(set(ours) & set(theirs))
                        if masked(ours[path].read_bytes(), places[0]) != masked(theirs[path].read_bytes(), places[1]))
    finally:
        subprocess.run(["chmod", "-R", "u+w", parent], check=False)
        shutil.rmtree(parent, ignore_errors=True)


def main():
    binaries = [os.path.abspath(path) for path in sys.argv[1:3]]
    count = failed = 0
    for name in FOLDERS:
        for example in EXAMPLES:
            found = list(differences(example, name, binaries))
            count += 1
            failed += bool(found)
            print("".join(line + "\n" for line in found[:10]), end="", flush=True)
    print(f"{count - failed} passed, {failed} failed")
    sys.exit(1 if failed else 0)


if __name__ == "__main__":
    main()
