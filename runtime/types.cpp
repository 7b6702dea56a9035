// Descriptor lookup over the ring of module records, cast lists, and the two
// boundary crossings: Python object -> library pointer and back.
#include "qrinternal.h"

#include <cstring>

namespace qr {

namespace {

swig_module_record *g_own = nullptr;
PyObject *g_this = nullptr;

swig_type_info *SearchRecord(const swig_module_record *r, const char *name) {
    if (!r->types || r->size == 0) return nullptr;
    size_t lo = 0, hi = r->size - 1;
    while (lo <= hi) {
        size_t mid = (lo + hi) / 2;
        swig_type_info *t = r->types[mid];
        if (!t || !t->name) return nullptr;
        int c = std::strcmp(name, t->name);
        if (c == 0) return t;
        if (c < 0) {
            if (mid == 0) return nullptr;
            hi = mid - 1;
        } else {
            lo = mid + 1;
        }
    }
    return nullptr;
}

// Equality of [a, ae) and [b, be) ignoring blanks.
bool SameIgnoringBlanks(const char *a, const char *ae, const char *b, const char *be) {
    for (;;) {
        while (a != ae && *a == ' ') ++a;
        while (b != be && *b == ' ') ++b;
        if (a == ae || b == be) break;
        if (*a++ != *b++) return false;
    }
    return (ae - a) == (be - b);
}

bool MatchesNameList(const char *list, const char *name) {
    const char *ne = name + std::strlen(name);
    for (const char *p = list;;) {
        const char *e = std::strchr(p, '|');
        if (!e) e = p + std::strlen(p);
        if (SameIgnoringBlanks(p, e, name, ne)) return true;
        if (!*e) return false;
        p = e + 1;
    }
}

PySwigObject *NextView(PySwigObject *s) {
    PyObject *n = s->next;
    return n && IsSwigObject(n) ? reinterpret_cast<PySwigObject *>(n) : nullptr;
}

bool IsDead(const PySwigObject *s) {
    return detail::IsFamilyObject(s) && s->dead;
}

// Whether type->tp_new may be called for cls directly: the checks that
// type.__new__(cls) makes before it allocates. A class registered with a
// borrowed __new__ such as dict.__new__ would otherwise get an object laid
// out as another type.
bool SafeBuiltinNew(PyTypeObject *type, PyTypeObject *cls) {
    if (!type->tp_new || !PyType_IsSubtype(cls, type)) return false;
    PyTypeObject *base = cls;
    while (base && (base->tp_flags & Py_TPFLAGS_HEAPTYPE)) base = base->tp_base;
    return !base || base->tp_new == type->tp_new;
}

// A shadow instance of the registered class holding robj as "this", or null.
PyObject *NewShadow(swig_class_data *data, PyObject *robj) {
    PyObject *inst = nullptr;
    if (data->newraw) {
        PyObject *self = PyCFunction_Check(data->newraw) ? PyCFunction_GET_SELF(data->newraw) : nullptr;
        if (self && PyType_Check(self) && PyTuple_Check(data->newargs) && PyTuple_GET_SIZE(data->newargs) == 1 &&
            PyType_Check(PyTuple_GET_ITEM(data->newargs, 0)) &&
            SafeBuiltinNew(reinterpret_cast<PyTypeObject *>(self),
                           reinterpret_cast<PyTypeObject *>(PyTuple_GET_ITEM(data->newargs, 0)))) {
            // The class keeps a built-in __new__: call the defining type's
            // allocation slot directly, as __new__(cls) would, without a
            // Python-level call per wrapped result.
            static PyObject *empty = PyTuple_New(0);
            PyTypeObject *cls = reinterpret_cast<PyTypeObject *>(PyTuple_GET_ITEM(data->newargs, 0));
            inst = empty ? reinterpret_cast<PyTypeObject *>(self)->tp_new(cls, empty, nullptr) : nullptr;
        } else {
            // The class's __new__ may register the class again, freeing data
            // and what it holds: keep both alive for the call.
            PyObject *newraw = data->newraw, *newargs = data->newargs;
            Py_INCREF(newraw);
            Py_INCREF(newargs);
            inst = PyObject_Call(newraw, newargs, nullptr);
            Py_DECREF(newraw);
            Py_DECREF(newargs);
        }
        if (inst) {
            PyObject **dictptr = _PyObject_GetDictPtr(inst);
            if (dictptr) {
                if (!*dictptr) *dictptr = PyDict_New();
                if (!*dictptr || PyDict_SetItem(*dictptr, detail::ThisKey(), robj) < 0) Py_CLEAR(inst);
            }
        }
    } else if (data->newargs && PyClass_Check(data->newargs)) {
        PyObject *dict = PyDict_New();
        if (dict && PyDict_SetItem(dict, detail::ThisKey(), robj) == 0)
            inst = PyInstance_NewRaw(data->newargs, dict);
        Py_XDECREF(dict);
    }
    return inst;
}

}  // namespace

namespace detail {

PyObject *ThisKey() {
    if (!g_this) g_this = PyString_InternFromString("this");
    return g_this;
}

void ReleaseThisKey() { Py_CLEAR(g_this); }

void SetOwnRecord(swig_module_record *r) { g_own = r; }

}  // namespace detail

swig_module_record *OwnRecord() { return g_own; }

swig_type_info *FindTypeByMangledName(swig_module_record *start, const char *name) {
    if (!start || !name) return nullptr;
    swig_module_record *stop = g_own ? g_own : start;
    swig_module_record *r = start;
    do {
        if (swig_type_info *t = SearchRecord(r, name)) return t;
        r = r->next;
    } while (r && r != stop);
    return nullptr;
}

swig_type_info *FindTypeByName(const char *name) {
    swig_module_record *own = g_own;
    if (!own || !name) return nullptr;
    if (swig_type_info *t = FindTypeByMangledName(own, name)) return t;
    swig_module_record *r = own;
    do {
        for (size_t i = 0; r->types && i < r->size; ++i) {
            swig_type_info *t = r->types[i];
            if (t && t->str && MatchesNameList(t->str, name)) return t;
        }
        r = r->next;
    } while (r && r != own);
    return nullptr;
}

swig_cast_entry *FindCast(const char *source_mangled, swig_type_info *target) {
    if (!target || !source_mangled) return nullptr;
    for (swig_cast_entry *e = target->cast; e; e = e->next) {
        if (!e->type || std::strcmp(e->type->name, source_mangled) != 0) continue;
        if (e != target->cast) {
            e->prev->next = e->next;
            if (e->next) e->next->prev = e->prev;
            e->prev = nullptr;
            e->next = target->cast;
            target->cast->prev = e;
            target->cast = e;
        }
        return e;
    }
    return nullptr;
}

void *CastPointer(swig_cast_entry *entry, void *p) {
    if (!entry || !entry->converter) return p;
    int new_memory = 0;
    return entry->converter(p, &new_memory);
}

const char *DisplayName(const swig_type_info *ty) {
    if (!ty) return "unknown";
    if (!ty->str) return ty->name;
    const char *bar = std::strrchr(ty->str, '|');
    return bar ? bar + 1 : ty->str;
}

PySwigObject *GetThisObject(PyObject *obj) {
    PyObject *key = detail::ThisKey();
    // "this" chains are short; the bound stops an object that is its own
    // "this" (directly or through others) from hanging the interpreter.
    for (int depth = 0; obj && depth < 64; ++depth) {
        if (IsSwigObject(obj)) return reinterpret_cast<PySwigObject *>(obj);
        PyObject *found = nullptr;
        if (PyInstance_Check(obj)) {
            found = _PyInstance_Lookup(obj, key);
        } else if (PyObject **dictptr = _PyObject_GetDictPtr(obj)) {
            found = *dictptr ? PyDict_GetItem(*dictptr, key) : nullptr;
        } else if (PyWeakref_CheckProxy(obj)) {
            found = PyWeakref_GET_OBJECT(obj);
            if (found == Py_None) found = nullptr;  // the referent is gone
        } else {
            found = PyObject_GetAttr(obj, key);
            if (!found) {
                PyErr_Clear();
            } else if (Py_REFCNT(found) == 1) {
                // Made by the lookup itself (a property computing it): nothing
                // would keep it, or the library object it may own, alive for
                // the call, so the object does not count as wrapped.
                Py_DECREF(found);
                found = nullptr;
            } else {
                Py_DECREF(found);
            }
        }
        obj = found;
    }
    return nullptr;
}

int SWIG_Python_ConvertPtrAndOwn(PyObject *obj, void **out, swig_type_info *ty, int flags) {
    if (!obj) return ERR_GENERIC;
    if (obj == Py_None) {
        if (out) *out = nullptr;
        return 0;
    }
    for (PySwigObject *s = GetThisObject(obj); s; s = NextView(s)) {
        swig_cast_entry *entry = nullptr;
        if (ty && s->ty != ty) {
            entry = s->ty ? FindCast(s->ty->name, ty) : nullptr;
            if (!entry) continue;
        }
        // Checked before any cast: a converter reads the object's vtable.
        if (IsDead(s)) return ERR_VALUE;
        // Only an object Python owns may be destroyed: a borrowed one belongs
        // to the library (or lives inside another object's storage).
        if ((flags & POINTER_DESTROY) && s->own != 1) return ERR_VALUE;
        if (out) *out = CastPointer(entry, s->ptr);
        if (flags & POINTER_DISOWN) s->own = 0;
        if ((flags & POINTER_DESTROY) && detail::IsFamilyObject(s)) s->dead = 1;
        return 0;
    }
    return ERR_GENERIC;
}

PyObject *WrapPointer(void *p, swig_type_info *ty, int flags) {
    if (!p) return NoneResult();
    PyObject *robj = NewSwigObject(p, ty, flags & POINTER_OWN);
    if (!robj) return nullptr;
    swig_class_data *data = ty ? static_cast<swig_class_data *>(ty->clientdata) : nullptr;
    if (data && !(flags & POINTER_NO_SHADOW)) {
        if (PyObject *inst = NewShadow(data, robj)) {
            Py_DECREF(robj);
            return inst;
        }
        PyErr_Clear();  // fall back to the bare object
    }
    return robj;
}

PyObject *WrapPointerKeep(void *p, swig_type_info *ty, PyObject *parent) {
    PyObject *r = WrapPointer(p, ty, 0);
    if (r && r != Py_None && parent) {
        PySwigObject *s = GetThisObject(r);
        if (s && detail::IsFamilyObject(s) && !s->keep) {
            Py_INCREF(parent);
            s->keep = parent;
        }
    }
    return r;
}

}  // namespace qr
