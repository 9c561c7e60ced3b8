#!/usr/bin/env python3
"""Hints: what a terminal shows behind a message, on a line of its own, and a pipe or a file does not."""

import subprocess

from terminal_fixture import on_terminal
from workspace_fixture import COMPILERS, SETTINGS, Workspace, comparable, equal, holds, in_workspace, lacks, need, run_tests

PROJECT = '$TARGET_TYPE = "%s"\n$ROOT_TO_PROJDIR = "%s"\nconfig { "Debug|x64" }\n%s\n{\n    "src"\n    {\n        %s\n    }\n}\n'
FILES = {
    "main.qrex": SETTINGS.replace('"tree"', '"tree" "more"') + "translateOnly = true\n",
    "tree/.qrwsroot": "",
    "tree/all.qrws": '"main" { "core" "app" "tool" }\n',
    "tree/core/src/core.qrpj": PROJECT % ("Static Library", "core", "qrex", '"core.cpp"'),
    "tree/core/src/core.cpp": "int core() { return 0; }\n",
    "tree/app/src/app.qrpj": PROJECT % ("Console Application", "app", 'subproj { "core" } qrex', '"app.cpp"'),
    "tree/app/src/app.cpp": "int core();\nint main() { return core(); }\n",
    "tree/tool/src/tool.qrpj": PROJECT % ("Console Application", "tool", "qrex", '"tool.cpp"'),
    "tree/tool/src/tool.cpp": "int main() {}\n",
}
HERE = " (relative paths begin in the folder where Qrex runs)"


def hints_of(binary, changes, *arguments):
    """The hints of a run on a terminal. Its other lines are all that a pipe gets."""
    files = {name: text for name, text in {**FILES, **changes}.items() if text is not None}
    command, outputs = [binary, "main.qrex", *arguments], []
    for terminal in (True, False):
        with Workspace(binary, files) as workspace:
            if terminal:
                output = on_terminal(command, workspace.folder, TERM="dumb")[0]
            else:
                done = subprocess.run(command, cwd=workspace.folder, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True)
                output = done.stdout
            outputs.append(output.replace(str(workspace.folder), "FOLDER"))
    lacks(outputs[1], "hint: ")
    equal(*map(comparable, outputs))
    return [line.removeprefix("    hint: ") for line in outputs[0].splitlines() if line.startswith("    hint: ")]


LEFT_OUT = "the run ends here and leaves out: "
MODES = "one of clean compile build gen show"
ON_COMMAND_LINE = "this line is none of the file, it stands on the command line: "
SETTINGS_OF_ALL = FILES["main.qrex"]
TWO = {"tree/all.qrws": '"all" { "core" "app" }\n'}
ALL = {"tree/all.qrws": '"all" { "core" "app" "tool" }\n'}


def tool(files, statements="qrex", kind="Console Application", root="tool"):
    return {"tree/tool/src/tool.qrpj": PROJECT % (kind, root, statements, files)}


def source(text):
    return {"tree/tool/src/tool.cpp": text + "\n"}


LISTED = "app/src/app.cpp is listed in tree/app/src/app.qrpj(8)"
COPIED = {**tool('"tool.cpp" "a.cc" "b.HPP" "c.c++"'), **{f"tree/tool/src/{name}": "" for name in ("a.cc", "b.HPP", "c.c++")}}
IS_COPIED = "tool/src/a.cc and 2 more are only copied: what is compiled ends in .cpp or .c, a header with declarations in .h"
IMPORTED = {"tree/tool/src/tool.h": "inline int Tool() { return 1; }\n",
            "tree/app/src/app.cpp": '@import "tool/src/tool.h"\nint core();\nint main() { return core() + Tool(); }\n'}
PLAIN = {**IMPORTED, **tool('"tool.h" "tool.cpp"', "", "Static Library")}
FIRST = '; write "tool" in subproj { } of tree/app/src/app.qrpj, and it is built first'
BLOCK = {"main.qrex": SETTINGS_OF_ALL.replace('"all.qrws"', '"tool"'),
         "tree/tool/src/tool.qrpj": PROJECT.replace("%s\n{", "+cpp %s\n{", 1) % ("Console Application", "tool", "{ -Wall", '"tool.cpp"')}
BLOCK_HINTS = ["is there a } missing? A block of switches begins at tree/tool/src/tool.qrpj(4)",
               "nothing is done for the project of tree/tool/src/tool.qrpj, whose error is told above"]
FILE = "tree/tool/src/tool.cpp"
# What is changed of the workspace, the arguments, the hints.
CASES = [
    ({}, [], []),
    # A workspace, project, source or import that is not found.
    ({"tree/all.qrws": None}, [], ["not found as tree/all.qrws, more/all.qrws" + HERE]),
    ({"tree/all.qrws": '"all" { "deep/other.qrws" }'}, [], ["not found as tree/deep/other.qrws, more/deep/other.qrws" + HERE]),
    ({"tree/all.qrws": '"all" { "cor" }'}, [], ["not found as tree/cor/src/cor.qrpj, more/cor/src/cor.qrpj" + HERE]),
    ({"tree/app/src/app.cpp": None}, [], [LISTED, LEFT_OUT + "tool"]),
    (source('@import "core.h"'), [], ["no project lists tool/src/core.h or core.h or tool/core.h"]),
    ({"main.qrex": '@import "x.inc"'}, [], ["not found as x.inc; virtualTree has no roots" + HERE]),
    ({"tree/all.qrws": '@import "x.inc"\n"all" { }'}, [], ["not found as x.inc, tree/x.inc, more/x.inc" + HERE]),
    # Invalid words, in the file and on the command line.
    ({"main.qrex": "mode = biuld"}, [], [MODES]),
    ({"main.qrex": "compiler = g++"}, [], ["one of " + " ".join(COMPILERS)]),
    ({"main.qrex": "moed = build"}, [], ["no statement begins so; Qrex --help lists the keys"]),
    (tool('"tool.cpp" : exlude', "", "Utility Project"), [], ["an option of a file is one of exclude, +cpp, -cpp"]),
    ({}, ["rebuildAll=true", "mode=biuld"], [MODES, ON_COMMAND_LINE + "mode=biuld"]),
    ({}, ['@fail("no")'], [ON_COMMAND_LINE + '@fail("no")']),
    ({}, ['config="Fast"'], ["tree/core/src/core.qrpj has Debug|x64", LEFT_OUT + "app tool"]),
    # What this program, or the compiler, does not build.
    ({**TWO, "tree/core/src/core.qrpj": PROJECT % ("Static Library", "core", "", '"core.cpp"')}, ["translateOnly=false"],
     ["tree/core/src/core.qrpj does not say qrex: this program does not build core, which app links against"]),
    ({"tree/app/src/app.qrpj": PROJECT % ("Console Application", "app", "qrex", '"app.cpp" "a.asm" "b.asm"'),
      "tree/app/src/a.asm": "", "tree/app/src/b.asm": "", "tree/all.qrws": '"all" { "app" }\n'},
     ["translateOnly=false", 'PATH("x64") = { "none" }'],
     ["an .asm is given to ml /coff; this compiler has no assembler of its own for it"]),
    (COPIED, [], [IS_COPIED]),
    # An import that cannot be used.
    ({**IMPORTED, **tool('"tool.h" "tool.cpp"', kind="Static Library")}, ["translateOnly=false"],
     ["app/src/app.cpp imports it" + FIRST, LEFT_OUT + "tool"]),
    (PLAIN, [], ["app/src/app.cpp imports it; write qrex in tree/tool/src/tool.qrpj, or #include it" + FIRST, LEFT_OUT + "tool"]),
    ({**PLAIN, "tree/app/src/app.qrpj": PROJECT % ("Console Application", "app", 'subproj { "core" "tool" } qrex', '"app.cpp"')}, [],
     ["app/src/app.cpp imports it; write qrex in tree/tool/src/tool.qrpj, or #include it"]),
    ({**tool('"tool.cpp" "keeper.h"'), "tree/tool/src/keeper.h": "$enum+ E { x };\n"}, [],
     ['write tree/tool/src/keeper.cpp with the line @import "keeper.h", and list it in tree/tool/src/tool.qrpj']),
    # Make files whose call builds nothing.
    (ALL, ["mode=gen"], ["make translates by Qrex all.qrex, which is not there: name main.qrex so, or \"all\" in the workspace "
                         "file otherwise"]),
    ({**ALL, "all.qrex": SETTINGS_OF_ALL}, ["mode=gen"], []),
    (ALL, ["mode=gen", "compiler=vc14"], []),
    ({"main.qrex": SETTINGS_OF_ALL + "mode = gen\n"}, [],
     ["make translates by Qrex main.qrex, and mode = gen stands there: write mode = build, and call Qrex main.qrex mode=gen for the "
      "make files"]),
    # What macros hold, and plain C++.
    (source("@for (x in names) { }"), [], ["there is no macro names; a list is [a, b] or a macro that holds one"]),
    (source("@def names = {a}\n\n@for (x in names) { }"), [], [f"the list is names, which stands at {FILE}(1)"]),
    (source('@let int x = "s"'), [], [f"in the @let at {FILE}(1)"]),
    (source('@let int x = 1\n@let x = "s"'), [], [f"in the @let at {FILE}(2)"]),
    (source("$[[nodiscard]] int32 f();"), [], ["an attribute stands ahead of the $, where it is plain text"]),
    (source("$function+ std::string f();"), [],
     ["nothing of std is reflected: write string8 for std::string, xvector<T> for std::vector<T>, xmap<K,V> for std::map<K,V>"]),
    # A project file that misleads.
    (BLOCK, [], BLOCK_HINTS),
    (tool('"tool.cpp"', root="tul"), [], ["tul/src/tool.cpp is listed in tree/tool/src/tool.qrpj(8), and tree/tool/src/tool.qrpj "
                                          'does not stand below its $ROOT_TO_PROJDIR, "tul"']),
]


def test_hints(binary):
    need("g++")
    for changes, arguments, hints in CASES:
        equal((changes, arguments, hints_of(binary, changes, *arguments)), (changes, arguments, hints))


def test_a_configuration_that_is_none(binary):
    for argument, hint in (("--hlep", "did you mean --help?"),
                           ("--frob", "the options are --graph --help --init --list --reflect --report --there --version --where --why"),
                           ("X=/p", "a variable has its value in quotes: 'X=\"/p\"'; a line of the configuration stands behind the file")):
        with Workspace(binary, {}) as workspace:
            output, _ = on_terminal([binary, argument], workspace.folder, TERM="dumb")
        equal(output.splitlines()[-2:], [f"Exception: Couldn't open file {argument}", "    hint: " + hint])


@in_workspace({**FILES, **COPIED})
def test_diagnostics_tell_what_is_copied(workspace):
    lacks(workspace.run("main.qrex"), "only copied")
    holds(workspace.run("main.qrex", "diagnostics=true"), f"\n{IS_COPIED}\n")


run_tests(globals())
