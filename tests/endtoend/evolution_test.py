#!/usr/bin/env python3
"""Builds the example of a model of three releases against the runtime, and runs its program."""

import shutil
import sys
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import Workspace, equal, holds, need, run_tests  # noqa: E402

ROOT = Path(__file__).parents[2]


def evolution(binary):
    need("g++")
    with Workspace(binary, {}) as workspace:
        shutil.copytree(ROOT / "examples/evolution", workspace.folder, dirs_exist_ok=True)
        workspace.replace("evolution.qrex", "../../runtime", str(ROOT / "runtime"))
        holds(workspace.run("evolution.qrex"), "Completed.")
        equal(workspace.shell("out/lib/x64/Debug/notes"),
              'release 1: "call the harbour", 90000 ms, 3 words, tags: urgent\n'
              'release 2: "call the harbour", 90000 ms, 3 words, tags: sea today\n'
              'release 3: "two words", 1500 ms, 2 words, tags: new\n')


run_tests([evolution])
