"""Shows the library's types in gdb as what they hold: `source packaging/debugger/torvane_gdb.py`."""

import gdb
import gdb.printing


def text_of(string):
    """The characters of a String."""
    length = int(string["length_"])
    block = string["block_"]
    if length <= 0 or int(block) == 0:
        return ""
    units = gdb.selected_inferior().read_memory(int(block), 2 * length)
    return bytes(units).decode("utf-16-le", "replace")


class StringPrinter:
    """A String as its text."""

    def __init__(self, value):
        self.value = value

    def to_string(self):
        return text_of(self.value)

    def display_hint(self):
        return "string"


class VectorPrinter:
    """A Vector as (x, y, z)."""

    def __init__(self, value):
        self.value = value

    def to_string(self):
        return "(%g, %g, %g)" % tuple(float(self.value[axis]) for axis in "xyz")


class GeDataPrinter:
    """A GeData as its kind and what it holds."""

    # Kind: name and member of the payload. A pointer is followed.
    KINDS = {
        0: ("nil", None), 14: ("pointer", "pointer"), 15: ("long", "integer"), 19: ("real", "real"), 22: ("time", "time"),
        23: ("vector", "vector"), 25: ("matrix", "matrix"), 26: ("llong", "wide"),
        130: ("string", "string"), 131: ("filename", "filename"), 132: ("container", "container"),
        133: ("link", "link"),
    }

    def __init__(self, value):
        self.value = value

    def to_string(self):
        kind = int(self.value["type_"])
        name, member = self.KINDS.get(kind, ("type %d" % kind, None))
        if member is None:
            return name
        payload = self.value["payload_"][member]
        if payload.type.code == gdb.TYPE_CODE_PTR and member != "pointer":
            if int(payload) == 0:
                return name + " (none)"
            payload = payload.dereference()
        return "%s %s" % (name, payload.format_string(max_elements=20))


class FilenamePrinter:
    """A Filename as its text."""

    def __init__(self, value):
        self.value = value

    def to_string(self):
        return text_of(self.value["text_"])

    def display_hint(self):
        return "string"


class ContainerPrinter:
    """A BaseContainer as its entries, each under its id."""

    def __init__(self, value):
        self.value = value

    def to_string(self):
        return "container %d" % int(self.value["id_"])

    def children(self):
        element = self.value["head_"]
        while int(element) != 0:
            yield str(int(element["id"])), element["value"]
            element = element["next"]


def is_node(kind):
    """True for BaseList2D and what derives from it."""
    if kind.code != gdb.TYPE_CODE_STRUCT:
        return False
    return kind.name == "_torvane_::BaseList2D" or any(
        field.is_base_class and is_node(field.type.strip_typedefs()) for field in kind.fields())


class NodePrinter:
    """A node as its class, type and name; its container as a child."""

    def __init__(self, value):
        self.value = value

    def to_string(self):
        name = text_of(self.value["name_"])
        return '%s %d "%s"' % (self.value.dynamic_type, int(self.value["type_"]), name)

    def children(self):
        yield "data", self.value["data_"]


class NodePrinters(gdb.printing.PrettyPrinter):
    """The printer of every class of nodes, those of clients too."""

    def __init__(self):
        super().__init__("torvane nodes")

    def __call__(self, value):
        return NodePrinter(value) if is_node(value.type.strip_typedefs()) else None


def printers():
    """The printers of single types, under their names."""
    collection = gdb.printing.RegexpCollectionPrettyPrinter("torvane")
    for name, printer in (("String", StringPrinter), ("Filename", FilenamePrinter), ("Vector", VectorPrinter),
                          ("GeData", GeDataPrinter), ("BaseContainer", ContainerPrinter)):
        collection.add_printer(name, "^_torvane_::%s$" % name, printer)
    return collection


gdb.printing.register_pretty_printer(None, printers(), replace=True)
gdb.printing.register_pretty_printer(None, NodePrinters(), replace=True)
