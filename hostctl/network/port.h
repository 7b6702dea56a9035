// Switch ports. The network bindings define the classes here.
#ifndef HOSTCTL_NETWORK_PORT_H
#define HOSTCTL_NETWORK_PORT_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// One port of a virtual switch.
class Port;

}  // namespace Network
}  // namespace HostCtl

namespace QorCtl {
namespace Network {

class PortImpl;

}  // namespace Network
}  // namespace QorCtl

#endif
