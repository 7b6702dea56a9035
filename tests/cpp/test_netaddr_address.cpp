// Address value types: text parsing and printing, binary forms, netmask and
// prefix conversions, validity rules, equality and copies.
#include <arpa/inet.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "lib/exception.h"
#include "network/address.h"

using namespace HostCtl::Network;
using HostCtl::Lib::HostCtlException;

namespace {

// Malformed IPv4 text: empty, too few or many parts, out-of-range and
// over-long octets, leading zeros, blanks, signs, stray characters.
const std::vector<std::string> kBadIpv4 = {
    "", "1", "1.2.3", "1.2.3.4.5", "256.1.1.1", "1.2.3.256", "1.2.3.999", "1234.1.1.1",
    "01.2.3.4", "1.2.3.00", "1..2.3", ".1.2.3", "1.2.3.", " 1.2.3.4", "1.2.3.4 ", "1.2.3.-4",
    "+1.2.3.4", "a.b.c.d", "0x1.2.3.4", "1.2.3.4/24", std::string("1.2.3.4\0", 8), "1,2,3,4",
    "4294967295", "1.2.3.4.", "\xff.1.1.1",
};

// Malformed IPv6 text.
const std::vector<std::string> kBadIpv6 = {
    "", ":", ":::", "1:::2", "1::2::3", "::1::", ":1::", ":1:2:3:4:5:6:7:8", "1::2:",
    "1:2:3:4:5:6:7:8:", "1:2:3:4:5:6:7", "1:2:3:4:5:6:7:8:9", "1:2:3:4:5:6:7:8::",
    "::1:2:3:4:5:6:7:8", "12345::", "1:2:3:4:5:6:7:12345", "g::1", "::x", "1.2.3.4",
    "::1.2.3", "::1.2.3.4:5", "::256.1.1.1", "::01.2.3.4", "1:2:3:4:5:6:7:1.2.3.4",
    "1.2.3.4::", "fe80::1%eth0", "[::1]", "::1/64", " ::1", "::1 ", "2001:db8::-1",
    std::string("::1\0", 4), std::string(46, '1'),
    "0000:0000:0000:0000:0000:0000:0000:0000:0000",
};

std::string Canonical6(std::string const &text) { return Ipv6Address(text).GetStringAddress(); }

} // namespace

TEST(NetAddrIpv4, TextRoundTripsAndNumericForm)
{
    for (std::string s : {"0.0.0.0", "1.2.3.4", "10.0.0.1", "127.0.0.1", "169.254.0.1", "172.16.31.255",
                          "192.168.100.254", "224.0.0.251", "255.255.255.255"}) {
        Ipv4Address a(s);
        EXPECT_EQ(s, a.GetStringAddress());
        EXPECT_EQ(s, Ipv4Address::AddressFromUint(Ipv4Address::UintFromAddress(s)));
        EXPECT_EQ(s, Ipv4Address(a.GetBinaryAddress()).GetStringAddress());
    }
    EXPECT_EQ(0x01020304U, Ipv4Address::UintFromAddress("1.2.3.4"));
    EXPECT_EQ(0xC0A80001U, Ipv4Address("192.168.0.1").GetBinaryAddress());
    Ipv4Address a;
    EXPECT_EQ("0.0.0.0", a.GetStringAddress());
    a.SetBinaryAddress(0x0A000001U);
    EXPECT_EQ("10.0.0.1", a.GetStringAddress());
    IpAddress &base = a;  // through the base class
    EXPECT_EQ("10.0.0.1", base.GetStringAddress());
    EXPECT_EQ(IP_ADDRESS_V4, base.GetIpAddressType());
    EXPECT_TRUE(a == Ipv4Address("10.0.0.1"));
    EXPECT_FALSE(a == Ipv4Address("10.0.0.2"));
}

TEST(NetAddrIpv4, MalformedTextIsRefused)
{
    for (std::string const &s : kBadIpv4) {
        EXPECT_THROW(Ipv4Address{s}, HostCtlException) << "'" << s << "'";
        EXPECT_THROW(Ipv4Address::UintFromAddress(s), HostCtlException) << "'" << s << "'";
        EXPECT_FALSE(Ipv4Address::IsValidAddress(s)) << "'" << s << "'";
    }
}

TEST(NetAddrIpv4, ValidityRules)
{
    for (std::string s : {"1.0.0.0", "10.1.2.3", "127.0.0.1", "223.255.255.255"}) {
        EXPECT_TRUE(Ipv4Address(s).IsValidAddress()) << s;
        EXPECT_TRUE(Ipv4Address::IsValidAddress(s)) << s;
    }
    for (std::string s : {"0.0.0.0", "0.1.2.3", "224.0.0.1", "240.0.0.1", "255.255.255.255"}) {
        EXPECT_FALSE(Ipv4Address(s).IsValidAddress()) << s;
        EXPECT_FALSE(Ipv4Address::IsValidAddress(s)) << s;
    }
    for (std::string s : {"0.0.0.0", "128.0.0.0", "255.0.0.0", "255.255.255.0", "255.255.255.254", "255.255.255.255"})
        EXPECT_TRUE(Ipv4Address(s).IsValidNetmask()) << s;
    for (std::string s : {"0.255.255.255", "255.0.255.0", "255.255.254.255", "1.0.0.0", "255.255.255.253"})
        EXPECT_FALSE(Ipv4Address(s).IsValidNetmask()) << s;
    EXPECT_TRUE(Ipv4Address("224.0.0.1").IsValidMulticastAddress());
    EXPECT_TRUE(Ipv4Address("239.255.255.255").IsValidMulticastAddress());
    EXPECT_FALSE(Ipv4Address("223.255.255.255").IsValidMulticastAddress());
    EXPECT_FALSE(Ipv4Address("240.0.0.0").IsValidMulticastAddress());
}

TEST(NetAddrIpv6, CanonicalOutput)
{
    const std::vector<std::pair<std::string, std::string>> cases = {
        {"::", "::"},
        {"::1", "::1"},
        {"1::", "1::"},
        {"2001:db8::1", "2001:db8::1"},
        {"2001:0DB8:0000:0000:0000:0000:0000:0001", "2001:db8::1"},
        {"2001:DB8::A:b:C", "2001:db8::a:b:c"},
        {"2001:db8:0:0:1:0:0:1", "2001:db8::1:0:0:1"},  // leftmost of equal runs
        {"1:0:0:2:0:0:0:3", "1:0:0:2::3"},                // longest run
        {"2001:db8:0:1:1:1:1:1", "2001:db8:0:1:1:1:1:1"},  // one zero group stays
        {"1:2:3:4:5:6:7::", "1:2:3:4:5:6:7:0"},
        {"::2:3:4:5:6:7:8", "0:2:3:4:5:6:7:8"},
        {"0:0:1:0:0:0:0:0", "0:0:1::"},
        {"fe80::0202:b3ff:fe1e:8329", "fe80::202:b3ff:fe1e:8329"},
        {"ff02::1:ff00:1", "ff02::1:ff00:1"},
        {"ffff:ffff:ffff:ffff:ffff:ffff:ffff:ffff", "ffff:ffff:ffff:ffff:ffff:ffff:ffff:ffff"},
        {"::ffff:1.2.3.4", "::ffff:1.2.3.4"},
        {"::FFFF:0102:0304", "::ffff:1.2.3.4"},
        {"::ffff:0.0.0.0", "::ffff:0.0.0.0"},
        {"::1.2.3.4", "::102:304"},
        {"64:ff9b::192.0.2.33", "64:ff9b::c000:221"},
        {"1:2:3:4:5:6:255.255.255.255", "1:2:3:4:5:6:ffff:ffff"},
        {"0000:0000:0000:0000:0000:ffff:255.255.255.255", "::ffff:255.255.255.255"},
    };
    for (auto const &c : cases) {
        EXPECT_EQ(c.second, Canonical6(c.first)) << c.first;
        EXPECT_EQ(c.second, Canonical6(c.second)) << c.second;  // canonical text is a fixed point
        EXPECT_EQ(c.second, Ipv6Address::AddressFromUint(Ipv6Address::UintFromAddress(c.first)));
    }
}

TEST(NetAddrIpv6, BinaryForms)
{
    Ipv6_addr raw = Ipv6Address::UintFromAddress("2001:db8::1");
    EXPECT_EQ(0x20010db8U, raw.addr[0]);
    EXPECT_EQ(0U, raw.addr[1]);
    EXPECT_EQ(0U, raw.addr[2]);
    EXPECT_EQ(1U, raw.addr[3]);
    EXPECT_EQ(0x0000ffffU, Ipv6Address::UintFromAddress("::ffff:1.2.3.4").addr[2]);
    EXPECT_EQ(0x01020304U, Ipv6Address::UintFromAddress("::ffff:1.2.3.4").addr[3]);

    Ipv6_addr zero;
    for (uint32 w : zero.addr) EXPECT_EQ(0U, w);
    EXPECT_EQ("::", Ipv6Address().GetStringAddress());

    // The platform form gives the same text.
    for (char const *s : {"2001:db8::1", "fe80::1:2", "::ffff:10.0.0.1", "::"}) {
        in6_addr platform;
        ASSERT_EQ(1, inet_pton(AF_INET6, s, &platform));
        EXPECT_EQ(Canonical6(s), Ipv6Address::AddressFromUint(platform));
    }

    Ipv6Address a("fe80::1");
    Ipv6_addr got = a.GetBinaryAddress();
    got.addr[3] = 2;  // a returned copy does not reach back
    EXPECT_EQ("fe80::1", a.GetStringAddress());
    a.SetBinaryAddress(got);
    EXPECT_EQ("fe80::2", a.GetStringAddress());
    EXPECT_TRUE(Ipv6Address(got) == a);
    EXPECT_FALSE(Ipv6Address("fe80::1") == a);
    EXPECT_EQ(IP_ADDRESS_V6, a.GetIpAddressType());
}

TEST(NetAddrIpv6, MalformedTextIsRefused)
{
    for (std::string const &s : kBadIpv6) {
        EXPECT_THROW(Ipv6Address{s}, HostCtlException) << "'" << s << "'";
        EXPECT_THROW(Ipv6Address::UintFromAddress(s), HostCtlException) << "'" << s << "'";
        EXPECT_FALSE(Ipv6Address::IsValidAddress(s)) << "'" << s << "'";
    }
}

// A simple deterministic generator for the comparison tests below.
class Random {
public:
    explicit Random(uint32 seed) : state_(seed) {}
    uint32 Next(uint32 bound)
    {
        state_ = state_ * 1103515245U + 12345U;
        return ((state_ >> 16) & 0x7fff) % bound;
    }
    // Replace, delete or insert one character, or leave the text alone.
    std::string Mutate(std::string text, char const *alphabet)
    {
        size_t n = std::char_traits<char>::length(alphabet);
        uint32 kind = Next(4);
        size_t at = text.empty() ? 0 : Next(uint32(text.size()));
        if (kind == 0 && !text.empty()) text[at] = alphabet[Next(uint32(n))];
        if (kind == 1 && !text.empty()) text.erase(at, 1);
        if (kind == 2) text.insert(at, 1, alphabet[Next(uint32(n))]);
        return text;
    }

private:
    uint32 state_;
};

// Generated and mutated text must be accepted exactly when the platform
// parser accepts it, with the same value; canonical output must match the
// platform's except for its IPv4-compatible "::a.b.c.d" form.
TEST(NetAddrIpv6, AgreesWithPlatformParser)
{
    Random rnd(12345);
    int accepted = 0, refused = 0;
    for (int round = 0; round < 20000; ++round) {
        std::vector<std::string> groups;
        for (int g = 0; g < 8; ++g) {
            std::string group;
            if (rnd.Next(3) == 0) group = "0";
            else
                for (uint32 d = 0, len = 1 + rnd.Next(4); d < len; ++d) group += "0123456789abcdefABCDEF"[rnd.Next(22)];
            groups.push_back(group);
        }
        std::string tail;
        if (rnd.Next(4) == 0) {
            tail = std::to_string(rnd.Next(256)) + "." + std::to_string(rnd.Next(256)) + "." +
                   std::to_string(rnd.Next(256)) + "." + std::to_string(rnd.Next(256));
            groups.resize(6);
        }
        int gapStart = rnd.Next(2) ? -1 : int(rnd.Next(uint32(groups.size())));
        int gapLen = gapStart < 0 ? 0 : 1 + rnd.Next(uint32(groups.size()) - gapStart);
        std::string text;
        for (int g = 0; g < int(groups.size()); ++g) {
            if (g == gapStart) { text += "::"; g += gapLen - 1; continue; }
            if (!text.empty() && text.back() != ':') text += ':';
            text += groups[g];
        }
        if (!tail.empty()) text += (text.empty() || text.back() == ':' ? "" : ":") + tail;
        if (rnd.Next(2)) text = rnd.Mutate(text, "0aF:.:g1");

        in6_addr platform;
        bool theirs = inet_pton(AF_INET6, text.c_str(), &platform) == 1;
        Ipv6_addr mine;
        bool parsed = true;
        try {
            mine = Ipv6Address::UintFromAddress(text);
        } catch (HostCtlException const &) {
            parsed = false;
        }
        ASSERT_EQ(theirs, parsed) << "'" << text << "'";
        if (!parsed) { ++refused; continue; }
        ++accepted;
        uint8 const *b = platform.s6_addr;
        for (int k = 0; k < 4; ++k)
            ASSERT_EQ((uint32(b[4 * k]) << 24) | (uint32(b[4 * k + 1]) << 16) | (uint32(b[4 * k + 2]) << 8) | b[4 * k + 3],
                      mine.addr[k]) << text;
        bool compat = !mine.addr[0] && !mine.addr[1] && !mine.addr[2] && (mine.addr[3] >> 16);
        char shown[INET6_ADDRSTRLEN];
        ASSERT_TRUE(inet_ntop(AF_INET6, &platform, shown, sizeof shown));
        if (!compat) {
            EXPECT_EQ(shown, Ipv6Address::AddressFromUint(mine)) << text;
        }
    }
    // Both outcomes are well represented.
    EXPECT_GT(accepted, 5000);
    EXPECT_GT(refused, 2000);
}

TEST(NetAddrIpv4, AgreesWithPlatformParser)
{
    Random rnd(777);
    int accepted = 0, refused = 0;
    for (int round = 0; round < 20000; ++round) {
        std::string text = std::to_string(rnd.Next(300)) + "." + std::to_string(rnd.Next(300)) + "." +
                           std::to_string(rnd.Next(300)) + "." + std::to_string(rnd.Next(300));
        if (rnd.Next(2)) text = rnd.Mutate(text, "0.9a ");
        in_addr platform;
        bool theirs = inet_pton(AF_INET, text.c_str(), &platform) == 1;
        uint32 mine = 0;
        bool parsed = true;
        try {
            mine = Ipv4Address::UintFromAddress(text);
        } catch (HostCtlException const &) {
            parsed = false;
        }
        ASSERT_EQ(theirs, parsed) << "'" << text << "'";
        if (!parsed) { ++refused; continue; }
        ++accepted;
        EXPECT_EQ(ntohl(platform.s_addr), mine) << text;
        EXPECT_EQ(text, Ipv4Address::AddressFromUint(mine));
    }
    EXPECT_GT(accepted, 5000);
    EXPECT_GT(refused, 2000);
}

TEST(NetAddrIpv6, ValidityRules)
{
    for (std::string s : {"::1", "2001:db8::1", "fe80::1", "::ffff:1.2.3.4"}) {
        EXPECT_TRUE(Ipv6Address(s).IsValidAddress()) << s;
        EXPECT_TRUE(Ipv6Address::IsValidAddress(s)) << s;
    }
    for (std::string s : {"::", "ff02::1", "ff00::"}) {
        EXPECT_FALSE(Ipv6Address(s).IsValidAddress()) << s;
        EXPECT_FALSE(Ipv6Address::IsValidAddress(s)) << s;
    }
    EXPECT_TRUE(Ipv6Address("ff02::1").IsValidMulticastAddress());
    EXPECT_FALSE(Ipv6Address("fe80::1").IsValidMulticastAddress());
    EXPECT_TRUE(Ipv6Address("::").IsValidNetmask());
    EXPECT_TRUE(Ipv6Address("ffff:ffff:ffff:ff00::").IsValidNetmask());
    EXPECT_TRUE(Ipv6Address("ffff:ffff:ffff:ffff:ffff:ffff:ffff:ffff").IsValidNetmask());
    EXPECT_FALSE(Ipv6Address("ffff:00ff::").IsValidNetmask());
    EXPECT_FALSE(Ipv6Address("ffff::1").IsValidNetmask());
    EXPECT_FALSE(Ipv6Address("::1").IsValidNetmask());
}

TEST(NetAddrIpv4Network, TextForms)
{
    Ipv4Network byPrefix("10.1.0.0/16"), byMask("10.1.0.0/255.255.0.0");
    EXPECT_TRUE(byPrefix == byMask);
    EXPECT_EQ("10.1.0.0/16", byMask.GetStringAddress());
    EXPECT_EQ("255.255.0.0", byPrefix.GetNetmask().GetStringAddress());
    EXPECT_EQ("10.1.0.0", byPrefix.GetNetwork().GetStringAddress());
    EXPECT_EQ("192.168.1.7/32", Ipv4Network("192.168.1.7").GetStringAddress());
    EXPECT_EQ("0.0.0.0/0", Ipv4Network("0.0.0.0/0").GetStringAddress());
    EXPECT_EQ("10.1.2.3/8", Ipv4Network("10.1.2.3/8").GetStringAddress());  // host bits kept
    for (std::string s : {"", "/8", "10.0.0.0/", "10.0.0.0/33", "10.0.0.0/08", "10.0.0.0/-1", "10.0.0.0/8/8",
                          "10.0.0.0/255.0.255.0", "10.0.0.0/255.0.0", "10.0.0/8", "10.0.0.0 /8", "10.0.0.0/1000"})
        EXPECT_THROW(Ipv4Network{s}, HostCtlException) << "'" << s << "'";
}

TEST(NetAddrIpv4Network, ConstructorsAndAccessors)
{
    EXPECT_EQ("0.0.0.0/0", Ipv4Network().GetStringAddress());
    EXPECT_EQ("10.0.0.1/32", Ipv4Network(0x0A000001U).GetStringAddress());
    EXPECT_EQ("10.0.0.0/8", Ipv4Network(0x0A000000U, 0xFF000000U).GetStringAddress());
    Ipv4Network net(Ipv4Address("172.16.0.0"), Ipv4Address("255.240.0.0"));
    EXPECT_EQ("172.16.0.0/12", net.GetStringAddress());
    // A netmask that is not contiguous can be stored and is shown as is.
    net.SetNetmask(Ipv4Address("255.0.255.0"));
    EXPECT_EQ("172.16.0.0/255.0.255.0", net.GetStringAddress());
    EXPECT_FALSE(net.IsValidNetworkAddress(Ipv4Address("172.16.0.1")));
    net.SetNetmask(Ipv4Address("255.255.0.0"));
    net.SetNetwork(Ipv4Address("172.17.0.0"));
    EXPECT_EQ("172.17.0.0/16", net.GetStringAddress());
    EXPECT_TRUE(net.IsValidNetworkAddress(Ipv4Address("172.17.200.1")));
    EXPECT_FALSE(net.IsValidNetworkAddress(Ipv4Address("172.18.0.1")));
    EXPECT_TRUE(Ipv4Network("0.0.0.0/0").IsValidNetworkAddress(Ipv4Address("8.8.8.8")));

    Ipv4Network copy(net);
    copy.SetNetwork(Ipv4Address("1.0.0.0"));
    EXPECT_EQ("172.17.0.0/16", net.GetStringAddress());
    Ipv4Address mask = net.GetNetmask();
    mask.SetBinaryAddress(0);
    EXPECT_EQ("255.255.0.0", net.GetNetmask().GetStringAddress());
}

TEST(NetAddrIpv4Network, OrderingAndEquality)
{
    Ipv4Network a("10.0.0.0/8"), b("10.0.0.0/16"), c("11.0.0.0/8");
    EXPECT_EQ(1, a < b);
    EXPECT_EQ(0, b < a);
    EXPECT_EQ(1, b < c);
    EXPECT_EQ(0, a < a);
    EXPECT_FALSE(a == b);
    EXPECT_TRUE(a == Ipv4Network(0x0A000000U, 0xFF000000U));
}

TEST(NetAddrIpv4Network, PrefixNetmaskConversions)
{
    for (uint32 n = 0; n <= 32; ++n) {
        Ipv4Address mask = Ipv4Network::NetmaskFromNumber(n);
        EXPECT_TRUE(mask.IsValidNetmask()) << n;
        EXPECT_EQ(n, Ipv4Network::NumberFromNetmask(mask));
    }
    EXPECT_EQ("0.0.0.0", Ipv4Network::NetmaskFromNumber(0).GetStringAddress());
    EXPECT_EQ("255.255.255.255", Ipv4Network::NetmaskFromNumber(32).GetStringAddress());
    EXPECT_EQ("255.255.240.0", Ipv4Network::NetmaskFromNumber(20).GetStringAddress());
    EXPECT_THROW(Ipv4Network::NetmaskFromNumber(33), HostCtlException);
    EXPECT_THROW(Ipv4Network::NetmaskFromNumber(4294967295U), HostCtlException);
    EXPECT_THROW(Ipv4Network::NumberFromNetmask(Ipv4Address("255.0.255.0")), HostCtlException);
    EXPECT_THROW(Ipv4Network::NumberFromNetmask(Ipv4Address("0.0.0.1")), HostCtlException);
}

TEST(NetAddrIpv6Network, TextFormsAndAttributes)
{
    Ipv6Network net("2001:DB8::/32");
    EXPECT_EQ("2001:db8::/32", net.GetStringAddress());
    EXPECT_EQ(32U, net.GetNetmask());
    EXPECT_EQ(IP6_ADDRESS_STATIC, net.GetIpv6AddressType());
    EXPECT_EQ(IP6_ADDRESS_UNSET, net.GetIpv6AddressStatus());
    EXPECT_EQ(IP6_SCOPE_UNSET, net.GetIpv6Scope());
    EXPECT_EQ("fe80::1/128", Ipv6Network("fe80::1").GetStringAddress());
    EXPECT_EQ("::/0", Ipv6Network("::/0").GetStringAddress());
    for (std::string s : {"", "/64", "::1/", "::1/129", "::1/064", "::1/-1", "::1/64/64", "1.2.3.4/8", "::1/ 64", "::1/1280"})
        EXPECT_THROW(Ipv6Network{s}, HostCtlException) << "'" << s << "'";

    Ipv6Network d;
    EXPECT_EQ(IP6_ADDRESS_UNSET, d.GetIpv6AddressType());
    EXPECT_FALSE(d.IsValid());
    d.SetAddress(Ipv6Address("fe80::5"));
    d.SetNetmask(64);
    d.SetUseDhcp();
    EXPECT_EQ(IP6_ADDRESS_DHCP, d.GetIpv6AddressType());
    d.SetUseRouterAdvertised();
    EXPECT_EQ(IP6_ADDRESS_AUTOCONF, d.GetIpv6AddressType());
    d.SetLifeTime(3600);
    EXPECT_TRUE(d.IsValid());
    // Equality looks at address and prefix only.
    EXPECT_TRUE(d == Ipv6Network("fe80::5/64"));
    d.SetNetmask(200);
    EXPECT_FALSE(d.IsValid());
    EXPECT_FALSE(d.IsValidNetworkAddress(Ipv6Address("fe80::5")));

    Ipv6Network copy(net);
    copy.SetAddress(Ipv6Address("2001:db9::"));
    EXPECT_EQ("2001:db8::/32", net.GetStringAddress());
}

TEST(NetAddrIpv6Network, ContainmentOrderingAndChecks)
{
    Ipv6Network net(Ipv6Address("2001:db8:aa00::"), 40);
    EXPECT_TRUE(net.IsValidNetworkAddress(Ipv6Address("2001:db8:aaff:1::1")));
    EXPECT_FALSE(net.IsValidNetworkAddress(Ipv6Address("2001:db8:ab00::1")));
    EXPECT_TRUE(Ipv6Network("::/0").IsValidNetworkAddress(Ipv6Address("ff02::1")));
    EXPECT_TRUE(Ipv6Network("fe80::1/128").IsValidNetworkAddress(Ipv6Address("fe80::1")));
    EXPECT_FALSE(Ipv6Network("fe80::1/128").IsValidNetworkAddress(Ipv6Address("fe80::2")));

    EXPECT_TRUE(Ipv6Network("::1/64") < Ipv6Network("::2/64"));
    EXPECT_TRUE(Ipv6Network("::1/64") < Ipv6Network("::1/65"));
    EXPECT_FALSE(Ipv6Network("::1/64") < Ipv6Network("::1/64"));
    EXPECT_TRUE(Ipv6Network("1::/16") < Ipv6Network("2::/16"));
    EXPECT_FALSE(Ipv6Network("1::/64") == Ipv6Network("1::/65"));

    EXPECT_TRUE(Ipv6Network::IsValidAddressAndNetmask("2001:db8::1/64"));
    EXPECT_TRUE(Ipv6Network::IsValidAddressAndNetmask("fe80::1/128"));
    for (char const *s : {"2001:db8::1", "2001:db8::1/129", "::/64", "ff02::1/64", "zz::1/64", "::1/", ""})
        EXPECT_FALSE(Ipv6Network::IsValidAddressAndNetmask(s)) << s;
}

TEST(NetAddrIpv6Network, PrefixNetmaskConversions)
{
    for (uint32 n = 0; n <= 128; ++n) {
        Ipv6Address mask = Ipv6Network::NetmaskFromNumber(n);
        EXPECT_TRUE(mask.IsValidNetmask()) << n;
        EXPECT_EQ(n, Ipv6Network::NumberFromNetmask(mask));
    }
    EXPECT_EQ("::", Ipv6Network::NetmaskFromNumber(0).GetStringAddress());
    EXPECT_EQ("ffff:ffff:ffff:ffff::", Ipv6Network::NetmaskFromNumber(64).GetStringAddress());
    EXPECT_EQ("ffff:ffff:ffff:ffff:ffff:ffff:ffff:fffe", Ipv6Network::NetmaskFromNumber(127).GetStringAddress());
    EXPECT_EQ("ffff:fe00::", Ipv6Network::NetmaskFromNumber(23).GetStringAddress());
    EXPECT_THROW(Ipv6Network::NetmaskFromNumber(129), HostCtlException);
    EXPECT_THROW(Ipv6Network::NumberFromNetmask(Ipv6Address("ffff::ffff")), HostCtlException);
    EXPECT_THROW(Ipv6Network::NumberFromNetmask(Ipv6Address("7fff::")), HostCtlException);
}

TEST(NetAddrMac, TextForms)
{
    for (std::string s : {"00:50:56:ab:cd:ef", "00-50-56-AB-CD-EF", "0050.56ab.cdef", "005056ABCDEF", "0:50:56:ab:cd:ef"})
        EXPECT_EQ("00:50:56:ab:cd:ef", MacAddress(s).GetStringAddress()) << s;
    EXPECT_EQ("0a:0b:0c:0d:0e:0f", MacAddress("a:b:c:d:e:f").GetStringAddress());
    EXPECT_TRUE(MacAddress::IsValid("ff:ff:ff:ff:ff:ff"));
    EXPECT_TRUE(MacAddress("00:50:56:ab:cd:ef").IsValid());

    // Unparsable text gives the all-zero address and is not valid.
    for (std::string s : {"", "00:50:56:ab:cd", "00:50:56:ab:cd:ef:01", "00:50-56:ab:cd:ef", "000:50:56:ab:cd:ef",
                          "00:50:56:ab:cd:eg", "00::56:ab:cd:ef", "0050.56ab.cde", "0050.56ab.cdeff",
                          "0050:56ab:cdef", "005056abcde", "005056abcdef0", " 00:50:56:ab:cd:ef",
                          "00:50:56:ab:cd:ef ", "00:50:56:ab:cd:", "00.50.56.ab.cd.ef"}) {
        MacAddress m(s);
        EXPECT_EQ("00:00:00:00:00:00", m.GetStringAddress()) << s;
        EXPECT_FALSE(m.IsValid()) << s;
        EXPECT_FALSE(MacAddress::IsValid(s)) << s;
    }
    EXPECT_FALSE(MacAddress().IsValid());
    EXPECT_FALSE(MacAddress::IsValid("00:00:00:00:00:00"));
}

TEST(NetAddrMac, BinaryForms)
{
    uint8 bytes[6] = {0x00, 0x1b, 0x21, 0x3c, 0x4d, 0xff};
    MacAddress fromBytes(bytes);
    EXPECT_EQ("00:1b:21:3c:4d:ff", fromBytes.GetStringAddress());
    bytes[0] = 0x99;  // the value holds its own copy
    EXPECT_EQ("00:1b:21:3c:4d:ff", fromBytes.GetStringAddress());

    uint32 words[6] = {0, 0x1b, 0x21, 0x3c, 0x4d, 0xff};
    EXPECT_TRUE(MacAddress(words) == fromBytes);
    words[2] = 256;
    EXPECT_FALSE(MacAddress(words).IsValid());

    uint8 out[6] = {0};
    MacAddress("02:00:00:00:00:01").GetBinaryAddress(out);
    EXPECT_EQ(0x02, out[0]);
    EXPECT_EQ(0x01, out[5]);

    EXPECT_FALSE(MacAddress(static_cast<uint8 *>(nullptr)).IsValid());
    EXPECT_FALSE(MacAddress(static_cast<uint32 *>(nullptr)).IsValid());
    fromBytes.GetBinaryAddress(nullptr);  // ignored, no crash

    MacAddress copy(fromBytes);
    copy = MacAddress("02:00:00:00:00:02");
    EXPECT_EQ("00:1b:21:3c:4d:ff", fromBytes.GetStringAddress());
}

TEST(NetAddrIpConfig, Ipv4Modes)
{
    IpConfig c;
    EXPECT_FALSE(c.GetUseDhcp());
    EXPECT_FALSE(c.GetIpv4UseNone());
    EXPECT_FALSE(c.IsIpv4Valid());  // static without an address
    c.SetIpv4Address(Ipv4Address("192.168.1.10"));
    EXPECT_FALSE(c.IsIpv4Valid());  // no netmask yet
    c.SetIpv4Netmask(Ipv4Address("255.255.255.0"));
    EXPECT_TRUE(c.IsIpv4Valid());
    c.SetIpv4Broadcast(Ipv4Address("192.168.1.255"));
    EXPECT_TRUE(c.IsValid());
    c.SetIpv4Broadcast(Ipv4Address("192.168.2.255"));
    EXPECT_FALSE(c.IsIpv4Valid());  // broadcast outside the network
    c.SetIpv4Broadcast(Ipv4Address("255.255.255.255"));
    EXPECT_TRUE(c.IsIpv4Valid());

    c.SetUseDhcp(true);
    EXPECT_TRUE(c.GetUseDhcp());
    EXPECT_TRUE(c.GetDhcpDns());  // the default second flag
    EXPECT_EQ("192.168.1.10", c.GetIpv4Address().GetStringAddress());
    c.SetIpv4Address(Ipv4Address("192.168.1.11"));  // back to static
    EXPECT_FALSE(c.GetUseDhcp());
    EXPECT_FALSE(c.GetDhcpDns());

    c.SetIpv4UseNone();
    EXPECT_TRUE(c.GetIpv4UseNone());
    EXPECT_TRUE(c.IsIpv4Valid());
    EXPECT_EQ("0.0.0.0", c.GetIpv4Address().GetStringAddress());
    EXPECT_EQ("0.0.0.0", c.GetIpv4Netmask().GetStringAddress());
    c.SetUseDhcp(true, false);
    EXPECT_FALSE(c.GetIpv4UseNone());
    EXPECT_FALSE(c.GetDhcpDns());
}

TEST(NetAddrIpConfig, SettersRefuseBadValues)
{
    IpConfig c;
    c.SetIpv4Address(Ipv4Address("10.0.0.5"));
    c.SetIpv4Netmask(Ipv4Address("255.0.0.0"));
    for (char const *s : {"0.0.0.0", "224.0.0.1", "255.255.255.255", "0.1.2.3"})
        EXPECT_THROW(c.SetIpv4Address(Ipv4Address(s)), HostCtlException) << s;
    for (char const *s : {"0.0.0.0", "255.0.255.0", "0.0.0.255"})
        EXPECT_THROW(c.SetIpv4Netmask(Ipv4Address(s)), HostCtlException) << s;
    for (char const *s : {"0.0.0.0", "224.0.0.1"})
        EXPECT_THROW(c.SetIpv4Broadcast(Ipv4Address(s)), HostCtlException) << s;
    // Refused values leave the configuration as it was.
    EXPECT_EQ("10.0.0.5", c.GetIpv4Address().GetStringAddress());
    EXPECT_EQ("255.0.0.0", c.GetIpv4Netmask().GetStringAddress());

    EXPECT_THROW(c.SetDhcpDns(true), HostCtlException);  // no DHCP at all
    c.SetDhcpDns(false);
    c.SetUseIpv6Dhcp(true);
    c.SetDhcpDns(true);
    EXPECT_TRUE(c.GetDhcpDns());
    c.SetUseIpv6Dhcp(false);
    EXPECT_FALSE(c.GetDhcpDns());  // no DHCP left to supply DNS
}

TEST(NetAddrIpConfig, Ipv6Networks)
{
    IpConfig c;
    c.SetUseIpv6RouterAdvertised(true);
    EXPECT_TRUE(c.GetUseIpv6RouterAdvertised());
    c.AddIpv6Network(Ipv6Network("2001:db8::10/64"));
    c.AddIpv6Network(Ipv6Network("fe80::10/64"));
    EXPECT_THROW(c.AddIpv6Network(Ipv6Network("2001:db8::10/48")), HostCtlException);  // same address
    EXPECT_THROW(c.AddIpv6Network(Ipv6Network("ff02::1/64")), HostCtlException);
    EXPECT_THROW(c.AddIpv6Network(Ipv6Network()), HostCtlException);
    Ipv6Network wide("2001:db8::20/64");
    wide.SetNetmask(129);
    EXPECT_THROW(c.AddIpv6Network(wide), HostCtlException);

    std::vector<Ipv6Network> nets = c.GetIpv6Network();
    ASSERT_EQ(2U, nets.size());
    EXPECT_EQ("2001:db8::10/64", nets[0].GetStringAddress());
    nets[0].SetNetmask(8);  // a copy: the configuration is unchanged
    EXPECT_EQ("2001:db8::10/64", c.GetIpv6Network()[0].GetStringAddress());
    EXPECT_TRUE(c.IsIpv6Valid());

    EXPECT_TRUE(c.ContainsAddress("2001:DB8:0::10"));
    EXPECT_TRUE(c.ContainsAddress("fe80::10"));
    EXPECT_FALSE(c.ContainsAddress("2001:db8::11"));
    EXPECT_FALSE(c.ContainsAddress("not an address"));
    EXPECT_FALSE(c.ContainsAddress("0.0.0.0"));  // no static IPv4 address

    EXPECT_THROW(c.RemoveIpv6Network(Ipv6Network("2001:db8::10/48")), HostCtlException);
    c.RemoveIpv6Network(Ipv6Network("2001:db8::10/64"));
    EXPECT_EQ(1U, c.GetIpv6Network().size());
    EXPECT_THROW(c.RemoveIpv6Network(Ipv6Network("2001:db8::10/64")), HostCtlException);

    c.SetIpv4Address(Ipv4Address("10.1.1.1"));
    EXPECT_TRUE(c.ContainsAddress("10.1.1.1"));
    EXPECT_FALSE(c.ContainsAddress("10.1.1.2"));

    IpConfig copy(c);
    copy.AddIpv6Network(Ipv6Network("2001:db8::99/64"));
    copy.SetIpv4UseNone();
    EXPECT_EQ(1U, c.GetIpv6Network().size());
    EXPECT_TRUE(c.ContainsAddress("10.1.1.1"));
}

TEST(NetAddrHostAddress, Classification)
{
    struct Case { char const *text; HostAddress::HostAddressType type; char const *shown; };
    const Case cases[] = {
        {"", HostAddress::HOST_ADDR_TYPE_NONE, ""},
        {"10.20.30.40", HostAddress::HOST_ADDR_TYPE_IPV4, "10.20.30.40"},
        {"2001:DB8:0::1", HostAddress::HOST_ADDR_TYPE_IPV6, "2001:db8::1"},
        {"::ffff:1.2.3.4", HostAddress::HOST_ADDR_TYPE_IPV6, "::ffff:1.2.3.4"},
        {"storage-01.lab.example", HostAddress::HOST_ADDR_TYPE_FDN, "storage-01.lab.example"},
        {"node7.example.", HostAddress::HOST_ADDR_TYPE_FDN, "node7.example"},
        {"localhost", HostAddress::HOST_ADDR_TYPE_FDN, "localhost"},
        {"3com.example", HostAddress::HOST_ADDR_TYPE_FDN, "3com.example"},
        {"1.2.3.4a", HostAddress::HOST_ADDR_TYPE_FDN, "1.2.3.4a"},
    };
    for (Case const &c : cases) {
        HostAddress h(c.text);
        EXPECT_EQ(c.type, h.GetHostAddressType()) << c.text;
        EXPECT_EQ(c.shown, h.GetHostAddress()) << c.text;
    }
    EXPECT_EQ(HostAddress::HOST_ADDR_TYPE_NONE, HostAddress().GetHostAddressType());

    std::string label63(63, 'a'), label64(64, 'a');
    EXPECT_EQ(HostAddress::HOST_ADDR_TYPE_FDN, HostAddress(label63 + ".example").GetHostAddressType());
    std::string long253;
    while (long253.size() < 250) long253 += label63.substr(0, 9) + ".";
    long253 += "abc";  // 253 characters
    ASSERT_EQ(253U, long253.size());
    EXPECT_EQ(HostAddress::HOST_ADDR_TYPE_FDN, HostAddress(long253).GetHostAddressType());

    for (std::string s : std::vector<std::string>{"-host.example", "host-.example", "a..b", "a_b.example", "host name", ".", "..",
                          ".example", "1.2.3.256", "300.1.1.1", "01.2.3.4", "1.2.3", "example.123",
                          "::1::", "host.example..", "h\xc3\xa9.example", std::string("a\0b", 3),
                          label64 + ".example", long253 + "x", "[::1]"})
        EXPECT_THROW(HostAddress{s}, HostCtlException) << "'" << s << "'";
}

TEST(NetAddrHostAddress, AccessorsAndEquality)
{
    HostAddress v4("192.0.2.1"), v6("2001:db8::1"), name("Filer.Example.");
    EXPECT_EQ("192.0.2.1", v4.GetIpv4Address().GetStringAddress());
    EXPECT_EQ("", v4.GetHostName());
    EXPECT_EQ("0.0.0.0", v6.GetIpv4Address().GetStringAddress());
    EXPECT_EQ("0.0.0.0", name.GetIpv4Address().GetStringAddress());
    EXPECT_EQ("Filer.Example", name.GetHostName());

    EXPECT_TRUE(name == HostAddress("filer.example"));
    EXPECT_FALSE(name == HostAddress("filer.example2"));
    EXPECT_TRUE(v6 == HostAddress("2001:0db8:0:0:0:0:0:1"));
    EXPECT_FALSE(v4 == HostAddress("192.0.2.2"));
    EXPECT_TRUE(HostAddress() == HostAddress(""));
    EXPECT_FALSE(v4 == HostAddress());
}

TEST(NetAddrPortAddress, Text)
{
    EXPECT_EQ("", PortAddress().GetStringAddress());
    EXPECT_EQ("10.0.0.5:3260", PortAddress("10.0.0.5", 3260).GetStringAddress());
    EXPECT_EQ("target.example:65535", PortAddress("target.example", 65535).GetStringAddress());
    EXPECT_EQ("[2001:db8::5]:3260", PortAddress("2001:db8::5", 3260).GetStringAddress());
    EXPECT_EQ("[fe80::1]:0", PortAddress("[fe80::1]", 0).GetStringAddress());
    PortAddress a("10.0.0.5", 3260);
    PortAddress b(a);
    b = PortAddress("10.0.0.6", 1);
    EXPECT_EQ("10.0.0.5:3260", a.GetStringAddress());
    EXPECT_EQ(3260, a.GetPort());
    EXPECT_EQ("10.0.0.5", a.GetHost());
}
