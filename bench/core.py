"""A simulated Cortex-M0+ that counts cycles. Unicorn runs the instructions; this adds up what each
takes by the timing table of the core's Technical Reference Manual, with zero wait states and the
multiplier of one cycle. The cycles of a block of instructions are worked out once."""
from bisect import bisect
from typing import NamedTuple

import unicorn
from unicorn import arm_const as arm

from image import BadImage

# Where the caller's memory is: at the end of the core's SRAM region, where no device has any.
RAM, RAM_SIZE = 0x3FFC0000, 0x20000
RETURN = RAM
DATA, DATA_SIZE = RAM + 0x4000, 0x14000
STRIDE = 0x4000  # between two arguments
STACK_TOP = RAM + RAM_SIZE
ENDLESS = 5_000_000  # cycles: no call of the search takes a tenth of that
PAGE = 0x1000
FILL = 0xA5  # what a watched buffer has in it before a call
SAME = object()  # an argument that is the same pointer as the first
CODECS = {1: "latin-1", 2: "utf-16-le"}  # by the bytes of a unit


class Buffer(NamedTuple):
    """An argument that has room for so many units, or for as many as need be, and may hold
    a string."""
    units: int | None
    held: str | bytes = b""


class Stopped(Exception):
    """Why a call did not return."""


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
    return float("inf") if op & 0xFF87 in (0x4485, 0x4685) else 0  # ADD, MOV to SP: cannot be told


def is_conditional(op):
    return op & 0xF000 == 0xD000 and op & 0x0E00 != 0x0E00


class Core:
    """A core with an image in its memory. After run(): `cycles`; `stack`, the most bytes below the
    caller's stack pointer; `result`, the register R0; `registers`, the arguments as numbers; and,
    if memory is watched, `outside`, the first access outside the arguments, or None."""

    def __init__(self, image, watches=False):
        self.uc = unicorn.Uc(unicorn.UC_ARCH_ARM, unicorn.UC_MODE_THUMB | unicorn.UC_MODE_MCLASS)
        self.uc.ctl_set_cpu_model(arm.UC_CPU_ARM_CORTEX_M0)
        self.uc.mem_map(RAM, RAM_SIZE)
        self.load(image.segments)
        self.code = image.code
        self.sizes = {address: max(size for start, size in self.code.values() if start == address)
                      for address, _ in self.code.values()}
        self.starts = sorted(self.sizes)
        self.division = {address for symbol, (address, _) in self.code.items()
                         if symbol.startswith("__aeabi_")}
        self.blocks = {}
        self.watches = watches
        self.uc.hook_add(unicorn.UC_HOOK_BLOCK, self.on_block)
        self.uc.hook_add(unicorn.UC_HOOK_MEM_UNMAPPED, self.on_unmapped)
        if watches:
            data = DATA, DATA + DATA_SIZE - 1
            self.uc.hook_add(unicorn.UC_HOOK_MEM_READ, self.on_read, None, *data)
            self.uc.hook_add(unicorn.UC_HOOK_MEM_WRITE, self.on_write, None, *data)

    def load(self, segments):
        pages = {page for address, data in segments
                 for page in range(address // PAGE, (address + len(data) - 1) // PAGE + 1)}
        if not pages.isdisjoint(range(RAM // PAGE, STACK_TOP // PAGE)):
            raise BadImage(f"has something at {RAM:#x}, where the simulated caller is")
        for page in pages:
            self.uc.mem_map(page * PAGE, PAGE)
        for address, data in segments:
            self.uc.mem_write(address, data)

    def analyse(self, address, size):
        """Of a block: its cycles, the bytes that it pushes in all and at most, and the address
        behind it if it ends in a conditional branch."""
        code = bytes(self.uc.mem_read(address, size))
        cycles = depth = deepest = at = op = width = 0
        while at < size:
            op = int.from_bytes(code[at:at + 2], "little")
            width = 4 if op >= 0xE800 else 2
            at += width
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
        if self.after and self.after != address:
            self.cycles += 1  # a branch that is taken
        self.after = after
        if deepest:
            self.stack = max(self.stack, self.depth + deepest)
        self.depth += depth
        if self.cycles > ENDLESS:
            self.uc.emu_stop()

    def parts(self):
        """The sizes, by address, of the functions that ran since the blocks were cleared, but for
        the compiler's division, which most firmware has anyway."""
        found = {self.starts[bisect(self.starts, address) - 1] for address, _ in self.blocks}
        return {start: self.sizes[start] for start in found - self.division}

    def on_unmapped(self, _uc, access, address, _size, _value, _):
        what = {unicorn.UC_MEM_READ_UNMAPPED: "reads", unicorn.UC_MEM_WRITE_UNMAPPED: "writes"}
        self.why = f"{what.get(access, 'runs')} {address:#x}, where the image has nothing"
        return False

    def on_read(self, _uc, _access, address, size, _value, _):
        if 0 in self.readable[address - DATA:address - DATA + size] and not self.outside:
            self.outside = f"reads {size} bytes at {address:#x}, outside the arguments"

    def on_write(self, _uc, _access, address, size, _value, _):
        start = address - DATA
        if 0 in self.writable[start:start + size] and not self.outside:
            self.outside = f"writes {size} bytes at {address:#x}, outside the arguments"
        self.readable[start:start + size] = b"\1" * size

    def put(self, place, argument, width):
        """Writes what a pointer's argument holds to its place."""
        held = argument.held if isinstance(argument, Buffer) else argument
        if isinstance(held, str):
            held = (held + "\0").encode(CODECS[width])
        self.uc.mem_write(place, held)
        if self.watches:
            size = len(held)
            if isinstance(argument, Buffer):
                size = STRIDE if argument.units is None else argument.units * width
                self.uc.mem_write(place + len(held), bytes([FILL]) * (size - len(held)))
            if not isinstance(argument, bytes):
                self.buffers.append((place, size))
            start = place - DATA
            self.readable[start:start + len(held)] = b"\1" * len(held)
            self.writable[start:start + size] = b"\1" * size

    def run(self, symbol, arguments, widths, misaligned=False, order=()):
        """Puts the arguments into memory and makes a call with all of them, or in an order of its
        own. An argument is a number, a string, a buffer, or the bytes of integers or pointers.
        `widths` are the bytes of a unit of the first argument and of the others; misaligned strings
        are not word-aligned."""
        self.outside = None
        if self.watches:
            self.readable, self.writable = bytearray(DATA_SIZE), bytearray(DATA_SIZE)
        self.places, self.buffers = [], []
        for index, argument in enumerate(arguments):
            place = DATA + index * STRIDE
            width = widths[index > 0]
            if isinstance(argument, int):
                place = argument
            elif argument is SAME:
                place = self.places[0]
            else:
                if misaligned and not isinstance(argument, bytes):
                    place += width * (3 if index else 1)
                self.put(place, argument, width)
            self.places.append(place)
        self.registers = [self.places[index] for index in order] or self.places
        self.call(symbol, self.registers)

    def call(self, symbol, registers):
        if symbol not in self.code:
            raise Stopped(f"the image has no {symbol}")
        self.cycles = self.after = self.depth = self.stack = 0
        self.why = None
        for number, value in enumerate(registers):
            self.uc.reg_write(arm.UC_ARM_REG_R0 + number, value & 0xFFFFFFFF)
        self.uc.reg_write(arm.UC_ARM_REG_SP, STACK_TOP)
        self.uc.reg_write(arm.UC_ARM_REG_LR, RETURN | 1)
        try:
            self.uc.emu_start(self.code[symbol][0] | 1, RETURN)
        except unicorn.UcError as error:
            raise Stopped(self.why or str(error)) from None
        if self.uc.reg_read(arm.UC_ARM_REG_PC) != RETURN:
            raise Stopped(f"does not return within {ENDLESS} cycles")
        self.result = self.uc.reg_read(arm.UC_ARM_REG_R0)

    def contents(self):
        """What the strings and buffers that were given hold now."""
        return [bytes(self.uc.mem_read(place, size)) for place, size in self.buffers]
