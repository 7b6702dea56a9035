"""Every function of the modules against hostile arguments (tests/robust),
and the sweep's own ability to catch and attribute each kind of fault.

QORCTL_SWEEP=full sweeps every function; the default ("quick") sweeps all
of _genfixture, which has every wrapper shape, and a stable subset of
_qorctl sized to stay under a couple of thousand functions.
QORCTL_SWEEP_TIMEOUT sets the seconds without progress that count as a hang.
"""
import ctypes
import math
import os
import sys
import types
import unittest

sys.path.insert(0, os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "robust"))
import hostile  # noqa: E402
import surface  # noqa: E402
import sweep  # noqa: E402

MODULES = ["_qorctl", "_genfixture"]
QUICK_LIMIT = 1500


def quick_sample():
    """Sweep 1 in N of _qorctl's functions, N chosen so about QUICK_LIMIT
    remain; the others are chosen by a hash of their names, so the subset
    is stable for a given surface."""
    import _qorctl
    n = int(math.ceil(len(surface.callables(_qorctl)) / float(QUICK_LIMIT)))
    return (1, n, set(["_qorctl"])) if n > 1 else None


class SweepModules(unittest.TestCase):
    def test_no_function_crashes_hangs_or_leaves_an_error_behind(self):
        mode = os.environ.get("QORCTL_SWEEP", "quick")
        sample = None if mode == "full" else quick_sample()
        timeout = float(os.environ.get("QORCTL_SWEEP_TIMEOUT", "60"))
        mods = sweep.import_modules(MODULES)
        selected = sweep.select_functions(mods, sample)
        r = sweep.sweep(MODULES, sample=sample, timeout=timeout, out=sys.stdout)
        sys.stdout.flush()
        self.assertEqual([str(f) for f in r.unexpected], [])
        self.assertEqual(r.stale, [])
        # Every selected function was swept to its end, with its full battery.
        self.assertEqual(r.functions, len(selected))
        self.assertGreater(r.calls, 40 * r.functions)
        self.assertGreater(r.outcomes.get("ok", 0), r.functions / 2)


# ---- The sweep against a stand-in module that misbehaves on purpose ---------

def _argcheck(name, typename, accept):
    def check(x):
        if not accept(x):
            raise TypeError("in method '%s', argument 1 of type '%s'" % (name, typename))
    return check


def _is_u64(x):
    return isinstance(x, (int, long)) and not isinstance(x, bool) and 0 <= x < 2 ** 64


def _make_module():
    m = types.ModuleType("_standin")
    u64 = _argcheck("Crashes", "uint64", _is_u64)

    def Crashes(x):
        u64(x)
        if x == 2 ** 32:
            ctypes.string_at(0)  # reads address 0: the process dies
        return x

    def Hangs(seq):
        _argcheck("Hangs", "std::vector< std::string > const &",
                  lambda s: hasattr(s, "__len__") and not isinstance(s, (basestring, dict)))(seq)
        if isinstance(seq, hostile.Growing):
            while True:
                len(seq)
        return len(seq)

    def ReturnsNullWithoutError(x):
        _argcheck("ReturnsNullWithoutError", "int32", _is_u64)(x)
        if x == 0:
            raise SystemError("error return without exception set")
        return x

    def Behaves(x):
        u64(x)
        return x

    kept = []

    def LeaksReferences(x):
        _argcheck("LeaksReferences", "uint64", _is_u64)(x)
        if x == 2 ** 31 - 1:
            kept.append(object())
        return x

    for f in (Crashes, Hangs, ReturnsNullWithoutError, Behaves, LeaksReferences):
        setattr(m, f.__name__, f)
    return m


class SweepFindsFaults(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        m = _make_module()
        pool = surface.build_pool([m])
        cls.results = sweep.Results()
        runner = sweep.Runner([m], pool, sweep.Guard(), 2, cls.results)
        runner.run([(m, n) for n in surface.callables(m)])

    def faults(self, function):
        return [(f.kind, f.label) for f in self.results.faults if f.function == function]

    def test_crash_is_attributed_and_the_sweep_goes_on(self):
        self.assertEqual(self.faults("Crashes"), [("crash", "arg1=int:2**32"), ("crash", "arg1=long:2**32")])
        # The calls after the crashing one still ran, the valid one included.
        self.assertEqual(self.results.functions, 5)
        self.assertGreaterEqual(self.results.outcomes.get("ok", 0), 4)

    def test_hang_is_cut_short_and_attributed(self):
        self.assertEqual(self.faults("Hangs"), [("hang", "arg1=seq:growing"), ("hang", "arg1=seq:growing-int")])

    def test_error_return_without_exception_is_a_fault(self):
        self.assertEqual([k for k, _ in self.faults("ReturnsNullWithoutError")],
                         ["system-error", "system-error"])
        self.assertEqual(self.faults("Behaves"), [])

    @unittest.skipUnless(hasattr(sys, "gettotalrefcount"), "reference totals need the debug interpreter")
    def test_reference_leak_is_attributed(self):
        self.assertEqual(self.faults("LeaksReferences"), [("ref-leak", "arg1=int:2**31-1")])

    def test_signature_is_learned_from_the_messages(self):
        m = _make_module()
        sig, = surface.Inferrer(surface.Pool()).infer("Behaves", m.Behaves)
        self.assertEqual((sig.types, sig.valid, sig.complete), (["uint64"], [1], True))


@unittest.skipUnless(hasattr(sys, "gettotalrefcount"), "reference totals need the debug interpreter")
class RefcheckFindsLeaks(unittest.TestCase):
    def test_growing_test_is_named_and_flat_one_is_not(self):
        import refcheck
        kept = []

        class Cases(unittest.TestCase):
            def test_leaks(self):
                kept.append([object()])

            def test_keeps_nothing(self):
                self.made = [object() for _ in range(10)]
        m = types.ModuleType("_refcheck_standin")
        m.Cases = Cases
        sys.modules[m.__name__] = m
        try:
            bad = refcheck.check(m.__name__, 2, 4, out=open(os.devnull, "w"))
        finally:
            del sys.modules[m.__name__]
        self.assertEqual([tid.split(".")[-1] for tid, _ in bad], ["test_leaks"])
        self.assertIn("leaked references per run: [2, 2, 2, 2]", bad[0][1])


class Guard(unittest.TestCase):
    def test_command_runners_only_get_the_harmless_command(self):
        g = sweep.Guard()
        pool = surface.Pool()
        for name in ("QorCtl_Exec", "QorCtl_Daemon"):
            self.assertEqual(g.valid_value(name, 1), g.HARMLESS)
            self.assertTrue(g.allows(name, [g.HARMLESS, True], pool))
            self.assertTrue(g.allows(name, [None, True], pool))
            self.assertTrue(g.allows(name, [2 ** 64], pool))
            for cmd in ("x", "", "rm -rf x", u"reboot", hostile.StrSub("x"), bytearray("x")):
                self.assertFalse(g.allows(name, [cmd, False], pool), repr(cmd))


if __name__ == "__main__":
    unittest.main()
