#include <algorithm>

#include "addrtext.h"

using namespace QorCtl::Network::AddrText;

namespace HostCtl {
namespace Network {

IpConfig::IpConfig()
    : useDhcp_(false), useIpv6Dhcp_(false), useIpv6RouterAdvertised_(false), dhcpDns_(false),
      ipv4None_(false) {}

void IpConfig::SetUseDhcp(bool useDhcp, bool useDhcpDns)
{
    useDhcp_ = useDhcp;
    if (useDhcp) ipv4None_ = false;
    dhcpDns_ = useDhcpDns && (useDhcp_ || useIpv6Dhcp_);
}

void IpConfig::SetUseIpv6Dhcp(bool useDhcp)
{
    useIpv6Dhcp_ = useDhcp;
    dhcpDns_ = dhcpDns_ && (useDhcp_ || useIpv6Dhcp_);
}

bool IpConfig::GetUseDhcp() { return useDhcp_; }

bool IpConfig::GetUseIpv6Dhcp() { return useIpv6Dhcp_; }

void IpConfig::SetUseIpv6RouterAdvertised(bool useRouterAdvertised)
{
    useIpv6RouterAdvertised_ = useRouterAdvertised;
}

bool IpConfig::GetUseIpv6RouterAdvertised() { return useIpv6RouterAdvertised_; }

bool IpConfig::GetDhcpDns() { return dhcpDns_; }

void IpConfig::SetDhcpDns(bool useDhcpDns)
{
    if (useDhcpDns && !useDhcp_ && !useIpv6Dhcp_)
        Fail("DNS servers from DHCP need IPv4 or IPv6 DHCP");
    dhcpDns_ = useDhcpDns;
}

void IpConfig::SetIpv4UseNone()
{
    ipv4None_ = true;
    useDhcp_ = false;
    dhcpDns_ = dhcpDns_ && useIpv6Dhcp_;
    ipv4Address_ = ipv4Netmask_ = ipv4Broadcast_ = Ipv4Address();
}

bool IpConfig::GetIpv4UseNone() { return ipv4None_; }

Ipv4Address IpConfig::GetIpv4Address() { return ipv4Address_; }

std::vector<Ipv6Network> IpConfig::GetIpv6Network() { return ipv6Networks_; }

void IpConfig::SetIpv4Address(Ipv4Address address)
{
    if (!address.IsValidAddress())
        Fail(address.GetStringAddress() + " is not a valid IPv4 host address");
    ipv4Address_ = address;
    ipv4None_ = false;
    useDhcp_ = false;
    dhcpDns_ = dhcpDns_ && useIpv6Dhcp_;
}

void IpConfig::AddIpv6Network(Ipv6Network network)
{
    if (!network.IsValid())
        Fail(network.GetStringAddress() + " is not a valid IPv6 interface address");
    Ipv6Address address = network.GetAddress();
    for (Ipv6Network &n : ipv6Networks_)
        if (n.GetAddress() == address)
            Fail(address.GetStringAddress() + " is already configured");
    ipv6Networks_.push_back(network);
}

void IpConfig::RemoveIpv6Network(Ipv6Network network)
{
    auto it = std::find_if(ipv6Networks_.begin(), ipv6Networks_.end(),
                           [&](Ipv6Network &n) { return n == network; });
    if (it == ipv6Networks_.end())
        Fail(network.GetStringAddress() + " is not configured");
    ipv6Networks_.erase(it);
}

Ipv4Address IpConfig::GetIpv4Netmask() { return ipv4Netmask_; }

void IpConfig::SetIpv4Netmask(Ipv4Address netmask)
{
    if (!netmask.IsValidNetmask() || netmask.GetBinaryAddress() == 0)
        Fail(netmask.GetStringAddress() + " is not a valid IPv4 netmask");
    ipv4Netmask_ = netmask;
}

Ipv4Address IpConfig::GetIpv4Broadcast() { return ipv4Broadcast_; }

void IpConfig::SetIpv4Broadcast(Ipv4Address broadcast)
{
    if (broadcast.GetBinaryAddress() == 0 || broadcast.IsValidMulticastAddress())
        Fail(broadcast.GetStringAddress() + " is not a valid IPv4 broadcast address");
    ipv4Broadcast_ = broadcast;
}

bool IpConfig::IsValid() { return IsIpv4Valid() && IsIpv6Valid(); }

bool IpConfig::IsIpv4Valid()
{
    if (ipv4None_ || useDhcp_) return true;
    uint32 mask = ipv4Netmask_.GetBinaryAddress();
    if (!ipv4Address_.IsValidAddress() || mask == 0 || PrefixOfMask(mask) < 0) return false;
    uint32 bcast = ipv4Broadcast_.GetBinaryAddress();
    return bcast == 0 || bcast == 0xffffffffU ||
           (bcast & mask) == (ipv4Address_.GetBinaryAddress() & mask);
}

bool IpConfig::IsIpv6Valid()
{
    return std::all_of(ipv6Networks_.begin(), ipv6Networks_.end(),
                       [](Ipv6Network &n) { return n.IsValid(); });
}

bool IpConfig::ContainsAddress(std::string const &address)
{
    uint32 v4;
    Ipv6_addr v6;
    if (ParseIpv4(address, v4))
        return !ipv4None_ && v4 != 0 && v4 == ipv4Address_.GetBinaryAddress();
    if (!ParseIpv6(address, v6)) return false;
    Ipv6Address wanted(v6);
    return std::any_of(ipv6Networks_.begin(), ipv6Networks_.end(),
                       [&](Ipv6Network &n) { return n.GetAddress() == wanted; });
}

} // namespace Network
} // namespace HostCtl
