// NUMA: the NUMA view of the hardware area and its nodes. The hardware
// bindings define the classes here.
#ifndef HOSTCTL_HARDWARE_NUMA_H
#define HOSTCTL_HARDWARE_NUMA_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Hardware {

// One NUMA node: its processors and its memory range.
class NumaNode;

}  // namespace Hardware
}  // namespace HostCtl

#endif
