/**
 * @file
 * Gives each function name its numbered link symbol: callers write the names and link against the
 * numbers. The documentation of each function is in strutil.h.
 *
 * These are plain macros. They replace such an identifier everywhere after this header, class
 * members and local names included.
 */
#ifndef STRUTIL_SUBNAME_H
#define STRUTIL_SUBNAME_H

/* Lengths and case mapping */
#define StrLen VELKO_002014
#define WStrLen VELKO_002039
#define CharToLower VELKO_002026
#define CharToUpper VELKO_002027
#define StrUpper VELKO_002025
#define WStrUpper VELKO_002052
#define StrLower VELKO_002015
#define WStrLower VELKO_002040

/* Copying */
#define StrCopy VELKO_002009
#define WStrCopy VELKO_002034
#define StrCopyBuf VELKO_002010
#define WStrCopyBuf VELKO_002035
#define StrNCopy VELKO_002017
#define WStrNCopy VELKO_002044

/* Concatenation */
#define StrCat VELKO_002005
#define WStrCat VELKO_002030
#define StrCatBuf VELKO_002006
#define WStrCatBuf VELKO_002031
#define WStrNCat VELKO_002041
#define WStrNCatBuf VELKO_002042

/* Searching */
#define StrChr VELKO_002007
#define WStrChr VELKO_002032
#define StrStr VELKO_002022
#define WStrStr VELKO_002049
#define StrIStr VELKO_002013
#define WStrIStr VELKO_002038

/* Comparison */
#define StrCmp VELKO_002008
#define WStrCmp VELKO_002033
#define StrICmp VELKO_002012
#define WStrICmp VELKO_002037
#define StrNCmp VELKO_002016
#define WStrNCmp VELKO_002043
#define StrNICmp VELKO_002019
#define WStrNICmp VELKO_002046

/* Tokenizing and splitting */
#define StrToken VELKO_002023
#define WStrToken VELKO_002050
#define StrSplit VELKO_002021
#define WStrSplit VELKO_002048

/* Trimming */
#define StrTrim VELKO_002024
#define WStrTrim VELKO_002051

/* Replacing */
#define StrReplace VELKO_002020
#define WStrReplace VELKO_002047

/* Integer text conversion */
#define IntToStr VELKO_002003
#define IntToWStr VELKO_002004
#define StrToInt VELKO_002000
#define WStrToInt VELKO_002053

/* Width conversion */
#define BytesToWords VELKO_002002
#define StrToWStr VELKO_002001
#define WStrToStr VELKO_002029
#define WStrToWords VELKO_002028

#endif
