"""A Cortex-M0+ that computes with unknown values. A register or a unit of memory holds a number
or, where the contents can be any, a term of the solver Z3. A conditional branch that can go both
ways makes two states of one. States that meet at the same place become one again, whose memory
says which content came from where. What the machine does not know ends in an error."""
import heapq
import operator
from itertools import count

import z3

from contracts import Not, Or

MASK = 0xFFFFFFFF
SP, LR, PC, FLAGS = 13, 14, 15, 16  # numbers of registers
RETURN = 0xFFFFFFF0  # where the caller of the function is
STACK_TOP, STACK_SIZE = 0x20008000, 256
STACK_END = STACK_TOP - STACK_SIZE
KEPT = (4, 5, 6, 7, 8, 9, 10, 11, SP)
STEP_LIMIT = 1000000
CHECK_LIMIT = 1000000000  # what one question to the solver may take, in units of its own


class GivenUp(Exception):
    """The code does what this machine cannot follow, so nothing is proved."""


class Broken(Exception):
    """The code breaks a rule that holds for every function; `state` says where."""

    def __init__(self, message, state=None):
        super().__init__(message)
        self.state = state


class StillNeeded(Exception):
    """A register was dropped where states met, and is read later: place and register."""


class Pause(Exception):
    """A state is about to load a unit, and waits for others that may meet it."""


class Unsettled(Exception):
    """A term whose values have to be told apart: an address, or by how many bits to shift."""


class Dropped:
    """What a register holds after states met that had different values in it."""

    def __init__(self, pc, register):
        self.place = pc, register


# Arithmetic, with a number as result where both operands are numbers.


def is_number(value):
    return isinstance(value, int)


def term(value):
    return z3.BitVecVal(value, 32) if is_number(value) else value


def simple(value):
    value = z3.simplify(value)
    return value.as_long() if z3.is_bv_value(value) else value


def operation(of):
    def compute(a, b):
        if is_number(a) and is_number(b):
            return of(a, b) & MASK
        return simple(of(term(a), term(b)))
    return compute


add, subtract, multiply = map(operation, (operator.add, operator.sub, operator.mul))
bit_and, bit_or, bit_xor = map(operation, (operator.and_, operator.or_, operator.xor))


def signed(number):
    return (number ^ 0x80000000) - 0x80000000


def is_same(a, b):
    if isinstance(a, z3.AstRef):
        return a is b or isinstance(b, z3.AstRef) and a.eq(b)
    return a is b or is_number(a) and is_number(b) and a == b


def extended(value, bits, with_sign=False):
    """The low bits of a value as 32 bits."""
    if is_number(value):
        value &= (1 << bits) - 1
        return (value - (1 << bits)) & MASK if with_sign and value >> bits - 1 else value
    low = z3.Extract(bits - 1, 0, value)
    return simple((z3.SignExt if with_sign else z3.ZeroExt)(32 - bits, low))


def has_bit(value, bit):
    return bool(value >> bit & 1) if is_number(value) else z3.Extract(bit, bit, value) == 1


def is_lower(a, b):
    """Whether a is less than b, both without a sign."""
    return a < b if is_number(a) and is_number(b) else z3.ULT(term(a), term(b))


def is_less(a, b):
    """Whether a is less than b, both with a sign."""
    return signed(a) < signed(b) if is_number(a) and is_number(b) else term(a) < term(b)


def shifted(value, amount, kind):
    """The value of a shift by 1 to 32, and the last bit that it moves out."""
    if kind == "LSL":
        return multiply(value, 1 << amount & MASK), has_bit(value, 32 - amount)
    if is_number(value):
        result = (signed(value) if kind == "ASR" else value) >> amount & MASK
    elif kind == "ASR":
        result = simple(value >> min(amount, 31))
    else:
        result = simple(z3.LShR(value, amount))
    return result, has_bit(value, amount - 1)


class Flags:
    """What the last instruction that sets flags has left. N and Z are of its result. C and V follow
    from the operands of a sum or a difference, else they are as `before`. `carry` is C where it is
    another: the bit that a shift moved out."""

    def __init__(self, result, before=None, sum=None, difference=None, carry=None):
        self.result, self.sum, self.difference, self.carry = result, sum, difference, carry
        keeps_both = isinstance(before, Flags) and not before.sum and not before.difference \
            and before.carry is None
        self.before = before.before if keeps_both else before

    def n(self):
        return has_bit(self.result, 31)

    def z(self):
        return self.result == 0

    def c(self):
        if self.carry is not None:
            return self.carry
        if self.sum:
            return is_lower(self.result, self.sum[0])
        return Not(is_lower(*self.difference)) if self.difference else self.earlier().c()

    def v(self):
        if not self.sum and not self.difference:
            return self.earlier().v()
        a, b = self.sum or self.difference
        other = bit_xor(b, self.result) if self.sum else bit_xor(a, b)
        return has_bit(bit_and(bit_xor(a, self.result), other), 31)

    def earlier(self):
        if isinstance(self.before, Dropped):
            raise StillNeeded(*self.before.place)
        if self.before is None:
            raise GivenUp("reads a flag that no instruction has set")
        return self.before

    def has(self, number):
        """Whether a condition of the manual's table holds: EQ, NE, CS, CC and so on."""
        kind = number >> 1
        if self.difference and kind in (0, 4, 5, 6):
            a, b = self.difference
            found = a == b if kind == 0 else is_lower(b, a) if kind == 4 else \
                Not(is_less(a, b)) if kind == 5 else is_less(b, a)
        elif kind < 4:
            found = (self.z, self.c, self.n, self.v)[kind]()
        elif kind == 4:
            found = Not(Or(Not(self.c()), self.z()))
        else:
            found = Not(Or(self.z() if kind == 6 else False, self.n() != self.v()))
        return Not(found) if number & 1 else found


class Memory:
    """The arrays of the caller, and the stack. A cell is a unit of an array, at its address; there
    is nothing beside the cells. `read` and `written` say when a cell was: what the function read
    before it wrote there itself counts only. Before a load from a `paced` cell states wait."""

    def __init__(self, segments):
        self.segments, self.paced = segments, set()
        self.sizes, self.cells, self.read, self.written = {}, {}, {}, {}
        self.give(STACK_END, 4, [0xAAAAAAAA] * (STACK_SIZE // 4))

    def give(self, address, size, units, is_paced=False):
        for index, unit in enumerate(units):
            self.cells[address + size * index] = unit
            self.sizes[address + size * index] = size
        if is_paced:
            self.paced.update(range(address, address + size * len(units), size))

    def copy(self):
        other = Memory.__new__(Memory)
        other.segments, other.sizes, other.paced = self.segments, self.sizes, self.paced
        other.cells, other.read, other.written = \
            dict(self.cells), dict(self.read), dict(self.written)
        return other

    def covered(self, address, size):
        """The addresses of the cells that an access covers."""
        if address % size:
            raise Broken(f"an access of {size} bytes at {address:#x}, which is not aligned")
        unit = self.sizes.get(address, size)
        covered = range(address, address + size, min(unit, size))
        if unit > size or any(self.sizes.get(cell) != unit for cell in covered):
            raise Broken(f"an access of {size} bytes at {address:#x}, where nothing is given")
        return covered

    def load(self, address, size):
        if address not in self.sizes and address % size == 0:
            constant = number_at(self.segments, address, size)
            if constant is not None:
                return constant
        value = self.cells.get(address)
        for cell in self.covered(address, size):
            is_own = self.written.get(cell, False)
            self.read[cell] = Or(self.read.get(cell, False), Not(is_own))
            if cell > address:
                value = bit_or(value, multiply(self.cells[cell], 1 << 8 * (cell - address)))
        return value

    def store(self, address, size, value):
        for cell in self.covered(address, size):
            bits = 8 * self.sizes[cell]
            part = shifted(value, 8 * (cell - address), "LSR")[0] if cell > address else value
            self.cells[cell] = extended(part, bits) if bits < 32 else part
            self.written[cell] = True


def number_at(segments, address, size):
    """A number that the image has at an address, or None."""
    for start, data in segments:
        if start <= address and address + size <= start + len(data):
            return int.from_bytes(data[address - start:address - start + size], "little")
    return None


class State:
    """A moment of some paths. `path` is true in the solver where the contents take one of them, and
    `facts` are what they have in common: conditions, by number, and whether they hold. `settled` is
    the number of a term and its value, for the instruction that needs it. `cycles` are the most of
    any path, `fewer` by how many a path took less, `lowest` is the lowest stack pointer, `loads`
    are counted from paced cells."""

    def __init__(self, registers, memory, path):
        self.r, self.memory, self.path = registers, memory, path
        self.cycles, self.fewer, self.lowest, self.loads, self.facts = 0, 0, STACK_TOP, 0, {}
        self.paused, self.is_checked, self.settled = False, False, (None, None)

    def copy(self):
        other = State(list(self.r), self.memory.copy(), self.path)
        other.cycles, other.fewer, other.lowest = self.cycles, self.fewer, self.lowest
        other.loads, other.facts = self.loads, dict(self.facts)
        return other

    def get(self, register):
        value = self.r[register]
        if isinstance(value, Dropped):
            raise StillNeeded(*value.place)
        return value

    def number(self, value):
        """The value of a term, of which there is one in this state."""
        if is_number(value):
            return value
        if value.get_id() != self.settled[0]:
            raise Unsettled(value)
        return self.settled[1]

    def place(self, address):
        address = self.number(address)
        if STACK_END <= address < self.r[SP]:
            raise Broken("an access below the stack pointer, where interrupts write")
        return address

    def pause(self):
        """Stops before a load, once, so that others can meet this state."""
        if not self.paused:
            raise Pause
        self.loads += 1

    def load(self, address, size):
        address = self.place(address)
        if address in self.memory.paced:
            self.pause()
        return self.memory.load(address, size)

    def store(self, address, size, register):
        address = self.place(address)
        is_saved = address >= STACK_END  # which is no use of a register yet
        value = self.r[register] if is_saved else self.get(register)
        self.memory.store(address, size, value)

    def set(self, register, value, carry=None):
        """A result that sets N and Z; and C, if a shift moved out a bit."""
        self.r[register], self.r[FLAGS] = value, Flags(value, self.r[FLAGS], carry=carry)

    def move_stack(self, value):
        if not is_number(value) or value % 4:
            raise GivenUp("a stack pointer that is no number, or not aligned")
        self.r[SP], self.lowest = value, min(self.lowest, value)

    def jump(self, target):
        """To an address with its lowest bit set, as BX, BLX and POP do."""
        if not is_number(target) or not target & 1:
            raise Broken(f"a jump to {target}")
        self.r[PC] = target & ~1


# Instructions. Each function takes a state, in which PC is the address of the next instruction, and
# the encoding. The fields have the manual's names: d of the destination, n and m of the operands.


def field(bit):
    """A low register of an encoding, from a bit on."""
    return lambda op: op >> bit & 7


at0, at3, at6, at8 = map(field, (0, 3, 6, 8))


def high_d(op):
    return op & 7 | op >> 4 & 8


def high_m(op):
    return op >> 3 & 15


def byte(_, op):
    return op & 0xFF


def bits3(_, op):
    return op >> 6 & 7


def register(at):
    return lambda s, op: s.get(at(op))


def sum_of(n, operand, d=None):
    def execute(s, op):
        a, b = s.get(n(op)), operand(s, op)
        result = add(a, b)
        s.r[FLAGS] = Flags(result, sum=(a, b))
        if d:
            s.r[d(op)] = result
    return execute


def difference_of(first, operand, d=None):
    def execute(s, op):
        a, b = first(s, op), operand(s, op)
        result = subtract(a, b)
        s.r[FLAGS] = Flags(result, difference=(a, b))
        if d:
            s.r[d(op)] = result
    return execute


def logical(of, keeps=True):
    def execute(s, op):
        result = of(s.get(at0(op)), s.get(at3(op)))
        s.r[FLAGS] = Flags(result, s.r[FLAGS])
        if keeps:
            s.r[at0(op)] = result
    return execute


def with_carry(changed):
    """a + b + C, which ADCS does as it is and SBCS with the complement of b."""
    def execute(s, op):
        a, b, carry = s.get(at0(op)), changed(s.get(at3(op))), s.get(FLAGS).c()
        whole = z3.ZeroExt(1, term(a)) + z3.ZeroExt(1, term(b)) + \
            z3.If(carry, z3.BitVecVal(1, 33), z3.BitVecVal(0, 33))
        result, last = simple(z3.Extract(31, 0, whole)), simple(z3.Extract(32, 32, whole))
        s.r[at0(op)] = result
        s.r[FLAGS] = Flags(result, sum=(a, b), carry=last == 1)
    return execute


def complement(value):
    return bit_xor(value, MASK)


def shift_immediate(kind):
    def execute(s, op):
        amount, value = op >> 6 & 31, s.get(at3(op))
        if kind == "LSL" and amount == 0:  # MOVS between registers
            return s.set(at0(op), value)
        s.set(at0(op), *shifted(value, amount or 32, kind))
    return execute


def shift_register(kind):
    def execute(s, op):
        value, amount = s.get(at0(op)), s.number(s.get(at3(op))) & 0xFF
        if amount > 32:
            raise GivenUp(f"a shift by {amount}")
        s.set(at0(op), *(shifted(value, amount, kind) if amount else (value,)))
    return execute


def mov_high(s, op):
    d, m = high_d(op), high_m(op)
    value = s.r[PC] + 2 if m == PC else s.get(m) if d in (PC, SP) else s.r[m]
    if d == PC:
        s.cycles += 1
        s.jump(bit_or(value, 1))
    elif d == SP:
        s.move_stack(value)
    else:
        s.r[d] = value


def add_high(s, op):
    d, m = high_d(op), high_m(op)
    if PC in (d, m):
        raise GivenUp("an ADD with PC")
    value = add(s.get(d), s.get(m))
    if d == SP:
        return s.move_stack(value)
    s.r[d] = value


def bx(s, op):
    target = s.get(high_m(op))
    if op & 0x80:  # BLX
        s.r[LR] = s.r[PC] | 1
    s.jump(target)


def by_register(s, op):
    return at0(op), add(s.get(at3(op)), s.get(at6(op)))


def by_offset(scale):
    return lambda s, op: (at0(op), add(s.get(at3(op)), (op >> 6 & 31) * scale))


def by_stack(s, op):
    return at8(op), s.r[SP] + (op & 0xFF) * 4


def by_pc(s, op):
    return at8(op), (s.r[PC] + 2 & ~3) + (op & 0xFF) * 4


def load(size, address_of, with_sign=False):
    def execute(s, op):
        d, address = address_of(s, op)
        value = s.load(address, size)
        s.r[d] = extended(value, 8 * size, True) if with_sign else value
    return execute


def store(size, address_of):
    def execute(s, op):
        d, address = address_of(s, op)
        s.store(address, size, d)
    return execute


def listed(op):
    return [one for one in range(8) if op >> one & 1]


def push(s, op):
    registers = listed(op) + [LR] * (op >> 8 & 1)
    s.cycles += len(registers)
    s.move_stack(s.r[SP] - 4 * len(registers))
    for index, one in enumerate(registers):
        s.store(s.r[SP] + 4 * index, 4, one)


def pop(s, op):
    registers = listed(op) + [PC] * (op >> 8 & 1)
    s.cycles += len(registers)
    values = [s.load(s.r[SP] + 4 * index, 4) for index in range(len(registers))]
    s.move_stack(s.r[SP] + 4 * len(registers))
    for one, value in zip(registers, values):
        if one == PC:
            s.cycles += 2
            s.jump(value)
        else:
            s.r[one] = value


def stm(s, op):
    n, registers = at8(op), listed(op)
    if n in registers[1:]:
        raise GivenUp("an STM that stores its own base")
    address = s.get(n)
    for index, one in enumerate(registers):
        s.store(add(address, 4 * index), 4, one)
    s.cycles += len(registers)
    s.r[n] = add(address, 4 * len(registers))


def ldm(s, op):
    n, registers = at8(op), listed(op)
    address = s.get(n)
    values = [s.load(add(address, 4 * index), 4) for index in range(len(registers))]
    s.cycles += len(registers)
    s.r[n] = add(address, 4 * len(registers))
    for one, value in zip(registers, values):
        s.r[one] = value


def extend(bits, with_sign):
    return lambda s, op: s.r.__setitem__(at0(op), extended(s.get(at3(op)), bits, with_sign))


def branch(s, op):
    s.r[PC] += 2 + ((op & 0x7FF ^ 0x400) - 0x400) * 2


def branch_with_link(s, op):
    """The two halves of a BL; the upper half of `op` is the first."""
    sign = op >> 26 & 1
    bits = [op >> bit & 1 ^ 1 ^ sign for bit in (13, 11)]
    offset = bits[0] << 22 | bits[1] << 21 | (op >> 16 & 0x3FF) << 11 | op & 0x7FF
    s.r[LR] = s.r[PC] | 1
    s.r[PC] += 2 * (offset - (sign << 23))


# Name, the bits that tell an instruction, their values, cycles, what it does. A conditional branch
# is the machine's own.
INSTRUCTIONS = [
    ("LSLS immediate", 0xF800, 0x0000, 1, shift_immediate("LSL")),
    ("LSRS immediate", 0xF800, 0x0800, 1, shift_immediate("LSR")),
    ("ASRS immediate", 0xF800, 0x1000, 1, shift_immediate("ASR")),
    ("ADDS register", 0xFE00, 0x1800, 1, sum_of(at3, register(at6), at0)),
    ("SUBS register", 0xFE00, 0x1A00, 1, difference_of(register(at3), register(at6), at0)),
    ("ADDS 3 bits", 0xFE00, 0x1C00, 1, sum_of(at3, bits3, at0)),
    ("SUBS 3 bits", 0xFE00, 0x1E00, 1, difference_of(register(at3), bits3, at0)),
    ("MOVS immediate", 0xF800, 0x2000, 1, lambda s, op: s.set(at8(op), op & 0xFF)),
    ("CMP immediate", 0xF800, 0x2800, 1, difference_of(register(at8), byte)),
    ("ADDS 8 bits", 0xF800, 0x3000, 1, sum_of(at8, byte, at8)),
    ("SUBS 8 bits", 0xF800, 0x3800, 1, difference_of(register(at8), byte, at8)),
    ("ANDS", 0xFFC0, 0x4000, 1, logical(bit_and)),
    ("EORS", 0xFFC0, 0x4040, 1, logical(bit_xor)),
    ("LSLS register", 0xFFC0, 0x4080, 1, shift_register("LSL")),
    ("LSRS register", 0xFFC0, 0x40C0, 1, shift_register("LSR")),
    ("ASRS register", 0xFFC0, 0x4100, 1, shift_register("ASR")),
    ("ADCS", 0xFFC0, 0x4140, 1, with_carry(lambda b: b)),
    ("SBCS", 0xFFC0, 0x4180, 1, with_carry(complement)),
    ("TST", 0xFFC0, 0x4200, 1, logical(bit_and, keeps=False)),
    ("RSBS", 0xFFC0, 0x4240, 1, difference_of(lambda s, op: 0, register(at3), at0)),
    ("CMP register", 0xFFC0, 0x4280, 1, difference_of(register(at0), register(at3))),
    ("CMN", 0xFFC0, 0x42C0, 1, sum_of(at0, register(at3))),
    ("ORRS", 0xFFC0, 0x4300, 1, logical(bit_or)),
    ("MULS", 0xFFC0, 0x4340, 1, logical(multiply)),
    ("BICS", 0xFFC0, 0x4380, 1, logical(lambda a, b: bit_and(a, complement(b)))),
    ("MVNS", 0xFFC0, 0x43C0, 1, logical(lambda _, b: complement(b))),
    ("ADD high", 0xFF00, 0x4400, 1, add_high),
    ("CMP high", 0xFF00, 0x4500, 1, difference_of(register(high_d), register(high_m))),
    ("MOV high", 0xFF00, 0x4600, 1, mov_high),
    ("BX, BLX", 0xFF07, 0x4700, 2, bx),
    ("LDR literal", 0xF800, 0x4800, 2, load(4, by_pc)),
    ("STR register", 0xFE00, 0x5000, 2, store(4, by_register)),
    ("STRH register", 0xFE00, 0x5200, 2, store(2, by_register)),
    ("STRB register", 0xFE00, 0x5400, 2, store(1, by_register)),
    ("LDRSB register", 0xFE00, 0x5600, 2, load(1, by_register, True)),
    ("LDR register", 0xFE00, 0x5800, 2, load(4, by_register)),
    ("LDRH register", 0xFE00, 0x5A00, 2, load(2, by_register)),
    ("LDRB register", 0xFE00, 0x5C00, 2, load(1, by_register)),
    ("LDRSH register", 0xFE00, 0x5E00, 2, load(2, by_register, True)),
    ("STR offset", 0xF800, 0x6000, 2, store(4, by_offset(4))),
    ("LDR offset", 0xF800, 0x6800, 2, load(4, by_offset(4))),
    ("STRB offset", 0xF800, 0x7000, 2, store(1, by_offset(1))),
    ("LDRB offset", 0xF800, 0x7800, 2, load(1, by_offset(1))),
    ("STRH offset", 0xF800, 0x8000, 2, store(2, by_offset(2))),
    ("LDRH offset", 0xF800, 0x8800, 2, load(2, by_offset(2))),
    ("STR stack", 0xF800, 0x9000, 2, store(4, by_stack)),
    ("LDR stack", 0xF800, 0x9800, 2, load(4, by_stack)),
    ("ADR", 0xF800, 0xA000, 1, lambda s, op: s.r.__setitem__(*by_pc(s, op))),
    ("ADD stack address", 0xF800, 0xA800, 1, lambda s, op: s.r.__setitem__(*by_stack(s, op))),
    ("ADD SP", 0xFF80, 0xB000, 1, lambda s, op: s.move_stack(s.r[SP] + (op & 0x7F) * 4)),
    ("SUB SP", 0xFF80, 0xB080, 1, lambda s, op: s.move_stack(s.r[SP] - (op & 0x7F) * 4)),
    ("SXTH", 0xFFC0, 0xB200, 1, extend(16, True)),
    ("SXTB", 0xFFC0, 0xB240, 1, extend(8, True)),
    ("UXTH", 0xFFC0, 0xB280, 1, extend(16, False)),
    ("UXTB", 0xFFC0, 0xB2C0, 1, extend(8, False)),
    ("PUSH", 0xFE00, 0xB400, 1, push),
    ("POP", 0xFE00, 0xBC00, 1, pop),
    ("NOP", 0xFFFF, 0xBF00, 1, lambda s, op: None),
    ("STM", 0xF800, 0xC000, 1, stm),
    ("LDM", 0xF800, 0xC800, 1, ldm),
    ("B", 0xF800, 0xE000, 2, branch),
    ("BL", 0xF800D000, 0xF000D000, 3, branch_with_link),
]


def is_conditional(op):
    return op >> 12 == 0xD and op >> 8 & 15 < 14


def decode(op):
    """The row of the table of an encoding, which is of 32 bits for a BL."""
    for row in INSTRUCTIONS:
        if op & row[1] == row[2] and (op > 0xFFFF) == (row[1] > 0xFFFF):
            return row
    raise GivenUp(f"an instruction that it does not know: {op:#06x}")


class Machine:
    """An image whose functions run from arguments that are any. `needed` is learned: at which place
    which registers are read again, so that states that differ in one of them stay apart."""

    def __init__(self, segments, division=None):
        self.segments, self.division, self.division_of = segments, division, Division()
        self.needed, self.decoded = {}, {}

    def fetch(self, pc):
        if pc not in self.decoded:
            op = number_at(self.segments, pc, 2)
            if op is None:
                raise Broken(f"a jump to {pc:#x}, where the image has nothing")
            if op >> 11 > 0x1C:
                op = op << 16 | (number_at(self.segments, pc + 2, 2) or 0)
            self.decoded[pc] = op, None if is_conditional(op) else decode(op)
        return self.decoded[pc]

    def run(self, pc, arguments, memory, conditions, has_result):
        """All states in which a call ends. `conditions` hold of the arguments and the contents."""
        registers = [*arguments, *(0xDEAD0000 + 4 * n for n in range(len(arguments), 13))]
        registers += [STACK_TOP, RETURN | 1, pc, Flags(0)]
        self.needed[RETURN] = {0, *KEPT} if has_result else set(KEPT)
        while True:
            self.solver = z3.SimpleSolver()
            self.solver.set("rlimit", CHECK_LIMIT)
            self.solver.add(*conditions, *self.division_of.promises)
            self.numbers, self.kept, self.steps = count(), [], 0
            try:
                ended = self.explore(State(list(registers), memory.copy(), z3.BoolVal(True)))
            except StillNeeded as place:
                self.needed.setdefault(place.args[0], set()).add(place.args[1])
                continue
            if not ended:
                raise GivenUp("no path ends")
            for state in ended:
                for register in KEPT:
                    if state.r[register] != registers[register]:
                        raise Broken(f"r{register} is not kept", state)
            return ended

    def is_possible(self, condition):
        found = self.solver.check(condition)
        if found == z3.unknown:
            raise GivenUp(f"the solver gives up: {self.solver.reason_unknown()}")
        return found == z3.sat

    def named(self, condition):
        """A new variable that implies a condition."""
        name = z3.Bool(f"path {next(self.numbers)}")
        self.solver.add(z3.Implies(name, condition))
        return name

    def explore(self, start):
        """Runs waiting states, first those that have loaded the fewest units, so that others meet
        them. A path is checked to be possible where it is about to load: most branches can go both
        ways."""
        self.queue, self.waiting, ended = [], {}, []
        self.wait(start)
        while self.queue:
            state = self.waiting.pop(heapq.heappop(self.queue)[-1])
            if state.paused and not state.is_checked:
                if not self.is_possible(state.path):
                    continue
                state.is_checked = True
            try:
                self.advance(state, ended)
            except Broken as broken:
                if self.is_possible(state.path):
                    broken.state = state
                    raise
        return [state for state in ended if self.is_possible(state.path)]

    def wait(self, state):
        """Puts a state among the waiting, or merges it into one that is at the same place with the
        same values in the registers that matter and on the stack."""
        pc, sp = state.r[PC], state.r[SP]
        values = [state.r[register] for register in self.needed.get(pc, ())]
        values += [state.memory.cells[cell] for cell in range(sp, STACK_TOP, 4)]
        key = (pc, sp, state.settled, *map(identity, values))
        if key in self.waiting:
            self.merge(self.waiting[key], state)
        else:
            self.waiting[key] = state
            heapq.heappush(self.queue, (state.loads, next(self.numbers), key))

    def merge(self, one, other):
        for register, value in enumerate(one.r):
            if not is_same(value, other.r[register]):
                one.r[register] = Dropped(one.r[PC], register)
        ours, theirs = one.memory, other.memory
        for cell, value in ours.cells.items():
            if cell < STACK_END and not is_same(value, theirs.cells[cell]):
                ours.cells[cell] = z3.If(one.path, term(value), term(theirs.cells[cell]))
        for mine, others in ((ours.read, theirs.read), (ours.written, theirs.written)):
            for cell in mine.keys() | others.keys():
                a, b = mine.get(cell, False), others.get(cell, False)
                if not is_same(a, b):
                    mine[cell] = z3.If(one.path, a, b)
        most = max(one.cycles, other.cycles)
        fewer = [add(state.fewer, most - state.cycles) for state in (one, other)]
        one.fewer = fewer[0] if is_same(*fewer) else z3.If(one.path, *map(term, fewer))
        one.path = self.named(z3.Or(one.path, other.path))
        one.facts = dict(one.facts.items() & other.facts.items())
        one.paused = one.paused and other.paused
        one.is_checked = one.is_checked or other.is_checked
        one.cycles, one.lowest = most, min(one.lowest, other.lowest)

    def advance(self, s, ended):
        """Runs a state until it ends, or has to wait."""
        while s.r[PC] != RETURN:
            self.steps += 1
            if self.steps > STEP_LIMIT:
                raise GivenUp(f"more than {STEP_LIMIT} steps")
            pc = s.r[PC]
            try:
                if pc == self.division:
                    self.divide(s)
                else:
                    op, row = self.fetch(pc)
                    s.r[PC] = pc + (4 if op > 0xFFFF else 2)
                    if row is None:
                        if self.branch(s, op):
                            return
                        continue
                    row[4](s, op)
                    s.cycles += row[3]
                s.paused, s.settled = False, (None, None)
            except Pause:
                s.r[PC], s.paused = pc, True
                return self.wait(s)
            except Unsettled as term:
                s.r[PC] = pc
                return self.settle(s, *term.args)
        for register in self.needed[RETURN]:
            s.get(register)
        ended.append(s)

    def divide(self, s):
        """The runtime's division by its contract: quotient and remainder; all other registers that
        a call may change are any. Its own cycles and stack are not counted."""
        s.pause()
        dividend, divisor = s.get(0), s.get(1)
        if not is_number(divisor) or not 0 < signed(divisor):
            raise GivenUp(f"a division by {divisor}")
        if not is_number(dividend) and self.is_possible(z3.And(s.path, dividend < 0)):
            raise GivenUp("a division of a negative number that is none in particular")
        known = len(self.division_of.promises)
        quotient, remainder = self.division_of(dividend, divisor)
        self.solver.add(*self.division_of.promises[known:])
        s.r[0], s.r[1] = quotient, remainder
        for register in (2, 3, 12):
            s.r[register] = z3.BitVec(f"r{register} after division {next(self.numbers)}", 32)
        s.r[FLAGS] = Dropped(RETURN, FLAGS)
        s.jump(s.get(LR))

    def settle(self, s, value):
        """Makes a state of one of the values that a term can have, and another one of the rest."""
        self.kept.append(value)
        if self.is_possible(s.path):
            one, rest = self.solver.model().eval(value, True), s.copy()
            self.assume(s, value == one, True)
            s.settled = value.get_id(), one.as_long()
            s.r = [one.as_long() if is_same(register, value) else register for register in s.r]
            self.assume(rest, value == one, False)
            rest.paused = s.paused
            self.wait(s)
            if self.is_possible(rest.path):
                self.wait(rest)

    def branch(self, s, op):
        """A conditional branch: whether it goes both ways, and both states wait."""
        taken = s.get(FLAGS).has(op >> 8 & 15)
        if not isinstance(taken, bool):
            taken = decided(s, z3.simplify(taken))
        s.cycles += 1
        if isinstance(taken, bool):
            go(s, op, taken)
            return False
        other = s.copy()
        for state, is_taken in ((s, True), (other, False)):
            self.assume(state, taken, is_taken)
            go(state, op, is_taken)
            self.wait(state)
        return True

    def assume(self, s, condition, holds):
        s.path = self.named(z3.And(s.path, condition if holds else z3.Not(condition)))
        s.is_checked = False
        if z3.is_not(condition):
            condition, holds = condition.arg(0), not holds
        self.kept.append(condition)  # so that no other term gets its number
        s.facts[condition.get_id()] = holds


def go(s, op, is_taken):
    if is_taken:
        s.r[PC] += 2 + ((op & 0xFF ^ 0x80) - 0x80) * 2
        s.cycles += 1


def decided(s, condition):
    """What earlier branches of the same path say of a condition, or the condition."""
    if z3.is_true(condition) or z3.is_false(condition):
        return z3.is_true(condition)
    is_negated = z3.is_not(condition)
    found = s.facts.get((condition.arg(0) if is_negated else condition).get_id())
    return condition if found is None else found != is_negated


def identity(value):
    """What tells values in registers apart."""
    if isinstance(value, z3.AstRef):
        return "term", value.get_id()
    return value if is_number(value) else id(value)


class Division:
    """Quotients and remainders. Those of a term, which is not negative, are two new variables, with
    what the division promises of them. The same dividend has the same ones."""

    def __init__(self):
        self.found, self.most, self.promises = {}, {}, []

    def __call__(self, dividend, divisor):
        if is_number(dividend):
            quotient = abs(signed(dividend)) // divisor * (-1 if dividend >> 31 else 1)
            return quotient & MASK, signed(dividend) - quotient * divisor & MASK
        dividend = simple(dividend)
        if is_number(dividend):
            return self(dividend, divisor)
        key = dividend.get_id(), divisor
        if key not in self.found:
            q, r = (z3.BitVec(f"{name} {len(self.found)}", 32) for name in ("quotient", "rest"))
            most = self.most.get(dividend.get_id(), 0x7FFFFFFF) // divisor
            self.promises.append(z3.And(dividend == q * divisor + r, 0 <= r, r < divisor,
                                        0 <= q, q <= most))
            self.found[key] = dividend, q, r
            self.most[q.get_id()] = most
        return self.found[key][1:]
