// Distributed switches. The network bindings define the classes here.
#ifndef HOSTCTL_NETWORK_DVSWITCH_H
#define HOSTCTL_NETWORK_DVSWITCH_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// A distributed switch as this host sees it.
class DVSwitch;

}  // namespace Network
}  // namespace HostCtl

#endif
