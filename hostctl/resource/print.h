// Printing of resource records, and sizes for people.
//
// Resgrp_Print(printer, label, record) prints one resource record through an
// ObjectPrinter (one overload per record type); the overloads are added
// here together with the resource allocation and statistics records.
#ifndef HOSTCTL_RESOURCE_PRINT_H
#define HOSTCTL_RESOURCE_PRINT_H

#include <string>

#include "annotate.h"
#include "types.h"

namespace QorCtl {
namespace Resource {

// A byte count in binary units: below 1024 as "<n> B", otherwise with two
// decimals in the largest unit that keeps the number below 1024 once
// rounded: KiB, MiB, GiB, TiB, PiB, EiB. 0 -> "0 B", 1536 -> "1.50 KiB",
// 1073741824 -> "1.00 GiB", 1048575 -> "1.00 MiB".
std::string Resgrp_SizeString(uint64 bytes);

}  // namespace Resource
}  // namespace QorCtl

#endif
