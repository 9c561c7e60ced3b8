#!/usr/bin/env python3
"""A run that keeps going behind errors of translations: all are told, and what they do not touch is made."""

from workspace_fixture import (Workspace, comparable, contents, equal, holds, in_workspace, lacks, project, run_tests,
                               stand_ins, workspace_of)

PROJECTS = {  # kind, subprojects, public headers, sources
    "core": ("Static Library", "", ("good.h", "bad.h", "over.h"), ("core.cpp", "fine.cpp")),
    "util": ("Static Library", '"core"', (), ("util.cpp",)),
    "app": ("Console Application", '"core" "util"', (), ("app.cpp", "own.cpp", "far.cpp", "fine.cpp")),
    "tool": ("Console Application", '"util"', (), ("tool.cpp",)),
    "other": ("Console Application", "", (), ("other.cpp",)),
}
TEXTS = {"core/bad.h": "int bad;\n@let 5\n", "core/over.h": '@import "bad.h"\n', "core/src/core.cpp": '@import "good.h"\n',
         "app/src/own.cpp": "\n\n$enum 5\n", "app/src/far.cpp": '@import "core/good.h"\n\n@import "core/over.h"\n',
         "app/src/app.cpp": '@import "core/bad.h"\n'}


def files():
    made = {**workspace_of(*PROJECTS), **stand_ins()}
    for name, (kind, used, headers, sources) in PROJECTS.items():
        listed = " ".join(f'"{each}"' for each in headers) + ' "src" { ' + " ".join(f'"{each}"' for each in sources) + " }"
        made[f"tree/{name}/src/{name}.qrpj"] = project(kind, name, listed, f"subproj {{ {used} }}")
        for path in [f"{name}/{header}" for header in headers] + [f"{name}/src/{source}" for source in sources]:
            made[f"tree/{path}"] = TEXTS.get(path, f"int {name};\n")
    return made


def made(workspace):
    files = contents(workspace.folder, "x64/**/*", "out/**/*", "qrexsource/**/*")
    return {name: content for name, content in files.items() if ".qrexdep" not in name}


@in_workspace(files())
def test_all_errors_are_comparable(workspace):
    logs = []
    for jobs in ("1", "3"):
        workspace.clean()
        logs.append(comparable(workspace.run("all.qrex", "keepGoing=true", f"jobs={jobs}", status=1)))
    equal(logs[1], logs[0])
    log = logs[0]
    holds(log, "\ntree/core/bad.h(2) : ", "\ntree/core/over.h(1) : note : not translated: it imports tree/core/bad.h, which has "
          "an error\n", "util\n", "\ntree/app/src/own.cpp(3) : ", "\ntree/app/src/far.cpp(3) : note : not translated: it imports tree/core/over.h",
          "\ntree/app/src/app.cpp(1) : note : not translated: it imports tree/core/bad.h",
          "tool is not linked: core could not be made\n", "other\n", "Completed with 0 warnings, 2 errors")
    equal((log.count("bad.h(2)"), log.count("not translated")), (1, 3))
    equal(sorted(name for name in made(workspace) if name.startswith("out/lib") or name.endswith(".o")),
          ["out/lib/x64/Debug/libutil.a", "out/lib/x64/Debug/other", "x64/Debug/app/fine.o",
           "x64/Debug/core/fine.o", "x64/Debug/other/other.o", "x64/Debug/tool/tool.o", "x64/Debug/util/util.o"])
    # Told again as long as they are there, also where the main source alone is asked for; then what lacked is made.
    holds(workspace.run("all.qrex", "keepGoing=true", status=1), "bad.h(2)", "Completed with 0 warnings, 2 errors")
    lacks(workspace.run("all.qrex", "keepGoing=true", "mode=compile", '$COMPILE_FILE_PATH="%s/tree/app/src/app.cpp"'
                        % workspace.folder, status=1), "Compile completed")
    workspace.write("tree/core/bad.h", "int bad;\n")
    workspace.write("tree/app/src/own.cpp", "int own;\n")
    lacks(workspace.run("all.qrex", "keepGoing=true"), "error")
    with Workspace(workspace.binary, files()) as fresh:
        fresh.write("tree/core/bad.h", "int bad;\n")
        fresh.write("tree/app/src/own.cpp", "int own;\n")
        log = fresh.run("all.qrex")
        equal(made(workspace), made(fresh))
        fresh.clean()
        equal(comparable(fresh.run("all.qrex", "keepGoing=true")), comparable(log))


run_tests(globals())
