"""What each function returns, writes and may read, as include/strutil.h says it. Units, counts and
results are numbers, or terms of the solver Z3 for any number: every rule here holds for both."""
import z3

MOST = 0x7FFFFFFF
EMPTY = "an empty string"  # a result that is a pointer to one in the image


class Array:
    """A pointer's argument: units of a size in bytes from an address on."""

    def __init__(self, name, address, size, units):
        self.name, self.address, self.size, self.units = name, address, size, units

    def __len__(self):
        return len(self.units)

    def place(self, index):
        return self.address + self.size * index

    def after(self, count):
        return Array(self.name, self.place(count), self.size, self.units[count:])


class Call:
    """What a call may do: when it may read a unit and when it writes one, by addresses. `cells` are
    the units as they are by then, `needs` what the caller has to see to, `lengths` those that its
    upper bound in cycles depends on."""

    def __init__(self, arrays, divide=None):
        self.cells = {array.place(index): unit
                      for array in arrays for index, unit in enumerate(array.units)}
        self.readable, self.written, self.needs, self.divide = {}, {}, [], divide
        self.lengths = {"n": 0, "d": 0, "m": 1, "w": 0, "r": 0}

    def decided(self, condition):
        """Whether a condition holds, for all that the caller may pass or for none of it."""
        if isinstance(condition, bool):
            return condition
        solver = z3.Solver()
        solver.add(*self.needs)
        can_hold = solver.check(condition) == z3.sat
        assert not can_hold or solver.check(Not(condition)) == z3.unsat, condition
        return can_hold

    def unit(self, array, index):
        return self.cells[array.place(index)]

    def write(self, array, index, value, when=True):
        if when is False:
            return
        address = array.place(index)
        self.cells[address] = If(when, value, self.cells[address])
        self.written[address] = Or(self.written.get(address, False), when)

    def may_read(self, array, index, when=True):
        address = array.place(index)
        self.readable[address] = Or(self.readable.get(address, False), when)

    def reads(self, text, most=MOST):
        """No unit after the terminator, or past a count."""
        for index, when in enumerate(before_end(text)):
            self.may_read(text, index, And(when, index < most))


# Python's operators on conditions, and the solver's where one of them is a term.

def If(condition, yes, no):
    if isinstance(condition, bool):
        return yes if condition else no
    if isinstance(yes, int) and isinstance(no, int) and not isinstance(yes, bool):
        yes = z3.BitVecVal(yes, 32)
    return z3.If(condition, yes, no)


def And(*conditions):
    if any(one is False for one in conditions):
        return False
    terms = [one for one in conditions if one is not True]
    return z3.And(*terms) if terms else True


def Or(*conditions):
    if any(one is True for one in conditions):
        return True
    terms = [one for one in conditions if one is not False]
    return z3.Or(*terms) if terms else False


def Not(condition):
    return not condition if isinstance(condition, bool) else z3.Not(condition)


def least(a, b):
    return If(a < b, a, b)


# Words that the contracts share.

def before_end(text):
    """Of each unit, whether no terminator is in front of it."""
    found, when = [], True
    for unit in text.units:
        found.append(when)
        when = And(when, unit != 0)
    return found


def first(text, condition, start=0):
    """The first index from `start` on for which the condition holds."""
    found = len(text)
    for index in reversed(range(len(text))):
        found = If(And(condition(index), index >= start), index, found)
    return found


def length(text):
    return first(text, lambda index: text.units[index] == 0) if text else 0


def lower(unit):
    return If(And(unit >= 65, unit <= 90), unit + 32, unit)


def upper(unit):
    return If(And(unit >= 97, unit <= 122), unit - 32, unit)


def is_in(text, unit):
    """Whether a text has the unit; it never has the terminator."""
    members = zip(text.units, before_end(text))
    return And(unit != 0, Or(*(And(when, one == unit) for one, when in members)))


def begins_with(units, text, mapped=lambda unit: unit):
    matches = False
    for index in reversed(range(len(text))):
        goes_on = index < len(units) and \
            And(mapped(units[index]) == mapped(text.units[index]), matches)
        matches = Or(text.units[index] == 0, goes_on)
    return matches


# Lengths and case mapping

def str_len(call, str):
    if not str:
        return 0
    call.reads(str)
    call.lengths["n"] = length(str)
    return length(str)


def char_to_lower(_, c):
    return lower(c)


def char_to_upper(_, c):
    return upper(c)


def map_case(mapped):
    def contract(call, str):
        if not str:
            return 0
        call.reads(str)
        call.lengths["n"] = length(str)
        for index, when in enumerate(before_end(str)):
            unit = str.units[index]
            call.write(str, index, mapped(unit), And(when, mapped(unit) != unit))
        return str.address
    return contract


# Copying

def copy_units(call, dst, src, last):
    """Copies forward up to the index `last`, which gets the terminator."""
    call.lengths["n"] = If(last < 0, 0, last)
    for index in range(len(src)):
        unit = call.unit(src, index)
        call.write(dst, index, If(index == last, 0, unit), index <= last)


def is_nothing_to_copy(dst, src):
    return not dst or (src and dst.address == src.address)


def str_copy(call, dst, src):
    if is_nothing_to_copy(dst, src):
        return
    if not src:
        return call.write(dst, 0, 0)
    call.reads(src)
    copy_units(call, dst, src, length(src))


def str_copy_buf(call, dst, n, src):
    if is_nothing_to_copy(dst, src):
        return
    if not src:
        return call.write(dst, 0, 0, n >= 1)
    call.reads(src)
    copy_units(call, dst, src, If(n < 1, -1, least(length(src), n - 1)))


def str_n_copy(call, dst, src, n):
    if is_nothing_to_copy(dst, src):
        return
    if not src:
        return call.write(dst, 0, 0)
    call.reads(src, n)
    ends = counted_length(call, src, n)
    call.lengths["n"] = If(ends < 0, 0, ends)
    call.write(dst, 0, 0, n < 1)
    for index in range(len(src)):
        call.write(dst, index, call.unit(src, index), And(index <= ends, index < n))


def counted_length(call, text, count):
    """Of a text that has a terminator unless the count bounds what is read of it."""
    call.needs.append(Or(count <= len(text), *(unit == 0 for unit in text.units)))
    return least(length(text), count)


# Concatenation

def append(call, dst, src, count):
    """Appends so many units and the terminator; none of it where the count is negative."""
    old = length(dst)
    call.lengths.update(d=old, n=If(count < 0, 0, count))
    for end in range(len(dst)):
        for index in range(min(len(src) + 1, len(dst) - end)):
            unit = src.units[index] if index < len(src) else 0
            when = And(old == end, index <= count)
            call.write(dst, end + index, If(index == count, 0, unit), when)


def str_cat(call, dst, src):
    if dst and src:
        call.reads(dst)
        call.reads(src)
        append(call, dst, src, length(src))


def str_cat_buf(call, dst, n, src):
    if dst and src:
        call.reads(dst)
        call.reads(src)
        append(call, dst, src, room(dst, n, length(src)))


def str_n_cat(call, dst, src, num):
    if dst and src:
        call.reads(dst)
        call.reads(src, num)
        ends = counted_length(call, src, num)
        append(call, dst, src, If(ends < 0, 0, ends))


def str_n_cat_buf(call, dst, n, src, num):
    if dst and src:
        call.reads(dst)
        call.reads(src, num)
        ends = counted_length(call, src, num)
        append(call, dst, src, room(dst, n, If(ends < 0, 0, ends)))


def room(dst, n, count):
    """How many of so many units fit into a capacity; -1 if there is no room for one."""
    old = length(dst)
    return If(n <= old + 1, -1, least(count, n - 1 - old))


# Searching

def str_chr(call, str, c):
    if not str:
        return 0
    call.reads(str)
    found = 0
    for index, when in reversed(list(enumerate(before_end(str)))):
        unit = str.units[index]
        found = If(And(when, unit != 0, unit == c), str.place(index), found)
    call.lengths["n"] = first(str, lambda index: Or(str.units[index] == 0, str.units[index] == c))
    return found


def find(mapped):
    def contract(call, str, substr):
        if not str or not substr:
            return 0
        call.reads(str)
        call.reads(substr)
        found, walked = 0, 0
        for index in reversed(range(len(str))):
            is_end = str.units[index] == 0
            matches = begins_with(str.units[index:], substr, mapped)
            found = If(is_end, 0, If(matches, str.place(index), found))
            walked = If(is_end, index, If(matches, index + length(substr), walked))
        call.lengths.update(n=walked, m=length(substr))
        return found
    return contract


# Comparison

def compare(mapped=lambda unit: unit, ordered=True):
    def contract(call, str1, str2, n=MOST):
        if not str1 or not str2:
            return (1 if str1 else 0) - (1 if str2 else 0)
        if str1.address == str2.address:
            return 0
        for text in (str1, str2):
            call.reads(text, n)
            counted_length(call, text, n)
        result, walked = 0, min(len(str1), len(str2))
        for index in reversed(range(min(len(str1), len(str2)))):
            a, b = mapped(str1.units[index]), mapped(str2.units[index])
            place = If(a < b, -(index + 1), index + 1) if ordered else -(index + 1)
            result = If(index >= n, 0, If(a != b, place, If(a == 0, 0, result)))
            walked = If(Or(index >= n, a != b, a == 0), index, walked)
        call.lengths["n"] = walked
        return result
    return contract


# Tokenizing and splitting

def str_token(call, str, off, dlmt):
    if not str or not off or not dlmt:
        return 0
    call.may_read(off, 0)
    rest = str.after(off.units[0])
    call.reads(rest)
    call.reads(dlmt)
    delimits = [is_in(dlmt, unit) for unit in rest.units]
    start = first(rest, lambda index: Not(delimits[index]))
    is_end = [Or(delimits[index], unit == 0) for index, unit in enumerate(rest.units)]
    end = first(rest, lambda index: is_end[index], start)
    is_cut = Or(*(And(end == index, delimits[index]) for index in range(len(rest))))
    for index in range(len(rest)):
        call.write(rest, index, 0, And(end == index, delimits[index]))
    walked = end + If(is_cut, 1, 0)
    call.write(off, 0, off.units[0] + walked)
    call.lengths.update(n=walked, m=length(dlmt))
    return If(end == start, 0, rest.address + rest.size * start)


def str_split(call, str, dlmt, wrd):
    if not str or not dlmt or not wrd:
        return 0
    call.reads(str)
    call.reads(dlmt)
    call.lengths.update(n=length(str), m=length(dlmt))
    number, in_token = 0, False
    for index, when in enumerate(before_end(str)):
        unit = str.units[index]
        is_token = And(when, unit != 0, Not(is_in(dlmt, unit)))
        starts = And(is_token, Not(in_token))
        for entry in range(min(len(wrd), index + 1)):
            call.write(wrd, entry, str.place(index), And(starts, number == entry))
        call.write(str, index, 0, And(in_token, when, unit != 0, Not(is_token)))
        number, in_token = number + If(starts, 1, 0), is_token
    return number


# Trimming

def str_trim(call, str, trimSet):
    if not str:
        return 0
    call.reads(str)
    call.lengths.update(n=length(str), m=length(trimSet))
    kept = [True] * len(str)
    if trimSet:
        call.reads(trimSet)
        kept = [Not(is_in(trimSet, unit)) for unit in str.units]
    start = first(str, lambda index: kept[index]) if trimSet else 0
    end = start
    for index, when in enumerate(before_end(str)):
        end = If(And(when, str.units[index] != 0, kept[index]), index + 1, end)
    for index in range(len(str)):
        call.write(str, index, 0, end == index)
    for index in range(len(str)):
        for removed in range(1, len(str) - index):
            when = And(start == removed, index + removed <= end)
            call.write(str, index, call.unit(str, index + removed), when)
    return end - start


# Replacing

def str_replace(call, orig, rep, with_, result):
    for text in (orig, rep, with_):
        if text:
            call.reads(text)
    if not orig or not rep or not with_:
        return 0
    is_real = rep.units[0] != 0
    passed, size = 0, 0  # units of an occurrence that are still to be passed; of the new text
    for index, when in enumerate(before_end(orig)):
        is_free = And(is_real, when, orig.units[index] != 0, passed == 0)
        begins = And(is_free, begins_with(orig.units[index:], rep))
        if result and result.address == orig.address:
            call.needs.append(Not(begins))
        elif result:
            replaced = And(is_free, Not(begins))
            for at in range(len(result)):
                call.write(result, at, orig.units[index], And(replaced, size == at))
                for unit, is_unit, number in zip(with_.units, before_end(with_), range(at + 1)):
                    is_here = And(begins, is_unit, unit != 0, size + number == at)
                    call.write(result, at, unit, is_here)
        size = size + If(begins, length(with_), If(is_free, 1, 0))
        passed = If(begins, length(rep) - 1, If(passed == 0, 0, passed - 1))
    call.lengths = {"n": If(is_real, length(orig), 0), "m": If(is_real, length(rep), 1), "d": 0,
                    "w": length(with_), "r": size}
    if result and result.address != orig.address:
        for at in range(len(result)):
            call.write(result, at, 0, And(is_real, size == at))
    return size


# Integer text conversion

def int_to_str(call, value, string, radix):
    """The radix is a number. All values that are meant have the same sign."""
    if not string:
        return 0
    is_negative = call.decided(value < 0)
    rest, digits = -value if is_negative else value, []
    if radix > 1:
        for _ in range(min(32, len(string) - 1 - is_negative)):
            rest, digit = divmod(rest, radix) if isinstance(rest, int) else call.divide(rest, radix)
            unit = If(digit < 10, 48 + digit, 87 + digit)
            digits.append((unit & (0xFF if string.size == 1 else 0xFFFF), rest != 0))
    elif radix == 1:
        digits = [(48, False)] if call.decided(value == 0) else []
    write_number(call, string, digits, is_negative)
    return string.address


def write_number(call, string, digits, is_negative):
    """The last digit comes first, each with whether another follows."""
    is_size, sign = True, [ord("-")] if is_negative else []
    if not digits:
        return call.write(string, 0, 0)
    for size in range(1, len(digits) + 1):
        units = sign + [unit for unit, _ in reversed(digits[:size])] + [0]
        goes_on = digits[size - 1][1]
        for index, unit in enumerate(units):
            call.write(string, index, unit, And(is_size, Not(goes_on)))
        is_size = And(is_size, goes_on)
    call.needs.append(Not(is_size))


def str_to_int(call, string):
    if not string:
        return 0

    def digits(index, sign, value=0):
        """The value and where reading ends."""
        unit = string.units[index]
        if index == len(string) - 1:
            return sign * value, index
        more, end = digits(index + 1, sign, value * 10 + (unit - 48))
        is_digit = And(unit >= 48, unit <= 57)
        return If(is_digit, more, sign * value), If(is_digit, end, index)

    call.reads(string)
    result, walked = 0, len(string) - 1
    for index in reversed(range(len(string) - 1)):
        unit = string.units[index]
        positive, negative = digits(index, 1), digits(index + 1, -1)
        is_minus, is_blank = unit == ord("-"), Or(unit == 32, unit == 9)
        result = If(is_blank, result, If(is_minus, negative[0], positive[0]))
        walked = If(is_blank, walked, If(is_minus, negative[1], positive[1]))
    call.lengths["n"] = walked
    return result


# Width conversion

def to_words(call, src, des, len):
    if not src or not des:
        return
    call.needs.append(len <= min(src.__len__(), des.__len__()))
    call.lengths["n"] = If(len < 0, 0, len)
    for index in range(min(src.__len__(), des.__len__())):
        call.may_read(src, index, index < len)
        call.write(des, index, call.unit(src, index), index < len)


def str_to_w_str(call, src, des, bufsize):
    if not des:
        return 0
    if not src:
        call.write(des, 0, 0)
        return des.address
    call.reads(src)
    copy_units(call, des, src, If(bufsize < 2, 0, least(length(src), bufsize - 1)))
    return des.address


def w_str_to_str(call, src, des, bufsize):
    if not des:
        return EMPTY
    if not src:
        call.write(des, 0, 0)
        return des.address
    call.reads(src)
    size, fits, walked = 0, True, 0
    for unit, when in zip(src.units, before_end(src)):
        is_plain = And(unit >= 32, unit <= 126)
        digits = If(unit < 0x10, 1, If(unit < 0x100, 2, If(unit < 0x1000, 3, 4)))
        wanted = If(is_plain, 1, digits + 5)
        walked = walked + If(And(fits, when, unit != 0), 1, 0)
        fits = And(fits, when, unit != 0, size + wanted < bufsize)
        for at in range(des.__len__()):
            is_here = And(fits, at >= size, at < size + wanted)
            if is_here is False:
                continue
            number = at - size
            digit = at - size - 4
            nibble = shifted_right(unit, 4 * (digits - 1 - digit)) & 15
            escape = If(digit == digits, ord(")"), nibble + If(nibble < 10, 48, 87))
            for place, letter in enumerate("&(0x"):
                escape = If(number == place, ord(letter), escape)
            call.write(des, at, If(is_plain, unit, escape), is_here)
        size = size + If(fits, wanted, 0)
    call.lengths["n"] = walked
    for at in range(des.__len__()):
        call.write(des, at, 0, size == at)
    return des.address


def shifted_right(unit, bits):
    if isinstance(unit, int) and isinstance(bits, int):
        return unit >> max(bits, 0)
    return z3.LShR(unit if not isinstance(unit, int) else z3.BitVecVal(unit, 32), bits)


# Each function, with its arguments: the name of each and what it is.
FUNCTIONS = {
    "StrLen": (str_len, "str:text"),
    "CharToLower": (char_to_lower, "c:int"),
    "CharToUpper": (char_to_upper, "c:int"),
    "StrUpper": (map_case(upper), "str:text"),
    "StrLower": (map_case(lower), "str:text"),
    "StrCopy": (str_copy, "dst:out src:text"),
    "StrCopyBuf": (str_copy_buf, "dst:out n:int src:text"),
    "StrNCopy": (str_n_copy, "dst:out src:counted n:int"),
    "StrCat": (str_cat, "dst:room src:text"),
    "StrCatBuf": (str_cat_buf, "dst:room n:int src:text"),
    "StrNCat": (str_n_cat, "dst:room src:counted num:int"),
    "StrNCatBuf": (str_n_cat_buf, "dst:room n:int src:counted num:int"),
    "StrChr": (str_chr, "str:text c:unit"),
    "StrStr": (find(lambda unit: unit), "str:text substr:pattern"),
    "StrIStr": (find(lower), "str:text substr:pattern"),
    "StrNCmp": (compare(), "str1:counted str2:counted n:int"),
    "StrNICmp": (compare(lower, False), "str1:counted str2:counted n:int"),
    "WStrNICmp": (compare(lower), "str1:counted str2:counted n:int"),
    "StrCmp": (compare(), "str1:text str2:text"),
    "StrICmp": (compare(lower), "str1:text str2:text"),
    "StrToken": (str_token, "str:text off:offset dlmt:pattern"),
    "StrSplit": (str_split, "str:text dlmt:pattern wrd:pointers"),
    "StrTrim": (str_trim, "str:text trimSet:pattern"),
    "StrReplace": (str_replace, "orig:text rep:pattern with:with result:out"),
    "IntToStr": (int_to_str, "value:int string:out radix:int"),
    "StrToInt": (str_to_int, "string:text"),
    "BytesToWords": (to_words, "src:words des:words len:int"),
    "WStrToWords": (to_words, "src:words des:words len:int"),
    "StrToWStr": (str_to_w_str, "src:text des:out bufsize:int"),
    "WStrToStr": (w_str_to_str, "src:text des:out bufsize:int"),
}


def narrow(name):
    """The name of which a function has the contract."""
    if name == "IntToWStr":
        return "IntToStr"
    return name if name in FUNCTIONS else name[1:]


def expected(name, values):
    """What a call returns, or 0, with numbers as arguments, and arrays of numbers, which it
    changes."""
    arrays = [one for one in values if isinstance(one, Array)]
    call = Call(arrays)
    result = FUNCTIONS[narrow(name)][0](call, *values)
    for array in arrays:
        array.units = [call.unit(array, index) for index in range(len(array))]
    return result or 0
