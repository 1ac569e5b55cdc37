/**
 * @file
 * strutil: a string library for small firmware. 50 functions measure, copy, append, search, split,
 * compare, trim, replace and convert null-terminated strings of 8-bit `char` or 16-bit `WCHAR`.
 *
 * No function allocates memory, keeps state, throws an exception or calls the C library. None reads
 * a unit after a terminator or past a given count, and none writes a unit that its comment does not
 * name. Every pointer may be null, with a stated result. There are no error codes: an invalid
 * argument gives null, 0 or an empty string, which valid arguments can give as well.
 *
 * The headers compile as C from C99 on and as C++ from C++11 on. Only strutil.cpp needs C++17.
 *
 * The words used below:
 * - unit (code unit): one element of a string, a `char` if narrow or a `WCHAR` if wide. Its value
 *   is unsigned, 0 to 255 or 0 to 65535, whether the caller's plain `char` is signed or not. Each
 *   unit stands alone: no UTF-8 sequence or surrogate pair is interpreted.
 * - terminator: the unit 0 that ends a string. Every string passed in must have one, unless a count
 *   bounds what is read of it.
 * - length: the number of units before the terminator; 0 for a null string.
 * - capacity: the size of a whole buffer in units, terminator included.
 * - count: the largest number of units that a function takes from a source.
 * - to make a buffer empty: to write the terminator to its first unit, and nothing else.
 * - letter: A to Z (uppercase) or a to z (lowercase). No other unit has a case, in either width.
 *
 * Capacities and counts are signed, and a negative one acts as 0 does. The caller must ensure what
 * a function cannot check: that every buffer is large enough; that output and input do not overlap,
 * except where a comment allows it; and that every ``WCHAR*`` and ``WORD*`` is 2-byte aligned, as
 * every array of these types is: a misaligned access is a HardFault on Cortex-M0+.
 *
 * The wide version of a function follows it and has the same contract, with WCHARs in place of
 * chars. All lengths, capacities, counts and positions of a wide string are in WCHARs, never in
 * bytes, so `sizeof` of a WCHAR array is not its capacity. CharToLower() and CharToUpper() serve
 * both widths, WStrNCat() and WStrNCatBuf() are wide only, and WStrNICmp() differs from StrNICmp().
 *
 * In C11, u"..." is a wide string literal of the right type. In C++ its type is another one: write
 * ``const WCHAR hi[] = {'H', 'i', 0}``, or convert a narrow string with StrToWStr().
 *
 * Every function is reentrant: threads and interrupt handlers may call it at any time, as long as
 * no call writes a buffer that another call is using.
 *
 * Beware: SubName.h turns each function name into a macro for its numbered link symbol. The macro
 * replaces that identifier everywhere after the include, class members included.
 */
#ifndef STRUTIL_H
#define STRUTIL_H

#include "base_types.h"
/* Last, because its macros replace names in what follows. */
#include "SubName.h"

/** The version of these files, as a string and as numbers for `#if`. */
#define STRUTIL_VERSION "1.4.0"
#define STRUTIL_VERSION_MAJOR 1
#define STRUTIL_VERSION_MINOR 4
#define STRUTIL_VERSION_PATCH 0

#ifdef __cplusplus
#define STRUTIL_NOEXCEPT noexcept
extern "C" {
#else
#define STRUTIL_NOEXCEPT
#endif

/** @name Lengths and case mapping */
/**@{*/

/** Returns the length of `str` in units, terminator excluded; 0 if `str` is null. */
int StrLen(const char* str) STRUTIL_NOEXCEPT;
/** Wide version of StrLen(). The length is in WCHARs, not bytes. */
int WStrLen(const WCHAR* str) STRUTIL_NOEXCEPT;

/** Returns `c` + 32 if `c` is 'A' to 'Z', otherwise `c`. `c` may be any int: serves both widths. */
int CharToLower(const int c) STRUTIL_NOEXCEPT;
/** Returns `c` - 32 if `c` is 'a' to 'z', otherwise `c`. `c` may be any int: serves both widths. */
int CharToUpper(const int c) STRUTIL_NOEXCEPT;

/**
 * Converts `str` to uppercase in place (ASCII letters only) and returns it. Only units that change
 * are written: a string without lowercase letters may be read-only. A null `str` returns null.
 */
char* StrUpper(char* str) STRUTIL_NOEXCEPT;
/** Wide version of StrUpper(): WCHARs above 127 have no case. */
WCHAR* WStrUpper(WCHAR* str) STRUTIL_NOEXCEPT;

/**
 * Converts `str` to lowercase in place (ASCII letters only) and returns it. Only units that change
 * are written: a string without uppercase letters may be read-only. A null `str` returns null.
 */
char* StrLower(char* str) STRUTIL_NOEXCEPT;
/** Wide version of StrLower(): WCHARs above 127 have no case. */
WCHAR* WStrLower(WCHAR* str) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Copying
 * These copy forward. They return nothing: compare lengths if truncation matters.
 */
/**@{*/

/**
 * Copies `src`, terminator included, to `dst`. `dst` must have room for StrLen(src) + 1 units.
 *
 * Nothing is written if `dst` is null or `dst` == `src`. A null `src` makes `dst` empty. `dst` may
 * overlap `src` only if it begins before `src`.
 */
void StrCopy(char* dst, const char* src) STRUTIL_NOEXCEPT;
/** Wide version of StrCopy(). `dst` must have room for WStrLen(src) + 1 WCHARs. */
void WStrCopy(WCHAR* dst, const WCHAR* src) STRUTIL_NOEXCEPT;

/**
 * Copies `src` to `dst`, truncated to fit. `n` is the capacity of `dst` in units, terminator
 * included: at most `n` - 1 units are copied, then the terminator is written. The units after it
 * are unchanged. Truncation is not reported.
 *
 * Nothing is written if `dst` is null, `dst` == `src` or `n` is below 1. Otherwise a null `src`
 * makes `dst` empty. `dst` may overlap `src` only if it begins before `src`.
 */
void StrCopyBuf(char* dst, int n, const char* src) STRUTIL_NOEXCEPT;
/** Wide version of StrCopyBuf(). `n` counts WCHARs, not bytes: do not pass sizeof. */
void WStrCopyBuf(WCHAR* dst, int n, const WCHAR* src) STRUTIL_NOEXCEPT;

/**
 * Copies at most `n` units of `src` to `dst`. It stops after the terminator of `src` and does not
 * pad. **If StrLen(src) >= n, `dst` gets `n` units and no terminator.** `n` is a count: no more
 * than `n` units of `src` are read, and `src` needs no terminator if it has `n` units. `dst` must
 * have room for `n` units or for StrLen(src) + 1, whichever is fewer, and for at least one.
 *
 * Nothing is written if `dst` is null or `dst` == `src`. Otherwise a null `src`, or `n` below 1,
 * makes `dst` empty. `dst` may overlap `src` only if it begins before `src`.
 */
void StrNCopy(char* dst, const char* src, int n) STRUTIL_NOEXCEPT;
/** Wide version of StrNCopy(), which may leave `dst` unterminated. `n` counts WCHARs, not bytes. */
void WStrNCopy(WCHAR* dst, const WCHAR* src, int n) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Concatenation
 * All append to the string in `dst`. They return nothing: compare lengths if truncation matters.
 */
/**@{*/

/**
 * Appends `src` to the string in `dst`. `dst` must be terminated and must have room for both
 * lengths + 1 units. The units after the new terminator are unchanged.
 *
 * Nothing is written if `dst` or `src` is null. An empty `src` writes the terminator again, so
 * `dst` must be writable. `src` must not overlap `dst`, so no string can be appended to itself.
 */
void StrCat(char* dst, const char* src) STRUTIL_NOEXCEPT;
/** Wide version of StrCat(). `dst` must have room for both lengths + 1 WCHARs. */
void WStrCat(WCHAR* dst, const WCHAR* src) STRUTIL_NOEXCEPT;

/**
 * Appends `src` to the string in `dst`, truncated to fit. `n` is the capacity of the whole buffer
 * `dst` in units, not the room that is left: at most `n` - StrLen(dst) - 1 units are appended, then
 * the terminator is written. The units after it are unchanged. Truncation is not reported.
 *
 * Nothing is written if `dst` or `src` is null, or if there is no room for one more unit: a `dst`
 * that is full, or longer than `n` allows, keeps its string. With room, an empty `src` writes the
 * terminator again, so `dst` must be writable. `dst` must be terminated: the search for its end is
 * not limited by `n`. `src` must not overlap `dst`, so no string can be appended to itself.
 */
void StrCatBuf(char* dst, int n, const char* src) STRUTIL_NOEXCEPT;
/** Wide version of StrCatBuf(). `n` counts WCHARs, not bytes: do not pass sizeof. */
void WStrCatBuf(WCHAR* dst, int n, const WCHAR* src) STRUTIL_NOEXCEPT;

/**
 * Appends at most `num` WCHARs of `src` to the string in `dst`, then writes the terminator. `num`
 * is a count of WCHARs, not bytes: no more than `num` WCHARs of `src` are read, and `src` needs no
 * terminator if it has that many. `dst` must be terminated and must have room for its string, the
 * WCHARs appended and the terminator. The WCHARs after the new terminator are unchanged.
 *
 * Nothing is written if `dst` or `src` is null. With `num` below 1 or an empty `src`, only the
 * terminator of `dst` is written again, so `dst` must be writable. `src` must not overlap `dst`, so
 * no string can be appended to itself.
 */
void WStrNCat(WCHAR* dst, const WCHAR* src, int num) STRUTIL_NOEXCEPT;

/**
 * Appends at most `num` WCHARs of `src` to the string in `dst`, and no more than fit. `n` is the
 * capacity of the whole buffer `dst`, `num` a count; both are in WCHARs, not bytes. It appends at
 * most `n` - WStrLen(dst) - 1 WCHARs, reads no more than `num` of `src`, and then writes the
 * terminator. The WCHARs after the new terminator are unchanged. Truncation is not reported.
 *
 * Nothing is written if `dst` or `src` is null, or if there is no room for one more WCHAR: a `dst`
 * that is full, or longer than `n` allows, keeps its string. With room, `num` below 1 or an empty
 * `src` writes the terminator again, so `dst` must be writable. `dst` must be terminated: the
 * search for its end is not limited by `n`. `src` must not overlap `dst`, so no string can be
 * appended to itself.
 */
void WStrNCatBuf(WCHAR* dst, int n, const WCHAR* src, int num) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Searching
 * The result points into `str`. None of these functions writes anything.
 */
/**@{*/

/**
 * Returns a pointer to the first unit of `str` that equals `c`, or null if there is none. Also null
 * if `str` is null or empty, or if `c` is 0: unlike strchr(), the terminator is never found.
 * Nothing is written. The result is not const, but do not write through it if `str` is constant.
 */
char* StrChr(const char* str, const char c) STRUTIL_NOEXCEPT;
/** Wide version of StrChr(). `c` is a whole WCHAR: 'A' does not match 0x0141. */
WCHAR* WStrChr(const WCHAR* str, const WCHAR c) STRUTIL_NOEXCEPT;

/**
 * Returns a pointer to the first occurrence of `substr` in `str`, or null if there is none. Also
 * null if either is null or `str` is empty. An empty `substr` is found at the start of a `str` that
 * is not empty. Nothing is written. The result is not const, but do not write through it if `str`
 * is constant.
 */
char* StrStr(const char* str, const char* substr) STRUTIL_NOEXCEPT;
/** Wide version of StrStr(). The result points to a WCHAR of `str`. */
WCHAR* WStrStr(const WCHAR* str, const WCHAR* substr) STRUTIL_NOEXCEPT;

/**
 * Returns a pointer to the first occurrence of `substr` in `str`, ignoring case (ASCII letters
 * only), or null if there is none. Also null if either is null or `str` is empty. An empty `substr`
 * is found at the start of a `str` that is not empty. Nothing is written. The result is not const,
 * but do not write through it if `str` is constant.
 */
char* StrIStr(const char* str, const char* substr) STRUTIL_NOEXCEPT;
/** Wide version of StrIStr(). WCHARs above 127 have no case. */
WCHAR* WStrIStr(const WCHAR* str, const WCHAR* substr) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Comparison
 * The result is the position of the first difference, not just a sign. Nothing is written.
 */
/**@{*/

/**
 * Compares two strings. Returns 0 if they are equal. Otherwise returns the position of the first
 * difference, counted from 1: negative if `str1` has the smaller unit there, positive if it has the
 * larger one. StrCmp("abc", "abd") is -3. Units compare as unsigned. The terminator takes part as
 * the unit 0, so a string is smaller than one that continues it.
 *
 * Null equals null and is smaller than every string: -1 if only `str1` is null, 1 if only `str2`
 * is. The same pointer twice is equal, without being read.
 */
int StrCmp(const char* str1, const char* str2) STRUTIL_NOEXCEPT;
/** Wide version of StrCmp(). The position counts WCHARs, not bytes. */
int WStrCmp(const WCHAR* str1, const WCHAR* str2) STRUTIL_NOEXCEPT;

/**
 * Compares two strings, ignoring case: uppercase ASCII letters count as lowercase, also for the
 * order. Returns 0 if they are equal. Otherwise returns the position of the first difference,
 * counted from 1: negative if `str1` has the smaller unit there, positive if it has the larger one.
 * Units compare as unsigned. The terminator takes part as the unit 0, so a string is smaller than
 * one that continues it.
 *
 * Null equals null and is smaller than every string: -1 if only `str1` is null, 1 if only `str2`
 * is. The same pointer twice is equal, without being read.
 */
int StrICmp(const char* str1, const char* str2) STRUTIL_NOEXCEPT;
/** Wide version of StrICmp(). The position counts WCHARs, not bytes. */
int WStrICmp(const WCHAR* str1, const WCHAR* str2) STRUTIL_NOEXCEPT;

/**
 * Compares at most the first `n` units of two strings, and reads no more of them; neither needs a
 * terminator within `n` units. Returns 0 if these are equal or `n` is below 1. Otherwise returns
 * the position of the first difference, counted from 1: negative if `str1` has the smaller unit
 * there, positive if it has the larger one. Units compare as unsigned. The terminator takes part as
 * the unit 0, so a string is smaller than one that continues it.
 *
 * Null equals null and is smaller than every string, whatever `n` is: -1 if only `str1` is null, 1
 * if only `str2` is. The same pointer twice is equal, without being read.
 */
int StrNCmp(const char* str1, const char* str2, int n) STRUTIL_NOEXCEPT;
/** Wide version of StrNCmp(). `n` and the position count WCHARs, not bytes. */
int WStrNCmp(const WCHAR* str1, const WCHAR* str2, int n) STRUTIL_NOEXCEPT;

/**
 * Compares at most the first `n` units of two strings, ignoring case (ASCII letters only), and
 * reads no more of them; neither needs a terminator within `n` units. Returns 0 if these are equal
 * or `n` is below 1. **Any difference gives the negative position, counted from 1, whichever string
 * is larger:** test the result for equality only, do not sort by it. The terminator takes part as
 * the unit 0.
 *
 * Null equals null, whatever `n` is; -1 if only `str1` is null, and 1, the one positive result, if
 * only `str2` is. The same pointer twice is equal, without being read.
 */
int StrNICmp(const char* str1, const char* str2, int n) STRUTIL_NOEXCEPT;
/**
 * Compares at most the first `n` WCHARs of two strings, ignoring case: uppercase ASCII letters
 * count as lowercase, also for the order. It reads no more of them, and neither needs a terminator
 * within `n` WCHARs. Returns 0 if these are equal or `n` is below 1. Otherwise returns the position
 * of the first difference, counted from 1: negative if `str1` has the smaller unit there and,
 * unlike StrNICmp(), positive if it has the larger one. `n` and the position count WCHARs, not
 * bytes. The terminator is the unit 0, so a string is smaller than one that continues it.
 *
 * Null equals null and is smaller than every string, whatever `n` is: -1 if only `str1` is null, 1
 * if only `str2` is. The same pointer twice is equal, without being read.
 */
int WStrNICmp(const WCHAR* str1, const WCHAR* str2, int n) STRUTIL_NOEXCEPT;

/**@}*/

/**
 * @name Tokenizing and splitting
 * A token is a longest run of units that are not delimiters, so it is never empty.
 */
/**@{*/

/**
 * Returns the next token of `str` that begins at or after the index `*off`, or null when only
 * delimiters remain. `dlmt` is a set of delimiters, given as a string: order and repetition do not
 * matter. An empty one makes the rest of `str` one token. Runs of delimiters are skipped, so a
 * token is never empty: an empty field between two delimiters is not seen.
 *
 * `str` is split in place: the one delimiter that ends the token is overwritten with the
 * terminator, and no other unit is written. Set `*off` to 0 before the first call. Each call leaves
 * it after the delimiter that it overwrote, or at the index of the terminator, from where every
 * call returns null. `*off` must be between 0 and the length that `str` had before the first call;
 * this is not checked.
 *
 * If an argument is null, the result is null and `*off` is unchanged. No state is kept but `*off`,
 * so calls for several strings may alternate, and each call may pass another `dlmt`.
 */
char* StrToken(char* str, int* off, const char* dlmt) STRUTIL_NOEXCEPT;
/** Wide version of StrToken(). `*off` counts WCHARs, not bytes. */
WCHAR* WStrToken(WCHAR* str, int* off, const WCHAR* dlmt) STRUTIL_NOEXCEPT;

/**
 * Splits `str` into all its tokens, stores a pointer to each in `wrd` and returns their number; 0
 * if an argument is null. `dlmt` is a set of delimiters, given as a string: order and repetition do
 * not matter. An empty one makes `str` one token. Runs of delimiters are skipped, so a token is
 * never empty.
 *
 * `str` is split in place: the one delimiter that ends each token is overwritten with the
 * terminator, and no other unit is written. `wrd` must have room for all tokens, which is not
 * checked: (length of `str` + 1) / 2 entries are always enough. Later entries are unchanged.
 */
int StrSplit(char* str, const char* dlmt, char** wrd) STRUTIL_NOEXCEPT;
/** Wide version of StrSplit(). The length of `str` is in WCHARs, not bytes. */
int WStrSplit(WCHAR* str, const WCHAR* dlmt, WCHAR** wrd) STRUTIL_NOEXCEPT;

/**@}*/

/** @name Trimming */
/**@{*/

/**
 * Removes the units of the set `trimSet` from both ends of `str` in place and returns the new
 * length. `trimSet` is given as a string: order and repetition do not matter. A null or empty
 * `trimSet` removes nothing. A null `str` returns 0.
 *
 * First the terminator is written after the last unit that is kept, even if one is there already,
 * so `str` must be writable. Then, if units were removed at the start, the kept units and the
 * terminator are copied to the start of `str`. No other unit is written: "--ab-." trimmed by "-."
 * then holds 'a', 'b', 0, 'b', 0, '.', 0.
 */
int StrTrim(char* str, const char* trimSet) STRUTIL_NOEXCEPT;
/** Wide version of StrTrim(). The length is in WCHARs, not bytes. */
int WStrTrim(WCHAR* str, const WCHAR* trimSet) STRUTIL_NOEXCEPT;

/**@}*/

/** @name Replacing */
/**@{*/

/**
 * Writes `orig` to `result` with every occurrence of `rep` replaced by `with`, and returns the
 * length of the new string. Occurrences are found from left to right and do not overlap; the
 * replacement is not searched again. An empty `with` deletes the occurrences.
 *
 * If `result` is null, nothing is written and the length that the new string will have is returned:
 * call once to size the buffer, provide that many units + 1, and call again to fill it. A `result`
 * that is too small is not detected, nor a length that an int cannot hold. `result` must not
 * overlap the other strings, except that it may be `orig` if `rep` does not occur in it: then
 * nothing is written.
 *
 * If `orig`, `rep` or `with` is null or `rep` is empty, the result is 0 and nothing is written, not
 * even a terminator.
 */
int StrReplace(const char* orig, const char* rep, const char* with, char* result) STRUTIL_NOEXCEPT;
/** Wide version of StrReplace(). The length is in WCHARs: provide that many + 1, not bytes. */
int WStrReplace(const WCHAR* orig, const WCHAR* rep, const WCHAR* with,
                WCHAR* result) STRUTIL_NOEXCEPT;

/**@}*/

/** @name Integer text conversion */
/**@{*/

/**
 * Writes `value` in `radix` to `string` and returns `string`; a null `string` returns null. Use
 * radix 2 to 36: the digits above 9 are "a" to "z". A negative value, the most negative one
 * included, has a "-" in front in every radix. There are no leading zeros. Nothing after the
 * terminator is written. `string` must have room for 34 units in radix 2, 13 in radix 8, 12 in
 * radix 10, 10 in 16 and 8 in 36.
 *
 * Other radices: below 1, `string` becomes empty. Radix 1 writes 0 as "0" and makes `string` empty
 * for every other value. Above 36 a digit d is the unit 'a' - 10 + d, truncated to the width of a
 * unit; above radix 169 (wide: 65449) that can be a terminator. 34 units are enough in every radix.
 */
char* IntToStr(int value, char* string, int radix) STRUTIL_NOEXCEPT;
/** Wide version of IntToStr(). `string` must have room for as many WCHARs, not bytes. */
WCHAR* IntToWStr(int value, WCHAR* string, int radix) STRUTIL_NOEXCEPT;

/**
 * Returns the decimal integer at the start of `string`: spaces and tabs, an optional "-", digits.
 * The first other unit ends the number. Returns 0 if there is no such number or `string` is null. A
 * leading "+" is not accepted, nor a space after the "-". A value too large for an int is not
 * detected: it wraps modulo 2^32.
 */
int StrToInt(const char* string) STRUTIL_NOEXCEPT;
/** Wide version of StrToInt(). Only the WCHARs '0' to '9' are digits. */
int WStrToInt(const WCHAR* string) STRUTIL_NOEXCEPT;

/**@}*/

/** @name Width conversion */
/**@{*/

/**
 * Copies `len` bytes of `src` to `des`, each zero-extended to 16 bits. `des` must have room for
 * `len` WORDs. No terminator is looked for or written. Nothing is written if a pointer is null or
 * `len` is below 1. The copy runs forward, one unit after the other, also if the arrays overlap.
 */
void BytesToWords(const char* src, WORD* des, int len) STRUTIL_NOEXCEPT;

/**
 * Copies `src` to `des`, each byte zero-extended to a WCHAR, truncated to fit, and returns `des`.
 * UTF-8 is not decoded. `bufsize` is the capacity of `des` in WCHARs, not bytes, terminator
 * included. The WCHARs after the terminator are unchanged. Truncation is not reported.
 *
 * A null `des` returns null. A null `src`, or `bufsize` below 2, makes `des` empty: `des` must have
 * room for one WCHAR even if `bufsize` is 0 or negative.
 */
WCHAR* StrToWStr(const char* src, WCHAR* des, int bufsize) STRUTIL_NOEXCEPT;

/**
 * Writes `src` to `des` as printable ASCII and returns `des`. The WCHARs 32 to 126 are written as
 * they are, every other one as an escape: "&(0x", its value in lowercase hexadecimal without
 * leading zeros, ")". "&" is not escaped, so the original cannot always be recovered. `bufsize` is
 * the capacity of `des` in chars; 9 x WStrLen(src) + 1 are always enough. Writing stops before the
 * first unit or escape that does not fit whole with the terminator. Truncation is not reported.
 *
 * A null `src`, or `bufsize` below 2, makes `des` empty: `des` must have room for one char even if
 * `bufsize` is 0 or negative. A null `des` returns a constant empty string: do not write to it.
 */
char* WStrToStr(const WCHAR* src, char* des, int bufsize) STRUTIL_NOEXCEPT;

/**
 * Copies `len` WCHARs of `src` to `des`. `len` counts WCHARs, not bytes: `des` must have room for
 * `len` WORDs. No terminator is looked for or written. Nothing is written if a pointer is null or
 * `len` is below 1. The result is that of a forward copy, one unit after the other, also if the
 * arrays overlap. If both are 4-byte aligned, it uses 32-bit accesses: neither may be memory for
 * 16-bit accesses only.
 */
void WStrToWords(const WCHAR* src, WORD* des, int len) STRUTIL_NOEXCEPT;

/**@}*/

#undef STRUTIL_NOEXCEPT
#ifdef __cplusplus
}
#endif

#endif
