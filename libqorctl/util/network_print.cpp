// Network_Print: network records as readable text.
#include "network/print.h"

#include <cstdio>

#include "resource/print.h"
#include "util/object_printer.h"

namespace QorCtl {
namespace Network {

using namespace HostCtl::Network;

namespace {

std::string const kNotSet = "not set";

char const *const kCapabilityNames[] = {
    "VlanTag", "VlanUntag", "ChecksumOffload", "TcpSegmentationOffload", "ScatterGatherTx",
    "HighDMA", "ScatterGatherSpanPagesTx", "ChecksumOffloadIPv6", "TcpSegmentationOffloadIPv6",
    "TcpSegmentationOffload256k", "UplinkReadOnlyInetHeaders", "UPT", "ENCAP", "DCB",
    "Offload8Offset", "Offload16Offset", "ChecksumOffloadIPv6ExtHdrs",
    "TcpSegmentationOffloadIPv6ExtHdrs", "Sched", "SRIOV", "AdjustHeaderAlignment",
    "GenericOffload"};

std::string YesNo(bool b) { return b ? "yes" : "no"; }

std::string Ignored(std::string text, bool ignored) {
    return ignored ? text + " (ignored)" : text;
}

std::string Hex(uint64 v) {
    char buf[32];
    std::snprintf(buf, sizeof buf, "0x%llx", (unsigned long long)v);
    return buf;
}

std::string TeamPolicyName(NicTeamingPolicy::TeamPolicyType t) {
    switch (t) {
    case NicTeamingPolicy::TEAM_POLICY_NONE: return "none";
    case NicTeamingPolicy::TEAM_POLICY_LB_IP: return "load balance by IP hash";
    case NicTeamingPolicy::TEAM_POLICY_LB_SRCMAC: return "load balance by source MAC";
    case NicTeamingPolicy::TEAM_POLICY_LB_SRCID: return "load balance by source port";
    case NicTeamingPolicy::TEAM_POLICY_FO_EXPLICIT: return "explicit failover order";
    default: return "unknown (" + std::to_string(int(t)) + ")";
    }
}

// Prints through printer, or standard output when it is null.
template <class Body>
void WithPrinter(Util::ObjectPrinter *printer, std::string const &label, Body body) {
    Util::ObjectPrinter fallback;
    Util::ObjectPrinter &p = printer ? *printer : fallback;
    p.Begin(label);
    body(p);
    p.End();
}

}  // namespace

void Network_Print(Util::ObjectPrinter *printer, std::string label,
                   LinkCriteriaSelectionPolicy const &policy) {
    LinkCriteriaSelectionPolicy c = policy;  // the getters are not const
    WithPrinter(printer, label, [&](Util::ObjectPrinter &p) {
        p.Field("Exact speed",
                c.HasExactSpeed()
                    ? Ignored(std::to_string(c.GetExactSpeed()) + " Mbit/s", c.IgnoreExactSpeed())
                    : kNotSet);
        p.Field("Minimum speed", c.HasMinimumSpeed()
                                     ? Ignored(std::to_string(c.GetMinimumSpeed()) + " Mbit/s",
                                               c.IgnoreMinimumSpeed())
                                     : kNotSet);
        p.Field("Percent error", c.HasPercentError()
                                     ? Ignored(std::to_string(c.GetPercentError()) + "%",
                                               c.IgnorePercentError())
                                     : kNotSet);
        p.Field("Duplex", c.HasDuplex()
                              ? Ignored(c.GetDuplex() ? "full" : "half", c.IgnoreDuplex())
                              : kNotSet);
        p.Field("Beacon probing", c.HasBeacon() ? Ignored("set", c.IgnoreBeacon()) : kNotSet);
    });
}

void Network_Print(Util::ObjectPrinter *printer, std::string label,
                   NicCapabilities const &capabilities) {
    NicCapabilities c = capabilities;
    WithPrinter(printer, label, [&](Util::ObjectPrinter &p) {
        uint64 flags = c.GetFlags(), mask = c.GetMask();
        p.Field("Flags", Hex(flags));
        p.Field("Mask", Hex(mask));
        for (unsigned bit = 0; bit < sizeof kCapabilityNames / sizeof kCapabilityNames[0]; ++bit)
            p.Field(kCapabilityNames[bit],
                    mask >> bit & 1 ? std::string(flags >> bit & 1 ? "on" : "off") : kNotSet);
    });
}

void Network_Print(Util::ObjectPrinter *printer, std::string label,
                   NicTeamingPolicy const &policy) {
    NicTeamingPolicy t = policy;
    WithPrinter(printer, label, [&](Util::ObjectPrinter &p) {
        p.Field("Teaming policy", t.HasTeamingPolicy() ? TeamPolicyName(t.GetTeamingPolicy()) : kNotSet);
        p.Field("Failback", t.HasReversePolicy() ? YesNo(t.GetReversePolicy()) : kNotSet);
        p.Field("Notify switch on failure",
                t.HasNotifySwitchOnFailure() ? YesNo(t.GetNotifySwitchOnFailure()) : kNotSet);
        if (t.HasLinkCriteria())
            Network_Print(&p, "Failure detection", t.GetLinkCriteria());
        else
            p.Field("Failure detection", kNotSet);
        std::string order;
        for (std::string const &uplink : t.GetUplinkOrder())
            order += (order.empty() ? "" : ", ") + uplink;
        p.Field("Uplink order", t.HasUplinkOrder() ? (order.empty() ? "(empty)" : order) : kNotSet);
        p.Field("Rolling restoration",
                t.HasRollingRestoration() ? YesNo(t.GetRollingRestoration()) : kNotSet);
        p.Field("Maximum active uplinks",
                t.HasMaxActiveUplinks() ? std::to_string(t.GetMaxActiveUplinks()) : kNotSet);
    });
}

void Network_Print(Util::ObjectPrinter *printer, std::string label,
                   PortSecurityPolicy const &policy) {
    PortSecurityPolicy s = policy;
    WithPrinter(printer, label, [&](Util::ObjectPrinter &p) {
        p.Field("Allow promiscuous", s.HasAllowPromiscuous() ? YesNo(s.GetAllowPromiscuous()) : kNotSet);
        p.Field("Allow MAC address change",
                s.HasAllowMacAddressChange() ? YesNo(s.GetAllowMacAddressChange()) : kNotSet);
        p.Field("Allow forged transmits",
                s.HasAllowForgedTransmits() ? YesNo(s.GetAllowForgedTransmits()) : kNotSet);
    });
}

void Network_Print(Util::ObjectPrinter *printer, std::string label, ShapingPolicy const &policy) {
    ShapingPolicy s = policy;
    WithPrinter(printer, label, [&](Util::ObjectPrinter &p) {
        p.Field("Enabled", s.HasEnabled() ? YesNo(s.GetEnabled()) : kNotSet);
        p.Field("Average rate", s.HasAverageBps() ? std::to_string(s.GetAverageBps()) + " bit/s" : kNotSet);
        p.Field("Peak rate", s.HasPeakBps() ? std::to_string(s.GetPeakBps()) + " bit/s" : kNotSet);
        p.Field("Burst size", s.HasBurstSize() ? Resource::Resgrp_SizeString(s.GetBurstSize()) : kNotSet);
    });
}

void Network_Print(Util::ObjectPrinter *printer, std::string label, IpConfig const &config) {
    IpConfig c = config;
    WithPrinter(printer, label, [&](Util::ObjectPrinter &p) {
        if (c.GetUseDhcp()) {
            p.Field("IPv4", "DHCP");
        } else if (c.GetIpv4UseNone()) {
            p.Field("IPv4", "none");
        } else {
            p.Field("IPv4 address", c.GetIpv4Address().GetStringAddress());
            p.Field("IPv4 netmask", c.GetIpv4Netmask().GetStringAddress());
            p.Field("IPv4 broadcast", c.GetIpv4Broadcast().GetStringAddress());
        }
        p.Field("DNS from DHCP", YesNo(c.GetDhcpDns()));
        p.Field("IPv6 DHCP", YesNo(c.GetUseIpv6Dhcp()));
        p.Field("IPv6 router advertisements", YesNo(c.GetUseIpv6RouterAdvertised()));
        std::string networks;
        for (Ipv6Network &n : c.GetIpv6Network())
            networks += (networks.empty() ? "" : ", ") + n.GetStringAddress();
        p.Field("IPv6 networks", networks.empty() ? "none" : networks);
    });
}

}  // namespace Network
}  // namespace QorCtl
