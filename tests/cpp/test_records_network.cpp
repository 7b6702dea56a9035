// Network records and library variables: port ranges, the CDP status
// names, the invalid connection id and the default-route networks.
#include <gtest/gtest.h>

#include <string>

#include "network/connection.h"
#include "network/discovery.h"
#include "network/range.h"
#include "network/routing.h"

using namespace HostCtl::Network;
using QorCtl::Network::RoutingInfoImpl;

TEST(RecordsNetworkVariables, CdpNamesFollowTheStatusValuesAndTheIdIsAllOnes)
{
    EXPECT_EQ("down", CDP_STATUS[0]);
    EXPECT_EQ("listen", CDP_STATUS[1]);
    EXPECT_EQ("advertise", CDP_STATUS[2]);
    EXPECT_EQ("both", CDP_STATUS[3]);
    EXPECT_EQ(0xffffffffu, INVALID_CONNECTION_ID);
    EXPECT_STREQ("Enabled Capabilities", LLDP_KEY_SYS_CAP);
}

TEST(RecordsNetworkVariables, DefaultRoutesCoverEveryAddressAndCanBeReplaced)
{
    EXPECT_EQ("0.0.0.0/0", RoutingInfoImpl::DEFAULT_IPV4_ROUTE.GetStringAddress());
    EXPECT_EQ("::/0", RoutingInfoImpl::DEFAULT_IPV6_ROUTE.GetStringAddress());
    EXPECT_TRUE(RoutingInfoImpl::DEFAULT_IPV4_ROUTE.IsValidNetworkAddress(Ipv4Address("203.0.113.9")));
    EXPECT_TRUE(RoutingInfoImpl::DEFAULT_IPV6_ROUTE.IsValidNetworkAddress(Ipv6Address("2001:db8::1")));

    // Scripts copy other networks in (cvar); the object stays the same.
    Ipv4Network *before = &RoutingInfoImpl::DEFAULT_IPV4_ROUTE;
    Ipv4Network saved = RoutingInfoImpl::DEFAULT_IPV4_ROUTE;
    RoutingInfoImpl::DEFAULT_IPV4_ROUTE = Ipv4Network("10.0.0.0/8");
    EXPECT_EQ(before, &RoutingInfoImpl::DEFAULT_IPV4_ROUTE);
    EXPECT_EQ("10.0.0.0/8", RoutingInfoImpl::DEFAULT_IPV4_ROUTE.GetStringAddress());
    RoutingInfoImpl::DEFAULT_IPV4_ROUTE = saved;
    EXPECT_EQ("0.0.0.0/0", RoutingInfoImpl::DEFAULT_IPV4_ROUTE.GetStringAddress());
}

TEST(RecordsPortRange, KeepsWhatItIsGiven)
{
    PortRange r;
    EXPECT_EQ(0u, r.min);
    EXPECT_EQ(0u, r.max);
    r.min = 4094;
    r.max = 1;  // reversed: stored as given
    PortRange copy = r;
    EXPECT_EQ(4094u, copy.min);
    EXPECT_EQ(1u, copy.max);
}
