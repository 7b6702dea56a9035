// Network policy values: optional attributes, derivation, defaults, the NIC
// capability words and the configuration serializer.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "../../libqorctl/network/config_branch.h"
#include "../../libqorctl/network/ip_routing.h"
#include "lib/exception.h"
#include "network/policy.h"
#include "network/policy_serializer.h"

using namespace HostCtl::Network;
using HostCtl::Lib::HostCtlException;
using QorCtl::Config::ConfigBranch;
using QorCtl::Network::NetworkPolicySerializer;

namespace {

ConfigBranchPtr NewBranch() { return ConfigBranchPtr(new ConfigBranch); }

} // namespace

TEST(NetAddrPolicy, FreshPoliciesHaveNothingSet)
{
    NicTeamingPolicy t;
    EXPECT_FALSE(t.IsSet());
    EXPECT_FALSE(t.HasTeamingPolicy() || t.HasReversePolicy() || t.HasNotifySwitchOnFailure() ||
                 t.HasLinkCriteria() || t.HasUplinkOrder() || t.HasRollingRestoration() || t.HasMaxActiveUplinks());
    ShapingPolicy s;
    EXPECT_FALSE(s.IsSet());
    EXPECT_FALSE(s.HasPeakBps() || s.HasAverageBps() || s.HasBurstSize() || s.HasEnabled());
    PortSecurityPolicy p;
    EXPECT_FALSE(p.IsSet());
    EXPECT_FALSE(p.HasAllowPromiscuous() || p.HasAllowMacAddressChange() || p.HasAllowForgedTransmits());
    LinkCriteriaSelectionPolicy l;
    EXPECT_FALSE(l.IsSet());
    EXPECT_FALSE(l.HasExactSpeed() || l.HasMinimumSpeed() || l.HasPercentError() || l.HasDuplex() || l.HasBeacon());
    NicCapabilities n;
    EXPECT_FALSE(n.IsSet());
    EXPECT_EQ(0U, n.GetMask());
}

TEST(NetAddrPolicy, SetUnsetAndUnsetAll)
{
    NicTeamingPolicy t;
    t.SetTeamingPolicy(NicTeamingPolicy::TEAM_POLICY_FO_EXPLICIT);
    t.SetMaxActiveUplinks(-1);
    t.SetUplinkOrder({"uplink1", "uplink0"});
    EXPECT_TRUE(t.IsSet());
    EXPECT_EQ(NicTeamingPolicy::TEAM_POLICY_FO_EXPLICIT, t.GetTeamingPolicy());
    EXPECT_EQ(-1, t.GetMaxActiveUplinks());
    EXPECT_EQ((std::vector<std::string>{"uplink1", "uplink0"}), t.GetUplinkOrder());
    t.UnsetTeamingPolicy();
    EXPECT_FALSE(t.HasTeamingPolicy());
    EXPECT_TRUE(t.HasMaxActiveUplinks());
    t.UnsetAll();
    EXPECT_FALSE(t.IsSet());
    EXPECT_FALSE(t.HasUplinkOrder());

    ShapingPolicy s;
    s.SetPeakBps(uint64(1) << 40);
    EXPECT_EQ(uint64(1) << 40, s.GetPeakBps());
    s.SetEnabled(true);
    s.UnsetPeakBps();
    EXPECT_FALSE(s.HasPeakBps());
    EXPECT_TRUE(s.IsSet());
    s.UnsetAll();
    EXPECT_FALSE(s.IsSet());

}

TEST(NetAddrPolicy, LinkCriteriaIgnoreMarks)
{
    LinkCriteriaSelectionPolicy l;
    l.SetExactSpeed(1000);
    l.SetMinimumSpeed(100, true);
    l.SetDuplex(true);
    l.SetBeacon();
    EXPECT_TRUE(l.HasExactSpeed());
    EXPECT_FALSE(l.IgnoreExactSpeed());
    EXPECT_TRUE(l.IgnoreMinimumSpeed());
    EXPECT_EQ(100U, l.GetMinimumSpeed());
    EXPECT_TRUE(l.GetDuplex());
    EXPECT_TRUE(l.HasBeacon());
    EXPECT_FALSE(l.IgnoreBeacon());
    EXPECT_FALSE(l.HasPercentError());
    l.SetMinimumSpeed(100);  // setting again replaces the ignore mark
    EXPECT_FALSE(l.IgnoreMinimumSpeed());
    l.SetBeacon(true);
    EXPECT_TRUE(l.IgnoreBeacon());
    l.UnsetBeacon();
    EXPECT_FALSE(l.HasBeacon());
    EXPECT_FALSE(l.IgnoreBeacon());  // unset clears both marks
    l.UnsetExactSpeed();
    l.UnsetMinimumSpeed();
    l.UnsetDuplex();
    EXPECT_FALSE(l.IsSet());
}

TEST(NetAddrPolicy, DeriveTakesOnlyWhatIsMissing)
{
    ShapingPolicy parent = ShapingPolicy::GetDefaultPolicy(), child;
    child.SetAverageBps(5000);
    child.Derive(parent);
    EXPECT_EQ(5000U, child.GetAverageBps());
    EXPECT_TRUE(child.HasPeakBps());
    EXPECT_EQ(parent.GetPeakBps(), child.GetPeakBps());
    EXPECT_TRUE(child.HasEnabled());

    ShapingPolicy empty, untouched;
    untouched.SetBurstSize(7);
    untouched.Derive(empty);
    EXPECT_TRUE(untouched.HasBurstSize());
    EXPECT_FALSE(untouched.HasPeakBps());

    PortSecurityPolicy sec;
    sec.SetAllowPromiscuous(true);
    sec.Derive(PortSecurityPolicy::GetDefaultPolicy());
    EXPECT_TRUE(sec.GetAllowPromiscuous());
    EXPECT_TRUE(sec.GetAllowMacAddressChange());

    // Link criteria take the parent's ignore mark with its value.
    LinkCriteriaSelectionPolicy lc, lp;
    lc.SetExactSpeed(100);
    lp.SetExactSpeed(10, true);
    lp.SetPercentError(5, true);
    lp.SetBeacon(true);
    lc.Derive(lp);
    EXPECT_EQ(100U, lc.GetExactSpeed());
    EXPECT_FALSE(lc.IgnoreExactSpeed());
    EXPECT_EQ(5U, lc.GetPercentError());
    EXPECT_TRUE(lc.IgnorePercentError());
    EXPECT_TRUE(lc.HasBeacon() && lc.IgnoreBeacon());
    EXPECT_FALSE(lc.HasDuplex());

    // Teaming: criteria present on both sides are completed one by one.
    NicTeamingPolicy team, base = NicTeamingPolicy::GetDefaultPolicy();
    LinkCriteriaSelectionPolicy own;
    own.SetDuplex(true);
    team.SetLinkCriteria(own);
    team.SetReversePolicy(false);
    base.SetUplinkOrder({"uplink0"});
    team.Derive(base);
    EXPECT_FALSE(team.GetReversePolicy());
    EXPECT_EQ(NicTeamingPolicy::TEAM_POLICY_LB_SRCID, team.GetTeamingPolicy());
    EXPECT_EQ(1U, team.GetUplinkOrder().size());
    LinkCriteriaSelectionPolicy got = team.GetLinkCriteria();
    EXPECT_TRUE(got.GetDuplex());
    EXPECT_FALSE(got.IgnoreDuplex());
    EXPECT_TRUE(got.HasMinimumSpeed());
    EXPECT_FALSE(team.HasMaxActiveUplinks());
}

TEST(NetAddrPolicy, Defaults)
{
    EXPECT_EQ(int(NicTeamingPolicy::TEAM_POLICY_LB_SRCID), NicTeamingPolicy::DEF_TEAM_POLICY);
    NicTeamingPolicy t = NicTeamingPolicy::GetDefaultPolicy();
    EXPECT_EQ(NicTeamingPolicy::TEAM_POLICY_LB_SRCID, t.GetTeamingPolicy());
    EXPECT_TRUE(t.HasLinkCriteria() && t.GetLinkCriteria().IgnoreBeacon());
    EXPECT_FALSE(t.HasUplinkOrder());
    EXPECT_TRUE(ShapingPolicy::GetDefaultPolicy().IsValid());
    NicCapabilities n = NicCapabilities::GetDefaultPolicy();
    EXPECT_EQ((uint64(1) << 22) - 1, n.GetMask());
    EXPECT_TRUE(n.GetVlanTag() && n.GetScatterGatherSpanPagesTx());
    EXPECT_FALSE(n.GetChecksumOffloadIPv6());
}

TEST(NetAddrPolicy, ShapingValidityAndFill)
{
    ShapingPolicy s;
    EXPECT_TRUE(s.IsValid());
    s.SetEnabled(true);
    EXPECT_FALSE(s.IsValid());  // enabled without rates
    s.SetAverageBps(1000);
    s.SetPeakBps(2000);
    s.SetBurstSize(100);
    EXPECT_TRUE(s.IsValid());
    s.SetPeakBps(999);
    EXPECT_FALSE(s.IsValid());  // peak below average
    s.SetPeakBps(1000);
    s.SetBurstSize(0);
    EXPECT_FALSE(s.IsValid());

    ShapingPolicy partial;
    partial.SetAverageBps(3000000000ULL);
    ShapingPolicy filled = partial.FillValues();
    EXPECT_TRUE(filled.HasPeakBps() && filled.HasBurstSize() && filled.HasEnabled());
    EXPECT_EQ(3000000000ULL, filled.GetAverageBps());
    EXPECT_FALSE(partial.HasPeakBps());  // the source is unchanged
}

TEST(NetAddrPolicy, NicCapabilityBits)
{
    using Setter = void (NicCapabilities::*)(bool);
    using Getter = bool (NicCapabilities::*)();
    struct Cap { Setter set; void (NicCapabilities::*unset)(); Getter has, get; };
#define CAP(N) {&NicCapabilities::Set##N, &NicCapabilities::Unset##N, &NicCapabilities::Has##N, &NicCapabilities::Get##N}
    const Cap caps[] = {
        CAP(VlanTag), CAP(VlanUntag), CAP(ChecksumOffload), CAP(TcpSegmentationOffload), CAP(ScatterGatherTx),
        CAP(HighDMA), CAP(ScatterGatherSpanPagesTx), CAP(ChecksumOffloadIPv6), CAP(TcpSegmentationOffloadIPv6),
        CAP(TcpSegmentationOffload256k), CAP(UplinkReadOnlyInetHeaders), CAP(UPT), CAP(ENCAP), CAP(DCB),
        CAP(Offload8Offset), CAP(Offload16Offset), CAP(ChecksumOffloadIPv6ExtHdrs),
        CAP(TcpSegmentationOffloadIPv6ExtHdrs), CAP(Sched), CAP(SRIOV), CAP(AdjustHeaderAlignment),
        CAP(GenericOffload),
    };
#undef CAP
    ASSERT_EQ(22U, sizeof caps / sizeof *caps);
    for (int i = 0; i < 22; ++i) {
        NicCapabilities n;
        (n.*caps[i].set)(true);
        EXPECT_EQ(uint64(1) << i, n.GetMask()) << i;  // one distinct bit each
        EXPECT_EQ(uint64(1) << i, n.GetFlags()) << i;
        EXPECT_TRUE((n.*caps[i].has)());
        EXPECT_TRUE((n.*caps[i].get)());
        (n.*caps[i].set)(false);
        EXPECT_TRUE((n.*caps[i].has)());
        EXPECT_FALSE((n.*caps[i].get)());
        (n.*caps[i].unset)();
        EXPECT_FALSE((n.*caps[i].has)());
        EXPECT_FALSE(n.IsSet());
    }

    NicCapabilities words(0x5, 0x7 | (uint64(1) << 40));
    EXPECT_TRUE(words.GetVlanTag());
    EXPECT_FALSE(words.GetVlanUntag());
    EXPECT_TRUE(words.HasVlanUntag());
    EXPECT_FALSE(words.HasTcpSegmentationOffload());
    EXPECT_EQ(uint64(1) << 40, words.GetMask() & (uint64(1) << 40));  // unknown bits are kept

    NicCapabilities child;
    child.SetVlanTag(false);
    child.Derive(NicCapabilities::GetDefaultPolicy());
    EXPECT_FALSE(child.GetVlanTag());
    EXPECT_TRUE(child.GetVlanUntag());
    EXPECT_EQ((uint64(1) << 22) - 1, child.GetMask());

    NicCapabilities copy(child);
    copy.UnsetAll();
    EXPECT_TRUE(child.IsSet());
}

TEST(NetAddrPolicy, CopiesAreIndependent)
{
    NicTeamingPolicy a;
    a.SetUplinkOrder({"uplink0", "uplink1"});
    LinkCriteriaSelectionPolicy l;
    l.SetExactSpeed(10);
    a.SetLinkCriteria(l);
    NicTeamingPolicy b(a);
    b.SetUplinkOrder({"uplink9"});
    LinkCriteriaSelectionPolicy got = b.GetLinkCriteria();
    got.SetExactSpeed(99);
    l.SetExactSpeed(77);  // the stored criteria are a copy too
    EXPECT_EQ(2U, a.GetUplinkOrder().size());
    EXPECT_EQ(10U, a.GetLinkCriteria().GetExactSpeed());
    EXPECT_EQ(10U, b.GetLinkCriteria().GetExactSpeed());
}

TEST(NetAddrSerializer, PoliciesRoundTrip)
{
    NicTeamingPolicy team;
    team.SetTeamingPolicy(NicTeamingPolicy::TEAM_POLICY_LB_IP);
    team.SetNotifySwitchOnFailure(false);
    team.SetUplinkOrder({"uplink2", "uplink0", "uplink1"});
    team.SetMaxActiveUplinks(-2147483647 - 1);
    LinkCriteriaSelectionPolicy criteria;
    criteria.SetMinimumSpeed(1000, true);
    criteria.SetDuplex(true);
    criteria.SetBeacon(false);
    team.SetLinkCriteria(criteria);
    ConfigBranchPtr branch = NewBranch();
    NetworkPolicySerializer::SaveConfiguration(branch, team);
    std::string name;
    ASSERT_TRUE(branch->GetValue("teamingPolicy", name));
    EXPECT_EQ(NetworkPolicySerializer::TeamPolicyStr[NicTeamingPolicy::TEAM_POLICY_LB_IP], name);
    NicTeamingPolicy back = NicTeamingPolicy::GetDefaultPolicy();
    EXPECT_TRUE(NetworkPolicySerializer::LoadConfiguration(branch, back));
    EXPECT_EQ(NicTeamingPolicy::TEAM_POLICY_LB_IP, back.GetTeamingPolicy());
    EXPECT_FALSE(back.HasReversePolicy());  // replaced, not merged
    EXPECT_FALSE(back.GetNotifySwitchOnFailure());
    EXPECT_EQ(team.GetUplinkOrder(), back.GetUplinkOrder());
    EXPECT_EQ(-2147483647 - 1, back.GetMaxActiveUplinks());
    LinkCriteriaSelectionPolicy lc = back.GetLinkCriteria();
    EXPECT_TRUE(lc.HasMinimumSpeed() && lc.IgnoreMinimumSpeed());
    EXPECT_EQ(1000U, lc.GetMinimumSpeed());
    EXPECT_TRUE(lc.GetDuplex() && !lc.IgnoreDuplex());
    EXPECT_TRUE(lc.HasBeacon() && !lc.IgnoreBeacon());
    EXPECT_FALSE(lc.HasExactSpeed());

    // An empty uplink order is still an attribute that is set.
    NicTeamingPolicy emptyOrder;
    emptyOrder.SetUplinkOrder({});
    NetworkPolicySerializer::SaveConfiguration(branch, emptyOrder);
    NicTeamingPolicy loaded;
    EXPECT_TRUE(NetworkPolicySerializer::LoadConfiguration(branch, loaded));
    EXPECT_TRUE(loaded.HasUplinkOrder());
    EXPECT_FALSE(loaded.HasTeamingPolicy());

    ShapingPolicy shaping;
    shaping.SetPeakBps(18446744073709551615ULL);
    shaping.SetEnabled(true);
    NetworkPolicySerializer::SaveConfiguration(branch, shaping);
    ShapingPolicy shapingBack;
    EXPECT_TRUE(NetworkPolicySerializer::LoadConfiguration(branch, shapingBack));
    EXPECT_EQ(18446744073709551615ULL, shapingBack.GetPeakBps());
    EXPECT_TRUE(shapingBack.GetEnabled());
    EXPECT_FALSE(shapingBack.HasAverageBps());

    PortSecurityPolicy security = PortSecurityPolicy::GetDefaultPolicy();
    NetworkPolicySerializer::SaveConfiguration(branch, security);
    PortSecurityPolicy securityBack;
    EXPECT_TRUE(NetworkPolicySerializer::LoadConfiguration(branch, securityBack));
    EXPECT_TRUE(securityBack.HasAllowPromiscuous() && !securityBack.GetAllowPromiscuous());
    EXPECT_TRUE(securityBack.GetAllowForgedTransmits());

    NicCapabilities caps(0x3, 0xffULL | (uint64(1) << 63));
    NetworkPolicySerializer::SaveConfiguration(branch, caps);
    NicCapabilities capsBack;
    EXPECT_TRUE(NetworkPolicySerializer::LoadConfiguration(branch, capsBack));
    EXPECT_EQ(caps.GetFlags(), capsBack.GetFlags());
    EXPECT_EQ(caps.GetMask(), capsBack.GetMask());
}

TEST(NetAddrSerializer, IpConfigAndRoutingRoundTrip)
{
    IpConfig config;
    config.SetIpv4Address(Ipv4Address("192.168.10.5"));
    config.SetIpv4Netmask(Ipv4Address("255.255.255.0"));
    config.SetIpv4Broadcast(Ipv4Address("192.168.10.255"));
    config.SetUseDhcp(true);
    config.SetUseIpv6Dhcp(true);
    config.AddIpv6Network(Ipv6Network("2001:db8::5/64"));
    config.AddIpv6Network(Ipv6Network("fd00::5/48"));
    ConfigBranchPtr branch = NewBranch();
    NetworkPolicySerializer::SaveConfiguration(branch, config);
    IpConfig back;
    EXPECT_TRUE(NetworkPolicySerializer::LoadConfiguration(branch, back));
    EXPECT_TRUE(back.GetUseDhcp() && back.GetUseIpv6Dhcp() && back.GetDhcpDns());
    EXPECT_EQ("192.168.10.5", back.GetIpv4Address().GetStringAddress());
    EXPECT_EQ("192.168.10.255", back.GetIpv4Broadcast().GetStringAddress());
    ASSERT_EQ(2U, back.GetIpv6Network().size());
    EXPECT_EQ("fd00::5/48", back.GetIpv6Network()[1].GetStringAddress());

    IpConfig none;
    none.SetIpv4UseNone();
    NetworkPolicySerializer::SaveConfiguration(branch, none);
    EXPECT_TRUE(NetworkPolicySerializer::LoadConfiguration(branch, back));
    EXPECT_TRUE(back.GetIpv4UseNone());
    EXPECT_TRUE(back.GetIpv6Network().empty());

    IpRouting routing;
    routing.ipv4Gateway = Ipv4Address("10.0.0.1");
    routing.ipv4GatewayDevice = "hnic0";
    routing.ipv6Gateway = Ipv6Address("fe80::1");
    routing.ipv4Routes.emplace_back(Ipv4Network("172.16.0.0/12"), Ipv4Address("10.0.0.254"));
    routing.ipv6Routes.emplace_back(Ipv6Network("2001:db8:1::/48"), Ipv6Address("fe80::2"));
    NetworkPolicySerializer::SaveConfiguration(branch, routing);
    IpRouting routingBack;
    EXPECT_TRUE(NetworkPolicySerializer::LoadConfiguration(branch, routingBack));
    EXPECT_EQ("10.0.0.1", routingBack.ipv4Gateway.GetStringAddress());
    EXPECT_EQ("hnic0", routingBack.ipv4GatewayDevice);
    EXPECT_EQ("fe80::1", routingBack.ipv6Gateway.GetStringAddress());
    ASSERT_EQ(1U, routingBack.ipv4Routes.size());
    EXPECT_EQ("172.16.0.0/12", routingBack.ipv4Routes[0].first.GetStringAddress());
    ASSERT_EQ(1U, routingBack.ipv6Routes.size());
    EXPECT_EQ("fe80::2", routingBack.ipv6Routes[0].second.GetStringAddress());
}

TEST(NetAddrSerializer, RefusesBadInputAndLeavesPolicyAlone)
{
    ShapingPolicy shaping;
    EXPECT_THROW(NetworkPolicySerializer::SaveConfiguration(ConfigBranchPtr(), shaping), HostCtlException);
    EXPECT_THROW(NetworkPolicySerializer::LoadConfiguration(ConfigBranchPtr(), shaping), HostCtlException);

    // Nothing stored: false, policy untouched.
    shaping.SetBurstSize(42);
    EXPECT_FALSE(NetworkPolicySerializer::LoadConfiguration(NewBranch(), shaping));
    EXPECT_EQ(42U, shaping.GetBurstSize());

    struct Bad { char const *key, *value; };
    for (Bad bad : {Bad{"peakBps", "-1"}, Bad{"peakBps", "18446744073709551616"}, Bad{"peakBps", "012"},
                    Bad{"peakBps", ""}, Bad{"burstSize", "1e3"}, Bad{"enabled", "yes"}, Bad{"enabled", "TRUE"}}) {
        ConfigBranchPtr b = NewBranch();
        b->SetValue("averageBps", "10");
        b->SetValue(bad.key, bad.value);
        EXPECT_THROW(NetworkPolicySerializer::LoadConfiguration(b, shaping), HostCtlException) << bad.key << "=" << bad.value;
        EXPECT_EQ(42U, shaping.GetBurstSize());
        EXPECT_FALSE(shaping.HasAverageBps());
    }

    NicTeamingPolicy team;
    team.SetTeamingPolicy(NicTeamingPolicy::TeamPolicyType(NicTeamingPolicy::TEAM_POLICY_LAST_ELEMENT));
    ConfigBranchPtr kept = NewBranch();
    kept->SetValue("reversePolicy", "true");
    EXPECT_THROW(NetworkPolicySerializer::SaveConfiguration(kept, team), HostCtlException);
    std::string value;
    EXPECT_TRUE(kept->GetValue("reversePolicy", value));  // the branch is untouched

    for (Bad bad : {Bad{"teamingPolicy", "roundrobin"}, Bad{"maxActiveUplinks", "2147483648"},
                    Bad{"maxActiveUplinks", "-2147483649"}, Bad{"maxActiveUplinks", "--1"}}) {
        ConfigBranchPtr b = NewBranch();
        b->SetValue(bad.key, bad.value);
        EXPECT_THROW(NetworkPolicySerializer::LoadConfiguration(b, team), HostCtlException) << bad.key << "=" << bad.value;
    }
    ConfigBranchPtr gaps = NewBranch();
    gaps->GetBranch("uplinkOrder", true)->SetValue("1", "uplink1");
    EXPECT_THROW(NetworkPolicySerializer::LoadConfiguration(gaps, team), HostCtlException);

    LinkCriteriaSelectionPolicy criteria;
    for (Bad bad : {Bad{"exactSpeed", "100 skip"}, Bad{"exactSpeed", " ignore"}, Bad{"duplex", "2"},
                    Bad{"beacon", "on"}}) {
        ConfigBranchPtr b = NewBranch();
        b->SetValue(bad.key, bad.value);
        EXPECT_THROW(NetworkPolicySerializer::LoadConfiguration(b, criteria), HostCtlException) << bad.key << "=" << bad.value;
    }
    EXPECT_FALSE(criteria.IsSet());

    IpConfig config;
    config.SetIpv4UseNone();
    for (Bad bad : {Bad{"ipv4Address", "300.1.1.1"}, Bad{"ipv4Address", "0.0.0.0"}, Bad{"ipv4Netmask", "255.0.255.0"},
                    Bad{"dhcpDns", "true"}}) {
        ConfigBranchPtr b = NewBranch();
        b->SetValue(bad.key, bad.value);
        EXPECT_THROW(NetworkPolicySerializer::LoadConfiguration(b, config), HostCtlException) << bad.key << "=" << bad.value;
        EXPECT_TRUE(config.GetIpv4UseNone());
    }
    ConfigBranchPtr dup = NewBranch();
    ConfigBranchPtr list = dup->GetBranch("ipv6Networks", true);
    list->SetValue("0", "fe80::1/64");
    list->SetValue("1", "fe80::1/64");
    EXPECT_THROW(NetworkPolicySerializer::LoadConfiguration(dup, config), HostCtlException);

    IpRouting routing;
    ConfigBranchPtr route = NewBranch();
    route->GetBranch("ipv4Routes", true)->SetValue("0", "10.0.0.0/8");
    EXPECT_THROW(NetworkPolicySerializer::LoadConfiguration(route, routing), HostCtlException);
}
