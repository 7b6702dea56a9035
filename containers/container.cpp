// The parts of the container methods that do not depend on the element
// type: names, message texts, argument conversions and overload messages.
#include "ops_common.h"

#include <vector>

namespace qr {

const char *const VectorMethodNames[VM_COUNT] = {
    "iterator", "__nonzero__", "__len__", "pop", "__getslice__", "__setslice__", "__delslice__",
    "__delitem__", "__getitem__", "__setitem__", "append", "empty", "size", "clear", "swap",
    "get_allocator", "begin", "end", "rbegin", "rend", "pop_back", "erase",
    "push_back", "front", "back", "assign", "resize", "insert", "reserve",
    "capacity", "new",
};

const char *const SetMethodNames[SM_COUNT] = {
    "iterator", "__nonzero__", "__len__", "append", "__contains__", "__getitem__", "empty", "size",
    "clear", "swap", "count", "begin", "end", "rbegin", "rend", "erase", "find",
    "lower_bound", "upper_bound", "equal_range", "insert", "new",
};

namespace cont {

// ---- names ---------------------------------------------------------------

std::string TypeText(const ContainerInfo &ci, const char *suffix) { return std::string(ci.spelled) + suffix; }

std::string ElementSpelling(const char *spelled) {
    std::string s = spelled ? spelled : "";
    size_t open = s.find('<'), close = s.rfind('>');
    if (open == std::string::npos || close == std::string::npos || close <= open) return s;
    std::string e = s.substr(open + 1, close - open - 1);
    size_t b = e.find_first_not_of(' '), t = e.find_last_not_of(' ');
    return b == std::string::npos ? std::string() : e.substr(b, t - b + 1);
}

std::string FullSpelling(const char *spelled) {
    std::string s = spelled ? spelled : "";
    std::string e = ElementSpelling(spelled);
    if (s.compare(0, 13, "std::vector< ") == 0) return "std::vector< " + e + ",std::allocator< " + e + " > >";
    if (s.compare(0, 10, "std::set< ") == 0)
        return "std::set< " + e + ",std::less< " + e + " >,std::allocator< " + e + " > >";
    return s;
}

// ---- arguments ---------------------------------------------------------------

// The message texts are built only when a conversion fails.

bool Parse(PyObject *args, const char *fn, int n, PyObject **o) {
    if (PyTuple_Check(args) && PyTuple_GET_SIZE(args) == n) {
        for (int i = 0; i < n; ++i) o[i] = PyTuple_GET_ITEM(args, i);
        return true;
    }
    // The interpreter's own message for a wrong count.
    std::string format(static_cast<size_t>(n), 'O');
    format += ':';
    format += fn;
    return Unpack(args, format.c_str(), n, o);
}

bool Enter(PyObject *args, const ContainerInfo &ci, int slot, int n, PyObject **o, void **self) {
    const char *fn = ci.names[slot];
    if (!Parse(args, fn, n, o)) return false;
    swig_type_info *ty = Desc(ci.container);
    if (ty && o[0] != Py_None && SWIG_Python_ConvertPtrAndOwn(o[0], self, ty, 0) == 0 && *self) return true;
    std::string type = TypeText(ci, " *");
    if (!ty) {
        // Without the descriptor any wrapped object would pass.
        ArgError(ERR_TYPE, fn, 1, type.c_str());
        return false;
    }
    return ArgSelf(o[0], self, ty, fn, type.c_str());
}

bool IndexArg(PyObject *o, int32_t *i, const ContainerInfo &ci, const char *fn, int argn) {
    return IsOk(ToInt32(o, i)) || ArgInt32(o, i, fn, argn, TypeText(ci, "::difference_type").c_str());
}

bool CountArg(PyObject *o, uint32_t *n, const ContainerInfo &ci, const char *fn, int argn) {
    return IsOk(ToUint32(o, n)) || ArgUint32(o, n, fn, argn, TypeText(ci, "::size_type").c_str());
}

bool ContainerRefArg(PyObject *o, void **out, const ContainerInfo &ci, const char *fn, int argn,
                     const char *suffix) {
    std::string type = TypeText(ci, suffix);
    swig_type_info *ty = Desc(ci.container);
    if (!ty) {
        ArgError(ERR_TYPE, fn, argn, type.c_str());
        return false;
    }
    return ArgRef(o, out, ty, fn, argn, type.c_str());
}

swig::PySwigIterator *IteratorObject(PyObject *o, const ContainerInfo &ci, int *code) {
    swig_type_info *ty = Desc(ci.iterator);
    void *p = nullptr;
    *code = ty ? SWIG_Python_ConvertPtrAndOwn(o, &p, ty, 0) : ERR_TYPE;
    return IsOk(*code) ? static_cast<swig::PySwigIterator *>(p) : nullptr;
}

void IteratorTypeError(const ContainerInfo &ci, const char *fn, int argn, int code) {
    ArgError(IsOk(code) ? ERR_TYPE : code, fn, argn, TypeText(ci, "::iterator").c_str());
}

swig_type_info *CompareType(const ContainerInfo &ci) {
    if (swig_type_info *t = Desc(ci.compare)) return t;
    std::string name = "std::less< " + ElementSpelling(ci.spelled) + " > *";
    return FindTypeByName(name.c_str());
}

bool CompareArg(PyObject *o, void **out, swig_type_info *ty, const ContainerInfo &ci, const char *fn) {
    std::string type = "std::less< " + ElementSpelling(ci.spelled) + " > const &";
    return ArgRef(o, out, ty, fn, 1, type.c_str());
}

PyObject *Pair(PyObject *a, PyObject *b) {
    PyObject *t = a && b ? PyTuple_New(2) : nullptr;
    if (!t) {
        Py_XDECREF(a);
        Py_XDECREF(b);
        return nullptr;
    }
    PyTuple_SET_ITEM(t, 0, a);
    PyTuple_SET_ITEM(t, 1, b);
    return t;
}

bool ProbeSelf(PyObject *args, const ContainerInfo &ci) {
    swig_type_info *ty = Desc(ci.container);
    return ty && ProbePtr(ArgAt(args, 0), ty);
}

bool ProbeIterator(PyObject *args, Py_ssize_t i, const ContainerInfo &ci) {
    swig_type_info *ty = Desc(ci.iterator);
    return ty && ProbePtr(ArgAt(args, i), ty);
}

namespace {

PyObject *Overload(const char *fn, const std::vector<std::string> &prototypes) {
    std::vector<const char *> p;
    for (const std::string &s : prototypes) p.push_back(s.c_str());
    p.push_back(nullptr);
    return OverloadError(fn, p.data());
}

}  // namespace

PyObject *VectorOverloadError(const ContainerInfo &ci, int slot) {
    const std::string s = ci.spelled, self = s + " *", it = s + "::iterator", size = s + "::size_type",
                      value = s + "::value_type const &";
    switch (slot) {
    case VM_erase:
        return Overload(ci.names[slot], {"erase(" + self + "," + it + ")", "erase(" + self + "," + it + "," + it + ")"});
    case VM_resize:
        return Overload(ci.names[slot],
                        {"resize(" + self + "," + size + ")", "resize(" + self + "," + size + "," + value + ")"});
    case VM_insert:
        return Overload(ci.names[slot], {"insert(" + self + "," + it + "," + value + ")",
                                         "insert(" + self + "," + it + "," + size + "," + value + ")"});
    case VM_new:
        return Overload(ci.names[slot],
                        {s + "()", s + "(" + s + " const &)", s + "(" + size + ")", s + "(" + size + "," + value + ")"});
    }
    return Overload(ci.names[slot], {});
}

PyObject *SetOverloadError(const ContainerInfo &ci, int slot) {
    const std::string s = ci.spelled, self = s + " *", it = s + "::iterator";
    switch (slot) {
    case SM_erase:
        return Overload(ci.names[slot], {"erase(" + self + "," + s + "::key_type const &)",
                                         "erase(" + self + "," + it + ")", "erase(" + self + "," + it + "," + it + ")"});
    case SM_new: {
        std::string cmp = "std::less< " + ElementSpelling(ci.spelled) + " > const &";
        return Overload(ci.names[slot], {s + "(" + cmp + ")", s + "()", s + "(" + s + " const &)"});
    }
    }
    return Overload(ci.names[slot], {});
}

// ---- index and slice rules ------------------------------------------------

size_t CheckIndex(long long i, size_t n, bool allow_end) {
    if (i < 0) {
        unsigned long long back = 0ULL - static_cast<unsigned long long>(i);
        if (back <= n) return n - static_cast<size_t>(back);
    } else if (static_cast<unsigned long long>(i) < n || (allow_end && static_cast<unsigned long long>(i) == n)) {
        return static_cast<size_t>(i);
    }
    throw std::out_of_range("index out of range");
}

size_t SliceEnd(long long j, size_t n) {
    if (j < 0) return CheckIndex(j, n);
    return static_cast<unsigned long long>(j) < n ? static_cast<size_t>(j) : n;
}

// ---- exceptions and iterators ------------------------------------------------

PyObject *Translate() {
    try {
        throw;
    } catch (const std::out_of_range &e) {
        return RaiseStdOutOfRange(e.what());
    } catch (const std::invalid_argument &e) {
        return RaiseStdInvalidArgument(e.what());
    } catch (const std::bad_alloc &) {
        return PyErr_NoMemory();
    } catch (...) {
        return RaiseForeign();
    }
}

PyObject *WrapIterator(swig::PySwigIterator *it, const ContainerInfo &ci) {
    PyObject *r = WrapPointer(it, Desc(ci.iterator), POINTER_OWN);
    if (!r) delete it;
    return r;
}

void CheckOwner(const void *iterator_owner, const void *container) {
    if (iterator_owner != container) throw std::invalid_argument("iterator does not belong to this container");
}

}  // namespace cont
}  // namespace qr
