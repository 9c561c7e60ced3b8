"""Keys typed in an editor, as the language server takes them. A clangd that answers at once stands behind it."""

import os
import stat
import statistics
import sys
import time
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent
sys.path.insert(0, str(ROOT / "tests/endtoend"))
from lsp_fixture import Client, uri_of  # noqa: E402

STAND_IN = """#!{python}
import json
import sys
stream = sys.stdin.buffer
while True:
    length = None
    while (line := stream.readline()) not in (b"\\r\\n", b""):
        if line.lower().startswith(b"content-length"):
            length = int(line.split(b":")[1])
    if length is None:
        break
    message = json.loads(stream.read(length))
    if "id" in message:
        body = json.dumps({{"jsonrpc": "2.0", "id": message["id"], "result": {{}}}}).encode()
        sys.stdout.buffer.write(b"Content-Length: %d\\r\\n\\r\\n" % len(body) + body)
        sys.stdout.buffer.flush()
"""


def lay_out(root, count):
    """A project with `count` headers, a source that imports all of them, and as many sources that import the first."""
    source = Path(root) / "tree/app/src"
    source.mkdir(parents=True)
    for i in range(count):
        (source / f"h{i}.h").write_text(
            f'@import "Vesk/vxObject/IObject.h"\nnamespace h{i}\n{{\n$struct+ S{i}\n{{\n    $int32 n;\n    $float64 x : [ unit("m") ];\n}};\n'
            f"@def twice{i}(x) = x + x\n}}\n")
        (source / f"u{i}.cpp").write_text(f'@import "h0.h"\nint u{i}()\n{{\n    h0::S0 s;\n    return s.n;\n}}\n')
    imports = "".join(f'@import "h{i}.h"\n' for i in range(count))
    (source / "app.cpp").write_text(imports + "int main()\n{\n    h1::S1 s;\n    return twice1(1);\n}\n")
    (source / "app.qrpj").write_text('$TARGET_TYPE = "Application"\n$ROOT_TO_PROJDIR = "app"\nqrex subproj { "Vesk/vxObject" }\n'
                                     'config { "Debug|x64" }\n{ "src" { "*.h" "*.cpp" } }\n')
    (Path(root) / "tree/.qrwsroot").write_text("")
    (Path(root) / "tree/all.qrws").write_text('"all" { "Vesk/vxObject" "app" }\n')
    (Path(root) / "main.qrex").write_text(
        f'virtualTree = {{ "tree" "{ROOT / "runtime"}" }}\n$EXPORT_LIB = "out/lib"\n$EXPORT_TRANSLATED_INCLUDE = "out/include"\n'
        '$EXPORT_UNTRANSLATED_INCLUDE = "out/source"\nworkspaces = { "all.qrws" }\ncompiler = gcc\nsystemName = "Linux"\n'
        'config = "Debug"\nplatform = "x64"\nmode = build\ntranslateOnly = true\n')
    stand_in = Path(root) / "clangd"
    stand_in.write_text(STAND_IN.format(python=sys.executable))
    stand_in.chmod(stand_in.stat().st_mode | stat.S_IXUSR)


def milliseconds(server, root, count, keys):
    """Medians, from a key until all texts that it changes are out: in the source with the imports, and in the header that all
    sources import, which are open."""
    os.environ["XDG_CACHE_HOME"] = str(Path(root) / "cache")
    with Client(server, root, clangd=str(Path(root) / "clangd")) as client:
        def show(name):
            client.open(name)
            client.ask("workspace/executeCommand", {"command": "qrex.showGenerated", "arguments": [uri_of(client.path(name))]})

        def key(name, old, new, texts):
            client.notes.clear()
            begin = time.perf_counter()
            client.edit(name, old, new)
            while sum(note["method"] == "qrex/generatedChanged" for note in client.notes) < texts:
                client.take()
            return (time.perf_counter() - begin) * 1000

        def median(name, old, new, texts):
            return statistics.median(key(name, *way, texts) for _ in range(keys) for way in ((old, new), (new, old)))

        show("tree/app/src/app.cpp")
        in_source = median("tree/app/src/app.cpp", "twice1(1)", "twice1(1 + 1)", 1)
        for i in range(count):
            show(f"tree/app/src/u{i}.cpp")
        show("tree/app/src/h0.h")
        return in_source, median("tree/app/src/h0.h", "$int32 n;", "$int32 n; $int32 m;", count + 2)
