"""Advanced options through the module: the walk from the host, the typed
views, refused values, ownership and the implementation classes seen
through every base."""
import shutil
import tempfile
import unittest

import _qorctl as Q
import qorctl

INT_TYPE = qorctl.AdvancedOption_ADV_OPTION_INT_TYPE
STRING_TYPE = qorctl.AdvancedOption_ADV_OPTION_STRING_TYPE
TOP_BRANCHES = ["Net", "Disk", "Mem", "Misc", "UserVars"]

_tmpdir = None


def setUpModule():
    # Nothing here saves, but keep the host's configuration file out of
    # the system's directory all the same.
    global _tmpdir
    _tmpdir = tempfile.mkdtemp(prefix="qorctl-options-")
    qorctl.HostImpl().SetConfigFile(_tmpdir + "/host.conf")


def tearDownModule():
    shutil.rmtree(_tmpdir, ignore_errors=True)


def addr(obj):
    return int(getattr(obj, "this", obj))


def find(path):
    return qorctl.AdvancedOptionImpl.FindOption(path)


class OptionTestCase(unittest.TestCase):
    """Puts every option a test touches back to its default."""

    def setUp(self):
        self._touched = []

    def tearDown(self):
        for path in self._touched:
            find(path).SetToDefault()

    def touch(self, path):
        self._touched.append(path)


class Walk(OptionTestCase):
    def test_walk_in_calling_order(self):
        host = Q.HostFactory_GetHost()
        root = Q.Host_GetAdvancedOptions(host)
        net = Q.AdvancedOptionBranch_GetBranchByName(root, "Net")
        opt = Q.AdvancedOptionBranch_GetOptionByName(net, "TcpipHeapSize")
        self.assertEqual(Q.AdvancedOption_GetType(opt), INT_TYPE)
        heap = Q.CastAdvInt(opt)
        self.assertEqual((Q.AdvancedIntegerOption_GetValue(heap),
                          Q.AdvancedIntegerOption_GetMinimum(heap),
                          Q.AdvancedIntegerOption_GetMaximum(heap)), (32, 0, 1024))
        self.touch("/Net/TcpipHeapSize")
        Q.AdvancedIntegerOption_SetValue(heap, 64)
        self.assertEqual(Q.AdvancedIntegerOption_GetValue(heap), 64)
        Q.AdvancedOption_SetToDefault(heap)
        self.assertEqual(Q.AdvancedIntegerOption_GetValue(heap), 32)

        # The same walk over the lists instead of the names.
        tcpip = [b for b in Q.AdvancedOptionBranch_GetBranches(net)
                 if Q.AdvancedOptionBranch_GetBranchName(b) == "Tcpip"][0]
        cc = [o for o in Q.AdvancedOptionBranch_GetOptions(tcpip)
              if o.GetOptionName() == "CongestionControl"][0]
        self.assertEqual(Q.AdvancedOption_GetType(cc), STRING_TYPE)
        text = Q.CastAdvString(cc)
        self.assertEqual(Q.AdvancedStringOption_GetValue(text), "newreno")
        self.assertEqual(Q.AdvancedStringOption_GetValidCharacters(text),
                         "abcdefghijklmnopqrstuvwxyz0123456789-_")
        self.touch("/Net/Tcpip/CongestionControl")
        Q.AdvancedStringOption_SetValue(text, "cubic")
        self.assertEqual(text.GetValue(), "cubic")
        Q.AdvancedOption_SetToDefault(text)
        self.assertEqual(text.GetValue(), "newreno")

    def test_whole_tree_is_consistent(self):
        root = qorctl.HostFactory.GetHost().GetAdvancedOptions()
        self.assertEqual(root.GetBranchName(), "")
        self.assertEqual(root.GetName(), "/")
        self.assertEqual([b.GetBranchName() for b in root.GetBranches()], TOP_BRANCHES)
        self.assertEqual(root.GetOptions(), ())
        seen = []

        def visit(branch):
            for opt in branch.GetOptions():
                self.assertIsInstance(opt, qorctl.AdvancedOption)
                self.assertFalse(opt.thisown)
                path = opt.GetOptionPath()
                self.assertEqual(path, branch.GetName().rstrip("/") + "/" + opt.GetOptionName())
                as_int, as_str = qorctl.CastAdvInt(opt), qorctl.CastAdvString(opt)
                # Exactly one view, and the one that the type code names.
                self.assertEqual((as_int is not None, as_str is not None),
                                 (opt.GetType() == INT_TYPE, opt.GetType() == STRING_TYPE))
                typed = as_int or as_str
                self.assertFalse(typed.IsHidden())
                if as_int is not None:
                    self.assertTrue(as_int.GetMinimum() <= as_int.GetDefaultValue()
                                    <= as_int.GetMaximum())
                else:
                    self.assertTrue(all(c in as_str.GetValidCharacters()
                                        for c in as_str.GetDefaultValue()))
                self.assertTrue(typed.GetDescription())
                seen.append(path)
            for sub in branch.GetBranches():
                self.assertFalse(sub.thisown)
                self.assertEqual(sub.GetName(), branch.GetName().rstrip("/") + "/"
                                 + sub.GetBranchName())
                visit(sub)

        visit(root)
        self.assertEqual(len(seen), len(set(seen)))
        for path in ("/Net/TcpipHeapSize", "/Net/Tcpip/CongestionControl", "/UserVars/Locale"):
            self.assertIn(path, seen)
        self.assertNotIn("/Mem/ScrubPattern", seen)

    def test_same_library_object_each_time(self):
        root = qorctl.HostFactory.GetHost().GetAdvancedOptions()
        a = root.GetBranchByName("Net").GetOptionByName("TcpipHeapSize")
        b = find("Net/TcpipHeapSize")
        self.assertEqual(addr(a), addr(b))
        self.assertEqual(addr(root.GetBranchByName("Mem")),
                         addr(root.GetBranches()[TOP_BRANCHES.index("Mem")]))

    def test_hidden_options(self):
        mem = qorctl.HostFactory.GetHost().GetAdvancedOptions().GetBranchByName("Mem")
        names = [o.GetOptionName() for o in mem.GetOptions()]
        self.assertNotIn("ScrubPattern", names)
        scrub = qorctl.CastAdvInt(mem.GetOptionByName("ScrubPattern"))
        self.assertTrue(scrub.IsHidden())
        impl = qorctl.AdvancedOptionBranchImpl(["Mem"], "")
        self.assertEqual(impl.GetName(), "/Mem")
        with_hidden = [o.GetOptionName() for o in impl.GetOptions(True)]
        self.assertEqual([o.GetOptionName() for o in impl.GetOptions(False)], names)
        self.assertEqual([n for n in with_hidden if n not in names], ["ScrubPattern"])

    def test_branch_without_options(self):
        net = qorctl.HostFactory.GetHost().GetAdvancedOptions().GetBranchByName("Net")
        empty = net.GetBranchByName("Experimental")
        self.assertEqual(empty.GetOptions(), ())
        self.assertEqual(empty.GetBranches(), ())

    def test_unknown_names_are_refused_by_the_library(self):
        root = qorctl.HostFactory.GetHost().GetAdvancedOptions()
        net = root.GetBranchByName("Net")
        cases = [
            (lambda: root.GetBranchByName("Nope"), 'No advanced option branch "Nope" in branch /'),
            (lambda: net.GetOptionByName("Nope"), 'No advanced option "Nope" in branch /Net'),
            # Names are single components; paths are for FindOption.
            (lambda: net.GetOptionByName("Tcpip/DelayedAck"),
             'No advanced option "Tcpip/DelayedAck" in branch /Net'),
            (lambda: find("/Net/Nope"), "No advanced option /Net/Nope on this host"),
        ]
        for call, message in cases:
            with self.assertRaises(qorctl.HostCtlException) as cm:
                call()
            self.assertEqual(str(cm.exception), message)


class TypedViews(OptionTestCase):
    def test_downcasts(self):
        heap = find("/Net/TcpipHeapSize")
        cc = find("/Net/Tcpip/CongestionControl")
        self.assertIsNone(qorctl.CastAdvInt(None))
        self.assertIsNone(qorctl.CastAdvString(None))
        self.assertIsNone(qorctl.CastAdvString(heap))
        self.assertIsNone(qorctl.CastAdvInt(cc))
        as_int = qorctl.CastAdvInt(heap)
        as_str = qorctl.CastAdvString(cc)
        self.assertIs(type(as_int), qorctl.AdvancedIntegerOptionImpl)
        self.assertIs(type(as_str), qorctl.AdvancedStringOptionImpl)
        self.assertFalse(as_int.thisown)
        self.assertFalse(as_str.thisown)
        self.assertEqual(as_int.GetOptionPath(), "/Net/TcpipHeapSize")
        self.assertEqual(as_str.GetOptionPath(), "/Net/Tcpip/CongestionControl")

    def test_downcast_of_an_owned_handle(self):
        owned = qorctl.AdvancedIntegerOptionImpl(["Net"], "TcpipHeapSize")
        view = qorctl.CastAdvInt(owned)
        self.assertTrue(owned.thisown)
        self.assertFalse(view.thisown)
        self.assertEqual(addr(view), addr(owned))
        self.assertIsNone(qorctl.CastAdvString(owned))

    def test_base_view_refused_by_typed_methods(self):
        heap = find("/Net/TcpipHeapSize")
        with self.assertRaises(TypeError) as cm:
            Q.AdvancedIntegerOption_GetValue(heap)
        self.assertEqual(str(cm.exception), "in method 'AdvancedIntegerOption_GetValue', "
                         "argument 1 of type 'HostCtl::Adv::AdvancedIntegerOption *'")
        with self.assertRaises(TypeError) as cm:
            Q.AdvancedStringOption_GetValue(heap)
        self.assertEqual(str(cm.exception), "in method 'AdvancedStringOption_GetValue', "
                         "argument 1 of type 'HostCtl::Adv::AdvancedStringOption *'")

    def test_uint32_results_above_int_range_are_longs(self):
        scrub = qorctl.CastAdvInt(find("/Mem/ScrubPattern"))
        self.touch("/Mem/ScrubPattern")
        self.assertEqual(scrub.GetValue(), 0xA5A5A5A5)
        self.assertIs(type(scrub.GetValue()), long)
        self.assertIs(type(scrub.GetMaximum()), long)
        self.assertIs(type(scrub.GetMinimum()), int)
        scrub.SetValue(2147483647)
        self.assertIs(type(scrub.GetValue()), int)
        scrub.SetValue(2147483648)
        self.assertEqual(scrub.GetValue(), 2147483648)
        self.assertIs(type(scrub.GetValue()), long)
        scrub.SetValue(4294967295L)
        self.assertEqual(scrub.GetValue(), 4294967295)


class Refusals(OptionTestCase):
    def test_out_of_range_is_the_registered_exception(self):
        heap = qorctl.CastAdvInt(find("/Net/TcpipHeapSize"))
        self.touch("/Net/TcpipHeapSize")
        heap.SetValue(100)
        for value, text in ((1025, "1025"), (4294967295, "4294967295")):
            with self.assertRaises(qorctl.HostCtlException) as cm:
                heap.SetValue(value)
            e = cm.exception
            self.assertIs(type(e), qorctl.HostCtlException)
            message = "Value %s for option /Net/TcpipHeapSize is out of range [0, 1024]" % text
            self.assertEqual(str(e), message)
            self.assertEqual(e.GetMessage(), message)
            self.assertTrue(e.thisown)
            self.assertEqual(heap.GetValue(), 100)
        # Both ends of the range are accepted.
        heap.SetValue(0)
        heap.SetValue(1024)
        self.assertEqual(heap.GetValue(), 1024)
        lower = qorctl.CastAdvInt(find("/Net/TcpipHeapMax"))
        with self.assertRaises(qorctl.HostCtlException) as cm:
            lower.SetValue(31)
        self.assertEqual(str(cm.exception),
                         "Value 31 for option /Net/TcpipHeapMax is out of range [32, 1536]")

    def test_uint32_conversion_refuses_before_the_library(self):
        heap = qorctl.CastAdvInt(find("/Net/TcpipHeapSize"))
        message = "in method 'AdvancedIntegerOption_SetValue', argument 2 of type 'uint32'"
        for value, error in ((-1, OverflowError), (4294967296, TypeError), (-1L, TypeError),
                             ("64", TypeError), (64.0, TypeError), (None, TypeError)):
            with self.assertRaises(error) as cm:
                Q.AdvancedIntegerOption_SetValue(heap, value)
            self.assertEqual(str(cm.exception), message, repr(value))
        self.assertEqual(heap.GetValue(), 32)

    def test_string_values(self):
        cc = qorctl.CastAdvString(find("/Net/Tcpip/CongestionControl"))
        self.touch("/Net/Tcpip/CongestionControl")
        cc.SetValue("cubic")
        with self.assertRaises(qorctl.HostCtlException) as cm:
            cc.SetValue("Cubic")
        self.assertEqual(str(cm.exception),
                         'Value "Cubic" for option /Net/Tcpip/CongestionControl contains "C" at '
                         'position 0, which is not a valid character; valid characters are '
                         '"abcdefghijklmnopqrstuvwxyz0123456789-_"')
        with self.assertRaises(qorctl.HostCtlException):
            cc.SetValue("bbr\0x")   # the zero byte reaches the library and is refused
        with self.assertRaises(qorctl.HostCtlException) as cm:
            cc.SetValue("a" * 1025)
        self.assertIn("is too long (1025 characters, at most 1024)", str(cm.exception))
        self.assertEqual(cc.GetValue(), "cubic")
        cc.SetValue("a" * 1024)
        self.assertEqual(cc.GetValue(), "a" * 1024)
        cc.SetValue("")  # empty is made of valid characters only
        self.assertEqual(cc.GetValue(), "")
        with self.assertRaises(ValueError) as cm:
            Q.AdvancedStringOption_SetValue(cc, None)
        self.assertEqual(str(cm.exception), "invalid null reference in method "
                         "'AdvancedStringOption_SetValue', argument 2 of type "
                         "'std::string const &'")


class ImplementationObjects(OptionTestCase):
    def test_integer_impl_accepted_by_every_base(self):
        obj = qorctl.AdvancedIntegerOptionImpl(["Net"], "TcpipHeapSize")
        self.assertTrue(obj.thisown)
        self.touch("/Net/TcpipHeapSize")
        # AdvancedIntegerOption
        self.assertEqual(Q.AdvancedIntegerOption_GetType(obj), INT_TYPE)
        self.assertEqual(Q.AdvancedIntegerOption_GetDefaultValue(obj), 32)
        self.assertEqual(Q.AdvancedIntegerOption_GetMinimum(obj), 0)
        self.assertEqual(Q.AdvancedIntegerOption_GetMaximum(obj), 1024)
        Q.AdvancedIntegerOption_SetValue(obj, 77)
        self.assertEqual(Q.AdvancedIntegerOption_GetValue(obj), 77)
        # AdvancedOptionImpl
        self.assertEqual(Q.AdvancedOptionImpl_GetOptionName(obj), "TcpipHeapSize")
        self.assertEqual(Q.AdvancedOptionImpl_GetOptionPath(obj), "/Net/TcpipHeapSize")
        self.assertEqual(Q.AdvancedOptionImpl_GetDescription(obj),
                         "Initial size of the TCP/IP stack heap in MiB.")
        self.assertIs(Q.AdvancedOptionImpl_IsHidden(obj), False)
        self.assertEqual(Q.AdvancedOptionImpl_GetName(obj), "/Net/TcpipHeapSize")
        self.assertIsNone(Q.AdvancedOptionImpl_Refresh(obj))
        # AdvancedOption
        self.assertEqual(Q.AdvancedOption_GetOptionName(obj), "TcpipHeapSize")
        self.assertEqual(Q.AdvancedOption_GetOptionPath(obj), "/Net/TcpipHeapSize")
        self.assertEqual(Q.AdvancedOption_GetType(obj), INT_TYPE)
        self.assertTrue(Q.AdvancedOption_GetDescription(obj))
        # QorCtlObject and HostCtlObject
        self.assertEqual(Q.QorCtlObject_GetName(obj), "/Net/TcpipHeapSize")
        self.assertIs(Q.QorCtlObject_IsConfigDirty(obj), True)
        self.assertEqual(Q.QorCtlObject_GetChildren(obj), ())
        self.assertIsNone(Q.QorCtlObject_Refresh(obj))
        self.assertEqual(Q.HostCtlObject_GetName(obj), "/Net/TcpipHeapSize")
        self.assertEqual(Q.HostCtlObject_GetChildren(obj), ())
        self.assertIsNone(Q.HostCtlObject_Refresh(obj))
        # Every view changed the one option of the host.
        self.assertEqual(qorctl.CastAdvInt(find("/Net/TcpipHeapSize")).GetValue(), 77)
        Q.AdvancedOptionImpl_SetToDefault(obj)
        self.assertEqual(obj.GetValue(), 32)
        Q.AdvancedIntegerOption_SetValue(obj, 78)
        Q.AdvancedOption_SetToDefault(obj)
        self.assertEqual(obj.GetValue(), 32)

    def test_string_impl_accepted_by_every_base(self):
        obj = qorctl.AdvancedStringOptionImpl(["Net", "Tcpip"], "CongestionControl")
        self.touch("/Net/Tcpip/CongestionControl")
        self.assertEqual(Q.AdvancedStringOption_GetType(obj), STRING_TYPE)
        self.assertEqual(Q.AdvancedStringOption_GetDefaultValue(obj), "newreno")
        Q.AdvancedStringOption_SetValue(obj, "vegas")
        self.assertEqual(Q.AdvancedStringOptionImpl_GetValue(obj), "vegas")
        self.assertEqual(Q.AdvancedOptionImpl_GetOptionPath(obj), "/Net/Tcpip/CongestionControl")
        self.assertEqual(Q.AdvancedOption_GetType(obj), STRING_TYPE)
        self.assertEqual(Q.QorCtlObject_GetName(obj), "/Net/Tcpip/CongestionControl")
        self.assertEqual(Q.HostCtlObject_GetName(obj), "/Net/Tcpip/CongestionControl")
        Q.AdvancedOption_SetToDefault(obj)
        self.assertEqual(obj.GetValue(), "newreno")

    def test_branch_impl_accepted_by_every_base(self):
        mem = qorctl.AdvancedOptionBranchImpl([], "Mem")
        self.assertTrue(mem.thisown)
        self.assertEqual(Q.AdvancedOptionBranch_GetBranchName(mem), "Mem")
        self.assertEqual([b.GetName() for b in Q.AdvancedOptionBranch_GetBranches(mem)],
                         ["/Mem/Numa"])
        self.assertEqual(addr(Q.AdvancedOptionBranch_GetOptionByName(mem, "MinFreePct")),
                         addr(find("/Mem/MinFreePct")))
        self.assertEqual(Q.QorCtlObject_GetName(mem), "/Mem")
        # Children: sub-branches first, then every option, hidden ones too.
        children = [c.GetName() for c in Q.HostCtlObject_GetChildren(mem)]
        self.assertEqual(children[0], "/Mem/Numa")
        self.assertIn("/Mem/ScrubPattern", children)
        self.assertEqual(len(children), 1 + len(mem.GetOptions(True)))
        root = qorctl.AdvancedOptionBranchImpl()
        self.assertEqual(root.GetName(), "/")
        self.assertEqual([b.GetBranchName() for b in root.GetBranches()], TOP_BRANCHES)

    def test_owned_handles_leave_the_library_objects_alone(self):
        self.touch("/Net/TcpipHeapSize")
        obj = qorctl.AdvancedIntegerOptionImpl(["Net"], "TcpipHeapSize")
        copy = qorctl.AdvancedIntegerOptionImpl(obj)
        self.assertTrue(copy.thisown)
        copy.SetValue(300)
        del obj
        Q.delete_AdvancedIntegerOptionImpl(copy)
        self.assertFalse(copy.thisown)
        library = qorctl.CastAdvInt(find("/Net/TcpipHeapSize"))
        self.assertEqual(library.GetValue(), 300)
        branch = qorctl.AdvancedOptionBranchImpl(qorctl.AdvancedOptionBranchImpl(["Net"], "Tcpip"))
        self.assertEqual(branch.GetName(), "/Net/Tcpip")
        del branch
        self.assertEqual(qorctl.HostFactory.GetHost().GetAdvancedOptions()
                         .GetBranchByName("Net").GetBranchByName("Tcpip").GetName(), "/Net/Tcpip")

    def test_constructor_refusals(self):
        # The two-argument form is the only one of its count, so a path that
        # is not a sequence of strings is refused as its argument 1.
        vector = "'std::vector< std::string,std::allocator< std::string > > const &'"
        for path in ([1], 5, None):
            with self.assertRaises((TypeError, ValueError)) as cm:
                qorctl.AdvancedIntegerOptionImpl(path, "TcpipHeapSize")
            self.assertIn("in method 'new_AdvancedIntegerOptionImpl', argument 1 of type " + vector,
                          str(cm.exception))
        # Constructors declare no library exception; the library's refusal
        # still arrives with its text.
        with self.assertRaises(RuntimeError) as cm:
            qorctl.AdvancedIntegerOptionImpl(["Net", "Tcpip"], "CongestionControl")
        self.assertEqual(str(cm.exception), "Option /Net/Tcpip/CongestionControl is a string "
                         "option, not an integer option")
        with self.assertRaises(RuntimeError) as cm:
            qorctl.AdvancedOptionBranchImpl(["Net"], "Nope")
        self.assertEqual(str(cm.exception), "No advanced option branch /Net/Nope on this host")
        with self.assertRaises(ValueError) as cm:
            Q.new_AdvancedIntegerOptionImpl(None)
        self.assertEqual(str(cm.exception), "invalid null reference in method "
                         "'new_AdvancedIntegerOptionImpl', argument 1 of type "
                         "'QorCtl::Adv::AdvancedIntegerOptionImpl const &'")


class OverloadMessages(unittest.TestCase):
    def test_branch_get_options(self):
        branch = qorctl.AdvancedOptionBranchImpl()
        with self.assertRaises(NotImplementedError) as cm:
            Q.AdvancedOptionBranchImpl_GetOptions(branch, True, 1)
        self.assertEqual(str(cm.exception),
                         "Wrong number of arguments for overloaded function "
                         "'AdvancedOptionBranchImpl_GetOptions'.\n"
                         "  Possible C/C++ prototypes are:\n"
                         "    GetOptions(QorCtl::Adv::AdvancedOptionBranchImpl *)\n"
                         "    GetOptions(QorCtl::Adv::AdvancedOptionBranchImpl *,bool)\n")
        with self.assertRaises(NotImplementedError) as cm2:
            Q.AdvancedOptionBranchImpl_GetOptions()
        self.assertEqual(str(cm2.exception), str(cm.exception))

    def test_branch_constructor(self):
        with self.assertRaises(NotImplementedError) as cm:
            Q.new_AdvancedOptionBranchImpl([], "Net", 3)
        self.assertEqual(str(cm.exception),
                         "Wrong number of arguments for overloaded function "
                         "'new_AdvancedOptionBranchImpl'.\n"
                         "  Possible C/C++ prototypes are:\n"
                         "    QorCtl::Adv::AdvancedOptionBranchImpl()\n"
                         "    QorCtl::Adv::AdvancedOptionBranchImpl(std::vector< std::string,"
                         "std::allocator< std::string > > const &,std::string const &)\n"
                         "    QorCtl::Adv::AdvancedOptionBranchImpl("
                         "QorCtl::Adv::AdvancedOptionBranchImpl const &)\n")


if __name__ == "__main__":
    unittest.main()
