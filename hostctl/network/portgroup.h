// Port groups of standard virtual switches. The network bindings define the
// classes here.
#ifndef HOSTCTL_NETWORK_PORTGROUP_H
#define HOSTCTL_NETWORK_PORTGROUP_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// A named group of ports on a standard switch, with its VLAN and policies.
class PortGroup;

}  // namespace Network
}  // namespace HostCtl

#endif
