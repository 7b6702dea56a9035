"""The host root: the factory's host, the area roots, ownership, and the
implementation object seen through every base."""
import gc
import os
import shutil
import subprocess
import sys
import tempfile
import unittest

import _qorctl as Q
import qorctl

AREA_GETTERS = ["GetHardwareInfo", "GetResourceInfo", "GetStorageInfo", "GetNetworkInfo",
                "GetAdvancedOptions", "GetQorAccessInfo", "GetSecurityInfo", "GetSystemInfo",
                "GetDeviceInfo", "GetMelvarInfo", "GetOrlumeInfo", "GetGraphicsInfo"]

_tmpdir = None


def setUpModule():
    global _tmpdir
    _tmpdir = tempfile.mkdtemp(prefix="qorctl-host-")
    qorctl.HostImpl().SetConfigFile(os.path.join(_tmpdir, "host.conf"))


def tearDownModule():
    shutil.rmtree(_tmpdir, ignore_errors=True)


def addr(obj):
    return int(getattr(obj, "this", obj))


class FactoryHost(unittest.TestCase):
    def test_host_is_borrowed_and_survives_its_wrapper(self):
        host = qorctl.HostFactory.GetHost()
        self.assertIsInstance(host, qorctl.Host)
        self.assertFalse(host.thisown)
        where = addr(host)
        del host
        gc.collect()
        again = Q.HostFactory_GetHost()
        self.assertEqual(addr(again), where)
        self.assertEqual(again.GetName(), "simhost")
        self.assertEqual(again.GetAdvancedOptions().GetName(), "/")

    def test_area_roots(self):
        host = qorctl.HostFactory.GetHost()
        roots = [getattr(Q, "Host_" + g)(host) for g in AREA_GETTERS]
        for getter, root in zip(AREA_GETTERS, roots):
            self.assertIsNotNone(root, getter)
            self.assertFalse(addr(root) == 0, getter)
        # Each getter answers the same library object every time.
        self.assertEqual([addr(getattr(host, g)()) for g in AREA_GETTERS],
                         [addr(r) for r in roots])
        # GetChildren lists the same roots, in the order of the getters.
        children = host.GetChildren()
        self.assertEqual([c.GetName() for c in children],
                         ["hardware", "resources", "storage", "network", "/", "access",
                          "security", "system", "devices", "melvar", "orlume", "graphics"])
        self.assertTrue(all(not c.thisown for c in children))
        self.assertIsInstance(roots[4], qorctl.AdvancedOptionBranch)
        self.assertIsNone(host.Refresh())

    def test_factory_object(self):
        factory = qorctl.HostFactory()
        self.assertTrue(factory.thisown)
        self.assertEqual(addr(factory.GetHost()), addr(qorctl.HostFactory.GetHost()))
        Q.delete_HostFactory(factory)
        self.assertFalse(factory.thisown)


class Implementation(unittest.TestCase):
    def test_host_impl_accepted_by_every_base(self):
        impl = qorctl.HostImpl()
        self.assertTrue(impl.thisown)
        host = qorctl.HostFactory.GetHost()
        # Host_* on the implementation object: the same library-owned roots
        # as the factory's host, which a wrongly adjusted pointer would not give.
        for getter in AREA_GETTERS:
            self.assertEqual(addr(getattr(Q, "Host_" + getter)(impl)),
                             addr(getattr(Q, "Host_" + getter)(host)), getter)
            self.assertEqual(addr(getattr(Q, "HostImpl_" + getter)(impl)),
                             addr(getattr(Q, "Host_" + getter)(host)), getter)
        self.assertEqual(Q.HostCtlObject_GetName(impl), "simhost")
        self.assertEqual(Q.QorCtlObject_GetName(impl), "simhost")
        self.assertEqual(Q.HostImpl_GetName(impl), "simhost")
        names = [c.GetName() for c in host.GetChildren()]
        self.assertEqual([c.GetName() for c in Q.HostCtlObject_GetChildren(impl)], names)
        self.assertEqual([c.GetName() for c in Q.QorCtlObject_GetChildren(impl)], names)
        self.assertIsNone(Q.HostCtlObject_Refresh(impl))
        self.assertIsNone(Q.QorCtlObject_Refresh(impl))
        self.assertIsNone(Q.HostImpl_Refresh(impl))
        self.assertIs(Q.QorCtlObject_IsConfigDirty(impl), True)
        self.assertIsNone(Q.QorCtlObject_MarkConfigDirty(impl))
        self.assertIs(Q.QorCtlObject_IsConfigDirty(impl), True)

    def test_copies_and_deletion(self):
        impl = qorctl.HostImpl()
        copy = qorctl.HostImpl(impl)
        self.assertTrue(copy.thisown)
        self.assertEqual(copy.GetName(), "simhost")
        Q.delete_HostImpl(impl)
        self.assertFalse(impl.thisown)
        del copy
        gc.collect()
        # Deleting handles never touches the library's host.
        self.assertEqual(qorctl.HostFactory.GetHost().GetName(), "simhost")
        with self.assertRaises(ValueError) as cm:
            Q.new_HostImpl(None)
        self.assertEqual(str(cm.exception), "invalid null reference in method 'new_HostImpl', "
                         "argument 1 of type 'QorCtl::HostImpl const &'")

    def test_constructor_overload_message(self):
        message = ("Wrong number of arguments for overloaded function 'new_HostImpl'.\n"
                   "  Possible C/C++ prototypes are:\n"
                   "    QorCtl::HostImpl()\n"
                   "    QorCtl::HostImpl(QorCtl::HostImpl const &)\n")
        with self.assertRaises(NotImplementedError) as cm:
            Q.new_HostImpl(1, 2)
        self.assertEqual(str(cm.exception), message)
        # The one-argument form is the only one of its count: it is called
        # and its conversion refuses the argument.
        with self.assertRaises(TypeError) as cm:
            qorctl.HostImpl("not a host")
        self.assertEqual(str(cm.exception), "in method 'new_HostImpl', argument 1 of type 'QorCtl::HostImpl const &'")

    def test_print_summary(self):
        # A null printer prints to standard output; run it where that can be read.
        config = os.path.join(_tmpdir, "print.conf")
        code = ("import qorctl\n"
                "qorctl.CastAdvInt(qorctl.AdvancedOptionImpl.FindOption('/Net/UseHwTso'))"
                ".SetValue(0)\n"
                "qorctl.HostImpl().Print(None)\n")
        env = dict(os.environ, QORCTL_CONFIG=config)
        child = subprocess.Popen([sys.executable, "-c", code], env=env,
                                 stdout=subprocess.PIPE, stderr=subprocess.PIPE)
        out, err = child.communicate()
        self.assertEqual(child.returncode, 0, err)
        lines = [l.strip() for l in out.splitlines()]
        self.assertEqual(lines[0], "Host simhost:")
        self.assertIn("Configuration file: " + config, lines)
        self.assertTrue(any(l.startswith("Advanced options: ") and l.endswith(" (1 changed)")
                            for l in lines), out)



class DeletingBorrowedObjects(unittest.TestCase):
    def test_delete_refuses_objects_python_does_not_own(self):
        host = qorctl.HostFactory.GetHost()
        with self.assertRaises(ValueError) as cm:
            Q.delete_Host(host)
        self.assertEqual(str(cm.exception), "in method 'delete_Host', argument 1 of type 'HostCtl::Host *'")
        with self.assertRaises(ValueError):
            Q.delete_HostCtlObject(host.GetAdvancedOptions())
        # The library's objects are untouched.
        self.assertEqual(qorctl.HostFactory.GetHost().GetName(), host.GetName())
        self.assertEqual(host.GetAdvancedOptions().GetBranchName(), "")

    def test_owned_objects_are_still_deleted_once(self):
        impl = qorctl.HostImpl()
        Q.delete_HostImpl(impl)
        self.assertFalse(impl.thisown)
        self.assertRaises(ValueError, Q.delete_HostImpl, impl)
        self.assertRaises(ValueError, impl.GetName)

if __name__ == "__main__":
    unittest.main()
