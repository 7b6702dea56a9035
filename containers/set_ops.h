// The methods of a set class, once for every std::set< K >. Each generated
// wrapper is one call:
//
//   return qr::SetOps< std::set< std::string > >::insert(args, qi_StringSet);
#ifndef QORCTL_CONTAINERS_SET_OPS_H
#define QORCTL_CONTAINERS_SET_OPS_H

#include "ops_common.h"

#include <iterator>
#include <set>

namespace qr {

template <class C>
struct SetOps : CommonOps<C, SetSlots> {
    typedef CommonOps<C, SetSlots> Base;
    using Base::Enter;
    typedef typename C::key_type K;
    typedef typename C::iterator It;
    typedef swig::PySwigIterator_T<It> ItObj;
    typedef cont::ElemArg<K> Elem;


    // append(value): inserts; the value is passed by value.
    static PyObject *append(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[2];
        C *c;
        if (!Enter(args, ci, SM_append, 2, o, &c)) return nullptr;
        try {
            Elem e;
            if (!cont::ElemConvert(e, o[1], ci, ci.names[SM_append], 2, "::value_type", true)) return nullptr;
            c->insert(e.get());
            return NoneResult();
        } catch (...) {
            return cont::Translate();
        }
    }

    static PyObject *contains(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[2];
        C *c;
        if (!Enter(args, ci, SM_contains, 2, o, &c)) return nullptr;
        try {
            Elem e;
            if (!cont::ElemConvert(e, o[1], ci, ci.names[SM_contains], 2, "::value_type", true)) return nullptr;
            return FromBool(c->find(e.get()) != c->end());
        } catch (...) {
            return cont::Translate();
        }
    }

    // The index-th element in ascending order.
    static PyObject *getitem(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[2];
        C *c;
        int32_t i;
        if (!Enter(args, ci, SM_getitem, 2, o, &c) || !cont::IndexArg(o[1], &i, ci, ci.names[SM_getitem], 2))
            return nullptr;
        try {
            It it = c->begin();
            std::advance(it, static_cast<ptrdiff_t>(cont::CheckIndex(i, c->size())));
            return cont::ElemValue<K>(*it, cont::Desc(ci.element));
        } catch (...) {
            return cont::Translate();
        }
    }

    static PyObject *count(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[2];
        C *c;
        if (!Enter(args, ci, SM_count, 2, o, &c)) return nullptr;
        try {
            Elem e;
            if (!cont::ElemConvert(e, o[1], ci, ci.names[SM_count], 2, kKeyRef)) return nullptr;
            return FromUint32(static_cast<uint32_t>(c->count(e.get())));
        } catch (...) {
            return cont::Translate();
        }
    }


    static PyObject *find(PyObject *args, const ContainerInfo &ci) { return Lookup(args, ci, SM_find); }
    static PyObject *lower_bound(PyObject *args, const ContainerInfo &ci) { return Lookup(args, ci, SM_lower_bound); }
    static PyObject *upper_bound(PyObject *args, const ContainerInfo &ci) { return Lookup(args, ci, SM_upper_bound); }
    // A 2-tuple of iterators: [lower_bound, upper_bound).
    static PyObject *equal_range(PyObject *args, const ContainerInfo &ci) { return Lookup(args, ci, SM_equal_range); }

    // A 2-tuple (iterator at the value, whether it was inserted).
    static PyObject *insert(PyObject *args, const ContainerInfo &ci) {
        PyObject *o[2];
        C *c;
        if (!Enter(args, ci, SM_insert, 2, o, &c)) return nullptr;
        try {
            Elem e;
            if (!cont::ElemConvert(e, o[1], ci, ci.names[SM_insert], 2, "::value_type const &")) return nullptr;
            std::pair<It, bool> r = c->insert(e.get());
            return Pair(cont::OpenIterator(*c, r.first, ci), FromBool(r.second));
        } catch (...) {
            return cont::Translate();
        }
    }

    // erase(key) -> count removed | erase(iterator) | erase(iterator,
    // iterator). With one argument an iterator is tried before a key.
    static PyObject *erase(PyObject *args, const ContainerInfo &ci) {
        const char *fn = ci.names[SM_erase];
        Py_ssize_t argc = cont::ArgCount(args);
        if (argc == 2 && cont::ProbeSelf(args, ci) && cont::ProbeIterator(args, 1, ci)) {
            PyObject *o[2];
            C *c;
            ItObj *it;
            if (!Enter(args, ci, SM_erase, 2, o, &c) || !cont::IteratorArg(o[1], &it, ci, fn, 2)) return nullptr;
            try {
                c->erase(Position(*c, it, false));
                return NoneResult();
            } catch (...) {
                return cont::Translate();
            }
        }
        if (argc == 2 && cont::ProbeSelf(args, ci) && Elem::Probe(cont::ArgAt(args, 1), cont::Desc(ci.element))) {
            PyObject *o[2];
            C *c;
            if (!Enter(args, ci, SM_erase, 2, o, &c)) return nullptr;
            try {
                Elem e;
                if (!cont::ElemConvert(e, o[1], ci, fn, 2, kKeyRef)) return nullptr;
                return FromUint32(static_cast<uint32_t>(c->erase(e.get())));
            } catch (...) {
                return cont::Translate();
            }
        }
        if (argc == 3 && cont::ProbeSelf(args, ci) && cont::ProbeIterator(args, 1, ci) &&
            cont::ProbeIterator(args, 2, ci)) {
            PyObject *o[3];
            C *c;
            ItObj *first, *last;
            if (!Enter(args, ci, SM_erase, 3, o, &c) || !cont::IteratorArg(o[1], &first, ci, fn, 2) ||
                !cont::IteratorArg(o[2], &last, ci, fn, 3))
                return nullptr;
            try {
                std::pair<It, It> r = Range(*c, first, last);
                c->erase(r.first, r.second);
                return NoneResult();
            } catch (...) {
                return cont::Translate();
            }
        }
        return cont::SetOverloadError(ci, SM_erase);
    }

    // new_<Set>(comparator) | () | (set or sequence).
    static PyObject *new_(PyObject *args, const ContainerInfo &ci) {
        typedef typename C::key_compare Cmp;
        const char *fn = ci.names[SM_new];
        Py_ssize_t argc = cont::ArgCount(args);
        try {
            swig_type_info *cmp_ty = cont::CompareType(ci);
            if (argc == 1 && cmp_ty && ProbePtr(cont::ArgAt(args, 0), cmp_ty)) {
                PyObject *o[1];
                void *p = nullptr;
                if (!cont::Parse(args, fn, 1, o) || !cont::CompareArg(o[0], &p, cmp_ty, ci, fn)) return nullptr;
                return WrapOwned(new C(*static_cast<const Cmp *>(p)), ci, POINTER_NO_SHADOW);
            }
            if (argc == 0) {
                if (!cont::Parse(args, fn, 0, nullptr)) return nullptr;
                return WrapOwned(new C(), ci, POINTER_NO_SHADOW);
            }
            if (argc == 1 && SeqProbe<C>(cont::ArgAt(args, 0), cont::Desc(ci.container), cont::Desc(ci.element))) {
                PyObject *o[1];
                if (!cont::Parse(args, fn, 1, o)) return nullptr;
                C *src = nullptr;
                int r = SeqToContainer<C>(o[0], &src, cont::Desc(ci.container), cont::Desc(ci.element));
                if (!IsOk(r)) return ArgError(r, fn, 1, cont::TypeText(ci, " const &").c_str());
                if (!src) return NullRefError(fn, 1, cont::TypeText(ci, " const &").c_str());
                return WrapOwned((r & RESULT_NEW_OBJECT) ? src : new C(*src), ci, POINTER_NO_SHADOW);
            }
            PyErr_Clear();  // a failed sequence probe describes its element
        } catch (...) {
            return cont::Translate();
        }
        return cont::SetOverloadError(ci, SM_new);
    }

private:
    static constexpr const char *kKeyRef = "::key_type const &";

    // find, lower_bound, upper_bound, equal_range.
    static PyObject *Lookup(PyObject *args, const ContainerInfo &ci, int slot) {
        PyObject *o[2];
        C *c;
        if (!Enter(args, ci, slot, 2, o, &c)) return nullptr;
        try {
            Elem e;
            if (!cont::ElemConvert(e, o[1], ci, ci.names[slot], 2, kKeyRef)) return nullptr;
            const K &k = e.get();
            switch (slot) {
            case SM_find: return cont::OpenIterator(*c, c->find(k), ci);
            case SM_lower_bound: return cont::OpenIterator(*c, c->lower_bound(k), ci);
            case SM_upper_bound: return cont::OpenIterator(*c, c->upper_bound(k), ci);
            default: {
                std::pair<It, It> r = c->equal_range(k);
                return Pair(cont::OpenIterator(*c, r.first, ci), cont::OpenIterator(*c, r.second, ci));
            }
            }
        } catch (...) {
            return cont::Translate();
        }
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

    // A new 2-tuple of a and b (both new references, released on failure).
    static PyObject *Pair(PyObject *a, PyObject *b) { return cont::Pair(a, b); }

    static PyObject *WrapOwned(C *p, const ContainerInfo &ci, int flags) {
        PyObject *r = WrapPointer(p, cont::Desc(ci.container), POINTER_OWN | flags);
        if (!r) delete p;
        return r;
    }
};

}  // namespace qr

#endif
