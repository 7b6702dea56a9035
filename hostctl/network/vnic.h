// Console virtual NICs. The network bindings define the classes here.
#ifndef HOSTCTL_NETWORK_VNIC_H
#define HOSTCTL_NETWORK_VNIC_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// A virtual NIC of the service console.
class Vnic;

}  // namespace Network
}  // namespace HostCtl

#endif
