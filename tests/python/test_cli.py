"""The qorctl command-line tool, run as users run it: the build tree's
launcher in a child process, against a configuration file in a temporary
directory."""
import json
import os
import shutil
import subprocess
import tempfile
import unittest
import zlib

import qorctl


def build_dir():
    return os.environ.get("QORCTL_BUILD") or os.path.dirname(
        os.path.dirname(os.path.abspath(qorctl.__file__)))


LAUNCHER = os.path.join(build_dir(), "bin", "qorctl")


def expected_counts():
    """(all options, hidden options) of the host, counted through the module."""
    total = hidden = 0
    pending = [qorctl.AdvancedOptionBranchImpl()]
    while pending:
        branch = pending.pop()
        options = branch.GetOptions(True)
        total += len(options)
        hidden += len(options) - len(branch.GetOptions())
        for sub in branch.GetBranches():
            parts = sub.GetName().strip("/").split("/")
            pending.append(qorctl.AdvancedOptionBranchImpl(parts[:-1], parts[-1]))
    return total, hidden


class CliTestCase(unittest.TestCase):
    def setUp(self):
        self.dir = tempfile.mkdtemp(prefix="qorctl-cli-")
        self.config = os.path.join(self.dir, "host.conf")
        # Also the fallback when a command is run without --config, so no
        # test can reach the system's configuration file.
        self.env = dict(os.environ, QORCTL_CONFIG=os.path.join(self.dir, "env.conf"))

    def tearDown(self):
        shutil.rmtree(self.dir, ignore_errors=True)

    def run_cli(self, *args, **kw):
        config = kw.get("config", self.config)
        argv = [LAUNCHER] + (["--config", config] if config is not None else []) + list(args)
        proc = subprocess.Popen(argv, env=self.env, stdout=subprocess.PIPE,
                                stderr=subprocess.PIPE)
        out, err = proc.communicate()
        return proc.returncode, out, err

    def ok(self, *args, **kw):
        status, out, err = self.run_cli(*args, **kw)
        self.assertEqual((status, err), (0, ""), "qorctl %s" % " ".join(args))
        return out

    def json(self, *args, **kw):
        return json.loads(self.ok(*(("--json",) + args), **kw))

    def fails(self, status, *args, **kw):
        """Runs a failing command; returns its one-line message."""
        got, out, err = self.run_cli(*args, **kw)
        self.assertEqual(got, status, "qorctl %s: %s" % (" ".join(args), err))
        self.assertEqual(out, "")
        self.assertNotIn("Traceback", err)
        self.assertTrue(err.startswith("qorctl: error: ") and err.endswith("\n"), err)
        self.assertEqual(err.count("\n"), 1, err)
        return err[len("qorctl: error: "):-1]


class Reading(CliTestCase):
    def test_show(self):
        total, hidden = expected_counts()
        lines = self.ok("show").splitlines()
        self.assertEqual(lines[0], "Host simhost")
        self.assertIn("  Configuration file: %s (not present; defaults)" % self.config, lines)
        self.assertIn("  Advanced options:   %d (%d hidden, 0 changed from default)"
                      % (total, hidden), lines)
        self.assertTrue(any(l.startswith("  Areas:") and "advanced options" in l for l in lines))
        data = self.json("show")
        self.assertEqual(data["host"], "simhost")
        self.assertEqual(data["config_file"], self.config)
        self.assertFalse(data["config_loaded"])
        self.assertEqual(data["options"], {"total": total, "hidden": hidden, "changed": 0})
        self.assertEqual([b["path"] for b in data["branches"]],
                         ["/Net", "/Disk", "/Mem", "/Misc", "/UserVars"])
        self.assertEqual(sum(b["options"] for b in data["branches"]), total)
        self.assertEqual(len(data["areas"]), 12)

    def test_list(self):
        text = self.ok("options", "list")
        self.assertIn("\n/Net/Tcpip\n", text)
        self.assertIn("/Net/Experimental\n  (no options)\n", text)
        self.assertNotIn("ScrubPattern", text)
        heap = [l for l in text.splitlines() if l.split()[:1] == ["TcpipHeapSize"]]
        self.assertEqual(len(heap), 1)
        self.assertEqual(heap[0].split()[1:4], ["int", "32", "default"])
        self.assertIn("range 0..1024", heap[0])
        cc = [l for l in text.splitlines() if "CongestionControl" in l][0]
        self.assertIn('"newreno"', cc)
        self.assertIn("chars a-z0-9-_", cc)
        with_hidden = self.ok("options", "list", "--all", "/Mem")
        self.assertIn("[hidden]", [l for l in with_hidden.splitlines() if "ScrubPattern" in l][0])
        self.assertNotIn("/Net", with_hidden)

    def test_list_json(self):
        total, hidden = expected_counts()
        data = self.json("options", "list")
        self.assertEqual(len(data["options"]), total - hidden)
        self.assertEqual(len(self.json("options", "list", "--all")["options"]), total)
        sub = self.json("options", "list", "Net/Tcpip/")
        self.assertEqual(sub["path"], "/Net/Tcpip")
        self.assertEqual(sub["branches"], ["/Net/Tcpip"])
        self.assertTrue(all(o["path"].startswith("/Net/Tcpip/") for o in sub["options"]))
        one = self.json("options", "list", "/Net/TcpipHeapSize")
        self.assertEqual([o["path"] for o in one["options"]], ["/Net/TcpipHeapSize"])

    def test_get(self):
        text = self.ok("options", "get", "/Net/TcpipHeapSize").splitlines()
        self.assertEqual(text[0], "/Net/TcpipHeapSize")
        fields = dict(l.strip().split(":", 1) for l in text[1:])
        self.assertEqual(fields["Value"].strip(), "32")
        self.assertEqual(fields["Range"].strip(), "0 .. 1024")
        self.assertEqual(self.ok("options", "get", "--value", "Net/Tcpip/CongestionControl"),
                         "newreno\n")
        data = self.json("options", "get", "/Mem/ScrubPattern")
        self.assertEqual((data["type"], data["value"], data["maximum"], data["hidden"]),
                         ("integer", 0xA5A5A5A5, 4294967295, True))
        data = self.json("options", "get", "/UserVars/Locale")
        self.assertEqual((data["type"], data["value"], data["changed"]),
                         ("string", "en_US.UTF-8", False))
        self.assertIn("@", data["valid_characters"])

    def test_options_may_follow_the_command(self):
        self.ok("--config", self.config, "options", "set", "/Mem/MinFreePct", "9", config=None)
        self.assertEqual(self.ok("options", "get", "/Mem/MinFreePct", "--value",
                                 "--config", self.config, config=None), "9\n")
        data = json.loads(self.ok("options", "get", "/Mem/MinFreePct", "--json"))
        self.assertEqual(data["value"], 9)

    def test_help(self):
        out = self.ok("--help", config=None)
        for word in ("show", "options", "--json", "--config", "exit status"):
            self.assertIn(word, out)
        self.assertIn("--all", self.ok("options", "list", "--help", config=None))


class Changing(CliTestCase):
    def test_set_persists_across_invocations(self):
        out = self.ok("options", "set", "/Net/TcpipHeapSize", "64")
        self.assertEqual(out, "/Net/TcpipHeapSize: 32 -> 64\nsaved to %s\n" % self.config)
        self.assertIn("option /Net/TcpipHeapSize int 64\n", open(self.config).read())
        self.assertEqual(self.ok("options", "get", "--value", "/Net/TcpipHeapSize"), "64\n")
        self.ok("options", "set", "Net/Tcpip/CongestionControl", "cubic")
        self.ok("options", "set", "/Mem/ScrubPattern", "0xffffffff")
        data = self.json("show")
        self.assertTrue(data["config_loaded"])
        self.assertEqual(data["options"]["changed"], 3)
        self.assertEqual(self.json("options", "get", "/Mem/ScrubPattern")["value"], 4294967295)
        listing = self.ok("options", "list", "/Net")
        self.assertIn("* TcpipHeapSize", listing)
        self.assertIn("(* changed from the default)", listing)

    def test_set_json(self):
        data = self.json("options", "set", "/UserVars/ContactEmail", "ops@example.org")
        self.assertEqual(data["config_file"], self.config)
        self.assertEqual(data["changes"], [{"path": "/UserVars/ContactEmail", "old": "",
                                            "value": "ops@example.org", "changed": True}])

    def test_reset(self):
        self.ok("options", "set", "/Net/TcpipHeapSize", "64")
        self.ok("options", "set", "/Net/Tcpip/CongestionControl", "cubic")
        self.ok("options", "set", "/Mem/MinFreePct", "9")
        self.assertEqual(self.ok("options", "reset", "/Net/TcpipHeapSize"),
                         "/Net/TcpipHeapSize: 64 -> 32\nsaved to %s\n" % self.config)
        self.assertEqual(self.ok("options", "get", "--value", "/Net/TcpipHeapSize"), "32\n")
        # A branch resets everything below it, and nothing else.
        data = self.json("options", "reset", "/Net")
        self.assertEqual([c["path"] for c in data["changes"] if c["changed"]],
                         ["/Net/Tcpip/CongestionControl"])
        self.assertEqual(self.ok("options", "get", "--value", "/Mem/MinFreePct"), "9\n")
        saved = open(self.config).read()
        self.assertNotIn("/Net/", saved)
        self.assertIn("option /Mem/MinFreePct int 9\n", saved)

    def test_environment_names_the_file_without_config(self):
        self.ok("options", "set", "/Mem/MinFreePct", "12", config=None)
        self.assertIn("option /Mem/MinFreePct int 12\n",
                      open(self.env["QORCTL_CONFIG"]).read())
        self.assertFalse(os.path.exists(self.config))


class Errors(CliTestCase):
    def test_unknown_paths(self):
        self.assertEqual(self.fails(3, "options", "get", "/Net/Nope"),
                         "no option or branch /Net/Nope on this host")
        self.assertEqual(self.fails(3, "options", "list", "/Nope/Deeper"),
                         "no option or branch /Nope on this host")
        self.assertIn("is a branch, not an option", self.fails(3, "options", "get", "/Net"))
        self.fails(3, "options", "set", "/Net/Nope", "1")
        self.fails(3, "options", "reset", "/Nope")
        self.assertFalse(os.path.exists(self.config))

    def test_refused_values_change_nothing(self):
        self.ok("options", "set", "/Net/TcpipHeapSize", "64")
        before = open(self.config).read()
        self.assertEqual(self.fails(4, "options", "set", "/Net/TcpipHeapSize", "5000"),
                         "Value 5000 for option /Net/TcpipHeapSize is out of range [0, 1024]")
        self.assertIn("is not a valid character",
                      self.fails(4, "options", "set", "/Net/Tcpip/CongestionControl", "New Reno"))
        self.assertEqual(open(self.config).read(), before)
        self.assertEqual(self.ok("options", "get", "--value", "/Net/TcpipHeapSize"), "64\n")

    def test_bad_integer_text(self):
        for text in ("abc", "-1", "1.5", "", "0x", "4294967296"):
            message = self.fails(2, "options", "set", "/Net/TcpipHeapSize", text)
            self.assertTrue(message.startswith("/Net/TcpipHeapSize is an integer option; "),
                            message)
        self.assertFalse(os.path.exists(self.config))

    def test_damaged_configuration_file(self):
        body = ("QORCTL-HOST-CONFIG 1\nhost simhost\noption /Net/TcpipHeapSize int 64\n")
        good = body + "checksum crc32 %08x\n" % (zlib.crc32(body) & 0xFFFFFFFF)
        damaged = good.replace("int 64", "int 65")
        with open(self.config, "w") as f:
            f.write(damaged)
        for args in (("show",), ("options", "list"), ("options", "set", "/Mem/MinFreePct", "1")):
            message = self.fails(5, *args)
            self.assertTrue(message.startswith("Configuration file %s is damaged" % self.config),
                            message)
        self.assertEqual(open(self.config).read(), damaged)  # never overwritten
        with open(self.config, "w") as f:
            f.write(good)
        self.assertEqual(self.ok("options", "get", "--value", "/Net/TcpipHeapSize"), "64\n")

    def test_unwritable_configuration(self):
        # The file's directory would have to be below a plain file.
        plain = os.path.join(self.dir, "plain")
        open(plain, "w").close()
        message = self.fails(5, "options", "set", "/Mem/MinFreePct", "1",
                             config=os.path.join(plain, "host.conf"))
        self.assertTrue(message.startswith("Configuration file %s/host.conf cannot be written: "
                                           % plain), message)
        # A directory in the file's place cannot be loaded.
        message = self.fails(5, "show", config=self.dir)
        self.assertIn("cannot be read", message)

    def test_usage_errors(self):
        self.fails(2, config=None)
        self.fails(2, "options")
        self.fails(2, "options", "frob")
        self.fails(2, "options", "set", "/Net/TcpipHeapSize")
        self.fails(2, "show", "--bogus")
        self.fails(2, "show", config="")


if __name__ == "__main__":
    unittest.main()
