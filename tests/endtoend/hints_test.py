#!/usr/bin/env python3
"""Hints: what a terminal shows behind a message, on a line of its own, and a pipe or a file does not."""

import os
import pty
import re
import subprocess
import sys
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import COMPILERS, SETTINGS, Workspace, equal, holds, need, run_tests  # noqa: E402

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


def on_terminal(command, folder):
    """What the command writes to a terminal."""
    terminal, its_end = pty.openpty()
    process = subprocess.Popen(command, cwd=folder, stdin=its_end, stdout=its_end, stderr=its_end,
                               env={**os.environ, "TERM": "dumb"})  # which takes no status line
    os.close(its_end)
    output = b""
    while True:
        try:
            part = os.read(terminal, 65536)
        except OSError:  # the last writer has closed it
            break
        if not part:
            break
        output += part
    os.close(terminal)
    process.wait(timeout=60)
    return output.decode().replace("\r\n", "\n")


def comparable(text, folder):
    """Without what differs from run to run."""
    return re.sub(r"\.+ +[0-9.]+ ms$", "", text.replace(str(folder), "FOLDER"), flags=re.MULTILINE)


def hints_of(binary, changes, *arguments):
    """The hints of a run on a terminal. Its other lines are all that a pipe and a file get."""
    def run(how):
        files = {name: text for name, text in {**FILES, **changes}.items() if text is not None}
        with Workspace(binary, files) as workspace:
            command = [binary, "main.qrex", *arguments]
            if how == "terminal":
                return comparable(on_terminal(command, workspace.folder), workspace.folder)
            with open(workspace.path("output"), "wb") as file:
                target = subprocess.PIPE if how == "pipe" else file
                done = subprocess.run(command, cwd=workspace.folder, stdout=target, stderr=subprocess.STDOUT, timeout=60)
            output = done.stdout if how == "pipe" else workspace.path("output").read_bytes()
            return comparable(output.decode(), workspace.folder)
    lines = run("terminal").splitlines(keepends=True)
    plain = "".join(line for line in lines if not line.startswith("    hint: "))
    for how in ("pipe", "file"):
        equal(run(how), plain)
    return [line.removeprefix("    hint: ").rstrip("\n") for line in lines if line.startswith("    hint: ")]


def no_message_no_hint(binary):
    equal(hints_of(binary, {}), [])


def a_workspace_or_project_that_is_not_found(binary):
    equal(hints_of(binary, {"tree/all.qrws": None}), ["not found as tree/all.qrws, more/all.qrws" + HERE])
    equal(hints_of(binary, {"tree/all.qrws": '"all" { "deep/other.qrws" }'}),
          ["not found as tree/deep/other.qrws, more/deep/other.qrws" + HERE])
    equal(hints_of(binary, {"tree/all.qrws": '"all" { "cor" }'}),
          ["not found as tree/cor/src/cor.qrpj, more/cor/src/cor.qrpj" + HERE])


def a_source_that_is_missing(binary):
    listed = "app/src/app.cpp is listed in tree/app/src/app.qrpj(8)"
    equal(hints_of(binary, {"tree/app/src/app.cpp": None}), [listed, "the run ends here and leaves out: tool"])
    equal(hints_of(binary, {"tree/app/src/app.cpp": None}, "mode=gen"), [listed])


def an_import_that_is_not_found(binary):
    equal(hints_of(binary, {"tree/tool/src/tool.cpp": '@import "core.h"\n'}),
          ["no project lists tool/src/core.h or core.h or tool/core.h"])
    equal(hints_of(binary, {"tree/all.qrws": '@import "x.inc"\n"all" { }'}),
          ["not found as x.inc, tree/x.inc, more/x.inc" + HERE])


def an_invalid_word(binary):
    equal(hints_of(binary, {"main.qrex": "mode = biuld"}), ["one of clean compile build gen show"])
    equal(hints_of(binary, {"main.qrex": "compiler = g++"}), ["one of " + " ".join(COMPILERS)])
    equal(hints_of(binary, {"main.qrex": "moed = build"}), ["no statement begins so; Qrex --help lists the keys"])
    equal(hints_of(binary, {"tree/tool/src/tool.qrpj": PROJECT % ("Utility Project", "tool", "", '"tool.cpp" : exlude')}),
          ["an option of a file is one of exclude, +cpp, -cpp"])


def a_configuration_that_a_project_lacks(binary):
    equal(hints_of(binary, {}, 'config="Fast"'),
          ["tree/core/src/core.qrpj has Debug|x64", "the run ends here and leaves out: app tool"])


def a_line_of_the_command_line(binary):
    where = "this line is none of the file, it stands on the command line: "
    equal(hints_of(binary, {}, "rebuildAll=true", "mode=biuld"),
          ["one of clean compile build gen show", where + "mode=biuld"])
    equal(hints_of(binary, {}, "mode="), ["one of clean compile build gen show", where + "mode="])
    equal(hints_of(binary, {}, "@fail(\"no\")"), [where + "@fail(\"no\")"])


def a_library_that_this_program_does_not_build(binary):
    need("g++")
    changes = {"tree/core/src/core.qrpj": PROJECT % ("Static Library", "core", "", '"core.cpp"'),
               "tree/all.qrws": '"all" { "core" "app" }\n'}
    equal(hints_of(binary, changes, "translateOnly=false"),
          ["tree/core/src/core.qrpj does not say qrex: this program does not build core, which app links against"])


def an_assembler_that_is_missing(binary):
    changes = {"tree/app/src/app.qrpj": PROJECT % ("Console Application", "app", "qrex", '"app.cpp" "a.asm" "b.asm"'),
               "tree/app/src/a.asm": "", "tree/app/src/b.asm": "", "tree/all.qrws": '"all" { "app" }\n'}
    equal(hints_of(binary, changes, "translateOnly=false", 'PATH("x64") = { "none" }'),
          ["an .asm is given to ml /coff; this compiler has no assembler of its own for it"])


def an_import_that_cannot_be_used(binary):
    imports = {"tree/tool/src/tool.qrpj": PROJECT % ("Static Library", "tool", "qrex", '"tool.h" "tool.cpp"'),
               "tree/tool/src/tool.h": "inline int Tool() { return 1; }\n",
               "tree/app/src/app.cpp": '@import "tool/src/tool.h"\nint core();\nint main() { return core() + Tool(); }\n'}
    missing = '; write "tool" in subproj { } of tree/app/src/app.qrpj, and it is built first'
    left = "the run ends here and leaves out: tool"
    need("g++")
    equal(hints_of(binary, imports, "translateOnly=false"), ["app/src/app.cpp imports it" + missing, left])
    plain = PROJECT % ("Static Library", "tool", "", '"tool.h" "tool.cpp"')
    equal(hints_of(binary, {**imports, "tree/tool/src/tool.qrpj": plain}),
          ["app/src/app.cpp imports it; write qrex in tree/tool/src/tool.qrpj, or #include it" + missing, left])
    uses = PROJECT % ("Console Application", "app", 'subproj { "core" "tool" } qrex', '"app.cpp"')
    equal(hints_of(binary, {**imports, "tree/tool/src/tool.qrpj": plain, "tree/app/src/app.qrpj": uses}),
          ["app/src/app.cpp imports it; write qrex in tree/tool/src/tool.qrpj, or #include it"])


def sources_that_are_only_copied(binary):
    what = " only copied: what is compiled ends in .cpp or .c, a header with declarations in .h"
    files = {"tree/tool/src/tool.qrpj": PROJECT % ("Console Application", "tool", "qrex", '"tool.cpp" "a.cc" "b.HPP" "c.c++"'),
             **{f"tree/tool/src/{name}": "" for name in ("a.cc", "b.HPP", "c.c++")}}
    equal(hints_of(binary, files), ["tool/src/a.cc and 2 more are" + what])
    equal(hints_of(binary, files, "mode=gen"), ["tool/src/a.cc and 2 more are" + what])
    with Workspace(binary, {**FILES, **files}) as workspace:
        equal("only copied" in workspace.run("main.qrex"), False)
        holds(workspace.run("main.qrex", "diagnostics=true"), "\ntool/src/a.cc and 2 more are" + what + "\n")


def make_files_whose_call_builds_nothing(binary):
    called = "make translates by Qrex all.qrex, "
    settings = FILES["main.qrex"]
    other = {"tree/all.qrws": '"all" { "core" "app" "tool" }\n'}
    equal(hints_of(binary, other, "mode=gen"),
          [called + 'which is not there: name main.qrex so, or "all" in the workspace file otherwise'])
    equal(hints_of(binary, {**other, "all.qrex": settings}, "mode=gen"), [])
    equal(hints_of(binary, other, "mode=gen", "compiler=vc14"), [])
    equal(hints_of(binary, {}, "mode=gen"), [])
    equal(hints_of(binary, {"main.qrex": settings + "mode = gen\n"}),
          ["make translates by Qrex main.qrex, and mode = gen stands there: write mode = build, and call "
           "Qrex main.qrex mode=gen for the make files"])


def a_configuration_that_is_none(binary):
    quotes = "; a line of the configuration stands behind the file"
    for argument, hint in (("--hlep", "did you mean --help?"), ("--frob", "the options are --graph --help --init --list --reflect --report --there --version --where --why"),
                           ("X=/p", "a variable has its value in quotes: 'X=\"/p\"'" + quotes)):
        with Workspace(binary, {}) as workspace:
            output = on_terminal([binary, argument], workspace.folder)
        equal(output.splitlines()[-2:], [f"Exception: Couldn't open file {argument}", "    hint: " + hint])


def what_macros_hold(binary):
    lists = ('@for (x in names) { }', '@def names = {a}\n\n@for (x in names) { }', '@let int x = "s"',
             '@let int x = 1\n@let x = "s"')
    file = "tree/tool/src/tool.cpp"
    expected = ("there is no macro names; a list is [a, b] or a macro that holds one",
                f"the list is names, which stands at {file}(1)", f"in the @let at {file}(1)", f"in the @let at {file}(2)")
    for text, hint in zip(lists, expected):
        equal(hints_of(binary, {"tree/tool/src/tool.cpp": text + "\n"}), [hint])


def what_is_plain_cpp(binary):
    std = ("nothing of std is reflected: write string8 for std::string, xvector<T> for std::vector<T>, xmap<K,V> for "
           "std::map<K,V>")
    for text, hint in (("$[[nodiscard]] int32 f();", "an attribute stands ahead of the $, where it is plain text"),
                       ("$function+ std::string f();", std)):
        equal(hints_of(binary, {"tree/tool/src/tool.cpp": text + "\n"}), [hint])


def a_project_file_that_misleads(binary):
    where = " begins at tree/tool/src/tool.qrpj(4)"
    block = PROJECT.replace('%s\n{', '+cpp %s\n{', 1) % ("Console Application", "tool", "{ -Wall", '"tool.cpp"')
    none = "nothing is done for the project of tree/tool/src/tool.qrpj, whose error is told above"
    changes = {"main.qrex": FILES["main.qrex"].replace('"all.qrws"', '"tool"'), "tree/tool/src/tool.qrpj": block}
    equal(hints_of(binary, changes), ["is there a } missing? A block of switches" + where, none])
    changes["main.qrex"] = changes["main.qrex"].replace("= gcc", "= vc14")
    equal(hints_of(binary, changes), ["is there a } missing? A block of switches" + where, none])
    changes = {"tree/tool/src/tool.qrpj": PROJECT % ("Console Application", "tul", "qrex", '"tool.cpp"')}
    equal(hints_of(binary, changes),
          ['tul/src/tool.cpp is listed in tree/tool/src/tool.qrpj(8), and tree/tool/src/tool.qrpj does not stand below '
           'its $ROOT_TO_PROJDIR, "tul"'])


def a_header_that_nobody_registers(binary):
    changes = {"tree/tool/src/tool.qrpj": PROJECT % ("Console Application", "tool", "qrex", '"tool.cpp" "keeper.h"'),
               "tree/tool/src/keeper.h": "$enum+ E { x };\n"}
    equal(hints_of(binary, changes),
          ['write tree/tool/src/keeper.cpp with the line @import "keeper.h", and list it in tree/tool/src/tool.qrpj'])


run_tests([no_message_no_hint, a_configuration_that_is_none, what_macros_hold, what_is_plain_cpp,
           a_project_file_that_misleads, a_header_that_nobody_registers, a_workspace_or_project_that_is_not_found,
           a_source_that_is_missing, an_import_that_is_not_found, an_import_that_cannot_be_used, sources_that_are_only_copied,
           an_invalid_word, a_configuration_that_a_project_lacks, a_line_of_the_command_line,
           a_library_that_this_program_does_not_build, an_assembler_that_is_missing, make_files_whose_call_builds_nothing])
