#!/usr/bin/env python3
"""`#line` in generated text, as compilers, debuggers and coverage read it."""

import re
from pathlib import Path

from runtime_fixture import translate, translated_shop, write_library
from workspace_fixture import data, equal, holds, lacks, need, run_tests

KEY = "lineDirectives = true "
OUT = "qrexsource/x64/Debug/"
SHOP = data("line_directives/shop.h")
MAIN = data("line_directives/app.cpp")


def line_of(text, what):
    return next(n for n, line in enumerate(text.splitlines(), 1) if what in line)


def shop(binary, keys=KEY, main=MAIN, header=SHOP):
    return translated_shop(binary, keys, main, header)


def compiled_lines(workspace, compiler, source, include):
    """(file, line, text) of each line that the compiler sees of our sources."""
    place, line = None, 0
    for text in workspace.shell(f"{compiler} -E {include} {source}").splitlines():
        marker = re.match(r'# (\d+) "([^"]*)"', text)
        if marker:
            line, place = int(marker[1]), marker[2]
            continue
        if place.startswith("tree/") or "/runtime/" in place:
            yield place, line, text.strip()
        line += 1


def check_lines(workspace, sources, include):
    """What stands in a source as it is has the line that it has there; no text lies behind the end of its source."""
    checked = 0
    for compiler in ("g++ -std=c++17", "clang++ -std=c++17"):
        need(compiler.split()[0])
        texts = {}
        for source in sources:
            for name, number, text in compiled_lines(workspace, compiler, source, include):
                if name not in texts:
                    texts[name] = [re.sub("//.*", "", line).strip() for line in workspace.path(name).read_text().splitlines()]
                lines = texts[name]
                assert not text or number <= len(lines), f"{name} has no line {number}: {text}"
                if len(text) > 8 and "(" in text and lines.count(text) == 1:
                    checked += 1
                    equal((name, number, text), (name, lines.index(text) + 1, text))
    return checked


def test_every_kind(binary):
    """All declarations of the tests of the runtime, and the runtime itself: with both compilers, and as many warnings."""
    warnings = []
    for keys in ("", KEY):
        workspace, root = translate(binary, "all.qrws", keys + " compilableText = true modernCpp = true ")
        with workspace:
            include = f"-I{root} -I{root}/kinds -I{root}/kinds/src"
            sources = [p.relative_to(workspace.folder) for p in sorted(workspace.path(f"{root}/kinds/src").glob("*.cpp"))]
            told = workspace.shell(f"g++ -std=c++17 -fsyntax-only -Wall -Wextra {include} {' '.join(map(str, sources))} 2>&1 || true")
            warnings.append(sorted(re.findall(r"(?:warning|error): .*", told)))
            if keys:
                assert check_lines(workspace, sources, include) > 500
    equal(warnings[1], warnings[0])


def build(workspace, switches="-g -O0"):
    """What the compiler says of the translated program; the library is compiled without the switches, as elsewhere."""
    write_library(workspace)
    told = ""
    for source, options in ((f"{OUT}app/src/app.cpp", f"-Wall -Wextra {switches}"), ("library.cpp", "")):
        told += workspace.shell(f"g++ -std=c++17 -I{OUT} -I{OUT}app/src -c {source} -o {Path(source).stem}.o {options}")
    workspace.shell(f"g++ app.o library.o -o app {switches}")
    return told


def test_messages(binary):
    """A warning, an assertion and a sanitizer name the source."""
    need("g++")
    place = f"tree/app/src/shop.h:{line_of(SHOP, 'int unused')}"
    with shop(binary) as workspace:
        holds(build(workspace), f"{place}:", "unused variable")
        holds(workspace.shell("./app 2>&1 || true"), f"tree/app/src/app.cpp:{line_of(MAIN, 'assert(')}: ")
        workspace.replace("tree/app/src/app.cpp", "assert(left != 19)", "left = (&left)[3]")
        workspace.run("all.qrex")
        build(workspace, "-g -fsanitize=address")
        holds(workspace.shell("./app 2>&1 || true"), f"app.cpp:{line_of(MAIN, 'assert(')}")

def test_debugger(binary):
    need("gdb")
    with shop(binary) as workspace:
        build(workspace)
        body, first, half = line_of(SHOP, "pieces -= count"), line_of(MAIN, "shelf.Sold"), line_of(SHOP, "half = pieces")
        commands = [f"break shop.h:{body}", "run", "bt", "list", *["next"] * 4, f"break shop.h:{half}", "continue", "info source"]
        workspace.write("commands.gdb", "set pagination off\nset width 0\nset style enabled off\n" + "\n".join(commands) + "\n")
        told = workspace.shell("gdb -nx -q -batch -x commands.gdb ./app </dev/null 2>&1")
        holds(told, f"Breakpoint 1, shop::Shelf::Sold", f"at tree/app/src/shop.h:{body}", f"{body}\t    pieces -= count;")
        holds(told, f"in main (count=1) at tree/app/src/app.cpp:{first}", "$int32 Sold(int32 count)")
        holds(told, f"{body + 1}\t    return pieces;", f"{first + 1}\t  left += shop::Counted(count);")
        holds(told, f"Breakpoint 2 at 0x", f"line {half}.", "half_calc", f"at tree/app/src/shop.h:{half}",
              "Current source file is tree/app/src/shop.h")
        lacks(told, "qrexsource")


def test_coverage(binary):
    """Every line that ran is one of the source."""
    need("g++", "gcov")
    with shop(binary, main=MAIN.replace("left != 19", "left == 19")) as workspace:
        build(workspace, "--coverage -O0")
        workspace.shell("./app || true")
        told = workspace.shell("gcov -t *.gcda 2>/dev/null")
        holds(told, "Source:tree/app/src/app.cpp")
        lacks(told, "Source:qrexsource/x64/Debug/app")
        section = told[told.index("Source:tree/app/src/shop.h"):]
        for text in ("pieces -= count", "sum_of(more", "twice = pieces", "int more)"):
            assert re.search(rf"^ *1\*?: *{line_of(SHOP, text)}:", section, re.MULTILINE), f"{text}\n{section[:6000]}"


def test_incremental(binary):
    """Positions are of the text: a file in which only lines have moved is written, and the key itself makes all anew."""
    keys = " fingerprints = true writeTokenEquivalent = false modernCpp = true "
    with shop(binary, keys) as workspace:
        output = workspace.path(OUT + "app/src/app.cpp")
        workspace.run("all.qrex", KEY)
        marked = output.read_bytes()
        assert b'#line 1 "tree/app/src/app.cpp"\r\n' in marked
        workspace.replace("tree/app/src/app.cpp", "int left", "/* one\n*/ int left")
        workspace.run("all.qrex", KEY)
        moved = output.read_bytes()
        assert moved != marked
        workspace.replace("tree/app/src/app.cpp", "/* one", "/* two")
        workspace.run("all.qrex", KEY)
        equal(output.read_bytes(), moved)
        number = line_of(workspace.path("tree/app/src/app.cpp").read_text(), "return left")
        there = workspace.run("--there", "all.qrex", KEY, f"tree/app/src/app.cpp:{number}").strip()
        holds(output.read_text().splitlines()[int(there.split(":")[1]) - 1], "return left")
        equal(workspace.run("--where", "all.qrex", KEY, there).strip(), f"tree/app/src/app.cpp:{number}")
        workspace.run("all.qrex")
        lacks(output.read_text(), "#line")


run_tests(globals())
