#!/usr/bin/env python3
"""What a build depends on beside the age of files: commands, keys, and inputs that became older."""

import os
import time
from pathlib import Path

from workspace_fixture import equal, in_workspace, project, run_tests, stand_ins, workspace_of

TOOLS = stand_ins()
FILES = {
    **workspace_of("lib", "app", settings="fingerprints = true\nwriteTokenEquivalent = false\n"), **TOOLS,
    "tools/clang": TOOLS["tools/gcc-4"], "tools/clang++": TOOLS["tools/g++"],
    "tree/lib/src/lib.qrpj": project("Static Library", "lib", '"lib.h" "src" { "lib.cpp" "more.cpp" }', "+cpp { -O1 }"),
    "tree/lib/lib.h": "int lib;\n", "tree/lib/src/lib.cpp": '@import "lib.h"\nint of_lib;\n',
    "tree/lib/src/more.cpp": "int more;\n",
    "tree/app/src/app.qrpj": project("Console Application", "app", '"src" { "app.cpp" }', '+cpp { -O1 }\nsubproj { "lib" }\n+link { -lm }'),
    "tree/app/src/app.cpp": '@import "lib/lib.h"\nint app;\n',
}
MADE = ("x64/**/*.o", "out/lib/**/*", "qrexsource/**/*.cpp", "qrexsource/**/*.h")


def build(workspace, *arguments):
    """The names of what was made."""
    before = {}
    for pattern in MADE:
        before.update(workspace.times(pattern))
    workspace.run("all.qrex", *arguments)
    changed = {name for pattern in MADE for name in workspace.changed(before, pattern)}
    return sorted(Path(name).name for name in changed if workspace.path(name).is_file())


def age(workspace, name, seconds):
    os.utime(workspace.path(name), (time.time() + seconds,) * 2)


@in_workspace(FILES)
def test_whatever_differs_is_made_again(workspace):
    for name in workspace.times("tree/**/*"):
        age(workspace, name, -1000)
    build(workspace)
    equal(build(workspace), [])
    equal(build(workspace, "jobs=4", "keepGoing=true", "commandFiles=false"), [])  # these change nothing
    # Switches of compilers and linkers, and the compiler itself.
    workspace.replace("tree/lib/src/lib.qrpj", "-O1", "-O2")
    equal(build(workspace), ["app", "lib.o", "liblib.a", "more.o"])
    workspace.replace("tree/app/src/app.qrpj", "-lm", "-lrt")
    equal(build(workspace), ["app"])
    equal(build(workspace, "compiler=clang"), ["app"])  # which has another linker alone
    equal(build(workspace), ["app"])
    workspace.append("tools/gcc-4", "# of another release\n")
    equal(build(workspace), ["app", "app.o", "lib.o", "liblib.a", "more.o"])
    # A key of translations: the same texts come of it, so that nothing is compiled.
    before = workspace.path("qrexsource/x64/Debug/app.qrexprint").read_bytes()
    equal([name for name in build(workspace, "modernCpp=true") if not name.endswith((".cpp", ".h"))], [])
    assert workspace.path("qrexsource/x64/Debug/app.qrexprint").read_bytes() != before
    build(workspace)
    # A source that an older one replaced, a header as well.
    workspace.write("tree/lib/src/more.cpp", "int fewer;\n")
    age(workspace, "tree/lib/src/more.cpp", -2000)
    equal(build(workspace), ["app", "liblib.a", "more.cpp", "more.o"])
    workspace.write("tree/lib/lib.h", "int old;\n")
    age(workspace, "tree/lib/lib.h", -2000)
    equal([name for name in build(workspace) if name.endswith((".o", ".a", ".h", "app"))],
          ["app", "app.o", "lib.h", "lib.o", "liblib.a"])
    # What was written over outputs.
    workspace.path("out/lib/x64/Debug/app").write_text("other")
    equal(build(workspace), ["app"])
    workspace.path("x64/Debug/lib/more.o").write_text("other")
    equal(build(workspace), ["app", "liblib.a", "more.o"])
    equal(build(workspace), [])


@in_workspace(FILES)
def test_damaged_prints_are_made_anew(workspace):
    build(workspace)
    for content in (b"", b"rubbish" * 9, workspace.path("qrexsource/x64/Debug/lib.qrexprint").read_bytes()[:-3]):
        workspace.path("qrexsource/x64/Debug/lib.qrexprint").write_bytes(content)
        assert "lib.o" in build(workspace)
        equal(build(workspace), [])
    workspace.run("all.qrex", "mode=clean")
    assert not workspace.times("qrexsource/**/*.qrexprint")


@in_workspace({
    **workspace_of("app", settings="fingerprints = true\n"),
    "tree/app/src/app.qrpj": project("Console Application", "app", '"src" { "app.cpp" "more.cpp" }', "+cpp { -MMD -DNUMBER=1 }"),
    "tree/app/src/app.cpp": "#include <cstdio>\nint more();\nint main() { std::printf(\"%d\\n\", more()); }\n",
    "tree/app/src/more.cpp": "int more() { return NUMBER; }\n"}, "make", "g++")
def test_make_compiles_for_another_switch(workspace):
    for number in (1, 2):
        if number == 2:
            workspace.replace("tree/app/src/app.qrpj", "NUMBER=1", "NUMBER=2")
        workspace.run("all.qrex", "mode=gen")
        workspace.shell("make d")
        equal(workspace.shell("out/lib/x64/Debug/app"), f"{number}\n")
        objects = workspace.times("x64/**/*.o")
        workspace.run("all.qrex", "mode=gen")
        workspace.shell("make d")
        equal(workspace.changed(objects, "x64/**/*.o"), [])


run_tests(globals())
