"""A Cortex-M0+ that counts cycles: Unicorn executes, this adds up the costs of the Technical Reference
Manual's timing table, with zero wait states and the multiplier of one cycle. What a block of
instructions costs is worked out once."""
from bisect import bisect

import unicorn
from elftools.elf.elffile import ELFFile
from unicorn import arm_const as arm

RAM, RAM_SIZE = 0x20000000, 0x40000
STACK_TOP = RAM + RAM_SIZE
DATA, DATA_SIZE = RAM + 0x4000, 0x30000  # the callers' buffers are here
RETURN = 0x000F0000  # flash that no image uses


def cost(op, size):
    """The cycles of an instruction; of a conditional branch, those of one that is not taken."""
    listed = (op & 0xFF).bit_count()
    if size == 4:  # BL, MRS, MSR, barriers
        return 3
    if op & 0xFF00 == 0xBD00:  # POP with PC
        return 3 + listed + 1
    if op & 0xF600 == 0xB400:  # PUSH, POP
        return 1 + (op & 0x1FF).bit_count()
    if op & 0xF000 == 0xC000:  # LDM, STM
        return 1 + listed
    if op & 0xF800 == 0x4800 or 0x5000 <= op < 0xA000:  # loads and stores
        return 2
    if op & 0xF800 == 0xE000 or op & 0xFF00 == 0x4700 or op & 0xFD87 == 0x4487:  # B, BX, to PC
        return 2
    return 1


def pushed(op):
    """By how many bytes an instruction lowers the stack pointer."""
    if op & 0xF600 == 0xB400:  # PUSH, POP
        return (op & 0x1FF).bit_count() * (-4 if op & 0x800 else 4)
    if op & 0xFF00 == 0xB000:  # SUB, ADD
        return (op & 0x7F) * (4 if op & 0x80 else -4)
    return float("inf") if op & 0xFF87 in (0x4485, 0x4685) else 0  # ADD, MOV to SP: not to be told


def is_conditional(op):
    return op & 0xF000 == 0xD000 and op & 0x0E00 != 0x0E00


class Core:
    """A linked image. After call(): `cycles`, `result` and `stack` in bytes; `reads_past`, whether a call
    since forget_given() read what the caller did not give, if that is watched; and `directions`, which
    ways the conditional branches went in all calls: pairs of the address behind one, and whether it was
    taken."""

    def __init__(self, image, watches_reads=False):
        self.uc = unicorn.Uc(unicorn.UC_ARCH_ARM, unicorn.UC_MODE_THUMB | unicorn.UC_MODE_MCLASS)
        self.uc.ctl_set_cpu_model(arm.UC_CPU_ARM_CORTEX_M0)
        self.uc.mem_map(0, 0x100000)
        self.uc.mem_map(RAM, RAM_SIZE)
        self.functions, self.sizes, self.blocks = {}, [], {}
        self.directions = set()
        with open(image, "rb") as file:
            elf = ELFFile(file)
            for segment in elf.iter_segments("PT_LOAD"):
                self.uc.mem_write(segment["p_paddr"], segment.data())
            symbols = list(elf.get_section_by_name(".symtab").iter_symbols())
        for symbol in symbols:
            if symbol["st_info"]["type"] == "STT_FUNC" and symbol["st_shndx"] != "SHN_UNDEF":
                self.functions[symbol.name] = symbol["st_value"] | 1
                self.sizes.append((symbol["st_value"] & ~1, symbol["st_size"]))
        self.sizes.sort()
        # "$t" is where code begins, "$d" where data does.
        self.marks = sorted({(symbol["st_value"], symbol.name[:2]) for symbol in symbols
                             if symbol.name[:2] in ("$t", "$d")})
        self.forget_given()
        self.uc.hook_add(unicorn.UC_HOOK_BLOCK, self.on_block)
        if watches_reads:
            self.uc.hook_add(unicorn.UC_HOOK_MEM_READ, self.on_read, None, DATA, DATA + DATA_SIZE - 1)
            self.uc.hook_add(unicorn.UC_HOOK_MEM_WRITE, self.on_write, None, DATA, DATA + DATA_SIZE - 1)

    def instructions(self, address, size):
        """Address, operation and width of each instruction of a piece of code."""
        code = bytes(self.uc.mem_read(address, size))
        at = 0
        while at < size:
            op = int.from_bytes(code[at:at + 2], "little")
            width = 4 if op >= 0xE800 else 2
            yield address + at, op, width
            at += width

    def branches(self, name):
        """The addresses behind the conditional branches of a function, in their order."""
        start = self.functions[name] & ~1
        end = start + dict(self.sizes)[start]
        found = []
        for (begin, kind), (after, _) in zip(self.marks, [*self.marks[1:], (1 << 32, "")]):
            begin, after = max(begin, start), min(after, end)
            if kind == "$t" and begin < after:
                found += [address + 2 for address, op, _ in self.instructions(begin, after - begin)
                          if is_conditional(op)]
        return found

    def analyse(self, address, size):
        """Cycles, pushed bytes and the most of these of a block, and the address behind it if it ends in a
        conditional branch."""
        cycles = depth = deepest = op = width = 0
        for _, op, width in self.instructions(address, size):
            cycles += cost(op, width)
            depth += pushed(op)
            deepest = max(deepest, depth)
        return cycles, depth, deepest, address + size if width == 2 and is_conditional(op) else 0

    def on_block(self, _uc, address, size, _):
        block = self.blocks.get((address, size))
        if block is None:
            block = self.blocks[address, size] = self.analyse(address, size)
        cycles, depth, deepest, after = block
        self.cycles += cycles
        if self.after:
            taken = self.after != address
            self.cycles += taken  # a cycle more
            self.directions.add((self.after, taken))
        self.after = after
        if deepest:
            self.stack = max(self.stack, self.depth + deepest)
        self.depth += depth

    def parts(self):
        """The functions that ran since the blocks were cleared, as pairs of address and size."""
        return {self.sizes[bisect(self.sizes, (address, 0xFFFF)) - 1] for address, _ in self.blocks}

    def on_read(self, _uc, _access, address, size, _value, _):
        if 0 in self.given[address - DATA:address - DATA + size]:
            self.reads_past = True

    def on_write(self, _uc, _access, address, size, _value, _):
        self.given[address - DATA:address - DATA + size] = bytes([1]) * size

    def give(self, address, data):
        self.uc.mem_write(address, data)
        self.given[address - DATA:address - DATA + len(data)] = bytes([1]) * len(data)

    def forget_given(self):
        self.given, self.reads_past = bytearray(DATA_SIZE), False

    def call(self, name, arguments):
        self.cycles = self.after = self.depth = self.stack = 0
        for number, value in enumerate(arguments):
            self.uc.reg_write(arm.UC_ARM_REG_R0 + number, value & 0xFFFFFFFF)
        self.uc.reg_write(arm.UC_ARM_REG_SP, STACK_TOP)
        self.uc.reg_write(arm.UC_ARM_REG_LR, RETURN | 1)
        try:
            self.uc.emu_start(self.functions[name], RETURN, count=0)
        except unicorn.UcError as error:
            raise RuntimeError(f"{name}({arguments}): {error}") from error
        if self.uc.reg_read(arm.UC_ARM_REG_PC) != RETURN:
            raise RuntimeError(f"{name}({arguments}): does not return")
        self.result = self.uc.reg_read(arm.UC_ARM_REG_R0)
