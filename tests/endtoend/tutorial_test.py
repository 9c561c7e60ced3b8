#!/usr/bin/env python3
"""Does what docs/tutorial.md says, in its order: writes its files, types its commands, and looks for what they print."""

import os
import re

from workspace_fixture import ROOT, equal, holds, in_workspace, indented, run_tests

PAGE = ROOT / "docs/tutorial.md"
FILE = re.compile(r"(?:^|.*\. )`([^`]+)`:$")  # ahead of a block: its name


def commands(block):
    """The lines behind a `$`, each with what is shown of its output."""
    for part in re.split(r"^\$ ", block, flags=re.MULTILINE)[1:]:
        command, *output = part.splitlines()
        yield command, output


def follow(workspace, text):
    """Follows the page; how many files it wrote and how many commands it ran."""
    files = typed = 0
    folder = "."
    for ahead, block in indented(text):
        name = FILE.match(ahead)
        if name:
            workspace.write(os.path.join(folder, name.group(1)), block)
            files += 1
            continue
        for command, output in commands(block):
            printed = workspace.shell(f"cd {folder} && {command}")
            if command.startswith("cd "):
                folder = os.path.join(folder, command[3:])
            holds(printed, *output)
            typed += 1
    return files, typed


@in_workspace({}, "g++", "make")
def test_the_tutorial(workspace):
    text = PAGE.read_text()
    files, typed = follow(workspace, text)
    equal(files, len(re.findall(r"`:$", text, flags=re.MULTILINE)))
    equal(typed, len(re.findall(r"^    \$ ", text, flags=re.MULTILINE)))


run_tests(globals())
