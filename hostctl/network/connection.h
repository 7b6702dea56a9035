// Connections of clients to switch ports.
#ifndef HOSTCTL_NETWORK_CONNECTION_H
#define HOSTCTL_NETWORK_CONNECTION_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// The connection id of a port that has no client connected (all 32 bits
// set).
extern const uint32 INVALID_CONNECTION_ID;

}  // namespace Network
}  // namespace HostCtl

#endif
