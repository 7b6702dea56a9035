// Host virtual NICs. The network bindings define the classes here.
#ifndef HOSTCTL_NETWORK_QORNIC_H
#define HOSTCTL_NETWORK_QORNIC_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// A virtual NIC of the host's own network stack.
class QorNic;

}  // namespace Network
}  // namespace HostCtl

#endif
