"""Makers of workloads: each writes a workspace (and what a peer reads) below a folder and tells what it made."""

import os
import random
import re

CONFIGURATION = """virtualTree = { "tree" }
$EXPORT_LIB = "out/lib"
$EXPORT_TRANSLATED_INCLUDE = "out/tinc"
$EXPORT_UNTRANSLATED_INCLUDE = "out/uinc"
workspaces = { "ws/all.qrws" }
config = "Debug"
platform = "x64"
mode = build
translateOnly = true
compiler = gcc
systemName = "Linux"
"""

PROJECT = """$TARGET_TYPE = "Application"
$ROOT_TO_PROJDIR = "app"
qrex
config { "Debug|x64" "Release|x64" }
subproj { "Vesk/vxObject" }
{
"src" { %s }
}
"""


def write(path, text):
    os.makedirs(os.path.dirname(path), exist_ok=True)
    with open(path, "w", newline="\n") as file:
        file.write(text)


OBJECT_HEADER = """namespace vesk
{
$interface+ IObject { };
$interface+ IPersistable : IObject { };
}
"""
OBJECT_PROJECT = """$TARGET_TYPE = "Utility Project"
$ROOT_TO_PROJDIR = "Vesk/vxObject"
qrex
config { "Debug|x64" "Release|x64" }
{ "IObject.h" }
"""


def workspace(root, files):
    """A workspace with one project, `app`, whose sources are `files` (name: text), and the head of the runtime.
    `Qrex main.qrex` in root builds it."""
    write(f"{root}/main.qrex", CONFIGURATION)
    write(f"{root}/tree/.qrwsroot", "")
    write(f"{root}/tree/ws/all.qrws", '"all" { "Vesk/vxObject" "app" }\n')
    write(f"{root}/tree/Vesk/vxObject/IObject.h", OBJECT_HEADER)
    write(f"{root}/tree/Vesk/vxObject/src/vxObject.qrpj", OBJECT_PROJECT)
    write(f"{root}/tree/app/src/app.qrpj", PROJECT % " ".join(f'"{name}"' for name in files))
    for name, text in files.items():
        write(f"{root}/tree/app/src/{name}", text)


def is_translated(root, name, expected, exactly=True):
    """Whether the generated text of a source of `app` begins with the content of the file `expected`; unless exactly,
    comments and blanks don't count."""
    texts = []
    for path in (f"{root}/qrexsource/x64/Debug/app/src/{name}", expected):
        with open(path) as file:
            text = file.read()
        texts.append(text if exactly else re.sub(r"//.*|/\*.*?\*/|\s", "", text))
    return texts[0].startswith(texts[1])


# --- Plain C++

WORDS = """account buffer cache column cursor delta entry field frame handle header image input item key label limit line
list margin message name node offset option order owner packet page parent path pixel point price queue range record
region result row sample scope segment session shape signal size slot source state store stream style table target task
text thread token total tree unit value vector version view weight width window""".split()
TYPES = ["int", "double", "bool", "std::string", "const char*", "size_t", "uint32_t"]


class Names:
    """Names of the kinds that C++ programs hold; the same for each run."""

    def __init__(self, seed):
        self.random = random.Random(seed)

    def word(self):
        return self.random.choice(WORDS)

    def name(self):
        return f"{self.word()}{self.word().capitalize()}"

    def unique(self, number):
        return f"{self.name()}{number}"

    def type(self):
        return self.random.choice(TYPES)

    def number(self):
        return self.random.randrange(1000)


def plain_function(names, number):
    a, b, c, f = names.name(), names.name(), names.name(), names.unique(number)
    return f"""// Adds the {names.word()} of each {names.word()} to the {names.word()}; {names.word()} first.
static {names.type()} {f}(const {names.type()}& {a}, int {b}) {{
  int {c} = {names.number()};  /* {names.word()} */
  for (int i = 0; i < {b}; ++i) {{
    if ({a}.{names.word()}[i] != {names.number()} && !{a}.{names.name()}()) continue;
    {c} += {a}.{names.word()}[i] * {names.number()} - ({b} << {names.number() % 8});
    report("{names.word()} of {names.word()}: %d\\n", {c}, '{names.word()[0]}', {names.number()}.5);
  }}
  return {names.name()}({c}, {a}->{names.word()}, 0x{names.number():x});
}}

"""


def plain_text(size, seed=1):
    names = Names(seed)
    pieces, length = [], 0
    while length < size:
        piece = plain_function(names, len(pieces))
        pieces.append(piece)
        length += len(piece)
    return "".join(pieces)


def plain(root, size):
    """Plain C++ without a macro: plain.cpp of the workspace. Gives its size."""
    text = plain_text(size)
    workspace(root, {"plain.cpp": text})
    return len(text)


# --- Macro calls

MACROS = {  # name: formals, body with the formals in braces
    "LIMIT": ([], "4096"),
    "FIELD": (["type", "name"], "{type} get_{name}() const {{ return m_{name}; }}"),
    "CHECK": (["x", "y"], "if (!({x} == {y})) {{ report({x}, {y}); }}"),
    "GUARD": (["lock"], "Guard guard({lock}); enter({lock})"),
    "CLAMP": (["v", "low", "high"], "({v} < {low} ? {low} : {v} > {high} ? {high} : {v})"),
}


# As -C, except that blanks behind a comma are not part of the argument, which FIELD pastes.
GPP_SYNTAX = ["-n", "-U", "", "", "(", r",\w", ")", "(", ")", "#", "", "-M", r"\n#\w", r"\n", " ", " ", r"\n", "", "",
              "+c", "/*", "*/", "+c", "//", r"\n", "+s", '"', '"', "\\", "+s", "'", "'", "\\"]


def definitions(line, reference, paste=""):
    """A line for each macro. Its body has a reference for each formal, with `paste` before those that end a name."""
    lines = []
    for name, (formals, body) in MACROS.items():
        references = {formal: reference.format(name=formal, number=index + 1) for index, formal in enumerate(formals)}
        lines.append(line.format(name=name, formals=f"({', '.join(formals)})" if formals else "",
                                 body=body.replace("_{", f"_{paste}{{").format(**references)))
    return "".join(lines)


def calling_function(names, number):
    """Five calls in some 290 bytes."""
    a, b, f = names.name(), names.name(), names.unique(number)
    return f"""class {f} {{
  FIELD({names.type()}, {a})
  int {names.name()}(int {b}) {{
    GUARD({names.word()}Lock);
    CHECK({b}, {names.number()})
    for (int i = LIMIT; i > {b}; --i) {names.word()}[i] += {b};
    return CLAMP({b} + {names.number()}, 0, {names.name()});
  }}
  {names.type()} m_{a};
}};
"""


def macro_calls(root, size, calls):
    """C++ with macro calls, padded with plain text: calls.cpp of the workspace, and for the peers
    calls.m4, calls.gpp and calls.c. Gives the size."""
    names = Names(2)
    classes = [calling_function(names, number) for number in range(calls // 5)]
    padding = plain_text(max(0, size - sum(map(len, classes))), 3).split("\n\n")
    step = max(1, len(classes) // max(1, len(padding)))
    pieces = []
    for index, text in enumerate(classes):
        pieces.append(text)
        if index % step == 0 and index // step < len(padding):
            pieces.append(padding[index // step] + "\n\n")
    text = "".join(pieces)
    workspace(root, {"calls.cpp": definitions("@def {name}{formals} = {body}\n", "{name}", "@@") + text})
    m4 = "changecom(`//')dnl\n" + definitions("define(`{name}', `{body}')dnl\n", "${number}")
    write(f"{root}/calls.m4", m4 + text)
    write(f"{root}/calls.gpp", definitions("#define {name} {body}\n", "#{number}") + text)
    write(f"{root}/calls.c", definitions("#define {name}{formals} {body}\n", "{name}", "##") + text)
    return len(text)


# --- Headers

def import_chain(root, count):
    """Each header imports the one before it and uses a macro of it; main.cpp imports the last."""
    files = {}
    for number in range(count):
        imported = f'@import "h{number - 1}.h"\n' if number else ""
        used = f"step{number - 1}(x)" if number else "x"
        files[f"h{number}.h"] = (f"{imported}@def step{number}(x) = (x + {number})\n"
                                 f"inline int f{number}(int x) {{ return {used}; }}\n")
    files["main.cpp"] = f'@import "h{count - 1}.h"\nint main() {{ return f{count - 1}(0); }}\n'
    workspace(root, files)


def reflected_classes(root, count, per_header=10):
    """Chained headers of reflected classes, and the same fields as messages for protoc and as properties for moc, in as
    many files (proto/) and in one (moc/classes.h). Gives the names in proto/."""
    headers = count // per_header
    files, moc = {}, ["#include <QObject>\n#include <QString>\n"]
    scalars = [("int32", "int32", "int"), ("float64", "double", "double"), ("bool", "bool", "bool"),
               ("string8", "string", "QString"), ("int64", "int64", "qint64"), ("float32", "float", "float")]
    for header in range(headers):
        before = header - 1
        pieces = [f'@import "h{before}.h"\n' if header else '@import "Vesk/vxObject/IObject.h"\n']
        proto = ['syntax = "proto3";\npackage bench;\n', f'import "p{before}.proto";\n' if header else ""]
        for number in range(header * per_header, (header + 1) * per_header):
            fields = [(ours, theirs, qt, f"field{i}_{number}") for i, (ours, theirs, qt) in enumerate(scalars)]
            pieces.append(f"$struct+ Class{number}\n{{\n" +
                          "".join(f"    ${ours} {name};\n" for ours, _, _, name in fields) + "};\n")
            proto.append(f"message Class{number} {{\n" +
                         "".join(f"  {theirs} {name} = {i + 1};\n" for i, (_, theirs, _, name) in enumerate(fields)) +
                         "}\n")
            moc.append(f"class Class{number} : public QObject\n{{\n    Q_OBJECT\n" +
                       "".join(f"    Q_PROPERTY({qt} {name} MEMBER {name})\n" for _, _, qt, name in fields) +
                       "public:\n" + "".join(f"    {qt} {name};\n" for _, _, qt, name in fields) + "};\n")
        if header:  # a field of a class of the header before
            proto.append(f"message Uses{header} {{ Class{before * per_header} used = 1; }}\n")
            pieces.append(f"$struct+ Uses{header} {{ $Class{before * per_header} used; }};\n")
        files[f"h{header}.h"] = "".join(pieces)
        write(f"{root}/proto/p{header}.proto", "".join(proto))
    files["app.cpp"] = "".join(f'@import "h{header}.h"\n' for header in range(headers))
    workspace(root, files)
    write(f"{root}/moc/classes.h", "".join(moc))
    os.makedirs(f"{root}/cpp", exist_ok=True)
    return [f"p{header}.proto" for header in range(headers)]


# --- Directives

def write_lines(root):
    with open(f"{root}/main.qrex", "a", newline="\n") as file:
        file.write("lineDirectives = true\n")


def count_directives(root):
    """Of the outputs, and the most there may be: one for each file and declaration, of which a tail has text of its own, two
    for each call of a macro."""
    written = most = 0
    for folder, _, names in os.walk(f"{root}/tree/app"):
        for name in names:
            if name.endswith((".h", ".cpp")):
                with open(os.path.join(folder, name)) as file:
                    text = file.read()
                macros = re.findall(r"^@def (\w+)", text, re.MULTILINE)
                calls = len(re.findall(rf"\b(?:{'|'.join(macros)})\b", text)) - len(macros) if macros else 0
                declarations = len(re.findall(r"[$@][a-zA-Z]\w*", text))
                most += 1 + declarations + 2 * calls
    for folder, _, names in os.walk(f"{root}/qrexsource"):
        for name in names:
            if name.endswith((".h", ".cpp")):
                with open(os.path.join(folder, name)) as file:
                    written += sum(line.startswith("#line ") for line in file)
    return written, most
