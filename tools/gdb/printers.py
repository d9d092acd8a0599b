"""Printers for gdb: what a Value, a Dictionary and a Packet hold, in place of their members.

    (gdb) source tools/gdb/printers.py

They read the members as they stand in memory and call no function of the program, so they work on a core file too.
Dots stand for the elements that gdb's "print elements" limit leaves out. The limit matters: a variable that has no
value yet can seem to be huge.
"""

import datetime
import struct

import gdb
import gdb.printing

# Characters that a literal writes as escapes.
ESCAPES = {code: "\\x%02x" % code for code in (*range(0x20), 0x7F)}
ESCAPES.update({ord('"'): '\\"', ord("\n"): "\\n", ord("\t"): "\\t"})

# Log type 1, record length 2, log code 2, timestamp 8.
HEADER_SIZE = 13


def shown_count(count):
    """How many of that many elements gdb's limit lets through; no limit is 0 or None."""
    limit = gdb.parameter("print elements") or count
    return min(count, int(limit))


def bytes_at(pointer, count):
    """The bytes in hexadecimal, with dots for those that are left out."""
    shown = shown_count(count)
    if shown == 0:
        return ""
    memory = gdb.selected_inferior().read_memory(int(pointer), shown).tobytes()
    return memory.hex(" ") + (" ..." if shown < count else "")


def quoted(text):
    """A std::string as a literal in quotes."""
    count = int(text["_M_string_length"])
    shown = shown_count(count)
    pointer = text["_M_dataplus"]["_M_p"]
    memory = gdb.selected_inferior().read_memory(int(pointer), shown).tobytes() if shown else b""
    literal = memory.replace(b"\\", b"\\\\").decode("utf-8", "backslashreplace").translate(ESCAPES)
    return '"' + literal + '"' + ("..." if shown < count else "")


def vector_elements(vector):
    """The first element of a std::vector, and how many there are."""
    begin, end = vector["_M_impl"]["_M_start"], vector["_M_impl"]["_M_finish"]
    return begin, int(end - begin)


def counted(count, one, many):
    return "%d %s" % (count, one if count == 1 else many)


def date(seconds, microseconds):
    """Counted from 2001-01-01 00:00:00 UTC."""
    moment = datetime.datetime(2001, 1, 1) + datetime.timedelta(seconds=seconds, microseconds=microseconds)
    return moment.isoformat(" ", "microseconds" if moment.microsecond else "seconds") + " UTC"


class DictionaryPrinter:
    """The entries in their order."""

    def __init__(self, dictionary):
        self._begin, self._count = vector_elements(dictionary["_entries"])

    def to_string(self):
        return "Dictionary of " + counted(self._count, "entry", "entries")

    def children(self):
        for place in range(self._count):
            entry = (self._begin + place).dereference()
            yield "key %d" % place, quoted(entry["key"])
            yield "value %d" % place, entry["value"]

    def display_hint(self):
        return "map"


class ArrayPrinter:
    def __init__(self, array):
        self._begin, self._count = vector_elements(array)

    def to_string(self):
        return "Array of " + counted(self._count, "element", "elements")

    def children(self):
        for place in range(self._count):
            yield "[%d]" % place, (self._begin + place).dereference()

    def display_hint(self):
        return "array"


class PlainPrinter:
    def __init__(self, text):
        self._text = text

    def to_string(self):
        return self._text


def data_text(data):
    begin, count = vector_elements(data)
    return ("Data of %s: %s" % (counted(count, "byte", "bytes"), bytes_at(begin, count))).rstrip(": ")


# For each alternative of Value's variant, in its order, what prints it.
KINDS = (
    lambda content: PlainPrinter("Absent"),
    lambda content: PlainPrinter("String " + quoted(content)),
    lambda content: PlainPrinter("Integer %d" % int(content)),
    lambda content: PlainPrinter("Real %r" % float(content)),
    lambda content: PlainPrinter("Boolean " + ("true" if bool(content) else "false")),
    lambda content: PlainPrinter("Date " + date(int(content["seconds"]), int(content["microseconds"]))),
    lambda content: PlainPrinter(data_text(content["_M_ptr"].dereference())),
    lambda content: ArrayPrinter(content["_M_ptr"].dereference()),
    lambda content: DictionaryPrinter(content["_M_ptr"].dereference()),
)


def value_printer(value):
    """The printer of what the value holds. Every alternative of a variant begins where the variant begins."""
    variant = value["_content"]
    index = int(variant["_M_index"])
    if index >= len(KINDS):
        return PlainPrinter("Value without a content (index %d)" % index)
    kind = variant.type.strip_typedefs().template_argument(index)
    return KINDS[index](variant["_M_u"].address.cast(kind.pointer()).dereference())


def packet_printer(packet):
    """The fields of the header and all bytes. The view of a record within a packet has no header; its bytes tell."""
    view = packet["_bytes"]
    pointer, count = view["_M_ptr"], int(view["_M_extent"]["_M_extent_value"])
    memory = bytes_at(pointer, count)
    if count < HEADER_SIZE:
        text = "Packet of %s, too short for a header: %s" % (counted(count, "byte", "bytes"), memory)
        return PlainPrinter(text.rstrip(": "))
    header = gdb.selected_inferior().read_memory(int(pointer), HEADER_SIZE).tobytes()
    log_type, record_length, log_code = struct.unpack_from("<BHH", header)
    if log_type == 0xFF:  # made by the telephony server
        log_code += 0xFF0000
    return PlainPrinter(
        "Packet of log type %d, log code 0x%04X, record length %d, %d bytes: %s"
        % (log_type, log_code, record_length, count, memory)
    )


PRINTERS = {
    "varnel::Value": value_printer,
    "varnel::Dictionary": DictionaryPrinter,
    "varnel::Packet": packet_printer,
}


class Printers:
    """What gdb lists as "varnel" and asks for each value that it prints."""

    name = "varnel"
    enabled = True
    subprinters = None

    def __call__(self, value):
        printer = PRINTERS.get(value.type.strip_typedefs().unqualified().name)
        return printer(value) if printer else None


gdb.printing.register_pretty_printer(None, Printers(), replace=True)
