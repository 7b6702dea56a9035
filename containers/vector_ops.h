// The methods of a vector class, once for every std::vector< E >. Each
// generated wrapper is one call:
//
//   return qr::VectorOps< std::vector< uint32 > >::getitem(args, qi_Uint32Vector);
//
// Each function unpacks its arguments with the wrapper's name from ci,
// converts them with the protocol's messages, runs the operation, and
// returns a new reference or null with a Python exception set.
#ifndef QORCTL_CONTAINERS_VECTOR_OPS_H
#define QORCTL_CONTAINERS_VECTOR_OPS_H

#include "ops_common.h"

#include <algorithm>
#include <vector>

namespace qr {

template <class C>
struct VectorOps {
    typedef typename C::value_type E;
    typedef typename C::iterator It;
    typedef swig::PySwigIterator_T<It> ItObj;
    typedef cont::ElemArg<E> Elem;

    // ---- methods without overloads ------------------------------------------

    static PyObject *iterator(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_iterator, 1, [&](const char *, C &c, PyObject **o) {
            return cont::ClosedIterator(c, o[0], ci);
        });
    }

    static PyObject *nonzero(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_nonzero, 1, [&](const char *, C &c, PyObject **) { return FromBool(!c.empty()); });
    }

    static PyObject *len(PyObject *args, const ContainerInfo &ci) { return Size(args, ci, VM_len); }
    static PyObject *size(PyObject *args, const ContainerInfo &ci) { return Size(args, ci, VM_size); }

    static PyObject *empty(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_empty, 1, [&](const char *, C &c, PyObject **) { return FromBool(c.empty()); });
    }

    static PyObject *capacity(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_capacity, 1,
                      [&](const char *, C &c, PyObject **) { return FromUint32(static_cast<uint32_t>(c.capacity())); });
    }

    static PyObject *pop(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_pop, 1, [&](const char *, C &c, PyObject **) -> PyObject * {
            if (c.empty()) throw std::out_of_range("pop from empty container");
            PyObject *r = cont::ElemValue<E>(c.back(), cont::Desc(ci.element));
            if (r) c.pop_back();
            return r;
        });
    }

    static PyObject *getslice(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_getslice, 3, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            int32_t i, j;
            if (!Index(o[1], &i, ci, fn, 2) || !Index(o[2], &j, ci, fn, 3)) return nullptr;
            size_t n = c.size();
            size_t first = cont::CheckIndex(i, n);
            size_t last = cont::SliceEnd(j, n);
            C *r = last > first ? new C(c.begin() + first, c.begin() + last) : new C();
            return WrapOwned(r, ci, 0);
        });
    }

    static PyObject *setslice(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_setslice, 4, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            int32_t i, j;
            if (!Index(o[1], &i, ci, fn, 2) || !Index(o[2], &j, ci, fn, 3)) return nullptr;
            SeqArg<C> seq;
            if (!seq.Convert(o[3], cont::Desc(ci.container), cont::Desc(ci.element), fn, 4,
                             (cont::FullSpelling(ci.spelled) + " const &").c_str()))
                return nullptr;
            size_t n = c.size();
            size_t first = cont::CheckIndex(i, n, true);
            size_t last = std::max(cont::SliceEnd(j, n), first);
            // The vector itself may come back as the sequence: insert from a copy.
            C self_copy;
            const C *v = &seq.get();
            if (v == &c) {
                self_copy = c;
                v = &self_copy;
            }
            size_t k = last - first;
            if (k > v->size()) {
                c.erase(c.begin() + first, c.begin() + last);
                c.insert(c.begin() + first, v->begin(), v->end());
            } else {
                std::copy(v->begin(), v->begin() + k, c.begin() + first);
                c.insert(c.begin() + last, v->begin() + k, v->end());
            }
            return NoneResult();
        });
    }

    static PyObject *delslice(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_delslice, 3, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            int32_t i, j;
            if (!Index(o[1], &i, ci, fn, 2) || !Index(o[2], &j, ci, fn, 3)) return nullptr;
            size_t n = c.size();
            size_t first = cont::CheckIndex(i, n, true);
            size_t last = cont::SliceEnd(j, n);
            if (first < last) c.erase(c.begin() + first, c.begin() + last);
            return NoneResult();
        });
    }

    static PyObject *delitem(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_delitem, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            int32_t i;
            if (!Index(o[1], &i, ci, fn, 2)) return nullptr;
            c.erase(c.begin() + cont::CheckIndex(i, c.size()));
            return NoneResult();
        });
    }

    static PyObject *getitem(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_getitem, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            int32_t i;
            if (!Index(o[1], &i, ci, fn, 2)) return nullptr;
            return cont::ElemRef<E>(c[cont::CheckIndex(i, c.size())], cont::Desc(ci.element));
        });
    }

    static PyObject *setitem(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_setitem, 3, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            int32_t i;
            Elem e;
            if (!Index(o[1], &i, ci, fn, 2) || !ElemConvert(e, o[2], ci, fn, 3)) return nullptr;
            c[cont::CheckIndex(i, c.size())] = e.get();
            return NoneResult();
        });
    }

    static PyObject *append(PyObject *args, const ContainerInfo &ci) { return PushBack(args, ci, VM_append); }
    static PyObject *push_back(PyObject *args, const ContainerInfo &ci) { return PushBack(args, ci, VM_push_back); }

    static PyObject *clear(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_clear, 1, [&](const char *, C &c, PyObject **) {
            c.clear();
            return NoneResult();
        });
    }

    static PyObject *swap(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_swap, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            void *p = nullptr;
            if (!ArgRef(o[1], &p, cont::Desc(ci.container), fn, 2, cont::Ty(ci, " &").c_str())) return nullptr;
            c.swap(*static_cast<C *>(p));
            return NoneResult();
        });
    }

    static PyObject *get_allocator(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_get_allocator, 1, [&](const char *, C &c, PyObject **) -> PyObject * {
            typedef typename C::allocator_type A;
            A *a = new A(c.get_allocator());
            PyObject *r = WrapPointer(a, cont::Desc(ci.allocator), POINTER_OWN);
            if (!r) delete a;
            return r;
        });
    }

    static PyObject *begin(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_begin, 1,
                      [&](const char *, C &c, PyObject **) { return cont::OpenIterator(c, c.begin(), ci); });
    }
    static PyObject *end(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_end, 1,
                      [&](const char *, C &c, PyObject **) { return cont::OpenIterator(c, c.end(), ci); });
    }
    static PyObject *rbegin(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_rbegin, 1,
                      [&](const char *, C &c, PyObject **) { return cont::OpenIterator(c, c.rbegin(), ci); });
    }
    static PyObject *rend(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_rend, 1,
                      [&](const char *, C &c, PyObject **) { return cont::OpenIterator(c, c.rend(), ci); });
    }

    static PyObject *pop_back(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_pop_back, 1, [&](const char *, C &c, PyObject **) {
            if (c.empty()) throw std::out_of_range("pop_back from empty container");
            c.pop_back();
            return NoneResult();
        });
    }

    static PyObject *front(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_front, 1, [&](const char *, C &c, PyObject **) {
            if (c.empty()) throw std::out_of_range("front of empty container");
            return cont::ElemRef<E>(c.front(), cont::Desc(ci.element));
        });
    }

    static PyObject *back(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_back, 1, [&](const char *, C &c, PyObject **) {
            if (c.empty()) throw std::out_of_range("back of empty container");
            return cont::ElemRef<E>(c.back(), cont::Desc(ci.element));
        });
    }

    static PyObject *assign(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_assign, 3, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            uint32_t n;
            Elem e;
            if (!Count(o[1], &n, ci, fn, 2) || !ElemConvert(e, o[2], ci, fn, 3)) return nullptr;
            c.assign(n, e.get());
            return NoneResult();
        });
    }

    static PyObject *reserve(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, VM_reserve, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            uint32_t n;
            if (!Count(o[1], &n, ci, fn, 2)) return nullptr;
            c.reserve(n);
            return NoneResult();
        });
    }

    // ---- overloaded methods -------------------------------------------------

    // erase(iterator) | erase(iterator, iterator): the iterator after the
    // removed elements.
    static PyObject *erase(PyObject *args, const ContainerInfo &ci) {
        Py_ssize_t argc = cont::ArgCount(args);
        if (argc == 2 && ProbeSelf(args, ci) && ProbeIt(args, 1, ci))
            return Method(args, ci, VM_erase, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
                ItObj *it;
                if (!IteratorArg(o[1], &it, ci, fn, 2)) return nullptr;
                return cont::OpenIterator(c, c.erase(Position(c, it, false)), ci);
            });
        if (argc == 3 && ProbeSelf(args, ci) && ProbeIt(args, 1, ci) && ProbeIt(args, 2, ci))
            return Method(args, ci, VM_erase, 3, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
                ItObj *first, *last;
                if (!IteratorArg(o[1], &first, ci, fn, 2) || !IteratorArg(o[2], &last, ci, fn, 3)) return nullptr;
                It f = Position(c, first, true), l = Position(c, last, true);
                if (l < f) throw std::invalid_argument("invalid iterator range");
                return cont::OpenIterator(c, c.erase(f, l), ci);
            });
        std::string self = Ty(ci, " *"), it = Ty(ci, "::iterator");
        return cont::Overload(ci.names[VM_erase],
                              {"erase(" + self + "," + it + ")", "erase(" + self + "," + it + "," + it + ")"});
    }

    // resize(count) | resize(count, element).
    static PyObject *resize(PyObject *args, const ContainerInfo &ci) {
        Py_ssize_t argc = cont::ArgCount(args);
        if (argc == 2 && ProbeSelf(args, ci) && ProbeUint32(cont::ArgAt(args, 1)))
            return Method(args, ci, VM_resize, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
                uint32_t n;
                if (!Count(o[1], &n, ci, fn, 2)) return nullptr;
                c.resize(n);
                return NoneResult();
            });
        if (argc == 3 && ProbeSelf(args, ci) && ProbeUint32(cont::ArgAt(args, 1)) && ProbeElem(args, 2, ci))
            return Method(args, ci, VM_resize, 3, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
                uint32_t n;
                Elem e;
                if (!Count(o[1], &n, ci, fn, 2) || !ElemConvert(e, o[2], ci, fn, 3)) return nullptr;
                c.resize(n, e.get());
                return NoneResult();
            });
        std::string self = Ty(ci, " *"), size = Ty(ci, "::size_type"), value = Ty(ci, "::value_type const &");
        return cont::Overload(ci.names[VM_resize],
                              {"resize(" + self + "," + size + ")", "resize(" + self + "," + size + "," + value + ")"});
    }

    // insert(iterator, element) -> iterator at the new element |
    // insert(iterator, count, element) -> None.
    static PyObject *insert(PyObject *args, const ContainerInfo &ci) {
        Py_ssize_t argc = cont::ArgCount(args);
        if (argc == 3 && ProbeSelf(args, ci) && ProbeIt(args, 1, ci) && ProbeElem(args, 2, ci))
            return Method(args, ci, VM_insert, 3, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
                ItObj *it;
                Elem e;
                if (!IteratorArg(o[1], &it, ci, fn, 2) || !ElemConvert(e, o[2], ci, fn, 3)) return nullptr;
                return cont::OpenIterator(c, c.insert(Position(c, it, true), e.get()), ci);
            });
        if (argc == 4 && ProbeSelf(args, ci) && ProbeIt(args, 1, ci) && ProbeUint32(cont::ArgAt(args, 2)) &&
            ProbeElem(args, 3, ci))
            return Method(args, ci, VM_insert, 4, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
                ItObj *it;
                uint32_t n;
                Elem e;
                if (!IteratorArg(o[1], &it, ci, fn, 2) || !Count(o[2], &n, ci, fn, 3) ||
                    !ElemConvert(e, o[3], ci, fn, 4))
                    return nullptr;
                c.insert(Position(c, it, true), n, e.get());
                return NoneResult();
            });
        std::string self = Ty(ci, " *"), it = Ty(ci, "::iterator"), size = Ty(ci, "::size_type"),
                    value = Ty(ci, "::value_type const &");
        return cont::Overload(ci.names[VM_insert], {"insert(" + self + "," + it + "," + value + ")",
                                                    "insert(" + self + "," + it + "," + size + "," + value + ")"});
    }

    // new_<Vector>() | (sequence) | (count) | (count, element). With one
    // argument a count is tried before a sequence.
    static PyObject *new_(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[VM_new];
        Py_ssize_t argc = cont::ArgCount(args);
        if (argc == 0)
            return cont::Guard([&]() -> PyObject * {
                if (!cont::Parse(args, fn, 0, nullptr)) return nullptr;
                return WrapOwned(new C(), ci, POINTER_NO_SHADOW);
            });
        if (argc == 1 && ProbeUint32(cont::ArgAt(args, 0)))
            return cont::Guard([&]() -> PyObject * {
                PyObject *o[1];
                uint32_t n;
                if (!cont::Parse(args, fn, 1, o) || !Count(o[0], &n, ci, fn, 1)) return nullptr;
                return WrapOwned(new C(n), ci, POINTER_NO_SHADOW);
            });
        if (argc == 1 && SeqProbe<C>(cont::ArgAt(args, 0), cont::Desc(ci.container), cont::Desc(ci.element)))
            return cont::Guard([&]() -> PyObject * {
                PyObject *o[1];
                if (!cont::Parse(args, fn, 1, o)) return nullptr;
                C *src = nullptr;
                int r = SeqToContainer<C>(o[0], &src, cont::Desc(ci.container), cont::Desc(ci.element));
                std::string type = Ty(ci, " const &");
                if (!IsOk(r)) return ArgError(r, fn, 1, type.c_str());
                if (!src) return NullRefError(fn, 1, type.c_str());
                // A freshly converted sequence becomes the new vector as it is.
                return WrapOwned((r & RESULT_NEW_OBJECT) ? src : new C(*src), ci, POINTER_NO_SHADOW);
            });
        PyErr_Clear();  // a failed sequence probe describes its element
        if (argc == 2 && ProbeUint32(cont::ArgAt(args, 0)) && ProbeElem(args, 1, ci))
            return cont::Guard([&]() -> PyObject * {
                PyObject *o[2];
                uint32_t n;
                Elem e;
                if (!cont::Parse(args, fn, 2, o) || !Count(o[0], &n, ci, fn, 1) || !ElemConvert(e, o[1], ci, fn, 2))
                    return nullptr;
                return WrapOwned(new C(n, e.get()), ci, POINTER_NO_SHADOW);
            });
        std::string s = ci.spelled, size = Ty(ci, "::size_type");
        return cont::Overload(fn, {s + "()", s + "(" + s + " const &)", s + "(" + size + ")",
                                   s + "(" + size + "," + Ty(ci, "::value_type const &") + ")"});
    }

private:
    static std::string Ty(const ContainerInfo &ci, const char *suffix) { return cont::Ty(ci, suffix); }

    // Unpacks n arguments, converts self (argument 1) and runs
    // body(fn, container, objects) under the exception guard.
    template <class F>
    static PyObject *Method(PyObject *args, const ContainerInfo &ci, int slot, int n, F &&body) {
        return cont::Guard([&]() -> PyObject * {
            const char *fn = ci.names[slot];
            PyObject *o[4] = {nullptr, nullptr, nullptr, nullptr};
            C *c = nullptr;
            if (!cont::Parse(args, fn, n, o) || !Self(o[0], &c, ci, fn)) return nullptr;
            return body(fn, *c, o);
        });
    }

    static bool Self(PyObject *o, C **c, const ContainerInfo &ci, const char *fn) {
        void *p = nullptr;
        std::string type = Ty(ci, " *");
        swig_type_info *ty = cont::Desc(ci.container);
        if (!ty) {
            ArgError(ERR_TYPE, fn, 1, type.c_str());
            return false;
        }
        if (!ArgSelf(o, &p, ty, fn, type.c_str())) return false;
        *c = static_cast<C *>(p);
        return true;
    }

    static PyObject *Size(PyObject *args, const ContainerInfo &ci, int slot) {
        return Method(args, ci, slot, 1,
                      [&](const char *, C &c, PyObject **) { return FromUint32(static_cast<uint32_t>(c.size())); });
    }

    static PyObject *PushBack(PyObject *args, const ContainerInfo &ci, int slot) {
        return Method(args, ci, slot, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            Elem e;
            if (!ElemConvert(e, o[1], ci, fn, 2)) return nullptr;
            c.push_back(e.get());
            return NoneResult();
        });
    }

    static bool Index(PyObject *o, int32_t *i, const ContainerInfo &ci, const char *fn, int argn) {
        return ArgInt32(o, i, fn, argn, Ty(ci, "::difference_type").c_str());
    }

    static bool Count(PyObject *o, uint32_t *n, const ContainerInfo &ci, const char *fn, int argn) {
        return ArgUint32(o, n, fn, argn, Ty(ci, "::size_type").c_str());
    }

    static bool ElemConvert(Elem &e, PyObject *o, const ContainerInfo &ci, const char *fn, int argn) {
        return e.Convert(o, cont::Desc(ci.element), fn, argn, Ty(ci, "::value_type const &").c_str());
    }

    static bool IteratorArg(PyObject *o, ItObj **it, const ContainerInfo &ci, const char *fn, int argn) {
        return cont::IteratorArg<It>(o, it, ci, fn, argn, Ty(ci, "::iterator"));
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

    // Overload probes.
    static bool ProbeSelf(PyObject *args, const ContainerInfo &ci) {
        return ProbePtr(cont::ArgAt(args, 0), cont::Desc(ci.container));
    }
    static bool ProbeIt(PyObject *args, Py_ssize_t i, const ContainerInfo &ci) {
        return cont::Desc(ci.iterator) && ProbePtr(cont::ArgAt(args, i), cont::Desc(ci.iterator));
    }
    static bool ProbeElem(PyObject *args, Py_ssize_t i, const ContainerInfo &ci) {
        return Elem::Probe(cont::ArgAt(args, i), cont::Desc(ci.element));
    }
};

}  // namespace qr

#endif
