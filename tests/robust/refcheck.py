"""Runs each test of a test module repeatedly under the debug interpreter
and reports the tests whose reference total keeps growing.

    python2.7-dbg tests/robust/refcheck.py test_core_host [--warmup 2] [--rounds 4]

A test is run warmup times first (caches fill, lazily made objects appear),
then rounds more times with sys.gettotalrefcount() read before and after
each run. A test whose total grows in every measured round leaks; one that
fails is reported as failing. The process exits non-zero on either. A test
that passes once but not when repeated (it changes state a second run
depends on) is listed as not repeatable and not measured.
"""
import argparse
import gc
import sys
import unittest


def _cases(suite):
    for t in suite:
        if isinstance(t, unittest.TestSuite):
            for c in _cases(t):
                yield c
        else:
            yield t


def _settle():
    sys.exc_clear()
    for _ in range(3):
        gc.collect()


def _run_once(case):
    result = unittest.TestResult()
    unittest.TestSuite([case]).run(result)
    problems = [text for _, text in result.errors + result.failures]
    del result
    return problems


class _Empty(unittest.TestCase):
    def test_nothing(self):
        pass


def _deltas(make, rounds, problems):
    """The change of the reference total over each of rounds runs, measured
    from the start of one run to the start of the next, so the test case and
    all it made are gone at both ends."""
    totals = []
    for r in range(rounds + 1):
        _settle()
        totals.append(sys.gettotalrefcount())
        if r < rounds:
            problems += _run_once(make())
    return [b - a for a, b in zip(totals, totals[1:])]


def check(module_name, warmup, rounds, out=sys.stdout):
    """[(test id, deltas or failure text)] of the tests that leak or fail."""
    if not hasattr(sys, "gettotalrefcount"):
        raise SystemExit("refcheck needs the debug interpreter (python2.7-dbg)")
    module = __import__(module_name)
    suite = unittest.defaultTestLoader.loadTestsFromModule(module)
    # What measuring itself costs, from runs of a test that does nothing.
    _deltas(lambda: _Empty("test_nothing"), 3, [])
    bias = min(_deltas(lambda: _Empty("test_nothing"), 3, []))
    bad = []
    for case in _cases(suite):
        tid = case.id()
        # A fresh instance per run, so the runs share nothing but the module.
        make = lambda: type(case)(case._testMethodName)  # noqa: E731
        first = _run_once(make())
        if first:
            bad.append((tid, "failed: " + first[0].strip().splitlines()[-1]))
            continue
        problems = []
        for _ in range(warmup - 1):
            problems += _run_once(make())
        deltas = [d - bias for d in _deltas(make, rounds, problems)]
        if problems:
            # It passes once but changes what a second run expects: its
            # references cannot be compared from run to run.
            out.write("%-70s not repeatable: %s\n" % (tid, problems[0].strip().splitlines()[-1]))
            continue
        if min(deltas) > 0:
            bad.append((tid, "leaked references per run: %s" % deltas))
        out.write("%-70s %s\n" % (tid, " ".join("%+d" % d for d in deltas)))
    return bad


def main(argv):
    ap = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    ap.add_argument("modules", nargs="+")
    ap.add_argument("--warmup", type=int, default=2)
    ap.add_argument("--rounds", type=int, default=4)
    a = ap.parse_args(argv)
    bad = []
    for name in a.modules:
        bad += check(name, a.warmup, a.rounds)
    for tid, what in bad:
        sys.stdout.write("REFLEAK %s: %s\n" % (tid, what))
    n = len(bad)
    sys.stdout.write("reference check: %d tests leak or fail\n" % n)
    return 1 if n else 0


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
