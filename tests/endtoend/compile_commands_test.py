#!/usr/bin/env python3
"""compile_commands.json, as other tools read it: what stands there compiles each file, and clangd and clang-tidy take it."""

import json
import shlex
import shutil
import subprocess

from workspace_fixture import ROOT, Skipped, Workspace, equal, holds, in_workspace, lacks, plain, project, run_tests, workspace_of

EXAMPLES = {"cmake": "stock", "evolution": "evolution", "first": "first", "remote": "remote", "shapes": "geometry", "tour": "tour"}
NAME = "compile_commands.json"
PLAIN = project("Console Application", "plain", '"src" { "plain.cpp" }').replace("qrex\n", "")
FILES = {
    **workspace_of("app", "plain", settings="compileCommands = true\ntranslateOnly = true\n"),
    "tree/app/src/app.qrpj": project("Console Application", "app", '"src" { "app.cpp" "two words.cpp" "c.c" "a.asm" "h.h" }',
                                     '+cpp ("gcc") { -DVALUE=2 }'),
    "tree/app/src/app.cpp": "int value = VALUE;\nint main() { return 0; }\n",
    "tree/app/src/two words.cpp": "int two;\n",
    "tree/app/src/c.c": "int c;\n",
    "tree/app/src/a.asm": "end\n",
    "tree/app/src/h.h": "int h();\n",
    "tree/plain/src/plain.qrpj": PLAIN,
    "tree/plain/src/plain.cpp": "int main() { return 0; }\n",
}


def entries(workspace):
    return json.loads(plain(workspace.path(NAME).read_text()))


def compile_all(workspace):
    """Each entry as it stands, without a shell between."""
    for entry in entries(workspace):
        output = workspace.path(entry["output"])
        output.parent.mkdir(parents=True, exist_ok=True)
        done = subprocess.run(entry["arguments"], cwd=entry["directory"], capture_output=True, text=True)
        assert done.returncode == 0, f"{entry}:\n{done.stderr}"
        assert output.exists(), entry
        output.unlink()


@in_workspace(FILES, "gcc")
def test_files(workspace):
    """Those of all projects that are compiled, whether translated or not, in all modes alike."""
    workspace.run("all.qrex")
    first = workspace.path(NAME).read_text()
    equal([entry["file"] for entry in entries(workspace)],
          [f"qrexsource/x64/Debug/app/src/{name}" for name in ("c.c", "two words.cpp", "app.cpp")] + ["tree/plain/src/plain.cpp"])
    equal({entry["directory"] for entry in entries(workspace)}, {str(workspace.folder.resolve())})
    compile_all(workspace)
    before = workspace.times(NAME)
    for mode in ("build", "gen", "compile"):
        workspace.run("all.qrex", f"mode={mode}", '$COMPILE_FILE_PATH = "tree/app/src/app.cpp"')
    equal(workspace.changed(before, NAME), [])  # the same, and left alone
    workspace.run("all.qrex", 'launcher = "ccache"', "commandFiles=false")
    equal(workspace.path(NAME).read_text(), first)  # neither is part of it
    workspace.replace("tree/app/src/app.qrpj", "VALUE=2", "VALUE=2 -DOTHER=1")
    workspace.run("all.qrex", "mode=gen")
    holds(workspace.path(NAME).read_text(), '"-DOTHER=1"')


@in_workspace(FILES)
def test_only_where_asked(workspace):
    for line in ("compileCommands=false", "mode=clean"):
        workspace.run("all.qrex", line)
        assert not workspace.path(NAME).exists(), line
    workspace.write("tree/app/src/app.cpp", "$class {\n")
    workspace.run("all.qrex", status=1)
    equal(len(entries(workspace)), 4)  # an editor needs it most where a source has an error
    workspace.path(NAME).unlink()
    workspace.path(NAME).mkdir()
    holds(workspace.run("all.qrex", status=1), "Error: ", NAME)


@in_workspace(FILES)
def test_visual(workspace):
    """Words of cl, which clang takes by that name."""
    workspace.run("all.qrex", "compiler=vc14", "mode=gen")
    entry = entries(workspace)[2]
    equal(entry["arguments"][:2], ["cl", "/c"])
    holds(" ".join(entry["arguments"]), "/I qrexsource/x64/Debug/app", "/Fo", entry["file"])
    equal(entry["output"], "x64/Debug/app/app.obj")
    assert not [word for word in entry["arguments"] if word.startswith(("/Yu", "/Yc", "/Fp"))], entry
    workspace.run("all.qrex", "compiler=vc14")
    tidy = shutil.which("clang-tidy-19") or shutil.which("clang-tidy-14")
    if not tidy:
        raise Skipped("clang-tidy-19")
    lacks(workspace.shell(f"{tidy} --checks='-*,misc-*' '{entry['file']}' -extra-arg=/DVALUE=2 2>&1"), "error")


def test_examples(binary):
    """What stands there of each example compiles, and clangd takes it; the runtime's files are among them once."""
    server = shutil.which("clangd-19")
    for folder, name in EXAMPLES.items():
        with Workspace(binary, {}) as workspace:
            shutil.copytree(ROOT / "examples" / folder, workspace.path("w/e"))
            workspace.folder = workspace.path("w/e")
            text = workspace.path(f"{name}.qrex").read_text()
            workspace.write(f"{name}.qrex", text.replace("../../runtime", str(ROOT / "runtime")))
            workspace.run(f"{name}.qrex", "translateOnly=true", "compileCommands=true", "mode=build")
            workspace.write(NAME, plain(workspace.path(NAME).read_text()))  # clangd is of this system
            own = {entry["file"]: entry["arguments"] for entry in entries(workspace)
                   if folder == "tour" or "/Vesk/" not in entry["file"]}
            assert own, folder
            for file, words in own.items():
                workspace.path(words[words.index("-o") + 1]).parent.mkdir(parents=True, exist_ok=True)
                workspace.shell(shlex.join([*words, "-fsyntax-only"]))
                if server:
                    checked = workspace.shell(f"{server} --check='{file}' --check-locations=0 2>&1")
                    holds(checked, "compile_commands.json", "completed, 0 errors")
    if not server:
        raise Skipped("clangd-19")


run_tests(globals())
