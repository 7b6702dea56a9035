// Statistics records of the resource area: what the host, its groups and
// its virtual machines report about processor and memory use. They are
// plain values; the resource root and groups fill them.
#ifndef HOSTCTL_RESOURCE_STATS_H
#define HOSTCTL_RESOURCE_STATS_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Resource {

// One physical processor (an element of ResourceInfo::GetHostCpuStats):
// times in microseconds since the host started. A new record is all zero.
struct HostCpuStats {
    uint64 usedTime = 0;
    uint64 idleTime = 0;
    uint64 haltTime = 0;
    uint64 coreHaltTime = 0;
    uint64 elapsedTime = 0;
};

}  // namespace Resource
}  // namespace HostCtl

#endif
