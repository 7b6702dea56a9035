// The methods of a vector class, once for every std::vector< E >. Each
// generated wrapper is one call:
//
//   return qr::VectorOps< std::vector< uint32 > >::getitem(args, qi_Uint32Vector);
//
// Each function unpacks its arguments with the wrapper's name from ci,
// converts them with the protocol's messages, runs the operation, and
// returns a new reference or null with a Python exception set. Everything
// that does not depend on the element type lives in container.cpp, so an
// instantiation stays small.
#ifndef QORCTL_CONTAINERS_VECTOR_OPS_H
#define QORCTL_CONTAINERS_VECTOR_OPS_H

#include "ops_common.h"

#include <algorithm>
#include <vector>

namespace qr {

template <class C>
struct VectorOps : CommonOps<C, VectorSlots> {
    typedef CommonOps<C, VectorSlots> Base;
    using Base::Enter;
    typedef typename C::value_type E;
    typedef typename C::iterator It;
    typedef swig::PySwigIterator_T<It> ItObj;
    typedef cont::ElemArg<E> Elem;

    // ---- methods without overloads ------------------------------------------


    static PyObject *capacity(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[1];
        C *c;
        return Enter(args, ci, VM_capacity, 1, o, &c) ? FromUint32(static_cast<uint32_t>(c->capacity())) : nullptr;
    }

    static PyObject *pop(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[1];
        C *c;
        if (!Enter(args, ci, VM_pop, 1, o, &c)) return nullptr;
        try {
            if (c->empty()) throw std::out_of_range("pop from empty container");
            PyObject *r = cont::ElemValue<E>(c->back(), cont::Desc(ci.element));
            if (r) c->pop_back();
            return r;
        } catch (...) {
            return cont::Translate();
        }
    }

    static PyObject *getslice(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_getslice];
        PyObject *o[3];
        C *c;
        int32_t i, j;
        if (!Enter(args, ci, VM_getslice, 3, o, &c) || !cont::IndexArg(o[1], &i, ci, fn, 2) ||
            !cont::IndexArg(o[2], &j, ci, fn, 3))
            return nullptr;
        try {
            size_t n = c->size();
            size_t first = cont::CheckIndex(i, n);
            size_t last = cont::SliceEnd(j, n);
            return WrapOwned(last > first ? new C(c->begin() + first, c->begin() + last) : new C(), ci, 0);
        } catch (...) {
            return cont::Translate();
        }
    }

    static PyObject *setslice(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_setslice];
        PyObject *o[4];
        C *c;
        int32_t i, j;
        if (!Enter(args, ci, VM_setslice, 4, o, &c) || !cont::IndexArg(o[1], &i, ci, fn, 2) ||
            !cont::IndexArg(o[2], &j, ci, fn, 3))
            return nullptr;
        try {
            SeqArg<C> seq;
            if (!seq.Convert(o[3], cont::Desc(ci.container), cont::Desc(ci.element), fn, 4,
                             (cont::FullSpelling(ci.spelled) + " const &").c_str()))
                return nullptr;
            size_t n = c->size();
            size_t first = cont::CheckIndex(i, n, true);
            size_t last = std::max(cont::SliceEnd(j, n), first);
            // The vector itself may come back as the sequence: insert from a copy.
            C self_copy;
            const C *v = &seq.get();
            if (v == c) {
                self_copy = *c;
                v = &self_copy;
            }
            size_t k = last - first;
            if (k > v->size()) {
                c->erase(c->begin() + first, c->begin() + last);
                c->insert(c->begin() + first, v->begin(), v->end());
            } else {
                std::copy(v->begin(), v->begin() + k, c->begin() + first);
                c->insert(c->begin() + last, v->begin() + k, v->end());
            }
            return NoneResult();
        } catch (...) {
            return cont::Translate();
        }
    }

    static PyObject *delslice(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_delslice];
        PyObject *o[3];
        C *c;
        int32_t i, j;
        if (!Enter(args, ci, VM_delslice, 3, o, &c) || !cont::IndexArg(o[1], &i, ci, fn, 2) ||
            !cont::IndexArg(o[2], &j, ci, fn, 3))
            return nullptr;
        try {
            size_t n = c->size();
            size_t first = cont::CheckIndex(i, n, true);
            size_t last = cont::SliceEnd(j, n);
            if (first < last) c->erase(c->begin() + first, c->begin() + last);
            return NoneResult();
        } catch (...) {
            return cont::Translate();
        }
    }

    static PyObject *delitem(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[2];
        C *c;
        int32_t i;
        if (!Enter(args, ci, VM_delitem, 2, o, &c) || !cont::IndexArg(o[1], &i, ci, ci.names[VM_delitem], 2))
            return nullptr;
        try {
            c->erase(c->begin() + cont::CheckIndex(i, c->size()));
            return NoneResult();
        } catch (...) {
            return cont::Translate();
        }
    }

    static PyObject *getitem(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[2];
        C *c;
        int32_t i;
        if (!Enter(args, ci, VM_getitem, 2, o, &c) || !cont::IndexArg(o[1], &i, ci, ci.names[VM_getitem], 2))
            return nullptr;
        try {
            return cont::ElemRef<E>((*c)[cont::CheckIndex(i, c->size())], cont::Desc(ci.element));
        } catch (...) {
            return cont::Translate();
        }
    }

    // The element is converted before the index is tested.
    static PyObject *setitem(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_setitem];
        PyObject *o[3];
        C *c;
        int32_t i;
        if (!Enter(args, ci, VM_setitem, 3, o, &c) || !cont::IndexArg(o[1], &i, ci, fn, 2)) return nullptr;
        try {
            Elem e;
            if (!cont::ElemConvert(e, o[2], ci, fn, 3, kValueRef)) return nullptr;
            (*c)[cont::CheckIndex(i, c->size())] = e.get();
            return NoneResult();
        } catch (...) {
            return cont::Translate();
        }
    }

    static PyObject *append(PyObject *args, const ContainerInfo &ci) { return PushBack(args, ci, VM_append); }
    static PyObject *push_back(PyObject *args, const ContainerInfo &ci) { return PushBack(args, ci, VM_push_back); }

    static PyObject *get_allocator(PyObject *args, const ContainerInfo &ci) {
        typedef typename C::allocator_type A;
        PyObject *o[1];
        C *c;
        if (!Enter(args, ci, VM_get_allocator, 1, o, &c)) return nullptr;
        try {
            A *a = new A(c->get_allocator());
            PyObject *r = WrapPointer(a, cont::Desc(ci.allocator), POINTER_OWN);
            if (!r) delete a;
            return r;
        } catch (...) {
            return cont::Translate();
        }
    }


    static PyObject *pop_back(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[1];
        C *c;
        if (!Enter(args, ci, VM_pop_back, 1, o, &c)) return nullptr;
        if (c->empty()) return RaiseStdOutOfRange("pop_back from empty container");
        c->pop_back();
        return NoneResult();
    }

    static PyObject *front(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[1];
        C *c;
        if (!Enter(args, ci, VM_front, 1, o, &c)) return nullptr;
        if (c->empty()) return RaiseStdOutOfRange("front of empty container");
        return cont::ElemRef<E>(c->front(), cont::Desc(ci.element));
    }

    static PyObject *back(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[1];
        C *c;
        if (!Enter(args, ci, VM_back, 1, o, &c)) return nullptr;
        if (c->empty()) return RaiseStdOutOfRange("back of empty container");
        return cont::ElemRef<E>(c->back(), cont::Desc(ci.element));
    }

    static PyObject *assign(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_assign];
        PyObject *o[3];
        C *c;
        uint32_t n;
        if (!Enter(args, ci, VM_assign, 3, o, &c) || !cont::CountArg(o[1], &n, ci, fn, 2)) return nullptr;
        try {
            Elem e;
            if (!cont::ElemConvert(e, o[2], ci, fn, 3, kValueRef)) return nullptr;
            c->assign(n, e.get());
            return NoneResult();
        } catch (...) {
            return cont::Translate();
        }
    }

    static PyObject *reserve(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[2];
        C *c;
        uint32_t n;
        if (!Enter(args, ci, VM_reserve, 2, o, &c) || !cont::CountArg(o[1], &n, ci, ci.names[VM_reserve], 2))
            return nullptr;
        try {
            c->reserve(n);
            return NoneResult();
        } catch (...) {
            return cont::Translate();
        }
    }

    // ---- overloaded methods -------------------------------------------------

    // erase(iterator) | erase(iterator, iterator): the iterator after the
    // removed elements.
    static PyObject *erase(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_erase];
        Py_ssize_t argc = cont::ArgCount(args);
        if (argc == 2 && cont::ProbeSelf(args, ci) && cont::ProbeIterator(args, 1, ci)) {
            PyObject *o[2];
            C *c;
            ItObj *it;
            if (!Enter(args, ci, VM_erase, 2, o, &c) || !cont::IteratorArg(o[1], &it, ci, fn, 2)) return nullptr;
            try {
                return cont::OpenIterator(*c, c->erase(Position(*c, it, false)), ci);
            } catch (...) {
                return cont::Translate();
            }
        }
        if (argc == 3 && cont::ProbeSelf(args, ci) && cont::ProbeIterator(args, 1, ci) &&
            cont::ProbeIterator(args, 2, ci)) {
            PyObject *o[3];
            C *c;
            ItObj *first, *last;
            if (!Enter(args, ci, VM_erase, 3, o, &c) || !cont::IteratorArg(o[1], &first, ci, fn, 2) ||
                !cont::IteratorArg(o[2], &last, ci, fn, 3))
                return nullptr;
            try {
                It f = Position(*c, first, true), l = Position(*c, last, true);
                if (l < f) throw std::invalid_argument("invalid iterator range");
                return cont::OpenIterator(*c, c->erase(f, l), ci);
            } catch (...) {
                return cont::Translate();
            }
        }
        return cont::VectorOverloadError(ci, VM_erase);
    }

    // resize(count) | resize(count, element).
    static PyObject *resize(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_resize];
        Py_ssize_t argc = cont::ArgCount(args);
        if (argc == 2 && cont::ProbeSelf(args, ci) && ProbeUint32(cont::ArgAt(args, 1))) {
            PyObject *o[2];
            C *c;
            uint32_t n;
            if (!Enter(args, ci, VM_resize, 2, o, &c) || !cont::CountArg(o[1], &n, ci, fn, 2)) return nullptr;
            try {
                c->resize(n);
                return NoneResult();
            } catch (...) {
                return cont::Translate();
            }
        }
        if (argc == 3 && cont::ProbeSelf(args, ci) && ProbeUint32(cont::ArgAt(args, 1)) && ProbeElem(args, 2, ci)) {
            PyObject *o[3];
            C *c;
            uint32_t n;
            if (!Enter(args, ci, VM_resize, 3, o, &c) || !cont::CountArg(o[1], &n, ci, fn, 2)) return nullptr;
            try {
                Elem e;
                if (!cont::ElemConvert(e, o[2], ci, fn, 3, kValueRef)) return nullptr;
                c->resize(n, e.get());
                return NoneResult();
            } catch (...) {
                return cont::Translate();
            }
        }
        return cont::VectorOverloadError(ci, VM_resize);
    }

    // insert(iterator, element) -> iterator at the new element |
    // insert(iterator, count, element) -> None.
    static PyObject *insert(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_insert];
        Py_ssize_t argc = cont::ArgCount(args);
        if (argc == 3 && cont::ProbeSelf(args, ci) && cont::ProbeIterator(args, 1, ci) && ProbeElem(args, 2, ci)) {
            PyObject *o[3];
            C *c;
            ItObj *it;
            if (!Enter(args, ci, VM_insert, 3, o, &c) || !cont::IteratorArg(o[1], &it, ci, fn, 2)) return nullptr;
            try {
                Elem e;
                if (!cont::ElemConvert(e, o[2], ci, fn, 3, kValueRef)) return nullptr;
                return cont::OpenIterator(*c, c->insert(Position(*c, it, true), e.get()), ci);
            } catch (...) {
                return cont::Translate();
            }
        }
        if (argc == 4 && cont::ProbeSelf(args, ci) && cont::ProbeIterator(args, 1, ci) &&
            ProbeUint32(cont::ArgAt(args, 2)) && ProbeElem(args, 3, ci)) {
            PyObject *o[4];
            C *c;
            ItObj *it;
            uint32_t n;
            if (!Enter(args, ci, VM_insert, 4, o, &c) || !cont::IteratorArg(o[1], &it, ci, fn, 2) ||
                !cont::CountArg(o[2], &n, ci, fn, 3))
                return nullptr;
            try {
                Elem e;
                if (!cont::ElemConvert(e, o[3], ci, fn, 4, kValueRef)) return nullptr;
                c->insert(Position(*c, it, true), n, e.get());
                return NoneResult();
            } catch (...) {
                return cont::Translate();
            }
        }
        return cont::VectorOverloadError(ci, VM_insert);
    }

    // new_<Vector>() | (sequence) | (count) | (count, element). With one
    // argument a count is tried before a sequence.
    static PyObject *new_(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_new];
        Py_ssize_t argc = cont::ArgCount(args);
        try {
            if (argc == 0) {
                if (!cont::Parse(args, fn, 0, nullptr)) return nullptr;
                return WrapOwned(new C(), ci, POINTER_NO_SHADOW);
            }
            if (argc == 1 && ProbeUint32(cont::ArgAt(args, 0))) {
                PyObject *o[1];
                uint32_t n;
                if (!cont::Parse(args, fn, 1, o) || !cont::CountArg(o[0], &n, ci, fn, 1)) return nullptr;
                return WrapOwned(new C(n), ci, POINTER_NO_SHADOW);
            }
            if (argc == 1 && SeqProbe<C>(cont::ArgAt(args, 0), cont::Desc(ci.container), cont::Desc(ci.element))) {
                PyObject *o[1];
                if (!cont::Parse(args, fn, 1, o)) return nullptr;
                C *src = nullptr;
                int r = SeqToContainer<C>(o[0], &src, cont::Desc(ci.container), cont::Desc(ci.element));
                if (!IsOk(r)) return ArgError(r, fn, 1, cont::TypeText(ci, " const &").c_str());
                if (!src) return NullRefError(fn, 1, cont::TypeText(ci, " const &").c_str());
                // A freshly converted sequence becomes the new vector as it is.
                return WrapOwned((r & RESULT_NEW_OBJECT) ? src : new C(*src), ci, POINTER_NO_SHADOW);
            }
            PyErr_Clear();  // a failed sequence probe describes its element
            if (argc == 2 && ProbeUint32(cont::ArgAt(args, 0)) && ProbeElem(args, 1, ci)) {
                PyObject *o[2];
                uint32_t n;
                Elem e;
                if (!cont::Parse(args, fn, 2, o) || !cont::CountArg(o[0], &n, ci, fn, 1) ||
                    !cont::ElemConvert(e, o[1], ci, fn, 2, kValueRef))
                    return nullptr;
                return WrapOwned(new C(n, e.get()), ci, POINTER_NO_SHADOW);
            }
        } catch (...) {
            return cont::Translate();
        }
        return cont::VectorOverloadError(ci, VM_new);
    }

private:
    static constexpr const char *kValueRef = "::value_type const &";

    static PyObject *PushBack(PyObject *args, const ContainerInfo &ci, int slot) {
        PyObject *o[2];
        C *c;
        if (!Enter(args, ci, slot, 2, o, &c)) return nullptr;
        try {
            Elem e;
            if (!cont::ElemConvert(e, o[1], ci, ci.names[slot], 2, kValueRef)) return nullptr;
            c->push_back(e.get());
            return NoneResult();
        } catch (...) {
            return cont::Translate();
        }
    }

    // The position of an iterator argument in c: it must belong to c and lie
    // in [begin, end] ([begin, end) without allow_end). Positions are
    // compared as numbers, so a stale iterator is refused without reading
    // through it.
    static It Position(C &c, ItObj *it, bool allow_end) {
        cont::CheckOwner(it->owner(), &c);
        ptrdiff_t d = it->get_current() - c.begin();
        ptrdiff_t n = static_cast<ptrdiff_t>(c.size());
        if (d < 0 || d > n || (d == n && !allow_end)) throw std::invalid_argument("iterator out of range");
        return c.begin() + d;
    }

    static PyObject *WrapOwned(C *p, const ContainerInfo &ci, int flags) {
        PyObject *r = WrapPointer(p, cont::Desc(ci.container), POINTER_OWN | flags);
        if (!r) delete p;
        return r;
    }

    static bool ProbeElem(PyObject *args, Py_ssize_t i, const ContainerInfo &ci) {
        return Elem::Probe(cont::ArgAt(args, i), cont::Desc(ci.element));
    }
};

}  // namespace qr

#endif
