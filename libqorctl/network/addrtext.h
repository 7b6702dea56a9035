// Text forms of network addresses, shared by the address value classes and
// the configuration serializer. The accepted forms are described in
// hostctl/network/address.h. Every parser reads only inside the given
// string and leaves its output untouched on failure.
#ifndef LIBQORCTL_NETWORK_ADDRTEXT_H
#define LIBQORCTL_NETWORK_ADDRTEXT_H

#include <string>

#include "network/address.h"

namespace QorCtl {
namespace Network {
namespace AddrText {

bool ParseIpv4(std::string const &text, uint32 &out);
std::string FormatIpv4(uint32 address);

bool ParseIpv6(std::string const &text, HostCtl::Network::Ipv6_addr &out);
std::string FormatIpv6(HostCtl::Network::Ipv6_addr const &address);

// A prefix length written in decimal without leading zeros, at most max.
bool ParsePrefix(std::string const &text, uint32 max, uint32 &out);

// Prefix length of a contiguous netmask, -1 for any other mask.
int PrefixOfMask(uint32 mask);
int PrefixOfMask(HostCtl::Network::Ipv6_addr const &mask);
uint32 MaskOfPrefix(uint32 prefix);  // prefix 0..32
HostCtl::Network::Ipv6_addr Ipv6MaskOfPrefix(uint32 prefix);  // 0..128

bool ParseMac(std::string const &text, uint8 out[6]);

// An RFC 1123 host name (see HostAddress); a trailing dot is allowed.
bool IsHostName(std::string const &text);

// Throws HostCtl::Lib::HostCtlException with the message.
[[noreturn]] void Fail(std::string const &message);

} // namespace AddrText
} // namespace Network
} // namespace QorCtl

#endif
