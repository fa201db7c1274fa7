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


class NodePrinter:
    """A node as its class, type and name; its fields as children."""

    def __init__(self, value):
        self.value = value

    def to_string(self):
        name = text_of(self.value["name_"])
        return '%s %d "%s"' % (self.value.dynamic_type, int(self.value["type_"]), name)


def printers():
    """The printers of this file, under the names of their types."""
    collection = gdb.printing.RegexpCollectionPrettyPrinter("torvane")
    collection.add_printer("String", "^_torvane_::String$", StringPrinter)
    collection.add_printer("Vector", "^_torvane_::Vector$", VectorPrinter)
    collection.add_printer("GeData", "^_torvane_::GeData$", GeDataPrinter)
    collection.add_printer(
        "Node", "^_torvane_::(BaseList2D|BaseList4D|BaseObject|BaseTag|BaseMaterial|Material|BaseShader|LayerObject|CTrack|CCurve|CKey)$",
        NodePrinter)
    return collection


gdb.printing.register_pretty_printer(None, printers(), replace=True)
