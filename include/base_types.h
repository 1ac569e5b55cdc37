/**
 * @file
 * The fixed-width types of strutil's interfaces.
 */
#ifndef STRUTIL_BASE_TYPES_H
#define STRUTIL_BASE_TYPES_H

#include <stdint.h>

/** A unit of a wide string: 16 bits, unsigned, whatever the platform's own `wchar_t` is. */
typedef uint16_t WCHAR;

/** An element of a raw array of 16-bit values, which carries no terminator. */
typedef uint16_t WORD;

/** A signed 8-bit integer. Not used by strutil; provided for SDKs that share these types. */
typedef int8_t INT8;

#endif
