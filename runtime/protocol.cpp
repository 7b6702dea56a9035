// The helpers generated wrappers call: argument conversion with the
// protocol's messages, overload probes and exception translation.
#include "qrinternal.h"

#include <cstring>
#include <exception>
#include <string>

namespace qr {

namespace {

const char kInMethod[] = "in method '%s', argument %d of type '%s'";

// Reports a failed converter result for an argument.
bool Fail(int code, const char *fn, int argn, const char *type) {
    ArgError(code, fn, argn, type);
    return false;
}

}  // namespace

PyObject *ArgError(int code, const char *fn, int argn, const char *type) {
    PyErr_Format(ErrorClassFor(code == ERR_GENERIC ? ERR_TYPE : code), kInMethod, fn, argn, type);
    return nullptr;
}

PyObject *NullRefError(const char *fn, int argn, const char *type) {
    PyErr_Format(PyExc_ValueError, "invalid null reference in method '%s', argument %d of type '%s'", fn, argn,
                 type);
    return nullptr;
}

PyObject *NullVarError(const char *var, const char *type) {
    PyErr_Format(PyExc_ValueError, "invalid null reference in variable '%s' of type '%s'", var, type);
    return nullptr;
}

PyObject *OverloadError(const char *fn, const char *const *prototypes) {
    std::string msg = "Wrong number of arguments for overloaded function '";
    msg += fn;
    msg += "'.\n  Possible C/C++ prototypes are:\n";
    for (const char *const *p = prototypes; p && *p; ++p) {
        msg += "    ";
        msg += *p;
        msg += "\n";
    }
    PyErr_SetString(PyExc_NotImplementedError, msg.c_str());
    return nullptr;
}

// ---- Class arguments --------------------------------------------------------

bool Unpack(PyObject *args, const char *format, Py_ssize_t n, PyObject **o) {
    if (PyTuple_Check(args) && PyTuple_GET_SIZE(args) == n) {
        for (Py_ssize_t i = 0; i < n; ++i) o[i] = PyTuple_GET_ITEM(args, i);
        return true;
    }
    // The wrong count: the interpreter's own parse gives its usual message.
    switch (n) {
    case 0: return PyArg_ParseTuple(args, format);
    case 1: return PyArg_ParseTuple(args, format, &o[0]);
    case 2: return PyArg_ParseTuple(args, format, &o[0], &o[1]);
    case 3: return PyArg_ParseTuple(args, format, &o[0], &o[1], &o[2]);
    case 4: return PyArg_ParseTuple(args, format, &o[0], &o[1], &o[2], &o[3]);
    case 5: return PyArg_ParseTuple(args, format, &o[0], &o[1], &o[2], &o[3], &o[4]);
    case 6: return PyArg_ParseTuple(args, format, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5]);
    case 7: return PyArg_ParseTuple(args, format, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6]);
    case 8: return PyArg_ParseTuple(args, format, &o[0], &o[1], &o[2], &o[3], &o[4], &o[5], &o[6], &o[7]);
    default:
        PyErr_Format(PyExc_TypeError, "%s takes exactly %d arguments (%d given)",
                     std::strchr(format, ':') ? std::strchr(format, ':') + 1 : format, (int)n,
                     PyTuple_Check(args) ? (int)PyTuple_GET_SIZE(args) : 0);
        return false;
    }
}

bool ArgSelf(PyObject *obj, void **out, swig_type_info *ty, const char *fn, const char *type) {
    return ArgRef(obj, out, ty, fn, 1, type);
}

bool ArgPtr(PyObject *obj, void **out, swig_type_info *ty, const char *fn, int argn, const char *type,
            int flags) {
    int r = SWIG_Python_ConvertPtrAndOwn(obj, out, ty, flags);
    return IsOk(r) || Fail(r, fn, argn, type);
}

bool ArgRef(PyObject *obj, void **out, swig_type_info *ty, const char *fn, int argn, const char *type) {
    if (!ArgPtr(obj, out, ty, fn, argn, type)) return false;
    if (*out) return true;
    NullRefError(fn, argn, type);
    return false;
}

// ---- Scalar arguments -------------------------------------------------------

#define QR_SCALAR_ARG(Name, T)                                                          \
    bool Arg##Name(PyObject *o, T *v, const char *fn, int argn, const char *type) {    \
        int r = To##Name(o, v);                                                         \
        return IsOk(r) || Fail(r, fn, argn, type);                                      \
    }                                                                                   \
    bool Probe##Name(PyObject *o) { return IsOk(To##Name(o, nullptr)); }

QR_SCALAR_ARG(Int32, int32_t)
QR_SCALAR_ARG(Uint32, uint32_t)
QR_SCALAR_ARG(Uint16, uint16_t)
QR_SCALAR_ARG(Uint8, uint8_t)
QR_SCALAR_ARG(Uint64, uint64_t)
QR_SCALAR_ARG(Int64, int64_t)
QR_SCALAR_ARG(Char, char)
#undef QR_SCALAR_ARG

bool ArgBool(PyObject *o, bool *v, const char *fn, int argn, const char *type) {
    int r = ToBool(o, v);
    return IsOk(r) || Fail(r, fn, argn, type);  // replaces the truth test's error
}

bool ProbeBool(PyObject *o) {
    if (IsOk(ToBool(o, nullptr))) return true;
    PyErr_Clear();
    return false;
}

bool ArgCharArray(PyObject *o, char *v, size_t n, const char *fn, int argn, const char *type) {
    int r = ToCharArray(o, v, n);
    return IsOk(r) || Fail(r, fn, argn, type);
}

bool ProbeString(PyObject *o) { return IsOk(ToStdString(o, nullptr)); }

bool ProbePtr(PyObject *o, swig_type_info *ty) {
    // A destroyed object of the right class still selects its overload, whose
    // conversion then reports it.
    int r = SWIG_Python_ConvertPtrAndOwn(o, nullptr, ty, 0);
    return IsOk(r) || r == ERR_VALUE;
}

// ---- String arguments -------------------------------------------------------

bool StrArg::Convert(PyObject *o, bool by_value, const char *fn, int argn, const char *type) {
    int r = ToStdString(o, &p_);
    if (!IsOk(r)) return Fail(by_value ? ERR_TYPE : r, fn, argn, type);
    owned_ = (r & RESULT_NEW_OBJECT) != 0;
    if (p_) return true;
    if (by_value) return Fail(ERR_TYPE, fn, argn, type);
    NullRefError(fn, argn, type);
    return false;
}

bool CharPtrArg::Convert(PyObject *o, const char *fn, int argn, const char *type) {
    // Always a copy: the library may write through a char *, and the text of
    // a Python string must never change.
    int r = ToCharBuffer(o, &p_, nullptr, true);
    if (!IsOk(r)) return Fail(r, fn, argn, type);
    owned_ = (r & RESULT_NEW_OBJECT) != 0;
    return true;
}

// ---- Exceptions -------------------------------------------------------------

PyObject *RaiseLibraryException(void *copy, swig_type_info *ty) {
    PyObject *obj = WrapPointer(copy, ty, POINTER_OWN);
    if (!obj) return nullptr;
    swig_class_data *data = ty ? static_cast<swig_class_data *>(ty->clientdata) : nullptr;
    PyErr_SetObject(data && data->klass ? data->klass : PyExc_RuntimeError, obj);
    Py_DECREF(obj);
    return nullptr;
}

PyObject *RaiseStdOutOfRange(const char *what) {
    PyErr_SetString(PyExc_IndexError, what);
    return nullptr;
}

PyObject *RaiseStdInvalidArgument(const char *what) {
    PyErr_SetString(PyExc_ValueError, what);
    return nullptr;
}

PyObject *RaiseForeign() {
    try {
        throw;
    } catch (const std::exception &e) {
        PyErr_SetString(PyExc_RuntimeError, e.what());
    } catch (...) {
        PyErr_SetString(PyExc_RuntimeError, "unknown C++ exception");
    }
    return nullptr;
}

}  // namespace qr
