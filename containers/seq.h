// Conversion between Python sequences and library containers.
//
// One generic routine per direction, instantiated per container type; the
// element conversion is chosen by the element's kind:
//   number        uint64, int64, ...: ToUint64 / FromUint64 ...
//   string        std::string: ToStdString (a string must result)
//   class pointer T*: a wrapped T (None gives null); out: borrowed
//   class value   T (records, and wrapped scalars such as uint32 and
//                 enumerations): a wrapped T, copied; out: owned copy
#ifndef QORCTL_CONTAINERS_SEQ_H
#define QORCTL_CONTAINERS_SEQ_H

#include "qorrt.h"

#include <set>
#include <stdexcept>
#include <string>
#include <vector>

namespace qr {

// Element name for error messages: the first human name without " *".
std::string ElementName(swig_type_info *ety);
// Sets TypeError with the element's name unless an exception is pending,
// then appends "in sequence element %d ".
void ElementError(swig_type_info *ety, Py_ssize_t index);

// ---- element conversion: Python -> element -------------------------------
inline bool ElemIn(PyObject *o, std::string *out, swig_type_info *) {
    std::string *s = nullptr;
    int r = ToStdString(o, &s);
    if (!IsOk(r) || !s) return false;
    *out = *s;
    if (r & RESULT_NEW_OBJECT) delete s;
    return true;
}
inline bool ElemIn(PyObject *o, uint64_t *out, swig_type_info *) { return IsOk(ToUint64(o, out)); }
inline bool ElemIn(PyObject *o, int64_t *out, swig_type_info *) { return IsOk(ToInt64(o, out)); }
inline bool ElemIn(PyObject *o, uint16_t *out, swig_type_info *) { return IsOk(ToUint16(o, out)); }
inline bool ElemIn(PyObject *o, uint8_t *out, swig_type_info *) { return IsOk(ToUint8(o, out)); }
template <class T>
bool ElemIn(PyObject *o, T **out, swig_type_info *ety) {
    void *p = nullptr;
    if (SWIG_Python_ConvertPtrAndOwn(o, &p, ety, 0) != 0) return false;
    *out = static_cast<T *>(p);
    return true;
}
template <class T>
bool ElemIn(PyObject *o, T *out, swig_type_info *ety) {
    void *p = nullptr;
    if (o == Py_None || SWIG_Python_ConvertPtrAndOwn(o, &p, ety, 0) != 0 || !p) return false;
    *out = *static_cast<T *>(p);
    return true;
}

// ---- element conversion: element -> Python --------------------------------
inline PyObject *ElemOut(const std::string &s, swig_type_info *) { return FromStdString(s); }
inline PyObject *ElemOut(uint64_t v, swig_type_info *) { return FromUint64(v); }
inline PyObject *ElemOut(int64_t v, swig_type_info *) { return FromInt64(v); }
inline PyObject *ElemOut(uint16_t v, swig_type_info *) { return FromInt(v); }
inline PyObject *ElemOut(uint8_t v, swig_type_info *) { return FromInt(v); }
template <class T>
PyObject *ElemOut(T *p, swig_type_info *ety) { return WrapPointer((void *)p, ety, 0); }
template <class T>
PyObject *ElemOut(const T &v, swig_type_info *ety) { return WrapPointer(new T(v), ety, POINTER_OWN); }

template <class T> inline void Add(std::vector<T> &c, const T &v) { c.push_back(v); }
template <class T> inline void Add(std::set<T> &c, const T &v) { c.insert(v); }

// The length of a sequence being read, re-read before each element: a
// sequence that shrinks while it is read ends early. One that grows past the
// length it had at the start is refused, since its elements' own code could
// otherwise keep it growing for ever. -1 with TypeError set when obj stopped
// being a sequence or grew.
inline Py_ssize_t SeqLength(PyObject *obj, Py_ssize_t first) {
    Py_ssize_t n = PySequence_Size(obj);
    if (n < 0) {
        PyErr_Clear();
        PyErr_SetString(PyExc_TypeError, "a sequence is expected");
        return -1;
    }
    if (first >= 0 && n > first) {
        PyErr_SetString(PyExc_TypeError, "the sequence grew while it was read");
        return -1;
    }
    return n;
}

// Sequence (or wrapped container) to container. With out: 0 (a wrapped
// container used as it is, or null for None), RESULT_NEW_OBJECT (a new
// container the caller frees), or ERR_GENERIC with an exception describing
// the element. Without out: a probe that fetches every element and tests
// string elements only.
template <class C>
int SeqToContainer(PyObject *obj, C **out, swig_type_info *cty, swig_type_info *ety) {
    typedef typename C::value_type E;
    // Plain lists and tuples carry no wrapped pointer: skip the lookup.
    bool plain = PyList_CheckExact(obj) || PyTuple_CheckExact(obj);
    if (!plain && (obj == Py_None || GetThisObject(obj))) {
        void *p = nullptr;
        if (SWIG_Python_ConvertPtrAndOwn(obj, out ? &p : nullptr, cty, 0) != 0) return ERR_GENERIC;
        if (out) *out = static_cast<C *>(p);
        return 0;
    }
    PyErr_Clear();
    if (!PySequence_Check(obj)) return ERR_GENERIC;
    const Py_ssize_t first = SeqLength(obj, -1);
    if (first < 0) return ERR_GENERIC;
    if (!out) {
        for (Py_ssize_t i = 0;; ++i) {
            Py_ssize_t n = SeqLength(obj, first);
            if (n < 0) return ERR_GENERIC;
            if (i >= n) break;
            PyObject *item = PySequence_GetItem(obj, i);
            bool ok = item != nullptr;
            if (ok && std::is_same<E, std::string>::value) {
                std::string *s = nullptr;
                int r = ToStdString(item, &s);
                ok = IsOk(r) && s;
                if (r >= 0 && (r & RESULT_NEW_OBJECT)) delete s;
            }
            Py_XDECREF(item);
            if (!ok) {
                PyErr_Format(PyExc_RuntimeError, "in sequence element %d", (int)i);
                return ERR_GENERIC;
            }
        }
        return 0;
    }
    C *c = new C();
    for (Py_ssize_t i = 0;; ++i) {
        Py_ssize_t n = SeqLength(obj, first);
        if (n < 0) {
            delete c;
            return ERR_GENERIC;
        }
        if (i >= n) break;
        PyObject *item = PySequence_GetItem(obj, i);
        E v{};
        bool ok = item && ElemIn(item, &v, ety);
        Py_XDECREF(item);
        if (!ok) {
            ElementError(ety, i);
            delete c;
            return ERR_GENERIC;
        }
        Add(*c, v);
    }
    *out = c;
    return RESULT_NEW_OBJECT;
}

// The probe of an overload dispatcher: like every probe it leaves no
// exception behind, since the dispatcher may go on to call another signature.
template <class C>
bool SeqProbe(PyObject *obj, swig_type_info *cty, swig_type_info *ety) {
    if (IsOk(SeqToContainer<C>(obj, nullptr, cty, ety))) return true;
    PyErr_Clear();
    return false;
}

// Container to a new tuple, in container order.
template <class C>
PyObject *SeqOut(const C &c, swig_type_info *ety) {
    if (c.size() > 2147483647u) {
        PyErr_SetString(PyExc_OverflowError, "sequence size not valid in python");
        return nullptr;
    }
    PyObject *t = PyTuple_New((Py_ssize_t)c.size());
    if (!t) return nullptr;
    Py_ssize_t i = 0;
    for (typename C::const_iterator it = c.begin(); it != c.end(); ++it, ++i) {
        PyObject *e = ElemOut(*it, ety);
        if (!e) {
            Py_DECREF(t);
            return nullptr;
        }
        PyTuple_SET_ITEM(t, i, e);
    }
    return t;
}

// A container parameter: converts, keeps a new container until scope exit.
template <class C>
class SeqArg {
public:
    SeqArg() : p_(nullptr), owned_(false) {}
    ~SeqArg() { if (owned_) delete p_; }
    SeqArg(const SeqArg &) = delete;
    SeqArg &operator=(const SeqArg &) = delete;
    bool Convert(PyObject *o, swig_type_info *cty, swig_type_info *ety, const char *fn, int argn,
                 const char *type) {
        int r = SeqToContainer<C>(o, &p_, cty, ety);
        if (!IsOk(r)) {
            ArgError(r, fn, argn, type);
            return false;
        }
        owned_ = (r & RESULT_NEW_OBJECT) != 0;
        if (!p_) {
            NullRefError(fn, argn, type);
            return false;
        }
        return true;
    }
    C &get() const { return *p_; }
private:
    C *p_;
    bool owned_;
};

}  // namespace qr

#endif
