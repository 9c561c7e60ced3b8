#!/usr/bin/env python3
"""The key schemaLock: releases that are recorded stay as they are, whatever a run translates of them."""

import shutil

from workspace_fixture import ROOT, equal, holds, in_workspace, lacks, project, run_tests, workspace_of

LOCK = "kept/all.schemas"
HEAD = "# Releases of models whose archives can be read. Kept by Qrex, to be committed.\n"
IMPORT = '@import "Vesk/vxObject/IObject.h"\n'
KINDS = """namespace n {
$enum Kind { low, high };
$variant Either { Kind; int32 count; };
$model Part { xvector<Kind> kinds; };
$typedef int32 Number;
}
"""
NOTE = """$model Note
{
    assignable<string8> text;
    n::Part part;
    xmap<int32,n::Either> parts;
    $dropped { n::Number old; }
    $schema
    {
        1: +old +text
        10: -old +part +parts
    }
};
"""
OTHER = "$model Other\n{\n    int32 a;\n    $schema { 2: +a }\n};\n"
LINES = """app Note 1 = +old:int32 +text:string8
app Note 10 = -old +part:n::Part +parts:xmap<int32,n::Either>
app Other 2 = +a:int32
app n::Either variant = :n::Kind count:int32
app n::Kind enum = low:0 high:1
app n::Part model = kinds:xvector<n::Kind>
"""
KEY = f'schemaLock = "{LOCK}"\n'
FILES = {
    **workspace_of("app", "Vesk/vxObject", settings=f'virtualTree += {{ "{ROOT / "runtime"}" }}\ntranslateOnly = true\n'),
    "tree/app/src/app.qrpj": project("Console Application", "app", '"src" { "kinds.h" "note.h" "other.h" "other.cpp" "app.cpp" }',
                                     'subproj { "Vesk/vxObject" }'),
    "tree/app/src/kinds.h": IMPORT + KINDS,
    "tree/app/src/note.h": '@import "kinds.h"\n' + NOTE,
    "tree/app/src/other.h": IMPORT + OTHER,
    "tree/app/src/other.cpp": '@import "other.h"\n',
    "tree/app/src/app.cpp": '@import "kinds.h"\n@import "note.h"\nvxDefineTarget(app, 10)\nint main() { return 0; }\n',
}
KEYED = {**FILES, "all.qrex": FILES["all.qrex"] + KEY}
HEADER_OF = {"Kind": ("kinds.h", "low, high"), "Other": ("other.h", "int32 a;\n    $schema { 2: +a }")}


def lock(workspace):
    return workspace.path(LOCK).read_text()


def change(workspace, name, new):
    """Gives a declaration another body than it has at first."""
    file, old = HEADER_OF[name]
    workspace.edit(f"tree/app/src/{file}", old, new)


@in_workspace(KEYED)
def test_what_is_new_is_recorded(workspace):
    workspace.run("all.qrex")
    equal(lock(workspace), HEAD + LINES)
    before = workspace.times("**/*")
    for line in ("jobs=1", "rebuildAll=true", "mode=clean", "mode=gen"):
        workspace.run("all.qrex", line)
    lacks(str(workspace.changed(before, "**/*")), LOCK)
    assert not list(workspace.folder.glob("qrexsource/**/*.qrexschemas")) and workspace.path(LOCK).exists()
    workspace.run("all.qrex")
    change(workspace, "Kind", "low, high, last")
    workspace.edit("tree/app/src/kinds.h", "int32 count;", "int32 count; bool;")
    change(workspace, "Other", "int32 a; int32 b;\n    $schema { 2: +a 10: +b }")
    workspace.run("all.qrex")
    equal(lock(workspace), HEAD + LINES.replace("high:1", "high:1 last:2").replace("count:int32", "count:int32 :bool").replace(
        "Other 2 = +a:int32\n", "Other 2 = +a:int32\napp Other 10 = +b:int32\n"))
    workspace.write("tree/app/src/new.h", IMPORT + OTHER.replace("Other", "New"))
    workspace.replace("tree/app/src/app.qrpj", '"other.h"', '"other.h" "new.h"')
    workspace.edit("tree/app/src/app.cpp", "int main", '@import "new.h"\nint main')
    workspace.run("all.qrex")
    holds(lock(workspace), "app New 2 = +a:int32\napp Note 1 ")


@in_workspace(FILES)
def test_without_the_key(workspace):
    """Nothing is read or written; a target that is too low is a warning with compilableText alone."""
    workspace.edit("tree/app/src/app.cpp", "(app, 10)", "(app, 9)")
    workspace.write(LOCK, "<<<<<<< HEAD\n")
    lacks(workspace.run("all.qrex"), "release 9")
    holds(workspace.run("all.qrex", "rebuildAll=true", "compilableText=true"), "app.cpp(3) : warning W1020 : ")
    equal(list(workspace.folder.glob("qrexsource/**/*.qrexschemas")), [])
    equal(lock(workspace), "<<<<<<< HEAD\n")


@in_workspace(KEYED)
def test_what_is_recorded_stays(workspace):
    """Each change is an error at the $schema, in this run and the next; taken back, all is well."""
    workspace.run("all.qrex")
    next_release = "and what is new as release 11"
    lines = {"note.h": 8, "other.h": 5, "kinds.h": 5}
    for name, old, new, at, told in [
            ("note.h", "10: -old +part +parts", "10: -old +parts +part", "note.h",
             [f'Release 10 of $model Note is "-old +part:n::Part +parts:xmap<int32,n::Either>" in {LOCK}(3) and "-old +parts:', next_release]),
            ("note.h", "1: +old +text", "1: +text +old", "note.h", ["Release 1 of $model Note is ", next_release]),
            ("note.h", "    assignable<string8> text;", "    string16 text;", "note.h", ['+text:string16" here: archives of it and of later releases']),
            ("kinds.h", "$typedef int32 Number", "$typedef int64 Number", "note.h", ["+old:int64"]),
            ("other.h", "2: +a", "3: +a", "other.h", ["Release 3 of $model Other is new, and archives of releases up to 10", "make it release 11"]),
            ("other.h", "int32 a;\n    $schema { 2: +a }", "int32 a; int32 b;\n    $schema { 2: +a 5: +b }", "other.h", ["Release 5 ", "make it release 11"]),
            ("other.h", "$schema { 2: +a }", "/* none */", "", ["Release 2 of $model Other stands in", 'Write "2: +a" again']),
            ("kinds.h", "low, high", "low = 1, high", "note.h", [f'$model Note stores n::Kind, which is "low:0 high:1" in {LOCK}(6)', "with their numbers"]),
            ("kinds.h", "low, high", "high", "note.h", ['and "high:0" now']),
            ("kinds.h", "Kind; int32 count;", "int32 count; Kind;", "note.h", ["stores n::Either", "Give the items back in their order"]),
            ("kinds.h", "xvector<Kind> kinds;", "xvector<Kind> kinds; bool b;", "note.h", ["stores n::Part", "or give it a $schema whose first release has them"]),
            ("kinds.h", "xvector<Kind> kinds;", "xvector<Kind> kinds; bool b; $schema { 1: +b 11: +kinds }", "kinds.h",
             ['The first release of $model n::Part is "+b:bool"', '"+kinds:xvector<n::Kind>"'])]:
        workspace.edit(f"tree/app/src/{name}", old, new)
        place = f"{at}({lines[at]})" if at else f"{name}(2)"
        for line in ("jobs=1", "jobs=1", "keepGoing=true", "jobs=1"):
            holds(workspace.run("all.qrex", line, status=1), f"tree/app/src/{place} : error : ", *told)
            equal(lock(workspace), HEAD + LINES)
        workspace.edit(f"tree/app/src/{name}", new, old)
        workspace.run("all.qrex")
    equal(lock(workspace), HEAD + LINES)
    workspace.edit("tree/app/src/kinds.h", "xvector<Kind> kinds;", "xvector<Kind> kinds; bool b; $schema { 1: +kinds 11: +b }")
    workspace.edit("tree/app/src/app.cpp", "(app, 10)", "(app, 11)")
    workspace.run("all.qrex")
    holds(lock(workspace), "app n::Part 1 = +kinds:xvector<n::Kind>\napp n::Part 11 = +b:bool\n")


@in_workspace(KEYED)
def test_partial_runs(workspace):
    """What a run does not see stays recorded, and what was changed in the lock itself is seen though no source is stale."""
    workspace.run("all.qrex")
    workspace.path(LOCK).unlink()
    workspace.run("all.qrex")
    equal(lock(workspace), HEAD + LINES)
    workspace.edit("tree/app/src/other.h", "$schema { 2: +a }", "$schema { 2: +a }\n@fail(\"no\")\n")
    change(workspace, "Kind", "low, high, last")
    holds(workspace.run("all.qrex", "keepGoing=true", status=1), "other.h(6)")
    equal(lock(workspace), HEAD + LINES.replace("high:1", "high:1 last:2"))
    workspace.edit("tree/app/src/other.h", "\n@fail(\"no\")\n", "")
    workspace.run("all.qrex")
    before = workspace.times("qrexsource/**/*.[hc]*")
    workspace.replace(LOCK, "Other 2 = +a:int32", "Other 2 = +a:int64")
    for _ in range(2):
        holds(workspace.run("all.qrex", status=1), 'tree/app/src/other.h(5) : error : Release 2 of $model Other is "+a:int64"')
    workspace.replace(LOCK, "+a:int64", "+a:int32")
    lacks(workspace.run("all.qrex"), "warning")
    equal(workspace.changed(before, "qrexsource/**/*.[hc]*"), [])
    workspace.append(LOCK, "app Lost 3 = +x:int32\nlib Foreign 1 = +x:bool\n")
    holds(workspace.run("all.qrex"), f"{LOCK}(8) : warning : Lost is no model with a $schema of project app any more")
    lacks(workspace.run("all.qrex"), "Lost")
    holds(lock(workspace), "app Lost 3 = +x:int32\n", "lib Foreign 1 = +x:bool\n")
    workspace.edit("tree/app/src/app.cpp", "int main", "int other();\nint main")
    lacks(workspace.run("all.qrex", "$COMPILE_FILE_PATH=\"" + str(workspace.path("tree/app/src/app.cpp")) + '"', "mode=compile"), "Lost")
    holds(workspace.run("all.qrex", "rebuildAll=true"), f"{LOCK}(2) : warning : Lost is no model")


@in_workspace(KEYED)
def test_a_lock_that_is_none(workspace):
    workspace.run("all.qrex")
    workspace.edit("tree/app/src/other.h", "int32 a;", "int32 a; ")
    for text, line, told in [
            (HEAD + LINES + "app Other 2 = +a:int64\n", 8, f"Release 2 of Other stands in {LOCK}(4) in another way: where two changes have added it"),
            (HEAD + LINES + "app n::Kind enum = low:0\n", 8, "n::Kind stands in"),
            (HEAD + "<<<<<<< HEAD\n" + LINES + "=======\n>>>>>>> other\n", 2, "A merge has left a conflict here"),
            ("app Note\n", 1, "PROJECT NAME RELEASE = CHANGES expected"),
            ("app Note one = +a:int32\n", 1, "PROJECT NAME RELEASE"),
            ("app Note 99999999999 = +a:int32\n", 1, "PROJECT NAME RELEASE"),
            ("\0\xff\n", 1, "PROJECT NAME RELEASE")]:
        workspace.write(LOCK, text)
        before = workspace.times("qrexsource/**/*")
        holds(workspace.run("all.qrex", status=1), f"{LOCK}({line}) : error : {told}")
        equal((lock(workspace), workspace.changed(before, "qrexsource/**/*")), (text, []))
    workspace.path(LOCK).unlink()
    workspace.path(LOCK).mkdir()
    holds(workspace.run("all.qrex", status=1), LOCK)
    workspace.path(LOCK).rmdir()
    workspace.write(LOCK, (LINES.replace("\n", "\r\n") + "# Mine\r\n" + LINES.replace("\n", "\r\n")))
    workspace.run("all.qrex")  # a union of two sides
    equal(lock(workspace), HEAD + LINES)
    workspace.path(LOCK).unlink()
    shutil.rmtree(workspace.path("kept"))
    workspace.write("kept", "")
    workspace.edit("tree/app/src/other.h", "int32 a; ", "int32 a;")
    for _ in range(2):  # what could not be recorded is not taken for done
        holds(workspace.run("all.qrex", status=1), "kept/all.schemas")
    workspace.path("kept").unlink()
    workspace.run("all.qrex")
    equal(lock(workspace), HEAD + LINES)


@in_workspace(KEYED)
def test_the_release_of_the_target(workspace):
    workspace.run("all.qrex")
    change(workspace, "Other", "int32 a; int32 b;\n    $schema { 2: +a 12: +b }")  # app.cpp is not stale by it
    told = "app.cpp(3) : error : The target of the project writes archives of release 10, and a $schema of it has release 12"
    for lines in ([], [], ["keepGoing=true"], ["rebuildAll=true"], []):
        holds(workspace.run("all.qrex", *lines, status=1), told)
    workspace.edit("tree/app/src/app.cpp", "(app, 10)", "(app, 12)")
    lacks(workspace.run("all.qrex"), "error")
    workspace.edit("tree/app/src/app.cpp", "(app, 12)", "(app, 11)")
    holds(workspace.run("all.qrex", status=1), "define the target with 12")


run_tests(globals())
