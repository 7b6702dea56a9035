// Numeric ranges carried by network configuration records.
#ifndef HOSTCTL_NETWORK_RANGE_H
#define HOSTCTL_NETWORK_RANGE_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// An inclusive range of numbers, min to max; port groups use it for their
// guest VLAN filters. The record stores what it is given: a range with min
// above max is kept as it is, and whoever takes the range decides whether
// it is acceptable. A new range is 0 to 0.
class PortRange {
public:
    uint32 min = 0;
    uint32 max = 0;
};

}  // namespace Network
}  // namespace HostCtl

#endif
