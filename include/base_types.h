/**
 * @file
 * The fixed-width types of strutil's interfaces.
 */
#ifndef STRUTIL_BASE_TYPES_H
#define STRUTIL_BASE_TYPES_H

#include <stdint.h>

/** A unit of wide text: 16 bits and unsigned, whatever the platform's own `wchar_t` is. */
typedef uint16_t WCHAR;

/** An element of a raw array of 16-bit values, which carries no terminator. */
typedef uint16_t WORD;

/** A signed 8-bit integer. No function here has one: kits that share these types use it. */
typedef int8_t INT8;

#endif
