// Library-wide basic definitions: truth values, the build's architecture
// flag, printf format pieces for the library's sized types, and the 64-bit
// limits. Scripts see each as a module constant.
#ifndef HOSTCTL_BASIC_H
#define HOSTCTL_BASIC_H

#include "types.h"

#define FALSE 0
#define TRUE 1

#define vm_x86_64 0

// Length modifiers for printing sized values ("%" FMTSZ "u" prints a size).
#define FMTH ""
#define FMTSZ "Z"
#define FMTPD ""
#define FMT64 "L"

#define MIN_INT64 (-9223372036854775807LL - 1)
#define MAX_INT64 9223372036854775807LL
#define MIN_UINT64 0
#define MAX_UINT64 18446744073709551615ULL

#define FMTLA ""
#define FMTVA ""
#define FMTVPN ""
#define FMTPID "d"
#define FMTUID "u"
#define FMTMODE "o"
#define FMTTIME "ld"

#endif
