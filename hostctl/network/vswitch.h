// Standard virtual switches. The network bindings define the classes here.
#ifndef HOSTCTL_NETWORK_VSWITCH_H
#define HOSTCTL_NETWORK_VSWITCH_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// A standard virtual switch.
class VirtualSwitch;

}  // namespace Network
}  // namespace HostCtl

#endif
