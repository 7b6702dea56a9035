"""Hostile argument values for the sweep.

Each entry is (label, factory): the factory builds a fresh value for every
call, because several values change state while they are used (sequences
whose length moves, lists that contain themselves). Factories that need
wrapped objects take the object pool (see surface.py).
"""
import sys
import weakref


# ---- Objects that misbehave when the runtime looks inside them -------------

class OldStyle:
    pass


class OldStyleWithThis:
    def __init__(self, this):
        self.this = this


class NewStyle(object):
    pass


class ThisRaises(object):
    """A "this" lookup that raises something other than AttributeError."""
    @property
    def this(self):
        raise RuntimeError("this is not available")


class ThisIsSelf(object):
    """An object that is its own "this": the lookup must not loop forever."""
    @property
    def this(self):
        return self


class ThisChain(object):
    """A long chain of shadow-like objects, each the "this" of the previous."""
    def __init__(self, depth):
        self.this = ThisChain(depth - 1) if depth else 5


class ThisComputed(object):
    """Hands out a new bare wrapped object on every lookup, so nothing but
    the lookup's result keeps it alive."""
    def __init__(self, make):
        self._make = make

    @property
    def this(self):
        return self._make()


class ThisComputedNoDict(object):
    """The same without an instance dictionary, so "this" is found by the
    generic attribute lookup, which runs the property."""
    __slots__ = ("_make",)

    def __init__(self, make):
        self._make = make

    @property
    def this(self):
        return self._make()


class Slotted(object):
    __slots__ = ("this",)

    def __init__(self, this):
        self.this = this


class TruthRaises(object):
    def __nonzero__(self):
        raise ZeroDivisionError("no truth value")


class LenRaises(object):
    def __len__(self):
        raise RuntimeError("no length")

    def __getitem__(self, i):
        return 1


class GetItemRaises(object):
    def __len__(self):
        return 3

    def __getitem__(self, i):
        raise RuntimeError("item %d" % i)


class Growing(object):
    """Its length grows every time it is read: read naively, it never ends."""
    def __init__(self, item):
        self.n = 1
        self.item = item

    def __len__(self):
        self.n += 1
        return self.n

    def __getitem__(self, i):
        if i >= self.n:
            raise IndexError(i)
        return self.item


class Shrinking(object):
    """Its length drops every time it is read."""
    def __init__(self, item):
        self.n = 8
        self.item = item

    def __len__(self):
        self.n = max(self.n - 3, 0)
        return self.n

    def __getitem__(self, i):
        if i >= self.n:
            raise IndexError(i)
        return self.item


class LyingLength(object):
    """Claims two thousand million elements and has two."""
    def __len__(self):
        return 2 ** 31 - 1

    def __getitem__(self, i):
        if i >= 2:
            raise IndexError(i)
        return "x"


class MutatesList(object):
    """An element whose "this" lookup empties the list being converted."""
    def __init__(self, owner):
        self.owner = owner

    @property
    def this(self):
        del self.owner[:]
        raise AttributeError("this")


class StrSub(str):
    pass


class IntSub(int):
    def __index__(self):
        raise RuntimeError("no index")


class LongSub(long):
    pass


# ---- Classes a script might register for a library type ------------------

class DestroyIsWrong(object):
    """Its destroy function is a builtin that takes one object but deletes
    nothing."""
    __swig_destroy__ = len


class NewRaises(object):
    def __new__(cls, *args):
        raise RuntimeError("no instances")


class NewReturnsNone(object):
    def __new__(cls, *args):
        return None


class BorrowedNew(object):
    """__new__ taken from another built-in type: an instance laid out as
    that type would not fit this class."""
    __new__ = dict.__new__


class OldStyleClass:
    pass


def _self_containing():
    l = []
    l.append(l)
    return l


def _mutating_list():
    l = ["a", "b", "c"]
    l.insert(1, MutatesList(l))
    return l


# ---- Integers at and beyond the converters' boundaries ---------------------

INTEGERS = [
    ("int:-1", -1), ("long:-1L", -1L), ("int:0", 0), ("long:0L", 0L), ("int:1", 1),
    ("int:127", 127), ("int:128", 128), ("int:-129", -129), ("int:255", 255), ("int:256", 256),
    ("int:65535", 65535), ("int:65536", 65536),
    ("int:2**31-1", 2 ** 31 - 1), ("int:2**31", int(2 ** 31)), ("long:2**31", 2L ** 31),
    ("int:-2**31", -2 ** 31), ("int:-2**31-1", int(-2 ** 31 - 1)), ("long:-2**31-1", -2L ** 31 - 1),
    ("int:2**32-1", int(2 ** 32 - 1)), ("long:2**32-1", 2L ** 32 - 1),
    ("int:2**32", int(2 ** 32)), ("long:2**32", 2L ** 32),
    ("int:2**63-1", sys.maxint), ("int:-2**63", -sys.maxint - 1),
    ("long:2**63", 2L ** 63), ("long:-2**63-1", -2L ** 63 - 1),
    ("long:2**64-1", 2L ** 64 - 1), ("long:2**64", 2L ** 64),
    ("long:2**200", 2L ** 200), ("long:-2**200", -2L ** 200),
    ("bool:True", True), ("bool:False", False),
    ("intsub:7", IntSub(7)), ("longsub:2**40", LongSub(2 ** 40)),
]

OTHER_SCALARS = [
    ("float:1.5", 1.5), ("float:nan", float("nan")), ("float:inf", float("inf")), ("float:-0.0", -0.0),
    ("complex:1j", 1j),
    ("str:empty", ""), ("str:nul", "a\0b"), ("str:fmt", "%s%n%x%d"), ("str:bytes", "\xff\xfe\x80"),
    ("str:long", "x" * 70000), ("strsub", StrSub("sub")),
    ("unicode:x", u"x"), ("unicode:euro", u"\u20ac"),
    ("bytearray", bytearray("ab")), ("buffer", buffer("abc")),
]


def values(pool, focus=None):
    """Every hostile value as (label, factory). pool may be None; focus is
    the type the parameter expects, if it is a library class."""
    out = [("None", lambda: None)]
    out += [(label, (lambda v=v: v)) for label, v in INTEGERS + OTHER_SCALARS]
    out += [
        ("list:ints", lambda: [1, 2]), ("list:empty", lambda: []), ("tuple:strs", lambda: ("a", "b")),
        ("dict", lambda: {1: 2}), ("set", lambda: set([1])), ("xrange", lambda: xrange(3)),
        ("list:object", lambda: [object()]), ("list:None", lambda: [None, None]),
        ("list:mixed", lambda: ["a", 1, None, u"u", 2L ** 64]),
        ("list:self", _self_containing), ("list:mutated", _mutating_list),
        ("seq:growing", lambda: Growing("x")), ("seq:growing-int", lambda: Growing(1)),
        ("seq:shrinking", lambda: Shrinking("x")), ("seq:lying-length", LyingLength),
        ("seq:len-raises", LenRaises), ("seq:item-raises", GetItemRaises),
        ("oldstyle", OldStyle), ("oldstyle:this=str", lambda: OldStyleWithThis("this")),
        ("newstyle", NewStyle), ("this-raises", ThisRaises), ("this-is-self", ThisIsSelf),
        ("this-chain", lambda: ThisChain(200)), ("slots:this=int", lambda: Slotted(3)),
        ("truth-raises", TruthRaises),
        ("module", lambda: sys), ("function", lambda: len), ("type", lambda: int),
        ("exception", lambda: ValueError("v")),
        ("class:destroy=len", lambda: DestroyIsWrong), ("class:new-raises", lambda: NewRaises),
        ("class:new-returns-None", lambda: NewReturnsNone), ("class:borrowed-new", lambda: BorrowedNew),
        ("class:oldstyle", lambda: OldStyleClass),
        ("class:exception", lambda: KeyError),
    ]
    if pool is not None:
        out += pool.hostile_objects(focus)
    return out


def for_bool(pool):
    """The values worth passing where a bool is expected: every object is
    accepted by its truth value, so only the failing truth tests and one of
    each truth value matter."""
    return [("None", lambda: None), ("newstyle", NewStyle), ("truth-raises", TruthRaises),
            ("seq:len-raises", LenRaises), ("list:empty", lambda: [])]


def proxy_to(obj):
    return weakref.proxy(obj)
