"""Signals to runs while their tools write: to the group, as from a terminal, and to the tool alone, whose tools then go on.

The tools of the campaign can be told to stop half-way (PAUSE): the output holds half of what it is to hold, and a child
of the tool, which no driver waits for once it is gone, is about to write what an older source would have given."""

import os
import shutil
import signal
import subprocess
import time

SIGNALS = [signal.SIGINT, signal.SIGQUIT, signal.SIGTERM, signal.SIGHUP, signal.SIGKILL]
TARGETS = {"the group": os.killpg, "the tool alone": os.kill}
ORPHAN_WRITES = 0.4  # seconds after the pause began
# For the scripts that stand for tools, behind the line that sets $out. Each call adds a folder to tools/calls.
PAUSE = f"""call=1
until mkdir tools/calls/$call 2> /dev/null || [ $call = 99 ]; do call=$((call + 1)); done
if [ "$call" = "$PAUSE_AT" ]; then
  printf half > "$out"; touch tools/paused; (sleep {ORPHAN_WRITES}; printf old > "$out") & wait; exit 1
fi
"""


def signalled(kind, folder, at, number, target):
    """One run that gets a signal while its n-th tool writes; what it broke, or None."""
    kind.copy(folder)
    try:
        process = subprocess.Popen([kind.binary, "all.qrex", *kind.arguments], cwd=folder, stdin=subprocess.DEVNULL,
                                   stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL, start_new_session=True,
                                   env={**os.environ, "PAUSE_AT": str(at)})
        while not (folder / "tools/paused").exists():
            if process.poll() is not None:
                return f"tool {at}: the run ended by itself"
            time.sleep(0.005)
        paused = time.monotonic()
        TARGETS[target](process.pid, number)
        process.wait(timeout=60)
        kind.mended(folder)
        time.sleep(max(0, paused + ORPHAN_WRITES + 0.2 - time.monotonic()))
        kind.compare(folder, "what outlived the run wrote over")
    except (kind.Violation, subprocess.TimeoutExpired) as violation:
        return f"{number.name} to {target} at tool {at}: {violation}"
    finally:
        shutil.rmtree(folder, ignore_errors=True)
    return None


def rows(kind, folder, short):
    """Name of the signal and a function for each run of it; of `--short` other tools for each signal."""
    for index, number in enumerate(SIGNALS):
        for target in TARGETS:
            points = range(1, kind.tools + 1)
            if short:
                points = points[index % 4::4] if target == "the group" else points[index % 4:index % 4 + 1]
            yield f"{number.name} to {target}", [
                (signalled, kind, folder / f"{number.name}{target.split()[-1]}{at}", at, number, target) for at in points]
