#!/usr/bin/env python3
"""The examples of docs/language.md: each is translated as a source of its own; all are compiled as one, and print what the page
says. Every keyword and directive of the tables has a section with an example."""

import re
from pathlib import Path

from runtime_fixture import PLAIN, link, write_library
from workspace_fixture import ROOT, Workspace, equal, holds, need, project, run_tests, workspace_of

PAGE = ROOT / "docs/language.md"
PROJECT = project("Console Application", "language", '"src" { "*.h" "*.cpp" }', 'subproj { "Vesk/vxObject" }')
KEYS = "modernCpp = true\ncompilableText = true\n"  # as --init sets them
HEAD = '@import "Vesk/vxObject/IObject.h"\nusing vesk::xout;\n'
BLOCK = re.compile(r"^```([^\n]*)\n(.*?)^```$", re.MULTILINE | re.DOTALL)
MAIN = """
#include "Vesk/vxObject/IObject.h"
void Register_Project_language();
int main()
{
    Register_Project_language();
%s}
"""


def sections(text):
    """Heading to what stands below it, of the headings that name keywords."""
    parts = re.split(r"^(### `.*)$", text, flags=re.MULTILINE)
    return {heading: re.split(r"^##", body, flags=re.MULTILINE)[0] for heading, body in zip(parts[1::2], parts[2::2])}


def test_every_word_of_the_tables_has_a_section(_):
    keywords = (ROOT / "src/translator/file/keywords.cpp").read_text()
    directives = (ROOT / "src/macro/directives.cpp").read_text()
    words = ["$" + word for word in re.findall(r'^    \{"(\w+)", ', keywords, re.MULTILINE)]
    words += ["@" + word for word in re.findall(r'^      \{"(\w+)", Line::', directives, re.MULTILINE)]
    assert len(words) > 55, words
    text = PAGE.read_text()
    examples = "".join(code for kind, code in BLOCK.findall(text) if kind.startswith(("c++", "qrex")))
    known = sections(text)
    for word in sorted(set(words)):
        assert any(f"`{word}`" in heading for heading in known), f"{word} has no section"
        assert re.search(rf"{re.escape(word)}\b", examples), f"{word} has no example"
    for heading, body in known.items():
        holds(body, "    " + re.search("`(.)", heading).group(1))  # a form


class Examples:
    """The blocks of the page, as files of a project: a header has its name behind `c++`."""
    def __init__(self, with_python):
        self.sources = {}  # name to text
        self.printed = []  # of each source whose function is called: the function, what it prints
        self.told = []     # while translating
        self.settings = ""
        shows = None
        for kind, code in BLOCK.findall(PAGE.read_text()):
            kind, _, name = kind.partition(" ")
            if kind == "qrex":
                self.settings += code
            elif kind == "text":
                if shows:
                    self.printed.append((shows, code))
                elif shows is None:
                    self.told.append(code)
            elif name.startswith("python") and not with_python:
                shows = ""
            elif name.endswith(".h"):
                self.sources[name] = code
            elif kind == "c++":
                self.sources[f"example{len(self.sources)}.cpp"] = HEAD + code
                found = re.findall(r"^void (Show\w+)\(\)", code, re.MULTILINE)
                shows = found[-1] if found else None


def translate(binary, examples):
    settings = f'virtualTree += {{ "{ROOT / "runtime"}" }} translateOnly = true\n' + KEYS + examples.settings
    workspace = Workspace(binary, {**workspace_of("Vesk/vxObject", "language", settings=settings), "tree/language/src/language.qrpj": PROJECT,
                                   "tree/language/src/language.cpp": HEAD + "vxDefineTarget(language, 2)\n"})
    for name, text in examples.sources.items():
        workspace.write("tree/language/src/" + name, text)
    workspace.shell("Qrex all.qrex > output || true")
    return workspace, workspace.path("output").read_text()


def test_the_examples_print_what_the_page_says(binary):
    need("g++")
    examples = Examples(with_python=True)
    workspace, output = translate(binary, examples)
    if "can't be loaded" in output:
        print("skipped: the examples with Python: Python 2.7 is not installed")
        examples = Examples(with_python=False)
        workspace, output = translate(binary, examples)
    with workspace:
        holds(output, *examples.told, "\nCompleted.")
        equal([line for line in output.splitlines() if " warning " in line or "error" in line], [])
        root = "qrexsource/x64/Debug"
        sources = ["language", *(Path(name).stem for name in examples.sources if name.endswith(".cpp"))]
        calls = "".join(f'    vesk::xout() << "{name}\\n"; {name}();\n' for name, _ in examples.printed)
        workspace.write(f"{root}/language/src/all.cpp", "".join(f'#include "language/src/{name}.cpp"\n' for name in sources) + MAIN % calls)
        write_library(workspace)
        link(workspace, PLAIN, [f"{root}/language/src/all.cpp"], "all", "-Wno-deprecated-declarations -Wno-parentheses")
        equal(workspace.shell("./all"), "".join(f"{name}\n{text}" for name, text in examples.printed))


run_tests(globals())
