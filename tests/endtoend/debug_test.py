#!/usr/bin/env python3
"""What debuggers show of programs: gdb with the printers of the runtime, and the file for the debugger of Visual Studio."""

import re
import xml.etree.ElementTree as XmlTree

from workspace_fixture import CACHE, ROOT, Workspace, data, equal, holds, lacks, need, run_tests

PRINTERS = ROOT / "runtime/debug/vesk_gdb.py"
NATVIS = ROOT / "runtime/debug/vesk.natvis"
HEADERS = ROOT / "runtime/Vesk/vxObject"
BIN = "out/lib/x64/Debug"


def gdb(workspace, program, *commands, options=f"-x {PRINTERS}"):
    """What gdb prints for the commands, from the last that starts the program on. It must come to their end."""
    settings = ["set pagination off", "set confirm off", "set width 0", "set style enabled off"]
    workspace.write("commands.gdb", "\n".join([*settings, *commands, "echo came to the end\\n"]) + "\n")
    output = workspace.shell(f"gdb -nx -q -batch {options} -x commands.gdb {BIN}/{program} </dev/null 2>&1")
    holds(output, "came to the end")
    lacks(output, "Python Exception")
    return output


HEADER = data("debug/more.h")
LONG = "a text that has no room in the string itself"
# Variables, with what gdb prints of them.
VALUES = [("numbers", "vesk::DynArray<int32> numbers{1, 2}", "vesk::DynArray of length 2 = {1, 2}"),
          ("five", "vesk::openvariant<int32> five(5)", "int: 5"),
          ("none", "vesk::openvariant<int32> none", "empty"),
          ("text", 'vesk::openvariant<int32> text(vesk::string8("hi"))', 'vesk::basic_xstring<char>: "hi"'),
          ("wide", "vesk::string16 wide(3, u'x')", 'u"xxx"'),
          ("cat", "more::Cat cat; cat.counter = -1", 'more::Cat of release 2 = {hue = "", counter = -1, twice = stale, plus() = cache}'),
          ("near", "vesk::ptr<more::INamed> near(&cat)", "more::Cat at 0x"),
          ("nobody", "vesk::ptr<more::INamed> nobody", "null"),
          ("kept", "vesk::cref<more::Cat> kept(&cat)", "more::Cat at 0x"),
          ("deque", "vesk::xdeque<int32> deque; deque.push_back(4)", "vesk::xdeque with 1 element = {4}"),
          ("names", 'vesk::xmap<vesk::string8, int32> names; names["a"] = 2', 'vesk::xmap with 1 element = {["a"] = 2}'),
          ("shared", "more::Cat shared; shared.counter = 1; shared.twice.read(); shared.plus(3)",
           'more::Cat of release 2 = {hue = "", counter = 1, twice = 2, plus() = cache = {[3] = 4}}'),
          ("raw", "alignas(more::Cat) char bytes[sizeof(more::Cat)]; std::memset(bytes, 0x7f, sizeof bytes);"
                  "more::Cat& raw = reinterpret_cast<more::Cat&>(bytes); (void)raw",
           "more::Cat of release 2 = {hue = <error: Cannot access memory at address 0x7f7f7f7f7f7f7f7f>, counter = 2139062143, "
           "twice = not initialised, plus() = cache}"),
          ("keys", "vesk::xset<int32> keys; keys.Insert(4)", "vesk::xset with 1 element = {[0] = 4}"),
          ("on_heap", "more::Value on_heap(2.5)", "2.5"),
          ("in_place", "more::Value in_place(vesk::int32(7))", "7"),
          ("longer", f'more::Value longer(vesk::string8("{LONG}"))', f'"{LONG}"'),
          ("big", 'more::Value big = more::Value::big(vesk::string8("x"))', 'big({s = "x"})'),
          ("scalar", "more::Value scalar = more::Value::num(3)", "num(3)"),
          ("nothing", "more::Value nothing = more::Value::nothing()", "nothing"),
          ("refined", "more::Refined refined(more::Refined::Two)", "Two"),
          ("two", "vesk::Array<more::Refined, 2> two", "vesk::Array of length 2 = {Two, Two}")]


def test_first_workspace(binary):
    """An enumeration by its label, and values of other kinds. The program names the printers itself; gdb loads them if it may."""
    need("g++", "gdb")
    with Workspace(binary, {}) as workspace:
        workspace.run("--init", "zoo", ".")
        workspace.write("tree/zoo_core/api/more.h", HEADER)
        workspace.write("tree/zoo_core/src/zoo_core.cpp", '@import "zoo_core/api/more.h"\n' +
                        workspace.path("tree/zoo_core/src/zoo_core.cpp").read_text())
        workspace.replace("tree/zoo_app/src/zoo_app.cpp", "int main()", "void Stop() {}\nvoid Values()\n{\n" + "".join(
            f"    {declaration};\n" for _, declaration, _ in VALUES) + "    Stop();\n}\nint main()")
        workspace.replace("tree/zoo_app/src/zoo_app.cpp", "animals::Animal leo(", "Values();\n    animals::Animal leo(")
        workspace.replace("tree/zoo_app/src/zoo_app.cpp", '@import "Vesk/vxObject/IObject.h"\n',
                          '@import "Vesk/vxObject/IObject.h"\n@import "Vesk/vxObject/DebugScript.h"\n'
                          '@import "zoo_core/api/more.h"\n'
                          f'vxDebugScript("{PRINTERS}")\n')
        holds(workspace.run("zoo.qrex", f'PATH("x64") = {{ "{CACHE}" "/usr/bin" "/bin" }}'), "\nCompleted.")
        stop = ["break animals::Animal::FoodPerDay", "run >/dev/null", "up"]
        there = gdb(workspace, "zoo_app", "break Stop", "run >/dev/null", "up", "info locals", "continue", "delete", *stop,
                    "print leo", "set var leo.diet.m_value = 7", "print leo.diet", options="-iex 'add-auto-load-safe-path /'")
        for name, _, printed in VALUES:
            holds(there, f"\n{name} = {printed}")
        holds(there, '$1 = {name = "Leo", diet = Meat, weight = 200}\n', "$2 = 7\n")
        holds(gdb(workspace, "zoo_app", *stop, "print leo.diet", options="-iex 'set auto-load safe-path /nowhere'"), "m_value = 1")


# --- The file for Visual Studio

# Of each element that the file may have: its attributes, and the elements in it.
SCHEMA = {"AutoVisualizer": (set(), {"Type"}), "Type": ({"Name"}, {"DisplayString", "Expand"}),
          "DisplayString": ({"Condition"}, set()), "Expand": (set(), {"ExpandedItem", "ArrayItems"}),
          "ExpandedItem": ({"Condition"}, set()),
          "ArrayItems": (set(), {"Size", "ValuePointer"}), "Size": (set(), set()), "ValuePointer": (set(), set())}
SPACE = "{http://schemas.microsoft.com/vstudio/debugger/natvis/2010}"


def class_text(name):
    """(head, body) of a class of the runtime."""
    for header in sorted(HEADERS.glob("*.h")):
        found = re.search(rf"^(template <[^{{;]*?>\n)?(?:class|struct) {name}\b([^;{{]*)\{{(.*?)^}};", header.read_text(),
                          re.M | re.S)
        if found:
            return found.group(1) or "", found.group(2), found.group(3)
    raise AssertionError(f"no class {name} in the runtime")


def members(name):
    """Words in a class and in what it derives from."""
    _, head, body = class_text(name)
    words = set(re.findall(r"\w+", body))
    for base in re.findall(r"(?:public|private) (?!std::)(\w\w+)", head):  # C is a parameter
        words |= members("DGNode" if base == "Node" else base)  # and so is this, of nodes of `$cache` functions
    return words


def test_natvis(_):
    """By the schema, and what it names is declared in the runtime's headers, with as many parameters."""
    root = XmlTree.parse(NATVIS).getroot()
    equal(root.tag, SPACE + "AutoVisualizer")
    for element in root.iter():
        attributes, inner = SCHEMA[element.tag.replace(SPACE, "")]
        equal((set(element.attrib) - attributes, {child.tag.replace(SPACE, "") for child in element} - inner), (set(), set()))
        equal(bool((element.text or "").strip()), not inner)
    equal([type_ for type_ in root if not type_.findall(SPACE + "DisplayString")], [])
    for type_ in root:
        name, parameters = re.fullmatch(r"vesk::(\w+)(?:<([*,]+)>)?", type_.get("Name")).groups()
        template = class_text(name)[0]
        equal((name, len(re.findall(r"\b(?:typename|ssize_t) \w+", template))), (name, parameters.count("*") if parameters else 0))
        expressions = " ".join((element.text or "") + " " + element.get("Condition", "") for element in type_.iter())
        equal((name, set(re.findall(r"\b(?:m_|_)[a-z]\w*", expressions)) - members(name)), (name, set()))
        for scope, word in re.findall(r"vesk::(\w+)::(\w+)", expressions):
            headers = "\n".join(header.read_text() for header in HEADERS.glob("*.h"))
            holds(re.search(rf"enum class {scope}\b[^;]*;", headers).group(), word)


run_tests(globals())
