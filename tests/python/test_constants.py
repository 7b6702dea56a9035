"""Module constants and the library variables behind cvar."""
import unittest

import _qorctl as Q
import qorctl


class Constants(unittest.TestCase):
    def test_basic_constants_and_their_types(self):
        expect = {"FALSE": 0, "TRUE": 1, "vm_x86_64": 0, "FMTH": "", "FMTSZ": "Z", "FMTPD": "", "FMT64": "L",
                  "FMTLA": "", "FMTVA": "", "FMTVPN": "", "FMTPID": "d", "FMTUID": "u", "FMTMODE": "o",
                  "FMTTIME": "ld", "MIN_UINT64": 0}
        for name, value in expect.items():
            self.assertEqual(getattr(Q, name), value, name)
            self.assertIs(type(getattr(Q, name)), type(value), name)
        self.assertEqual((Q.MIN_INT64, Q.MAX_INT64, Q.MAX_UINT64),
                         (-2 ** 63, 2 ** 63 - 1, 2 ** 64 - 1))
        for name in ("MIN_INT64", "MAX_INT64", "MAX_UINT64"):
            self.assertIs(type(getattr(Q, name)), long, name)

    def test_class_and_string_constants(self):
        self.assertEqual((Q.AdvancedOption_ADV_OPTION_INT_TYPE, Q.AdvancedOption_ADV_OPTION_STRING_TYPE), (0, 1))
        self.assertEqual((Q.LLDP_KEY_SYS_CAP, Q.LLDP_KEY_TIMEOUT, Q.LLDP_KEY_SAMPLES),
                         ("Enabled Capabilities", "TimeOut", "Samples"))
        self.assertEqual(qorctl.IP_ADDRESS_V6, 1)


class Variables(unittest.TestCase):
    def test_first_registered_is_listed_last(self):
        names = str(Q.cvar)[1:-1].split(", ")
        self.assertEqual(names[-1], "BootDevice_BootNames")
        self.assertEqual(len(names), len(set(names)))
        self.assertEqual(repr(Q.cvar), "<Swig global variables>")

    def test_unknown_names(self):
        with self.assertRaises(NameError) as cm:
            Q.cvar.NoSuchVariable
        self.assertEqual(str(cm.exception), "Unknown C global variable")
        self.assertRaises(NameError, setattr, Q.cvar, "NoSuchVariable", 1)

    def test_fixed_long(self):
        self.assertEqual(Q.cvar.INVALID_CONNECTION_ID, 4294967295L)
        self.assertIs(type(Q.cvar.INVALID_CONNECTION_ID), long)

    def test_read_only_variables(self):
        with self.assertRaises(AttributeError) as cm:
            Q.cvar.INVALID_CONNECTION_ID = 1
        self.assertEqual(str(cm.exception), "Variable INVALID_CONNECTION_ID is read-only.")
        with self.assertRaises(AttributeError) as cm:
            Q.cvar.CDP_STATUS = None
        self.assertEqual(str(cm.exception),
                         "in variable 'read-only HostCtl::Network::CDP_STATUS' of type 'std::string []'")
        self.assertEqual(type(Q.cvar.CDP_STATUS).__name__, "PySwigObject")

    def test_writable_c_string(self):
        old = Q.cvar.OFF
        try:
            Q.cvar.OFF = "switched off"
            self.assertEqual(Q.cvar.OFF, "switched off")
            with self.assertRaises(TypeError) as cm:
                Q.cvar.OFF = 5
            self.assertEqual(str(cm.exception), "in variable 'HostCtl::Storage::OFF' of type 'char const *'")
            self.assertEqual(Q.cvar.OFF, "switched off")
            with self.assertRaises(TypeError):
                del Q.cvar.OFF
            self.assertEqual(Q.cvar.OFF, "switched off")
        finally:
            Q.cvar.OFF = old

    def test_record_variables_and_their_accessors(self):
        route = Q.cvar.RoutingInfoImpl_DEFAULT_IPV4_ROUTE
        self.assertFalse(route.thisown)
        original = qorctl.Ipv4Network(route)
        try:
            Q.cvar.RoutingInfoImpl_DEFAULT_IPV4_ROUTE = qorctl.Ipv4Network("10.0.0.0/8")
            # The earlier wrapped object points at the library's own record.
            self.assertEqual(route.GetStringAddress(), qorctl.Ipv4Network("10.0.0.0/8").GetStringAddress())
            self.assertEqual(Q.RoutingInfoImpl_DEFAULT_IPV4_ROUTE_get().GetStringAddress(),
                             route.GetStringAddress())
            with self.assertRaises(ValueError) as cm:
                Q.cvar.RoutingInfoImpl_DEFAULT_IPV4_ROUTE = None
            self.assertEqual(str(cm.exception),
                             "invalid null reference in variable 'QorCtl::Network::RoutingInfoImpl::"
                             "DEFAULT_IPV4_ROUTE' of type 'HostCtl::Network::Ipv4Network'")
            with self.assertRaises(TypeError):
                Q.RoutingInfoImpl_DEFAULT_IPV6_ROUTE_set(qorctl.Ipv4Network("10.0.0.0/8"))
        finally:
            Q.RoutingInfoImpl_DEFAULT_IPV4_ROUTE_set(original)
        self.assertEqual(route.GetStringAddress(), original.GetStringAddress())

    def test_static_member_accessor_functions(self):
        for name in ("BootDevice_BootNames", "NetworkPolicySerializer_TeamPolicyStr",
                     "RoutingInfoImpl_DEFAULT_IPV4_ROUTE", "RoutingInfoImpl_DEFAULT_IPV6_ROUTE"):
            self.assertTrue(hasattr(Q, name + "_get"), name)
            self.assertTrue(hasattr(Q, name + "_set"), name)
        self.assertRaises(AttributeError, Q.BootDevice_BootNames_set, None)


if __name__ == "__main__":
    unittest.main()
