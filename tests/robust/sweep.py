"""Calls every function of the extension modules with hostile arguments.

Each function is swept in a child process forked from a parent that has
only built the object pool, so a crash or hang is caught, attributed to the
function and the argument tuple, and the host's state never carries over
from one function to the next. Every call must return or raise; a value
returned with an exception still pending, an error returned without one
(SystemError), a crash, a hang, a sanitizer report and the module's
"memory leak" warning are faults.

    PYTHONPATH=build/python python2.7 tests/robust/sweep.py [_qorctl _genfixture]
        [--sample K/N[:modules]] [--only REGEX] [--timeout S] [--verbose]

Under the debug interpreter every call is also checked for references it
leaves behind. Faults listed in known_faults.txt are shown without failing.
"""
import ctypes
import errno
import fnmatch
import gc
import os
import re
import select
import shutil
import signal
import sys
import tempfile
import time
import zlib

sys.path.insert(0, os.path.dirname(os.path.abspath(__file__)))
import hostile  # noqa: E402
import surface  # noqa: E402

# Saving the host's configuration is one of the calls the sweep makes: never
# into the machine's own configuration file.
if not os.environ.get("QORCTL_CONFIG"):
    os.environ["QORCTL_CONFIG"] = os.path.join(tempfile.gettempdir(), "qorctl-sweep-%d.conf" % os.getpid())

DEFAULT_MODULES = ["_qorctl", "_genfixture"]
SANITIZER_MARKS = ("ERROR: AddressSanitizer", "ERROR: LeakSanitizer", "runtime error:",
                   "SUMMARY: UndefinedBehaviorSanitizer")
# How the address sanitizer refuses an allocation beyond the process's limit
# (its operator new aborts where the plain build throws std::bad_alloc, which
# the wrapper turns into an exception): the call asked for too much memory,
# which is not a fault of the module.
MEMORY_LIMIT_MARKS = ("AddressSanitizer: requested allocation size", "AddressSanitizer: out-of-memory",
                      "AddressSanitizer: allocation-size-too-big", "allocator is out of memory",
                      "hard rss limit exhausted")
ASAN_LIMIT_OPTION = "max_allocation_size_mb"
LEAK_WARNING = "detected a memory leak of type"
HARNESS_ERROR = 99  # the child's exit status when the sweep itself failed


class Guard(object):
    """Keeps the sweep from doing harm outside the simulated host.

    The command runners start real shell commands: their command argument
    only ever receives the harmless command or a value that fails
    conversion. delete_ functions destroy what they are given: they only
    receive objects the sweep made and owns (or dead ones), never library
    objects reached through getters.
    """
    COMMANDS = {"QorCtl_Exec": 1, "QorCtl_Daemon": 1}
    HARMLESS = "true"

    def may_call(self, name):
        return not name.startswith("delete_")

    def valid_value(self, name, argn):
        if self.COMMANDS.get(name) == argn:
            return self.HARMLESS
        return None

    def allows(self, name, args, pool):
        pos = self.COMMANDS.get(name)
        if pos is not None and len(args) >= pos:
            v = args[pos - 1]
            if v != self.HARMLESS and (isinstance(v, (basestring, bytearray, buffer)) or
                                       surface.wrapped_type(v) is not None):
                return False
        if name.startswith("delete_"):
            for v in args:
                if surface.wrapped_type(v) is not None and not surface.is_owned(v) and \
                        not pool.is_dead(v):
                    return False
        return True


# ---- The pending-exception check -------------------------------------------

_pyapi = ctypes.pythonapi
_pyapi.PyErr_Occurred.restype = ctypes.c_void_p
_pyapi.PyErr_Occurred.argtypes = []


def pending_exception():
    """The class name of an exception left pending by the last call, or None.
    Clears it."""
    try:
        p = _pyapi.PyErr_Occurred()
    except BaseException as e:  # ctypes raises what it finds pending
        return type(e).__name__
    if p:
        name = ctypes.cast(p, ctypes.py_object).value.__name__
        _pyapi.PyErr_Clear()
        return name
    return None


# ---- The battery -------------------------------------------------------------

class Battery(object):
    """The argument tuples for one function: (label, builder) pairs; a
    builder makes fresh arguments for each call."""

    def __init__(self, name, sigs, pool, guard):
        self.name = name
        self.entries = []
        self.pool = pool
        self.guard = guard
        deleting = name.startswith("delete_")
        add = self.entries.append
        add(("no-args", lambda: []))
        for si, sig in enumerate(sigs):
            n = sig.arity
            valid = list(sig.valid)
            # Labels name the signature too when there are several.
            at = ("s%d:" % (si + 1)) if len(sigs) > 1 else ""
            if n == 0:
                add((at + "valid/0", lambda: []))
                add((at + "too-many/0", lambda: [None]))
                continue
            for k in range(n):
                focus = surface.wrapped_type(valid[k]) or surface.base_type(sig.types[k] or "")
                if sig.types[k] == "bool":
                    vals = hostile.for_bool(pool)
                elif deleting:
                    vals = self._deleting_values(focus)
                else:
                    vals = hostile.values(pool, focus)
                for label, make in vals:
                    add(("%sarg%d=%s" % (at, k + 1, label), self._with(valid, k, make, sig, n)))
            add((at + "none-all/%d" % n, (lambda n=n: [None] * n)))
            if n >= 2:
                focus = surface.wrapped_type(valid[0])
                for label, make in hostile.values(pool, focus):
                    if label.startswith(("computed-this", "seq:", "this-", "dead:", "proxy:")):
                        add(("%sall=%s" % (at, label), (lambda n=n, make=make: [make() for _ in range(n)])))
            add((at + "valid/%d" % n, self._valid(sig)))
            add((at + "too-many/%d" % n, (lambda sig=sig: self._valid(sig)() + [None])))

    def _fresh_valid(self, sig):
        """The valid values, with owned objects made anew where the function
        destroys its argument."""
        out = list(sig.valid)
        if self.name.startswith("delete_") and out:
            t = surface.wrapped_type(out[0])
            fresh = self.pool.fresh(t) if t else None
            out[0] = fresh
        return out

    def _valid(self, sig):
        return lambda: self._fresh_valid(sig)

    def _with(self, valid, k, make, sig, n):
        def build():
            args = self._fresh_valid(sig) if self.name.startswith("delete_") else list(valid)
            args[k] = make()
            return args
        return build

    def _deleting_values(self, focus):
        """The battery of a delete_ function: only objects the sweep made
        and owns, never the library's own."""
        pool = self.pool
        out = list(hostile.values(None))
        types_ = [t for t in [focus] + pool.sample_types(focus, 8) if pool.constructible(t)]
        for t in types_:
            out.append(("fresh:" + t, (lambda t=t: pool.fresh(t))))
            out.append(("fresh-bare:" + t, (lambda t=t: pool.fresh_bare(t))))
            out.append(("dead:" + t, (lambda t=t: pool.dead(t))))
        return out


# ---- Child side ----------------------------------------------------------------

class Journal(object):
    def __init__(self, fd):
        self.fd = fd

    def write(self, *parts):
        line = "\t".join(str(p).replace("\t", " ").replace("\n", "\\n") for p in parts) + "\n"
        while line:
            try:
                n = os.write(self.fd, line)
            except OSError as e:
                if e.errno == errno.EINTR:
                    continue
                raise
            line = line[n:]


def _touch(value):
    """Uses a result the way a script would: its text and its type."""
    try:
        repr(value)
        str(value)
        if isinstance(value, tuple):
            for v in value:
                repr(v)
    except Exception:
        pass


def sweep_function(module, name, pool, guard, journal, start):
    fn = getattr(module, name)
    inf = surface.Inferrer(pool, guard)
    journal.write("I", name)
    sigs = inf.infer(name, fn) if guard.may_call(name) else _delete_sigs(inf, name, fn, pool)
    journal.write("N", inf.calls, int(start == 0 and all(s.complete for s in sigs)))
    battery = Battery(name, sigs, pool, guard)
    registering = name.endswith("_swigregister")
    for i, (label, build) in enumerate(battery.entries):
        if i < start:
            continue
        try:
            args = build()
            if not guard.allows(name, args, pool):
                continue
        except Exception as e:
            journal.write("B", i, label, "%s: %s" % (type(e).__name__, e))
            continue
        journal.write("C", i, label)
        try:
            res = fn(*args)
        except SystemError as e:
            journal.write("S", i, label, str(e)[:200])
            continue
        except Exception as e:
            p = pending_exception()
            if p:
                journal.write("P", i, label, p)
            journal.write("R", i, type(e).__name__)
            try:
                str(e)
            except Exception:
                pass
            del e
            if registering:
                _after_register(pool, journal, i, label)
            continue
        p = pending_exception()
        if p:
            journal.write("P", i, label, p)
        _touch(res)
        del res
        p = pending_exception()
        if p:
            journal.write("P", i, label + " (on release)", p)
        journal.write("R", i, "ok")
        if registering:
            _after_register(pool, journal, i, label)
    if hasattr(sys, "gettotalrefcount") and start == 0 and not registering:
        _reference_passes(fn, name, battery, pool, guard, journal)
    journal.write("E", name)


REF_PASS = 1000000  # call numbers of the reference passes start here


def _reference_passes(fn, name, battery, pool, guard, journal, passes=2):
    """Under the debug interpreter: runs the battery again, twice, reading
    the reference total around every call. A call that adds references in
    both passes leaks them on its path (the first, main pass filled the
    caches)."""
    grew = {}
    for p in range(passes):
        for i, (label, build) in enumerate(battery.entries):
            try:
                args = build()
                if not guard.allows(name, args, pool):
                    continue
            except Exception:
                continue
            journal.write("c", REF_PASS + i, label)
            delta = _refs_of_call(fn, args)
            pending_exception()
            if delta > 0:
                grew.setdefault(label, []).append(delta)
            del args
    # Between two runs of a call the others may have emptied a cache that
    # it fills again; a leak keeps growing when the call runs on its own.
    entries = dict(battery.entries)
    for label, deltas in sorted(grew.items()):
        if len(deltas) < passes:
            continue
        again = []
        for _ in range(4):
            args = entries[label]()
            journal.write("c", REF_PASS, label + " (repeated)")
            again.append(_refs_of_call(fn, args))
            del args
        if min(again) > 0:
            journal.write("F", label, "references added per call: %s" % again)


def _call_quietly(fn, args):
    try:
        fn(*args)
    except Exception:
        pass
    sys.exc_clear()


def _refs_of_call(fn, args):
    # The call runs in a frame of its own: a frame that handled an exception
    # holds references to the exception state until it returns.
    before = sys.gettotalrefcount()
    _call_quietly(fn, args)
    # Less the reference that the number "before" itself holds.
    return sys.gettotalrefcount() - before - _REF_BIAS


def _nothing(*args):
    return None


_REF_BIAS = 0
if hasattr(sys, "gettotalrefcount"):
    _REF_BIAS = min(_refs_of_call(_nothing, ()) for _ in range(5))


def _after_register(pool, journal, i, label):
    """Registration changes how every later result of the class is wrapped
    and destroyed: use some at once, under whatever was registered."""
    journal.write("C", i, label + " then wrap")
    pool.exercise()
    p = pending_exception()
    if p:
        journal.write("P", i, label + " then wrap", p)


def _delete_sigs(inf, name, fn, pool):
    n, protos = inf.arity(fn)
    cls_obj = None
    for t in pool.order:
        if pool.deleters.get(t) is fn:
            cls_obj = pool.fresh(t)
            break
    return [surface.Signature(["self"] * n, [cls_obj] + [None] * (n - 1), cls_obj is not None, False)]


# A child may allocate at most this much address space, where the limit can
# be set (not under the address sanitizer or valgrind, which reserve far
# more for themselves): a script may ask a container for two thousand
# million elements, which must fail with an exception, not fill the machine.
CHILD_ADDRESS_SPACE = 8 << 30


def _limit_memory():
    if _asan() or "valgrind" in os.environ.get("LD_PRELOAD", "") or _under_valgrind():
        return
    import resource
    resource.setrlimit(resource.RLIMIT_AS, (CHILD_ADDRESS_SPACE, CHILD_ADDRESS_SPACE))


def _asan():
    try:
        ctypes.CDLL(None).__asan_init
        return True
    except AttributeError:
        return False


def _under_valgrind():
    try:
        with open("/proc/self/maps") as f:
            return "vgpreload" in f.read()
    except IOError:
        return False


def child_main(work, pool, guard, wfd, out_path, err_path, cwd):
    """Runs in the forked child: never returns."""
    code = 0
    try:
        # A full collection would write to every object the parent made,
        # copying its whole heap into each child; the child is short-lived.
        gc.disable()
        _limit_memory()
        os.chdir(cwd)
        out = os.open(out_path, os.O_WRONLY | os.O_CREAT | os.O_TRUNC, 0o600)
        err = os.open(err_path, os.O_WRONLY | os.O_CREAT | os.O_TRUNC, 0o600)
        sys.stdout.flush()
        sys.stderr.flush()
        os.dup2(out, 1)
        os.dup2(err, 2)
        journal = Journal(wfd)
        for module, name, start in work:
            sweep_function(module, name, pool, guard, journal, start)
        journal.write("X")
        lsan = _lsan()
        if lsan is not None and lsan():
            journal.write("L")
    except BaseException:
        import traceback
        traceback.print_exc()
        code = HARNESS_ERROR
    try:
        sys.stdout.flush()
        ctypes.CDLL(None).fflush(None)
    except Exception:
        pass
    os._exit(code)


def _lsan():
    """The leak checker of a process that runs with the AddressSanitizer
    runtime loaded, or None."""
    try:
        f = ctypes.CDLL(None).__lsan_do_recoverable_leak_check
    except AttributeError:
        return None
    if "detect_leaks=0" in os.environ.get("ASAN_OPTIONS", ""):
        return None
    f.restype = ctypes.c_int
    return f


# ---- Parent side ---------------------------------------------------------------

class Fault(object):
    def __init__(self, kind, function, label, detail=""):
        self.kind, self.function, self.label, self.detail = kind, function, label, detail

    def __str__(self):
        s = "%s in %s(%s)" % (self.kind, self.function, self.label)
        return s + ("\n" + self.detail if self.detail else "")


class Results(object):
    def __init__(self):
        self.functions = 0
        self.complete = 0
        self.calls = 0
        self.infer_calls = 0
        self.outcomes = {}
        self.faults = []
        self.children = 0

    def fault(self, *args):
        self.faults.append(Fault(*args))

    def split_known(self, known, swept):
        """(unexpected faults, known faults seen, known entries for swept
        functions that did not occur)."""
        seen = set()
        unexpected, expected = [], []
        for f in self.faults:
            key = next((k for k in known if k[0] == f.kind and fnmatch.fnmatchcase(f.function or "", k[1])),
                       None)
            if key is not None:
                expected.append((key, f))
                seen.add(key)
            else:
                unexpected.append(f)
        stale = sorted(k for k in known if k not in seen and any(fnmatch.fnmatchcase(n, k[1]) for n in swept))
        return unexpected, expected, stale

    def summary(self):
        lines = ["functions swept: %d (%d with a fully valid argument tuple)" % (self.functions, self.complete),
                 "calls made: %d (+%d to learn the signatures), in %d child processes" % (
                     self.calls, self.infer_calls, self.children),
                 "outcomes: " + ", ".join("%s %d" % kv for kv in sorted(self.outcomes.items(),
                                                                        key=lambda kv: -kv[1]))]
        kinds = {}
        for f in self.faults:
            kinds[f.kind] = kinds.get(f.kind, 0) + 1
        lines.append("faults: %d (%s)" % (len(self.faults), ", ".join(
            "%s %d" % kv for kv in sorted(kinds.items())) or "none"))
        lines.append("crashes: %d" % kinds.get("crash", 0))
        return "\n".join(lines)


def _excerpt(path, limit=40):
    try:
        with open(path) as f:
            text = f.read()
    except IOError:
        return ""
    lines = text.splitlines()
    marks = [i for i, l in enumerate(lines) if any(m in l for m in SANITIZER_MARKS + (LEAK_WARNING,))]
    start = max(marks[0] - 2, 0) if marks else max(len(lines) - limit, 0)
    return "\n".join(lines[start:start + limit])


def _memory_limit(path):
    try:
        with open(path) as f:
            text = f.read()
    except IOError:
        return False
    marks = [m for m in SANITIZER_MARKS if m in text]
    return any(m in text for m in MEMORY_LIMIT_MARKS) and marks == ["ERROR: AddressSanitizer"]


# valgrind (see leakcheck.py) reports into files named by this pattern, %p
# standing for the process id; its allocator cannot throw std::bad_alloc
# and ends the process instead.
VALGRIND_LOG = "QORCTL_VALGRIND_LOG"
VALGRIND_NO_THROW = "new/new[] failed and should throw an exception"


def _valgrind_memory_limit(pid):
    pattern = os.environ.get(VALGRIND_LOG)
    if not pattern:
        return False
    try:
        with open(pattern.replace("%p", str(pid))) as f:
            return VALGRIND_NO_THROW in f.read()
    except IOError:
        return False


def _scan(path):
    try:
        with open(path) as f:
            text = f.read()
    except IOError:
        return False, False
    return any(m in text for m in SANITIZER_MARKS), LEAK_WARNING in text


class Runner(object):
    def __init__(self, modules, pool, guard, timeout, results, verbose=False):
        self.modules = modules
        self.pool = pool
        self.guard = guard
        self.timeout = timeout
        self.results = results
        self.verbose = verbose
        self.tmp = tempfile.mkdtemp(prefix="qorctl-sweep-")
        self.cwd = os.path.join(self.tmp, "cwd")
        os.mkdir(self.cwd)

    def run(self, work, batch=1):
        """Sweeps work = [(module, name)], batch functions per child,
        resuming after each crash or hang so every later call still runs."""
        for i in range(0, len(work), batch):
            queue = [(m, n, 0) for m, n in work[i:i + batch]]
            while queue:
                queue = self._one_child(queue)

    def _one_child(self, work):
        out_path = os.path.join(self.tmp, "out")
        err_path = os.path.join(self.tmp, "err")
        r, w = os.pipe()
        sys.stdout.flush()
        sys.stderr.flush()
        pid = os.fork()
        if pid == 0:
            os.close(r)
            child_main(work, self.pool, self.guard, w, out_path, err_path, self.cwd)
        os.close(w)
        self.results.children += 1
        state = {"fn": None, "call": None, "label": None, "done": set(), "leak": False,
                 "finished": False, "infer": False}
        buf = ""
        hung = False
        last = time.time()
        while True:
            ready, _, _ = select.select([r], [], [], 1.0)
            if ready:
                data = os.read(r, 65536)
                if not data:
                    break
                last = time.time()
                buf += data
                while "\n" in buf:
                    line, buf = buf.split("\n", 1)
                    self._record(line, state)
            elif time.time() - last > self.timeout:
                hung = True
                os.kill(pid, signal.SIGKILL)
                break
        os.close(r)
        _, status = os.waitpid(pid, 0)
        sanitizer, leakwarn = _scan(err_path)
        _, leakwarn_out = _scan(out_path)
        fn = state["fn"]
        where = state["label"] if state["call"] is not None else ("learning the signature" if state["infer"] else "")
        if os.WIFEXITED(status) and os.WEXITSTATUS(status) != 0 and (
                _memory_limit(err_path) or _valgrind_memory_limit(pid)):
            self.results.outcomes["MemoryLimit"] = self.results.outcomes.get("MemoryLimit", 0) + 1
        elif hung:
            self.results.fault("hang", fn, where, "no progress for %ds" % self.timeout)
        elif os.WIFEXITED(status) and os.WEXITSTATUS(status) == HARNESS_ERROR:
            self.results.fault("harness", fn, where, _excerpt(err_path))
            return []
        elif os.WIFSIGNALED(status) or (os.WEXITSTATUS(status) != 0 and not state["finished"]):
            how = ("signal %d" % os.WTERMSIG(status)) if os.WIFSIGNALED(status) else \
                ("exit status %d" % os.WEXITSTATUS(status))
            self.results.fault("crash", fn, where, how + "\n" + _excerpt(err_path))
        elif sanitizer or state["leak"]:
            self.results.fault("sanitizer", fn or "(batch)", where, _excerpt(err_path))
        # A class registered without a destroy function makes every owned
        # object of that type warn when it dies: that is the script's doing.
        if (leakwarn or leakwarn_out) and not (fn or "").endswith("_swigregister"):
            self.results.fault("leak-warning", fn or "(batch)", "", _excerpt(out_path) + _excerpt(err_path))
        if state["finished"]:
            return []
        # Resume after the call that failed. A function that failed while its
        # signature was being learned is given up.
        rest = []
        for m, n, start in work:
            if n in state["done"]:
                continue
            if n == fn:
                if state["call"] is not None and state["call"] < REF_PASS:
                    rest.append((m, n, state["call"] + 1))
                continue
            rest.append((m, n, start))
        return rest

    def _record(self, line, st):
        parts = line.split("\t")
        tag = parts[0]
        res = self.results
        if tag == "I":
            st["fn"], st["call"], st["label"], st["infer"] = parts[1], None, None, True
        elif tag == "N":
            res.infer_calls += int(parts[1])
            res.complete += int(parts[2])
            st["infer"] = False
        elif tag == "C":
            st["call"], st["label"] = int(parts[1]), parts[2]
            res.calls += 1
        elif tag == "c":
            st["call"], st["label"] = int(parts[1]), parts[2] + " (reference pass)"
        elif tag == "F":
            res.fault("ref-leak", st["fn"], parts[1], parts[2])
        elif tag == "R":
            res.outcomes[parts[2]] = res.outcomes.get(parts[2], 0) + 1
        elif tag == "P":
            res.fault("pending-exception", st["fn"], parts[2], parts[3] if len(parts) > 3 else "")
        elif tag == "S":
            res.fault("system-error", st["fn"], parts[2], parts[3] if len(parts) > 3 else "")
            res.outcomes["SystemError"] = res.outcomes.get("SystemError", 0) + 1
        elif tag == "B":
            res.fault("harness", st["fn"], parts[2], "preparing the arguments raised " + parts[3])
        elif tag == "E":
            res.functions += 1
            st["done"].add(parts[1])
            if self.verbose:
                sys.stderr.write("  %s\n" % parts[1])
        elif tag == "L":
            st["leak"] = True
        elif tag == "X":
            st["finished"] = True


def select_functions(modules, sample=None, only=None):
    """[(module, name)] for every callable, or a stable subset: with sample
    K/N, the functions whose name hashes to one of K residues out of N."""
    out = []
    for m in modules:
        for name in surface.callables(m):
            if only and not re.search(only, name):
                continue
            if sample and m.__name__ in sample[2] and zlib.crc32(name) % sample[1] >= sample[0]:
                continue
            out.append((m, name))
    return out


def import_modules(names):
    mods = []
    for name in names:
        m = __import__(name)
        try:
            __import__(name.lstrip("_"))  # the shadow classes register here
        except ImportError:
            pass
        mods.append(m)
    return mods


KNOWN_FAULTS = os.path.join(os.path.dirname(os.path.abspath(__file__)), "known_faults.txt")


def load_known(path=KNOWN_FAULTS):
    """{(kind, function): reason} from the known-faults file: faults that are
    reported and tracked elsewhere, so they do not fail the sweep. An entry
    that stops occurring is reported as stale."""
    known = {}
    if not os.path.exists(path):
        return known
    with open(path) as f:
        for line in f:
            line = line.split("#", 1)[0].strip() if line.lstrip().startswith("#") else line.strip()
            if not line:
                continue
            parts = line.split(None, 2)
            known[(parts[0], parts[1])] = parts[2] if len(parts) > 2 else ""
    return known


def sweep(module_names, sample=None, only=None, timeout=30, verbose=False, out=sys.stdout, batch=1,
          known=None):
    if _asan() and ASAN_LIMIT_OPTION not in os.environ.get("ASAN_OPTIONS", ""):
        # Without the limit an allocation the size of the machine's memory
        # succeeds and filling it brings the machine's out-of-memory killer.
        raise SystemExit("under the address sanitizer the sweep needs ASAN_OPTIONS=%s=N "
                         "(the build's test environment sets it)" % ASAN_LIMIT_OPTION)
    t0 = time.time()
    mods = import_modules(module_names)
    guard = Guard()
    pool = surface.build_pool(mods, guard)
    results = Results()
    work = select_functions(mods, sample, only)
    runner = Runner(mods, pool, guard, timeout, results, verbose)
    try:
        runner.run(work, batch)
    finally:
        shutil.rmtree(runner.tmp, ignore_errors=True)
    results.elapsed = time.time() - t0
    results.pool_types = len(pool.order)
    results.total = sum(len(surface.callables(m)) for m in mods)
    out.write("sweep of %s: %d of %d callables, %d object types in the pool, %.1fs\n" % (
        ", ".join(module_names), len(work), results.total, results.pool_types, results.elapsed))
    out.write(results.summary() + "\n")
    known = load_known() if known is None else known
    unexpected, expected, stale = results.split_known(known, set(n for _, n in work))
    for f in unexpected:
        out.write("FAULT %s\n" % f)
    for key, f in expected:
        out.write("known fault (%s): %s in %s(%s)\n" % (known[key], f.kind, f.function, f.label))
    for kind, fn in stale:
        out.write("STALE known fault: %s in %s no longer occurs; remove it from %s\n" % (
            kind, fn, os.path.basename(KNOWN_FAULTS)))
    results.unexpected, results.stale = unexpected, stale
    out.write("%d passed, %d failed\n" % (results.functions - len(set(f.function for f in unexpected)),
                                          len(set(f.function for f in unexpected))))
    return results


def parse_sample(text, modules):
    """'K/N' or 'K/N:mod1,mod2' (the modules sampled; the rest are swept
    whole)."""
    if not text:
        return None
    frac, _, mods = text.partition(":")
    k, n = frac.split("/")
    return int(k), int(n), set(mods.split(",")) if mods else set(modules)


def main(argv):
    import argparse
    ap = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    ap.add_argument("modules", nargs="*", default=DEFAULT_MODULES)
    ap.add_argument("--sample", help="K/N[:modules]: sweep a stable K-in-N subset of the functions")
    ap.add_argument("--only", help="sweep only the functions whose name matches this expression")
    ap.add_argument("--timeout", type=float, default=30, help="seconds without progress that count as a hang")
    ap.add_argument("--batch", type=int, default=1, help="functions per child process")
    ap.add_argument("--verbose", action="store_true")
    a = ap.parse_args(argv)
    r = sweep(a.modules, parse_sample(a.sample, a.modules), a.only, a.timeout, a.verbose, batch=a.batch)
    return 1 if r.unexpected or r.stale else 0


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
