"""Printers for gdb: values of the runtime and of generated classes as their sources declare them. `source vesk_gdb.py`.

Nothing is called in the program, so core dumps print as well, and memory that holds no value gives an error of gdb's at the
worst. What a printer asks of a type is asked once."""

import re

import gdb

CF_MODEL = 2
MOST_BYTES = 1 << 47  # of user space
NODE_STATES = {0: False, 1: False, 2: True}  # ENodeState: whether the value is up to date

_known = {}


def _forget(_):
    _known.clear()


def once(function):
    """What the function finds out about a type is kept until other symbols are read."""
    def ask(type_):
        key = (function.__name__, str(type_))
        if key not in _known:
            _known[key] = function(type_)
        return _known[key]
    return ask


def plain(type_):
    if type_.code in (gdb.TYPE_CODE_REF, gdb.TYPE_CODE_RVALUE_REF):
        type_ = type_.target()
    return type_.strip_typedefs().unqualified()


def evaluate(expression):
    try:
        return gdb.parse_and_eval(expression)
    except gdb.error:
        return None


def find_type(name):
    try:
        return gdb.lookup_type(name)
    except gdb.error:
        return None


def bases(type_):
    return [plain(field.type) for field in type_.fields() if field.is_base_class]


def base_like(type_, *names):
    """The base, at any distance, whose name begins so; None without one."""
    for base in bases(type_):
        found = base if (base.name or "").startswith(names) else base_like(base, *names)
        if found:
            return found
    return None


def symbol_at(address):
    """The name of what stands at an address, "" where nothing is known to."""
    text = gdb.execute(f"info symbol {int(address)}", to_string=True)
    return "" if text.startswith("No symbol") else text.split(" in section ")[0].strip()


def shown(value):
    return value.format_string()


def as_type(value, type_):
    """What stands where the value is, as of a type."""
    return value.address.cast(type_.pointer()).dereference()


def is_whole(base):
    """Whether a container of the standard library can be walked: one in memory that was never set may lead in circles."""
    fields = {field.name for field in base.type.fields()}
    try:
        if "_M_t" in fields:
            tree = base["_M_t"]["_M_impl"]
            header = tree["_M_header"]
            at, count = int(header.address), int(tree["_M_node_count"])
            root, first, last = (int(header[name]) for name in ("_M_parent", "_M_left", "_M_right"))
            if count == 0:
                return (root, first, last) == (0, at, at)
            return count < MOST_BYTES and at not in (root, first, last) and int(header["_M_parent"]["_M_parent"]) == at
        if base.type.name.startswith(("std::list<", "std::__cxx11::list<")):
            node = base["_M_impl"]["_M_node"]
            return int(node["_M_next"]["_M_prev"]) == int(node.address)
        if base.type.name.startswith("std::vector<") and not base.type.name.startswith("std::vector<bool"):
            begin, end, room = (int(base["_M_impl"][name]) for name in ("_M_start", "_M_finish", "_M_end_of_storage"))
            width = base.type.template_argument(0).sizeof
            return (begin > 0) == (room > 0) and begin <= end <= room < MOST_BYTES and (end - begin) % width == (room - begin) % width == 0
    except gdb.MemoryError:
        return False
    except gdb.error:
        pass  # another standard library, which prints as it does
    return True


# --- The library's own types

class Inherited:
    """A container or string prints as the one of the standard library that it is."""

    def __init__(self, value, name):
        base = plain(value.type)
        while not base.name.startswith("std::"):
            base = bases(base)[0]
        self._base = value.cast(base)
        self._inner = gdb.default_visualizer(self._base)
        self._name = name
        self._is_whole = is_whole(self._base)
        if not self._is_whole:
            return
        for method in ("children", "display_hint"):
            if hasattr(self._inner, method):
                setattr(self, method, getattr(self._inner, method))

    def to_string(self):
        if not self._is_whole:
            return f"{self._name}, not initialised"
        if self._inner is None:
            return self._base.format_string(raw=True)
        text = self._inner.to_string() if hasattr(self._inner, "to_string") else self._name
        is_text = "string" in self._name or not isinstance(text, str)
        return text if is_text else re.sub(r"^std::(__\w+::)*\w+", self._name, text)


class Items:
    """Array and DynArray."""

    def __init__(self, value, name):
        self._name = name
        self._items = value["m_items"]
        if self._items.type.code == gdb.TYPE_CODE_ARRAY:
            self._size = self._items.type.range()[1] + 1
            self._is_whole = True
        else:
            self._size = int(value["m_size"])
            most = MOST_BYTES // max(1, self._items.type.target().sizeof)
            self._is_whole = 0 <= self._size <= most and (self._size == 0 or int(self._items) != 0)

    def to_string(self):
        return f"{self._name} of length {self._size}" if self._is_whole else f"{self._name}, not initialised"

    def children(self):
        for at in range(self._size if self._is_whole else 0):
            yield f"[{at}]", self._items[at]

    def display_hint(self):
        return "array"


class Handle:
    """ptr, pref and cref: the class of the object, which a table of functions names, and its address."""

    def __init__(self, value, name):
        self._self = int(value["m_self"])
        fields = [field.name for field in plain(value.type).fields()]
        if "m_table" in fields:
            table = re.search(r"::Stubs<(.*)>::GetTable\(\)::", symbol_at(value["m_table"]))
            self._class = table.group(1).strip() if table else "object"
        else:
            self._class = str(plain(value.type).template_argument(0))

    def to_string(self):
        return f"{self._class} at {self._self:#x}" if self._self else "null"


class OpenVariant:
    def __init__(self, value, _):
        self._at, self._ops = value["m_value"], value["m_ops"]

    def to_string(self):
        if int(self._at) == 0:
            return "empty"
        symbol = symbol_at(self._ops)
        found = re.search(r"MakeTypeOps<(.*)>\(\)|_GetReflected\((.*) const\*\)::", symbol)
        name = (found.group(1) or found.group(2)).strip() if found else None
        type_ = find_type(name) if name else None
        if type_ is None:
            return f"value at {int(self._at):#x}"
        return f"{name}: {shown(self._at.cast(type_.pointer()).dereference())}"


class NodeMap:
    """The nodes of a `$cache` function with keys."""

    def __init__(self, value, _):
        nodes = value["m_nodes"]
        inner = gdb.default_visualizer(nodes) if is_whole(nodes) else None
        self.children = inner.children if inner else lambda: iter(())

    def to_string(self):
        return "cache"

    def display_hint(self):
        return "map"


LIBRARY = {"basic_xstring": Inherited, "xvector": Inherited, "xdeque": Inherited, "xlist": Inherited, "xset": Inherited,
           "xbag": Inherited, "xmap": Inherited, "Array": Items, "DynArray": Items, "ptr": Handle, "pref": Handle,
           "cref": Handle, "openvariant": OpenVariant, "DGNodeMap": NodeMap}


# --- Enumerations that are classes

class Enumeration:
    def __init__(self, value, _):
        type_ = plain(value.type)
        self._number = int(value["m_value"])
        self._labels = labels(type_)

    def to_string(self):
        return self._labels.get(self._number, str(self._number))


@once
def labels(type_):
    numbers = find_type(f"{type_.name}::Enum")
    found = {}
    for field in numbers.fields() if numbers else []:
        found.setdefault(field.enumval, field.name.split("::")[-1])
    return found


# --- Variants

class Variant:
    def __init__(self, value, _):
        self._value = value
        self._type = plain(value.type)

    def to_string(self):
        items, size = variant_items(self._type), data_size(self._type)
        tag = int(self._value["_tag"])
        if not 0 <= tag < len(items):
            return f"no item (tag {tag})"
        name, word, on_heap = items[tag]
        type_ = find_type(name) if name != "void" else None
        if type_ is None:
            return word
        fields = [field.name for field in plain(type_).fields()] if plain(type_).code == gdb.TYPE_CODE_STRUCT else None
        if fields == [] or size == 0:
            return word
        data = self._value["_data"].address
        if on_heap or type_.sizeof > size or fields is None and self._leads_to_heap(size):
            if plain(type_).code == gdb.TYPE_CODE_STRUCT and fields == ["value"] and word != name:
                type_ = plain(type_).fields()[0].type
                fields = None
            data = data.cast(type_.pointer().pointer()).dereference()
        item = data.cast(type_.pointer()).dereference()
        if word == name:
            return shown(item)
        return f"{word}({shown(item['value'] if fields == ['value'] else item)})"

    def _leads_to_heap(self, size):
        """A number without a name declares nothing of where it is kept; no number looks like what `new` gives."""
        if size < 8:
            return False
        address = int(as_type(self._value["_data"], gdb.lookup_type("unsigned long")))
        if address % 16 or not 4096 <= address < MOST_BYTES:
            return False
        try:
            gdb.selected_inferior().read_memory(address, 1)
            return True
        except gdb.error:
            return False


def data_size(type_):
    return sum(field.type.sizeof for field in type_.fields() if field.name == "_data")


@once
def variant_items(type_):
    """(type, name, whether on the heap) of each item, by tags. Only the printed type has the methods, which tell them: `is` for
    each item in the order of tags, `as` for those with a name that are on the heap."""
    try:
        text = gdb.execute(f"ptype/M '{type_.name}'", to_string=True)
    except gdb.error:
        return []
    on_heap = set(re.findall(r"^ *const .* & as\((.*?) ?\*\) const;$", text, re.M))
    items = []
    for name in re.findall(r"^ *bool is\((.*?) ?\*\) const;$", text, re.M):
        is_named = name.startswith(type_.name + "::")
        items.append((name, name[len(type_.name) + 2:] if is_named else name, is_named and name in on_heap))
    return items


# --- Nodes

def state_of(node):
    """Whether a node is up to date, and what stands for its value if it is not; (None, text) for memory that holds no node."""
    number = int(node["m_state"].cast(gdb.lookup_type("unsigned char")))
    if number not in NODE_STATES:
        return None, "not initialised"
    return NODE_STATES[number], "stale" if node["m_isEmpty"] else "stale, was "


def node_text(node, value):
    """Of a `$dep` or `$indep` field, or a `$cache` function: its value, or that it is stale. `value` may be None."""
    fresh, text = state_of(node)
    if fresh:
        return shown(value) if value is not None else "up to date"
    if text == "stale, was ":
        return text + shown(value) if value is not None else "stale"
    return text


class FieldNode:
    """The node stands in the object whose field it is, beside the value."""

    def __init__(self, value, _):
        self._node = value

    def to_string(self):
        return node_text(self._node, self._value_beside())

    def _value_beside(self):
        owner, _, name = (plain(self._node.type).name or "").rpartition("::")
        name = re.sub(r"^(Depnode|Indepnode)_", "", name)
        type_ = find_type(owner)
        for field in plain(type_).fields() if type_ else []:
            if field.name == name:
                at = int(self._node.address) - field.bitpos // 8
                return gdb.Value(at).cast(type_.pointer()).dereference()[f"_{name}_"]
        return None


class CacheNode:
    def __init__(self, value, _):
        self._node = value

    def to_string(self):
        return node_text(self._node, self._node["_output"])


# --- Classes and models

class Class:
    """The fields of a class as it is declared: those of its mixins and of its model among them."""

    def __init__(self, value, _):
        self._value = value
        self._type = plain(value.type)

    def to_string(self):
        release = release_of(self._type)
        return None if release is None else f"{self._type.name} of release {release}"

    def children(self):
        return fields_of(self._value, self._type)


def fields_of(value, type_):
    fields = type_.fields()
    names = {field.name for field in fields}
    for field in fields:
        name = field.name
        if field.is_base_class:
            yield from fields_of(value.cast(field.type), plain(field.type))
        elif name == "_model_":
            model = value[field]
            yield from fields_of(model, plain(model.type))
        elif not name or not hasattr(field, "bitpos") or name.startswith("_vptr"):
            pass  # what stands for a model's fields in sources, statics
        elif re.fullmatch(r"_\w+_", name) and name[1:-1] in names:
            pass  # is told with its node
        elif f"_{name}_" in names:
            yield name, told(value[field], value[f"_{name}_"])
        else:
            yield re.sub(r"^_(dn|map)_(\w+)$", r"\2()", name), value[field]


def told(node, value):
    """The value itself, so that it unfolds, unless there is something to say."""
    return value if state_of(node)[0] else node_text(node, value)


def project_release(symbol):
    """The release of the project that a function is of. Its folder is that of one above the function's source."""
    parts = [part for part in symbol.symtab.filename.split("/")[:-1] if part]
    for end in range(len(parts), 0, -1):
        for begin in range(end - 1, -1, -1):
            project = "_".join(parts[begin:end])
            if re.fullmatch(r"\w+", project):
                target = evaluate(f"'vesk::{project}_GetXTarget()::target'.m_rsn")
                if target is not None:
                    return int(target)
    return None


def release_of(type_):
    """The release in which the project of a model writes it; None where that is not known, or the program has not begun."""
    function = declaring(type_)
    if function is None or not is_model(type_):
        return None
    release = project_release(function)
    return release or None


@once
def declaring(type_):
    """The function that gives the record of a class; None without one."""
    name = type_.name
    scope = name.rpartition("::")[0] if "<" not in name else ""
    return gdb.lookup_global_symbol(f"{scope + '::' if scope else ''}_GetReflected({name} const*)")


@once
def is_model(type_):
    if has_model(type_):
        return True
    function = declaring(type_)
    record = find_type("vesk::ReflectedClass")
    if function is None or record is None:
        return False
    name = type_.name.rpartition("::")[2]
    address = evaluate(f"(unsigned long)&'{function.name}::{name}_class'")
    if address is None:
        return False
    try:
        return bool(int(address.cast(record.pointer())["m_flags"]) & CF_MODEL)
    except gdb.error:
        return False


@once
def has_model(type_):
    return any(field.name == "_model_" or field.is_base_class and has_model(plain(field.type)) for field in type_.fields())


# --- Which printer

@once
def printer_for(type_):
    """(printer, name) for a type, None for those that print well as they are."""
    name = type_.name or ""
    if type_.code != gdb.TYPE_CODE_STRUCT or not name or name.startswith(("std::", "__")):
        return None
    if name.startswith("vesk::"):
        word = name[len("vesk::"):].partition("<")[0]
        if word in LIBRARY:
            return LIBRARY[word], f"vesk::{word}"
    fields = type_.fields()
    if [field.name for field in fields] in (["_tag"], ["_tag", "_data"]) and variant_items(type_):
        return Variant, name
    if base_like(type_, "vesk::EnumBase<"):
        return Enumeration, name
    if name.startswith("vesk::"):
        return None
    if base_like(type_, "vesk::DGCacheNode<"):
        return CacheNode, name
    if base_like(type_, "vesk::DGDepNode", "vesk::DGIndepNode"):
        return FieldNode, name
    if base_like(type_, "vesk::BaseMixin<") or has_nodes(fields) or is_model(type_):
        return Class, name
    return None


def has_nodes(fields):
    names = {field.name for field in fields}
    return any(field.name and f"_{field.name}_" in names and plain(field.type).code == gdb.TYPE_CODE_STRUCT
               and base_like(plain(field.type), "vesk::DGNode") for field in fields)


class Printers:
    """A row of gdb's `info pretty-printer`."""

    name = "vesk"
    enabled = True
    subprinters = None

    def __call__(self, value):
        found = printer_for(plain(value.type))
        if not found or value.is_optimized_out:
            return None
        if value.type.code in (gdb.TYPE_CODE_REF, gdb.TYPE_CODE_RVALUE_REF):
            value = value.referenced_value()
        make, name = found
        return make(value, name)


def register():
    gdb.pretty_printers[:] = [printer for printer in gdb.pretty_printers if getattr(printer, "name", "") != Printers.name]
    gdb.pretty_printers.insert(0, Printers())
    gdb.events.new_objfile.connect(_forget)
    gdb.events.clear_objfiles.connect(_forget)


register()
