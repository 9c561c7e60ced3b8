#!/usr/bin/env python3
"""Generates the project files of one workspace for each compiler, and reads them with an XML parser of another make."""

import shutil
import sys
import xml.etree.ElementTree as XmlTree
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import COMPILERS, SETTINGS, Workspace, equal, holds, lacks, run_tests  # noqa: E402

DATA = Path(__file__).parents[1] / "generators/workspace"
NAMESPACE = "{http://schemas.microsoft.com/developer/msbuild/2003}"


def generate(binary, compiler):
    family = "vc" if compiler.startswith("vc") else "gcc"
    workspace = Workspace(binary, {"main.qrex": SETTINGS + f'virtualTree += {{ "{family}" }} compiler = {compiler} '
                                   "defaultToDll = false mode = gen", "tree/.qrwsroot": "", "tree/all.qrws": '"all" { "app" }\n'})
    shutil.copytree(DATA, workspace.folder, dirs_exist_ok=True)
    workspace.run("main.qrex")
    return workspace


def xml_of(workspace, name):
    return XmlTree.parse(workspace.path(name)).getroot()


def names(output, word):
    return sorted(line[len(word):] for line in output.splitlines() if line.startswith(word))


def a_second_run_writes_nothing(binary):
    for compiler in COMPILERS:
        with generate(binary, compiler) as workspace:
            before = workspace.times("**/*")
            written = names(workspace.output, "Writing ")
            first = set(written) | set(names(workspace.output, "Skipping "))
            output = workspace.run("main.qrex")
            lacks(output, "Writing ")
            equal(set(names(output, "Skipping ")), first)
            equal(sorted(set(written)), written)
            equal(first.intersection(workspace.changed(before, "**/*")), set())


def line_ends_are_those_of_windows(binary):
    for compiler in ("vc6", "vc8", "vc14", "gcc"):
        with generate(binary, compiler) as workspace:
            for name in names(workspace.output, "Writing "):
                content = workspace.path(name).read_bytes()
                equal((name, content.count(b"\n")), (name, content.count(b"\r\n")))


def older_projects_are_xml(binary):
    with generate(binary, "vc9") as workspace:
        for name in ("app", "build_app", "core", "build_core", "gui", "tool", "pre"):
            root = xml_of(workspace, name + ".vcproj")
            equal((root.tag, root.get("Name")), ("VisualStudioProject", name.removeprefix("build_")))
            specs = [config.get("Name") for config in root.findall("Configurations/Configuration")]
            for file in root.iter("File"):
                compiled = file.get("RelativePath").endswith((".c", ".cpp", ".rc", ".asm"))
                equal([config.get("Name") for config in file], specs if compiled else [])
        libraries = xml_of(workspace, "app.vcproj").find(".//Tool[@Name='VCLinkerTool']").get("AdditionalDependencies")
        equal(libraries, '"out/lib/Win32/Debug/gui.lib" "tree/Win32/Debug/pre.lib" "x.lib"')


def newer_projects_and_their_filters_agree(binary):
    with generate(binary, "vc14") as workspace:
        solution = workspace.path("build_all.sln").read_text(encoding="utf-8-sig")
        for name in ("app", "build_app", "core", "build_core", "gui", "tool", "pre"):
            project, filters = xml_of(workspace, name + ".vcxproj"), xml_of(workspace, name + ".vcxproj.filters")
            listed = [(item.tag, item.get("Include")) for item in project.findall(NAMESPACE + "ItemGroup")[1]]
            groups = filters.findall(NAMESPACE + "ItemGroup")
            equal([(item.tag, item.get("Include")) for item in groups[1]], listed)
            declared = {item.get("Include") for item in groups[0]}
            used = {item.text for item in groups[1].iter(NAMESPACE + "Filter")}
            equal(used - declared, set())
            holds(solution, project.find(f".//{NAMESPACE}ProjectGuid").text)
        command = xml_of(workspace, "app.vcxproj").find(f".//{NAMESPACE}Command").text
        holds(command, '"$(VCInstallDir)bin\\ml" /c /Cx /coff /Fo "$(ProjectDir)', '%(Filename).obj" "%(FullPath)"')


def code_blocks_files_are_xml(binary):
    with generate(binary, "gcc") as workspace:
        projects = xml_of(workspace, "all.workspace").findall("Workspace/Project")
        equal([project.get("filename") for project in projects], ["core.cbp", "gui.cbp", "tool.cbp", "app.cbp"])
        equal([project.get("active") for project in projects], [None, None, "1", None])
        for name in ("core", "gui", "tool", "app", "pre"):
            equal(xml_of(workspace, name + ".cbp").find("Project/Option").get("title"), name)
        words = [word.get("option") for word in xml_of(workspace, "app.cbp").find(".//Target/Compiler")]
        equal(words, ["-Wall", '-DNAME="app"', "-g"])


run_tests([a_second_run_writes_nothing, line_ends_are_those_of_windows, older_projects_are_xml,
           newer_projects_and_their_filters_agree, code_blocks_files_are_xml])
