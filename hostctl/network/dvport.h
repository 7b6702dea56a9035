// Distributed ports and their records. The network bindings define the
// classes here.
#ifndef HOSTCTL_NETWORK_DVPORT_H
#define HOSTCTL_NETWORK_DVPORT_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// A VLAN id range of a distributed port's trunk.
class DVPortVlanRange;

}  // namespace Network
}  // namespace HostCtl

#endif
