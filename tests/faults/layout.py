"""`--init` with faults: a layout that ends with status 0 is whole, else something was said; and what is partial is finished
by the next call."""

import errno
import shutil
import subprocess

from workspace_fixture import contents
from workspaces import run

KINDS = {"--init": ["zoo"], "--init, in a folder": ["zoo", "."]}


def disturbed(binary, library, folder, arguments, expected, call, at, how, number):
    folder.mkdir()
    try:
        done = run(binary, folder, "--init", *arguments, LD_PRELOAD=library, FAULT_CALL=call, FAULT_AT=str(at), FAULT_HOW=how,
                   FAULT_ERRNO=str(number))
        place = f"{call} {at} {how} {errno.errorcode.get(number, '')}: "
        if how != "kill" and done.returncode not in (0, 1):
            return place + f"status {done.returncode}"
        if done.returncode == 0 and contents(folder, "**/*") != expected:
            return place + "a part, with status 0"
        if done.returncode == 1 and b"rror" not in done.stdout:
            return place + f"without a message: {done.stdout}"
        if done.returncode != 0:
            again = run(binary, folder, "--init", *arguments)
            if contents(folder, "**/*") != expected:
                return place + f"not finished by the next call: {again.stdout.decode()[-300:]}"
        return None
    except subprocess.TimeoutExpired:
        return f"{call} {at} {how}: no end"
    finally:
        shutil.rmtree(folder, ignore_errors=True)


def rows(binary, library, folder, faults, points):
    """Name of the kind of run, name of the fault and a function for each disturbed run of it; `points` chooses calls."""
    for name, arguments in KINDS.items():
        whole, counts = folder / "whole", folder / "counts"
        whole.mkdir()
        run(binary, whole, "--init", *arguments, LD_PRELOAD=library, FAULT_COUNTS=str(counts)).check_returncode()
        expected = contents(whole, "**/*")
        shutil.rmtree(whole)
        made = {call: int(count) for call, count in (line.split() for line in counts.read_text().splitlines())}
        for call, how, number in faults:
            yield name, f"{call}: {how} {errno.errorcode.get(number, '')}".strip(), [
                (disturbed, binary, library, folder / f"{call}{at}", arguments, expected, call, at, how, number)
                for at in points(made.get(call, 0))]
