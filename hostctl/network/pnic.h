// Physical NICs, including the FCoE-capable ones. The network bindings
// define the classes here.
#ifndef HOSTCTL_NETWORK_PNIC_H
#define HOSTCTL_NETWORK_PNIC_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// A physical NIC of the host.
class Pnic;
// A physical NIC that can carry Fibre Channel over Ethernet.
class FcoePnic;

}  // namespace Network
}  // namespace HostCtl

#endif
