"""Runs the Python tests and a sample of the hostile-input sweep under
valgrind and reports every leaked block and memory error that is not the
interpreter's own (see valgrind-python.supp).

    python2.7 tests/robust/leakcheck.py --build build [--only test_core_host]
        [--sample 1/8:_qorctl] [--no-sweep] [--no-cpp]

Each test module runs as one process, and so does the C++ test binary; the
sweep forks one process per function, and each process's report is read. The process exits non-zero
when any report has an error.
"""
import argparse
import glob
import os
import re
import shutil
import subprocess
import sys
import tempfile

HERE = os.path.dirname(os.path.abspath(__file__))
TESTS = os.path.join(os.path.dirname(HERE), "python")
SUPP = os.path.join(HERE, "valgrind-python.supp")

ERRORS = re.compile(r"ERROR SUMMARY: (\d+) errors")
LOST = re.compile(r"(definitely|indirectly|possibly) lost: ([\d,]+) bytes in ([\d,]+) blocks")
RECORD_START = re.compile(r"^==\d+== (\S.*(are (definitely|indirectly|possibly) lost|Invalid|uninitialised"
                          r"|Mismatched|overlap|free\(\)|Syscall param).*)$")

# The sweep's self-tests crash a stand-in function on purpose; the module
# sweep itself runs below, from the sweep's own entry point.
SKIP = set(["test_sweep"])


def valgrind(logdir, tag):
    return ["valgrind", "--tool=memcheck", "--leak-check=full",
            "--show-leak-kinds=definite,indirect,possible",
            "--errors-for-leak-kinds=definite,indirect,possible",
            "--suppressions=" + SUPP, "--num-callers=40",
            "--log-file=%s/%s.%%p.log" % (logdir, tag)]


def parse(path):
    """(error count, {kind: (bytes, blocks)}, [error records])."""
    with open(path) as f:
        lines = f.read().splitlines()
    errors = 0
    lost = {}
    records = []
    cur = None
    for line in lines:
        m = ERRORS.search(line)
        if m:
            errors = int(m.group(1))
        m = LOST.search(line)
        if m:
            lost[m.group(1)] = (int(m.group(2).replace(",", "")), int(m.group(3).replace(",", "")))
        if RECORD_START.match(line):
            cur = [line]
            records.append(cur)
        elif cur is not None:
            if re.match(r"^==\d+== *$", line):
                cur = None
            else:
                cur.append(line)
    return errors, lost, records


# Address space for a run under valgrind (valgrind's own included): a call
# that asks a container for thousands of millions of elements must fail
# with an exception instead of filling the machine's memory.
ADDRESS_SPACE = 16 << 30


def _limit():
    import resource
    resource.setrlimit(resource.RLIMIT_AS, (ADDRESS_SPACE, ADDRESS_SPACE))


def run(cmd, env, cwd, note, output):
    """Runs cmd with its output into the file output; its exit status."""
    sys.stdout.write("  %s\n" % note)
    sys.stdout.flush()
    with open(output, "w") as out:
        return subprocess.call(cmd, env=env, cwd=cwd, stdout=out, stderr=subprocess.STDOUT, preexec_fn=_limit)


def main(argv):
    ap = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    ap.add_argument("--build", default="build")
    ap.add_argument("--python", default="/usr/bin/python2.7")
    ap.add_argument("--only", nargs="*", help="test modules to run (default: every one)")
    ap.add_argument("--sample", default="1/8:_qorctl", help="the sweep's K/N[:modules] sample")
    ap.add_argument("--no-sweep", action="store_true")
    ap.add_argument("--no-cpp", action="store_true", help="leave out the C++ test binary")
    a = ap.parse_args(argv)
    build = os.path.abspath(a.build)
    logdir = tempfile.mkdtemp(prefix="qorctl-leakcheck-")
    env = dict(os.environ)
    env["PYTHONPATH"] = os.path.join(build, "python") + ":" + TESTS
    env["PYTHONDONTWRITEBYTECODE"] = "1"
    env["QORCTL_BUILD"] = build
    env["QORCTL_CONFIG"] = os.path.join(logdir, "host.conf")
    modules = a.only or sorted(os.path.basename(p)[:-3] for p in glob.glob(os.path.join(TESTS, "test_*.py")))
    statuses = {}
    for name in modules:
        if name in SKIP and not a.only:
            continue
        statuses[name] = run(valgrind(logdir, name) + [a.python, "-m", "unittest", name], env, TESTS,
                             "%s under valgrind" % name, os.path.join(logdir, name + ".out"))
    cpp = os.path.join(build, "tests", "qorctl_cpp_tests")
    if not a.no_cpp and not a.only and os.path.exists(cpp):
        statuses["cpp"] = run(valgrind(logdir, "cpp") + [cpp], env, os.path.join(build, "tests"),
                              "C++ tests under valgrind", os.path.join(logdir, "cpp.out"))
    if not a.no_sweep:
        env["QORCTL_VALGRIND_LOG"] = "%s/sweep.%%p.log" % logdir
        statuses["sweep"] = run(valgrind(logdir, "sweep") + [a.python, os.path.join(HERE, "sweep.py"),
                                                             "--sample", a.sample, "--timeout", "600"],
                                env, TESTS, "sweep (%s of _qorctl, all of _genfixture) under valgrind" % a.sample,
                                os.path.join(logdir, "sweep.out"))
        with open(os.path.join(logdir, "sweep.out")) as f:
            sys.stdout.write("".join("    " + l for l in f if not l.startswith(("swig/python", "known fault"))))
    total_errors = 0
    total_lost = {}
    processes = 0
    bad = []
    for path in sorted(glob.glob(os.path.join(logdir, "*.log"))):
        processes += 1
        errors, lost, records = parse(path)
        total_errors += errors
        for kind, (b, n) in lost.items():
            ob, on = total_lost.get(kind, (0, 0))
            total_lost[kind] = (ob + b, on + n)
        if errors:
            bad.append((os.path.basename(path), records))
    for name, records in bad:
        sys.stdout.write("\n%s:\n" % name)
        for rec in records[:10]:
            sys.stdout.write("\n".join(rec[:25]) + "\n")
    failed = [n for n, st in sorted(statuses.items()) if st != 0]
    for name in failed:
        sys.stdout.write("\n%s failed; its output is in %s\n" % (name, os.path.join(logdir, name + ".out")))
    sys.stdout.write("\nleak check: %d processes, %d errors (leaks and memory errors) after suppressions\n" % (
        processes, total_errors))
    sys.stdout.write("unsuppressed leaked blocks: %s\n" % (", ".join(
        "%s %d bytes in %d" % (k, total_lost[k][0], total_lost[k][1]) for k in sorted(total_lost)) or "none"))
    if failed:
        sys.stdout.write("runs that failed: %s\n" % ", ".join(failed))
    if total_errors == 0 and not failed:
        shutil.rmtree(logdir)
    else:
        sys.stdout.write("reports kept in %s\n" % logdir)
    return 1 if total_errors or failed else 0


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
