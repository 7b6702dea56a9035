#include <cmath>
#include <cstdio>

#include "resource/print.h"

namespace QorCtl {
namespace Resource {

std::string Resgrp_SizeString(uint64 bytes) {
    if (bytes < 1024)
        return std::to_string(bytes) + " B";
    static char const *const units[] = {"KiB", "MiB", "GiB", "TiB", "PiB", "EiB"};
    long double value = (long double)bytes / 1024;
    unsigned unit = 0;
    // Move up while the value, rounded to two decimals, would read 1024.00.
    while (unit + 1 < sizeof units / sizeof units[0] && std::round(value * 100) >= 1024 * 100) {
        value /= 1024;
        ++unit;
    }
    char buf[64];
    std::snprintf(buf, sizeof buf, "%.2Lf %s", value, units[unit]);
    return buf;
}

}  // namespace Resource
}  // namespace QorCtl
