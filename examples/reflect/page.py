#!/usr/bin/env python3
"""Makes a Markdown page of the declarations of a workspace:
Qrex --reflect tour.qrex --json | examples/reflect/page.py > declarations.md"""

import json
import sys


def signature(thing):
    arguments = ", ".join(f"{a['type']} {a['name']}" + (f" = {a['default']}" if "default" in a else "") for a in thing["arguments"])
    return f"{thing['returns']['type']} {thing['name'].split('::')[-1]}({arguments})" + (" const" if thing.get("const") else "")


def table(head, rows):
    if not rows:
        return ""
    cells = lambda row: "| " + " | ".join(str(cell).replace("|", "\\|").replace("\n", " ") for cell in row) + " |\n"
    return "\n" + cells(head) + cells(["---"] * len(head)) + "".join(map(cells, rows))


def members(thing):
    if "returns" in thing:
        yield f"\n`{signature(thing)}`\n"
    elif "type" in thing:
        yield f"\n`{thing['type']}`\n"
    yield table(["label", "value"], [[label["name"], label["value"]] for label in thing.get("labels", [])])
    yield table(["item", "type"], [[i["name"], i.get("type", "fields")] for i in thing.get("items", [])])
    fields = thing.get("fields", []) + thing.get("attributes", [])
    yield table(["field", "type", "metadata"], [[f["name"], f"`{f['type']}`", json.dumps(f.get("metadata", ""))] for f in fields])
    yield "".join(f"\n- `{signature(method)}`" for method in thing.get("methods", [])) + "\n"
    if model := thing.get("model"):
        yield table(["field", "type", "added", "dropped"], [[f["name"], f"`{f['type']}`", f["added"], f.get("dropped", "")] for f in model["fields"]])
        yield table(["release", "drops", "adds"], [[r["release"], " ".join(r["drops"]), " ".join(r["adds"])] for r in model["releases"]])


declarations = json.load(sys.stdin)["declarations"]
print("# Declarations")
for project in dict.fromkeys(thing["project"] for thing in declarations):
    print(f"\n## {project}")
    for thing in (thing for thing in declarations if thing["project"] == project):
        print(f"\n### {thing['name']}\n\n`${thing['kind']}`, {thing['file']}:{thing.get('line', 1)}")
        print("".join(members(thing)), end="")
