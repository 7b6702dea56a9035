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
std::string TypeText(const ContainerInfo &ci, const char *suffix);
// The container's type with its default arguments spelled out, as library
// parameters declare it: "std::vector< uint32,std::allocator< uint32 > >".
std::string FullSpelling(const char *spelled);
// The element type inside "std::vector< E >" / "std::set< E >".
std::string ElementSpelling(const char *spelled);

// ---- arguments ---------------------------------------------------------------
//
// Each returns false with the protocol's Python exception set.

// Unpacks exactly n objects with the format "O..O:<fn>" (n <= 4).
bool Parse(PyObject *args, const char *fn, int n, PyObject **o);
// Unpacks the n arguments of method `slot` and converts argument 1, the
// container ('<spelled> *'; None is refused).
bool Enter(PyObject *args, const ContainerInfo &ci, int slot, int n, PyObject **o, void **self);
// An index ('<spelled>::difference_type', signed 32-bit).
bool IndexArg(PyObject *o, int32_t *i, const ContainerInfo &ci, const char *fn, int argn);
// A count ('<spelled>::size_type', uint32).
bool CountArg(PyObject *o, uint32_t *n, const ContainerInfo &ci, const char *fn, int argn);
// Another container of the same class, by reference (suffix " &" or
// " const &"); None is the invalid-null-reference error.
bool ContainerRefArg(PyObject *o, void **out, const ContainerInfo &ci, const char *fn, int argn, const char *suffix);
// An iterator object (any iterator type), or null with *code set. Refused
// when ci has no iterator descriptor.
swig::PySwigIterator *IteratorObject(PyObject *o, const ContainerInfo &ci, int *code);
// The TypeError of an iterator argument of the wrong kind:
// '<spelled>::iterator'.
void IteratorTypeError(const ContainerInfo &ci, const char *fn, int argn, int code);

// Sets only: the comparator's descriptor ("std::less< K > *", from ci or
// looked up by that name), and a comparator argument ('std::less< K > const
// &'; None is the invalid-null-reference error).
swig_type_info *CompareType(const ContainerInfo &ci);
bool CompareArg(PyObject *o, void **out, swig_type_info *ty, const ContainerInfo &ci, const char *fn);

// A new 2-tuple of a and b, which are new references (or null); both are
// released when either is null or the tuple cannot be made.
PyObject *Pair(PyObject *a, PyObject *b);

// The argument count of an overloaded call, or -1 when args is no tuple.
inline Py_ssize_t ArgCount(PyObject *args) { return PyTuple_Check(args) ? PyTuple_GET_SIZE(args) : -1; }
inline PyObject *ArgAt(PyObject *args, Py_ssize_t i) { return PyTuple_GET_ITEM(args, i); }
// Overload probes of the container (argument 1) and of an iterator.
bool ProbeSelf(PyObject *args, const ContainerInfo &ci);
bool ProbeIterator(PyObject *args, Py_ssize_t i, const ContainerInfo &ci);

// NotImplementedError for an overloaded vector / set method (slot), listing
// its prototypes.
PyObject *VectorOverloadError(const ContainerInfo &ci, int slot);
PyObject *SetOverloadError(const ContainerInfo &ci, int slot);

// ---- index and slice rules ------------------------------------------------

// An index into n elements: i < 0 counts from the end (valid when -i <= n),
// i >= 0 must be below n (at most n with allow_end). Else
// std::out_of_range("index out of range").
size_t CheckIndex(long long i, size_t n, bool allow_end = false);
// The end of a slice: negative as above, non-negative clipped to n.
size_t SliceEnd(long long j, size_t n);

// ---- exceptions ------------------------------------------------------------

// Called in a catch (...) block: the standard exceptions that container
// methods throw become IndexError / ValueError with their text; nothing
// escapes into the interpreter. Returns null.
PyObject *Translate();

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

// A number by the converter of its type (enumerations as int32); the
// converter's code. out may be null (a probe).
template <class T>
int NumberTo(PyObject *o, T *out) {
    if constexpr (std::is_enum<T>::value) {
        int32_t x;
        int r = ToInt32(o, &x);
        if (IsOk(r) && out) *out = static_cast<T>(x);
        return r;
    } else if constexpr (std::is_same<T, bool>::value) {
        int r = ToBool(o, out);
        if (!IsOk(r)) PyErr_Clear();  // the truth test's own error
        return r;
    } else {
        static_assert(sizeof(T) == 1 || sizeof(T) == 2 || sizeof(T) == 4 || sizeof(T) == 8, "number size");
        typedef typename std::conditional<
            std::is_unsigned<T>::value,
            typename std::conditional<sizeof(T) == 1, uint8_t,
                typename std::conditional<sizeof(T) == 2, uint16_t,
                    typename std::conditional<sizeof(T) == 4, uint32_t, uint64_t>::type>::type>::type,
            typename std::conditional<sizeof(T) <= 4, int32_t, int64_t>::type>::type W;
        W x;
        int r;
        if constexpr (std::is_same<W, uint8_t>::value) r = ToUint8(o, &x);
        else if constexpr (std::is_same<W, uint16_t>::value) r = ToUint16(o, &x);
        else if constexpr (std::is_same<W, uint32_t>::value) r = ToUint32(o, &x);
        else if constexpr (std::is_same<W, uint64_t>::value) r = ToUint64(o, &x);
        else if constexpr (std::is_same<W, int32_t>::value) r = ToInt32(o, &x);
        else r = ToInt64(o, &x);
        if (IsOk(r) && out) *out = static_cast<T>(x);
        return r;
    }
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
// scope exit. The message's type text is ci.spelled + suffix, built only
// when the conversion fails.
template <class E, Kind K = KindOf<E>()>
class ElemArg;

template <class E>
class ElemArg<E, Kind::Number> {
public:
    bool Convert(PyObject *o, const ContainerInfo &ci, const char *fn, int argn, const char *suffix, bool = false) {
        int r = NumberTo(o, &v_);
        if (IsOk(r)) return true;
        ArgError(r, fn, argn, TypeText(ci, suffix).c_str());
        return false;
    }
    static bool Probe(PyObject *o, swig_type_info *) { return IsOk(NumberTo<E>(o, nullptr)); }
    const E &get() const { return v_; }
private:
    E v_{};
};

template <class E>
class ElemArg<E, Kind::String> {
public:
    ElemArg() = default;
    ElemArg(const ElemArg &) = delete;
    ElemArg &operator=(const ElemArg &) = delete;
    ~ElemArg() {
        if (owned_) delete p_;
    }
    // by_value: a std::string parameter (no string: TypeError); otherwise
    // std::string const & (no string: invalid null reference).
    bool Convert(PyObject *o, const ContainerInfo &ci, const char *fn, int argn, const char *suffix,
                 bool by_value = false) {
        int r = ToStdString(o, &p_);
        if (IsOk(r)) owned_ = (r & RESULT_NEW_OBJECT) != 0;
        if (IsOk(r) && p_) return true;
        std::string type = TypeText(ci, suffix);
        if (IsOk(r) && !by_value) NullRefError(fn, argn, type.c_str());
        else ArgError(by_value ? ERR_TYPE : r, fn, argn, type.c_str());
        return false;
    }
    static bool Probe(PyObject *o, swig_type_info *) { return ProbeString(o); }
    const E &get() const { return *p_; }
private:
    E *p_ = nullptr;
    bool owned_ = false;
};

template <class E>
class ElemArg<E, Kind::Pointer> {
public:
    // None gives a null element.
    bool Convert(PyObject *o, const ContainerInfo &ci, const char *fn, int argn, const char *suffix, bool = false) {
        void *p = nullptr;
        int r = SWIG_Python_ConvertPtrAndOwn(o, &p, Desc(ci.element), 0);
        if (!IsOk(r)) return ArgError(r, fn, argn, TypeText(ci, suffix).c_str()), false;
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
    bool Convert(PyObject *o, const ContainerInfo &ci, const char *fn, int argn, const char *suffix, bool = false) {
        void *p = nullptr;
        int r = SWIG_Python_ConvertPtrAndOwn(o, &p, Desc(ci.element), 0);
        if (IsOk(r) && p) {
            p_ = static_cast<const E *>(p);
            return true;
        }
        std::string type = TypeText(ci, suffix);
        if (IsOk(r)) NullRefError(fn, argn, type.c_str());
        else ArgError(r, fn, argn, type.c_str());
        return false;
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
bool IteratorArg(PyObject *o, swig::PySwigIterator_T<It> **out, const ContainerInfo &ci, const char *fn, int argn) {
    int code = 0;
    swig::PySwigIterator *base = IteratorObject(o, ci, &code);
    *out = base ? dynamic_cast<swig::PySwigIterator_T<It> *>(base) : nullptr;
    if (*out) return true;
    IteratorTypeError(ci, fn, argn, code);
    return false;
}

// An element argument with the type text ci.spelled + suffix.
template <class E>
bool ElemConvert(ElemArg<E> &e, PyObject *o, const ContainerInfo &ci, const char *fn, int argn, const char *suffix,
                 bool by_value = false) {
    return e.Convert(o, ci, fn, argn, suffix, by_value);
}

// Refuses an iterator of another container object.
void CheckOwner(const void *iterator_owner, const void *container);

}  // namespace cont
// Slot numbers of the operations vectors and sets share.
struct VectorSlots {
    enum { iterator = VM_iterator, nonzero = VM_nonzero, empty = VM_empty, len = VM_len, size = VM_size,
           clear = VM_clear, swap = VM_swap, begin = VM_begin, end = VM_end, rbegin = VM_rbegin,
           rend = VM_rend };
};
struct SetSlots {
    enum { iterator = SM_iterator, nonzero = SM_nonzero, empty = SM_empty, len = SM_len, size = SM_size,
           clear = SM_clear, swap = SM_swap, begin = SM_begin, end = SM_end, rbegin = SM_rbegin,
           rend = SM_rend };
};

// The methods every container class has, once for vectors and sets.
template <class C, class S>
struct CommonOps {
    static PyObject *iterator(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[1];
        C *c;
        if (!Enter(args, ci, S::iterator, 1, o, &c)) return nullptr;
        try {
            return cont::ClosedIterator(*c, o[0], ci);
        } catch (...) {
            return cont::Translate();
        }
    }
    static PyObject *nonzero(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[1];
        C *c;
        return Enter(args, ci, S::nonzero, 1, o, &c) ? FromBool(!c->empty()) : nullptr;
    }
    static PyObject *empty(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[1];
        C *c;
        return Enter(args, ci, S::empty, 1, o, &c) ? FromBool(c->empty()) : nullptr;
    }
    static PyObject *len(PyObject *args, const ContainerInfo &ci) { return Size(args, ci, S::len); }
    static PyObject *size(PyObject *args, const ContainerInfo &ci) { return Size(args, ci, S::size); }
    static PyObject *clear(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[1];
        C *c;
        if (!Enter(args, ci, S::clear, 1, o, &c)) return nullptr;
        c->clear();
        return NoneResult();
    }
    static PyObject *swap(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[2];
        C *c;
        void *other = nullptr;
        if (!Enter(args, ci, S::swap, 2, o, &c) ||
            !cont::ContainerRefArg(o[1], &other, ci, ci.names[S::swap], 2, " &"))
            return nullptr;
        c->swap(*static_cast<C *>(other));
        return NoneResult();
    }
    static PyObject *begin(PyObject *args, const ContainerInfo &ci) { return At(args, ci, S::begin); }
    static PyObject *end(PyObject *args, const ContainerInfo &ci) { return At(args, ci, S::end); }
    static PyObject *rbegin(PyObject *args, const ContainerInfo &ci) { return At(args, ci, S::rbegin); }
    static PyObject *rend(PyObject *args, const ContainerInfo &ci) { return At(args, ci, S::rend); }

protected:
    static bool Enter(PyObject *args, const ContainerInfo &ci, int slot, int n, PyObject **o, C **c) {
        void *p = nullptr;
        if (!cont::Enter(args, ci, slot, n, o, &p)) return false;
        *c = static_cast<C *>(p);
        return true;
    }
    static PyObject *Size(PyObject *args, const ContainerInfo &ci, int slot) {
        PyObject *o[1];
        C *c;
        return Enter(args, ci, slot, 1, o, &c) ? FromUint32(static_cast<uint32_t>(c->size())) : nullptr;
    }
    static PyObject *At(PyObject *args, const ContainerInfo &ci, int slot) {
        PyObject *o[1];
        C *c;
        if (!Enter(args, ci, slot, 1, o, &c)) return nullptr;
        try {
            if (slot == S::begin) return cont::OpenIterator(*c, c->begin(), ci);
            if (slot == S::end) return cont::OpenIterator(*c, c->end(), ci);
            if (slot == S::rbegin) return cont::OpenIterator(*c, c->rbegin(), ci);
            return cont::OpenIterator(*c, c->rend(), ci);
        } catch (...) {
            return cont::Translate();
        }
    }
};

}  // namespace qr

#endif
