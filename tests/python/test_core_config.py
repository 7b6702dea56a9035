"""The host configuration file through the module: save and reload, the
once-per-process load of Init, refused files, and which file is used.

Init loads at most once per process, so everything that depends on it runs
in a child interpreter with QORCTL_CONFIG pointing into a temporary
directory. The tests in this process use SetConfigFile for the same."""
import os
import shutil
import subprocess
import sys
import tempfile
import textwrap
import unittest
import zlib

import qorctl

HEADER = ("QORCTL-HOST-CONFIG 1\n"
          "# Host configuration written by libqorctl. The checksum covers every line above it;\n"
          "# change settings through the library, not by editing this file.\n"
          "host simhost\n")


def with_checksum(body):
    return body + "checksum crc32 %08x\n" % (zlib.crc32(body) & 0xFFFFFFFF)


def option(path):
    opt = qorctl.AdvancedOptionImpl.FindOption(path)
    return qorctl.CastAdvInt(opt) or qorctl.CastAdvString(opt)


def read(path):
    with open(path, "rb") as f:
        return f.read()


def write(path, data):
    with open(path, "wb") as f:
        f.write(data)


class ConfigTestCase(unittest.TestCase):
    TOUCHED = ("/Net/TcpipHeapSize", "/Net/Tcpip/CongestionControl", "/Mem/MinFreePct",
               "/Mem/ScrubPattern")

    def setUp(self):
        self.dir = tempfile.mkdtemp(prefix="qorctl-config-")
        self.path = os.path.join(self.dir, "host.conf")
        self.handle = qorctl.HostImpl()
        self.handle.SetConfigFile(self.path)
        self.host = qorctl.HostFactory.GetHost()

    def tearDown(self):
        for path in self.TOUCHED:
            option(path).SetToDefault()
        shutil.rmtree(self.dir, ignore_errors=True)

    def child(self, code, config=None, expect=0):
        """Runs code in a fresh interpreter; returns its standard output."""
        env = dict(os.environ, QORCTL_CONFIG=config or self.path)
        prelude = ("import qorctl\n"
                   "def option(path):\n"
                   "    o = qorctl.AdvancedOptionImpl.FindOption(path)\n"
                   "    return qorctl.CastAdvInt(o) or qorctl.CastAdvString(o)\n")
        proc = subprocess.Popen([sys.executable, "-c", prelude + textwrap.dedent(code)], env=env,
                                stdout=subprocess.PIPE, stderr=subprocess.PIPE)
        out, err = proc.communicate()
        self.assertEqual(proc.returncode, expect, err)
        return out


class SaveAndLoad(ConfigTestCase):
    def test_change_survives_into_a_new_process(self):
        self.child("""
            qorctl.QorCtlObject.Init()
            option('/Net/TcpipHeapSize').SetValue(100)
            option('/Net/Tcpip/CongestionControl').SetValue('cubic')
            qorctl.HostFactory.GetHost().SaveConfig()
            """)
        # Changed options only, in path order.
        self.assertEqual(read(self.path), with_checksum(
            HEADER + 'option /Net/Tcpip/CongestionControl string "cubic"\n'
                     "option /Net/TcpipHeapSize int 100\n"))
        out = self.child("""
            qorctl.QorCtlObject.Init()
            print option('/Net/TcpipHeapSize').GetValue()
            print option('/Net/Tcpip/CongestionControl').GetValue()
            print option('/Mem/MinFreePct').GetValue()
            """)
        self.assertEqual(out.split(), ["100", "cubic", "6"])

    def test_init_loads_once_and_only_an_existing_file(self):
        out = self.child("""
            qorctl.QorCtlObject.Init()          # no file yet: the defaults
            print option('/Net/TcpipHeapSize').GetValue()
            """)
        self.assertEqual(out.split(), ["32"])
        self.assertFalse(os.path.exists(self.path))
        write(self.path, with_checksum(HEADER + "option /Net/TcpipHeapSize int 200\n"))
        out = self.child("""
            qorctl.QorCtlObject.Init()
            heap = option('/Net/TcpipHeapSize')
            print heap.GetValue()
            heap.SetValue(7)
            qorctl.QorCtlObject.Init()          # a second call loads nothing
            print heap.GetValue()
            """)
        self.assertEqual(out.split(), ["200", "7"])

    def test_set_config_file_overrides_the_environment(self):
        other = os.path.join(self.dir, "other.conf")
        write(self.path, with_checksum(HEADER + "option /Mem/MinFreePct int 11\n"))
        write(other, with_checksum(HEADER + "option /Mem/MinFreePct int 22\n"))
        out = self.child("""
            qorctl.HostImpl().SetConfigFile(%r)
            qorctl.QorCtlObject.Init()
            print option('/Mem/MinFreePct').GetValue()
            qorctl.HostImpl().SetConfigFile('')  # back to QORCTL_CONFIG
            qorctl.HostFactory.GetHost().LoadConfig()
            print option('/Mem/MinFreePct').GetValue()
            """ % other)
        self.assertEqual(out.split(), ["22", "11"])

    def test_load_replaces_the_whole_configuration(self):
        heap, scrub = option("/Net/TcpipHeapSize"), option("/Mem/ScrubPattern")
        heap.SetValue(64)
        scrub.SetValue(4294967295)
        self.host.SaveConfig()
        self.assertIn("option /Mem/ScrubPattern int 4294967295\n", read(self.path))
        heap.SetValue(65)
        option("/Mem/MinFreePct").SetValue(1)   # not in the file: back to its default
        self.handle.LoadConfig()
        self.assertEqual((heap.GetValue(), scrub.GetValue()), (64, 4294967295))
        self.assertEqual(option("/Mem/MinFreePct").GetValue(), 6)

    def test_every_object_saves_the_same_host(self):
        option("/Mem/MinFreePct").SetValue(9)
        option("/Net/Tcpip/CongestionControl").SaveConfig()
        first = read(self.path)
        qorctl.AdvancedOptionBranchImpl().SaveConfig()
        self.assertEqual(read(self.path), first)
        self.assertIn("option /Mem/MinFreePct int 9\n", first)

    def test_escaped_string_values_round_trip(self):
        desc = qorctl.CastAdvString(qorctl.AdvancedOptionImpl.FindOption("/Misc/HostDescription"))
        self.addCleanup(desc.SetToDefault)
        desc.SetValue('rack "7", row 2')
        self.host.SaveConfig()
        self.assertIn('option /Misc/HostDescription string "rack \\"7\\", row 2"\n',
                      read(self.path))
        desc.SetToDefault()
        self.host.LoadConfig()
        self.assertEqual(desc.GetValue(), 'rack "7", row 2')


class RefusedFiles(ConfigTestCase):
    def assert_refused(self, data, why):
        write(self.path, data)
        heap = option("/Net/TcpipHeapSize")
        heap.SetValue(48)
        with self.assertRaises(qorctl.HostCtlException) as cm:
            self.host.LoadConfig()
        self.assertEqual(str(cm.exception), "Configuration file %s %s; nothing was loaded"
                         % (self.path, why))
        self.assertEqual(heap.GetValue(), 48)
        self.assertEqual(read(self.path), data)  # refusing never rewrites the file

    def test_damaged_files_change_nothing(self):
        good = with_checksum(HEADER + "option /Net/TcpipHeapSize int 100\n"
                                      "option /Mem/MinFreePct int 3\n")
        flipped = good.replace("int 100", "int 101")
        crc = good.rsplit(" ", 1)[1].strip()
        self.assert_refused(flipped, "is damaged (checksum %s recorded, %08x computed)"
                            % (crc, zlib.crc32(flipped[:flipped.rindex("checksum")]) & 0xFFFFFFFF))
        self.assert_refused(good[:good.rindex("checksum")],
                            "is truncated or damaged (its checksum line is missing)")
        self.assert_refused("", "is empty")
        self.assert_refused("something else\n", "is not a qorctl host configuration file")
        self.assertEqual(option("/Mem/MinFreePct").GetValue(), 6)

    def test_well_formed_but_invalid_entries(self):
        self.assert_refused(with_checksum(HEADER + "option /Net/TcpipHeapSize int 5000\n"),
                            "line 5: Value 5000 for option /Net/TcpipHeapSize is out of range "
                            "[0, 1024]")
        self.assert_refused(with_checksum(HEADER + "option /Net/Nope int 1\n"),
                            "line 5: no advanced option /Net/Nope on this host")
        self.assert_refused(with_checksum(HEADER + "option /Mem/MinFreePct int 1\n"
                                                   "option /Mem/MinFreePct int 2\n"),
                            "line 6: option /Mem/MinFreePct appears twice")
        self.assertEqual(option("/Mem/MinFreePct").GetValue(), 6)

    def test_init_refuses_a_damaged_file(self):
        data = with_checksum(HEADER + "option /Net/TcpipHeapSize int 100\n").replace("100", "99")
        write(self.path, data)
        out = self.child("""
            try:
                qorctl.QorCtlObject.Init()
            except qorctl.HostCtlException as e:
                print 'refused:', e
            print option('/Net/TcpipHeapSize').GetValue()
            """)
        lines = out.splitlines()
        self.assertTrue(lines[0].startswith("refused: Configuration file %s is damaged"
                                            % self.path), out)
        self.assertEqual(lines[1], "32")
        self.assertEqual(read(self.path), data)


class Saving(ConfigTestCase):
    def test_save_leaves_no_temporary_files(self):
        option("/Net/TcpipHeapSize").SetValue(128)
        self.host.SaveConfig()
        self.host.SaveConfig()
        self.assertEqual(os.listdir(self.dir), ["host.conf"])
        self.assertEqual(oct(os.stat(self.path).st_mode & 0o777), oct(0o644))

    def test_missing_last_directory_is_created(self):
        path = os.path.join(self.dir, "state", "host.conf")
        self.handle.SetConfigFile(path)
        self.host.SaveConfig()
        self.assertTrue(read(path).startswith("QORCTL-HOST-CONFIG 1\n"))

    def test_failed_save_keeps_the_old_file(self):
        self.host.SaveConfig()
        before = read(self.path)
        # A directory where the file should go: the rename fails.
        blocked = os.path.join(self.dir, "blocked")
        os.mkdir(blocked)
        self.handle.SetConfigFile(blocked)
        option("/Net/TcpipHeapSize").SetValue(256)
        with self.assertRaises(qorctl.HostCtlException) as cm:
            self.host.SaveConfig()
        self.assertTrue(str(cm.exception).startswith("Configuration file %s cannot be written: "
                                                     % blocked), str(cm.exception))
        self.assertEqual(sorted(os.listdir(self.dir)), ["blocked", "host.conf"])
        self.assertEqual(os.listdir(blocked), [])
        self.assertEqual(read(self.path), before)
        deeper = os.path.join(self.dir, "no", "such", "host.conf")
        self.handle.SetConfigFile(deeper)
        with self.assertRaises(qorctl.HostCtlException):
            self.host.SaveConfig()
        self.assertFalse(os.path.exists(os.path.join(self.dir, "no")))


if __name__ == "__main__":
    unittest.main()
