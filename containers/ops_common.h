// Pieces shared by the vector and set operations: argument unpacking, the
// conversion of single elements by kind, the index and slice rules, the
// exception guard, and making and checking iterator objects.
#ifndef QORCTL_CONTAINERS_OPS_COMMON_H
#define QORCTL_CONTAINERS_OPS_COMMON_H

#include "container.h"
#include "iterator.h"
#include "seq.h"

#include <cstdint>
#include <new>
#include <stdexcept>
#include <string>
#include <type_traits>

namespace qr {
namespace cont {

// The descriptor in an in-use slot (null for an absent slot).
inline swig_type_info *Desc(swig_type_info *const *slot) { return slot ? *slot : nullptr; }

// ---- names ---------------------------------------------------------------

// ci.spelled followed by suffix: "std::vector< uint32 >" + "::size_type".
inline std::string Ty(const ContainerInfo &ci, const char *suffix) { return std::string(ci.spelled) + suffix; }
// The container's type with its default arguments spelled out, as library
// parameters declare it: "std::vector< uint32,std::allocator< uint32 > >".
std::string FullSpelling(const char *spelled);
// The element type inside "std::vector< E >" / "std::set< E >".
std::string ElementSpelling(const char *spelled);

// Unpacks exactly n objects with the format "O..O:<fn>" (n <= 4).
bool Parse(PyObject *args, const char *fn, int n, PyObject **o);
// The argument count of an overloaded call, or -1 when args is no tuple.
inline Py_ssize_t ArgCount(PyObject *args) { return PyTuple_Check(args) ? PyTuple_GET_SIZE(args) : -1; }
inline PyObject *ArgAt(PyObject *args, Py_ssize_t i) { return PyTuple_GET_ITEM(args, i); }

// NotImplementedError listing the prototypes (each a full text).
PyObject *Overload(const char *fn, std::initializer_list<std::string> prototypes);

// ---- index and slice rules ------------------------------------------------

// An index into n elements: i < 0 counts from the end (valid when -i <= n),
// i >= 0 must be below n (at most n with allow_end). Else
// std::out_of_range("index out of range").
size_t CheckIndex(long long i, size_t n, bool allow_end = false);
// The end of a slice: negative as above, non-negative clipped to n.
size_t SliceEnd(long long j, size_t n);

// ---- exception guard -----------------------------------------------------

// Runs body; the standard exceptions that container methods throw become
// IndexError / ValueError with their text, and nothing escapes into the
// interpreter.
template <class F>
PyObject *Guard(F &&body) {
    try {
        return body();
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

// ---- single elements -------------------------------------------------------
//
// The element kinds of the single-element methods (append, __getitem__,
// pop, ...): numbers (including uint32 and enumerations, which only whole
// sequences and iterators wrap as pointers), strings, class pointers and
// class values.

enum class Kind { Number, String, Pointer, Value };

template <class E>
constexpr Kind KindOf() {
    if constexpr (std::is_same<E, std::string>::value)
        return Kind::String;
    else if constexpr (std::is_arithmetic<E>::value || std::is_enum<E>::value)
        return Kind::Number;
    else if constexpr (std::is_pointer<E>::value)
        return Kind::Pointer;
    else
        return Kind::Value;
}

template <class T>
bool NumberArg(PyObject *o, T *v, const char *fn, int argn, const char *type) {
    if constexpr (std::is_enum<T>::value) {
        int32_t x;
        if (!ArgInt32(o, &x, fn, argn, type)) return false;
        *v = static_cast<T>(x);
        return true;
    } else if constexpr (std::is_same<T, bool>::value) {
        return ArgBool(o, v, fn, argn, type);
    } else {
        static_assert(sizeof(T) == 1 || sizeof(T) == 2 || sizeof(T) == 4 || sizeof(T) == 8, "number size");
        typedef typename std::conditional<
            std::is_unsigned<T>::value,
            typename std::conditional<sizeof(T) == 1, uint8_t,
                typename std::conditional<sizeof(T) == 2, uint16_t,
                    typename std::conditional<sizeof(T) == 4, uint32_t, uint64_t>::type>::type>::type,
            typename std::conditional<sizeof(T) <= 4, int32_t, int64_t>::type>::type W;
        W x;
        bool ok;
        if constexpr (std::is_same<W, uint8_t>::value) ok = ArgUint8(o, &x, fn, argn, type);
        else if constexpr (std::is_same<W, uint16_t>::value) ok = ArgUint16(o, &x, fn, argn, type);
        else if constexpr (std::is_same<W, uint32_t>::value) ok = ArgUint32(o, &x, fn, argn, type);
        else if constexpr (std::is_same<W, uint64_t>::value) ok = ArgUint64(o, &x, fn, argn, type);
        else if constexpr (std::is_same<W, int32_t>::value) ok = ArgInt32(o, &x, fn, argn, type);
        else ok = ArgInt64(o, &x, fn, argn, type);
        if (ok) *v = static_cast<T>(x);
        return ok;
    }
}

template <class T>
bool NumberProbe(PyObject *o) {
    if constexpr (std::is_enum<T>::value) return ProbeInt32(o);
    else if constexpr (std::is_same<T, bool>::value) return ProbeBool(o);
    else if constexpr (std::is_unsigned<T>::value && sizeof(T) == 1) return ProbeUint8(o);
    else if constexpr (std::is_unsigned<T>::value && sizeof(T) == 2) return ProbeUint16(o);
    else if constexpr (std::is_unsigned<T>::value && sizeof(T) == 4) return ProbeUint32(o);
    else if constexpr (std::is_unsigned<T>::value) return ProbeUint64(o);
    else if constexpr (sizeof(T) <= 4) return ProbeInt32(o);
    else return ProbeInt64(o);
}

template <class T>
PyObject *NumberOut(T v) {
    if constexpr (std::is_enum<T>::value) return FromInt(static_cast<long>(v));
    else if constexpr (std::is_same<T, bool>::value) return FromBool(v);
    else if constexpr (std::is_unsigned<T>::value && sizeof(T) == 4) return FromUint32(v);
    else if constexpr (std::is_unsigned<T>::value && sizeof(T) == 8) return FromUint64(v);
    else if constexpr (std::is_signed<T>::value && sizeof(T) == 8) return FromInt64(v);
    else return FromInt(static_cast<long>(v));
}

// One element argument: converted with the protocol's messages; holds the
// element (or, for class values, a pointer to the caller's object) until
// scope exit.
template <class E, Kind K = KindOf<E>()>
class ElemArg;

template <class E>
class ElemArg<E, Kind::Number> {
public:
    bool Convert(PyObject *o, swig_type_info *, const char *fn, int argn, const char *type, bool = false) {
        return NumberArg(o, &v_, fn, argn, type);
    }
    static bool Probe(PyObject *o, swig_type_info *) { return NumberProbe<E>(o); }
    const E &get() const { return v_; }
private:
    E v_{};
};

template <class E>
class ElemArg<E, Kind::String> {
public:
    // by_value: a std::string parameter (no string: TypeError); otherwise
    // std::string const & (no string: invalid null reference).
    bool Convert(PyObject *o, swig_type_info *, const char *fn, int argn, const char *type, bool by_value = false) {
        return s_.Convert(o, by_value, fn, argn, type);
    }
    static bool Probe(PyObject *o, swig_type_info *) { return ProbeString(o); }
    const E &get() const { return s_.get(); }
private:
    StrArg s_;
};

template <class E>
class ElemArg<E, Kind::Pointer> {
public:
    // None gives a null element.
    bool Convert(PyObject *o, swig_type_info *ety, const char *fn, int argn, const char *type, bool = false) {
        void *p = nullptr;
        if (!ArgPtr(o, &p, ety, fn, argn, type)) return false;
        p_ = static_cast<E>(p);
        return true;
    }
    static bool Probe(PyObject *o, swig_type_info *ety) { return ProbePtr(o, ety); }
    const E &get() const { return p_; }
private:
    E p_ = nullptr;
};

template <class E>
class ElemArg<E, Kind::Value> {
public:
    // None is the invalid-null-reference error.
    bool Convert(PyObject *o, swig_type_info *ety, const char *fn, int argn, const char *type, bool = false) {
        void *p = nullptr;
        if (!ArgRef(o, &p, ety, fn, argn, type)) return false;
        p_ = static_cast<const E *>(p);
        return true;
    }
    static bool Probe(PyObject *o, swig_type_info *ety) { return ProbePtr(o, ety); }
    const E &get() const { return *p_; }
private:
    const E *p_ = nullptr;
};

// An element handed out by value (pop): a class value as an owned copy.
template <class E>
PyObject *ElemValue(const E &v, swig_type_info *ety) {
    constexpr Kind k = KindOf<E>();
    if constexpr (k == Kind::Number) return NumberOut(v);
    else if constexpr (k == Kind::String) return FromStdString(v);
    else if constexpr (k == Kind::Pointer) return WrapPointer((void *)v, ety, 0);
    else return WrapPointer(new E(v), ety, POINTER_OWN);
}

// An element handed out by reference (__getitem__, front, back): a class
// value as a borrowed pointer into the container's storage.
template <class E>
PyObject *ElemRef(E &v, swig_type_info *ety) {
    if constexpr (KindOf<E>() == Kind::Value) return WrapPointer((void *)&v, ety, 0);
    else return ElemValue<E>(v, ety);
}

// ---- iterator objects -----------------------------------------------------

template <class C>
void ForwardRange(const void *owner, typename C::iterator *first, typename C::iterator *last) {
    C *c = const_cast<C *>(static_cast<const C *>(owner));
    *first = c->begin();
    *last = c->end();
}

template <class C>
void ReverseRange(const void *owner, typename C::reverse_iterator *first, typename C::reverse_iterator *last) {
    C *c = const_cast<C *>(static_cast<const C *>(owner));
    *first = c->rbegin();
    *last = c->rend();
}

template <class C, class It>
constexpr typename swig::PySwigIterator_T<It>::RangeFn RangeOf() {
    if constexpr (std::is_same<It, typename C::iterator>::value) return &ForwardRange<C>;
    else return &ReverseRange<C>;
}

// Wraps a new iterator object as owned; frees it when wrapping fails.
PyObject *WrapIterator(swig::PySwigIterator *it, const ContainerInfo &ci);

// An unbounded iterator at pos of container c, owned.
template <class C, class It>
PyObject *OpenIterator(C &c, It pos, const ContainerInfo &ci) {
    typedef typename std::iterator_traits<It>::value_type V;
    return WrapIterator(new swig::PySwigIteratorOpen_T<It>(pos, nullptr, swig::from_oper<V>(Desc(ci.element)), &c,
                                                          RangeOf<C, It>()),
                        ci);
}

// The bounded iterator over [begin, end) of c, keeping seq alive, owned.
template <class C>
PyObject *ClosedIterator(C &c, PyObject *seq, const ContainerInfo &ci) {
    typedef typename C::iterator It;
    typedef typename C::value_type V;
    return WrapIterator(new swig::PySwigIteratorClosed_T<It>(c.begin(), c.begin(), c.end(), seq,
                                                            swig::from_oper<V>(Desc(ci.element)), &c,
                                                            RangeOf<C, It>()),
                        ci);
}

// An iterator argument: an iterator object whose concrete type is
// PySwigIterator_T<It>; anything else (None included) is a TypeError with
// the in-method message and type (e.g. 'std::vector< uint32 >::iterator').
template <class It>
bool IteratorArg(PyObject *o, swig::PySwigIterator_T<It> **out, const ContainerInfo &ci, const char *fn, int argn,
                 const std::string &type) {
    void *p = nullptr;
    // Without the iterator descriptor any wrapped object would pass: refuse.
    swig_type_info *ty = Desc(ci.iterator);
    int r = ty ? SWIG_Python_ConvertPtrAndOwn(o, &p, ty, 0) : ERR_TYPE;
    swig::PySwigIterator_T<It> *it =
        IsOk(r) && p ? dynamic_cast<swig::PySwigIterator_T<It> *>(static_cast<swig::PySwigIterator *>(p)) : nullptr;
    if (!it) {
        ArgError(IsOk(r) ? ERR_TYPE : r, fn, argn, type.c_str());
        return false;
    }
    *out = it;
    return true;
}

// Refuses an iterator of another container object.
void CheckOwner(const void *iterator_owner, const void *container);

}  // namespace cont
}  // namespace qr

#endif
