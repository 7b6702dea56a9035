// The methods of a set class, once for every std::set< K >. Each generated
// wrapper is one call:
//
//   return qr::SetOps< std::set< std::string > >::insert(args, qi_StringSet);
#ifndef QORCTL_CONTAINERS_SET_OPS_H
#define QORCTL_CONTAINERS_SET_OPS_H

#include "ops_common.h"

#include <functional>
#include <iterator>
#include <set>

namespace qr {

template <class C>
struct SetOps {
    typedef typename C::key_type K;
    typedef typename C::iterator It;
    typedef swig::PySwigIterator_T<It> ItObj;
    typedef cont::ElemArg<K> Elem;

    static PyObject *iterator(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_iterator, 1, [&](const char *, C &c, PyObject **o) {
            return cont::ClosedIterator(c, o[0], ci);
        });
    }

    static PyObject *nonzero(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_nonzero, 1, [&](const char *, C &c, PyObject **) { return FromBool(!c.empty()); });
    }
    static PyObject *empty(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_empty, 1, [&](const char *, C &c, PyObject **) { return FromBool(c.empty()); });
    }
    static PyObject *len(PyObject *args, const ContainerInfo &ci) { return Size(args, ci, SM_len); }
    static PyObject *size(PyObject *args, const ContainerInfo &ci) { return Size(args, ci, SM_size); }

    // append(value): inserts; the value is passed by value.
    static PyObject *append(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_append, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            Elem e;
            if (!Convert(e, o[1], ci, fn, 2, "::value_type", true)) return nullptr;
            c.insert(e.get());
            return NoneResult();
        });
    }

    static PyObject *contains(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_contains, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            Elem e;
            if (!Convert(e, o[1], ci, fn, 2, "::value_type", true)) return nullptr;
            return FromBool(c.find(e.get()) != c.end());
        });
    }

    // The index-th element in ascending order.
    static PyObject *getitem(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_getitem, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            int32_t i;
            if (!ArgInt32(o[1], &i, fn, 2, Ty(ci, "::difference_type").c_str())) return nullptr;
            size_t k = cont::CheckIndex(i, c.size());
            It it = c.begin();
            std::advance(it, static_cast<ptrdiff_t>(k));
            return cont::ElemValue<K>(*it, cont::Desc(ci.element));
        });
    }

    static PyObject *clear(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_clear, 1, [&](const char *, C &c, PyObject **) {
            c.clear();
            return NoneResult();
        });
    }

    static PyObject *swap(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_swap, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            void *p = nullptr;
            if (!ArgRef(o[1], &p, cont::Desc(ci.container), fn, 2, Ty(ci, " &").c_str())) return nullptr;
            c.swap(*static_cast<C *>(p));
            return NoneResult();
        });
    }

    static PyObject *count(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_count, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            Elem e;
            if (!Convert(e, o[1], ci, fn, 2, "::key_type const &", false)) return nullptr;
            return FromUint32(static_cast<uint32_t>(c.count(e.get())));
        });
    }

    static PyObject *begin(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_begin, 1,
                      [&](const char *, C &c, PyObject **) { return cont::OpenIterator(c, c.begin(), ci); });
    }
    static PyObject *end(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_end, 1,
                      [&](const char *, C &c, PyObject **) { return cont::OpenIterator(c, c.end(), ci); });
    }
    static PyObject *rbegin(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_rbegin, 1,
                      [&](const char *, C &c, PyObject **) { return cont::OpenIterator(c, c.rbegin(), ci); });
    }
    static PyObject *rend(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_rend, 1,
                      [&](const char *, C &c, PyObject **) { return cont::OpenIterator(c, c.rend(), ci); });
    }

    static PyObject *find(PyObject *args, const ContainerInfo &ci) {
        return Lookup(args, ci, SM_find, [](C &c, const K &k) { return c.find(k); });
    }
    static PyObject *lower_bound(PyObject *args, const ContainerInfo &ci) {
        return Lookup(args, ci, SM_lower_bound, [](C &c, const K &k) { return c.lower_bound(k); });
    }
    static PyObject *upper_bound(PyObject *args, const ContainerInfo &ci) {
        return Lookup(args, ci, SM_upper_bound, [](C &c, const K &k) { return c.upper_bound(k); });
    }

    // A 2-tuple of iterators: [lower_bound, upper_bound).
    static PyObject *equal_range(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_equal_range, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            Elem e;
            if (!Convert(e, o[1], ci, fn, 2, "::key_type const &", false)) return nullptr;
            std::pair<It, It> r = c.equal_range(e.get());
            return Pair(cont::OpenIterator(c, r.first, ci), cont::OpenIterator(c, r.second, ci));
        });
    }

    // A 2-tuple (iterator at the value, whether it was inserted).
    static PyObject *insert(PyObject *args, const ContainerInfo &ci) {
        return Method(args, ci, SM_insert, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            Elem e;
            if (!Convert(e, o[1], ci, fn, 2, "::value_type const &", false)) return nullptr;
            std::pair<It, bool> r = c.insert(e.get());
            return Pair(cont::OpenIterator(c, r.first, ci), FromBool(r.second));
        });
    }

    // erase(key) -> count removed | erase(iterator) | erase(iterator,
    // iterator). With one argument an iterator is tried before a key.
    static PyObject *erase(PyObject *args, const ContainerInfo &ci) {
        Py_ssize_t argc = cont::ArgCount(args);
        if (argc == 2 && ProbeSelf(args, ci) && ProbeIt(args, 1, ci))
            return Method(args, ci, SM_erase, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
                ItObj *it;
                if (!IteratorArg(o[1], &it, ci, fn, 2)) return nullptr;
                c.erase(Position(c, it, false));
                return NoneResult();
            });
        if (argc == 2 && ProbeSelf(args, ci) && Elem::Probe(cont::ArgAt(args, 1), cont::Desc(ci.element)))
            return Method(args, ci, SM_erase, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
                Elem e;
                if (!Convert(e, o[1], ci, fn, 2, "::key_type const &", false)) return nullptr;
                return FromUint32(static_cast<uint32_t>(c.erase(e.get())));
            });
        if (argc == 3 && ProbeSelf(args, ci) && ProbeIt(args, 1, ci) && ProbeIt(args, 2, ci))
            return Method(args, ci, SM_erase, 3, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
                ItObj *first, *last;
                if (!IteratorArg(o[1], &first, ci, fn, 2) || !IteratorArg(o[2], &last, ci, fn, 3)) return nullptr;
                std::pair<It, It> r = Range(c, first, last);
                c.erase(r.first, r.second);
                return NoneResult();
            });
        std::string self = Ty(ci, " *"), it = Ty(ci, "::iterator");
        return cont::Overload(ci.names[SM_erase],
                              {"erase(" + self + "," + Ty(ci, "::key_type const &") + ")",
                               "erase(" + self + "," + it + ")", "erase(" + self + "," + it + "," + it + ")"});
    }

    // new_<Set>(comparator) | () | (set or sequence).
    static PyObject *new_(PyObject *args, const ContainerInfo &ci) {
        typedef typename C::key_compare Cmp;
        const char *fn = ci.names[SM_new];
        Py_ssize_t argc = cont::ArgCount(args);
        std::string cmp_type = "std::less< " + cont::ElementSpelling(ci.spelled) + " >";
        swig_type_info *cmp_ty = CompareType(ci, cmp_type);
        if (argc == 1 && cmp_ty && ProbePtr(cont::ArgAt(args, 0), cmp_ty))
            return cont::Guard([&]() -> PyObject * {
                PyObject *o[1];
                void *p = nullptr;
                if (!cont::Parse(args, fn, 1, o) ||
                    !ArgRef(o[0], &p, cmp_ty, fn, 1, (cmp_type + " const &").c_str()))
                    return nullptr;
                return WrapOwned(new C(*static_cast<const Cmp *>(p)), ci, POINTER_NO_SHADOW);
            });
        if (argc == 0)
            return cont::Guard([&]() -> PyObject * {
                if (!cont::Parse(args, fn, 0, nullptr)) return nullptr;
                return WrapOwned(new C(), ci, POINTER_NO_SHADOW);
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
                return WrapOwned((r & RESULT_NEW_OBJECT) ? src : new C(*src), ci, POINTER_NO_SHADOW);
            });
        PyErr_Clear();  // a failed sequence probe describes its element
        std::string s = ci.spelled;
        return cont::Overload(fn, {s + "(" + cmp_type + " const &)", s + "()", s + "(" + s + " const &)"});
    }

private:
    static std::string Ty(const ContainerInfo &ci, const char *suffix) { return cont::Ty(ci, suffix); }

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

    template <class F>
    static PyObject *Lookup(PyObject *args, const ContainerInfo &ci, int slot, F find) {
        return Method(args, ci, slot, 2, [&](const char *fn, C &c, PyObject **o) -> PyObject * {
            Elem e;
            if (!Convert(e, o[1], ci, fn, 2, "::key_type const &", false)) return nullptr;
            return cont::OpenIterator(c, It(find(c, e.get())), ci);
        });
    }

    static bool Convert(Elem &e, PyObject *o, const ContainerInfo &ci, const char *fn, int argn, const char *suffix,
                        bool by_value) {
        return e.Convert(o, cont::Desc(ci.element), fn, argn, Ty(ci, suffix).c_str(), by_value);
    }

    static bool IteratorArg(PyObject *o, ItObj **it, const ContainerInfo &ci, const char *fn, int argn) {
        return cont::IteratorArg<It>(o, it, ci, fn, argn, Ty(ci, "::iterator"));
    }

    // An iterator argument as a position of c: it must belong to c and be
    // one of c's positions (end() only with allow_end). The search compares
    // positions and never steps through the argument itself.
    static It Position(C &c, ItObj *it, bool allow_end) {
        cont::CheckOwner(it->owner(), &c);
        const It &pos = it->get_current();
        for (It i = c.begin(); i != c.end(); ++i)
            if (i == pos) return i;
        if (allow_end && pos == c.end()) return c.end();
        throw std::invalid_argument("iterator out of range");
    }

    // [first, last) as positions of c, first not after last.
    static std::pair<It, It> Range(C &c, ItObj *first, ItObj *last) {
        It f = Position(c, first, true);
        It l = Position(c, last, true);
        for (It i = f;; ++i) {
            if (i == l) return std::make_pair(f, l);
            if (i == c.end()) break;
        }
        throw std::invalid_argument("invalid iterator range");
    }

    static PyObject *Pair(PyObject *a, PyObject *b) {
        if (!a || !b) {
            Py_XDECREF(a);
            Py_XDECREF(b);
            return nullptr;
        }
        PyObject *t = PyTuple_New(2);
        if (!t) {
            Py_DECREF(a);
            Py_DECREF(b);
            return nullptr;
        }
        PyTuple_SET_ITEM(t, 0, a);
        PyTuple_SET_ITEM(t, 1, b);
        return t;
    }

    static PyObject *WrapOwned(C *p, const ContainerInfo &ci, int flags) {
        PyObject *r = WrapPointer(p, cont::Desc(ci.container), POINTER_OWN | flags);
        if (!r) delete p;
        return r;
    }

    // The comparator's descriptor: the slot in ci, else looked up by name.
    static swig_type_info *CompareType(const ContainerInfo &ci, const std::string &cmp_type) {
        if (swig_type_info *t = cont::Desc(ci.compare)) return t;
        static swig_type_info *found = nullptr;
        if (!found) found = FindTypeByName((cmp_type + " *").c_str());
        return found;
    }

    static bool ProbeSelf(PyObject *args, const ContainerInfo &ci) {
        return ProbePtr(cont::ArgAt(args, 0), cont::Desc(ci.container));
    }
    static bool ProbeIt(PyObject *args, Py_ssize_t i, const ContainerInfo &ci) {
        return cont::Desc(ci.iterator) && ProbePtr(cont::ArgAt(args, i), cont::Desc(ci.iterator));
    }
};

}  // namespace qr

#endif
