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

bool Parse(PyObject *args, const char *fn, int n, PyObject **o) {
    std::string format(static_cast<size_t>(n), 'O');
    format += ':';
    format += fn;
    const char *f = format.c_str();
    switch (n) {
    case 0: return PyArg_ParseTuple(args, f) != 0;
    case 1: return PyArg_ParseTuple(args, f, &o[0]) != 0;
    case 2: return PyArg_ParseTuple(args, f, &o[0], &o[1]) != 0;
    case 3: return PyArg_ParseTuple(args, f, &o[0], &o[1], &o[2]) != 0;
    case 4: return PyArg_ParseTuple(args, f, &o[0], &o[1], &o[2], &o[3]) != 0;
    }
    PyErr_SetString(PyExc_SystemError, "too many arguments for a container method");
    return false;
}

PyObject *Overload(const char *fn, std::initializer_list<std::string> prototypes) {
    std::vector<const char *> p;
    for (const std::string &s : prototypes) p.push_back(s.c_str());
    p.push_back(nullptr);
    return OverloadError(fn, p.data());
}

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
