#!/usr/bin/env python3
"""What a build leaves to be looked at: the trace, and the page, which a browser shows."""

import json
import os
import re
import signal
import subprocess
import time
from pathlib import Path

from browser_fixture import Browser, with_selenium
from workspace_fixture import (DRIVE, RUNTIME, comparable, data, equal, holds, in_workspace, lacks, project, run_tests, stand_ins,
                               workspace_of)

with_selenium()

# Takes as long as the source says, and prints a warning or an error where it says so.
COMPILING = r"""seconds=$(sed -n 's/.*slow \([0-9.]*\).*/\1/p' "$source"); sleep "${seconds:-0}"
grep -n warned "$source" | sed "s|^\([0-9]*\):.*|$source:\1:5: warning: odd <b>bold</b>|" >&2
if grep -q wrong "$source"; then echo "$source:1:5: error: bad" >&2; exit 1; fi
if grep -q mute "$source"; then exit 3; fi"""
CORE = project("Static Library", "core", '"c.h" "src" { "one.cpp" "two.cpp" "core.cpp" }')
FILES = {
    **workspace_of("core", "app", settings="jobs = 2\n"), **stand_ins(COMPILING, "sleep 0.1"), "tree/core/src/core.qrpj": CORE,
    "tree/core/c.h": "$enum+ E { e1 };\n",
    "tree/core/src/one.cpp": '@import "core/c.h"\nint one;  // slow 0.3\n',
    "tree/core/src/two.cpp": '@import "core/c.h"\nint two;  // slow 0.2, warned\n',
    "tree/core/src/core.cpp": "int core;\n",
    "tree/app/src/app.qrpj": project("Console Application", "app", '"src" { "app.cpp" }', 'subproj { "core" }'),
    "tree/app/src/app.cpp": '@import "core/c.h"\nint main() {}\n',
}
RIGHT, LEFT, DOWN, ENTER, ESCAPE = "\ue014", "\ue012", "\ue015", "\ue007", "\ue00c"  # as the driver has them
TRACE, REPORT = 'buildTrace="out/trace.json"', 'report="out/report.html"'
# A folder and files below it, which no page may take for its own text; no file of Windows may have a < in its name.
TAGGED, SCRIPT, BOLD = ("&lt;", "&amp;.cpp", "&gt;.h") if DRIVE else ("<", "script><b>.cpp", "b>.h")
HOSTILE, HELD = f"core/src/{TAGGED}/{SCRIPT}", f"app/{TAGGED}/{BOLD}"


def spans(workspace):
    """Of the trace: by what each is about and its category, begin and end in milliseconds, slot, arguments."""
    events = json.loads(workspace.path("out/trace.json").read_text())["traceEvents"]
    names = {event["tid"]: event["args"]["name"] for event in events if event["ph"] == "M"}
    found = {}
    for event in events:
        if event["ph"] == "X":
            begin = event["ts"] / 1000
            found[event["name"], event["cat"]] = (begin, begin + event["dur"] / 1000, names[event["tid"]], event["args"])
    return found


def page_data(workspace):
    text = workspace.path("out/report.html").read_text()
    return json.loads(re.search(r'<script type="application/json" id="data">(.*?)</script>', text, re.DOTALL).group(1))


def counted(log):
    """Warnings and errors, as the last line has them."""
    return tuple(map(int, re.search(r"Completed with (\d+) warnings, (\d+) errors", log).groups()))


def compiled(workspace):
    return {name: span[3].get("why") for (name, category), span in spans(workspace).items() if category == "compiler"}


@in_workspace(FILES)
def test_trace_tells_what_ran_when_and_why(workspace):
    piped = workspace.run("all.qrex")
    workspace.clean()
    log = workspace.run("all.qrex", TRACE)
    equal(comparable(log), comparable(piped))
    found = spans(workspace)
    one, two = (found[f"core/src/{name}.cpp", "compiler"] for name in ("one", "two"))
    assert 300 <= one[1] - one[0] < 600 and two[0] < one[1] and {one[2], two[2]} == {"slot 1", "slot 2"}, found
    archive, link = found["out/lib/x64/Debug/libcore.a", "linker"], found["out/lib/x64/Debug/app", "linker"]
    assert one[1] <= archive[0] and archive[1] <= link[0], found
    equal(link[3], {"project": "app", "output": "out/lib/x64/Debug/app", "why": "it was missing"})
    workspace.rewrite("tree/core/c.h", "$enum+ E { e1, e2 };\n")
    workspace.run("all.qrex", TRACE)
    equal(compiled(workspace), dict.fromkeys(("core/src/one.cpp", "core/src/two.cpp", "app/src/app.cpp"), "tree/core/c.h was newer"))
    workspace.run("all.qrex", TRACE)
    equal(spans(workspace), {})


@in_workspace(FILES)
def test_trace_of_a_run_that_fails(workspace):
    workspace.write("tree/core/src/one.cpp", "wrong\n")
    workspace.run("all.qrex", TRACE)
    equal(spans(workspace)["core/src/one.cpp", "compiler"][3]["failed"], True)
    workspace.write("tree/app/src/app.cpp", "$class+ Broken {\n")
    workspace.run("all.qrex", TRACE, status=1)
    equal(list(compiled(workspace)), ["core/src/one.cpp"])
    workspace.write("tree/core/src/one.cpp", "mute\n")
    workspace.append("tree/core/src/two.cpp", "wrong\n")  # which the tool tells itself
    log = workspace.run("all.qrex", REPORT, "keepGoing=true", status=1)
    found = page_data(workspace)
    equal((found["completed"], found["warnings"], found["errors"]), (True, *counted(log)))
    errors = {message["text"]: message for message in found["messages"] if message["severity"] == "error"}
    mute, broken = "core/src/one.cpp: the tool ended with status 3", "error : @import of IObject.h required"
    equal((set(errors), len(errors)), ({mute, broken, "error: bad"}, found["errors"]))
    equal((errors[broken]["path"], errors[broken]["lines"]), ("app/src/app.cpp", [[1, "$class+ Broken {"]]))
    workspace.run("all.qrex", REPORT, status=1)
    equal(page_data(workspace)["completed"], False)


@in_workspace(FILES)
def test_trace_of_a_run_that_is_interrupted(workspace):
    workspace.write("tree/core/src/one.cpp", "slow 30\n")
    with subprocess.Popen([workspace.binary, "all.qrex", TRACE], cwd=workspace.folder, stdout=subprocess.PIPE, text=True,
                          start_new_session=True) as run:
        while not workspace.path("x64/Debug/core/one.o.rsp").exists():
            time.sleep(0.01)
        os.killpg(run.pid, signal.SIGINT)
        holds(run.communicate(timeout=60)[0], "Interrupted")
    holds(str(spans(workspace)), "core/src/one.cpp")


def shown_steps(browser):
    """What the timeline shows undimmed, by the file or output of each."""
    return sorted(browser.run("""return [...document.querySelectorAll("rect.step:not(.dim)")]
        .map((rect) => spans[rect.dataset.span]).map((span) => `${span.kind} ${nameOf(span)}`)"""))


def hostile_files():
    return {**FILES, "tree/core/src/core.qrpj": CORE.replace('"core.cpp"', f'"core.cpp" "{TAGGED}" {{ "{SCRIPT}" }}'),
            f"tree/{HOSTILE}": '@import "core/c.h"\nint hostile;  // warned\n', "tree/core/src/core.cpp": "int core;\nwrong\n"}


@in_workspace(hostile_files)
def test_page_in_a_browser(workspace):
    with Browser() as browser:
        log = workspace.run("all.qrex", REPORT)
        browser.open(workspace.path("out/report.html"))
        look_at_figures(browser, log)
        look_at_messages(browser)
        filter_by_click(browser)
        go_by_keys(browser)
        fits(browser, 400, "timeline", f"timeline/{HOSTILE}", "files", "headers", "messages")
        browser.resize(1280, 900)
        workspace.rewrite("tree/core/c.h", "$enum+ E { e1, e2 };\n")
        workspace.run("all.qrex", REPORT)
        browser.open(workspace.path("out/report.html"), "headers")
        equal(re.sub(r"changed .*|[\d.]+ m?s", "", "".join(browser.texts("#panel-headers tbody tr"))).split(),
              ["core/c.h", "4", "objects", "4", "objects"])
        browser.go("files")
        holds("\n".join(browser.texts("#panel-files tbody tr")), "core/c.h", "core/src/one.cpp", "tree/core/c.h was newer (")
        equal(browser.console(), [])
        equal(set(browser.requests()), {f"file://{workspace.path('out/report.html')}"})


def look_at_figures(browser, log):
    figures = dict(zip(browser.texts("#figures dt"), browser.texts("#figures dd")))
    warnings, errors = counted(log)
    equal([figures[name] for name in ("Warnings", "Errors", "Objects", "Slots")], [str(warnings), str(errors), "5", "2"])
    milliseconds = float(re.search(r"Completed.*?([\d.]+) ms", log).group(1))
    assert abs(browser.run("return data.total") / 1000 - milliseconds) < 50, (figures, milliseconds)
    equal(browser.texts("#verdict"), ["Completed with errors"])


def look_at_messages(browser):
    browser.go("messages")
    told = browser.texts(".messages li")
    equal(len(told), sum(int(number) for number in browser.texts("#figure-errors, #figure-warnings")))
    holds(told[0], "error", "tree/core/src/core.cpp:1", "bad", "qrexsource/x64/Debug/core/src/core.cpp:1", "1int core;", "2wrong")
    holds("".join(told), "odd <b>bold</b>")
    equal(browser.texts(".messages b"), [])
    equal(browser.run("return document.scripts.length"), 2)


def filter_by_click(browser):
    browser.go("files")
    holds("\n".join(browser.texts("#panel-files th a")), HOSTILE)
    browser.click('a[href$="one.cpp"]')
    equal(shown_steps(browser), ["compile core/src/one.cpp", "translate core/src/one.cpp"])
    holds(browser.texts(".filter")[0], "core/src/one.cpp")
    browser.driver.back()
    equal(browser.texts('[aria-selected="true"]'), ["Files"])
    browser.click('a[href$="c.h"]')
    equal([step for step in shown_steps(browser) if "compile" in step],
          [f"compile {name}" for name in ("app/src/app.cpp", HOSTILE, "core/src/one.cpp", "core/src/two.cpp")])
    browser.click(".filter a")
    equal(browser.texts(".filter"), [])
    browser.go(f"timeline/{HOSTILE}")
    equal(shown_steps(browser), [f"compile {HOSTILE}", f"translate {HOSTILE}"])
    browser.go("timeline")


def go_by_keys(browser):
    browser.press(".scroller", RIGHT)
    first = browser.texts(".told")[0]
    holds(first, "translated in", "why: no earlier build")
    browser.press(".scroller", RIGHT, RIGHT, LEFT, LEFT, "+", "-")
    equal(browser.texts(".told")[0], first)
    browser.press(".scroller", DOWN)
    holds(browser.texts(".told")[0], "compiled in", "slot 1")
    browser.press(".scroller", ENTER)
    holds(browser.texts(".filter")[0], browser.texts(".told a")[0])
    browser.press(".scroller", ESCAPE)
    equal(browser.texts(".filter"), [])
    browser.press("#tab-timeline", RIGHT)
    equal(browser.run("return document.activeElement.id"), "tab-files")
    equal(browser.texts('[aria-selected="true"]'), ["Files"])
    nameless = """return [...document.querySelectorAll("a, button, input, [role]")].filter((element) =>
        !(element.getAttribute("aria-label") || element.getAttribute("aria-labelledby") || element.textContent.trim())).length"""
    equal(browser.run(nameless), 0)


def fits(browser, width, *tabs):
    browser.resize(width, 800)
    for tab in tabs:
        browser.go(tab)
        assert browser.run("return document.documentElement.scrollWidth") <= width, tab


MODELS = data("report/models.h")
DECLARING = {
    **workspace_of("app", settings=RUNTIME + 'workspaces += { "Vesk/vxObject" }\ntranslateOnly = true\n'),
    "tree/app/src/app.qrpj": project("Console Application", "app", f'"a.h" "b.h" "{TAGGED}" {{ "{BOLD}" }} "src" {{ "app.cpp" "m*.cpp" }}',
                                     'subproj { "Vesk/vxObject" }'),
    "tree/app/a.h": f'@import "{HELD}"\n' + MODELS, "tree/app/b.h": '@import "app/a.h"\n$struct Held { $Point at; };\n',
    f"tree/{HELD}": "inline int b() { return 0; }\n", "tree/app/src/app.cpp": '@import "app/b.h"\nint main() { return 0; }\n',
    **{f"tree/app/src/m{i}.cpp": f'@import "{HELD}"\n' for i in range(20)},
}


def shown_nodes(browser):
    return browser.run("""return [...document.querySelectorAll("#panel-imports .node")].map((node) =>
        [...node.querySelectorAll(":scope > text")].map((text) => text.textContent).reverse().join(""))""")


@in_workspace(DECLARING)
def test_page_without_a_build(workspace):
    before = workspace.times("**/*")
    equal(workspace.run("--report", "all.qrex", "out/page.html", 'config="Debug"'), "")
    equal([path for path in workspace.changed(before, "**/*") if not Path(path).is_dir() and path != "out"], ["out/page.html"])
    equal(json.loads(workspace.run("--reflect", "all.qrex", "--json"))["form"], 1)  # without what is printed on the way
    with Browser() as browser:
        browser.open(workspace.path("out/page.html"))
        equal((browser.texts("#tabs a"), browser.texts("#verdict")), (["Models", "History", "Imports"], ["Nothing was built"]))
        look_at_declarations(browser)
        look_at_history(browser)
        look_at_imports(browser)
        for width in (400, 1280):
            fits(browser, width, "models", "models/Note", "history", "history/Note", "imports", "imports/app/a.h")
        equal(browser.texts("main b:not(.path), main i"), [])
        equal((browser.console(), set(browser.requests())), ([], {f"file://{workspace.path('out/page.html')}"}))


def look_at_declarations(browser):
    for words, names in (("mm", {"Note", "Point"}), ("mm script", {"Point"}), ("ISHAPE", {"IShape", "IShapeDelegatorMixin", "Page"}), ("head", {"Note"})):
        browser.run("document.querySelector('#panel-models input').value = ''")
        browser.press("#panel-models input", words)
        equal({text.split("\n")[0] for text in browser.texts("#panel-models tbody th")}, names)
    browser.go("models/Point")
    equal(browser.texts("#panel-models tbody tr")[0], 'x vesk::int32 mm "</script><i>"')
    holds("\n".join(browser.texts(".facts")), "tree/app/a.h:6", "Held (field at)")
    browser.click('#panel-models tbody a[href="#models/Side"]')
    equal(browser.texts("#panel-models tbody tr"), ["left 0 default", "right 7"])
    browser.go("models/IShape")
    holds("\n".join(browser.texts("#panel-models")), "Page (implements it)", "float64 Area(vesk::int32 places = 2) const")


def look_at_history(browser):
    """Of a name that changed twice, of what is computed, and of a release that is left out."""
    browser.press("#tab-models", RIGHT)
    holds("\n".join(browser.texts("#panel-history tbody tr")), "Note", "4 2 1 1 2")
    browser.click('#panel-history a[href="#history/Note"]')
    equal([row.split("\n")[0] for row in browser.texts("#panel-history .plain tbody th")], ["name", "inches", "head", "width", "title"])
    rows = [[cell.text for cell in row.find_elements("css selector", "td")]
            for row in browser.driver.find_elements("css selector", "#panel-history .plain tbody tr")]
    equal(rows, [["came", "renamed", ""], ["came", "is there", "went"], ["", "renamed", "renamed"], ["", "", "came"], ["", "", "renamed"]])
    holds(browser.texts(".releases > li")[0], "Release 4, the latest", "came width vesk::float64, computed from inches", "width = inches * 25.4;",
          "renamed title vesk::string8 from head", "went inches")
    lacks(browser.texts(".releases > li")[0], "went head")


def look_at_imports(browser):
    browser.go("imports/app/a.h")
    equal(shown_nodes(browser), ["app/a.h", "Vesk/vxObject/IObject.h", HELD, "app/b.h"])
    browser.press("#panel-imports .scroller", LEFT)
    holds(browser.texts("#panel-imports .told")[0], "app/b.h; project app; imports 1 file", "imported by 1 file, 1 in all; folded")
    browser.press("#panel-imports .scroller", " ")
    assert "app/src/app.cpp" in shown_nodes(browser) and "unfolded" in browser.texts("#panel-imports .told")[0]
    browser.press("#panel-imports .scroller", " ", LEFT, ENTER)
    equal(browser.texts("#panel-imports h2"), ["Imports around app/b.h"])
    browser.go(f"imports/{HELD}")
    equal(shown_nodes(browser), [HELD, "app/a.h", "20 filesapp/src/"])
    browser.press("#panel-imports .scroller", LEFT, DOWN, " ")
    equal(len(shown_nodes(browser)), 23)
    holds("\n".join(browser.texts("#panel-imports tbody tr")), "app/src/m7.cpp importing app 1", "app/src/app.cpp\nby way of app/b.h\nimporting app 3")


@in_workspace(DECLARING)
def test_page_of_files_with_errors(workspace):
    """In a build, what the page collects is not told twice; files behind the error are in it as well."""
    workspace.write("tree/app/b.h", '@import "app/a.h"\n@fail("no <b>")\n')
    workspace.write("tree/app/src/m0.cpp", '@import "Vesk/vxObject/IObject.h"\n$struct Behind { $int32 x; };\n')
    plain = workspace.run("all.qrex", status=1)
    workspace.shell("rm -rf qrexsource out")
    equal(comparable(workspace.run("all.qrex", REPORT, status=1)), comparable(plain))
    log = workspace.run("--report", "all.qrex", "page.html", status=1)
    holds(log, "b.h(2) : error : no")
    with Browser() as browser:
        for page in ("out/report.html", "page.html"):
            browser.open(workspace.path(page), "models/Note")
            holds(browser.texts("#panel-models .notice")[0], "1 error in the workspace", "2 files", "tree/app/b.h:2: no <b>")
            equal(len(browser.texts("#panel-models .facts")), 1)
            browser.go("models/Behind")
            equal(browser.texts("#panel-models tbody tr"), ["x vesk::int32"])
            browser.go("imports/app/b.h")
            equal(len(browser.driver.find_elements("css selector", ".node.failed")), 1)
        equal(browser.console(), [])
    for arguments, told in ((["all.qrex"], "PAGE.html is missing\nUsage: Qrex --report"), (["all.qrex", "tree/app/a.h/x.html"], "Error: File error")):
        holds(workspace.run("--report", *arguments, status=1), told)


run_tests(globals())
