// Network policy values carried by standard switches, port groups and
// distributed ports: link selection criteria, NIC teaming, traffic shaping,
// port security and the NIC capability set, plus the MAC address part of an
// access-control rule.
//
// Every policy is a set of optional attributes. Set<X>(value) stores the
// value and marks the attribute set, Unset<X>() clears the mark (the value
// stays but is no longer meaningful), Has<X>() tests the mark and Get<X>()
// returns the stored value. IsSet() is true when any attribute is set.
// Derive(parent) fills every attribute that is not set here but is set in
// parent with the parent's value (and mark). GetDefaultPolicy() returns the
// host's defaults with their attributes set.
#ifndef HOSTCTL_NETWORK_POLICY_H
#define HOSTCTL_NETWORK_POLICY_H

#include <string>
#include <vector>

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// How uplink failure is detected. Each criterion has, besides its set mark,
// an ignore mark (Ignore<X>()): an ignored criterion is kept but not used.
// Speeds are in Mbit/s, PercentError in percent, Duplex true for full
// duplex. Beacon has only marks: set means beacon probing is configured.
// The defaults set every criterion and ignore them all (link state only):
// ExactSpeed 0, MinimumSpeed 10, PercentError 0, Duplex false, Beacon.
class LinkCriteriaSelectionPolicy {
public:
    // The word a saved configuration uses to mark an ignored criterion.
    static const std::string IGNORE_STR;

    LinkCriteriaSelectionPolicy();
    static LinkCriteriaSelectionPolicy GetDefaultPolicy();
    void Derive(LinkCriteriaSelectionPolicy const &parent);
    bool IsSet();

    void SetExactSpeed(uint32 speed, bool ignore = false);
    void UnsetExactSpeed();
    bool HasExactSpeed();
    uint32 GetExactSpeed();
    bool IgnoreExactSpeed();

    void SetMinimumSpeed(uint32 speed, bool ignore = false);
    void UnsetMinimumSpeed();
    bool HasMinimumSpeed();
    uint32 GetMinimumSpeed();
    bool IgnoreMinimumSpeed();

    void SetPercentError(uint32 percent, bool ignore = false);
    void UnsetPercentError();
    bool HasPercentError();
    uint32 GetPercentError();
    bool IgnorePercentError();

    void SetDuplex(bool fullDuplex, bool ignore = false);
    void UnsetDuplex();
    bool HasDuplex();
    bool GetDuplex();
    bool IgnoreDuplex();

    void SetBeacon(bool ignore = false);
    void UnsetBeacon();
    bool HasBeacon();
    bool IgnoreBeacon();

private:
    enum { EXACT_SPEED = 1, MINIMUM_SPEED = 2, PERCENT_ERROR = 4, DUPLEX = 8, BEACON = 16 };
    void Mark(uint32 bit, bool ignore);

    uint32 set_;
    uint32 ignore_;
    uint32 exactSpeed_;
    uint32 minimumSpeed_;
    uint32 percentError_;
    bool duplex_;
};

// NIC teaming: the load-balancing policy, failback (ReversePolicy), switch
// notification, failure detection, the explicit uplink order, rolling
// restoration and the number of active uplinks. The defaults set
// TeamingPolicy (DEF_TEAM_POLICY), ReversePolicy true,
// NotifySwitchOnFailure true, LinkCriteria (its defaults) and
// RollingRestoration false; the uplink order and the active uplink count
// depend on the switch and stay unset.
class NicTeamingPolicy {
public:
    enum TeamPolicyType : int {
        TEAM_POLICY_NONE = 0,
        TEAM_POLICY_LB_IP = 1,
        TEAM_POLICY_LB_SRCMAC = 2,
        TEAM_POLICY_LB_SRCID = 3,
        TEAM_POLICY_FO_EXPLICIT = 4,
        TEAM_POLICY_LAST_ELEMENT = 5
    };
    static const int DEF_TEAM_POLICY = TEAM_POLICY_LB_SRCID;

    NicTeamingPolicy();
    static NicTeamingPolicy GetDefaultPolicy();
    void Derive(NicTeamingPolicy const &parent);
    bool IsSet();
    void UnsetAll();

    void SetTeamingPolicy(TeamPolicyType policy);
    void UnsetTeamingPolicy();
    bool HasTeamingPolicy();
    TeamPolicyType GetTeamingPolicy();

    void SetReversePolicy(bool reverse);
    void UnsetReversePolicy();
    bool HasReversePolicy();
    bool GetReversePolicy();

    void SetNotifySwitchOnFailure(bool notify);
    void UnsetNotifySwitchOnFailure();
    bool HasNotifySwitchOnFailure();
    bool GetNotifySwitchOnFailure();

    void SetLinkCriteria(LinkCriteriaSelectionPolicy criteria);
    void UnsetLinkCriteria();
    bool HasLinkCriteria();
    LinkCriteriaSelectionPolicy GetLinkCriteria();

    void SetUplinkOrder(std::vector<std::string> order);
    void UnsetUplinkOrder();
    bool HasUplinkOrder();
    std::vector<std::string> GetUplinkOrder();

    void SetRollingRestoration(bool rolling);
    void UnsetRollingRestoration();
    bool HasRollingRestoration();
    bool GetRollingRestoration();

    void SetMaxActiveUplinks(int count);
    void UnsetMaxActiveUplinks();
    bool HasMaxActiveUplinks();
    int GetMaxActiveUplinks();

private:
    enum {
        TEAMING_POLICY = 1, REVERSE_POLICY = 2, NOTIFY_SWITCH = 4, LINK_CRITERIA = 8,
        UPLINK_ORDER = 16, ROLLING_RESTORATION = 32, MAX_ACTIVE_UPLINKS = 64
    };

    uint32 set_;
    TeamPolicyType teamingPolicy_;
    bool reversePolicy_;
    bool notifySwitchOnFailure_;
    LinkCriteriaSelectionPolicy linkCriteria_;
    std::vector<std::string> uplinkOrder_;
    bool rollingRestoration_;
    int maxActiveUplinks_;
};

// Traffic shaping. Rates are in bits per second, the burst size in bytes.
// Defaults: PeakBps and AverageBps 100000000, BurstSize 104857600,
// Enabled false.
class ShapingPolicy {
public:
    ShapingPolicy();
    static ShapingPolicy GetDefaultPolicy();
    void Derive(ShapingPolicy const &parent);
    bool IsSet();
    void UnsetAll();
    // Every set rate and burst size is above zero and a set peak rate is
    // not below a set average rate; an enabled policy needs all three.
    bool IsValid();
    // A copy with every unset attribute set to its default.
    ShapingPolicy FillValues();

    void SetPeakBps(uint64 bps);
    void UnsetPeakBps();
    bool HasPeakBps();
    uint64 GetPeakBps();

    void SetAverageBps(uint64 bps);
    void UnsetAverageBps();
    bool HasAverageBps();
    uint64 GetAverageBps();

    void SetBurstSize(uint64 bytes);
    void UnsetBurstSize();
    bool HasBurstSize();
    uint64 GetBurstSize();

    void SetEnabled(bool enabled);
    void UnsetEnabled();
    bool HasEnabled();
    bool GetEnabled();

private:
    enum { PEAK_BPS = 1, AVERAGE_BPS = 2, BURST_SIZE = 4, ENABLED = 8 };

    uint32 set_;
    uint64 peakBps_;
    uint64 averageBps_;
    uint64 burstSize_;
    bool enabled_;
};

// Port security. Defaults: AllowPromiscuous false, AllowMacAddressChange
// true, AllowForgedTransmits true.
class PortSecurityPolicy {
public:
    PortSecurityPolicy();
    static PortSecurityPolicy GetDefaultPolicy();
    void Derive(PortSecurityPolicy const &parent);
    bool IsSet();
    void UnsetAll();

    void SetAllowPromiscuous(bool allow);
    void UnsetAllowPromiscuous();
    bool HasAllowPromiscuous();
    bool GetAllowPromiscuous();

    void SetAllowMacAddressChange(bool allow);
    void UnsetAllowMacAddressChange();
    bool HasAllowMacAddressChange();
    bool GetAllowMacAddressChange();

    void SetAllowForgedTransmits(bool allow);
    void UnsetAllowForgedTransmits();
    bool HasAllowForgedTransmits();
    bool GetAllowForgedTransmits();

private:
    enum { ALLOW_PROMISCUOUS = 1, ALLOW_MAC_CHANGE = 2, ALLOW_FORGED_TRANSMITS = 4 };

    uint32 set_;
    bool allowPromiscuous_;
    bool allowMacAddressChange_;
    bool allowForgedTransmits_;
};

// The 22 NIC capabilities. The mask word has bit n set when capability n
// (in the order below, VlanTag = bit 0 ... GenericOffload = bit 21) is set;
// the flags word holds the values. Words built from numbers are kept as
// given, bits above 21 included. The defaults set every capability: the
// first seven (VlanTag to ScatterGatherSpanPagesTx) on, the rest off.
#define HC_NIC_CAPABILITY(Name) \
    void Set##Name(bool enabled); \
    void Unset##Name(); \
    bool Has##Name(); \
    bool Get##Name();

class NicCapabilities {
public:
    NicCapabilities();
    NicCapabilities(uint64 flags, uint64 mask);
    NicCapabilities(NicCapabilities const &other) = default;
    static NicCapabilities GetDefaultPolicy();
    void Derive(NicCapabilities const &parent);
    bool IsSet();
    void UnsetAll();
    uint64 GetFlags();
    uint64 GetMask();

    HC_NIC_CAPABILITY(VlanTag)
    HC_NIC_CAPABILITY(VlanUntag)
    HC_NIC_CAPABILITY(ChecksumOffload)
    HC_NIC_CAPABILITY(TcpSegmentationOffload)
    HC_NIC_CAPABILITY(ScatterGatherTx)
    HC_NIC_CAPABILITY(HighDMA)
    HC_NIC_CAPABILITY(ScatterGatherSpanPagesTx)
    HC_NIC_CAPABILITY(ChecksumOffloadIPv6)
    HC_NIC_CAPABILITY(TcpSegmentationOffloadIPv6)
    HC_NIC_CAPABILITY(TcpSegmentationOffload256k)
    HC_NIC_CAPABILITY(UplinkReadOnlyInetHeaders)
    HC_NIC_CAPABILITY(UPT)
    HC_NIC_CAPABILITY(ENCAP)
    HC_NIC_CAPABILITY(DCB)
    HC_NIC_CAPABILITY(Offload8Offset)
    HC_NIC_CAPABILITY(Offload16Offset)
    HC_NIC_CAPABILITY(ChecksumOffloadIPv6ExtHdrs)
    HC_NIC_CAPABILITY(TcpSegmentationOffloadIPv6ExtHdrs)
    HC_NIC_CAPABILITY(Sched)
    HC_NIC_CAPABILITY(SRIOV)
    HC_NIC_CAPABILITY(AdjustHeaderAlignment)
    HC_NIC_CAPABILITY(GenericOffload)

private:
    void Put(int bit, bool enabled);
    void Clear(int bit);

    uint64 flags_;
    uint64 mask_;
};

#undef HC_NIC_CAPABILITY

// Address operators of access-control rules.
enum AclAddrOp : int {
    ACL_ADDR_ANY = 0,
    ACL_ADDR_EQ = 1,
    ACL_ADDR_NOTEQ = 2
};

// The MAC address part of an access-control rule: an address (MAC text),
// how many leading bits of it count, and how a frame's address is compared.
struct MacConfig {
    MacConfig();
    std::string addr;
    int prefixLength;
    AclAddrOp addrOp;
};

} // namespace Network
} // namespace HostCtl

#endif
