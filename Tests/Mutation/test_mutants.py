# SPDX-License-Identifier: MIT
"""The changes that are tried in a place, a condition, a rule and a record table."""

import collections
import unittest

import mutants

Constant = collections.namedtuple("Constant", "name view")
Type = collections.namedtuple("Type", "kind name signed enumerators",
                              defaults=("struct", "", False, ()))


class Image:
    """A file in which every value stands at its address."""

    def offset(self, address):
        return address


class Number:
    """A number of 4 bytes, or an enumerator's name."""

    def __init__(self, address, value, signed=False, enumerators=()):
        self.address = address
        self.value = value
        self.type = Type("integer", "", signed, enumerators)

    @property
    def bytes(self):
        return dict(self.type.enumerators).get(self.value, self.value)

    def unpack(self, data):
        return data

    def pack(self, number):
        return number


class Struct:
    """A value with members, which stand at the addresses from its own on."""

    def __init__(self, name, address, **members):
        self.image = Image()
        self.type = Type("struct", name)
        self._members = {
            key: Number(address + i, value) if isinstance(value, (int, str)) else value
            for i, (key, value) in enumerate(members.items())
        }

    def __getitem__(self, key):
        return self._members[key]

    @property
    def bytes(self):
        return [member.value for member in self._members.values()]


def place(address=0, offset=20, width=2, first=0, bits=16, origin="Here"):
    return Struct("Place", address, offset=offset, width=width, firstBit=first, bitCount=bits,
                  origin=origin, isSigned=0, isBigEndian=0)


def changes(view):
    """The mutants of a constant: what changes by kind, as {address: new value}."""
    found = mutants.Mutants(Constant("kRow", view), "A.cpp").collect()
    return {mutant.kind: dict(mutant.patches) for mutant in found}


class Places(unittest.TestCase):
    OFFSET, WIDTH, FIRST, BITS, ORIGIN, SIGNED, BIG_ENDIAN = range(7)

    def test_a_whole_integer_changes_in_offset_width_sign_and_order(self):
        self.assertEqual(changes(place()), {
            "offset+1": {self.OFFSET: 21},
            "offset-1": {self.OFFSET: 19},
            "wider": {self.WIDTH: 3, self.BITS: 24},
            "narrower": {self.WIDTH: 1, self.BITS: 8},
            "not isSigned": {self.SIGNED: 1},
            "not isBigEndian": {self.BIG_ENDIAN: 1},
        })

    def test_one_byte_has_no_order_and_is_not_narrower(self):
        self.assertEqual(
            set(changes(place(width=1, bits=8))), {"offset+1", "offset-1", "wider", "not isSigned"}
        )

    def test_four_bytes_are_not_wider(self):
        self.assertNotIn("wider", changes(place(width=4, bits=32)))

    def test_bits_move_and_change_in_number(self):
        found = changes(place(first=3, bits=5))
        self.assertEqual(found["wider"], {self.BITS: 6})
        self.assertEqual(found["narrower"], {self.BITS: 4})
        self.assertEqual(found["higher"], {self.FIRST: 4})
        self.assertEqual(found["lower"], {self.FIRST: 2})

    def test_an_offset_of_0_is_not_lowered(self):
        self.assertNotIn("offset-1", changes(place(offset=0)))

    def test_a_twins_place_becomes_the_records_own(self):
        self.assertEqual(changes(place(origin="Twin"))["origin"], {self.ORIGIN: 0})


class Conditions(unittest.TestCase):
    def changes(self, lowest, highest, **where):
        bounds = {"lowest": Number(50, lowest, True), "highest": Number(51, highest, True)}
        return changes(Struct("Condition", 40, place=place(**where), **bounds))

    def test_what_always_holds_is_not_changed(self):
        self.assertEqual(self.changes(0, -1), {})

    def test_both_bounds_move_both_ways(self):
        found = self.changes(2, 5)
        self.assertEqual([found["lowest+1"], found["lowest-1"]], [{50: 3}, {50: 1}])
        self.assertEqual([found["highest+1"], found["highest-1"]], [{51: 6}, {51: 4}])

    def test_bounds_do_not_leave_what_the_place_can_hold(self):
        found = self.changes(0, 255, width=1, bits=8)
        self.assertNotIn("lowest-1", found)
        self.assertNotIn("highest+1", found)

    def test_a_sign_is_tried_where_it_decides(self):
        self.assertNotIn("not isSigned", self.changes(0, 127, width=1, bits=8))
        self.assertIn("not isSigned", self.changes(0, 128, width=1, bits=8))


class Packets(unittest.TestCase):
    def test_the_code_and_the_least_length_change(self):
        self.assertEqual(changes(Struct("PacketKind", 8, code=0xB17F, minimumLength=33)), {
            "code+1": {8: 0xB180}, "minimumLength+1": {9: 34}, "minimumLength-1": {9: 32},
        })


class Requirements(unittest.TestCase):
    KINDS = (("MinimumLength", 0), ("ExactLength", 1), ("HoldsRecords", 2), ("EndsWithRecords", 3),
             ("Number", 4))

    def changes(self, kind, lowest=0, highest=-1):
        bounds = {"lowest": Number(50, lowest, True), "highest": Number(51, highest, True)}
        return changes(Struct("Requirement", 8, kind=Number(8, kind, enumerators=self.KINDS),
                              priority=Number(9, "Warning", enumerators=(("Warning", 4),)),
                              condition=Struct("Condition", 40, place=place(), **bounds)))

    def test_what_is_required_becomes_stricter_or_laxer(self):
        for kind, other in (("MinimumLength", 1), ("ExactLength", 0), ("HoldsRecords", 3),
                            ("EndsWithRecords", 2)):
            self.assertIn({8: other}, self.changes(kind).values())

    def test_the_lines_priority_changes(self):
        self.assertEqual(self.changes("Number"), {"priority+1": {9: 5}})

    def test_a_condition_changes(self):
        self.assertEqual(self.changes("Number", 2, 255)["lowest+1"], {50: 3})


class Counters(unittest.TestCase):
    def test_both_members_change(self):
        self.assertEqual(changes(Struct("SentCounter", 8, offset=17, bits=128)), {
            "offset+1": {8: 18}, "offset-1": {8: 16}, "bits+1": {9: 129},
        })


if __name__ == "__main__":
    unittest.main()
