"""Vector and set classes and their iterators, seen from Python: one
representative per element kind."""
import unittest

import _qorctl as Q
import qorctl


VECTOR_METHODS = ("iterator", "__nonzero__", "__len__", "pop", "__getslice__", "__setslice__",
                  "__delslice__", "__delitem__", "__getitem__", "__setitem__", "append", "empty",
                  "size", "clear", "swap", "get_allocator", "begin", "end", "rbegin", "rend",
                  "pop_back", "erase", "push_back", "front", "back", "assign", "resize", "insert",
                  "reserve", "capacity")
SET_METHODS = ("iterator", "__nonzero__", "__len__", "append", "__contains__", "__getitem__", "empty",
               "size", "clear", "swap", "count", "begin", "end", "rbegin", "rend", "erase", "find",
               "lower_bound", "upper_bound", "equal_range", "insert")
VECTORS = ("StringVector Uint32Vector Uint64Vector HVReplayVector BootDeviceVector SimplePciDeviceVector "
           "HostCpuStatsVector ResourceGroupSpecVector Ipv4AddressVector Ipv6NetworkVector "
           "PortAddressVector PortRangeVector LunHandleVector SatpClaimRuleVector AdvancedOptionVector "
           "AdvancedOptionBranchVector CpuVector NumaNodeVector PciDeviceVector HostCtlObjectVector "
           "ModuleVector VirtualMachineVector ResourceGroupVector ResourceGroupImplVector PnicVector "
           "FcoePnicVector MacAddressVector PortVector PortImplVector PortGroupVector VirtualSwitchVector "
           "DVSwitchVector DVPortVlanRangeVector VnicVector QorNicVector DeviceUidVector DurableNameVector "
           "LunVector DiskLunVector ScsiPathVector PartitionVector DiskLunPartitionVector "
           "DiagnosticPartitionVector StaticTargetVector TargetAddressVector ScsiInterfaceVector "
           "BlockScsiInterfaceVector FibreChannelInterfaceVector IdeScsiInterfaceVector "
           "ParallelScsiInterfaceVector iScsiInterfaceVector FileSystemVector VmFileSystemVector "
           "NetworkFileSystemVector VFATFileSystemVector UFSFileSystemVector UnresolvedVolumesVector "
           "UnresolvedExtentsVector PathSelectionPolicyVector StorageArrayTypeVector "
           "SatpClaimRulePtrVector").split()


def u64(values):
    return qorctl.Uint64Vector(list(values))


class Surface(unittest.TestCase):
    def test_every_container_class_has_all_its_functions(self):
        self.assertEqual(len(VECTORS), 61)
        for name in VECTORS:
            cls = getattr(qorctl, name)
            for m in VECTOR_METHODS:
                self.assertTrue(hasattr(Q, "%s_%s" % (name, m)), "%s_%s" % (name, m))
                self.assertTrue(hasattr(cls, m), "%s.%s" % (name, m))
            for f in ("new_", "delete_"):
                self.assertTrue(hasattr(Q, f + name))
            self.assertTrue(hasattr(Q, name + "_swigregister"))
        for m in SET_METHODS:
            self.assertTrue(hasattr(Q, "StringSet_" + m), m)
        self.assertEqual(len([n for n in dir(Q) if n.startswith("StringSet_") or n.endswith("_StringSet")]), 24)


class IndexAndSlices(unittest.TestCase):
    def test_index_rule(self):
        v = u64([1, 2, 3])
        self.assertEqual((v[0], v[-1], v[-3]), (1, 3, 1))
        for i in (3, -4):
            with self.assertRaises(IndexError) as cm:
                v[i]
            self.assertEqual(str(cm.exception), "index out of range")
        v[-1] = 9
        del v[0]
        self.assertEqual(list(v), [2, 9])

    def test_getslice(self):
        self.assertRaises(IndexError, u64([]).__getslice__, 0, 0)
        v = u64([1, 2, 3])
        self.assertEqual(list(v.__getslice__(1, 100)), [2, 3])
        self.assertEqual(list(v.__getslice__(2, 1)), [])
        self.assertEqual(list(v.__getslice__(-2, -1)), [2])
        self.assertRaises(IndexError, v.__getslice__, 0, -4)
        self.assertTrue(v.__getslice__(0, 1).thisown)

    def test_setslice(self):
        v = u64([1, 2, 3])
        v.__setslice__(3, 3, [9])
        self.assertEqual(list(v), [1, 2, 3, 9])
        v = u64([1, 2, 3])
        v.__setslice__(0, 1, [7, 8])
        self.assertEqual(list(v), [7, 8, 2, 3])
        v = u64([1, 2, 3])
        v.__setslice__(0, 3, [5])
        self.assertEqual(list(v), [5])
        v = u64([1, 2, 3])
        v.__setslice__(2, 0, [4])
        self.assertEqual(list(v), [1, 2, 4, 3])
        self.assertRaises(IndexError, u64([1]).__setslice__, 2, 2, [1])

    def test_delslice(self):
        v = u64([1, 2, 3])
        v.__delslice__(-2, 100)
        self.assertEqual(list(v), [1])
        v.__delslice__(1, 0)
        self.assertEqual(list(v), [1])

    def test_empty_container_edges(self):
        v = u64([])
        with self.assertRaises(IndexError) as cm:
            v.pop()
        self.assertEqual(str(cm.exception), "pop from empty container")
        for m in (v.front, v.back, v.pop_back):
            self.assertRaises(IndexError, m)
        self.assertFalse(v)
        self.assertEqual(len(v), 0)


class ElementKinds(unittest.TestCase):
    def test_numbers(self):
        v = qorctl.Uint64Vector(2, 7)
        self.assertEqual(list(v), [7, 7])
        v.append(2 ** 64 - 1)
        self.assertEqual(v.back(), 2 ** 64 - 1)
        self.assertRaises(OverflowError, v.append, -1)
        self.assertRaises(TypeError, qorctl.Uint64Vector, [1, -1])

    def test_wrapped_scalars(self):
        v = qorctl.Uint32Vector(3)
        self.assertEqual([v[i] for i in range(3)], [0, 0, 0])
        v.append(4294967295L)
        self.assertEqual(v.pop(), 4294967295L)
        with self.assertRaises(TypeError) as cm:
            qorctl.Uint32Vector([3])
        self.assertEqual(str(cm.exception),
                         "in method 'new_Uint32Vector', argument 1 of type 'std::vector< uint32 > const &'")
        # Whole-sequence conversion takes wrapped uint32 pointers, which the
        # vector's own iterator hands out.
        items = list(v)
        self.assertEqual(type(items[0]).__name__, "PySwigObject")
        copy = qorctl.Uint32Vector(items)
        self.assertEqual([copy[i] for i in range(len(copy))], [0, 0, 0])

    def test_strings(self):
        v = qorctl.StringVector("abc")
        self.assertEqual(list(v), ["a", "b", "c"])
        v[1] = "x\0y"
        self.assertEqual(v[1], "x\0y")
        # Elements are value_type const &: None is a null reference.
        self.assertRaises(ValueError, v.append, None)
        self.assertRaises(TypeError, v.append, 5)

    def test_class_values_pop_is_a_copy_getitem_a_view(self):
        v = qorctl.Ipv4AddressVector([qorctl.Ipv4Address("10.0.0.1"), qorctl.Ipv4Address("10.0.0.2")])
        view = v[0]
        self.assertFalse(view.thisown)
        v[0] = qorctl.Ipv4Address("10.9.9.9")
        self.assertEqual(view.GetStringAddress(), "10.9.9.9")
        popped = v.pop()
        self.assertTrue(popped.thisown)
        self.assertEqual(popped.GetStringAddress(), "10.0.0.2")
        v.clear()
        self.assertEqual(popped.GetStringAddress(), "10.0.0.2")
        self.assertRaises(ValueError, v.append, None)
        self.assertRaises(TypeError, v.append, qorctl.MacAddress())

    def test_class_pointers(self):
        branch = qorctl.HostFactory.GetHost().GetAdvancedOptions().GetBranchByName("Net")
        options = branch.GetOptions()
        v = qorctl.AdvancedOptionVector(options)
        self.assertEqual(len(v), len(options))
        self.assertEqual(v[0].GetOptionName(), options[0].GetOptionName())
        self.assertFalse(v[0].thisown)
        v.append(None)
        self.assertIsNone(v[-1])
        self.assertRaises(TypeError, v.append, branch)


class Sets(unittest.TestCase):
    def test_set_semantics(self):
        s = qorctl.StringSet(["b", "a", "a"])
        self.assertEqual(list(s), ["a", "b"])
        self.assertEqual(len(s), 2)
        self.assertTrue("a" in s)
        self.assertEqual((s.count("a"), s.count("z")), (1, 0))
        it, inserted = s.insert("c")
        self.assertTrue(inserted)
        self.assertEqual(it.value(), "c")
        self.assertFalse(s.insert("c")[1])
        self.assertEqual(s[-1], "c")
        self.assertEqual(s.erase("a"), 1)
        self.assertEqual(s.erase("a"), 0)
        self.assertEqual(list(s), ["b", "c"])
        self.assertRaises(ValueError, s.count, None)
        self.assertRaises(TypeError, s.__contains__, None)

    def test_bounds(self):
        s = qorctl.StringSet(["a", "c"])
        self.assertEqual(s.lower_bound("b").value(), "c")
        lo, hi = s.equal_range("a")
        self.assertEqual((lo.value(), hi.value()), ("a", "c"))


class Iterators(unittest.TestCase):
    def test_bounded_iterator(self):
        it = u64([1, 2]).iterator()
        self.assertEqual(it.next(), 1)
        self.assertEqual(it.next(), 2)
        self.assertRaises(StopIteration, it.next)
        self.assertRaises(StopIteration, it.value)
        self.assertRaises(StopIteration, u64([1]).iterator().previous)
        it = u64([1, 2, 3]).iterator()
        self.assertRaises(StopIteration, it.incr, 5)
        self.assertRaises(StopIteration, it.value)

    def test_iterator_keeps_its_container(self):
        it = u64([4, 5]).iterator()
        self.assertEqual(list(it), [4, 5])

    def test_unbounded_iterators_and_arithmetic(self):
        v = u64([1, 2, 3])
        b = v.begin()
        self.assertEqual(b.value(), 1)
        c = b + 2
        self.assertEqual(c.value(), 3)
        self.assertEqual(c - b, 2)
        self.assertTrue(b == v.begin())
        self.assertTrue(b != c)
        self.assertEqual(v.rbegin().value(), 3)

    def test_mixed_iterator_kinds_are_refused(self):
        a = qorctl.Uint32Vector(1).begin()
        b = qorctl.StringVector(["x"]).begin()
        self.assertRaises(RuntimeError, a.equal, b)

    def test_erase_and_insert_take_own_iterators_only(self):
        v = u64([1, 2, 3])
        it = v.erase(v.begin())
        self.assertEqual(it.value(), 2)
        self.assertEqual(list(v), [2, 3])
        v.insert(v.end(), 9)
        self.assertEqual(list(v), [2, 3, 9])
        other = u64([1])
        self.assertRaises(ValueError, v.erase, other.begin())
        with self.assertRaises(TypeError) as cm:
            v.erase(qorctl.StringVector(["a"]).begin())
        self.assertIn("std::vector< uint64 >::iterator", str(cm.exception))
        self.assertRaises(TypeError, v.insert, None, 1)


class OwnedCopiesWithoutClass(unittest.TestCase):
    def test_scalar_and_exception_copies_are_freed_silently(self):
        import subprocess
        import sys
        code = ("import qorctl\n"
                "items = list(qorctl.Uint32Vector(3))\n"
                "del items\n"
                "try:\n"
                "    qorctl.Uint32Vector(1).begin().equal(qorctl.StringVector(['x']).begin())\n"
                "except RuntimeError:\n"
                "    pass\n"
                "qorctl.Uint64Vector(2).get_allocator()\n"
                "print 'done'\n")
        out = subprocess.check_output([sys.executable, "-c", code])
        self.assertEqual(out, "done\n")


class Temporaries(unittest.TestCase):
    def test_sequence_arguments_leave_no_references_behind(self):
        import sys
        if not hasattr(sys, "gettotalrefcount"):
            items = [1, 2, 3]
            before = sys.getrefcount(items)
            for _ in range(100):
                qorctl.Uint64Vector(items)
            self.assertEqual(sys.getrefcount(items), before)


if __name__ == "__main__":
    unittest.main()
