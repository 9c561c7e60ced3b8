#!/usr/bin/env python3
"""The inspector: what a page is told and may change, who is kept out, and the page itself in a browser."""

import contextlib
import functools
import json
import random
import re
import shutil
import subprocess
import time

from browser_fixture import Browser, with_selenium
from inspector_fixture import ADDRESSES, THREADS, Page, Program, built
from workspace_fixture import ROOT, Workspace, equal, holds, need, run_tests

with_selenium()

# Fields of the shop: what each is set to as JSON, and its text then.
VALUES = {
    "isOpen": (True, "true"), "tiny": (-5, "-5"), "huge": ("12345678901234567890", "12345678901234567890"), "vast": ("-7", "-7"),
    "half": (1.25, "1.25"), "whole": (0.5, "0.5"), "letter": ("y", "y"), "name": ("n\u00e9", "n\u00e9"), "wide": ("\u2603", "\u2603"),
    "size": ("Large", "Large"), "wrap": ({"box": "b"}, "box = b"), "numbers": ([4, 5], "2 elements"), "bits": ([False], "1 element"),
    "names": (["q"], "1 element"), "queue": ([1], "1 element"), "fixed": ([7, 8, 9], "3 elements"), "stock": ({"p": 1}, "1 element"),
    "rate": (5.0, "5"),
}
REFUSED = [
    ("set", {"path": ["shop", "whole"], "value": 3}, "3 is more than 1"),
    ("set", {"path": ["shop", "spots", 0], "value": {"x": 11}}, "11 is more than 10"),
    ("set", {"path": ["shop", "numbers", 0], "value": 101}, "101 is more than 100"),
    ("set", {"path": ["shop", "numbers"], "value": [101]}, "101 is more than 100"),
    ("insert", {"path": ["shop", "numbers"], "at": 0, "value": -1}, "-1 is less than 0"),
    ("set", {"path": ["shop", "tiny"], "value": 300}, "out of the range of int8"),
    ("set", {"path": ["shop", "size"], "value": "Huge"}, "Huge"),
    ("set", {"path": ["shop", "twice"], "value": 1}, "the value is calculated"),
    ("set", {"path": ["shop", "items", 0], "value": None}, "references are not changed"),
    ("remove", {"path": ["shop", "items"], "at": 0}, "references are not changed"),
    ("set", {"path": ["shop", "set", 0], "value": 9}, "cannot be changed by itself"),
    ("insert", {"path": ["shop", "fixed"], "at": 0}, "no list of any length"), ("set", {"path": ["shop", "many"], "value": []}, "too large"),
    ("remove", {"path": ["shop", "numbers"], "at": 3}, "no such position"),
    ("rows", {"path": ["shop", "nothing"]}, "no field nothing"), ("rows", {"path": ["shop", "names", 2 ** 63 - 1]}, "any more"),
    ("rows", {"path": ["nobody"]}, "nothing is shown as nobody"), ("rows", {"path": [7]}, "expected a text"), ("rows", {}, "expected a path"),
    ("call", {"path": ["shop"], "method": "Fail", "args": []}, "it fails"),
    ("set", {"path": ["item", "color"], "value": 1}, "the colour stays"),
    ("call", {"path": ["shop"], "method": "Break", "args": []}, "no std::exception"), ("set", {"path": ["spot", "y"], "value": 1}, "cannot be changed"),
    ("call", {"path": ["shop"], "method": "Place", "args": [{}]}, "by value: shop::Spot"),
    ("call", {"path": ["shop"], "method": "AddTiny", "args": [1, 1000]}, "b: "),
    ("call", {"path": ["shop"], "method": "AddTiny", "args": [1]}, "takes 2 arguments"),
    ("calculate", {"path": ["shop", "rate"]}, "not calculated"), ("type", {"name": "Nobody"}, "no registered type"), ("burn", {}, "no such request"),
]
CALLS = {
    "AddTiny": ([100, 27], "127"), "Mix": ([1, 2.5, 3.25, True], "-6.75"), "Join": (["a", "b"], "a-b"), "Repeat": ([[1, 2], 3], "6 elements"),
    "Next": (["Small"], "Medium"), "Half": ([3], "1.5"), "Big": (["18446744073709551615"], "18446744073709551615"),
}


def in_program(mode, compiler=None):
    """A test of a program in one of its modes."""
    def decorate(test):
        @functools.wraps(test)
        def run(binary):
            with built(binary, *[compiler] * bool(compiler)) as workspace, Program(["./app", mode], workspace.folder) as program:
                test(program)
        return run
    return decorate


@in_program("loop", ADDRESSES)
def test_changes(program):
    """Each kind of value is set, each change undone and done again; what does not fit is refused and changes nothing."""
    with program.page() as page:
        before = page.ask("rows", path=["shop"])["rows"]
        for do, members, error in REFUSED:
            holds(str(page.ask(do, **members)), error)
        equal(page.ask("rows", path=["shop"])["rows"], before)
        for name in ("numbers", "names", "queue", "bits", "spots"):
            def texts():
                return [row["text"] for row in page.ask("rows", path=["shop", name])["rows"]]
            was = texts()
            for do, members, more in (("insert", {"at": 1}, 1), ("move", {"from": 1, "to": 0}, 1), ("remove", {"at": 0}, 0)):
                equal(page.ask(do, path=["shop", name], **members), {})
                equal(len(texts()), len(was) + more)
            equal(texts(), was)
            equal([page.ask("undo") for _ in range(3)], [{}] * 3)
            equal(texts(), was)
        for name, (value, text) in VALUES.items():
            equal(page.ask("set", path=["shop", name], value=value), {})
            equal(page.text("shop", name), text)
        for do, members in (("insert", {"at": 1, "value": 77}), ("move", {"from": 0, "to": 2}), ("remove", {"at": 1}), ("insert", {"at": 0})):
            equal(page.ask(do, path=["shop", "numbers"], **members), {})
        after = page.ask("rows", path=["shop"])["rows"]
        equal([row["text"] for row in page.ask("rows", path=["shop", "numbers"])["rows"]], ["0", "77", "4"])
        for step, end in (("undo", before), ("redo", after)):
            equal([page.ask(step) for _ in range(len(VALUES) + 4)], [{}] * (len(VALUES) + 4))
            equal(page.ask("rows", path=["shop"])["rows"], end)
            equal(page.ask(step), f"nothing to {step}")
        for name, value, argument in (("tiny", 7, "1"), ("huge", "2", "3")):
            page.ask("set", path=["shop", name], value=value)
            page.ask("call", path=["shop"], method="Big", args=[argument])
        equal(page.ask("undo"), "the program has changed it meanwhile")
        for name, (arguments, text) in CALLS.items():
            equal(page.ask("call", path=["shop"], method=name, args=arguments)["result"]["text"], text)
        equal(page.ask("call", path=["shop"], method="Ask", args=["x"])["out"][0]["text"], "asked x")
        equal(page.ask("calculate", path=["shop", "twice"]), {})
        equal(page.text("shop", "twice"), "10")
        states = {node["name"]: (node["state"], node["count"]) for node in page.ask("graph", path=["shop", "rate"])["nodes"]}
        equal(states, {"rate": ("fresh", 0), "twice": ("fresh", 0)})
        page.ask("set", path=["shop", "rate"], value=6)
        equal(page.ask("graph", path=["shop", "twice"])["nodes"][0]["state"], "stale")
        page.ask("calculate", path=["shop", "twice"])
        equal(page.ask("graph", path=["shop", "twice"])["nodes"][0]["count"], 1)
    equal(program.end(), "rate 6, twice 12\n")


@in_program("busy")
def test_telling(program):
    """A page is told what changes of the rows that it watches, at most 30 times a second; of what stands still, nothing."""
    with program.page() as page, program.page() as other:
        equal(page.ask("rows", path=["shop", "many"], first=999999)["rows"][0]["text"], "999999")
        equal(page.ask("rows", path=["shop", "stock", {"k": "]odd", "at": 0}]), {"count": 0, "first": 0, "rows": []})
        page.ask("watch", ranges=[{"path": ["shop", "items", 1], "first": 1, "count": 1}, {"path": ["shop"], "first": 0, "count": 3}])
        told = page.arrives(2)
        assert 10 <= len(told) <= 60, f"{len(told)} messages in two seconds"
        ranges = [each for message in told for each in message.get("ranges", [])]
        assert sum(each["path"] == ["shop"] for each in ranges) == 1, ranges
        logs = [log for message in told for log in message.get("logs", [])]
        assert sum(log["total"] for log in logs) > 1000, logs[:3]
        equal({(item["what"], item["path"], item["kind"]) for log in logs for item in log["items"]}, {("shop::Item", "price", "assign")})
        other.ask("find", text="SECOND")
        found = []
        while not found or not found[-1]["done"]:
            found += [message["found"] for message in other.arrives(0.2) if "found" in message]
        places = [hit["path"] for each in found for hit in each["hits"]]
        equal(places, [["item", "next", "label"]])


@in_program("readonly")
def test_reading(program):
    with program.page() as page:
        equal(page.ask("hello"), {"title": "Shop <b>", "changes": False})
        for do in ("set", "insert", "remove", "move", "undo", "redo", "call", "calculate"):
            equal(page.ask(do, path=["shop", "tiny"], method="Big", value=1, args=[1]), "the program does not allow changes")
        equal(page.ask("rows", path=[])["rows"][0], {"step": "broken", "name": "broken", "kind": "none", "text": "no <source>", "bad": True})
        fields = {field["name"]: field for field in page.ask("type", name="shop::Item")["fields"]}
        equal({name: field["added"] for name, field in fields.items()}, {"label": 1, "price": 1, "color": 2, "size": 2, "next": 2})


@in_program("loop", ADDRESSES)
def test_strangers(program):
    """Who has not the token, comes by another name or from another page, asks for too much, or for nothing."""
    token = program.address.split("/")[3]
    get = "GET {} HTTP/1.1\r\nHost: {}\r\n{}\r\n"
    equal(program.request(get.format(f"/{token}/", program.host, "")), "HTTP/1.1 200 OK")
    for path, host, more in ((f"/{token[:-1]}x/", program.host, ""), ("/", program.host, ""), ("//", program.host, ""), (f"/{token}x/", program.host, ""),
                             (f"/{token}/", "evil.example:80", ""), (f"/{token}/", program.host, "Origin: http://evil.example\r\n"),
                             ("x", program.host, "")):
        equal(program.request(get.format(path, host, more)), "HTTP/1.1 403 Forbidden")
    equal(program.request(get.format(f"/{token}/etc", program.host, "")), "HTTP/1.1 404 Not Found")
    equal(program.request(f"POST /{token}/ HTTP/1.1\r\nHost: {program.host}\r\nContent-Length: 0\r\n\r\n"), "HTTP/1.1 405 Method Not Allowed")
    for heads in ({"Origin": None}, {"Origin": "null"}, {"Origin": "http://evil.example"}, {"Host": "evil.example"}):
        equal(Page(program, **heads).status, 403)
    equal(Page(program, path="/0/live").status, 403)
    for bytes_ in ("GET /" + "a" * 20000, "\x00" * 100, f"GET / HTTP/1.1\r\nHost: x\r\nContent-Length: 99999999999\r\n\r\n"):
        assert "200" not in program.request(bytes_)
    slow = [program.connect() for _ in range(100)]  # each with half a request
    for client in slow[-20:]:
        client.sendall(b"GET / HT")
    with program.page() as page:
        equal(page.status, 101)
        equal(page.ask("hello")["title"], "Shop <b>")
        assert all(client.recv(1) == b"" for client in slow), "a client that waits too long stays"


@in_program("loop", ADDRESSES)
def test_hostile_pages(program):
    """Pages that send anything, flood, or do not read."""
    random.seed(5)
    words = ('"path" "do" "rows" "set" "watch" "shop" "items" "numbers" "look" "call" "graph" "find" "text" { } [ ] : , 0 -1 1e999 '
             '99999999999 null true "\\ud800" "ranges" "first" "count" "k" "at"').split()
    with program.page() as page:
        for _ in range(150):
            page.send("".join(random.choices(words, k=random.randrange(40))).encode())
        page.send(b"[" * 100000)
        page.send(b'{"id":999,"do":"archive","slot":0}\n' + random.randbytes(5000), 2)
        equal(page.ask("rows", path=[])["count"], 4)
        page.ask("watch", ranges=[{"path": ["shop", "many"], "first": 2 ** 63 - 1, "count": 2 ** 63 - 1}] * 5000)
        assert page.ask("rows", path=["shop", "many"], first=0, count=10 ** 15)["count"] == 1000000
    with program.page() as flood, program.page() as long:
        with contextlib.suppress(OSError):
            for _ in range(5000):
                flood.send(b'{"do":"types"}')
        long.socket.sendall(bytes([0x82, 0xFF]) + (1 << 40).to_bytes(8, "big") + bytes(4))
        for page in (flood, long):  # until it is shown out
            with contextlib.suppress(EOFError, OSError):
                while True:
                    page.receive()
    deaf = [program.page() for _ in range(6)]
    for page in deaf:
        for _ in range(150):
            page.send(b'{"do":"rows","path":["shop","many"]}')
    with program.page() as page:
        equal(page.ask("hello")["title"], "Shop <b>")
    for page in deaf:
        page.socket.close()


def test_threads(binary):
    """Serve in one thread, ended by another one, with pages in a third."""
    with built(binary, THREADS) as workspace:
        with Program(["./app", "serve"], workspace.folder) as program:
            with program.page() as one, program.page() as two:
                for page in (one, two):
                    page.ask("watch", ranges=[{"path": ["shop"], "first": 0, "count": 30}])
                    equal(page.ask("rows", path=["shop", "numbers"])["count"], 3)
            equal(program.end(), "")


# --- In a browser

class Shown(Browser):
    def visit(self, address):
        self.driver.get(address)
        self.wait("document.getElementById('state')?.textContent === 'Live' && document.querySelectorAll('.row').length > 0")

    def wait(self, condition):
        end = time.monotonic() + 15
        while not self.run(f"return !!({condition})"):
            assert time.monotonic() < end, f"{condition}:\n{self.run('return document.body.innerText')}\n{self.console()}"
            time.sleep(0.03)

    def find(self, *path):
        """Selects what stands at a path."""
        self.run("location.hash = '#objects/' + encodeURIComponent(arguments[0])", json.dumps(path))
        self.wait(f"tree.selected && tree.selected.key === {json.dumps(json.dumps(path, separators=(',', ':')))} && document.querySelector('.side h2')")

    def row(self, name):
        self.wait(f"[...document.querySelectorAll('.row')].some(row => row.querySelector('.name').textContent === {json.dumps(name)})")
        return next(row for row in self.driver.find_elements("css selector", ".row")
                    if row.find_element("css selector", ".name").text == name)

    def button(self, text):
        next(each for each in self.driver.find_elements("css selector", "button") if each.is_displayed() and each.text == text).click()


def test_page(binary):
    """A user opens, looks, changes, calls, undoes; sees the graph and archives; reloads; a second page sees it; the end is told."""
    from selenium.webdriver.common.keys import Keys
    with built(binary) as workspace, Program(["./app", "loop"], workspace.folder) as program, Shown() as browser, program.page() as other:
        workspace.shell("./app archives")
        browser.visit(program.address)
        browser.requests()
        equal(browser.run("return document.title"), "Shop <b>")
        # By keyboard: down to the shop, into it, to its name.
        tree = browser.driver.find_element("css selector", ".tree")
        tree.send_keys(Keys.HOME, Keys.DOWN, Keys.DOWN, Keys.RIGHT)
        browser.row("isOpen")
        tree.send_keys(Keys.RIGHT)
        browser.wait("document.querySelector('.side h2')?.textContent === 'isOpen'")
        equal(browser.run("return document.getElementById(document.querySelector('.tree').getAttribute('aria-activedescendant')).getAttribute('aria-level')"), "2")
        browser.find("shop", "name")
        holds(browser.texts(".row[aria-selected=true]")[0], "<script>document.title = 'taken'</script>")
        browser.find("shop", "many", 999999)
        equal(browser.row("999999").find_element("css selector", ".text").text, "999999")
        # Changes, each by its editor, seen by another page.
        browser.find("shop", "size")
        browser.run("const e = document.querySelector('.editor select'); e.value = 'Large'; e.dispatchEvent(new Event('change'))")
        browser.wait("tree.selected.row.text === 'Large'")
        equal(other.text("shop", "size"), "Large")
        browser.find("shop", "whole")
        number = browser.driver.find_element("css selector", ".editor input")
        for typed, text in (("7", "0"), ("0.5", "0.5")):  # the first is refused by the browser itself
            number.clear()
            number.send_keys(typed, Keys.ENTER)
            browser.wait(f"tree.selected.row.text === '{text}'")
        equal(other.text("shop", "whole"), "0.5")
        browser.find("shop", "numbers", 1)
        browser.button("Remove")
        browser.wait("tree.selected && tree.selected.row.text === '3'")
        for expected in ("3 elements", "0", "Small"):
            browser.button("Undo")
            browser.wait(f"document.body.innerText.includes({json.dumps(expected)})")
            time.sleep(0.1)
        equal([other.text("shop", name) for name in ("numbers", "whole", "size")], ["3 elements", "0", "Small"])
        other.ask("set", path=["shop", "tiny"], value=99)
        browser.find("shop", "tiny")
        browser.wait("tree.selected.row.text === '99'")
        # A method, and what stands in it when the row changes.
        browser.find("shop")
        form = browser.driver.find_element("css selector", "[data-method=AddTiny]")
        for field, text in zip(form.find_elements("css selector", "input"), ("40", "2")):
            field.clear()
            field.send_keys(text)
        form.find_element("css selector", "button").click()
        browser.wait("document.querySelector('[data-method=AddTiny] .result').textContent === '= 42'")
        # The graph, from a stale value on.
        browser.find("shop", "report")
        browser.button("Calculate")
        browser.wait("document.querySelector('.facts').innerText.includes('up to date')")
        browser.run("document.querySelector('.side .line button').click()")
        browser.wait("document.querySelectorAll('svg .node').length === 3")
        holds(browser.run("return document.querySelector('svg').textContent"), "<script>alert(4)</script>")
        other.ask("set", path=["shop", "rate"], value=3)
        browser.wait("document.querySelectorAll('svg .node.stale, svg .node.unsure').length === 2")
        # Archives, and what differs.
        browser.run("location.hash = '#archives'")
        browser.driver.find_element("css selector", "#archive-file").send_keys(f"{workspace.path('one.bin')}\n{workspace.path('two.bin')}")
        browser.wait("document.querySelectorAll('.archive tbody tr').length > 20")
        holds(browser.run("return document.getElementById('view-archives').innerText"), "From one.bin to two.bin", "price", "10", "99", "shop::Item", "release 2", "first")
        browser.run("""const dropped = new DataTransfer(); dropped.items.add(new File(['junk'], 'junk.bin'));
            window.dispatchEvent(new DragEvent('drop', { dataTransfer: dropped }))""")
        browser.wait("document.querySelector('.archive .bad')?.parentElement.innerText.includes('junk.bin')")
        # Search, types, a reload in the middle.
        search = browser.driver.find_element("css selector", "#search")
        search.send_keys("onerror")
        browser.wait("document.querySelectorAll('.names button').length && document.body.innerText.includes('1 place')")
        browser.run("document.querySelector('#view-objects .names button').click()")
        browser.wait("tree.selected && tree.selected.row.name === '<img src=x onerror=alert(1)>'")
        browser.driver.refresh()
        browser.wait("tree.selected && tree.selected.row.name === '<img src=x onerror=alert(1)>' && tree.selected.row.text === '5'")
        browser.run("location.hash = '#types/shop::Item'")
        browser.wait("document.querySelector('#view-types').innerText.includes('release 2') && document.querySelector('#view-types').innerText.includes('price')")
        equal(browser.run("return document.title"), "Shop <b>")
        asked = {re.sub(r"^(ws|http)://", "", url) for url in browser.requests() if not url.startswith(("data:", "about:"))}
        assert all(url.startswith(program.address[len("http://"):]) for url in asked), asked
        program.end()
        browser.wait("document.getElementById('state').textContent.includes('has ended')")
        equal([line for line in browser.console() if "WebSocket" not in line], [])


def test_looks(binary):
    """Light, dark and on a small screen: what is written can be read, and nothing runs over the edge."""
    contrast = """
        const parse = color => (color.match(/[\\d.]+/g) || []).map(Number);
        const light = ([r, g, b]) => [r, g, b].map(v => v / 255).map(v => v <= 0.03928 ? v / 12.92 : ((v + 0.055) / 1.055) ** 2.4)
          .reduce((sum, v, i) => sum + v * [0.2126, 0.7152, 0.0722][i], 0);
        const ground = element => { for (let e = element; e; e = e.parentElement) { const c = parse(getComputedStyle(e).backgroundColor);
          if (c.length === 3 || c[3] > 0) return c; } return [255, 255, 255]; };
        return [...document.querySelectorAll('body *')].filter(e => e.offsetParent && [...e.childNodes].some(n => n.nodeType === 3 && n.data.trim()) && !e.disabled)
          .map(e => [light(parse(getComputedStyle(e).color)), light(ground(e)), e]).map(([a, b, e]) => [(Math.max(a, b) + 0.05) / (Math.min(a, b) + 0.05), e.className + ':' + e.innerText])
          .filter(([ratio]) => ratio < 4.5).map(([ratio, text]) => `${ratio.toFixed(1)} ${text}`)"""
    with built(binary) as workspace, Program(["./app", "loop"], workspace.folder) as program:
        for width, dark in ((1100, False), (1100, True), (400, False)):
            with Shown(width, 760, dark=dark) as browser:
                browser.visit(program.address)
                browser.find("shop", "stock", {"k": "apples", "at": 2})
                for view in ("objects", "types", "changes", "graph", "archives"):
                    browser.run("document.getElementById('tab-' + arguments[0]).click()", view)
                    browser.settle()
                    equal(browser.run(contrast), [])
                    assert browser.run("return document.documentElement.scrollWidth <= innerWidth"), f"{view} is wider than {width}"
                equal(browser.console(), [])


def test_example(binary):
    """The greenhouse prints its address, and ends by itself."""
    need("g++")
    with Workspace(binary, {}) as workspace:
        shutil.copytree(ROOT / "examples/inspector/tree", workspace.path("tree"))
        text = (ROOT / "examples/inspector/inspector.qrex").read_text()
        workspace.write("inspector.qrex", text.replace("../../runtime", str(ROOT / "runtime")))
        holds(workspace.run("inspector.qrex"), "\nCompleted..")
        holds(workspace.shell("out/lib/x64/Debug/greenhouse 1"), "Look at http://127.0.0.1:", "\nAfter ", " minutes: Sweet Million is 10.", " cm high")


def test_new_workspace(binary):
    """The five lines of docs/inspector.md in the workspace that `Qrex --init` lays out."""
    page = (ROOT / "docs/inspector.md").read_text()
    lines = re.search(r"<!-- first -->\n((?:(?:    .*)?\n)+)", page).group(1)
    head, *body = [line.strip() for line in lines.splitlines() if line.strip() and not line.strip().startswith("//")]
    with Workspace(binary, {}) as workspace:
        workspace.shell("Qrex --init zoo")
        source = "zoo/tree/zoo_app/src/zoo_app.cpp"
        workspace.replace(source, '@import "Vesk/vxObject/IObject.h"\n', f'@import "Vesk/vxObject/IObject.h"\n{head}\n')
        text = workspace.path(source).read_text()
        workspace.path(source).write_text(text[:text.rindex("}")] + "\n".join(body) + "\n}\n")
        workspace.shell("cd zoo && Qrex zoo.qrex")
        process = subprocess.Popen([workspace.path("zoo/out/lib/x64/Debug/zoo_app")], stdout=subprocess.PIPE, text=True)
        try:
            address = next(line for line in process.stdout if line.startswith("Inspector: ")).split()[-1]
            with Shown() as browser:
                browser.visit(address)
                holds(" ".join(browser.texts(".row")), "leo", "name = Leo")
        finally:
            process.kill()
            process.wait()


run_tests(globals())
