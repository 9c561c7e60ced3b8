#!/usr/bin/env python3
"""The status line of a build on a terminal, and messages of tools in colours there: seen through a pseudo terminal."""

import re
import signal

import terminal_fixture
from workspace_fixture import comparable, equal, holds, in_workspace, lacks, project, run_tests, stand_ins, workspace_of

# Prints a warning, an error and a note, each with the lines that compilers add, where the source asks for it.
COMPILING = r"""case $(cat "$source") in
  *slow*) sleep 0.3;;
  *warned*) printf '%s:1:5: warning: odd [-Wodd]\n    1 | int warned;\n      |     ^~~~~~\n' "$source" >&2;;
  *wrong*) printf '%s:1:5: error: bad\n%s:1:1: note: here\n' "$source" "$source" >&2; exit 1;;
esac"""
LINKING = 'echo "ld: told ahead of the end"'
FILES = {
    **workspace_of("core", "app"), **stand_ins(COMPILING, "sleep 2.4; " + LINKING),
    "tree/core/src/core.qrpj": project("Static Library", "core", '"src" { "slow.cpp" "odd.cpp" "core.cpp" }'),
    "tree/core/src/slow.cpp": "int slow;\n", "tree/core/src/odd.cpp": "int warned;\n", "tree/core/src/core.cpp": "int core;\n",
    "tree/app/src/app.qrpj": project("Console Application", "app", '"src" { "app.cpp" }', 'subproj { "core" }'),
    "tree/app/src/app.cpp": "int app;\n",
}
STATUS = re.compile(r"\[\d+/\d+\] (\d+ running, )?\d+:\d\d(, [^\x1b\r]*)?")


def on_terminal(workspace, *arguments, **options):
    return terminal_fixture.on_terminal([workspace.binary, "all.qrex", *arguments], workspace.folder, **options)


def shown(output):
    """What stands on the terminal in the end."""
    lines, column = [""], 0
    for part in re.findall(r"\x1b\[\d*(?:;\d+)*[A-Za-z]|.", output, re.DOTALL):
        if part == "\n":
            lines.append("")
            column = 0
        elif part == "\r":
            column = 0
        elif part == "\x1b[K":
            lines[-1] = lines[-1][:column]
        elif not part.startswith("\x1b"):
            lines[-1] = lines[-1][:column] + part + lines[-1][column + 1:]
            column += 1
    return "\n".join(lines)


def statuses(output):
    return [match.group() for match in STATUS.finditer(output)]


@in_workspace(FILES)
def test_line_is_shown_and_gone(workspace):
    piped = workspace.run("all.qrex", "jobs=2")
    lacks(piped, "\x1b")
    workspace.clean()
    output, status = on_terminal(workspace, "jobs=2")
    equal(status, 0)
    equal(comparable(shown(output)), comparable(piped))  # what the linker printed stands whole in it, too
    lines = statuses(output)
    assert lines[0].startswith("[0/6] "), lines  # the second project is counted ahead of its begin
    holds("\n".join(lines), "1 running, 0:00, core/src/slow.cpp", "linking libcore.a", "[5/6] 1 running, 0:0", ", linking app (0:02)")
    for line in output.split("\n"):  # what stood there was cleared ahead of each text
        lacks(re.sub(r"[^\r]*\r\x1b\[K", "", line).removesuffix(statuses(line)[-1] if statuses(line) else ""), "running")
    lacks(on_terminal(workspace, "jobs=2")[0], "\x1b")  # nothing to do


@in_workspace(FILES)
def test_terminals_that_take_less(workspace):
    workspace.replace("tools/g++", "sleep 2.4; ", "")
    piped = comparable(workspace.run("all.qrex"))
    for kind in ("dumb", "", None):
        workspace.clean()
        equal(comparable(on_terminal(workspace, TERM=kind)[0]), piped)
    for columns in (4, 16, 34):
        workspace.clean()
        output = on_terminal(workspace, columns=columns)[0]
        drawn = re.findall(r"(\[\d[^\r\n\x1b]*)(?=\r\x1b\[K)", output)
        assert all(len(line) < columns for line in drawn) and bool(drawn) == (columns > 5), output
        equal(comparable(shown(output)), piped)


@in_workspace({**FILES, "tree/core/src/core.cpp": "int wrong;\n"})
def test_messages_of_tools_are_coloured(workspace):
    piped = workspace.run("all.qrex")
    holds(piped, "1 warnings, 1 errors")
    for environment, is_coloured in (({}, True), ({"NO_COLOR": ""}, True), ({"NO_COLOR": "1"}, False)):
        workspace.clean()
        output = on_terminal(workspace, **environment)[0]
        assert statuses(output)
        if is_coloured:
            holds(output, "\x1b[1;35mwarning\x1b[m: odd", "      |     \x1b[1;32m^~~~~~\x1b[m\n", "\x1b[1;31merror\x1b[m: bad",
                  "\x1b[1;36mnote\x1b[m: here")
        else:
            lacks(output, "\x1b[m")
        equal(comparable(shown(output)), comparable(piped))  # so they are found in it, and followed back, as ever


@in_workspace(FILES)
def test_signals_leave_no_line(workspace):
    for number, status in ((signal.SIGTERM, -signal.SIGTERM), (signal.SIGHUP, -signal.SIGHUP)):
        workspace.clean()
        output, ended = on_terminal(workspace, "jobs=2", until=b"slow.cpp", kill=number)
        equal(ended, status)
        assert shown(output).endswith("\n"), shown(output)
        workspace.run("all.qrex", "jobs=2")  # which waits for the ends of the tools


run_tests(globals())
