#!/usr/bin/env python3
"""Whole runs: modes, what a second run leaves alone, bad input, what is in the way, other runs."""

import os
import re
import shutil
import subprocess
import time

from workspace_fixture import DRIVE, Workspace, contents, equal, holds, in_workspace, lacks, project, run_tests, workspace_of

PROJECT = "tree/app/src/app.qrpj"
FILES = {
    **workspace_of("app", settings="translateOnly = true\n"),
    PROJECT: project("Static Library", "app", '"a.h" "b.h" "c.h" "n.txt" "src" { "x.cpp" "y.cpp" "app.cpp" }'),
    "tree/app/a.h": "$enum+ A { a1 };\n",
    "tree/app/b.h": '@import "a.h"\nint b;\n',
    "tree/app/c.h": "int c;\n",
    "tree/app/n.txt": "n\n",
    "tree/app/src/x.cpp": '@import "app/b.h"\n@import "app/a.h"\n$init { }\nint x;\n',
    "tree/app/src/y.cpp": '@import "app/c.h"\nint y;\n',
    "tree/app/src/app.cpp": "int app;\n",
}
DEPENDENCIES = "qrexsource/x64/Debug/app.qrexdep"
TRANSLATED = "qrexsource/x64/Debug/app/"
EACH_RUN = {DEPENDENCIES, "projects.guids"}  # written by every run
JUNK = bytes(range(256)) * 8
TELLING = ("all.qrex", "diagnostics=true")


def listing(files, statements="", kind="Static Library"):
    """Another project of the same name."""
    return f'$TARGET_TYPE = "{kind}"\n$ROOT_TO_PROJDIR = "app"\n{statements}{{ {files} }}\n'


def of_file(mode, path):
    return "all.qrex", f"mode={mode}", f'$COMPILE_FILE_PATH = "{path}"'


def changed(workspace, before):
    return [name for name in workspace.changed(before, "**/*") if not workspace.path(name).is_dir()]


def stale(log):
    return re.findall(r"^\* (.*)$", log, re.MULTILINE)


def made(workspace):
    return contents(workspace.folder, "qrexsource/**/*", "out/**/*")


def made_alike(workspace):
    """What every run makes in the same way."""
    return {name: content for name, content in made(workspace).items() if name not in EACH_RUN}


def main_source(workspace):
    return workspace.path(TRANSLATED + "src/app.cpp").read_text()


# --- Modes

@in_workspace(FILES)
def test_a_second_run_leaves_all_alone(workspace):
    text = workspace.run("all.qrex")
    holds(text, "Qrex V2.20 Oct  7 2020\n", "$EXPORT_LIB = out/lib\n",
          "PATH = tools;/usr/local/bin;/usr/bin;/bin\nINCLUDE = /usr/include\nLIB = /usr/lib\n",
          "Building workspace [all.qrws]\n", "Writing out/source/app/src/app.qrpj\n",
          "\n------------------------------------- app  [Debug|x64] ------------------------------------------\n")
    assert re.search(r"\napp\.{85} +\d+\.\d\d ms\n\nCompleted\.{79} +\d+\.\d\d ms\n$", text), text
    first = made(workspace)
    exported = {f"out/{kind}/app/{name}" for kind in ("include", "source") for name in ("a.h", "b.h", "c.h", "n.txt")}
    equal({name for name in first if name.startswith("out/")},
          {*exported, "out/source/.qrwsroot", "out/source/app/src/app.qrpj", "out/source/all.qrws"})
    equal(first["out/include/app/b.h"], first[TRANSLATED + "b.h"])
    assert first["out/source/app/b.h"] == FILES["tree/app/b.h"].encode() != first[TRANSLATED + "b.h"], first
    equal({name for name in first if workspace.path(name).stat().st_mode & 0o222}, {DEPENDENCIES, "out/source/.qrwsroot"})
    before = workspace.times("**/*")
    text = workspace.run("all.qrex")
    lacks(text, "Writing")
    lacks(text, "Deleting")
    holds(text, "Skipping out/source/app/src/app.qrpj\n")
    assert set(changed(workspace, before)) <= EACH_RUN, changed(workspace, before)
    equal(made(workspace), first)  # the dependency file included


@in_workspace(FILES)
def test_what_an_edit_makes_stale(workspace):
    workspace.run("all.qrex")
    for source, expected in [("a.h", ["a.h", "b.h", "x.cpp"]), ("b.h", ["b.h", "x.cpp"]), ("c.h", ["c.h", "y.cpp"]),
                             ("src/y.cpp", ["y.cpp"]), ("n.txt", ["n.txt"])]:
        workspace.edit(f"tree/app/{source}", "\n", "\n// edited\n")
        equal((source, stale(workspace.run(*TELLING))), (source, expected))
        equal(stale(workspace.run(*TELLING)), [])
    # What a .cpp registers is written into the main source.
    workspace.rewrite("tree/app/src/y.cpp", '@import "app/c.h"\n$init { }\n')
    text = workspace.run(*TELLING)
    holds(text, "* y.cpp\n", f"Writing: {TRANSLATED}src/y.cpp\n", f"Writing: {TRANSLATED}src/app.cpp\n")
    equal(stale(text), ["y.cpp"])
    holds(main_source(workspace), "void _Register_x0()", "void _Register_y0()")
    workspace.path(TRANSLATED + "c.h").unlink()
    equal(stale(workspace.run(*TELLING)), ["c.h"])
    workspace.write(DEPENDENCIES, JUNK)
    for line, told in ("jobs=1", f"No dependency file {DEPENDENCIES}\n"), ("rebuildAll=true", f"\nDeleting {DEPENDENCIES}\n"):
        text = workspace.run(*TELLING, line)
        holds(text, told)
        equal(len(stale(text)), 7)


@in_workspace(FILES)
def test_nothing_is_lost_when_an_error_ends_the_run(workspace):
    workspace.run("all.qrex")
    workspace.edit("tree/app/src/x.cpp", "$init { }\n", "$init { }\n$init { }\n")
    workspace.edit("tree/app/src/y.cpp", "int y;\n", "$bad\n")
    text = workspace.run("all.qrex", status=1)
    holds(text, "\ntree/app/src/y.cpp(2) : error : '$bad' is not a valid directive")
    lacks(text, "\napp...")
    lacks(text, "Completed")
    lacks(main_source(workspace), "_Register_x1")
    workspace.edit("tree/app/src/y.cpp", "$bad\n", "int y;\n")
    text = workspace.run(*TELLING)
    equal(re.findall(r"^Writing: .*/(.*)$", text, re.MULTILINE), ["y.cpp", "app.cpp"])  # x.cpp was finished before
    holds(main_source(workspace), "_Register_x1")


@in_workspace(FILES)
def test_a_main_source_that_is_compiled_alone_registers_all(workspace):
    compiled = of_file("compile", "tree/app/src/app.cpp")
    workspace.run(*compiled)
    alone = main_source(workspace)
    holds(alone, "_Register_x0")  # x.cpp was never translated, nor is it written
    assert not workspace.path(TRANSLATED + "src/x.cpp").exists()
    holds(workspace.run(*TELLING), f"Writing: {TRANSLATED}src/x.cpp")
    shutil.rmtree(workspace.path("qrexsource"))
    workspace.run("all.qrex")
    equal(main_source(workspace), alone)  # as a whole build writes it
    workspace.rewrite("tree/app/src/y.cpp", "$bad\n")
    workspace.path(DEPENDENCIES).unlink()
    holds(workspace.run(*compiled, status=1), "tree/app/src/y.cpp(1) : error : '$bad' is not a valid directive")


@in_workspace({**FILES, "tree/app/b.h": '@import "a.h"\n@import "c.h"\nint b;\n'})
def test_a_failed_translation_keeps_its_imports(workspace):
    """b.h fails ahead of its import of c.h, and c.h changed as well: mending the former must not hide the latter."""
    workspace.run("all.qrex")
    first = workspace.path("tree/app/a.h").stat().st_mtime_ns
    workspace.edit("tree/app/c.h", "int c;", "int  c;")
    workspace.edit("tree/app/a.h", "$enum", "$bad")
    workspace.run("all.qrex", status=1)
    workspace.replace("tree/app/a.h", "$bad", "$enum")
    os.utime(workspace.path("tree/app/a.h"), ns=(first, first))
    holds(workspace.run(*TELLING), "* b.h\n", "* x.cpp\n", "* y.cpp\n")
    equal(stale(workspace.run(*TELLING)), [])


@in_workspace(FILES)
def test_clean_compile_show(workspace):
    workspace.run("all.qrex")
    holds(workspace.run(*of_file("show", "tree/app/src/x.cpp")),
          "Showing generated file in workspace [all.qrws]\n", f"\n{TRANSLATED}src/x.cpp(1)\n")
    workspace.edit("tree/app/src/y.cpp", "int y", "int  y")
    before = workspace.times("**/*")
    holds(workspace.run(*of_file("compile", "tree/app/src/y.cpp")), "Compiling file tree/app/src/y.cpp...\n",
          f"Deleting {TRANSLATED}src/y.cpp\n", "\n\nCompile completed....")
    equal(changed(workspace, before), [DEPENDENCIES, TRANSLATED + "src/y.cpp"])
    for mode, path, message in [
            ("show", "tree/none.h", "\nFile is not part of an qrex project\n"),
            ("show", "nowhere/x.cpp", "\nSearch for .qrwsroot failed\n"),
            ("show", "x.cpp", "\nSearch for .qrwsroot failed\n"),
            ("compile", "tree/none.cpp", "\nCompilation aborted: File is not part of an qrex project\n"),
            ("compile", "tree/app/a.h", "\nCompilation aborted: File is not a cpp, c or asm file\n"),
            ("compile", "nowhere/x.cpp", "\nSearch for .qrwsroot failed\n")]:
        holds(workspace.run(*of_file(mode, path), status=1), message)
    holds(workspace.run("all.qrex", "mode=clean"), "Cleaning workspace [all.qrws]\n", f"Deleting {DEPENDENCIES}\n",
          f"Deleting {TRANSLATED}a.h\n")
    equal(contents(workspace.folder, "qrexsource/**/*"), {})
    lacks(workspace.run("all.qrex", "mode=clean"), "Deleting")


@in_workspace({name: text for name, text in FILES.items() if name != "tree/app/c.h"})
def test_missing_files_are_made(workspace):
    holds(workspace.run("all.qrex", "mode=gen"), "Generating workspace [all.qrws]\n", "Creating missing file tree/app/c.h\n")
    lacks(workspace.run("all.qrex", "mode=gen"), "Creating")
    equal(workspace.path("tree/app/c.h").read_text(), "")
    workspace.write(PROJECT, listing('"no" { "such.h" }'))
    holds(workspace.run("all.qrex", "mode=gen"), "Creating missing file tree/app/no/such.h\nError creating tree/app/no/such.h\n")


def test_projects_that_write_the_same_files(binary):
    """The last one's stay, as if the projects came one after the other; of the markers that of the first root stays."""
    names = [f"{prefix}{i}" for i in range(6) for prefix in ("p", "build_p")]
    projects = {f"{'over' if 'b' in name else 'tree'}/{name}/src/{name}.qrpj":
                f'$TARGET_TYPE = "Application" $ROOT_TO_PROJDIR = "{name}" qrex toolfiles {{ "of_{name}" }} {{ }}'
                for name in names}
    for _ in range(4):
        with Workspace(binary, {**workspace_of(*names), **projects, "over/.qrwsroot": "over"}) as workspace:
            os.utime(workspace.path("over/.qrwsroot"), (1000, 1000))  # older than the copy of the first
            text = workspace.run("all.qrex", "mode=gen", "compiler=vc9", 'virtualTree += { "over" }')
            equal(re.findall(r"Writing (.*)\.vcproj", text), [of for name in names for of in (name, "build_" + name)])
            for i in range(6):
                holds(workspace.path(f"build_p{i}.vcproj").read_text(), f'"of_build_p{i}"')
            equal(workspace.path("out/source/.qrwsroot").read_text(), "")
    twice = listing("", '+cpp { -one } config { "D|x" }').replace("+cpp", 'config { "D|x" } +cpp')
    with Workspace(binary, {**FILES, PROJECT: twice}) as workspace:
        equal(workspace.run("all.qrex", "mode=gen").count("Writing make_app_x_D\n"), 2)
        holds(workspace.path("make_app_x_D").read_text(), "CXXFLAGS = \n")


@in_workspace({**FILES, PROJECT: listing("", 'export\nconfig { "Debug|x64" }\n', "Application"),
               "tree/x64/Debug/app.exe": "#!/bin/sh\n"})
def test_repackaged_program_stays_executable(workspace):
    workspace.run("all.qrex", "repackageExecutableTargets=false")
    equal(contents(workspace.folder, "out/lib/**/*"), {})
    workspace.run("all.qrex")
    assert os.access(workspace.path("out/lib/x64/Debug/app.exe"), os.X_OK)


@in_workspace({**FILES, "all.translate.qrex": FILES["all.qrex"],
               "tools/MSBuild": '#!/bin/sh\necho "$PATH" "$@" > log\nexit 3\n'})
def test_parallel_build(workspace):
    workspace.path("all.qrex").unlink()
    text = workspace.run("*all.SLN", 'PATH("x64") = { "tools" "/bin" }')
    command = 'MSBuild /verbosity:minimal /m /t:Build "/p:Platform=x64;Configuration=Debug" build_all.SLN'
    holds(text, "argv[1] = *all.SLN\n", "\nCompleted...", f"\n{command}\n{command} failed with error code 3\n"
          "Parallel build with devenv....")
    equal(workspace.path("log").read_text(), "tools:/bin " + command[8:].replace('"', "") + "\n")
    text = workspace.run("*all.sln", "compiler=vc9", "mode=gen")
    holds(text, '\ndevenv build_all.sln /Build "Debug|x64"\n', f"failed with error code {9009 if DRIVE else 127}\n")


# --- Bad input: an orderly end with status 1, the place, and what is wrong

@in_workspace({"empty.qrex": ""})
def test_bad_command_lines(workspace):
    holds(workspace.run('x="1"', status=1), " --> adding variable $x=1\nUsage...\nQrex pathToConfigFile\n")
    equal(subprocess.run([workspace.binary], stdout=subprocess.PIPE).stdout,
          b"Qrex V2.20 Oct  7 2020\nUsage...\nQrex pathToConfigFile\n")
    for argument in ["mode=clean", "none.qrex", ".", "", "*x.qrex", '"unterminated', "/dev/null/x", "none.sln"]:
        name = argument.replace(".sln", ".qrex")
        holds(workspace.run(argument, status=1), f"argv[1] = {argument}\nException: Couldn't open file {name}\n")
    holds(workspace.run("empty.qrex", status=1),
          "\nERROR:  Missing setting: 'virtualTree' not specified\nError in config file empty.qrex\n")
    equal(subprocess.run([workspace.binary, b"\xff\xfe.qrex"], stdout=subprocess.DEVNULL).returncode, 1)


BAD_INPUT = [
    # changes to the tree (None: it is not there), then what the output holds, in order
    ({"all.qrex": JUNK}, ["all.qrex(1) : ", "    while processing qrex config file : all.qrex\n"]),
    ({"tree/all.qrws": None}, ["\nError: Couldn't open workspace file all.qrws\n"]),
    ({"tree/all.qrws": JUNK}, ["tree/all.qrws(1) : ", "\nError in workspace file tree/all.qrws\n"]),
    ({"tree/all.qrws": '"all" {\n"b.qrws" }', "tree/b.qrws": '"b" {\n\n"all.qrws" }'},
     ["\ntree/b.qrws(3) : Workspace file includes itself : all.qrws\n",
      "\ntree/all.qrws(2) : while reading workspace file b.qrws\n"]),
    ({"tree/all.qrws": '"all" ' + '{ "app" ' * 3000}, [" : Blocks nested too deeply\n"]),
    ({PROJECT: JUNK}, ["tree/app/src/app.qrpj(1) : ", "while reading project file app/src/app.qrpj\n"]),
    ({PROJECT: listing('"a" { ' * 3000)}, [" : Blocks nested too deeply\n"]),
    ({"all.qrex": FILES["all.qrex"] + 'workspaces = { "none" "app" }'},
     ["Error: Couldn't open project file none/src/none.qrpj\n", "Error: There is no configuration Debug|x64 in project \n"]),
    ({"tree/app/c.h": JUNK}, ["tree/app/c.h(1) : error : "]),
    ({"tree/app/c.h": None}, ["Couldn't open file tree/app/c.h\n"]),
]


def test_bad_input(binary):
    for changes, pieces in BAD_INPUT:
        files = {name: text for name, text in {**FILES, **changes}.items() if text is not None}
        with Workspace(binary, files) as workspace:
            holds(workspace.run("all.qrex", status=1), *pieces)
            equal(workspace.times("**/*.part"), {})


@in_workspace({**FILES, PROJECT: project("Static Library", "app", '"*.h" *')})
def test_symbolic_links_in_a_circle(workspace):
    workspace.path("tree/app/self").symlink_to(".")
    workspace.path("tree/app/again").symlink_to("../app")
    workspace.run("all.qrex")
    listed = workspace.path(DEPENDENCIES).read_text(errors="replace")
    holds(listed, "app/a.h", "app/b.h", "app/c.h")
    lacks(listed, "self")


@in_workspace({**FILES, "projects.guids": b"\x01\x03app" + bytes(range(16))})
def test_identifier_file_that_cannot_be_written(workspace):
    workspace.path("projects.guids").chmod(0o444)
    holds(workspace.run("all.qrex"), "Error : Couldn't write projects.guids\n", "\nCompleted")
    equal(workspace.path("projects.guids").read_bytes()[-1], 15)  # untouched


# --- What is in the way, and other runs. Failing calls and kills: tests/faults

@in_workspace({**FILES, "qrexsource": "a file"})
def test_what_is_in_the_way(workspace):
    holds(workspace.run("all.qrex", status=1),
          f"Error: File error ({TRANSLATED}a.h) : The system cannot find the path specified.\n")
    workspace.path("qrexsource").unlink()
    for name in ("c.h", "n.txt"):
        workspace.path(TRANSLATED + name).mkdir(parents=True)
    holds(workspace.run("all.qrex", status=1), f"Error: File error ({TRANSLATED}c.h) : ")
    workspace.path(TRANSLATED + "c.h").rmdir()
    holds(workspace.run("all.qrex"), f"ERROR: Copy file tree/app/n.txt to {TRANSLATED}n.txt failed\n"
          "ERROR : GetLastError() returned 5 : Access is denied.\n")
    workspace.clean()
    for name in ("src/app.qrpj", "c.h"):
        workspace.path(f"out/source/app/{name}").mkdir(parents=True)
    holds(workspace.run("all.qrex"), "Error: File error (out/source/app/src/app.qrpj) : ", "\n...Copy file failed\n", "\nCompleted")
    workspace.clean()
    workspace.write("out", "a file")
    holds(workspace.run("all.qrex"), "\n...Copy file failed\n", "\nCompleted")


@in_workspace({**FILES, "tree/app/c.h": "int c;\n" * 200000})
def test_standard_output_that_takes_nothing(workspace):
    workspace.run("all.qrex")
    wanted = made_alike(workspace)
    workspace.clean()
    workspace.shell("Qrex all.qrex diagnostics=true >&-")
    equal(made_alike(workspace) == wanted, True)  # what was printed stands in no file
    if DRIVE:
        return  # not every system has pipes that do not block
    # A pipe that is full for a while and does not block.
    reading, writing = os.pipe()
    os.set_blocking(writing, False)
    os.write(writing, b"." * 60000)
    process = subprocess.Popen([workspace.binary, *['a="' + "x" * 999 + '"'] * 60, "all.qrex", "mode=clean"],
                               cwd=workspace.folder, stdout=writing)
    os.close(writing)
    time.sleep(0.2)
    with os.fdopen(reading) as pipe:
        holds(pipe.read(), "argv[60] = ", "\nCompleted")
    equal(process.wait(), 0)


@in_workspace({**FILES, "tree/app/c.h": "int c;\n" * 100000})
def test_runs_at_the_same_time(workspace):
    workspace.run("all.qrex")
    wanted = made_alike(workspace)
    # Each with the process numbers of the others, as in containers of their own.
    apart = ["unshare", "--pid", "--fork"]
    if subprocess.run([*apart, "true"], stderr=subprocess.DEVNULL).returncode != 0:
        apart = []
    for _ in range(4):
        workspace.clean()
        runs = [subprocess.Popen([*apart, workspace.binary, "all.qrex"], cwd=workspace.folder, stdout=subprocess.PIPE, text=True)
                for _ in range(4)]
        for process in runs:
            text = process.communicate()[0]
            assert process.returncode == 0 and "rror" not in text and "failed" not in text, text
        equal((made_alike(workspace) == wanted, workspace.times("**/*.part")), (True, {}))


run_tests(globals())
