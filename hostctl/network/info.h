// The root of the network area (switches, NICs, routing, DNS). The network
// bindings complete this interface.
#ifndef HOSTCTL_NETWORK_INFO_H
#define HOSTCTL_NETWORK_INFO_H

#include "annotate.h"
#include "lib/object.h"
#include "types.h"

namespace HostCtl {
namespace Network {

class NetworkInfo : public virtual HostCtl::Lib::HostCtlObject {
};

}  // namespace Network
}  // namespace HostCtl

#endif
