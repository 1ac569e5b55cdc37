"""A linked program for a Cortex-M0 or Cortex-M0+, as its ELF file has it."""
from pathlib import Path

from elftools.common.exceptions import ELFError
from elftools.elf.elffile import ELFFile

import api

SOURCE = Path(__file__).resolve().parent.parent
ARMV6M = 11, 12  # Tag_CPU_arch of ARMv6-M and ARMv6S-M, in the ABI's Addenda
LARGEST = 1 << 24  # bytes: more is no Cortex-M0's, and a damaged file can claim 4 GiB


class BadImage(Exception):
    """Why a file cannot be used, in a line."""


class Image:
    """`segments`: what lies where while the program runs, pairs of address and bytes.
    `functions`: the library's functions that are in it, by name: pairs of address and size.
    `code`: all functions that are in it, by link symbol: pairs of address and size."""

    def __init__(self, path, needs_library=True):
        try:
            with open(path, "rb") as file:
                self.read(file)
            if needs_library and not self.functions:
                raise BadImage("has no function of the library")
        except OSError as error:
            raise BadImage(f"{path}: {error.strerror}") from None
        except BadImage as error:
            raise BadImage(f"{path}: {error}") from None
        except Exception as error:  # pyelftools raises a dozen kinds of them
            raise BadImage(f"{path}: a damaged ELF file: {error!r}") from None

    def read(self, file):
        try:
            elf = ELFFile(file)
        except ELFError:
            raise BadImage("not an ELF file") from None
        check_target(elf)
        self.segments = segments(elf)
        self.code = code(elf)
        self.functions = {name: self.code[symbol] for name, symbol in api.functions(SOURCE).items()
                          if symbol in self.code}
        for name, (address, size) in self.functions.items():
            if not self.holds(address, size):
                raise BadImage(f"a damaged ELF file: {name} at {address:#x} is not in the program")

    def holds(self, address, size):
        return any(start <= address and address + size <= start + len(data)
                   for start, data in self.segments)


def check_target(elf):
    if elf["e_machine"] != "EM_ARM":
        raise BadImage("not for Arm")
    if elf["e_type"] != "ET_EXEC":
        raise BadImage("not linked: an object or library has no addresses yet")
    section = elf.get_section_by_name(".ARM.attributes")
    found = section and [one.value for subsection in section.iter_subsections()
                         for part in subsection.iter_subsubsections()
                         for one in part.iter_attributes("TAG_CPU_ARCH")]
    if not found:
        raise BadImage("does not say which core it is for: .ARM.attributes has no architecture")
    if found[0] not in ARMV6M:
        raise BadImage("for another core: only the Cortex-M0 and Cortex-M0+ can be simulated")


def segments(elf):
    """Those that are loaded, where they are when the program runs. What the file lacks is 0."""
    found = []
    for segment in elf.iter_segments():
        size = segment["p_memsz"]
        if segment["p_type"] == "PT_LOAD" and size > 0:
            if size > LARGEST or segment["p_vaddr"] + size > 1 << 32:
                raise BadImage(f"a segment of {size} bytes is more than a Cortex-M0 has")
            data = segment.data()
            if len(data) != segment["p_filesz"] or len(data) > size:
                raise BadImage("a damaged ELF file: it ends within a segment")
            found.append((segment["p_vaddr"], data.ljust(size, b"\0")))
    if not found:
        raise BadImage("has nothing to load")
    return found


def code(elf):
    table = elf.get_section_by_name(".symtab")
    if not table:
        raise BadImage("has no symbol table: it was stripped")
    return {symbol.name: (symbol["st_value"] & ~1, symbol["st_size"])
            for symbol in table.iter_symbols()
            if symbol["st_info"]["type"] == "STT_FUNC" and symbol["st_shndx"] != "SHN_UNDEF"}
