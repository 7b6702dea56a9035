// Scalar and string converters (Python -> C++, returning codes) and builders
// (C++ -> Python), with the error-code table.
//
// The module behaves like a 32-bit interpreter by value: a Python int is at
// most 32 bits wide there, so an int outside the signed 32-bit range is
// handled the way a long of the same value is.
#include "qrinternal.h"

#include <climits>
#include <cstring>

namespace qr {

namespace {

const long kInt32Max = 2147483647L;
const long kInt32Min = -kInt32Max - 1;

bool FitsInt32(long v) { return v >= kInt32Min && v <= kInt32Max; }

// A descriptor looked up by name and kept once found.
swig_type_info *Cached(swig_type_info **slot, const char *name) {
    if (!*slot) *slot = FindTypeByName(name);
    return *slot;
}

char *CopyBytes(const char *p, size_t n) {
    char *c = new char[n];
    std::memcpy(c, p, n);
    return c;
}

}  // namespace

namespace detail {

swig_type_info *CharPtrType() {
    static swig_type_info *ty = nullptr;
    return Cached(&ty, "_p_char");
}

swig_type_info *StdStringType() {
    static swig_type_info *ty = nullptr;
    return Cached(&ty, "std::string *");
}

}  // namespace detail

PyObject *ErrorClassFor(int code) {
    switch (code) {
    case ERR_IO: return PyExc_IOError;
    case ERR_INDEX: return PyExc_IndexError;
    case ERR_TYPE: return PyExc_TypeError;
    case ERR_DIVISION_BY_ZERO: return PyExc_ZeroDivisionError;
    case ERR_OVERFLOW: return PyExc_OverflowError;
    case ERR_SYNTAX: return PyExc_SyntaxError;
    case ERR_VALUE: return PyExc_ValueError;
    case ERR_SYSTEM: return PyExc_SystemError;
    case ERR_ATTRIBUTE: return PyExc_AttributeError;
    case ERR_MEMORY: return PyExc_MemoryError;
    default: return PyExc_RuntimeError;  // ERR_GENERIC, ERR_RUNTIME and the rest
    }
}

void AppendErrorMessage(const char *text) {
    if (PyErr_Occurred()) {
        PyObject *type, *value, *tb;
        PyErr_Fetch(&type, &value, &tb);
        if (value) {
            PyErr_NormalizeException(&type, &value, &tb);
            PyObject *old = PyObject_Str(value);
            if (old) {
                PyErr_Format(type, "%s %s", PyString_AsString(old), text);
                Py_DECREF(old);
            } else {
                PyErr_Clear();
                PyErr_SetString(PyExc_RuntimeError, text);
            }
            Py_XDECREF(type);
            Py_XDECREF(value);
            Py_XDECREF(tb);
            return;
        }
        Py_XDECREF(type);
        Py_XDECREF(tb);
    }
    PyErr_SetString(PyExc_RuntimeError, text);
}

// ---- Converters -------------------------------------------------------------

int ToBool(PyObject *obj, bool *out) {
    int r = PyObject_IsTrue(obj);
    if (r < 0) return ERR_GENERIC;
    if (out) *out = r != 0;
    return 0;
}

int ToInt32(PyObject *obj, int32_t *out) {
    long v;
    if (PyInt_Check(obj)) {
        v = PyInt_AS_LONG(obj);
    } else if (PyLong_Check(obj)) {
        v = PyLong_AsLong(obj);
        if (v == -1 && PyErr_Occurred()) {
            PyErr_Clear();
            return ERR_TYPE;
        }
    } else {
        return ERR_TYPE;
    }
    if (!FitsInt32(v)) return ERR_TYPE;
    if (out) *out = static_cast<int32_t>(v);
    return 0;
}

int ToUint32(PyObject *obj, uint32_t *out) {
    unsigned long u;
    if (PyInt_Check(obj) && FitsInt32(PyInt_AS_LONG(obj))) {
        long v = PyInt_AS_LONG(obj);
        if (v < 0) return ERR_OVERFLOW;
        u = static_cast<unsigned long>(v);
    } else if (PyInt_Check(obj)) {
        long v = PyInt_AS_LONG(obj);  // a long on a 32-bit interpreter
        if (v < 0 || v > 4294967295L) return ERR_TYPE;
        u = static_cast<unsigned long>(v);
    } else if (PyLong_Check(obj)) {
        u = PyLong_AsUnsignedLong(obj);
        if (u == static_cast<unsigned long>(-1) && PyErr_Occurred()) {
            PyErr_Clear();
            return ERR_TYPE;
        }
        if (u > 4294967295UL) return ERR_TYPE;
    } else {
        return ERR_TYPE;
    }
    if (out) *out = static_cast<uint32_t>(u);
    return 0;
}

int ToUint16(PyObject *obj, uint16_t *out) {
    uint32_t v;
    int r = ToUint32(obj, &v);
    if (!IsOk(r)) return r;
    if (v > 65535) return ERR_OVERFLOW;
    if (out) *out = static_cast<uint16_t>(v);
    return 0;
}

int ToUint8(PyObject *obj, uint8_t *out) {
    uint32_t v;
    int r = ToUint32(obj, &v);
    if (!IsOk(r)) return r;
    if (v > 255) return ERR_OVERFLOW;
    if (out) *out = static_cast<uint8_t>(v);
    return 0;
}

int ToUint64(PyObject *obj, uint64_t *out) {
    uint64_t v;
    if (PyLong_Check(obj)) {
        unsigned long long u = PyLong_AsUnsignedLongLong(obj);
        if (u == static_cast<unsigned long long>(-1) && PyErr_Occurred()) {
            PyErr_Clear();
            return ERR_TYPE;
        }
        v = u;
    } else if (PyInt_Check(obj) && !FitsInt32(PyInt_AS_LONG(obj))) {
        long i = PyInt_AS_LONG(obj);  // a long on a 32-bit interpreter
        if (i < 0) return ERR_TYPE;
        v = static_cast<uint64_t>(i);
    } else {
        uint32_t u;
        int r = ToUint32(obj, &u);
        if (!IsOk(r)) return r;
        v = u;
    }
    if (out) *out = v;
    return 0;
}

int ToInt64(PyObject *obj, int64_t *out) {
    int64_t v;
    if (PyLong_Check(obj)) {
        long long l = PyLong_AsLongLong(obj);
        if (l == -1 && PyErr_Occurred()) {
            PyErr_Clear();
            return ERR_TYPE;
        }
        v = l;
    } else if (PyInt_Check(obj)) {
        v = PyInt_AS_LONG(obj);  // every C long fits, int or long alike
    } else {
        return ERR_TYPE;
    }
    if (out) *out = v;
    return 0;
}

int ToChar(PyObject *obj, char *out) {
    char c;
    if (IsOk(ToCharArray(obj, &c, 1))) {
        if (out) *out = c;
        return 0;
    }
    int32_t v;
    int r = ToInt32(obj, &v);
    if (!IsOk(r)) return r;
    if (v < -128 || v > 127) return ERR_OVERFLOW;
    if (out) *out = static_cast<char>(v);
    return 0;
}

int ToCharArray(PyObject *obj, char *out, size_t n) {
    char *p = nullptr;
    size_t size = 0;
    int r = ToCharBuffer(obj, &p, &size, false);
    if (!IsOk(r)) return r;
    if (size == n + 1 && p && p[n] == '\0') size = n;  // the terminator may go
    if (size > n) return ERR_TYPE;
    if (out) {
        if (size) std::memcpy(out, p, size);
        std::memset(out + size, 0, n - size);
    }
    return 0;
}

int ToCharBuffer(PyObject *obj, char **out, size_t *size, bool copy) {
    char *p;
    size_t n;
    if (PyString_Check(obj)) {
        p = PyString_AS_STRING(obj);
        n = static_cast<size_t>(PyString_GET_SIZE(obj)) + 1;
    } else {
        swig_type_info *ty = detail::CharPtrType();
        void *vp = nullptr;
        if (!ty || SWIG_Python_ConvertPtrAndOwn(obj, &vp, ty, 0) != 0) return ERR_TYPE;
        p = static_cast<char *>(vp);
        n = p ? std::strlen(p) + 1 : 0;
    }
    if (size) *size = n;
    if (copy && out && p) {
        *out = CopyBytes(p, n);
        return RESULT_NEW_OBJECT;
    }
    if (out) *out = p;
    return 0;
}

int ToStdString(PyObject *obj, std::string **out) {
    char *p = nullptr;
    size_t size = 0;
    if (IsOk(ToCharBuffer(obj, &p, &size, false))) {
        if (!p) {
            if (out) *out = nullptr;
            return 0;
        }
        if (!out) return 0;
        *out = new std::string(p, size - 1);
        return RESULT_NEW_OBJECT;
    }
    swig_type_info *ty = detail::StdStringType();
    if (!ty) return ERR_GENERIC;
    void *vp = nullptr;
    int r = SWIG_Python_ConvertPtrAndOwn(obj, &vp, ty, 0);
    if (r != 0) return r;
    if (out) *out = static_cast<std::string *>(vp);
    return 0;
}

// ---- Builders ---------------------------------------------------------------

PyObject *NoneResult() {
    Py_INCREF(Py_None);
    return Py_None;
}

PyObject *FromBool(bool v) { return PyBool_FromLong(v ? 1 : 0); }

PyObject *FromInt(long v) { return PyInt_FromLong(v); }

PyObject *FromUint32(uint32_t v) {
    return v > static_cast<uint32_t>(kInt32Max) ? PyLong_FromUnsignedLong(v) : PyInt_FromLong(static_cast<long>(v));
}

PyObject *FromUint64(uint64_t v) {
    return v > static_cast<uint64_t>(kInt32Max) ? PyLong_FromUnsignedLongLong(v)
                                                : PyInt_FromLong(static_cast<long>(v));
}

PyObject *FromInt64(int64_t v) {
    return v >= kInt32Min && v <= kInt32Max ? PyInt_FromLong(static_cast<long>(v)) : PyLong_FromLongLong(v);
}

PyObject *FromChar(char c) { return PyString_FromStringAndSize(&c, 1); }

PyObject *FromCharBuffer(const char *p, size_t n) {
    if (!p) return NoneResult();
    if (n > static_cast<size_t>(kInt32Max)) {
        swig_type_info *ty = detail::CharPtrType();
        return ty ? WrapPointer(const_cast<char *>(p), ty, 0) : NoneResult();
    }
    return PyString_FromStringAndSize(p, static_cast<Py_ssize_t>(n));
}

PyObject *FromCString(const char *p) { return p ? FromCharBuffer(p, std::strlen(p)) : NoneResult(); }

PyObject *FromStdString(const std::string &s) { return FromCharBuffer(s.data(), s.size()); }

PyObject *FromCharArray(const char *p, size_t n) {
    if (!p) return NoneResult();
    while (n && p[n - 1] == '\0') --n;
    return PyString_FromStringAndSize(p, static_cast<Py_ssize_t>(n));
}

}  // namespace qr
