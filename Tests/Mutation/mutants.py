# SPDX-License-Identifier: MIT
"""What is changed in the rows of the decoders' tables, type by type: one change is one mutant."""

import dataclasses

# The types whose constants are tables, or rows that stand alone.
TABLES = frozenset({
    "Place", "Condition", "Field", "NamedValue", "ListedValue", "RecordTable", "ListReading",
    "PacketKind", "PacketReading", "Requirement", "Section", "EcnoRow", "SentCounter",
    "ThroughputLayout",
})

# Requirements that differ in whether more than what is required may be there.
STRICTER_OR_LAXER = {"MinimumLength": "ExactLength", "ExactLength": "MinimumLength",
                     "HoldsRecords": "EndsWithRecords", "EndsWithRecords": "HoldsRecords"}


@dataclasses.dataclass(frozen=True)
class Mutant:
    row: str  # the constant, its element and the member
    kind: str
    source: str  # the file that declares the constant
    patches: tuple  # (offset in the file, bytes)

    @property
    def name(self):
        return f"{self.source} {self.row}: {self.kind}"


class Mutants:
    """The mutants of one constant, whose source is shown as `source`."""

    def __init__(self, constant, source):
        self._constant = constant
        self._source = source
        self.found = []

    def collect(self):
        view = self._constant.view
        if view.type.kind == "array":
            for index in range(len(view)):
                self._row(view[index], f"{self._constant.name}[{index}]")
        else:
            self._row(view, self._constant.name)
        return self.found

    def _row(self, view, path):
        _KINDS[view.type.name](self, view, path)

    # --- One change ------------------------------------------------------------------------------

    def change(self, path, kind, *members):
        """Adds the mutant that gives each member its new number."""
        image = self._constant.view.image
        patches = tuple((image.offset(view.address), view.pack(new)) for view, new in members)
        self.found.append(Mutant(path, kind, str(self._source), patches))

    def step(self, view, name, path, *steps):
        """Adds a mutant for each step by which the member is made larger or smaller."""
        member = view[name]
        for by in steps:
            if member.value + by >= 0 or member.type.signed or member.type.kind == "float":
                self.change(path, f"{name}{by:+}", (member, member.value + by))

    def flip(self, view, name, path):
        self.change(path, f"not {name}", (view[name], 1 - view[name].value))

    # --- The types -------------------------------------------------------------------------------

    def place(self, view, path, signs=True, wider=True):
        """`signs`: whether anybody asks for the sign; `wider`: whether more bits could matter."""
        self.step(view, "offset", path, +1, -1)
        self._width(view, path, wider)
        if signs:
            self.flip(view, "isSigned", path)
        if view["width"].value > 1:
            self.flip(view, "isBigEndian", path)
        if view["origin"].value != "Here":
            self.change(path, "origin", (view["origin"], 0))

    def _width(self, view, path, wider):
        width, bits, first = view["width"], view["bitCount"], view["firstBit"]
        if bits.value == 8 * width.value:
            for by, kind in ((+1, "wider"), (-1, "narrower")):
                if 1 <= width.value + by <= 4 and (wider or by < 0):
                    self.change(path, kind, (width, width.value + by), (bits, bits.value + 8 * by))
            return
        if first.value + bits.value < 32:
            if wider:
                self.change(path, "wider", (bits, bits.value + 1))
            self.change(path, "higher", (first, first.value + 1))
        if bits.value > 1:
            self.change(path, "narrower", (bits, bits.value - 1))
        if first.value > 0:
            self.change(path, "lower", (first, first.value - 1))

    def condition(self, view, path):
        lowest, highest = view["lowest"].value, view["highest"].value
        if lowest > highest:
            return  # always
        place = view["place"]
        bits = place["bitCount"].value
        assert not place["isSigned"].value
        # A sign, and bounds past all numbers that the place can hold, decide nothing.
        self.place(place, f"{path}.place", signs=highest >= 1 << (bits - 1))
        self.step(view, "lowest", path, +1, *([-1] if lowest > 0 else []))
        self.step(view, "highest", path, -1, *([+1] if highest < (1 << bits) - 1 else []))

    def rule(self, view, path):
        kind = view["kind"].value
        if kind == "Integer":
            self.step(view, "multiplier", path, +1)
            self.step(view, "addend", path, +1)
        if kind == "Scaled":
            self.change(path, "scale*2", (view["scale"], 2 * view["scale"].value))
            self.step(view, "offset", path, +1)
            self.step(view["format"], "precision", path, +1)
        if view["hasAbsentValue"].value:
            self.step(view, "absentValue", path, +1, -1)
            self.flip(view, "hasAbsentValue", path)

    def field(self, view, path):
        path = f"{path} \"{view['key'].text}\""
        places = view["places"]["_M_elems"]
        count = view["placeCount"].value
        for index in range(count):
            self.place(places[index], path if count == 1 else f"{path} place {index}")
        self.rule(view["text"], path)
        self.condition(view["condition"], f"{path} when")

    def named_value(self, view, path):
        self.step(view, "value", f"{path} \"{view['text'].text}\"", +1)

    def listed_value(self, view, path):
        self.rule(view["text"], f"{path} \"{view['key'].text}\"")

    def record_table(self, view, path):
        """Counts are read without regard to a sign, save where they are explained."""
        path = f"{path} \"{view['name'].text}\""
        self.place(view["count"], f"{path} count")
        self.step(view, "countAddend", path, +1)
        self._bounds(view, path)
        self.flip(view, "keepsNone", path)
        if view["keepsNone"].value:
            return  # the records are counted only
        for name in ("base", "stride"):
            self.step(view, name, path, +1, -1)
        if view["perCount"].value or view["twinPerCount"].value:
            self.place(view["counted"], f"{path} counted", signs=False)
            self.step(view, "perCount", path, +1, -1)
        if view["twinBase"].value or view["twinStride"].value:
            for name in ("twinBase", "twinStride", "twinPerCount"):
                self.step(view, name, path, +1, -1)
        self.condition(view["keep"], f"{path} keep")

    def _bounds(self, view, path):
        """A bound that is the count itself is never exceeded, nor is one of more of its bits."""
        isCount = view["boundsCount"].bytes == view["count"].bytes
        if view["isBounded"].value:
            self.place(view["boundsCount"], f"{path} boundsCount", signs=False, wider=not isCount)
        if not isCount:
            self.flip(view, "isBounded", path)

    def list_reading(self, view, path):
        self.record_table(view["table"], path)
        if view["key"]["_M_len"].value:
            self.flip(view, "keepsOldWhenEmpty", path)
        if not view["table"]["keepsNone"].value:
            self.flip(view, "isPlain", path)

    def packet_kind(self, view, path):
        self.step(view, "code", path, +1)
        self.step(view, "minimumLength", path, +1, -1)

    def packet_reading(self, view, path):
        pass  # a packet, and tables of their own

    def requirement(self, view, path):
        """The sub-packets that one asks for are constants of their own."""
        kind = view["kind"]
        if kind.value in STRICTER_OR_LAXER:
            numbers = dict(kind.type.enumerators)
            other = STRICTER_OR_LAXER[kind.value]
            self.change(path, other, (kind, numbers[other]))
        priority = view["priority"]
        self.change(path, "priority+1", (priority, priority.unpack(priority.bytes) + 1))
        self.condition(view["condition"], path)

    def section(self, view, path):
        pass  # texts, and tables of their own

    def ecno_row(self, view, path):
        self.step(view, "above", path, +1, -1)
        self.step(view, "decibels", path, +1)

    def sent_counter(self, view, path):
        self.step(view, "offset", path, +1, -1)
        self.step(view, "bits", path, +1)

    def throughput_layout(self, view, path):
        self.place(view["sequenceNumber"], f"{path} sequenceNumber")


_KINDS = {
    "Place": Mutants.place,
    "Condition": Mutants.condition,
    "Field": Mutants.field,
    "NamedValue": Mutants.named_value,
    "ListedValue": Mutants.listed_value,
    "RecordTable": Mutants.record_table,
    "ListReading": Mutants.list_reading,
    "PacketKind": Mutants.packet_kind,
    "PacketReading": Mutants.packet_reading,
    "Requirement": Mutants.requirement,
    "Section": Mutants.section,
    "EcnoRow": Mutants.ecno_row,
    "SentCounter": Mutants.sent_counter,
    "ThroughputLayout": Mutants.throughput_layout,
}
