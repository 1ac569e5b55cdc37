/**
 * @file
 * strutil: text for small firmware. 50 functions that measure, copy, join, search, compare,
 * tokenize, trim, replace and convert zero-terminated text of 8-bit and of 16-bit units.
 *
 * No function allocates, keeps state, throws or calls the C library. None reads a unit after a
 * terminator or past a given count, and none writes a unit that its contract does not name. A null
 * pointer is an ordinary argument with a stated result. Errors have no result of their own: they
 * give the null, 0 or empty text that an ordinary argument can give as well.
 *
 * These headers are for C from C99 on and for C++ from C++11 on; the module alone needs C++17.
 *
 * The words used below:
 * - unit: one element of a text, a `char` (narrow) or a `WCHAR` (wide). Units are unsigned, 0 to
 *   255 or 0 to 65535, whether the caller's plain `char` is signed or not, and stand alone: no
 *   surrogate pair or other sequence is interpreted.
 * - terminator: the unit 0 that ends a text. Every text passed in must have one, unless a count
 *   bounds what is read of it.
 * - length: the number of units before the terminator; 0 for a null text.
 * - capacity: the size of a whole buffer in units, the terminator included.
 * - count: the most units that are taken from a source.
 * - to empty a buffer: to write the terminator to its first unit, and nothing else.
 * - letter: "A" to "Z" and "a" to "z" of ASCII, in both widths. No other unit has a case.
 *
 * Counts and capacities are signed, so a miscalculated negative one is as harmless as 0. What a
 * function cannot see is the caller's to get right: that a buffer is large enough, that an output
 * does not overlap an input except where a contract allows it, and that a ``WCHAR*`` or ``WORD*``
 * is even, as every array of these types is: a Cortex-M0+ faults at an odd one.
 *
 * A wide twin is declared after its narrow function and has the same contract, with 16-bit units
 *  for 8-bit ones. CharToLower() and CharToUpper() serve both widths. The other functions without
 * such a twin state a contract of their own: WStrNCat(), WStrNCatBuf(), WStrNICmp(), and those that
 * convert between the widths.
 *
 * A wide text is written u"..." in C11, where its type is that of WCHAR. In C++ it is of another
 * type: write ``const WCHAR text[] = {'H', 'i', 0}``, or widen a narrow text with StrToWStr().
 *
 * Threads and interrupt handlers may call any function at any time, even while a call of the same
 * function is interrupted, as long as none writes a buffer that another uses.
 *
 * Beware: SubName.h turns each API name into a macro for its numbered link symbol. It rewrites
 * that identifier everywhere after the include, class members too.
 */
#ifndef STRUTIL_H
#define STRUTIL_H

#include "base_types.h"
/* Last, since its macros rewrite what follows. */
#include "SubName.h"

/** The version of these files, as a text and as numbers for `#if`. */
#define STRUTIL_VERSION "1.3.0"
#define STRUTIL_VERSION_MAJOR 1
#define STRUTIL_VERSION_MINOR 3
#define STRUTIL_VERSION_PATCH 0

#ifdef __cplusplus
#define STRUTIL_NOEXCEPT noexcept
extern "C" {
#else
#define STRUTIL_NOEXCEPT
#endif

/** @name Lengths and case mapping */
/**@{*/

/** Returns the length of `str`; 0 if it is null. */
int StrLen(const char* str) STRUTIL_NOEXCEPT;
/** Wide twin of StrLen(): counts units, not bytes. */
int WStrLen(const WCHAR* str) STRUTIL_NOEXCEPT;

/** Returns `c` + 32 if it is "A" to "Z", else `c`. Takes any int, so it serves both widths. */
int CharToLower(const int c) STRUTIL_NOEXCEPT;
/** Returns `c` - 32 if it is "a" to "z", else `c`. Takes any int, so it serves both widths. */
int CharToUpper(const int c) STRUTIL_NOEXCEPT;

/**
 * Turns the small letters of `str` into capitals in place and returns `str`; null if it is null.
 * Only the units that change are written: a text without a small letter may be read-only.
 */
char* StrUpper(char* str) STRUTIL_NOEXCEPT;
/** Wide twin of StrUpper(). */
WCHAR* WStrUpper(WCHAR* str) STRUTIL_NOEXCEPT;

/**
 * Turns the capital letters of `str` into small ones in place and returns `str`; null if it is
 * null. Only the units that change are written: a text without a capital may be read-only.
 */
char* StrLower(char* str) STRUTIL_NOEXCEPT;
/** Wide twin of StrLower(). */
WCHAR* WStrLower(WCHAR* str) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Copying
 * All copies run forward, so `dst` may overlap `src` if it begins before it; a `dst` that begins
 * inside `src` is not supported. The first of these rules that applies decides:
 * 1. `dst` is null or the same pointer as `src`: nothing is written.
 * 2. StrCopyBuf() with `n` below 1: nothing is written, not even for a null `src`.
 * 3. `src` is null: `dst` is emptied.
 * 4. StrNCopy() with `n` below 1: `dst` is emptied.
 * 5. Else `src` is copied as each function says.
 */
/**@{*/

/** Copies `src` and its terminator to `dst`, which has room for the length of `src` + 1 units. */
void StrCopy(char* dst, const char* src) STRUTIL_NOEXCEPT;
/** Wide twin of StrCopy(). */
void WStrCopy(WCHAR* dst, const WCHAR* src) STRUTIL_NOEXCEPT;

/**
 * Copies as much of `src` as fits into the capacity `n` of `dst`: at most `n` - 1 units, then the
 * terminator; the units after it are left as they were. A cut is not reported: compare the lengths
 * where it matters.
 */
void StrCopyBuf(char* dst, int n, const char* src) STRUTIL_NOEXCEPT;
/** Wide twin of StrCopyBuf(). */
void WStrCopyBuf(WCHAR* dst, int n, const WCHAR* src) STRUTIL_NOEXCEPT;

/**
 * Copies at most `n` units of `src`, its terminator counted. It ends after the terminator, and does
 * not pad up to `n`, or after `n` units: if the length of `src` is `n` or more, `dst` is left
 * unterminated. Nothing of `src` past these units is read.
 */
void StrNCopy(char* dst, const char* src, int n) STRUTIL_NOEXCEPT;
/** Wide twin of StrNCopy(). */
void WStrNCopy(WCHAR* dst, const WCHAR* src, int n) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Concatenation
 * All of these append to the text in `dst`, leave it terminated, and leave the units after the new
 * terminator as they were. The terminator is written again even if nothing is appended, so `dst`
 * must be writable; only if `dst` or `src` is null, or StrCatBuf() or WStrNCatBuf() has no room,
 * nothing is written. `src` must not overlap `dst`: a text cannot be appended to itself.
 */
/**@{*/

/** Appends all of `src`; `dst` has room for both lengths + 1 units. */
void StrCat(char* dst, const char* src) STRUTIL_NOEXCEPT;
/** Wide twin of StrCat(). */
void WStrCat(WCHAR* dst, const WCHAR* src) STRUTIL_NOEXCEPT;

/**
 * Appends as much of `src` as fits into the capacity `n` of the whole buffer `dst`, old text
 * included. If that leaves no room for one more unit, nothing is written: an old text that is too
 * long already is not cut. A cut is not reported. `n` does not bound the search for the end of the
 * old text: `dst` holds a terminator, within `n` or not.
 */
void StrCatBuf(char* dst, int n, const char* src) STRUTIL_NOEXCEPT;
/** Wide twin of StrCatBuf(). */
void WStrCatBuf(WCHAR* dst, int n, const WCHAR* src) STRUTIL_NOEXCEPT;

/**
 * Appends at most `num` units of `src` and reads no more than these; with `num` below 1 nothing is
 * appended. `dst` has room for its text, the units appended and the terminator. Wide only.
 */
void WStrNCat(WCHAR* dst, const WCHAR* src, int num) STRUTIL_NOEXCEPT;

/**
 * Appends at most `num` units of `src`, and no more than WStrCatBuf() with `n` would; with `num`
 * below 1 nothing is appended. Wide only.
 */
void WStrNCatBuf(WCHAR* dst, int n, const WCHAR* src, int num) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Searching
 * Each returns a pointer into `str` to the first place found, or null: when there is none, when a
 * pointer is null, and whenever `str` is empty. Nothing is written. The result is not const
 * although `str` is: do not write through it if the text is constant.
 */
/**@{*/

/** Finds the unit `c` in `str`. The terminator is never found: `c` = 0 gives null. */
char* StrChr(const char* str, const char c) STRUTIL_NOEXCEPT;
/** Wide twin of StrChr(). */
WCHAR* WStrChr(const WCHAR* str, const WCHAR c) STRUTIL_NOEXCEPT;

/** Finds `substr` in `str`; an empty one at the start of `str`, unless that is empty as well. */
char* StrStr(const char* str, const char* substr) STRUTIL_NOEXCEPT;
/** Wide twin of StrStr(). */
WCHAR* WStrStr(const WCHAR* str, const WCHAR* substr) STRUTIL_NOEXCEPT;

/** StrStr() with capital and small letters taken as equal. */
char* StrIStr(const char* str, const char* substr) STRUTIL_NOEXCEPT;
/** Wide twin of StrIStr(). */
WCHAR* WStrIStr(const WCHAR* str, const WCHAR* substr) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Comparison
 * Each returns 0 if the texts are equal; otherwise, with i the index of the first unit in which
 * they differ, -(i + 1) if the first text's unit is the smaller and i + 1 if it is the larger. The
 * terminator takes part as the unit 0, so a text is smaller than one that continues it.
 *
 * Null equals null and is smaller than any text: -1 if only `str1` is null, 1 if only `str2` is,
 * whatever `n` is. A text compared with itself (the same pointer) is equal without being read.
 * With N in the name, at most the first `n` units of each are compared and read; they need no
 * terminator, and with `n` below 1 texts are equal. With I in the name, capital letters are taken
 * as small ones, also for the order.
 */
/**@{*/

/** Compares at most `n` units. */
int StrNCmp(const char* str1, const char* str2, int n) STRUTIL_NOEXCEPT;
/** Wide twin of StrNCmp(). */
int WStrNCmp(const WCHAR* str1, const WCHAR* str2, int n) STRUTIL_NOEXCEPT;

/**
 * Compares at most `n` units without regard to case. Irregular: texts that differ always give
 * -(i + 1), whichever is the larger, so the result orders nothing; 1 is still given if only `str2`
 * is null.
 */
int StrNICmp(const char* str1, const char* str2, int n) STRUTIL_NOEXCEPT;
/**
 * Compares at most `n` units without regard to case. Unlike StrNICmp(), gives i + 1 where the first
 * text's unit is the larger.
 */
int WStrNICmp(const WCHAR* str1, const WCHAR* str2, int n) STRUTIL_NOEXCEPT;

/** Compares two texts. */
int StrCmp(const char* str1, const char* str2) STRUTIL_NOEXCEPT;
/** Wide twin of StrCmp(). */
int WStrCmp(const WCHAR* str1, const WCHAR* str2) STRUTIL_NOEXCEPT;

/** Compares two texts without regard to case. */
int StrICmp(const char* str1, const char* str2) STRUTIL_NOEXCEPT;
/** Wide twin of StrICmp(). */
int WStrICmp(const WCHAR* str1, const WCHAR* str2) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Tokenizing and splitting
 * A token is a maximal run of units that are not in the delimiter set `dlmt`, so it is never
 * empty. `dlmt` is a text; the order and repetition of its units do not matter, and an empty one
 * makes the whole rest of `str` one token. `str` is cut in place: the one delimiter that ends a
 * token is overwritten with the terminator, and no other unit is written.
 */
/**@{*/

/**
 * Returns the next token of `str` that begins at or after the index `*off`, or null when only
 * delimiters remain. Set `*off` to 0 before the first call. Each call leaves it after the
 * delimiter that it overwrote, or at the index of the terminator, from where every call returns
 * null. Delimiters before a token are skipped, so no token stands for an empty field between two
 * of them. `*off` must be from 0 to the index of the terminator that ended the text before it was
 * cut: another index is not detected. If an argument is null, the result is null and `*off` stays.
 *
 * A walk's state is `*off` alone, so walks over different texts may alternate, and each call may
 * pass another `dlmt`.
 */
char* StrToken(char* str, int* off, const char* dlmt) STRUTIL_NOEXCEPT;
/** Wide twin of StrToken(). */
WCHAR* WStrToken(WCHAR* str, int* off, const WCHAR* dlmt) STRUTIL_NOEXCEPT;

/**
 * Cuts `str` into all its tokens, stores a pointer to each in `wrd`, and returns their number; 0
 * if an argument is null. Entries past that number are not written. `wrd` has room for all tokens:
 * (length + 1) / 2 entries always suffice, too few are not detected.
 */
int StrSplit(char* str, const char* dlmt, char** wrd) STRUTIL_NOEXCEPT;
/** Wide twin of StrSplit(). */
int WStrSplit(WCHAR* str, const WCHAR* dlmt, WCHAR** wrd) STRUTIL_NOEXCEPT;

/**@}*/

/** @name Trimming */
/**@{*/

/**
 * Removes the units of the set `trimSet` from both ends of `str` in place and returns the new
 * length. First a terminator is written after the last unit that is kept, even if one is there, so
 * `str` must be writable; then, if units were removed at the start, the kept text and its
 * terminator are copied to the start of `str`. No other unit is written: "--ab-." trimmed by "-."
 * holds 'a', 'b', 0, 'b', 0, '.', 0. A null or empty `trimSet` removes nothing; a null `str` gives
 * 0.
 */
int StrTrim(char* str, const char* trimSet) STRUTIL_NOEXCEPT;
/** Wide twin of StrTrim(). */
int WStrTrim(WCHAR* str, const WCHAR* trimSet) STRUTIL_NOEXCEPT;

/**@}*/

/** @name Replacing */
/**@{*/

/**
 * Writes `orig` to `result` with every occurrence of `rep` replaced by `with`, and returns the
 * length of the new text. Occurrences are found from left to right and do not overlap; the
 * replacement is not searched again. An empty `with` deletes the occurrences.
 *
 * With a null `result` nothing is written and the length that the new text will have is returned:
 * call once to size the buffer, provide that many units + 1, and call again to fill it. A smaller
 * buffer is not detected, nor a length that an int cannot hold. `result` must not overlap the other
 * texts, except that it may be `orig` itself if `rep` does not occur in it: nothing is written
 * then.
 *
 * If `orig`, `rep` or `with` is null or `rep` is empty, the result is 0 and nothing is written, not
 * even a terminator.
 */
int StrReplace(const char* orig, const char* rep, const char* with, char* result) STRUTIL_NOEXCEPT;
/** Wide twin of StrReplace(). */
int WStrReplace(const WCHAR* orig, const WCHAR* rep, const WCHAR* with,
                WCHAR* result) STRUTIL_NOEXCEPT;

/**@}*/

/** @name Integer text conversion */
/**@{*/

/**
 * Writes the text of `value` in `radix` to `string` and returns `string`; null if it is null. The
 * text is a "-" if the value is negative, in any radix, then its digits without leading zeros, then
 * the terminator; nothing after it is written. 34 units hold every such text; 13 do in radix 8, 12
 * in radix 10, 10 in radix 16 and 8 in radix 36.
 *
 * A digit d of 0 to 9 is "0" to "9"; above 9 it is the unit 87 + d, cut to the width of a unit: "a"
 * to "z" up to 35. Above radix 169 (wide: 65449) that can be the unit 0, which ends the text early:
 * 169 in radix 200 has length 0.
 *
 * Every value is written so, the most negative one included. A radix below 1 gives the empty text.
 * Radix 1 writes 0 as "0" and gives the empty text for every other value.
 */
char* IntToStr(int value, char* string, int radix) STRUTIL_NOEXCEPT;
/** Wide twin of IntToStr(). */
WCHAR* IntToWStr(int value, WCHAR* string, int radix) STRUTIL_NOEXCEPT;

/**
 * Returns the decimal integer at the start of `string`: spaces and tabs, an optional "-", digits.
 * Reading ends at the first other unit, which is ignored with all that follows. Text that does not
 * begin so gives 0, and so does null: no "+" is read, and no space after the "-". A value too large
 * for an int is not detected: it wraps modulo 2^32.
 */
int StrToInt(const char* string) STRUTIL_NOEXCEPT;
/** Wide twin of StrToInt(). */
int WStrToInt(const WCHAR* string) STRUTIL_NOEXCEPT;

/**@}*/

/** @name Width conversion */
/**@{*/

/**
 * Copies `len` bytes of `src` to `des`, each widened to 16 bits; a byte of 128 or above stays
 * positive. No terminator is looked for or written. With a null pointer or `len` below 1, nothing
 * is written. The copy runs forward, one unit after the other, also where the arrays overlap.
 */
void BytesToWords(const char* src, WORD* des, int len) STRUTIL_NOEXCEPT;

/**
 * Widens as much of `src` as fits into the capacity `bufsize` of `des`, at most `bufsize` - 1
 * units, then the terminator, and returns `des`; null if it is null. A null `src` empties `des`.
 * So does a `bufsize` below 2, 0 and negative ones included: `des` must have room for one unit,
 * whatever `bufsize` is. A cut is not reported.
 */
WCHAR* StrToWStr(const char* src, WCHAR* des, int bufsize) STRUTIL_NOEXCEPT;

/**
 * Writes `src` as printable text to `des`, within its capacity `bufsize`, and returns `des`. The
 * units 32 to 126 are written as they are, every other one as an escape: "&(0x", its value in
 * hexadecimal without leading zeros, ")". 9 x the length of `src` + 1 units hold every such text.
 * An "&" is not escaped itself, so the text cannot be read back for certain. It ends before the
 * first unit or escape that does not fit whole with the terminator; a cut is not reported.
 *
 * A null `src` empties `des`. A `bufsize` below 1 is taken as 1: `des` must have room for one unit,
 * whatever `bufsize` is. A null `des` gives a constant empty text, which must not be written to.
 */
char* WStrToStr(const WCHAR* src, char* des, int bufsize) STRUTIL_NOEXCEPT;

/**
 * Copies `len` units of `src` to `des`. No terminator is looked for or written. With a null
 * pointer or `len` below 1, nothing is written. The copy runs forward as if unit by unit, also
 * where the arrays overlap; it moves 32 bits at a time where both are aligned to 4, so neither may
 * be memory that takes accesses of 16 bits only.
 */
void WStrToWords(const WCHAR* src, WORD* des, int len) STRUTIL_NOEXCEPT;

/**@}*/

#undef STRUTIL_NOEXCEPT
#ifdef __cplusplus
}
#endif

#endif
