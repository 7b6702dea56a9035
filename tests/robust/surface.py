"""What the sweep learns from the modules themselves: the functions, their
parameter types and a valid argument for each, and a pool of live objects.

Nothing here is a hand-kept list. The functions are the module's callables;
a function's arity comes from the interpreter's argument-count message or,
for overloaded names, from the prototypes listed by the dispatcher; each
parameter's declared type comes from the wrapper's own "in method '%s',
argument %d of type '%s'" message, found by passing a probe object and
fixing one argument at a time.
"""
import re
import types

import hostile

ARG_MESSAGE = re.compile(r"argument (\d+) of type '(.*)'$")
COUNT_MESSAGE = re.compile(r"takes (?:exactly|at least|at most) (\d+) arguments?")
OVERLOAD_MESSAGE = "Wrong number of arguments for overloaded function"
REPR_TYPE = re.compile(r"^<Swig Object of type '(.*?)' at 0x[0-9a-f]+>")

INTEGER_TYPES = set("""int int32 uint32 uint16 uint8 uint64 int64 int16 int8 size_t size_type
    difference_type long short unsigned signed""".split())


class Probe(object):
    """Accepted by no converter but the bool one."""
    def __repr__(self):
        return "<probe>"


def callables(module):
    """The module's functions, sorted by name."""
    kinds = (types.BuiltinFunctionType, types.FunctionType)
    return sorted(n for n in dir(module) if isinstance(getattr(module, n), kinds))


def split_params(text):
    """Splits a prototype's parameter list at the commas outside <>."""
    out, depth, cur = [], 0, []
    for ch in text:
        if ch == "<":
            depth += 1
        elif ch == ">":
            depth -= 1
        if ch == "," and depth == 0:
            out.append("".join(cur).strip())
            cur = []
        else:
            cur.append(ch)
    if "".join(cur).strip():
        out.append("".join(cur).strip())
    return out


def parse_prototypes(message):
    """The parameter type lists of an overload message, in listed order."""
    protos = []
    for line in message.splitlines():
        line = line.strip()
        if not line.endswith(")") or "(" not in line or line.startswith("Wrong"):
            continue
        inner = line[line.index("(") + 1:-1]
        protos.append(split_params(inner))
    return protos


def base_type(spelled):
    """'HostCtl::Host const *' -> 'HostCtl::Host'."""
    t = spelled.replace("&", " ").replace("*", " ")
    return " ".join(w for w in t.split() if w != "const")


def wrapped_type(obj):
    """The display type of the library object obj carries, or None."""
    try:
        this = obj if type(obj).__name__ == "PySwigObject" else getattr(obj, "this", None)
        if this is None or type(this).__name__ != "PySwigObject":
            return None
        m = REPR_TYPE.match(repr(this))
    except Exception:
        return None
    return base_type(m.group(1)) if m else None


def is_owned(obj):
    this = obj if type(obj).__name__ == "PySwigObject" else getattr(obj, "this", None)
    try:
        return bool(this.own())
    except Exception:
        return False


class Signature(object):
    """One way to call a function: its parameter types (None where unknown)
    and a valid value for each (None where none was found)."""

    def __init__(self, types_, valid, complete, overloaded):
        self.types = types_
        self.valid = valid
        self.complete = complete
        self.overloaded = overloaded

    @property
    def arity(self):
        return len(self.types)


def _rejects(exc, argn):
    """True when exc is the conversion failure of argument argn."""
    if not isinstance(exc, (TypeError, ValueError, OverflowError)):
        return False
    m = ARG_MESSAGE.search(str(exc))
    return bool(m) and int(m.group(1)) == argn


def _failing_arg(exc):
    if not isinstance(exc, (TypeError, ValueError, OverflowError)):
        return None
    m = ARG_MESSAGE.search(str(exc))
    return (int(m.group(1)), m.group(2)) if m else None


class Inferrer(object):
    """Finds signatures by calling the function. Every call it makes may reach
    the library (the last one, with every argument valid, does), so run it
    where the host's state may change."""

    def __init__(self, pool, guard=None, max_tries=40):
        self.pool = pool
        self.guard = guard
        self.max_tries = max_tries
        self.calls = 0

    def _call(self, fn, args):
        self.calls += 1
        try:
            fn(*args)
        except Exception as e:
            return e
        return None

    def arity(self, fn):
        """(arity, None) or (None, [prototype parameter lists])."""
        e = self._call(fn, ())
        if isinstance(e, NotImplementedError) and OVERLOAD_MESSAGE in str(e):
            return None, parse_prototypes(str(e))
        if isinstance(e, TypeError):
            m = COUNT_MESSAGE.search(str(e))
            if m:
                return int(m.group(1)), None
        return 0, None

    def candidates(self, spelled, name, argn):
        """Values to try for a parameter, most likely first."""
        if self.guard:
            fixed = self.guard.valid_value(name, argn)
            if fixed is not None:
                return [fixed]
        t = spelled or ""
        base = base_type(t)
        words = set(base.replace("::", " ").split())
        out = []
        if "std::vector" in t or "std::set" in t:
            out += [[], ()]
        if base == "bool":
            return [True]
        if base in ("char", "Bool") and "*" not in t or "char [" in t:
            out += ["x", 1]
        elif "string" in base or (base == "char" and "*" in t):
            out += ["x"]
        elif words & INTEGER_TYPES or base in INTEGER_TYPES:
            out += [1, 0, 2L ** 40]
        else:
            out += self.pool.objects_for(base, name.startswith("delete_") and argn == 1)
            if not name.startswith("delete_"):
                out += [0, 1]
        return out[:self.max_tries]

    def infer(self, name, fn):
        n, protos = self.arity(fn)
        if protos is not None:
            return [self._infer_overload(name, fn, p) for p in protos]
        return [self._infer_plain(name, fn, n)]

    def _infer_plain(self, name, fn, n):
        types_ = [None] * n
        valid = [None] * n
        complete = True
        argn = 1
        while argn <= n:
            args = valid[:argn - 1] + [Probe() for _ in range(n - argn + 1)]
            e = self._call(fn, args)
            failing = _failing_arg(e) if e is not None else None
            if failing is None or failing[0] < argn:
                break  # every remaining parameter took a probe (bool)
            pos, spelled = failing
            for k in range(argn, pos):
                types_[k - 1] = "bool"
                valid[k - 1] = True
            types_[pos - 1] = spelled
            found = False
            for cand in self.candidates(spelled, name, pos):
                args = valid[:pos - 1] + [cand] + [Probe() for _ in range(n - pos)]
                e = self._call(fn, args)
                if e is None or not _rejects(e, pos):
                    valid[pos - 1] = cand
                    found = True
                    break
            if not found:
                complete = False
                valid[pos - 1] = None
            argn = pos + 1
        for k in range(argn, n + 1):
            if types_[k - 1] is None:
                types_[k - 1] = "bool"
                valid[k - 1] = True
        return Signature(types_, valid, complete, False)

    def _infer_overload(self, name, fn, proto):
        # Constructor prototypes list only the parameters; method prototypes
        # start with self, which the dispatcher counts too.
        valid = []
        complete = True
        for i, spelled in enumerate(proto):
            cands = self.candidates(spelled, name, i + 1)
            valid.append(cands[0] if cands else None)
            complete = complete and bool(cands)
        if proto:
            e = self._call(fn, valid)
            if isinstance(e, NotImplementedError):
                complete = False
        return Signature(list(proto), valid, complete, True)


class Pool(object):
    """Live wrapped objects by type, with how each owned one was made."""

    def __init__(self):
        self.by_type = {}  # type -> [(obj, maker or None)]
        self.order = []
        self.deleters = {}  # type -> delete_ function, for owned objects
        self._dead = []  # deleted objects handed out, kept so ids stay unique
        self.sources = {}  # type -> (function, args) that produced one

    def add(self, obj, maker=None, keep=3):
        t = wrapped_type(obj)
        if t is None:
            return False
        new = t not in self.by_type
        if new:
            self.by_type[t] = []
            self.order.append(t)
        if len(self.by_type[t]) < keep:
            self.by_type[t].append((obj, maker))
        return new

    def objects_for(self, base, owned_only=False):
        """Objects of exactly base first, then every other type's first
        object (a derived class converts through its cast entry)."""
        out = []
        for obj, maker in self.by_type.get(base, []):
            if not owned_only or maker is not None:
                out.append(maker() if owned_only else obj)
        if owned_only:
            return out
        for t in self.order:
            if t != base:
                out.append(self.by_type[t][0][0])
        return out

    def fresh(self, t):
        """A new owned object of type t, or None."""
        for obj, maker in self.by_type.get(t, []):
            if maker is not None:
                try:
                    return maker()
                except Exception:
                    return None
        return None

    def constructible(self, t):
        return t in self.deleters and any(m is not None for _, m in self.by_type.get(t, []))

    def sample_types(self, focus, others):
        """Up to others types besides focus, spread evenly over the pool."""
        rest = [t for t in self.order if t != focus]
        if len(rest) > others:
            step = float(len(rest)) / others
            rest = [rest[int(i * step)] for i in range(others)]
        return rest

    def hostile_objects(self, focus=None, others=8):
        """Wrapped objects for the battery. Of the focus type (the type the
        parameter expects, when known): the object, its bare "this", a weak
        proxy, a deleted one, "this" computed on every lookup, and views
        chained to an object of another type. Of a bounded sample of the
        other types: the object and its bare "this"."""
        out = []
        if focus not in self.by_type:
            focus = next((t for t in self.order if self.constructible(t)), None)
        sample = self.sample_types(focus, others)
        if focus is not None:
            obj = self.by_type[focus][0][0]
            out.append(("obj:" + focus, (lambda o=obj: o)))
            if type(obj).__name__ != "PySwigObject":
                out.append(("bare:" + focus, (lambda o=obj: o.this)))
                out.append(("proxy:" + focus, (lambda o=obj: hostile.proxy_to(o))))
            if self.constructible(focus):
                f = focus
                out.append(("fresh-bare:" + f, (lambda f=f: self.fresh_bare(f))))
                out.append(("dead:" + f, (lambda f=f: self.dead(f))))
                out.append(("computed-this:" + f,
                            (lambda f=f: hostile.ThisComputed(lambda: self.fresh_bare(f)))))
                out.append(("computed-this-nodict:" + f,
                            (lambda f=f: hostile.ThisComputedNoDict(lambda: self.fresh_bare(f)))))
                out.append(("computed-shadow-nodict:" + f,
                            (lambda f=f: hostile.ThisComputedNoDict(lambda: self.fresh_shadow(f)))))
                if sample:
                    out.append(("chain:%s+%s" % (f, sample[0]), (lambda f=f, o=sample[0]: self.chained(f, o))))
            other = next((o for o in sample if self.constructible(o)), None)
            if other is not None:
                out.append(("chain:%s+%s" % (other, focus),
                            (lambda o=other, f=focus: self.chained(o, f))))
        # Objects of opaque types (no class: a script can only hold them and
        # pass them back) come back bare; a few always join the sample.
        opaque = [t for t in self.order if t != focus and t not in sample and
                  type(self.by_type[t][0][0]).__name__ == "PySwigObject"]
        for t in sample + opaque[:3]:
            obj = self.by_type[t][0][0]
            out.append(("obj:" + t, (lambda o=obj: o)))
            if type(obj).__name__ != "PySwigObject":
                out.append(("bare:" + t, (lambda o=obj: o.this)))
        out.append(("proxy:dead", self.dead_proxy))
        return out

    def exercise(self, limit=40):
        """Makes and drops an object of each type through the function that
        first produced one: wraps results and destroys owned ones with the
        class data registered at that moment. Returns the exceptions raised,
        by class name."""
        raised = []
        for t in self.order[:limit]:
            fn, args = self.sources.get(t, (None, None))
            if fn is None:
                continue
            try:
                r = fn(*args)
                repr(r)
                del r
            except Exception as e:
                raised.append(type(e).__name__)
        return raised

    def fresh_bare(self, t):
        obj = self.fresh(t)
        return obj if obj is None or type(obj).__name__ == "PySwigObject" else obj.this

    def fresh_shadow(self, t):
        """A new owned object of type t inside a shadow-like holder that
        nothing else references."""
        return hostile.OldStyleWithThis(self.fresh_bare(t))

    def dead(self, t):
        """A new owned object of type t, already deleted."""
        obj = self.fresh(t)
        self.deleters[t](obj)
        self._dead.append(obj)
        return obj

    def is_dead(self, obj):
        return any(obj is d for d in self._dead)

    def chained(self, a, b):
        """A fresh owned a whose "this" has a view of b appended: converts
        to either type."""
        bare = self.fresh_bare(a)
        other = self.by_type[b][0][0]
        bare.append(other if type(other).__name__ == "PySwigObject" else other.this)
        return bare

    def dead_proxy(self):
        class Gone(object):
            pass
        g = Gone()
        p = hostile.proxy_to(g)
        del g
        return p


def build_pool(modules, guard=None, rounds=3):
    """Fills a pool from the modules' constructors and getters. Only
    functions that make or read objects are called here: "new_" functions,
    field "_get" accessors and methods whose name starts with "Get"."""
    pool = Pool()
    producers = []
    for m in modules:
        for name in callables(m):
            if name.startswith("delete_"):
                cls = name[len("delete_"):]
                pool.deleters.setdefault(("module", m.__name__, cls), getattr(m, name))
            method = name.split("_")[-1] if "_" in name else name
            if name.startswith("new_") or name.endswith("_get") or method.startswith("Get"):
                if guard is None or guard.may_call(name):
                    producers.append((m, name))
    inf = Inferrer(pool, guard)
    for _ in range(rounds):
        grew = False
        for m, name in producers:
            fn = getattr(m, name)
            for sig in inf.infer(name, fn):
                if not sig.complete:
                    continue
                args = list(sig.valid)
                try:
                    res = fn(*args)
                except Exception:
                    continue
                maker = None
                if name.startswith("new_"):
                    maker = (lambda fn=fn, args=args: fn(*args))
                for r in (res if isinstance(res, tuple) else (res,)):
                    t = wrapped_type(r)
                    if t is None:
                        continue
                    pool.sources.setdefault(t, (fn, args))
                    if maker is not None and is_owned(r):
                        deleter = pool.deleters.get(("module", m.__name__, name[len("new_"):]))
                        if deleter is not None:
                            pool.deleters[t] = deleter
                        grew |= pool.add(r, maker)
                    else:
                        grew |= pool.add(r)
        if not grew:
            break
    return pool
