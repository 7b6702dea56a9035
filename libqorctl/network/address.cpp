#include "network/address.h"

#include <algorithm>
#include <cstring>

#include "addrtext.h"

using namespace QorCtl::Network::AddrText;

namespace HostCtl {
namespace Network {

namespace {

bool IsUnicastV4(uint32 a)
{
    uint32 first = a >> 24;
    return first != 0 && first < 224;
}

bool IsMulticastV4(uint32 a) { return (a >> 28) == 0xe; }

bool IsZeroV6(Ipv6_addr const &a) { return !a.addr[0] && !a.addr[1] && !a.addr[2] && !a.addr[3]; }

bool IsMulticastV6(Ipv6_addr const &a) { return (a.addr[0] >> 24) == 0xff; }

bool SameV6(Ipv6_addr const &a, Ipv6_addr const &b)
{
    return std::equal(a.addr, a.addr + 4, b.addr);
}

bool LessV6(Ipv6_addr const &a, Ipv6_addr const &b)
{
    return std::lexicographical_compare(a.addr, a.addr + 4, b.addr, b.addr + 4);
}

// The address inside the network given by a prefix.
bool InPrefixV6(Ipv6_addr const &a, Ipv6_addr const &net, uint32 prefix)
{
    Ipv6_addr mask = Ipv6MaskOfPrefix(prefix);
    for (int k = 0; k < 4; ++k)
        if ((a.addr[k] & mask.addr[k]) != (net.addr[k] & mask.addr[k])) return false;
    return true;
}

} // namespace

IpAddress::~IpAddress() {}

// ---- Ipv4Address ----

Ipv4Address::Ipv4Address() : address_(0) {}

Ipv4Address::Ipv4Address(std::string address) : address_(UintFromAddress(address)) {}

Ipv4Address::Ipv4Address(uint32 address) : address_(address) {}

bool Ipv4Address::operator==(Ipv4Address const &other) { return address_ == other.address_; }

std::string Ipv4Address::GetStringAddress() { return FormatIpv4(address_); }

uint32 Ipv4Address::GetBinaryAddress() { return address_; }

void Ipv4Address::SetBinaryAddress(uint32 address) { address_ = address; }

bool Ipv4Address::IsValidAddress() { return IsUnicastV4(address_); }

bool Ipv4Address::IsValidAddress(std::string address)
{
    uint32 value;
    return ParseIpv4(address, value) && IsUnicastV4(value);
}

bool Ipv4Address::IsValidNetmask() { return PrefixOfMask(address_) >= 0; }

bool Ipv4Address::IsValidMulticastAddress() { return IsMulticastV4(address_); }

std::string Ipv4Address::AddressFromUint(uint32 address) { return FormatIpv4(address); }

uint32 Ipv4Address::UintFromAddress(std::string address)
{
    uint32 value;
    if (!ParseIpv4(address, value)) Fail("'" + address + "' is not a valid IPv4 address");
    return value;
}

IpAddressType Ipv4Address::GetIpAddressType() { return IP_ADDRESS_V4; }

// ---- Ipv6Address ----

Ipv6Address::Ipv6Address() {}

Ipv6Address::Ipv6Address(std::string address) : address_(UintFromAddress(address)) {}

Ipv6Address::Ipv6Address(Ipv6_addr address) : address_(address) {}

std::string Ipv6Address::GetStringAddress() { return FormatIpv6(address_); }

Ipv6_addr Ipv6Address::GetBinaryAddress() { return address_; }

void Ipv6Address::SetBinaryAddress(Ipv6_addr address) { address_ = address; }

bool Ipv6Address::IsValidAddress() { return !IsZeroV6(address_) && !IsMulticastV6(address_); }

bool Ipv6Address::IsValidAddress(std::string address)
{
    Ipv6_addr value;
    return ParseIpv6(address, value) && Ipv6Address(value).IsValidAddress();
}

bool Ipv6Address::IsValidMulticastAddress() { return IsMulticastV6(address_); }

bool Ipv6Address::IsValidNetmask() { return PrefixOfMask(address_) >= 0; }

std::string Ipv6Address::AddressFromUint(Ipv6_addr address) { return FormatIpv6(address); }

std::string Ipv6Address::AddressFromUint(in6_addr address)
{
    Ipv6_addr value;
    for (int k = 0; k < 4; ++k) {
        uint8 const *b = address.s6_addr + 4 * k;
        value.addr[k] = (uint32(b[0]) << 24) | (uint32(b[1]) << 16) | (uint32(b[2]) << 8) | b[3];
    }
    return FormatIpv6(value);
}

Ipv6_addr Ipv6Address::UintFromAddress(std::string address)
{
    Ipv6_addr value;
    if (!ParseIpv6(address, value)) Fail("'" + address + "' is not a valid IPv6 address");
    return value;
}

bool Ipv6Address::operator==(Ipv6Address const &other) { return SameV6(address_, other.address_); }

IpAddressType Ipv6Address::GetIpAddressType() { return IP_ADDRESS_V6; }

// ---- Ipv4Network ----

Ipv4Network::Ipv4Network() {}

Ipv4Network::Ipv4Network(std::string network)
{
    size_t slash = network.find('/');
    uint32 address, mask = 0xffffffffU;
    if (!ParseIpv4(network.substr(0, slash), address))
        Fail("'" + network + "' is not a valid IPv4 network");
    if (slash != std::string::npos) {
        std::string tail = network.substr(slash + 1);
        uint32 prefix;
        if (ParsePrefix(tail, 32, prefix)) {
            mask = MaskOfPrefix(prefix);
        } else if (!ParseIpv4(tail, mask) || PrefixOfMask(mask) < 0) {
            Fail("'" + network + "' has an invalid prefix or netmask");
        }
    }
    network_.SetBinaryAddress(address);
    netmask_.SetBinaryAddress(mask);
}

Ipv4Network::Ipv4Network(Ipv4Address network, Ipv4Address netmask)
    : network_(network), netmask_(netmask) {}

Ipv4Network::Ipv4Network(uint32 network, uint32 netmask)
    : network_(network), netmask_(netmask) {}

bool Ipv4Network::operator==(Ipv4Network const &other)
{
    return network_ == other.network_ && netmask_ == other.netmask_;
}

int Ipv4Network::operator<(Ipv4Network const &other)
{
    Ipv4Network o(other);
    uint32 a = network_.GetBinaryAddress(), b = o.network_.GetBinaryAddress();
    if (a != b) return a < b;
    return netmask_.GetBinaryAddress() < o.netmask_.GetBinaryAddress();
}

std::string Ipv4Network::GetStringAddress()
{
    int prefix = PrefixOfMask(netmask_.GetBinaryAddress());
    return network_.GetStringAddress() + "/" +
           (prefix >= 0 ? std::to_string(prefix) : netmask_.GetStringAddress());
}

Ipv4Address Ipv4Network::GetNetmask() { return netmask_; }

void Ipv4Network::SetNetmask(Ipv4Address netmask) { netmask_ = netmask; }

Ipv4Address Ipv4Network::GetNetwork() { return network_; }

void Ipv4Network::SetNetwork(Ipv4Address network) { network_ = network; }

bool Ipv4Network::IsValidNetworkAddress(Ipv4Address address)
{
    uint32 mask = netmask_.GetBinaryAddress();
    return PrefixOfMask(mask) >= 0 &&
           (address.GetBinaryAddress() & mask) == (network_.GetBinaryAddress() & mask);
}

Ipv4Address Ipv4Network::NetmaskFromNumber(uint32 prefix)
{
    if (prefix > 32) Fail("IPv4 prefix length " + std::to_string(prefix) + " is above 32");
    return Ipv4Address(MaskOfPrefix(prefix));
}

uint32 Ipv4Network::NumberFromNetmask(Ipv4Address netmask)
{
    int prefix = PrefixOfMask(netmask.GetBinaryAddress());
    if (prefix < 0) Fail("netmask " + netmask.GetStringAddress() + " is not contiguous");
    return uint32(prefix);
}

// ---- Ipv6Network ----

Ipv6Network::Ipv6Network()
    : prefix_(0), type_(IP6_ADDRESS_UNSET), status_(IP6_ADDRESS_UNSET), lifetime_(0),
      scope_(IP6_SCOPE_UNSET) {}

Ipv6Network::Ipv6Network(std::string network) : Ipv6Network()
{
    size_t slash = network.find('/');
    Ipv6_addr address;
    uint32 prefix = 128;
    if (!ParseIpv6(network.substr(0, slash), address))
        Fail("'" + network + "' is not a valid IPv6 network");
    if (slash != std::string::npos && !ParsePrefix(network.substr(slash + 1), 128, prefix))
        Fail("'" + network + "' has an invalid prefix length");
    address_.SetBinaryAddress(address);
    prefix_ = prefix;
    type_ = IP6_ADDRESS_STATIC;
}

Ipv6Network::Ipv6Network(Ipv6Address address, uint32 prefix) : Ipv6Network()
{
    address_ = address;
    prefix_ = prefix;
    type_ = IP6_ADDRESS_STATIC;
}

bool Ipv6Network::operator==(Ipv6Network const &other)
{
    return address_ == other.address_ && prefix_ == other.prefix_;
}

bool Ipv6Network::operator<(Ipv6Network const &other)
{
    Ipv6Network o(other);
    Ipv6_addr a = address_.GetBinaryAddress(), b = o.address_.GetBinaryAddress();
    if (!SameV6(a, b)) return LessV6(a, b);
    return prefix_ < o.prefix_;
}

std::string Ipv6Network::GetStringAddress()
{
    return address_.GetStringAddress() + "/" + std::to_string(prefix_);
}

void Ipv6Network::SetNetmask(uint32 prefix) { prefix_ = prefix; }

uint32 Ipv6Network::GetNetmask() { return prefix_; }

Ipv6Address Ipv6Network::GetAddress() { return address_; }

void Ipv6Network::SetAddress(Ipv6Address address) { address_ = address; }

bool Ipv6Network::IsValid() { return prefix_ <= 128 && address_.IsValidAddress(); }

bool Ipv6Network::IsValidNetworkAddress(Ipv6Address address)
{
    return prefix_ <= 128 &&
           InPrefixV6(address.GetBinaryAddress(), address_.GetBinaryAddress(), prefix_);
}

Ipv6AddressType Ipv6Network::GetIpv6AddressType() { return type_; }

void Ipv6Network::SetIpv6AddressType(Ipv6AddressType type) { type_ = type; }

Ipv6AddressType Ipv6Network::GetIpv6AddressStatus() { return status_; }

void Ipv6Network::SetIpv6AddressStatus(Ipv6AddressType status) { status_ = status; }

uint32 Ipv6Network::GetLifeTime() { return lifetime_; }

void Ipv6Network::SetLifeTime(uint32 lifetime) { lifetime_ = lifetime; }

Ipv6Scope Ipv6Network::GetIpv6Scope() { return scope_; }

void Ipv6Network::SetIpv6Scope(Ipv6Scope scope) { scope_ = scope; }

void Ipv6Network::SetUseDhcp() { type_ = IP6_ADDRESS_DHCP; }

void Ipv6Network::SetUseRouterAdvertised() { type_ = IP6_ADDRESS_AUTOCONF; }

Ipv6Address Ipv6Network::NetmaskFromNumber(uint32 prefix)
{
    if (prefix > 128) Fail("IPv6 prefix length " + std::to_string(prefix) + " is above 128");
    return Ipv6Address(Ipv6MaskOfPrefix(prefix));
}

uint32 Ipv6Network::NumberFromNetmask(Ipv6Address netmask)
{
    int prefix = PrefixOfMask(netmask.GetBinaryAddress());
    if (prefix < 0) Fail("netmask " + netmask.GetStringAddress() + " is not contiguous");
    return uint32(prefix);
}

bool Ipv6Network::IsValidAddressAndNetmask(std::string network)
{
    size_t slash = network.find('/');
    Ipv6_addr address;
    uint32 prefix;
    return slash != std::string::npos && ParseIpv6(network.substr(0, slash), address) &&
           ParsePrefix(network.substr(slash + 1), 128, prefix) &&
           Ipv6Address(address).IsValidAddress();
}

// ---- MacAddress ----

MacAddress::MacAddress() { std::memset(octets_, 0, sizeof octets_); }

MacAddress::MacAddress(std::string address) : MacAddress() { ParseMac(address, octets_); }

MacAddress::MacAddress(uint8 address[6]) : MacAddress()
{
    if (address) std::memcpy(octets_, address, sizeof octets_);
}

MacAddress::MacAddress(uint32 address[6]) : MacAddress()
{
    if (address && std::all_of(address, address + 6, [](uint32 v) { return v <= 255; }))
        std::copy(address, address + 6, octets_);
}

void MacAddress::GetBinaryAddress(uint8 address[6])
{
    if (address) std::memcpy(address, octets_, sizeof octets_);
}

std::string MacAddress::GetStringAddress()
{
    static const char digits[] = "0123456789abcdef";
    std::string s;
    for (int k = 0; k < 6; ++k) {
        if (k) s += ':';
        s += digits[octets_[k] >> 4];
        s += digits[octets_[k] & 0xf];
    }
    return s;
}

bool MacAddress::IsValid()
{
    return std::any_of(octets_, octets_ + 6, [](uint8 v) { return v != 0; });
}

bool MacAddress::IsValid(std::string const &address)
{
    uint8 octets[6];
    return ParseMac(address, octets) && MacAddress(octets).IsValid();
}

bool MacAddress::operator==(MacAddress const &other) const
{
    return std::memcmp(octets_, other.octets_, sizeof octets_) == 0;
}

// ---- HostAddress ----

HostAddress::HostAddress(std::string address) : text_(address), type_(HOST_ADDR_TYPE_NONE)
{
    uint32 v4;
    Ipv6_addr v6;
    if (address.empty()) {
        type_ = HOST_ADDR_TYPE_NONE;
    } else if (ParseIpv4(address, v4)) {
        type_ = HOST_ADDR_TYPE_IPV4;
        ipv4_.SetBinaryAddress(v4);
        text_ = ipv4_.GetStringAddress();
    } else if (ParseIpv6(address, v6)) {
        type_ = HOST_ADDR_TYPE_IPV6;
        ipv6_.SetBinaryAddress(v6);
        text_ = ipv6_.GetStringAddress();
    } else if (IsHostName(address)) {
        type_ = HOST_ADDR_TYPE_FDN;
        if (text_.back() == '.') text_.pop_back();
    } else {
        Fail("'" + address + "' is neither an IP address nor a valid host name");
    }
}

std::string HostAddress::GetHostAddress() { return text_; }

HostAddress::HostAddressType HostAddress::GetHostAddressType() { return type_; }

bool HostAddress::operator==(HostAddress const &other)
{
    if (type_ != other.type_ || text_.size() != other.text_.size()) return false;
    // Addresses are held in canonical form, so text comparison suffices;
    // names compare without regard to case.
    for (size_t i = 0; i < text_.size(); ++i) {
        char a = text_[i], b = other.text_[i];
        if (a >= 'A' && a <= 'Z') a = char(a - 'A' + 'a');
        if (b >= 'A' && b <= 'Z') b = char(b - 'A' + 'a');
        if (a != b) return false;
    }
    return true;
}

Ipv4Address HostAddress::GetIpv4Address() { return ipv4_; }

std::string HostAddress::GetHostName() { return type_ == HOST_ADDR_TYPE_FDN ? text_ : std::string(); }

// ---- PortAddress ----

PortAddress::PortAddress() : port_(0) {}

PortAddress::PortAddress(std::string const &host, uint16 port) : host_(host), port_(port) {}

std::string PortAddress::GetStringAddress()
{
    if (host_.empty()) return std::string();
    bool bracket = host_.find(':') != std::string::npos && host_[0] != '[';
    return (bracket ? "[" + host_ + "]" : host_) + ":" + std::to_string(port_);
}

} // namespace Network
} // namespace HostCtl
