"""gdb: shows strings and containers of qxcore by their content.

Beside the installed library lies this file under the name that gdb loads by itself, when the folder is
among those that it trusts (add-auto-load-safe-path); else: source qxcore_printers.py
"""

import datetime

import gdb

HEADER_BYTES = 12  # count, length, capacity: the header in front of a string's text


def pointer(value):
    return int(value.cast(gdb.lookup_type("unsigned long")))


def plain(value):
    """The object itself, where a reference to it is shown."""
    return value.referenced_value() if value.type.code in (gdb.TYPE_CODE_REF, gdb.TYPE_CODE_RVALUE_REF) else value


def text_of(string):
    """The text of an SString, whole, inner NULs included."""
    text = string["m_text"]
    if pointer(text) == 0:
        return None
    header = gdb.Value(pointer(text) - HEADER_BYTES).cast(gdb.lookup_type("int").pointer())
    length = int(header[1])
    bytes_ = gdb.selected_inferior().read_memory(pointer(text), 2 * length).tobytes() if length > 0 else b""
    return bytes_.decode("utf-16-le", "surrogatepass")


class StringPrinter:
    def __init__(self, value):
        self.value = plain(value)

    def to_string(self):
        text = text_of(self.value)
        return "<destroyed>" if text is None else text.encode("utf-16-le", "replace").decode("utf-16-le")

    def display_hint(self):
        return "string"


class StringBufferPrinter(StringPrinter):
    def __init__(self, value):
        super().__init__(plain(value)["m_text"])


def elements(address, count, element_type):
    first = gdb.Value(address).cast(element_type.pointer())
    for index in range(count):
        yield f"[{index}]", (first + index).dereference()


class SequencePrinter:
    """What the tables and lists have in common; `parts` gives the count and the elements."""

    def __init__(self, value):
        self.value = plain(value)
        self.element_type = self.find_element_type()

    def find_element_type(self):
        return self.value.type.strip_typedefs().template_argument(0)

    def to_string(self):
        return f"{self.value.type.strip_typedefs()} of {self.parts()[0]}"

    def children(self):
        return self.parts()[1]

    def display_hint(self):
        return "array"


class TablePrinter(SequencePrinter):
    def parts(self):
        count = int(self.value["m_count"])
        return count, elements(pointer(self.value["m_data"]), count, self.element_type)


class StringTablePrinter(TablePrinter):
    def find_element_type(self):
        return gdb.lookup_type("SString")


class SharedTablePrinter(SequencePrinter):
    """A block with its header in front, or an odd number for none."""

    def word(self):
        return int(self.value["m_data"]["m_word"])

    def parts(self):
        word = self.word()
        if word & 1:
            return 0, iter(())
        header_type = gdb.lookup_type("__STableData")
        count = int(gdb.Value(word).cast(header_type.pointer())["m_count"])
        return count, elements(word + header_type.sizeof, count, self.element_type)


class TableMemPrinter(SharedTablePrinter):
    def word(self):
        return int(self.value["m_table"]["m_data"]["m_word"])


class ListPrinter(SequencePrinter):
    def parts(self):
        return int(self.value["m_count"]), self.walk()

    def walk(self):
        end = self.value["m_end"]
        node = end["m_next"]
        for index in range(int(self.value["m_count"])):
            yield f"[{index}]", gdb.Value(pointer(node + 1)).cast(self.element_type.pointer()).dereference()
            node = node["m_next"]


class MapPrinter:
    def __init__(self, value):
        self.value = value = plain(value)
        base = value.type.strip_typedefs()
        while not base.name.startswith(("SMap<", "SUnsortedMap<")):
            base = base.fields()[0].type.strip_typedefs()
        self.map = value.cast(base)
        self.entry = gdb.lookup_type(f"SMapEntry<{base.template_argument(0)}, {base.template_argument(1)} >".replace("> >", "> >"))

    def to_string(self):
        return f"{self.value.type.strip_typedefs().name.split('<')[0]} of {int(self.map['m_count'])}"

    def payloads(self):
        if self.map.type.name.startswith("SUnsortedMap<"):
            order = SharedTablePrinter(self.map["m_order"])
            for _, payload in order.parts()[1]:
                yield pointer(payload)
            return
        stack = []
        entry = self.map["m_root"]
        while stack or pointer(entry):
            while pointer(entry):
                stack.append(entry)
                entry = entry["m_left"]
            entry = stack.pop()
            yield pointer(entry + 1)
            entry = entry["m_right"]

    def children(self):
        for index, payload in enumerate(self.payloads()):
            entry = gdb.Value(payload).cast(self.entry.pointer())
            yield f"[{index}].key", entry["m_key"]
            yield f"[{index}].value", entry["m_value"]

    def display_hint(self):
        return "map"


class TimePrinter:
    """Seconds since 1970, in UTC: the debugger does not know the zone of the program."""

    def __init__(self, value):
        self.seconds = int(plain(value)["m_time"])

    def to_string(self):
        if self.seconds == -1:
            return "STime <invalid>"
        at = datetime.datetime(1970, 1, 1) + datetime.timedelta(seconds=self.seconds)
        return f"STime {at:%Y-%m-%d %H:%M:%S} UTC"


# A container's own name, not that of something declared in it, such as its iterator.
ARGUMENTS = "<((?!>::).)*>$"


def register(objfile):
    from gdb.printing import RegexpCollectionPrettyPrinter, register_pretty_printer

    printers = RegexpCollectionPrettyPrinter("qxcore11e")
    printers.add_printer("SString", "^SString$", StringPrinter)
    printers.add_printer("SStringBuffer", "^SStringBuffer$", StringBufferPrinter)
    printers.add_printer("STable", "^STable" + ARGUMENTS, TablePrinter)
    printers.add_printer("STableDumb", "^STableDumb" + ARGUMENTS, SharedTablePrinter)
    printers.add_printer("STableMem", "^STableMem" + ARGUMENTS, TableMemPrinter)
    printers.add_printer("SList", "^SList" + ARGUMENTS, ListPrinter)
    printers.add_printer("SMap", "^(SMap|SUnsortedMap)" + ARGUMENTS + "|^SString(Unsorted)?Map(NoCase)?$", MapPrinter)
    printers.add_printer("SStringTable", "^SStringTable$", StringTablePrinter)
    printers.add_printer("STime", "^STime$", TimePrinter)
    register_pretty_printer(objfile, printers, replace=True)


register(gdb.current_objfile())
