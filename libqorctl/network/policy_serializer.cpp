// Layout of a policy branch: one value per set attribute under the
// attribute's name (first letter lower case); booleans "true"/"false",
// numbers in decimal. Lists (uplink order, IPv6 addresses, routes) are child
// branches with values "0", "1", ...; a present list branch marks the
// attribute set even when empty. Link criteria are "<value>" or
// "<value> ignore" ("set"/"ignore" for the beacon); the teaming policy is
// its name from TeamPolicyStr.
#include <cerrno>
#include <cstdlib>

#include "addrtext.h"
#include "config_branch.h"
#include "ip_routing.h"

using namespace HostCtl::Network;
using QorCtl::Config::ConfigBranch;
using QorCtl::Network::AddrText::Fail;

namespace QorCtl {
namespace Network {

char const *NetworkPolicySerializer::TeamPolicyStr[] = {
    "none", "loadbalance_ip", "loadbalance_srcmac", "loadbalance_srcid", "failover_explicit",
};

NetworkPolicySerializer::NetworkPolicySerializer() {}

namespace {

ConfigBranch &Need(ConfigBranchPtr const &branch)
{
    if (!branch) Fail("no configuration branch given");
    return *branch;
}

[[noreturn]] void BadValue(std::string const &key, std::string const &value, char const *what)
{
    Fail("configuration value " + key + " = '" + value + "' is not " + what);
}

// Reads the values of one branch with checked conversions.
class Reader {
public:
    explicit Reader(ConfigBranch &branch) : branch_(branch) {}

    bool Text(char const *key, std::string &out) { return branch_.GetValue(key, out); }

    bool Bool(char const *key, bool &out)
    {
        std::string v;
        if (!branch_.GetValue(key, v)) return false;
        if (v != "true" && v != "false") BadValue(key, v, "true or false");
        out = v == "true";
        return true;
    }

    bool Unsigned(char const *key, uint64 max, uint64 &out)
    {
        std::string v;
        if (!branch_.GetValue(key, v)) return false;
        out = ParseUnsigned(key, v, max);
        return true;
    }

    bool Signed(char const *key, int &out)
    {
        std::string v;
        if (!branch_.GetValue(key, v)) return false;
        bool negative = !v.empty() && v[0] == '-';
        uint64 magnitude = ParseUnsigned(key, negative ? v.substr(1) : v, 2147483648ULL);
        if (!negative && magnitude > 2147483647ULL) BadValue(key, v, "a 32-bit integer");
        out = negative ? int(-int64(magnitude)) : int(magnitude);
        return true;
    }

    // A list branch; false when absent.
    bool List(char const *name, std::vector<std::string> &out)
    {
        ConfigBranchPtr child = branch_.GetBranch(name, false);
        if (!child) return false;
        out.clear();
        std::string v;
        while (child->GetValue(std::to_string(out.size()), v)) out.push_back(v);
        if (out.size() != child->GetKeys().size()) Fail(std::string("configuration list ") + name + " has gaps");
        return true;
    }

    static uint64 ParseUnsigned(std::string const &key, std::string const &v, uint64 max)
    {
        if (v.empty() || v.size() > 20 || v.find_first_not_of("0123456789") != std::string::npos ||
            (v.size() > 1 && v[0] == '0'))
            BadValue(key, v, "a decimal number");
        errno = 0;
        unsigned long long n = std::strtoull(v.c_str(), nullptr, 10);
        if (errno == ERANGE || n > max) BadValue(key, v, "in range");
        return n;
    }

private:
    ConfigBranch &branch_;
};

std::string BoolText(bool b) { return b ? "true" : "false"; }

void WriteList(ConfigBranch &branch, char const *name, std::vector<std::string> const &items)
{
    ConfigBranchPtr child = branch.GetBranch(name, true);
    child->Clear();
    for (size_t i = 0; i < items.size(); ++i) child->SetValue(std::to_string(i), items[i]);
}

// "<network> <gateway>" of a route.
std::pair<std::string, std::string> SplitRoute(std::string const &entry)
{
    size_t space = entry.find(' ');
    if (space == std::string::npos) Fail("configuration route '" + entry + "' has no gateway");
    return {entry.substr(0, space), entry.substr(space + 1)};
}

} // namespace

// ---- IpConfig ----

bool NetworkPolicySerializer::LoadConfiguration(ConfigBranchPtr branch, IpConfig &policy)
{
    ConfigBranch &b = Need(branch);
    if (b.IsEmpty()) return false;
    Reader r(b);
    IpConfig c;
    std::string text;
    bool flag;
    if (r.Bool("ipv4None", flag) && flag) {
        c.SetIpv4UseNone();
    } else {
        if (r.Text("ipv4Address", text)) c.SetIpv4Address(Ipv4Address(text));
        if (r.Text("ipv4Netmask", text)) c.SetIpv4Netmask(Ipv4Address(text));
        if (r.Text("ipv4Broadcast", text)) c.SetIpv4Broadcast(Ipv4Address(text));
        if (r.Bool("useDhcp", flag)) c.SetUseDhcp(flag, false);
    }
    if (r.Bool("useIpv6Dhcp", flag)) c.SetUseIpv6Dhcp(flag);
    if (r.Bool("useIpv6RouterAdvertised", flag)) c.SetUseIpv6RouterAdvertised(flag);
    if (r.Bool("dhcpDns", flag)) c.SetDhcpDns(flag);
    std::vector<std::string> networks;
    if (r.List("ipv6Networks", networks))
        for (std::string const &n : networks) c.AddIpv6Network(Ipv6Network(n));
    policy = c;
    return true;
}

void NetworkPolicySerializer::SaveConfiguration(ConfigBranchPtr branch, IpConfig &policy)
{
    ConfigBranch &b = Need(branch);
    b.Clear();
    b.SetValue("ipv4None", BoolText(policy.GetIpv4UseNone()));
    b.SetValue("useDhcp", BoolText(policy.GetUseDhcp()));
    b.SetValue("useIpv6Dhcp", BoolText(policy.GetUseIpv6Dhcp()));
    b.SetValue("useIpv6RouterAdvertised", BoolText(policy.GetUseIpv6RouterAdvertised()));
    b.SetValue("dhcpDns", BoolText(policy.GetDhcpDns()));
    Ipv4Address a = policy.GetIpv4Address(), m = policy.GetIpv4Netmask(), c = policy.GetIpv4Broadcast();
    if (a.GetBinaryAddress()) b.SetValue("ipv4Address", a.GetStringAddress());
    if (m.GetBinaryAddress()) b.SetValue("ipv4Netmask", m.GetStringAddress());
    if (c.GetBinaryAddress()) b.SetValue("ipv4Broadcast", c.GetStringAddress());
    std::vector<std::string> networks;
    for (Ipv6Network &n : policy.GetIpv6Network()) networks.push_back(n.GetStringAddress());
    WriteList(b, "ipv6Networks", networks);
}

// ---- IpRouting ----

bool NetworkPolicySerializer::LoadConfiguration(ConfigBranchPtr branch, IpRouting &policy)
{
    ConfigBranch &b = Need(branch);
    if (b.IsEmpty()) return false;
    Reader r(b);
    IpRouting routing;
    std::string text;
    if (r.Text("ipv4Gateway", text)) routing.ipv4Gateway = Ipv4Address(text);
    if (r.Text("ipv4GatewayDevice", text)) routing.ipv4GatewayDevice = text;
    if (r.Text("ipv6Gateway", text)) routing.ipv6Gateway = Ipv6Address(text);
    std::vector<std::string> routes;
    if (r.List("ipv4Routes", routes))
        for (std::string const &entry : routes) {
            auto parts = SplitRoute(entry);
            routing.ipv4Routes.emplace_back(Ipv4Network(parts.first), Ipv4Address(parts.second));
        }
    if (r.List("ipv6Routes", routes))
        for (std::string const &entry : routes) {
            auto parts = SplitRoute(entry);
            routing.ipv6Routes.emplace_back(Ipv6Network(parts.first), Ipv6Address(parts.second));
        }
    policy = routing;
    return true;
}

void NetworkPolicySerializer::SaveConfiguration(ConfigBranchPtr branch, IpRouting &policy)
{
    ConfigBranch &b = Need(branch);
    b.Clear();
    b.SetValue("ipv4Gateway", policy.ipv4Gateway.GetStringAddress());
    b.SetValue("ipv4GatewayDevice", policy.ipv4GatewayDevice);
    b.SetValue("ipv6Gateway", policy.ipv6Gateway.GetStringAddress());
    std::vector<std::string> routes;
    for (auto &route : policy.ipv4Routes)
        routes.push_back(route.first.GetStringAddress() + " " + route.second.GetStringAddress());
    WriteList(b, "ipv4Routes", routes);
    routes.clear();
    for (auto &route : policy.ipv6Routes)
        routes.push_back(route.first.GetStringAddress() + " " + route.second.GetStringAddress());
    WriteList(b, "ipv6Routes", routes);
}

// ---- LinkCriteriaSelectionPolicy ----

namespace {

// "<number>" or "<number> ignore".
bool ReadCriterion(ConfigBranch &b, char const *key, uint32 &value, bool &ignore)
{
    std::string v;
    if (!b.GetValue(key, v)) return false;
    std::string const suffix = " " + LinkCriteriaSelectionPolicy::IGNORE_STR;
    ignore = v.size() > suffix.size() && v.compare(v.size() - suffix.size(), suffix.size(), suffix) == 0;
    value = uint32(Reader::ParseUnsigned(key, ignore ? v.substr(0, v.size() - suffix.size()) : v, 0xffffffffU));
    return true;
}

void WriteCriterion(ConfigBranch &b, char const *key, uint32 value, bool ignore)
{
    b.SetValue(key, std::to_string(value) + (ignore ? " " + LinkCriteriaSelectionPolicy::IGNORE_STR : ""));
}

} // namespace

bool NetworkPolicySerializer::LoadConfiguration(ConfigBranchPtr branch, LinkCriteriaSelectionPolicy &policy)
{
    ConfigBranch &b = Need(branch);
    if (b.IsEmpty()) return false;
    LinkCriteriaSelectionPolicy p;
    uint32 value;
    bool ignore;
    if (ReadCriterion(b, "exactSpeed", value, ignore)) p.SetExactSpeed(value, ignore);
    if (ReadCriterion(b, "minimumSpeed", value, ignore)) p.SetMinimumSpeed(value, ignore);
    if (ReadCriterion(b, "percentError", value, ignore)) p.SetPercentError(value, ignore);
    if (ReadCriterion(b, "duplex", value, ignore)) {
        if (value > 1) BadValue("duplex", std::to_string(value), "0 or 1");
        p.SetDuplex(value == 1, ignore);
    }
    std::string beacon;
    if (b.GetValue("beacon", beacon)) {
        if (beacon != "set" && beacon != LinkCriteriaSelectionPolicy::IGNORE_STR)
            BadValue("beacon", beacon, "set or ignore");
        p.SetBeacon(beacon != "set");
    }
    policy = p;
    return true;
}

void NetworkPolicySerializer::SaveConfiguration(ConfigBranchPtr branch, LinkCriteriaSelectionPolicy &policy)
{
    ConfigBranch &b = Need(branch);
    b.Clear();
    LinkCriteriaSelectionPolicy &p = policy;
    if (p.HasExactSpeed()) WriteCriterion(b, "exactSpeed", p.GetExactSpeed(), p.IgnoreExactSpeed());
    if (p.HasMinimumSpeed()) WriteCriterion(b, "minimumSpeed", p.GetMinimumSpeed(), p.IgnoreMinimumSpeed());
    if (p.HasPercentError()) WriteCriterion(b, "percentError", p.GetPercentError(), p.IgnorePercentError());
    if (p.HasDuplex()) WriteCriterion(b, "duplex", p.GetDuplex() ? 1 : 0, p.IgnoreDuplex());
    if (p.HasBeacon()) b.SetValue("beacon", p.IgnoreBeacon() ? LinkCriteriaSelectionPolicy::IGNORE_STR : "set");
}

// ---- NicCapabilities ----

bool NetworkPolicySerializer::LoadConfiguration(ConfigBranchPtr branch, NicCapabilities &policy)
{
    ConfigBranch &b = Need(branch);
    if (b.IsEmpty()) return false;
    Reader r(b);
    uint64 flags = 0, mask = 0;
    r.Unsigned("flags", ~uint64(0), flags);
    r.Unsigned("mask", ~uint64(0), mask);
    policy = NicCapabilities(flags, mask);
    return true;
}

void NetworkPolicySerializer::SaveConfiguration(ConfigBranchPtr branch, NicCapabilities &policy)
{
    ConfigBranch &b = Need(branch);
    b.Clear();
    b.SetValue("flags", std::to_string(policy.GetFlags()));
    b.SetValue("mask", std::to_string(policy.GetMask()));
}

// ---- NicTeamingPolicy ----

bool NetworkPolicySerializer::LoadConfiguration(ConfigBranchPtr branch, NicTeamingPolicy &policy)
{
    ConfigBranch &b = Need(branch);
    if (b.IsEmpty()) return false;
    Reader r(b);
    NicTeamingPolicy p;
    std::string text;
    bool flag;
    int count;
    if (r.Text("teamingPolicy", text)) {
        int found = -1;
        for (int i = 0; i < NicTeamingPolicy::TEAM_POLICY_LAST_ELEMENT; ++i)
            if (text == TeamPolicyStr[i]) found = i;
        if (found < 0) BadValue("teamingPolicy", text, "a teaming policy name");
        p.SetTeamingPolicy(NicTeamingPolicy::TeamPolicyType(found));
    }
    if (r.Bool("reversePolicy", flag)) p.SetReversePolicy(flag);
    if (r.Bool("notifySwitchOnFailure", flag)) p.SetNotifySwitchOnFailure(flag);
    if (ConfigBranchPtr criteria = b.GetBranch("linkCriteria", false)) {
        LinkCriteriaSelectionPolicy c;
        LoadConfiguration(criteria, c);
        p.SetLinkCriteria(c);
    }
    std::vector<std::string> order;
    if (r.List("uplinkOrder", order)) p.SetUplinkOrder(order);
    if (r.Bool("rollingRestoration", flag)) p.SetRollingRestoration(flag);
    if (r.Signed("maxActiveUplinks", count)) p.SetMaxActiveUplinks(count);
    policy = p;
    return true;
}

void NetworkPolicySerializer::SaveConfiguration(ConfigBranchPtr branch, NicTeamingPolicy &policy)
{
    ConfigBranch &b = Need(branch);
    NicTeamingPolicy &p = policy;
    int team = p.GetTeamingPolicy();
    if (p.HasTeamingPolicy() && (team < 0 || team >= NicTeamingPolicy::TEAM_POLICY_LAST_ELEMENT))
        Fail("teaming policy " + std::to_string(team) + " is not a known policy");
    b.Clear();
    if (p.HasTeamingPolicy()) b.SetValue("teamingPolicy", TeamPolicyStr[team]);
    if (p.HasReversePolicy()) b.SetValue("reversePolicy", BoolText(p.GetReversePolicy()));
    if (p.HasNotifySwitchOnFailure()) b.SetValue("notifySwitchOnFailure", BoolText(p.GetNotifySwitchOnFailure()));
    if (p.HasLinkCriteria()) {
        LinkCriteriaSelectionPolicy c = p.GetLinkCriteria();
        SaveConfiguration(b.GetBranch("linkCriteria", true), c);
    }
    if (p.HasUplinkOrder()) WriteList(b, "uplinkOrder", p.GetUplinkOrder());
    if (p.HasRollingRestoration()) b.SetValue("rollingRestoration", BoolText(p.GetRollingRestoration()));
    if (p.HasMaxActiveUplinks()) b.SetValue("maxActiveUplinks", std::to_string(p.GetMaxActiveUplinks()));
}

// ---- PortSecurityPolicy ----

bool NetworkPolicySerializer::LoadConfiguration(ConfigBranchPtr branch, PortSecurityPolicy &policy)
{
    ConfigBranch &b = Need(branch);
    if (b.IsEmpty()) return false;
    Reader r(b);
    PortSecurityPolicy p;
    bool flag;
    if (r.Bool("allowPromiscuous", flag)) p.SetAllowPromiscuous(flag);
    if (r.Bool("allowMacAddressChange", flag)) p.SetAllowMacAddressChange(flag);
    if (r.Bool("allowForgedTransmits", flag)) p.SetAllowForgedTransmits(flag);
    policy = p;
    return true;
}

void NetworkPolicySerializer::SaveConfiguration(ConfigBranchPtr branch, PortSecurityPolicy &policy)
{
    ConfigBranch &b = Need(branch);
    b.Clear();
    PortSecurityPolicy &p = policy;
    if (p.HasAllowPromiscuous()) b.SetValue("allowPromiscuous", BoolText(p.GetAllowPromiscuous()));
    if (p.HasAllowMacAddressChange()) b.SetValue("allowMacAddressChange", BoolText(p.GetAllowMacAddressChange()));
    if (p.HasAllowForgedTransmits()) b.SetValue("allowForgedTransmits", BoolText(p.GetAllowForgedTransmits()));
}

// ---- ShapingPolicy ----

bool NetworkPolicySerializer::LoadConfiguration(ConfigBranchPtr branch, ShapingPolicy &policy)
{
    ConfigBranch &b = Need(branch);
    if (b.IsEmpty()) return false;
    Reader r(b);
    ShapingPolicy p;
    uint64 n;
    bool flag;
    if (r.Unsigned("peakBps", ~uint64(0), n)) p.SetPeakBps(n);
    if (r.Unsigned("averageBps", ~uint64(0), n)) p.SetAverageBps(n);
    if (r.Unsigned("burstSize", ~uint64(0), n)) p.SetBurstSize(n);
    if (r.Bool("enabled", flag)) p.SetEnabled(flag);
    policy = p;
    return true;
}

void NetworkPolicySerializer::SaveConfiguration(ConfigBranchPtr branch, ShapingPolicy &policy)
{
    ConfigBranch &b = Need(branch);
    b.Clear();
    ShapingPolicy &p = policy;
    if (p.HasPeakBps()) b.SetValue("peakBps", std::to_string(p.GetPeakBps()));
    if (p.HasAverageBps()) b.SetValue("averageBps", std::to_string(p.GetAverageBps()));
    if (p.HasBurstSize()) b.SetValue("burstSize", std::to_string(p.GetBurstSize()));
    if (p.HasEnabled()) b.SetValue("enabled", BoolText(p.GetEnabled()));
}

} // namespace Network
} // namespace QorCtl
