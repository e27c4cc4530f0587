# SPDX-License-Identifier: MIT
"""The constants of a program, read through its debugging information: where each value lies in the
file, of which type it is, and which constants there are."""

import collections
import dataclasses
import pathlib
import re
import struct

from elftools.elf.elffile import ELFFile

_RELATIVE = 8  # R_X86_64_RELATIVE: a pointer into the program itself
_ADDRESS = 3  # DW_OP_addr
_FLOAT = 4  # DW_ATE_float
_SIGNED = (5, 6, 13)  # DW_ATE_signed, DW_ATE_signed_char


@dataclasses.dataclass(frozen=True)
class Type:
    """A C++ type as far as its values can be read. `kind` is one of "integer", "float", "struct",
    "array" and "other"."""

    kind: str
    name: str = ""
    size: int = 0
    signed: bool = False
    members: tuple = ()  # of a struct: (name, offset, type)
    element: object = None  # of an array
    count: int = 0
    enumerators: tuple = ()  # of an enumeration: (name, value)


@dataclasses.dataclass(frozen=True)
class View:
    """A value in the program's file. Members are reached by name, elements by number."""

    image: object
    type: Type
    address: int

    def __getitem__(self, key):
        if isinstance(key, int):
            return View(self.image, self.type.element, self.address + key * self.type.element.size)
        for name, offset, type_ in self.type.members:
            if name == key:
                return View(self.image, type_, self.address + offset)
        raise KeyError(f"{self.type.name} has no {key}")

    def __len__(self):
        return self.type.count

    @property
    def bytes(self):
        return self.image.read(self.address, self.type.size)

    @property
    def value(self):
        """The number; for an enumeration the enumerator's name."""
        number = self.unpack(self.bytes)
        return dict((v, k) for k, v in self.type.enumerators).get(number, number)

    @property
    def text(self):
        """The text that a string view refers to."""
        length = self["_M_len"].value
        return self.image.pointed(self["_M_str"].address, length).decode("utf-8")

    def pack(self, number):
        """The bytes that would make the value `number`, without what does not fit."""
        if self.type.kind == "float":
            return struct.pack("<d" if self.type.size == 8 else "<f", number)
        return (number & ((1 << (8 * self.type.size)) - 1)).to_bytes(self.type.size, "little")

    def unpack(self, data):
        if self.type.kind == "float":
            return struct.unpack("<d" if self.type.size == 8 else "<f", data)[0]
        return int.from_bytes(data, "little", signed=self.type.signed)


@dataclasses.dataclass(frozen=True)
class Constant:
    source: str  # the file that declares it
    line: int
    name: str
    view: View


class Image:
    """A program's file. Not for writing."""

    def __init__(self, path):
        self._stream = open(path, "rb")
        self._elf = ELFFile(self._stream)
        self._sections = [s for s in self._elf.iter_sections() if s["sh_type"] == "SHT_PROGBITS"]
        relocations = self._elf.get_section_by_name(".rela.dyn").iter_relocations()
        self._pointers = {r["r_offset"]: r for r in relocations}
        self._types = {}

    def offset(self, address):
        """Where in the file an address of the program lies."""
        for section in self._sections:
            inside = address - section["sh_addr"]
            if section["sh_addr"] and 0 <= inside < section["sh_size"]:
                return section["sh_offset"] + inside
        raise ValueError(f"address {address:#x} is not in the file")

    def read(self, address, size):
        self._stream.seek(self.offset(address))
        return self._stream.read(size)

    def pointed(self, address, size):
        """The bytes that the pointer at an address refers to."""
        relocation = self._pointers.get(address)
        if relocation is None or relocation["r_info_type"] != _RELATIVE:
            return b""
        return self.read(relocation["r_addend"], size)

    def constants(self, folder, names):
        """Every constant of one of the named types, or an array of them, that the sources below
        `folder` define; each once, in the order of their addresses."""
        found = {}
        symbols = Symbols(self._elf.get_section_by_name(".symtab"))
        for unit in self._elf.get_dwarf_info().iter_CUs():
            source = pathlib.Path(unit.get_top_DIE().get_full_path())
            local = symbols.next_source(source.name)
            if pathlib.Path(folder) not in source.parents:
                continue
            files = self._files(unit)
            for variable in _variables(unit.get_top_DIE()):
                constant = self._constant(variable, files, local)
                if constant is not None and constant.view.type.name in names:
                    found[constant.view.address] = constant
        return [found[address] for address in sorted(found)]

    def _files(self, unit):
        """The paths by the numbers that declarations refer to; the first has the number 0."""
        program = self._elf.get_dwarf_info().line_program_for_CU(unit)
        folders = [folder.decode() for folder in program["include_directory"]]
        entries = program["file_entry"]
        return [f"{folders[entry.dir_index]}/{entry.name.decode()}" for entry in entries]

    def _constant(self, variable, files, symbols):
        declared = variable
        while "DW_AT_name" not in declared.attributes:
            if "DW_AT_specification" not in declared.attributes:
                return None
            declared = declared.get_DIE_from_attribute("DW_AT_specification")
        name = declared.attributes["DW_AT_name"].value.decode()
        address = _address(variable)
        if address is None and "DW_AT_const_value" in variable.attributes:
            address = symbols.get(name)  # the value stands where the address would
        if not address:
            return None  # not in the program: what only other constants were made from
        # The declaration may leave out what the definition has: an array's bound.
        typed = variable if "DW_AT_type" in variable.attributes else declared
        view = View(self, self._type(typed, "DW_AT_type"), address)
        if view.type.name.startswith("array<"):
            view = view["_M_elems"]
        return Constant(files[declared.attributes["DW_AT_decl_file"].value],
                        declared.attributes["DW_AT_decl_line"].value, name, view)

    def _type(self, die, attribute):
        if attribute not in die.attributes:
            return Type("other")
        target = die.get_DIE_from_attribute(attribute)
        if target.offset not in self._types:
            self._types[target.offset] = Type("other")  # for what refers to itself
            self._types[target.offset] = self._make_type(target)
        return self._types[target.offset]

    def _make_type(self, die):
        name = die.attributes["DW_AT_name"].value.decode() if "DW_AT_name" in die.attributes else ""
        size = die.attributes["DW_AT_byte_size"].value if "DW_AT_byte_size" in die.attributes else 0
        if die.tag in ("DW_TAG_const_type", "DW_TAG_typedef", "DW_TAG_volatile_type"):
            return self._type(die, "DW_AT_type")
        if die.tag == "DW_TAG_base_type":
            encoding = die.attributes["DW_AT_encoding"].value
            return Type(
                "float" if encoding == _FLOAT else "integer", name, size, encoding in _SIGNED
            )
        if die.tag == "DW_TAG_enumeration_type":
            enumerators = tuple(
                (child.attributes["DW_AT_name"].value.decode(),
                 child.attributes["DW_AT_const_value"].value)
                for child in die.iter_children()
            )
            return Type("integer", name, size, enumerators=enumerators)
        if die.tag in ("DW_TAG_structure_type", "DW_TAG_class_type"):
            return Type("struct", name, size, members=tuple(self._members(die)))
        if die.tag == "DW_TAG_array_type":
            return self._make_array(die)
        return Type("other", name, size or 8)

    def _members(self, die):
        for child in die.iter_children():
            if child.tag == "DW_TAG_inheritance":
                base = child.attributes["DW_AT_data_member_location"].value
                for name, offset, type_ in self._type(child, "DW_AT_type").members:
                    yield name, base + offset, type_
            if child.tag == "DW_TAG_member" and "DW_AT_data_member_location" in child.attributes:
                offset = child.attributes["DW_AT_data_member_location"].value
                name = child.attributes["DW_AT_name"].value.decode()
                yield name, offset, self._type(child, "DW_AT_type")

    def _make_array(self, die):
        element = self._type(die, "DW_AT_type")
        count = 1
        for child in die.iter_children():
            if child.tag == "DW_TAG_subrange_type" and "DW_AT_upper_bound" in child.attributes:
                count *= child.attributes["DW_AT_upper_bound"].value + 1
        return Type("array", element.name, element.size * count, element=element, count=count)


def _variables(die):
    """The variables of namespaces and classes, whatever they are nested in."""
    for child in die.iter_children():
        if child.tag == "DW_TAG_variable":
            yield child
        elif child.tag == "DW_TAG_namespace":
            yield from _variables(child)


def _address(variable):
    location = variable.attributes.get("DW_AT_location")
    if location is None or not location.value or location.value[0] != _ADDRESS:
        return None
    return int.from_bytes(bytes(location.value[1:9]), "little")


class Symbols:
    """Addresses by names as they stand in the sources. Those of one source follow each other in the
    table, the sources in the order of the debugging information."""

    _CONSTANT = re.compile(r"_ZN.*?L?(\d+)(k[A-Z]\w*)E$")

    def __init__(self, table):
        self._shared = {}
        self._sources = collections.defaultdict(collections.deque)
        names = self._shared
        for symbol in table.iter_symbols():
            if symbol["st_info"]["type"] == "STT_FILE":
                names = {}
                self._sources[symbol.name].append(names)
                continue
            name = self._name(symbol.name)
            isLocal = symbol["st_info"]["bind"] == "STB_LOCAL"
            if name:
                (names if isLocal else self._shared)[name] = symbol["st_value"]

    def next_source(self, name):
        """The names that the next source of that name sees."""
        return collections.ChainMap(self._sources[name].popleft() if self._sources[name] else {},
                                    self._shared)

    @classmethod
    def _name(cls, mangled):
        match = cls._CONSTANT.match(mangled)
        if not match:
            return None
        name = match[2]
        return name if match[1].endswith(str(len(name))) else None
