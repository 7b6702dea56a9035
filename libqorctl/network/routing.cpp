#include "network/routing.h"

namespace QorCtl {
namespace Network {

HostCtl::Network::Ipv4Network RoutingInfoImpl::DEFAULT_IPV4_ROUTE(0u, 0u);
HostCtl::Network::Ipv6Network RoutingInfoImpl::DEFAULT_IPV6_ROUTE(HostCtl::Network::Ipv6Address(), 0u);

}  // namespace Network
}  // namespace QorCtl
