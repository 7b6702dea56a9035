// Switch discovery protocols: the names of the CDP status values and the
// well-known keys of the optional TLVs that LLDP neighbour information
// carries.
#ifndef HOSTCTL_NETWORK_DISCOVERY_H
#define HOSTCTL_NETWORK_DISCOVERY_H

#include <string>

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// Names of the CDP status values, in their order: "down", "listen",
// "advertise", "both".
extern std::string CDP_STATUS[];

}  // namespace Network
}  // namespace HostCtl

// Keys of an LLDP neighbour's optional TLV map.
#define LLDP_KEY_SYS_CAP "Enabled Capabilities"
#define LLDP_KEY_TIMEOUT "TimeOut"
#define LLDP_KEY_SAMPLES "Samples"

#endif
