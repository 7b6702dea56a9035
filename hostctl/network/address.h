// Network address values: IPv4 and IPv6 addresses and networks, MAC
// addresses, the IP configuration of an interface, host and port addresses.
//
// These are plain values: scripts build them, copy them and pass them by
// value. Text rules shared by every class here:
//   IPv4  dotted quad "a.b.c.d", each part a decimal 0..255 written with at
//         most three digits and without a leading zero ("010" is refused,
//         "0" is fine). The uint32 form is numeric: 1.2.3.4 is 0x01020304.
//   IPv6  eight groups of 1..4 hex digits (either case), "::" at most once
//         standing for one or more zero groups, an optional embedded IPv4
//         tail in the last 32 bits ("::ffff:1.2.3.4"). No zone suffix, no
//         brackets, no prefix. Output is the RFC 5952 form: lower case,
//         leading zeros dropped, the longest run (leftmost on a tie) of two
//         or more zero groups compressed, and mapped addresses
//         (::ffff:0:0/96) written with a dotted tail. Ipv6_addr holds the
//         address as four numeric words, addr[0] the most significant.
//   MAC   six octets as "aa:bb:cc:dd:ee:ff" or "aa-bb-cc-dd-ee-ff" (one or
//         two hex digits per octet, one separator kind throughout),
//         "aabb.ccdd.eeff" or twelve bare hex digits; printed as lower-case
//         "aa:bb:cc:dd:ee:ff".
// Prefix lengths are decimal without leading zeros. Blanks are not part of
// any address: text with blanks is refused.
#ifndef HOSTCTL_NETWORK_ADDRESS_H
#define HOSTCTL_NETWORK_ADDRESS_H

#include <netinet/in.h>
#include <string>
#include <vector>

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Network {

// Address family of an IpAddress.
enum IpAddressType : int {
    IP_ADDRESS_V4 = 0,
    IP_ADDRESS_V6 = 1
};

// Type and status of an IPv6 interface address.
enum Ipv6AddressType : int {
    IP6_ADDRESS_STATIC = 0,
    IP6_ADDRESS_ANYCAST = 1,
    IP6_ADDRESS_TENTATIVE = 2,
    IP6_ADDRESS_DUPLICATED = 3,
    IP6_ADDRESS_DETACHED = 4,
    IP6_ADDRESS_DEPRECATED = 5,
    IP6_ADDRESS_NODAD = 6,
    IP6_ADDRESS_AUTOCONF = 7,
    IP6_ADDRESS_TEMPORARY = 8,
    IP6_ADDRESS_DHCP = 9,
    IP6_ADDRESS_PREFFERRED = 10,
    IP6_ADDRESS_UNSET = 11
};

enum Ipv6Scope : int {
    IP6_SCOPE_NODELOCAL = 0,
    IP6_SCOPE_LINKLOCAL = 1,
    IP6_SCOPE_SITELOCAL = 2,
    IP6_SCOPE_UNSET = 4
};

// IPv6 address classes (bit values).
enum Ipv6AddressClass : int {
    IPV6_ADDR_GLOBAL = 0x0000,
    IPV6_ADDR_LOOPBACK = 0x0010,
    IPV6_ADDR_LINKLOCAL = 0x0020,
    IPV6_ADDR_SITELOCAL = 0x0040,
    IPV6_ADDR_COMPATv4 = 0x0080,
    IPV6_ADDR_SCOPE_MASK = 0x00f0
};

// An IPv4 or IPv6 address.
class IpAddress {
public:
    virtual ~IpAddress();
    virtual std::string GetStringAddress() = 0;
    virtual bool IsValidAddress() = 0;
    virtual bool IsValidNetmask() = 0;
    virtual bool IsValidMulticastAddress() = 0;
    virtual IpAddressType GetIpAddressType() = 0;
};

// An IPv4 address. The default value is 0.0.0.0.
// IsValidAddress: a unicast host address, i.e. not in 0.0.0.0/8 and not in
// 224.0.0.0/3 (multicast, reserved, limited broadcast). IsValidNetmask:
// contiguous leading ones, 0.0.0.0 (/0) and 255.255.255.255 (/32)
// included. IsValidMulticastAddress: inside 224.0.0.0/4.
class Ipv4Address : public IpAddress {
public:
    Ipv4Address();
    // Throws HostCtlException for text that is not a dotted quad.
    HC_THROWS Ipv4Address(std::string address);
    Ipv4Address(uint32 address);
    bool operator==(Ipv4Address const &other);
    virtual std::string GetStringAddress();
    uint32 GetBinaryAddress();
    void SetBinaryAddress(uint32 address);
    virtual bool IsValidAddress();
    // The text parses and names a valid host address.
    static bool IsValidAddress(std::string address);
    virtual bool IsValidNetmask();
    virtual bool IsValidMulticastAddress();
    static std::string AddressFromUint(uint32 address);
    HC_THROWS static uint32 UintFromAddress(std::string address);
    virtual IpAddressType GetIpAddressType();

private:
    uint32 address_;
};

// The raw 128-bit IPv6 address as four numeric words, most significant
// first: 2001:db8::1 is { 0x20010db8, 0, 0, 1 }.
struct Ipv6_addr {
    uint32 addr[4] = {0, 0, 0, 0};
};

// An IPv6 address. The default value is "::".
// IsValidAddress: neither the unspecified address "::" nor multicast.
// IsValidNetmask: contiguous leading ones, "::" (/0) and all ones (/128)
// included. IsValidMulticastAddress: inside ff00::/8.
class Ipv6Address : public IpAddress {
public:
    Ipv6Address();
    // Throws HostCtlException for text that is not an IPv6 address.
    HC_THROWS Ipv6Address(std::string address);
    Ipv6Address(Ipv6_addr address);
    virtual std::string GetStringAddress();
    Ipv6_addr GetBinaryAddress();
    void SetBinaryAddress(Ipv6_addr address);
    virtual bool IsValidAddress();
    // The text parses and names a valid address.
    static bool IsValidAddress(std::string address);
    virtual bool IsValidMulticastAddress();
    virtual bool IsValidNetmask();
    static std::string AddressFromUint(Ipv6_addr address);
    static std::string AddressFromUint(in6_addr address);
    HC_THROWS static Ipv6_addr UintFromAddress(std::string address);
    bool operator==(Ipv6Address const &other);
    virtual IpAddressType GetIpAddressType();

private:
    Ipv6_addr address_;
};

// An IPv4 network (or interface address): an address and a netmask. Text
// is "a.b.c.d/prefix", "a.b.c.d/m.m.m.m" or a bare address (/32). The
// address keeps its host bits. GetStringAddress prints "a.b.c.d/prefix",
// or "a.b.c.d/m.m.m.m" when the netmask is not contiguous.
// IsValidNetworkAddress(a) is true when the netmask is contiguous and a
// lies inside this network. Ordering is by address, then by netmask.
class Ipv4Network {
public:
    Ipv4Network();
    // Throws HostCtlException for malformed text, a prefix above 32 or a
    // non-contiguous netmask.
    HC_THROWS Ipv4Network(std::string network);
    Ipv4Network(Ipv4Address network, Ipv4Address netmask);
    Ipv4Network(uint32 network, uint32 netmask = 4294967295U);
    Ipv4Network(Ipv4Network const &other) = default;
    bool operator==(Ipv4Network const &other);
    int operator<(Ipv4Network const &other);
    std::string GetStringAddress();
    Ipv4Address GetNetmask();
    void SetNetmask(Ipv4Address netmask);
    Ipv4Address GetNetwork();
    void SetNetwork(Ipv4Address network);
    bool IsValidNetworkAddress(Ipv4Address address);
    // Prefix length 0..32 to netmask; anything else throws.
    HC_THROWS static Ipv4Address NetmaskFromNumber(uint32 prefix);
    // Netmask to prefix length; a non-contiguous netmask throws.
    HC_THROWS static uint32 NumberFromNetmask(Ipv4Address netmask);

private:
    Ipv4Address network_;
    Ipv4Address netmask_;
};

// An IPv6 network or interface address: address, prefix length, type,
// status, lifetime and scope. Text is "address/prefix" or a bare address
// (/128). Status and scope start unset; the type starts as
// IP6_ADDRESS_STATIC for values built from an address, unset otherwise.
// SetNetmask stores any number; IsValid is false for a prefix above 128.
// Two networks are equal when address and prefix are equal; ordering is
// by address, then by prefix.
class Ipv6Network {
public:
    Ipv6Network();
    // Throws HostCtlException for malformed text or a prefix above 128.
    HC_THROWS Ipv6Network(std::string network);
    Ipv6Network(Ipv6Address address, uint32 prefix);
    Ipv6Network(Ipv6Network const &other) = default;
    bool operator==(Ipv6Network const &other);
    bool operator<(Ipv6Network const &other);
    std::string GetStringAddress();
    void SetNetmask(uint32 prefix);
    uint32 GetNetmask();
    Ipv6Address GetAddress();
    void SetAddress(Ipv6Address address);
    // A valid address with a prefix of at most 128.
    bool IsValid();
    // The prefix is at most 128 and the address lies inside this network.
    bool IsValidNetworkAddress(Ipv6Address address);
    Ipv6AddressType GetIpv6AddressType();
    void SetIpv6AddressType(Ipv6AddressType type);
    Ipv6AddressType GetIpv6AddressStatus();
    void SetIpv6AddressStatus(Ipv6AddressType status);
    uint32 GetLifeTime();
    void SetLifeTime(uint32 lifetime);
    Ipv6Scope GetIpv6Scope();
    void SetIpv6Scope(Ipv6Scope scope);
    // Mark the address as obtained by DHCPv6 (type IP6_ADDRESS_DHCP).
    void SetUseDhcp();
    // Mark the address as autoconfigured from router advertisements
    // (type IP6_ADDRESS_AUTOCONF).
    void SetUseRouterAdvertised();
    // Prefix length 0..128 to netmask; anything else throws.
    HC_THROWS static Ipv6Address NetmaskFromNumber(uint32 prefix);
    // Netmask to prefix length; a non-contiguous netmask throws.
    HC_THROWS static uint32 NumberFromNetmask(Ipv6Address netmask);
    // "address/prefix" with a valid address and a prefix of at most 128.
    static bool IsValidAddressAndNetmask(std::string network);

private:
    Ipv6Address address_;
    uint32 prefix_;
    Ipv6AddressType type_;
    Ipv6AddressType status_;
    uint32 lifetime_;
    Ipv6Scope scope_;
};

// An Ethernet MAC address. Text that does not parse, a null array and a
// uint32 array with an element above 255 give the all-zero address, which
// IsValid() reports as not valid (so does the default value).
// GetBinaryAddress ignores a null array.
class MacAddress {
public:
    MacAddress();
    MacAddress(std::string address);
    MacAddress(uint8 address[6]);
    MacAddress(uint32 address[6]);
    MacAddress(MacAddress const &other) = default;
    void GetBinaryAddress(uint8 address[6]);
    std::string GetStringAddress();
    // Not the all-zero address.
    bool IsValid();
    // The text parses and is not the all-zero address.
    static bool IsValid(std::string const &address);

    QC_HIDDEN bool operator==(MacAddress const &other) const;

private:
    uint8 octets_[6];
};

// The IP configuration of one interface.
// IPv4 is in one of three modes: DHCP, none (SetIpv4UseNone) or static
// (SetIpv4Address). Setting an address selects static mode; SetUseDhcp(true)
// selects DHCP; SetIpv4UseNone clears the static address, netmask and
// broadcast. The static setters refuse, with HostCtlException: an address
// that is not a valid host address, a netmask that is not contiguous or is
// 0.0.0.0, a broadcast of 0.0.0.0 or in multicast space. DHCP-supplied DNS
// needs IPv4 or IPv6 DHCP. IPv6 networks must be valid and are unique by
// address; removing an absent one throws.
class IpConfig {
public:
    IpConfig();
    IpConfig(IpConfig const &other) = default;
    // The second flag asks for the DNS servers from DHCP as well.
    void SetUseDhcp(bool useDhcp, bool useDhcpDns = true);
    void SetUseIpv6Dhcp(bool useDhcp);
    bool GetUseDhcp();
    bool GetUseIpv6Dhcp();
    void SetUseIpv6RouterAdvertised(bool useRouterAdvertised);
    bool GetUseIpv6RouterAdvertised();
    bool GetDhcpDns();
    HC_THROWS void SetDhcpDns(bool useDhcpDns);
    void SetIpv4UseNone();
    bool GetIpv4UseNone();
    Ipv4Address GetIpv4Address();
    std::vector<Ipv6Network> GetIpv6Network();
    HC_THROWS void SetIpv4Address(Ipv4Address address);
    HC_THROWS void AddIpv6Network(Ipv6Network network);
    HC_THROWS void RemoveIpv6Network(Ipv6Network network);
    Ipv4Address GetIpv4Netmask();
    HC_THROWS void SetIpv4Netmask(Ipv4Address netmask);
    Ipv4Address GetIpv4Broadcast();
    HC_THROWS void SetIpv4Broadcast(Ipv4Address broadcast);
    // IsIpv4Valid and IsIpv6Valid together.
    bool IsValid();
    // DHCP, none, or a valid static address with a netmask; a broadcast,
    // when set, is 255.255.255.255 or lies in the address's network.
    bool IsIpv4Valid();
    // Every IPv6 network is valid.
    bool IsIpv6Valid();
    // The text is the static IPv4 address or one of the IPv6 addresses.
    bool ContainsAddress(std::string const &address);

private:
    bool useDhcp_;
    bool useIpv6Dhcp_;
    bool useIpv6RouterAdvertised_;
    bool dhcpDns_;
    bool ipv4None_;
    Ipv4Address ipv4Address_;
    Ipv4Address ipv4Netmask_;
    Ipv4Address ipv4Broadcast_;
    std::vector<Ipv6Network> ipv6Networks_;
};

// A host given as an IPv4 address, an IPv6 address or a host name (RFC 1123
// labels of 1..63 letters, digits and inner hyphens, 253 characters at
// most, one trailing dot allowed and dropped, the last label not all
// digits). The empty string is type NONE; any other text that is none of
// these throws HostCtlException. Names compare without regard to case.
class HostAddress {
public:
    enum HostAddressType : int {
        HOST_ADDR_TYPE_IPV4 = 0,
        HOST_ADDR_TYPE_IPV6 = 1,
        HOST_ADDR_TYPE_FDN = 2,
        HOST_ADDR_TYPE_NONE = 3
    };

    HC_THROWS HostAddress(std::string address = "");
    // The address in canonical form, or the name.
    std::string GetHostAddress();
    HostAddressType GetHostAddressType();
    bool operator==(HostAddress const &other);
    // The IPv4 address; 0.0.0.0 for any other type (names are not resolved).
    Ipv4Address GetIpv4Address();
    // The host name; empty for any other type.
    std::string GetHostName();

private:
    std::string text_;
    HostAddressType type_;
    Ipv4Address ipv4_;
    Ipv6Address ipv6_;
};

// A host string with a port number. The host is kept as given.
// GetStringAddress gives "host:port", "[host]:port" for a host containing
// ':' (IPv6), and "" for an empty host.
class PortAddress {
public:
    PortAddress();
    PortAddress(std::string const &host, uint16 port);
    PortAddress(PortAddress const &other) = default;
    std::string GetStringAddress();

    QC_HIDDEN std::string const &GetHost() const { return host_; }
    QC_HIDDEN uint16 GetPort() const { return port_; }

private:
    std::string host_;
    uint16 port_;
};

} // namespace Network
} // namespace HostCtl

#endif
