// The library's scalar type names. Bindings spell parameter types with these
// names, so declarations use them exactly as the library documents them.
#ifndef HOSTCTL_TYPES_H
#define HOSTCTL_TYPES_H

#include <cstdint>

typedef uint8_t uint8;
typedef uint16_t uint16;
typedef uint32_t uint32;
typedef uint64_t uint64;
typedef int8_t int8;
typedef int16_t int16;
typedef int32_t int32;
typedef int64_t int64;

// The library's one-byte truth type.
typedef char Bool;

#endif
