#include "network/policy.h"

// The four accessors of one optional attribute held in member with set bit.
#define POLICY_ATTRIBUTE(Class, Name, Type, member, bit) \
    void Class::Set##Name(Type value) { member = value; set_ |= bit; } \
    void Class::Unset##Name() { set_ &= ~uint32(bit); } \
    bool Class::Has##Name() { return (set_ & bit) != 0; } \
    Type Class::Get##Name() { return member; }

// Derive: take the parent's value of an attribute not set here.
#define DERIVE(member, bit) \
    if (!(set_ & bit) && (parent.set_ & bit)) { member = parent.member; set_ |= bit; }

namespace HostCtl {
namespace Network {

// ---- LinkCriteriaSelectionPolicy ----

const std::string LinkCriteriaSelectionPolicy::IGNORE_STR = "ignore";

LinkCriteriaSelectionPolicy::LinkCriteriaSelectionPolicy()
    : set_(0), ignore_(0), exactSpeed_(0), minimumSpeed_(0), percentError_(0), duplex_(false) {}

LinkCriteriaSelectionPolicy LinkCriteriaSelectionPolicy::GetDefaultPolicy()
{
    LinkCriteriaSelectionPolicy p;
    p.SetExactSpeed(0, true);
    p.SetMinimumSpeed(10, true);
    p.SetPercentError(0, true);
    p.SetDuplex(false, true);
    p.SetBeacon(true);
    return p;
}

void LinkCriteriaSelectionPolicy::Mark(uint32 bit, bool ignore)
{
    set_ |= bit;
    ignore_ = ignore ? (ignore_ | bit) : (ignore_ & ~bit);
}

void LinkCriteriaSelectionPolicy::Derive(LinkCriteriaSelectionPolicy const &parent)
{
    uint32 taken = ~set_ & parent.set_;
    DERIVE(exactSpeed_, EXACT_SPEED)
    DERIVE(minimumSpeed_, MINIMUM_SPEED)
    DERIVE(percentError_, PERCENT_ERROR)
    DERIVE(duplex_, DUPLEX)
    set_ |= parent.set_ & BEACON;
    ignore_ = (ignore_ & ~taken) | (parent.ignore_ & taken);
}

bool LinkCriteriaSelectionPolicy::IsSet() { return set_ != 0; }

#define LINK_CRITERION(Name, Type, member, bit) \
    void LinkCriteriaSelectionPolicy::Set##Name(Type value, bool ignore) { member = value; Mark(bit, ignore); } \
    void LinkCriteriaSelectionPolicy::Unset##Name() { set_ &= ~uint32(bit); ignore_ &= ~uint32(bit); } \
    bool LinkCriteriaSelectionPolicy::Has##Name() { return (set_ & bit) != 0; } \
    Type LinkCriteriaSelectionPolicy::Get##Name() { return member; } \
    bool LinkCriteriaSelectionPolicy::Ignore##Name() { return (ignore_ & bit) != 0; }

LINK_CRITERION(ExactSpeed, uint32, exactSpeed_, EXACT_SPEED)
LINK_CRITERION(MinimumSpeed, uint32, minimumSpeed_, MINIMUM_SPEED)
LINK_CRITERION(PercentError, uint32, percentError_, PERCENT_ERROR)
LINK_CRITERION(Duplex, bool, duplex_, DUPLEX)

void LinkCriteriaSelectionPolicy::SetBeacon(bool ignore) { Mark(BEACON, ignore); }
void LinkCriteriaSelectionPolicy::UnsetBeacon() { set_ &= ~uint32(BEACON); ignore_ &= ~uint32(BEACON); }
bool LinkCriteriaSelectionPolicy::HasBeacon() { return (set_ & BEACON) != 0; }
bool LinkCriteriaSelectionPolicy::IgnoreBeacon() { return (ignore_ & BEACON) != 0; }

// ---- NicTeamingPolicy ----

const int NicTeamingPolicy::DEF_TEAM_POLICY;

NicTeamingPolicy::NicTeamingPolicy()
    : set_(0), teamingPolicy_(TeamPolicyType(DEF_TEAM_POLICY)), reversePolicy_(false),
      notifySwitchOnFailure_(false), rollingRestoration_(false), maxActiveUplinks_(0) {}

NicTeamingPolicy NicTeamingPolicy::GetDefaultPolicy()
{
    NicTeamingPolicy p;
    p.SetTeamingPolicy(TeamPolicyType(DEF_TEAM_POLICY));
    p.SetReversePolicy(true);
    p.SetNotifySwitchOnFailure(true);
    p.SetLinkCriteria(LinkCriteriaSelectionPolicy::GetDefaultPolicy());
    p.SetRollingRestoration(false);
    return p;
}

void NicTeamingPolicy::Derive(NicTeamingPolicy const &parent)
{
    // Link criteria set on both sides are completed criterion by criterion.
    if ((set_ & LINK_CRITERIA) && (parent.set_ & LINK_CRITERIA))
        linkCriteria_.Derive(parent.linkCriteria_);
    DERIVE(teamingPolicy_, TEAMING_POLICY)
    DERIVE(reversePolicy_, REVERSE_POLICY)
    DERIVE(notifySwitchOnFailure_, NOTIFY_SWITCH)
    DERIVE(linkCriteria_, LINK_CRITERIA)
    DERIVE(uplinkOrder_, UPLINK_ORDER)
    DERIVE(rollingRestoration_, ROLLING_RESTORATION)
    DERIVE(maxActiveUplinks_, MAX_ACTIVE_UPLINKS)
}

bool NicTeamingPolicy::IsSet() { return set_ != 0; }

void NicTeamingPolicy::UnsetAll() { set_ = 0; }

POLICY_ATTRIBUTE(NicTeamingPolicy, TeamingPolicy, NicTeamingPolicy::TeamPolicyType, teamingPolicy_, TEAMING_POLICY)
POLICY_ATTRIBUTE(NicTeamingPolicy, ReversePolicy, bool, reversePolicy_, REVERSE_POLICY)
POLICY_ATTRIBUTE(NicTeamingPolicy, NotifySwitchOnFailure, bool, notifySwitchOnFailure_, NOTIFY_SWITCH)
POLICY_ATTRIBUTE(NicTeamingPolicy, LinkCriteria, LinkCriteriaSelectionPolicy, linkCriteria_, LINK_CRITERIA)
POLICY_ATTRIBUTE(NicTeamingPolicy, UplinkOrder, std::vector<std::string>, uplinkOrder_, UPLINK_ORDER)
POLICY_ATTRIBUTE(NicTeamingPolicy, RollingRestoration, bool, rollingRestoration_, ROLLING_RESTORATION)
POLICY_ATTRIBUTE(NicTeamingPolicy, MaxActiveUplinks, int, maxActiveUplinks_, MAX_ACTIVE_UPLINKS)

// ---- ShapingPolicy ----

namespace {
const uint64 DEFAULT_PEAK_BPS = 100000000;
const uint64 DEFAULT_AVERAGE_BPS = 100000000;
const uint64 DEFAULT_BURST_SIZE = 104857600;
}

ShapingPolicy::ShapingPolicy() : set_(0), peakBps_(0), averageBps_(0), burstSize_(0), enabled_(false) {}

ShapingPolicy ShapingPolicy::GetDefaultPolicy()
{
    ShapingPolicy p;
    p.SetPeakBps(DEFAULT_PEAK_BPS);
    p.SetAverageBps(DEFAULT_AVERAGE_BPS);
    p.SetBurstSize(DEFAULT_BURST_SIZE);
    p.SetEnabled(false);
    return p;
}

void ShapingPolicy::Derive(ShapingPolicy const &parent)
{
    DERIVE(peakBps_, PEAK_BPS)
    DERIVE(averageBps_, AVERAGE_BPS)
    DERIVE(burstSize_, BURST_SIZE)
    DERIVE(enabled_, ENABLED)
}

bool ShapingPolicy::IsSet() { return set_ != 0; }

void ShapingPolicy::UnsetAll() { set_ = 0; }

bool ShapingPolicy::IsValid()
{
    if (((set_ & PEAK_BPS) && !peakBps_) || ((set_ & AVERAGE_BPS) && !averageBps_) ||
        ((set_ & BURST_SIZE) && !burstSize_))
        return false;
    if ((set_ & PEAK_BPS) && (set_ & AVERAGE_BPS) && peakBps_ < averageBps_) return false;
    uint32 all = PEAK_BPS | AVERAGE_BPS | BURST_SIZE;
    return !((set_ & ENABLED) && enabled_ && (set_ & all) != all);
}

ShapingPolicy ShapingPolicy::FillValues()
{
    ShapingPolicy filled(*this);
    filled.Derive(GetDefaultPolicy());
    return filled;
}

POLICY_ATTRIBUTE(ShapingPolicy, PeakBps, uint64, peakBps_, PEAK_BPS)
POLICY_ATTRIBUTE(ShapingPolicy, AverageBps, uint64, averageBps_, AVERAGE_BPS)
POLICY_ATTRIBUTE(ShapingPolicy, BurstSize, uint64, burstSize_, BURST_SIZE)
POLICY_ATTRIBUTE(ShapingPolicy, Enabled, bool, enabled_, ENABLED)

// ---- PortSecurityPolicy ----

PortSecurityPolicy::PortSecurityPolicy()
    : set_(0), allowPromiscuous_(false), allowMacAddressChange_(false), allowForgedTransmits_(false) {}

PortSecurityPolicy PortSecurityPolicy::GetDefaultPolicy()
{
    PortSecurityPolicy p;
    p.SetAllowPromiscuous(false);
    p.SetAllowMacAddressChange(true);
    p.SetAllowForgedTransmits(true);
    return p;
}

void PortSecurityPolicy::Derive(PortSecurityPolicy const &parent)
{
    DERIVE(allowPromiscuous_, ALLOW_PROMISCUOUS)
    DERIVE(allowMacAddressChange_, ALLOW_MAC_CHANGE)
    DERIVE(allowForgedTransmits_, ALLOW_FORGED_TRANSMITS)
}

bool PortSecurityPolicy::IsSet() { return set_ != 0; }

void PortSecurityPolicy::UnsetAll() { set_ = 0; }

POLICY_ATTRIBUTE(PortSecurityPolicy, AllowPromiscuous, bool, allowPromiscuous_, ALLOW_PROMISCUOUS)
POLICY_ATTRIBUTE(PortSecurityPolicy, AllowMacAddressChange, bool, allowMacAddressChange_, ALLOW_MAC_CHANGE)
POLICY_ATTRIBUTE(PortSecurityPolicy, AllowForgedTransmits, bool, allowForgedTransmits_, ALLOW_FORGED_TRANSMITS)

// ---- NicCapabilities ----

namespace {
const int NIC_CAPABILITY_COUNT = 22;
const int NIC_DEFAULT_ON = 7;  // VlanTag .. ScatterGatherSpanPagesTx
}

NicCapabilities::NicCapabilities() : flags_(0), mask_(0) {}

NicCapabilities::NicCapabilities(uint64 flags, uint64 mask) : flags_(flags), mask_(mask) {}

NicCapabilities NicCapabilities::GetDefaultPolicy()
{
    uint64 all = (uint64(1) << NIC_CAPABILITY_COUNT) - 1;
    return NicCapabilities((uint64(1) << NIC_DEFAULT_ON) - 1, all);
}

void NicCapabilities::Derive(NicCapabilities const &parent)
{
    uint64 taken = ~mask_ & parent.mask_;
    flags_ = (flags_ & ~taken) | (parent.flags_ & taken);
    mask_ |= taken;
}

bool NicCapabilities::IsSet() { return mask_ != 0; }

void NicCapabilities::UnsetAll() { mask_ = 0; }

uint64 NicCapabilities::GetFlags() { return flags_; }

uint64 NicCapabilities::GetMask() { return mask_; }

void NicCapabilities::Put(int bit, bool enabled)
{
    uint64 b = uint64(1) << bit;
    mask_ |= b;
    flags_ = enabled ? (flags_ | b) : (flags_ & ~b);
}

void NicCapabilities::Clear(int bit)
{
    uint64 b = uint64(1) << bit;
    mask_ &= ~b;
    flags_ &= ~b;
}

#define NIC_CAPABILITY(Name, bit) \
    void NicCapabilities::Set##Name(bool enabled) { Put(bit, enabled); } \
    void NicCapabilities::Unset##Name() { Clear(bit); } \
    bool NicCapabilities::Has##Name() { return (mask_ >> bit) & 1; } \
    bool NicCapabilities::Get##Name() { return (flags_ >> bit) & 1; }

NIC_CAPABILITY(VlanTag, 0)
NIC_CAPABILITY(VlanUntag, 1)
NIC_CAPABILITY(ChecksumOffload, 2)
NIC_CAPABILITY(TcpSegmentationOffload, 3)
NIC_CAPABILITY(ScatterGatherTx, 4)
NIC_CAPABILITY(HighDMA, 5)
NIC_CAPABILITY(ScatterGatherSpanPagesTx, 6)
NIC_CAPABILITY(ChecksumOffloadIPv6, 7)
NIC_CAPABILITY(TcpSegmentationOffloadIPv6, 8)
NIC_CAPABILITY(TcpSegmentationOffload256k, 9)
NIC_CAPABILITY(UplinkReadOnlyInetHeaders, 10)
NIC_CAPABILITY(UPT, 11)
NIC_CAPABILITY(ENCAP, 12)
NIC_CAPABILITY(DCB, 13)
NIC_CAPABILITY(Offload8Offset, 14)
NIC_CAPABILITY(Offload16Offset, 15)
NIC_CAPABILITY(ChecksumOffloadIPv6ExtHdrs, 16)
NIC_CAPABILITY(TcpSegmentationOffloadIPv6ExtHdrs, 17)
NIC_CAPABILITY(Sched, 18)
NIC_CAPABILITY(SRIOV, 19)
NIC_CAPABILITY(AdjustHeaderAlignment, 20)
NIC_CAPABILITY(GenericOffload, 21)

// ---- MacConfig ----

MacConfig::MacConfig() : prefixLength(0), addrOp(ACL_ADDR_ANY) {}

} // namespace Network
} // namespace HostCtl
