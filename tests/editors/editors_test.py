#!/usr/bin/env python3
"""What editors make of the languages: colours, types of files, and the server behind them."""

import contextlib
import html
import json
import os
import re
import shutil
import subprocess
import sys
import tempfile
from pathlib import Path

HERE = Path(__file__).resolve().parent
ROOT = HERE.parents[1]
sys.path.insert(0, str(ROOT / "tests/endtoend"))
from workspace_fixture import Skipped, equal, need, run_tests  # noqa: E402

EXTENSION = ROOT / "editors/vscode"
VIM = ROOT / "editors/vim"
SERVER = HERE / "server.py"
DOCS = ROOT / "docs/editors.md"
VIMS = {"nvim": ["nvim", "--clean", "--headless"], "vim": ["vim", "--clean", "-N", "-es"]}


def run(command, **options):
    done = subprocess.run(command, stdin=subprocess.DEVNULL, capture_output=True, text=True, timeout=120, **options)
    assert done.returncode == 0, f"{command}: status {done.returncode}\n{done.stdout[-4000:]}\n{done.stderr[-4000:]}"
    return done.stdout


def vim(editor, *arguments, **options):
    """What it prints, with our files."""
    need(editor)
    return run([*VIMS[editor], "--cmd", f"set runtimepath^={VIM} runtimepath+={VIM}/after", *arguments], **options)


def vim_answers(editor, folder, questions):
    """What check.vim answers in `folder` to questions [kind, file, line, column]."""
    answers = Path(folder) / "answers.json"
    vim(editor, "--cmd", f"let g:questions = {json.dumps(questions)}", "--cmd", f"let g:answers = '{answers}'",
        "-c", f"source {HERE}/vim/check.vim", cwd=folder)
    return json.loads(answers.read_text())


def samples():
    """The files of samples.txt, and what is asked of them: [file, line, needle, its column, group]."""
    files, questions = {}, []
    for line in (HERE / "vim/samples.txt").read_text().splitlines():
        if line.startswith("==== "):
            name = line[5:]
            files[name] = []
        elif line.startswith("~ "):
            for check in line[2:].split(", "):
                needle, group = check.split(" ")
                questions.append([name, len(files[name]), needle, files[name][-1].index(needle) + 1, group])
        else:
            files[name].append(line)
    return {name: "\n".join(lines) + "\n" for name, lines in files.items()}, questions


def check_groups(editor):
    files, questions = samples()
    with tempfile.TemporaryDirectory() as folder:
        for name, text in files.items():
            Path(folder, name).write_text(text)
        answers = vim_answers(editor, folder, [["group", name, line, column] for name, line, _, column, _ in questions])
    wrong = [f"{name}:{line}: {needle}: {answer or '-'}, not {group}"
             for (name, line, needle, _, group), answer in zip(questions, answers) if (answer or "-") != group
             and not (group == "-" and not answer.startswith("qrex"))]
    assert not wrong, "\n".join(wrong)


def test_vim_groups(_binary):
    check_groups("vim")


def test_nvim_groups(_binary):
    check_groups("nvim")


def test_vim_types_of_files(_binary):
    settings = (ROOT / "templates/workspace/tree/common.inc").read_text()
    files = {"a.qrex": ("", "qrex"), "a.qrws": ("", "qrex"), "a.qrpj": ("", "qrex"), "common.inc": (settings, "qrex"),
             "macros.inc": ("/* b\n*/ @def f(x) =\n{\n    x\n}\n@import \"x.inc\"\nconfig\n{ \"Debug|x64\" }\n", "qrex"),
             "page.inc": ("<?php\n", "php"), "table.inc": ("{ 1, 2 },\nint n = 3;\n", "pascal")}
    for editor in VIMS:
        with tempfile.TemporaryDirectory() as folder:
            for name, (text, _) in files.items():
                Path(folder, name).write_text(text)
            Path(folder, "a.cpp").write_text('@import "x.h"\n#include "y.h"\nimport x;\n')
            asked = [["filetype", name, 1, 1] for name in files] + [["include", "a.cpp", line, 1] for line in (1, 2, 3)]
            equal(vim_answers(editor, folder, asked), [kind for _, kind in files.values()] + ["yes", "yes", "no"])


def test_vim_reads_the_log(_binary):
    log = re.sub(r"\x1b\[[\d;]*[A-Za-z]|[^\n]*\r(?!\n)", "", (HERE / "client/terminal.log").read_bytes().decode())
    with tempfile.TemporaryDirectory() as folder:
        Path(folder, "log").write_text(log)
        equal(vim_answers("vim", folder, [["problems", "log", 1, 1]])[0].splitlines(), [
            "tree/zoo_core/api/animal.h|11|e|Unrecognised qualifier << : >> on $class+ animals::Animal",
            "tree/zoo_core/api/animal.h|9|w|Metadata on forward declaration is ignored",
            "tree/zoo_app/src/zoo_app.cpp|46|e|invalid conversion from 'const char*' to 'int' [-fpermissive]",
            "tree/zoo_app/src/zoo_app.cpp|46|w|unused variable 'unused' [-Wunused-variable]",
            "tree/zoo_app/src/zoo_app.cpp|12|e|with lineDirectives"])


@contextlib.contextmanager
def session(language):
    """A workspace with errors, and an environment in which qrex-lsp is the stand-in and $QREX_SETTINGS what docs/editors.md shows
    in `language`."""
    settings = re.search(f"^```{language}\n(.*?)^```", DOCS.read_text(), re.DOTALL | re.MULTILINE)[1]
    with tempfile.TemporaryDirectory() as folder:
        folder = Path(folder).resolve()
        work = folder / "w"
        for name, text in {"w/all.qrex": "", "w/src/a.cpp": "$class wrong\n", "w/common.inc": 'config { "wrong|x64" }\n',
                           "w/app.qrpj": "wrong\n", "other/b.cpp": "int n;\n", f"settings.{language}": settings}.items():
            (folder / name).parent.mkdir(parents=True, exist_ok=True)
            (folder / name).write_text(text)
        (folder / "bin").mkdir()
        (folder / "bin/qrex-lsp").symlink_to(SERVER)
        variables = {**os.environ, "PATH": f"{folder}/bin:{os.environ['PATH']}", "HOME": str(folder), "TERM": "dumb",
                     "QREX_SETTINGS": str(folder / f"settings.{language}"), "QREX_ELSEWHERE": str(folder / "other/b.cpp")}
        yield work, {"cwd": work, "env": variables}


def test_nvim_session(_binary):
    steps = ["error wrong cpp", "mapped true v:lua.vim.lsp.omnifunc", "shown // $CLASS WRONG| cpp false", "follows // INT SECOND;|",
             "error wrong qrex", "clients 1", r'options {"arguments": ["config=\"Debug\""]} arguments []', "shown there 1",
             "elsewhere cpp 0"]
    for newer in (None, "1"):
        with session("lua") as (_, options):
            if newer:
                options["env"]["QREX_NEWER"] = newer
            output = vim("nvim", "-c", f"luafile {HERE}/vim/session.lua", **options).splitlines()
        equal([line for line in output if not line.startswith("vim.lsp.start")], steps)
        equal([line for line in output if line.startswith("vim.lsp.start")], ["vim.lsp.start qrex w"] * 2 if newer else [])


def test_nvim_tour(binary):
    """The real server and clangd in Neovim, over examples/tour."""
    need("nvim", "clangd-19")
    server = Path(binary).resolve().parent / "qrex-lsp"
    if not server.exists():
        raise Skipped("qrex-lsp")
    with session("lua") as (work, options):
        shutil.rmtree(work)
        shutil.copytree(ROOT / "examples/tour", work)
        tour = work / "tour.qrex"
        tour.write_text(tour.read_text().replace("../../runtime", str(ROOT / "runtime")))
        (work.parent / "bin/qrex-lsp").unlink()
        (work.parent / "bin/qrex-lsp").symlink_to(server)
        output = vim("nvim", "-c", f"luafile {HERE}/vim/tour.lua", **options).splitlines()
    equal(output, ["error: $dep flaot64 subtotal = { subtotal = pieces * price; };", "completes: Getpieces",
                   'leads to: order.h int32 pieces : [ unit("piece"), 1 ];', "renamed: orders1::Order first_release;"])


def test_vim_session(_binary):
    if not Path("/usr/share/vim/vimfiles/pack/dist-bundle/opt/ale").is_dir():
        raise Skipped("vim-ale")
    with session("vim") as (folder, options):
        vim("vim", "-c", f"source {HERE}/vim/session_ale.vim", **options)
        equal((folder / "errors.txt").read_text().splitlines(), ["wrong cpp", "wrong qrex"])


def test_emacs_session(_binary):
    need("emacs", "git")
    eglot = [str(found.parent) for found in Path("/usr/share/emacs/site-lisp/elpa-src").glob("eglot-*/eglot.el")]
    with session("elisp") as (folder, options):
        run(["git", "init", "-q", "."], **options)
        output = run(["emacs", "-Q", "--batch", *(argument for path in eglot for argument in ("-L", path)),
                      "-l", f"{HERE}/session.el"], **options)
    # One of this age names the language of a server once, for all of its files.
    lines = output.splitlines()
    assert re.fullmatch(r"\(qrex: wrong cpp\)", lines[0]) and re.fullmatch(r"\(qrex: wrong \w+\)", lines[2]), output
    equal([lines[1], *lines[3:]], ["qrex-mode", r'(:arguments ["config=\"Debug\""])'])


def test_kate_colours(_binary):
    need("kate-syntax-highlighter")
    with tempfile.TemporaryDirectory() as folder:
        place = Path(folder, "org.kde.syntax-highlighting/syntax/qrex.xml")
        place.parent.mkdir(parents=True)
        place.write_text((ROOT / "editors/kate/qrex.xml").read_text())
        files, questions = samples()
        styles = {}
        for name in ("all.qrex", "app.qrpj"):
            Path(folder, name).write_text(files[name])
            page = run(["kate-syntax-highlighter", "-f", "html", str(Path(folder, name))], env={**os.environ, "XDG_DATA_HOME": folder})
            lines = re.search(r"<pre>\n(.*)</pre>", page, re.DOTALL)[1].splitlines()
            for file, line, needle, _, group in questions:
                if file == name:
                    spans = re.findall(r'<span style="([^"]*)">([^<]*)</span>', lines[line - 1])
                    found = [style for style, text in spans if needle in html.unescape(text)]
                    styles.setdefault(group, set()).add(found[0] if found else "plain")
    # What Vim has in groups of its own has one style each here; that what is known is not plain is what matters.
    mixed = {group: found for group, found in styles.items() if len(found) > 1}
    plain = {group for group, found in styles.items() if found == {"plain"}}
    equal((mixed, plain), ({}, {"-", "qrexSwitches"}))


def words_of_tool():
    """Directives, predefined variables, `$` words, keys and qualifiers, from the tables of the tool."""
    def table(file, pattern):
        words = set(re.findall(pattern, (ROOT / "src" / file).read_text(), re.MULTILINE))
        assert len(words) > 5, file
        return words
    return {"@": table("macro/directives.cpp", r'\{"(\w+)", Line::') | {"elseif"},
            "@=": table("translator/file/predefined_variables.cpp", r'Define\(file, "(\w+)"'),
            "$": table("translator/file/keywords.cpp", r'^    \{"(\w+)",'),
            "": table("driver/config_keys.h", r'^    \{"(\w+)", &(?:ConfigSettings|PlatformEnvironment)::(?!export)'),
            "<<": table("translator/reader/qualifiers.cpp", r'^      \{"(\w+)", &Q::')}


def test_all_words_are_in_the_grammars(_binary):
    rules = {"@": ("macros", "definition variable loop directive python"), "@=": ("macros", "predefined"), "": ("qrex", "key"),
             "$": ("cpp", "heading enumeration calculated words warning"), "<<": ("cpp", "qualifiers")}
    missing = []
    texts = {"kate": [ROOT / "editors/kate/qrex.xml"], "vim": [*VIM.glob("syntax/*.vim"), VIM / "after/syntax/c.vim"]}
    known_there = {editor: set(re.findall(r"[A-Za-z_]\w*", " ".join(path.read_text() for path in paths)))
                   for editor, paths in texts.items()}
    for kind, words in words_of_tool().items():
        for editor, known in known_there.items():
            if editor == "vim" or kind in ("@", "@=", ""):
                missing += [f"{editor}: {kind}{word}" for word in words - known]
        grammar, names = rules[kind]
        repository = json.loads((EXTENSION / f"syntaxes/{grammar}.tmLanguage.json").read_text())["repository"]
        known = set(re.findall(r"[A-Za-z_]\w*", json.dumps([repository[name] for name in names.split()])))
        missing += [f"{kind}{word}" for word in words - known]
    assert not missing, missing


def test_extension(_binary):
    """The grammars and the client, with what `scripts/editors` has installed."""
    need("node", "npm")
    if not (EXTENSION / "node_modules").is_dir():
        raise Skipped("what scripts/editors installs")
    run(["npm", "test", "--silent"], cwd=EXTENSION)


run_tests(globals())
