"""A Cortex-M0+ that computes with unknown values: a register or a unit of memory holds a number or, where
the contents are any, a term of the solver Z3. A conditional branch that can go both ways makes two states
of one; states that meet at the same place become one again, whose memory says which content came from where.
What it does not know ends in an error: an instruction, an access or an address that is not a number."""
import heapq
from itertools import count

import z3

MASK = 0xFFFFFFFF
SP, LR, PC = 13, 14, 15
RETURN = 0xFFFFFFF0  # where the caller of the function is
STACK_TOP, STACK_SIZE = 0x20008000, 256
STEP_LIMIT = 1000000
KEPT = (4, 5, 6, 7, 8, 9, 10, 11, SP)
CHECK_LIMIT = 100000000  # what one question to the solver may take, in units of its own


class GivenUp(Exception):
    """The code does what this machine cannot follow, so nothing is proved."""


class Broken(Exception):
    """The code breaks a rule that holds for every function. `state` has an example of it."""

    def __init__(self, message, state=None):
        super().__init__(message)
        self.state = state


class StillNeeded(Exception):
    """A register was taken for one that is not read again, at a place where states meet."""


class Pause(Exception):
    """A state is about to load a unit, and waits for others that may meet it."""


class Unsettled(Exception):
    """A term whose values have to be told apart, since it is an address or the number of bits to shift by."""


class Dropped:
    """What a register holds after states met that had different values in it."""

    def __init__(self, pc, register):
        self.place = pc, register


# Arithmetic: each function computes with numbers at once, and makes a term otherwise.

def is_number(value):
    return isinstance(value, int)


def term(value):
    return z3.BitVecVal(value, 32) if is_number(value) else value


def simple(value):
    """A number if the term is one, else the term in its shortest form."""
    value = z3.simplify(value)
    return value.as_long() if z3.is_bv_value(value) else value


def is_same(a, b):
    if a is b:
        return True
    if isinstance(a, z3.AstRef):
        return isinstance(b, z3.AstRef) and a.eq(b)
    return is_number(a) and is_number(b) and a == b


def signed(number):
    return (number ^ 0x80000000) - 0x80000000


def add(a, b):
    return (a + b) & MASK if is_number(a) and is_number(b) else simple(term(a) + term(b))


def subtract(a, b):
    return (a - b) & MASK if is_number(a) and is_number(b) else simple(term(a) - term(b))


def multiply(a, b):
    return (a * b) & MASK if is_number(a) and is_number(b) else simple(term(a) * term(b))


def bit_and(a, b):
    return a & b if is_number(a) and is_number(b) else simple(term(a) & term(b))


def bit_or(a, b):
    return a | b if is_number(a) and is_number(b) else simple(term(a) | term(b))


def bit_xor(a, b):
    return a ^ b if is_number(a) and is_number(b) else simple(term(a) ^ term(b))


def bit_not(a):
    return bit_xor(a, MASK)


def extended(value, bits, with_sign):
    """The low bits of a value as 32 bits."""
    if is_number(value):
        value &= (1 << bits) - 1
        return (value - (1 << bits)) & MASK if with_sign and value >> (bits - 1) else value
    low = z3.Extract(bits - 1, 0, value)
    return simple(z3.SignExt(32 - bits, low) if with_sign else z3.ZeroExt(32 - bits, low))


def has_bit(value, bit):
    return bool(value >> bit & 1) if is_number(value) else z3.Extract(bit, bit, value) == 1


def is_equal(a, b):
    return a == b if is_number(a) and is_number(b) else term(a) == term(b)


def is_lower(a, b):
    """Whether a is less than b, both without a sign."""
    return a < b if is_number(a) and is_number(b) else z3.ULT(term(a), term(b))


def is_less(a, b):
    """Whether a is less than b, both with a sign."""
    return signed(a) < signed(b) if is_number(a) and is_number(b) else term(a) < term(b)


def negation(condition):
    return not condition if isinstance(condition, bool) else z3.Not(condition)


def either(a, b):
    if isinstance(a, bool):
        return True if a else b
    if isinstance(b, bool):
        return True if b else a
    return z3.Or(a, b)


def differ(a, b):
    if isinstance(a, bool):
        return negation(b) if a else b
    if isinstance(b, bool):
        return negation(a) if b else a
    return z3.Xor(a, b)


class Flags:
    """What the last instruction that sets flags has left. N and Z are of its result; C and V follow from the
    operands of a sum or a difference, else they are as `before`; C is the bit that a shift moved out, if any."""

    def __init__(self, result, before=None, sum=None, difference=None, moved=None):
        self.result, self.sum, self.difference, self.moved = result, sum, difference, moved
        is_plain = isinstance(before, Flags) and not (before.sum or before.difference) and before.moved is None
        self.before = before.before if is_plain else before

    def n(self):
        return has_bit(self.result, 31)

    def z(self):
        return is_equal(self.result, 0)

    def c(self):
        if self.moved is not None:
            return self.moved
        if self.sum:
            return is_lower(self.result, self.sum[0])
        return negation(is_lower(*self.difference)) if self.difference else self.earlier().c()

    def v(self):
        if self.sum:
            a, b = self.sum
            return has_bit(bit_and(bit_xor(a, self.result), bit_xor(b, self.result)), 31)
        if self.difference:
            a, b = self.difference
            return has_bit(bit_and(bit_xor(a, b), bit_xor(a, self.result)), 31)
        return self.earlier().v()

    def earlier(self):
        if isinstance(self.before, Dropped):
            raise StillNeeded(*self.before.place)
        if self.before is None:
            raise GivenUp("reads a flag that no instruction has set")
        return self.before

    def has(self, number):
        """Whether a condition of the manual's table holds: EQ, NE, CS, CC and so on."""
        if self.difference and number >> 1 in (0, 4, 5, 6):
            a, b = self.difference
            found = {0: is_equal(a, b), 4: is_lower(b, a), 5: negation(is_less(a, b)),
                     6: is_less(b, a)}[number >> 1]
        elif number >> 1 < 4:
            found = [self.z, self.c, self.n, self.v][number >> 1]()
        elif number >> 1 == 4:
            found = negation(either(negation(self.c()), self.z()))
        else:
            is_less_than = differ(self.n(), self.v())
            found = negation(is_less_than if number >> 1 == 5 else either(self.z(), is_less_than))
        return negation(found) if number & 1 else found


class Memory:
    """The arrays of the caller, and the stack. A cell is a unit of an array, at its address; there is
    nothing beside the cells. `read` and `written` say when a cell was, as numbers or terms: what the
    function read before it wrote there itself counts only."""

    def __init__(self, segments):
        self.segments, self.paced = segments, set()
        self.sizes, self.cells, self.read, self.written = {}, {}, {}, {}
        self.give(STACK_TOP - STACK_SIZE, 4, [0xAAAAAAAA] * (STACK_SIZE // 4))

    def give(self, address, size, units, paced=False):
        for index, unit in enumerate(units):
            if paced:
                self.paced.add(address + size * index)
            self.cells[address + size * index] = unit
            self.sizes[address + size * index] = size

    def copy(self):
        other = Memory.__new__(Memory)
        other.segments, other.sizes, other.paced = self.segments, self.sizes, self.paced
        other.cells, other.read, other.written = dict(self.cells), dict(self.read), dict(self.written)
        return other

    def covered(self, address, size):
        """The addresses of the cells that an access covers."""
        if address % size:
            raise Broken(f"an access of {size} bytes at {address:#x}, which is not aligned")
        unit = self.sizes.get(address)
        if unit and unit <= size:
            covered = range(address, address + size, unit)
            if all(self.sizes.get(cell) == unit for cell in covered):
                return covered
        raise Broken(f"an access of {size} bytes at {address:#x}, where the caller has given none")

    def constant(self, address, size):
        for start, data in self.segments:
            if start <= address and address + size <= start + len(data):
                return int.from_bytes(data[address - start:address - start + size], "little")
        return None

    def load(self, address, size):
        if address not in self.sizes and address % size == 0:
            constant = self.constant(address, size)
            if constant is not None:
                return constant
        cells = self.covered(address, size)
        for cell in cells:
            self.read[cell] = either(self.read.get(cell, False), negation(self.written.get(cell, False)))
        value = self.cells[address]
        for index, cell in enumerate(cells[1:], 1):
            value = bit_or(value, multiply(self.cells[cell], 1 << (8 * self.sizes[cell] * index)))
        return value

    def store(self, address, size, value):
        cells = self.covered(address, size)
        for index, cell in enumerate(cells):
            bits = 8 * self.sizes[cell]
            part = value
            if bits < 32:
                shifted = part if index == 0 else shift_right(part, bits * index)
                part = extended(shifted, bits, False)
            self.cells[cell] = part
            self.written[cell] = True


def shift_right(value, amount):
    return value >> amount if is_number(value) else simple(z3.LShR(value, amount))


class State:
    """A moment of some paths: `path` is true in the solver where the contents take one of them, `cycles` the most that any of them took, `lowest` the lowest stack pointer."""

    def __init__(self, registers, memory, path):
        self.r, self.memory, self.path = registers, memory, path
        self.cycles, self.fewer, self.lowest, self.loads, self.facts = 0, 0, STACK_TOP, 0, {}
        self.paused, self.is_checked = False, False

    def copy(self):
        other = State(list(self.r), self.memory.copy(), self.path)
        other.cycles, other.fewer, other.lowest = self.cycles, self.fewer, self.lowest
        other.loads = self.loads
        other.facts = dict(self.facts)
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
        if value.get_id() not in self.facts:
            raise Unsettled(value)
        return self.facts[value.get_id()]

    def load(self, address, size):
        address = self.number(address)
        self.check_stack(address)
        if address in self.memory.paced:
            self.pause()
        return self.memory.load(address, size)

    def pause(self):
        """Stops before a load, once, so that others can meet this state."""
        if not self.paused:
            raise Pause
        self.loads += 1

    def store(self, address, size, value):
        address = self.number(address)
        self.check_stack(address)
        self.memory.store(address, size, value)

    def check_stack(self, address):
        if STACK_TOP - STACK_SIZE <= address < self.r[SP]:
            raise Broken("an access below the stack pointer, where interrupts write")

    def set_result(self, register, value, moved=None):
        """A result that changes N and Z, and C if a shift moved out a bit."""
        self.r[register] = value
        self.r[FLAGS] = Flags(value, self.r[FLAGS], moved=moved)

    def move_stack(self, value):
        if not is_number(value):
            raise GivenUp("a stack pointer that is no number")
        self.r[SP] = value
        self.lowest = min(self.lowest, value)

    def jump(self, target):
        """To an address with its lowest bit set, as BX, BLX and POP do."""
        if not is_number(target) or not target & 1:
            raise Broken(f"a jump to {target}")
        self.r[PC] = target & ~1


FLAGS = 16  # after the 16 registers of the manual


# Instructions. Each function takes the state, in which PC is the address of the next instruction, and the
# encoding. The names of the fields are the manual's: d of the destination, n and m of the operands.

def low(op, bit):
    return op >> bit & 7


def shifted(value, amount, kind):
    """The value of a shift by 1 to 32, and the last bit that it moves out."""
    if kind == "LSL":
        if is_number(value):
            return value << amount & MASK, bool(value << amount >> 32 & 1)
        return multiply(value, 1 << amount & MASK), has_bit(value, 32 - amount)
    kept = min(amount, 31)
    if is_number(value):
        result = signed(value) >> kept & MASK if kind == "ASR" else value >> amount
    elif kind == "ASR":
        result = simple(value >> kept)
    else:
        result = simple(z3.LShR(value, amount)) if amount < 32 else 0
    return result, has_bit(value, amount - 1)


def shift_immediate(kind):
    def execute(s, op):
        amount, value = op >> 6 & 31, s.get(low(op, 3))
        if kind == "LSL" and amount == 0:  # MOVS between registers
            return s.set_result(low(op, 0), value)
        value, carry = shifted(value, amount or 32, kind)
        s.set_result(low(op, 0), value, carry)
    return execute


def shift_register(kind):
    def execute(s, op):
        d, amount = low(op, 0), s.number(s.get(low(op, 3)))
        if amount & 0xFF > 32:
            raise GivenUp(f"a shift by {amount}")
        if amount & 0xFF == 0:
            return s.set_result(d, s.get(d))
        value, carry = shifted(s.get(d), amount & 0xFF, kind)
        s.set_result(d, value, carry)
    return execute


def set_sum(s, d, a, b):
    result = add(a, b)
    s.r[FLAGS] = Flags(result, sum=(a, b))
    if d is not None:
        s.r[d] = result


def set_difference(s, d, a, b):
    result = subtract(a, b)
    s.r[FLAGS] = Flags(result, difference=(a, b))
    if d is not None:
        s.r[d] = result


def add_with_carry(s, d, a, b):
    """a + b + C, which ADCS does as it is and SBCS with the complement of b."""
    carry = s.get(FLAGS).c()
    if isinstance(carry, bool) and is_number(a) and is_number(b):
        whole = a + b + carry
        result, carry = whole & MASK, whole > MASK
    else:
        bit = z3.BitVecVal(int(carry), 33) if isinstance(carry, bool) else \
            z3.If(carry, z3.BitVecVal(1, 33), z3.BitVecVal(0, 33))
        whole = z3.ZeroExt(1, term(a)) + z3.ZeroExt(1, term(b)) + bit
        result, carry = simple(z3.Extract(31, 0, whole)), z3.simplify(z3.Extract(32, 32, whole) == 1)
    s.r[d] = result
    s.r[FLAGS] = Flags(result, sum=(a, b), moved=carry)


def logical(operation):
    def execute(s, op):
        s.set_result(low(op, 0), operation(s.get(low(op, 0)), s.get(low(op, 3))))
    return execute


def tst(s, op):
    s.r[FLAGS] = Flags(bit_and(s.get(low(op, 0)), s.get(low(op, 3))), s.r[FLAGS])


def mov_high(s, op):
    d, m = op & 7 | op >> 4 & 8, op >> 3 & 15
    value = s.r[PC] + 2 if m == PC else s.r[m]
    if d == PC:
        value = s.get(m)
        s.cycles += 1
        return s.jump(value | 1 if is_number(value) else value)
    if d == SP:
        return s.move_stack(s.get(m))
    s.r[d] = value


def add_high(s, op):
    d, m = op & 7 | op >> 4 & 8, op >> 3 & 15
    if PC in (d, m):
        raise GivenUp("an ADD with PC")
    value = add(s.get(d), s.get(m))
    if d == SP:
        return s.move_stack(value)
    s.r[d] = value


def cmp_high(s, op):
    set_difference(s, None, s.get(op & 7 | op >> 4 & 8), s.get(op >> 3 & 15))


def bx(s, op):
    target = s.get(op >> 3 & 15)
    if op & 0x80:  # BLX
        s.r[LR] = s.r[PC] | 1
    s.jump(target)


def memory_access(size, is_load, address_of, with_sign=False):
    def execute(s, op):
        register, address = address_of(s, op)
        if not is_load:
            on_stack = is_number(address) and address >= STACK_TOP - STACK_SIZE
            return s.store(address, size, s.r[register] if on_stack else s.get(register))
        value = s.load(address, size)
        s.r[register] = extended(value, 8 * size, True) if with_sign else value
    return execute


def by_register(s, op):
    return low(op, 0), add(s.get(low(op, 3)), s.get(low(op, 6)))


def by_offset(scale):
    return lambda s, op: (low(op, 0), add(s.get(low(op, 3)), (op >> 6 & 31) * scale))


def by_stack(s, op):
    return low(op, 8), s.r[SP] + (op & 0xFF) * 4


def by_pc(s, op):
    return low(op, 8), (s.r[PC] + 2 & ~3) + (op & 0xFF) * 4


def listed(op):
    return [register for register in range(8) if op >> register & 1]


def push(s, op):
    registers = listed(op) + [LR] * (op >> 8 & 1)
    s.cycles += len(registers)
    s.move_stack(s.r[SP] - 4 * len(registers))
    for index, register in enumerate(registers):
        s.store(s.r[SP] + 4 * index, 4, s.r[register])


def pop(s, op):
    registers = listed(op) + [PC] * (op >> 8 & 1)
    s.cycles += len(registers)
    values = [s.load(s.r[SP] + 4 * index, 4) for index in range(len(registers))]
    s.move_stack(s.r[SP] + 4 * len(registers))
    for register, value in zip(registers, values):
        if register == PC:
            s.cycles += 2
            return s.jump(value)
        s.r[register] = value


def stm(s, op):
    n, registers = low(op, 8), listed(op)
    address = s.get(n)
    s.cycles += len(registers)
    for index, register in enumerate(registers):
        if register == n and index:
            raise GivenUp("an STM that stores its own base")
        s.store(add(address, 4 * index), 4, s.get(register))
    s.r[n] = add(address, 4 * len(registers))


def ldm(s, op):
    n, registers = low(op, 8), listed(op)
    address = s.get(n)
    values = [s.load(add(address, 4 * index), 4) for index in range(len(registers))]
    s.cycles += len(registers)
    s.r[n] = add(address, 4 * len(registers))
    for register, value in zip(registers, values):
        s.r[register] = value


def extend(bits, with_sign):
    return lambda s, op: s.r.__setitem__(low(op, 0), extended(s.get(low(op, 3)), bits, with_sign))


def branch(s, op):
    s.r[PC] += 2 + ((op & 0x7FF ^ 0x400) - 0x400) * 2


def branch_with_link(s, op):
    """The two halves of a BL: the first is the upper half of `op`."""
    upper, lower = op >> 16, op & 0xFFFF
    sign = upper >> 10 & 1
    j1, j2 = lower >> 13 & 1, lower >> 11 & 1
    offset = (1 ^ j1 ^ sign) << 22 | (1 ^ j2 ^ sign) << 21 | (upper & 0x3FF) << 11 | lower & 0x7FF
    s.r[LR] = s.r[PC] | 1
    s.r[PC] += 2 * (offset - (sign << 23))


# Name, the bits that tell it, their values, cycles, what it does. A conditional branch is the machine's own.
INSTRUCTIONS = [
    ("LSLS immediate", 0xF800, 0x0000, 1, shift_immediate("LSL")),
    ("LSRS immediate", 0xF800, 0x0800, 1, shift_immediate("LSR")),
    ("ASRS immediate", 0xF800, 0x1000, 1, shift_immediate("ASR")),
    ("ADDS register", 0xFE00, 0x1800, 1,
     lambda s, op: set_sum(s, low(op, 0), s.get(low(op, 3)), s.get(low(op, 6)))),
    ("SUBS register", 0xFE00, 0x1A00, 1,
     lambda s, op: set_difference(s, low(op, 0), s.get(low(op, 3)), s.get(low(op, 6)))),
    ("ADDS 3 bits", 0xFE00, 0x1C00, 1, lambda s, op: set_sum(s, low(op, 0), s.get(low(op, 3)), low(op, 6))),
    ("SUBS 3 bits", 0xFE00, 0x1E00, 1,
     lambda s, op: set_difference(s, low(op, 0), s.get(low(op, 3)), low(op, 6))),
    ("MOVS immediate", 0xF800, 0x2000, 1, lambda s, op: s.set_result(low(op, 8), op & 0xFF)),
    ("CMP immediate", 0xF800, 0x2800, 1, lambda s, op: set_difference(s, None, s.get(low(op, 8)), op & 0xFF)),
    ("ADDS 8 bits", 0xF800, 0x3000, 1, lambda s, op: set_sum(s, low(op, 8), s.get(low(op, 8)), op & 0xFF)),
    ("SUBS 8 bits", 0xF800, 0x3800, 1,
     lambda s, op: set_difference(s, low(op, 8), s.get(low(op, 8)), op & 0xFF)),
    ("ANDS", 0xFFC0, 0x4000, 1, logical(bit_and)),
    ("EORS", 0xFFC0, 0x4040, 1, logical(bit_xor)),
    ("LSLS register", 0xFFC0, 0x4080, 1, shift_register("LSL")),
    ("LSRS register", 0xFFC0, 0x40C0, 1, shift_register("LSR")),
    ("ASRS register", 0xFFC0, 0x4100, 1, shift_register("ASR")),
    ("ADCS", 0xFFC0, 0x4140, 1,
     lambda s, op: add_with_carry(s, low(op, 0), s.get(low(op, 0)), s.get(low(op, 3)))),
    ("SBCS", 0xFFC0, 0x4180, 1,
     lambda s, op: add_with_carry(s, low(op, 0), s.get(low(op, 0)), bit_not(s.get(low(op, 3))))),
    ("TST", 0xFFC0, 0x4200, 1, tst),
    ("RSBS", 0xFFC0, 0x4240, 1, lambda s, op: set_difference(s, low(op, 0), 0, s.get(low(op, 3)))),
    ("CMP register", 0xFFC0, 0x4280, 1,
     lambda s, op: set_difference(s, None, s.get(low(op, 0)), s.get(low(op, 3)))),
    ("CMN", 0xFFC0, 0x42C0, 1, lambda s, op: set_sum(s, None, s.get(low(op, 0)), s.get(low(op, 3)))),
    ("ORRS", 0xFFC0, 0x4300, 1, logical(bit_or)),
    ("MULS", 0xFFC0, 0x4340, 1, logical(multiply)),
    ("BICS", 0xFFC0, 0x4380, 1, logical(lambda a, b: bit_and(a, bit_not(b)))),
    ("MVNS", 0xFFC0, 0x43C0, 1, logical(lambda _, b: bit_not(b))),
    ("ADD high", 0xFF00, 0x4400, 1, add_high),
    ("CMP high", 0xFF00, 0x4500, 1, cmp_high),
    ("MOV high", 0xFF00, 0x4600, 1, mov_high),
    ("BX, BLX", 0xFF07, 0x4700, 2, bx),
    ("LDR literal", 0xF800, 0x4800, 2, memory_access(4, True, by_pc)),
    ("STR register", 0xFE00, 0x5000, 2, memory_access(4, False, by_register)),
    ("STRH register", 0xFE00, 0x5200, 2, memory_access(2, False, by_register)),
    ("STRB register", 0xFE00, 0x5400, 2, memory_access(1, False, by_register)),
    ("LDRSB register", 0xFE00, 0x5600, 2, memory_access(1, True, by_register, True)),
    ("LDR register", 0xFE00, 0x5800, 2, memory_access(4, True, by_register)),
    ("LDRH register", 0xFE00, 0x5A00, 2, memory_access(2, True, by_register)),
    ("LDRB register", 0xFE00, 0x5C00, 2, memory_access(1, True, by_register)),
    ("LDRSH register", 0xFE00, 0x5E00, 2, memory_access(2, True, by_register, True)),
    ("STR offset", 0xF800, 0x6000, 2, memory_access(4, False, by_offset(4))),
    ("LDR offset", 0xF800, 0x6800, 2, memory_access(4, True, by_offset(4))),
    ("STRB offset", 0xF800, 0x7000, 2, memory_access(1, False, by_offset(1))),
    ("LDRB offset", 0xF800, 0x7800, 2, memory_access(1, True, by_offset(1))),
    ("STRH offset", 0xF800, 0x8000, 2, memory_access(2, False, by_offset(2))),
    ("LDRH offset", 0xF800, 0x8800, 2, memory_access(2, True, by_offset(2))),
    ("STR stack", 0xF800, 0x9000, 2, memory_access(4, False, by_stack)),
    ("LDR stack", 0xF800, 0x9800, 2, memory_access(4, True, by_stack)),
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
    """The row of the table of an encoding, which is of 32 bits if its upper half is one of BL."""
    for row in INSTRUCTIONS:
        if op & row[1] == row[2] and (op > 0xFFFF) == (row[1] > 0xFFFF):
            return row
    raise GivenUp(f"an instruction that it does not know: {op:#06x}")


class Machine:
    """An image whose functions run from arguments that are any. `needed` is learned: at which place which
    registers are read again, so that states that differ in one of them stay apart."""

    def __init__(self, segments, division=None):
        self.segments, self.division, self.division_of = segments, division, Division()
        self.needed, self.decoded = {}, {}

    def fetch(self, pc):
        if pc not in self.decoded:
            op = Memory.constant(self, pc, 2)
            if op is None:
                raise Broken(f"jumps to {pc:#x}, where the image has nothing")
            if op >> 11 > 0x1C:
                op = op << 16 | Memory.constant(self, pc + 2, 2)
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
        """Runs waiting states, first those that have loaded the fewest units, so that others meet them. A
        path is checked to be possible where it is about to load: most branches can go both ways."""
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
        """Puts a state among the waiting, or merges it into one that is at the same place with the same
        values in the registers that matter and on the stack."""
        pc = state.r[PC]
        key = (pc, state.r[SP], tuple(identity(state.r[register]) for register in self.needed.get(pc, ())),
               tuple(identity(state.memory.cells[cell]) for cell in range(state.r[SP], STACK_TOP, 4)))
        if key in self.waiting:
            self.merge(self.waiting[key], state)
        else:
            self.waiting[key] = state
            heapq.heappush(self.queue, (state.loads, next(self.numbers), key))

    def merge(self, one, other):
        for register, value in enumerate(one.r):
            if not is_same(value, other.r[register]):
                one.r[register] = Dropped(one.r[PC], register)
        for cell, value in one.memory.cells.items():
            if cell < STACK_TOP - STACK_SIZE and not is_same(value, other.memory.cells[cell]):
                one.memory.cells[cell] = z3.If(one.path, term(value), term(other.memory.cells[cell]))
        for ours, theirs in ((one.memory.read, other.memory.read), (one.memory.written, other.memory.written)):
            for cell in ours.keys() | theirs.keys():
                a, b = ours.get(cell, False), theirs.get(cell, False)
                if not is_same(a, b):
                    ours[cell] = z3.If(one.path, a, b)
        most = max(one.cycles, other.cycles)
        fewer = [add(state.fewer, most - state.cycles) for state in (one, other)]
        one.fewer = fewer[0] if is_same(*fewer) else z3.If(one.path, *map(term, fewer))
        one.path = self.named(z3.Or(one.path, other.path))
        one.facts = {number: holds for number, holds in one.facts.items() if other.facts.get(number) == holds}
        one.paused, one.is_checked = one.paused and other.paused, one.is_checked or other.is_checked
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
                s.paused = False
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
        """The runtime's division by its contract: quotient and remainder, and all other registers that a
        call may change are any. Its own cycles and stack are not counted."""
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
            s.facts[value.get_id()] = one.as_long()
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
        s.path, s.is_checked = self.named(z3.And(s.path, condition if holds else z3.Not(condition))), False
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
    return value.get_id() if isinstance(value, z3.AstRef) else value if is_number(value) else id(value)


class Division:
    """Quotients and remainders of numbers that are not negative, also of terms: for these two new variables
    stand, with what the division promises of them. The same dividend has the same ones."""

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
            q, r = (z3.BitVec(f"{name} {len(self.found)}", 32) for name in ("quotient", "remainder"))
            most = self.most.get(dividend.get_id(), 0x7FFFFFFF) // divisor
            self.promises.append(z3.And(dividend == q * divisor + r, 0 <= r, r < divisor, 0 <= q, q <= most))
            self.found[key] = dividend, q, r
            self.most[q.get_id()] = most
        return self.found[key][1:]
