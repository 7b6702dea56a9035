// The routing part of a network stack's configuration: default gateways
// and static routes. Scripts only hold it; the routing objects and the
// policy serializer use it.
#ifndef LIBQORCTL_NETWORK_IP_ROUTING_H
#define LIBQORCTL_NETWORK_IP_ROUTING_H

#include <string>
#include <utility>
#include <vector>

#include "network/address.h"

namespace HostCtl {
namespace Network {

class IpRouting {
public:
    // 0.0.0.0 and "::" stand for no gateway.
    Ipv4Address ipv4Gateway;
    std::string ipv4GatewayDevice;
    Ipv6Address ipv6Gateway;
    // (destination network, gateway)
    std::vector<std::pair<Ipv4Network, Ipv4Address>> ipv4Routes;
    std::vector<std::pair<Ipv6Network, Ipv6Address>> ipv6Routes;
};

} // namespace Network
} // namespace HostCtl

#endif
