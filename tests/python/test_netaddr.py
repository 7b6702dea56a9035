"""Network address values and policies, seen from Python."""
import unittest

import _qorctl as Q
import qorctl as q


class Ipv4(unittest.TestCase):
    def test_text_binary_round_trip(self):
        for text, value in (("0.0.0.0", 0), ("1.2.3.4", 0x01020304), ("10.20.30.40", 0x0a141e28),
                            ("255.255.255.255", 4294967295L), ("192.168.1.254", 0xc0a801fe)):
            a = q.Ipv4Address(text)
            self.assertEqual(a.GetBinaryAddress(), value)
            self.assertEqual(q.Ipv4Address(value).GetStringAddress(), text)
            self.assertEqual(q.Ipv4Address.AddressFromUint(value), text)
            self.assertEqual(q.Ipv4Address.UintFromAddress(text), value)
        self.assertIsInstance(q.Ipv4Address("255.0.0.0").GetBinaryAddress(), long)

    def test_invalid_text_is_refused(self):
        for bad in ("", "1.2.3", "1.2.3.4.5", "256.1.1.1", "1.2.3.-4", "a.b.c.d", "01.2.3.4",
                    "1.2.3.4 ", " 1.2.3.4", "1..2.3", "1.2.3.4\0", "::1", "1.2.3.4/24"):
            self.assertRaises(q.HostCtlException, q.Ipv4Address, bad)
            self.assertRaises(q.HostCtlException, q.Ipv4Address.UintFromAddress, bad)
            self.assertFalse(q.Ipv4Address.IsValidAddress(bad), bad)

    def test_validity_checks(self):
        self.assertTrue(q.Ipv4Address("10.0.0.1").IsValidAddress())
        self.assertFalse(q.Ipv4Address("0.0.0.0").IsValidAddress())
        self.assertTrue(q.Ipv4Address("224.0.0.1").IsValidMulticastAddress())
        self.assertFalse(q.Ipv4Address("10.0.0.1").IsValidMulticastAddress())
        self.assertTrue(q.Ipv4Address("255.255.255.0").IsValidNetmask())
        self.assertFalse(q.Ipv4Address("255.0.255.0").IsValidNetmask())

    def test_prefixes_at_the_boundaries(self):
        self.assertEqual(q.Ipv4Network.NetmaskFromNumber(0).GetStringAddress(), "0.0.0.0")
        self.assertEqual(q.Ipv4Network.NetmaskFromNumber(32).GetStringAddress(), "255.255.255.255")
        self.assertEqual(q.Ipv4Network.NetmaskFromNumber(20).GetStringAddress(), "255.255.240.0")
        self.assertRaises(q.HostCtlException, q.Ipv4Network.NetmaskFromNumber, 33)
        for n in (0, 1, 8, 24, 31, 32):
            self.assertEqual(q.Ipv4Network.NumberFromNetmask(q.Ipv4Network.NetmaskFromNumber(n)), n)
        self.assertRaises(q.HostCtlException, q.Ipv4Network.NumberFromNetmask, q.Ipv4Address("255.0.255.0"))

    def test_networks(self):
        n = q.Ipv4Network("192.168.0.0/16")
        self.assertEqual(n.GetNetmask().GetStringAddress(), "255.255.0.0")
        self.assertTrue(n.IsValidNetworkAddress(q.Ipv4Address("192.168.7.7")))
        self.assertFalse(n.IsValidNetworkAddress(q.Ipv4Address("10.0.0.1")))
        self.assertEqual(q.Ipv4Network(0x0a000000).GetNetmask().GetStringAddress(), "255.255.255.255")
        self.assertTrue(q.Ipv4Network("10.0.0.0/8") == q.Ipv4Network(q.Ipv4Address("10.0.0.0"),
                                                                    q.Ipv4Address("255.0.0.0")))

    def test_copies_are_independent(self):
        a = q.Ipv4Address("10.0.0.1")
        n = q.Ipv4Network(a, q.Ipv4Address("255.0.0.0"))
        a.SetBinaryAddress(0x0b000001)
        self.assertEqual(n.GetNetwork().GetStringAddress(), "10.0.0.1")
        got = n.GetNetwork()
        got.SetBinaryAddress(0)
        self.assertEqual(n.GetNetwork().GetStringAddress(), "10.0.0.1")
        self.assertTrue(got.thisown)

    def test_equality(self):
        self.assertTrue(q.Ipv4Address("1.2.3.4") == q.Ipv4Address(0x01020304))
        self.assertFalse(q.Ipv4Address("1.2.3.4") == q.Ipv4Address("1.2.3.5"))


class Ipv6(unittest.TestCase):
    def test_canonical_forms(self):
        for text, canonical in (("::", "::"), ("::1", "::1"), ("0:0:0:0:0:0:0:1", "::1"),
                                ("2001:DB8:0:0:1:0:0:1", "2001:db8::1:0:0:1"),
                                ("2001:db8:0000:0000:0000:0000:0000:0001", "2001:db8::1"),
                                ("fe80::0202:b3ff:fe1e:8329", "fe80::202:b3ff:fe1e:8329"),
                                ("::ffff:192.0.2.1", "::ffff:192.0.2.1"),
                                ("1:0:0:2:0:0:0:3", "1:0:0:2::3"), ("FF19:0:0:0:0:1:2:3", "ff19::1:2:3")):
            self.assertEqual(q.Ipv6Address(text).GetStringAddress(), canonical)

    def test_binary_round_trip(self):
        a = q.Ipv6Address("2001:db8::ff00:42:8329")
        b = a.GetBinaryAddress()
        self.assertTrue(b.thisown)
        self.assertEqual(q.Ipv6Address(b).GetStringAddress(), "2001:db8::ff00:42:8329")
        self.assertEqual(q.Ipv6Address.AddressFromUint(q.Ipv6Address.UintFromAddress("::ffff:1.2.3.4")),
                         "::ffff:1.2.3.4")

    def test_invalid_text_is_refused(self):
        for bad in ("", ":", ":::", "1::2::3", "12345::", "g::1", "1:2:3:4:5:6:7:8:9", "::1.2.3",
                    "1:2:3:4:5:6:7", "::ffff:256.1.1.1", "[::1]", "fe80::1%eth0", "1" * 50):
            self.assertRaises(q.HostCtlException, q.Ipv6Address, bad)
            self.assertFalse(q.Ipv6Address.IsValidAddress(bad), bad)

    def test_prefixes_at_the_boundaries(self):
        self.assertEqual(q.Ipv6Network.NetmaskFromNumber(0).GetStringAddress(), "::")
        self.assertEqual(q.Ipv6Network.NetmaskFromNumber(128).GetStringAddress(),
                         "ffff:ffff:ffff:ffff:ffff:ffff:ffff:ffff")
        self.assertRaises(q.HostCtlException, q.Ipv6Network.NetmaskFromNumber, 129)
        for n in (0, 1, 64, 127, 128):
            self.assertEqual(q.Ipv6Network.NumberFromNetmask(q.Ipv6Network.NetmaskFromNumber(n)), n)

    def test_network_attributes(self):
        n = q.Ipv6Network("2001:db8::/32")
        self.assertEqual(n.GetNetmask(), 32)
        self.assertTrue(n.IsValidNetworkAddress(q.Ipv6Address("2001:db8:1::5")))
        self.assertFalse(n.IsValidNetworkAddress(q.Ipv6Address("2001:db9::5")))
        n.SetIpv6Scope(Q.IP6_SCOPE_LINKLOCAL)
        self.assertEqual(n.GetIpv6Scope(), Q.IP6_SCOPE_LINKLOCAL)
        n.SetLifeTime(4294967295L)
        self.assertEqual(n.GetLifeTime(), 4294967295L)


class Mac(unittest.TestCase):
    def test_text_forms(self):
        for text in ("00:50:56:aa:bb:cc", "00-50-56-AA-BB-CC", "0050.56aa.bbcc", "005056aabbcc"):
            m = q.MacAddress(text)
            self.assertTrue(m.IsValid(), text)
            self.assertEqual(m.GetStringAddress(), "00:50:56:aa:bb:cc")
        for bad in ("", "00:50:56:aa:bb", "00:50:56:aa:bb:cc:dd", "00:50-56:aa:bb:cc", "zz:50:56:aa:bb:cc"):
            self.assertFalse(q.MacAddress(bad).IsValid(), bad)
            self.assertFalse(q.MacAddress.IsValid(bad))


class HostAndPort(unittest.TestCase):
    def test_classification(self):
        self.assertEqual(q.HostAddress("10.1.1.1").GetHostAddressType(), Q.HostAddress_HOST_ADDR_TYPE_IPV4)
        self.assertEqual(q.HostAddress("fe80::1").GetHostAddressType(), Q.HostAddress_HOST_ADDR_TYPE_IPV6)
        self.assertEqual(q.HostAddress("host.example.com").GetHostAddressType(), Q.HostAddress_HOST_ADDR_TYPE_FDN)
        self.assertEqual(q.HostAddress().GetHostAddressType(), Q.HostAddress_HOST_ADDR_TYPE_NONE)
        for bad in ("-bad.example", "a..b", "x" * 64 + ".com", "under_score.com"):
            self.assertRaises(q.HostCtlException, q.HostAddress, bad)

    def test_port_address(self):
        self.assertEqual(q.PortAddress("10.0.0.1", 3260).GetStringAddress(), "10.0.0.1:3260")
        self.assertRaises(OverflowError, q.PortAddress, "h", 65536)


class IpConfiguration(unittest.TestCase):
    def test_ipv4_and_ipv6_lists(self):
        c = q.IpConfig()
        c.SetIpv4Address(q.Ipv4Address("10.0.0.5"))
        c.SetIpv4Netmask(q.Ipv4Address("255.255.255.0"))
        self.assertRaises(q.HostCtlException, c.SetIpv4Netmask, q.Ipv4Address("255.0.255.0"))
        c.AddIpv6Network(q.Ipv6Network("2001:db8::5/64"))
        self.assertRaises(q.HostCtlException, c.AddIpv6Network, q.Ipv6Network("2001:db8::5/64"))
        nets = c.GetIpv6Network()
        self.assertEqual([n.GetStringAddress() for n in nets], [q.Ipv6Network("2001:db8::5/64").GetStringAddress()])
        c.RemoveIpv6Network(nets[0])
        self.assertEqual(c.GetIpv6Network(), ())
        self.assertRaises(q.HostCtlException, c.RemoveIpv6Network, nets[0])

    def test_dhcp_flags(self):
        c = q.IpConfig()
        c.SetUseDhcp(True)
        self.assertTrue(c.GetUseDhcp() and c.GetDhcpDns())
        c.SetUseDhcp(False, False)
        self.assertRaises(q.HostCtlException, c.SetDhcpDns, True)


class Policies(unittest.TestCase):
    def test_attributes_set_and_unset(self):
        p = q.NicTeamingPolicy()
        self.assertFalse(p.IsSet())
        self.assertFalse(p.HasReversePolicy())
        p.SetReversePolicy(True)
        self.assertTrue(p.HasReversePolicy() and p.GetReversePolicy() and p.IsSet())
        p.SetUplinkOrder(["uplink1", "uplink0"])
        self.assertEqual(p.GetUplinkOrder(), ("uplink1", "uplink0"))
        p.UnsetReversePolicy()
        self.assertFalse(p.HasReversePolicy())
        p.UnsetAll()
        self.assertFalse(p.IsSet())

    def test_derive_fills_unset_attributes(self):
        parent = q.NicTeamingPolicy.GetDefaultPolicy()
        child = q.NicTeamingPolicy()
        child.SetNotifySwitchOnFailure(False)
        child.Derive(parent)
        self.assertFalse(child.GetNotifySwitchOnFailure())
        self.assertTrue(child.HasTeamingPolicy())
        self.assertEqual(child.GetTeamingPolicy(), parent.GetTeamingPolicy())

    def test_link_criteria_defaults(self):
        c = q.LinkCriteriaSelectionPolicy()
        c.SetExactSpeed(1000)
        self.assertEqual((c.HasExactSpeed(), c.GetExactSpeed(), c.IgnoreExactSpeed()), (True, 1000, False))
        c.SetExactSpeed(10, True)
        self.assertTrue(c.IgnoreExactSpeed())
        copy = q.NicTeamingPolicy()
        copy.SetLinkCriteria(c)
        c.UnsetExactSpeed()
        self.assertTrue(copy.GetLinkCriteria().HasExactSpeed())


if __name__ == "__main__":
    unittest.main()
