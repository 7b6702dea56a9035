// IP routing of a network stack instance.
//
// Declared here so far: the networks that stand for the default route.
// The network bindings complete RoutingInfoImpl in place with its bases,
// constructors and routing methods (and declare the RoutingInfo interface
// and the route and neighbour records before it).
#ifndef HOSTCTL_NETWORK_ROUTING_H
#define HOSTCTL_NETWORK_ROUTING_H

#include "annotate.h"
#include "network/address.h"
#include "types.h"

namespace QorCtl {
namespace Network {

class RoutingInfoImpl {
public:
    // The networks of the default route, 0.0.0.0/0 and ::/0 unless a
    // script copies other networks into them.
    static HostCtl::Network::Ipv4Network DEFAULT_IPV4_ROUTE;
    static HostCtl::Network::Ipv6Network DEFAULT_IPV6_ROUTE;
};

}  // namespace Network
}  // namespace QorCtl

#endif
