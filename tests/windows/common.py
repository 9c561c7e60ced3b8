"""What the groups of tests under Wine share."""

import subprocess
from pathlib import Path

ROOT = Path(__file__).resolve().parents[2]
WINE = str(ROOT / "tests/windows/wine")
WRAPPER = str(ROOT / "tests/windows/Qrex")


class Count:
    def __init__(self, name):
        self.name, self.passed, self.failed, self.skipped = name, 0, [], []

    def take(self, label, failure):
        if failure is None:
            self.passed += 1
        else:
            self.failed.append(label)
            print(f"FAILED {label}\n{failure}", flush=True)

    def take_or_try_again(self, label, failure, again):
        """Once more, as Wine may fail to start a program, and what asks for times may fail beside others. It is told."""
        if failure is not None:
            print(f"{label} failed and is tried again:\n{failure}", flush=True)
            failure = again()
        self.take(label, failure)

    def skip(self, label, reason):
        self.skipped.append(label)
        print(f"skipped {label}: {reason}", flush=True)

    def end(self, seconds):
        print(f"== {self.name}: {self.passed} passed, {len(self.failed)} failed, {len(self.skipped)} skipped, in {seconds:.0f} s", flush=True)


def run(command, **options):
    """What takes too long has failed."""
    try:
        return subprocess.run(command, stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, timeout=590,
                              **options)
    except subprocess.TimeoutExpired as late:
        return subprocess.CompletedProcess(command, 1, (late.stdout or b"") + b"\nIt took too long.\n")


def text_of(done):
    return done.stdout.decode(errors="replace").replace("\r", "")
