/**
 * @file
 * strutil: text for small firmware. 50 functions that measure, copy, join, search, compare,
 * tokenize, trim, replace and convert zero-terminated text of 8-bit and of 16-bit units.
 *
 * No function allocates, keeps state or calls the C library. None reads a unit after a terminator
 * or past a given count, and none writes a unit that its contract does not name. A null pointer
 * is an ordinary argument with a stated result. Errors have no result of their own: they give the
 * null, 0 or empty text that an ordinary argument can give as well.
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
 * function cannot see is the caller's to get right: that a buffer is large enough, and that an
 * output does not overlap an input except where a contract allows it.
 *
 * A function whose name starts with W is the wide twin of the one without and has the same
 * contract, with 16-bit units for 8-bit ones.
 *
 * Beware: SubName.h turns each API name into a macro for its numbered link symbol. It rewrites
 * that identifier everywhere after the include, class members too.
 */
#ifndef STRUTIL_H
#define STRUTIL_H

#include "SubName.h"
#include "base_types.h"

#ifdef __cplusplus
extern "C" {
#endif

/** @name Lengths and case mapping */
/**@{*/

/** Returns the length of `str`; 0 if it is null. */
int StrLen(const char* str);
/** Wide twin of StrLen(): counts units, not bytes. */
int WStrLen(const WCHAR* str);

/** Returns `c` + 32 if `c` is "A" to "Z", else `c`: any int is allowed, units of both widths too.
 */
int CharToLower(const int c);
/** Returns `c` - 32 if `c` is "a" to "z", else `c`: any int is allowed, units of both widths too.
 */
int CharToUpper(const int c);

/**
 * Turns the small letters of `str` into capitals in place and returns `str`; null if it is null.
 * Only the units that change are written: a text without a small letter may be read-only.
 */
char* StrUpper(char* str);
/** Wide twin of StrUpper(). */
WCHAR* WStrUpper(WCHAR* str);

/**
 * Turns the capital letters of `str` into small ones in place and returns `str`; null if it is
 * null. Only the units that change are written: a text without a capital may be read-only.
 */
char* StrLower(char* str);
/** Wide twin of StrLower(). */
WCHAR* WStrLower(WCHAR* str);

/**@}*/

/**
 * @name Copying
 * All copies run forward, so `dst` may overlap `src` if it begins before it; a `dst` that begins
 * inside `src` is not supported. If `dst` is null or the same pointer as `src`, nothing is
 * written. A null `src` empties `dst`.
 */
/**@{*/

/** Copies `src` and its terminator to `dst`, which has room for the length of `src` + 1 units. */
void StrCopy(char* dst, const char* src);
/** Wide twin of StrCopy(). */
void WStrCopy(WCHAR* dst, const WCHAR* src);

/**
 * Copies as much of `src` as fits into the capacity `n` of `dst`: at most `n` - 1 units, then the
 * terminator; the units after it are left as they were. With `n` below 1 nothing is written. A cut
 * is not reported: compare the lengths where it matters.
 */
void StrCopyBuf(char* dst, int n, const char* src);
/** Wide twin of StrCopyBuf(). */
void WStrCopyBuf(WCHAR* dst, int n, const WCHAR* src);

/**
 * Copies at most `n` units of `src`, its terminator counted. It ends after the terminator, without
 * filling up to `n`, or after `n` units: if the length of `src` is `n` or more, `dst` is left
 * unterminated. Nothing of `src` past these units is read. With `n` below 1, `dst` is emptied.
 */
void StrNCopy(char* dst, const char* src, int n);
/** Wide twin of StrNCopy(). */
void WStrNCopy(WCHAR* dst, const WCHAR* src, int n);

/**@}*/

/**
 * @name Concatenation
 * All of these append to the text in `dst`, leave it terminated, and leave the units after the new
 * terminator as they were. If `dst` or `src` is null, nothing is written. `src` must not overlap
 * `dst`: a text cannot be appended to itself.
 */
/**@{*/

/** Appends all of `src`; `dst` has room for both lengths + 1 units. */
void StrCat(char* dst, const char* src);
/** Wide twin of StrCat(). */
void WStrCat(WCHAR* dst, const WCHAR* src);

/**
 * Appends as much of `src` as fits into the capacity `n` of the whole buffer `dst`, old text
 * included. If that leaves no room for a unit more, nothing is written: an old text that is too
 * long already is not cut. A cut is not reported.
 */
void StrCatBuf(char* dst, int n, const char* src);
/** Wide twin of StrCatBuf(). */
void WStrCatBuf(WCHAR* dst, int n, const WCHAR* src);

/**
 * Appends at most `num` units of `src` and reads no more than these; with `num` below 1 the text
 * stays as it is. Wide only.
 */
void WStrNCat(WCHAR* dst, const WCHAR* src, int num);

/** Appends at most `num` units of `src`, and no more than WStrCatBuf() with `n` would. Wide only.
 */
void WStrNCatBuf(WCHAR* dst, int n, const WCHAR* src, int num);

/**@}*/

/**
 * @name Searching
 * Each returns a pointer into `str` to the first place found, or null: when there is none, when
 * an argument is null, and whenever `str` is empty. Nothing is written.
 */
/**@{*/

/** Finds the unit `c` in `str`. The terminator is never found: `c` = 0 gives null. */
char* StrChr(const char* str, const char c);
/** Wide twin of StrChr(). */
WCHAR* WStrChr(const WCHAR* str, const WCHAR c);

/** Finds `substr` in `str`. An empty `substr` is found at once, unless `str` is empty too. */
char* StrStr(const char* str, const char* substr);
/** Wide twin of StrStr(). */
WCHAR* WStrStr(const WCHAR* str, const WCHAR* substr);

/** StrStr() with capital and small letters taken as equal. */
char* StrIStr(const char* str, const char* substr);
/** Wide twin of StrIStr(). */
WCHAR* WStrIStr(const WCHAR* str, const WCHAR* substr);

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
int StrNCmp(const char* str1, const char* str2, int n);
/** Wide twin of StrNCmp(). */
int WStrNCmp(const WCHAR* str1, const WCHAR* str2, int n);

/**
 * Compares at most `n` units without regard to case. Irregular: texts that differ always give
 * -(i + 1), whichever is the larger, so the result orders nothing; 1 is still given if only `str2`
 * is null.
 */
int StrNICmp(const char* str1, const char* str2, int n);
/** Compares at most `n` units without regard to case. Not irregular as StrNICmp() is: i + 1 too. */
int WStrNICmp(const WCHAR* str1, const WCHAR* str2, int n);

/** Compares two texts. */
int StrCmp(const char* str1, const char* str2);
/** Wide twin of StrCmp(). */
int WStrCmp(const WCHAR* str1, const WCHAR* str2);

/** Compares two texts without regard to case. */
int StrICmp(const char* str1, const char* str2);
/** Wide twin of StrICmp(). */
int WStrICmp(const WCHAR* str1, const WCHAR* str2);

/**@}*/

#ifdef __cplusplus
}
#endif

#endif
