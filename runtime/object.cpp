// The wrapped-pointer object PySwigObject and the packed-value object
// PySwigPacked. Both types are built on first use and readied lazily by the
// interpreter's generic attribute lookup.
#include "qrinternal.h"

#include <unordered_map>

#include <cinttypes>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>

namespace qr {

namespace {

const char kObjectDoc[] = "Swig object carries a C/C++ instance pointer";

PySwigObject *Self(PyObject *o) { return reinterpret_cast<PySwigObject *>(o); }
PySwigPacked *Packed(PyObject *o) { return reinterpret_cast<PySwigPacked *>(o); }

PyObject *FormatPointer(const char *fmt, const void *p) {
    char buf[32];
    std::snprintf(buf, sizeof buf, fmt, reinterpret_cast<uintptr_t>(p));
    return PyString_FromString(buf);
}

// ---- PySwigObject slots -----------------------------------------------------

PyObject *obj_repr(PyObject *v) {
    PySwigObject *s = Self(v);
    char hex[32];
    std::snprintf(hex, sizeof hex, "%" PRIxPTR, reinterpret_cast<uintptr_t>(s->ptr));
    PyObject *r = PyString_FromFormat("<Swig Object of type '%s' at 0x%s>", DisplayName(s->ty), hex);
    if (r && s->next) PyString_ConcatAndDel(&r, PyObject_Repr(s->next));
    return r;
}

PyObject *obj_str(PyObject *v) {
    PySwigObject *s = Self(v);
    const char *name = s->ty ? s->ty->name : "";
    std::string buf(2 * sizeof(void *) + 2 + std::strlen(name), '\0');
    PackedText(&buf[0], buf.size(), &s->ptr, sizeof s->ptr, name);
    return PyString_FromString(buf.c_str());
}

int obj_print(PyObject *v, FILE *fp, int) {
    PyObject *r = obj_repr(v);
    if (!r) return 1;
    std::fputs(PyString_AS_STRING(r), fp);
    Py_DECREF(r);
    return 0;
}

int obj_compare(PyObject *a, PyObject *b) {
    uintptr_t x = reinterpret_cast<uintptr_t>(Self(a)->ptr), y = reinterpret_cast<uintptr_t>(Self(b)->ptr);
    return x < y ? -1 : (x > y ? 1 : 0);
}

PyObject *obj_int(PyObject *v) { return FromUint64(reinterpret_cast<uintptr_t>(Self(v)->ptr)); }
PyObject *obj_hex(PyObject *v) { return FormatPointer("%" PRIxPTR, Self(v)->ptr); }
PyObject *obj_oct(PyObject *v) { return FormatPointer("%" PRIoPTR, Self(v)->ptr); }

// Destroys the library object through the class's destroy function.
// Returns false when the destroy function resurrected v.
bool Destroy(PyObject *v, swig_class_data *data) {
    PySwigObject *s = Self(v);
    PyObject *et, *ev, *etb;
    PyErr_Fetch(&et, &ev, &etb);
    // The call may register the class again, which frees data: keep what is
    // used after it.
    PyObject *destroy = data->destroy;
    Py_INCREF(destroy);
    PyObject *res;
    bool alive = false;
    if (data->delargs) {
        // The temporary stands for the owning object during the call (so
        // delete_<Class> accepts it); it never destroys anything itself.
        PyObject *tmp = NewSwigObject(s->ptr, s->ty, 1);
        res = tmp ? PyObject_CallFunctionObjArgs(destroy, tmp, nullptr) : nullptr;
        if (tmp) reinterpret_cast<PySwigObject *>(tmp)->own = 0;
        Py_XDECREF(tmp);
    } else {
        // The function receives v itself: hold a reference for the call.
        Py_REFCNT(v) = 1;
        res = PyCFunction_GET_FUNCTION(destroy)(PyCFunction_GET_SELF(destroy), v);
        alive = --Py_REFCNT(v) != 0;
    }
    if (res)
        Py_DECREF(res);
    else
        PyErr_WriteUnraisable(destroy);
    Py_DECREF(destroy);
    PyErr_Restore(et, ev, etb);
    return !alive;
}

// Deleters of types that have no wrapper class (scalars, opaque records,
// standard exceptions), registered by the module that can delete them.
std::unordered_map<const swig_type_info *, Deleter> &Deleters() {
    static std::unordered_map<const swig_type_info *, Deleter> map;
    return map;
}

Deleter FindDeleter(const swig_type_info *ty) {
    auto it = Deleters().find(ty);
    return it == Deleters().end() ? nullptr : it->second;
}

void obj_dealloc(PyObject *v) {
    PySwigObject *s = Self(v);
    if (s->own == 1 && !s->dead) {
        swig_class_data *data = s->ty ? static_cast<swig_class_data *>(s->ty->clientdata) : nullptr;
        Deleter deleter = nullptr;
        if (data && data->destroy) {
            if (!Destroy(v, data)) return;
        } else if (s->ty && (deleter = FindDeleter(s->ty))) {
            deleter(s->ptr);
        } else {
            std::printf("swig/python detected a memory leak of type '%s', no destructor found.\n",
                        DisplayName(s->ty));
        }
    }
    Py_XDECREF(s->next);
    Py_XDECREF(s->keep);
    PyObject_Del(v);
}

// ---- PySwigObject methods ---------------------------------------------------

PyObject *m_disown(PyObject *v, PyObject *) {
    Self(v)->own = 0;
    return NoneResult();
}

PyObject *m_acquire(PyObject *v, PyObject *) {
    Self(v)->own = 1;
    return NoneResult();
}

PyObject *m_own(PyObject *v, PyObject *args) {
    PyObject *val = nullptr;
    if (!PyArg_UnpackTuple(args, "own", 0, 1, &val)) return nullptr;
    PyObject *prev = PyBool_FromLong(Self(v)->own);
    if (val) {
        int t = PyObject_IsTrue(val);
        if (t < 0) {
            Py_DECREF(prev);
            return nullptr;
        }
        Self(v)->own = t ? 1 : 0;
    }
    return prev;
}

PyObject *m_append(PyObject *v, PyObject *other) {
    if (!IsSwigObject(other)) {
        PyErr_SetString(PyExc_TypeError, "append: the argument must be a wrapped-pointer object");
        return nullptr;
    }
    // A chain that leads back to v would make lookups and repr loop forever.
    for (PyObject *o = other; o; o = Self(o)->next) {
        if (o == v) {
            PyErr_SetString(PyExc_ValueError, "append: the object is already in this chain");
            return nullptr;
        }
        if (!IsSwigObject(o)) break;
    }
    Py_INCREF(other);
    Py_XSETREF(Self(v)->next, other);
    return NoneResult();
}

PyObject *m_next(PyObject *v, PyObject *) {
    PyObject *n = Self(v)->next ? Self(v)->next : Py_None;
    Py_INCREF(n);
    return n;
}

PyObject *m_repr(PyObject *v, PyObject *) { return obj_repr(v); }

PyTypeObject *MakeObjectType() {
    static PyNumberMethods number;
    static PyMethodDef methods[] = {
        {"disown", m_disown, METH_NOARGS, "releases ownership of the pointer"},
        {"acquire", m_acquire, METH_NOARGS, "aquires ownership of the pointer"},
        {"own", m_own, METH_VARARGS, "returns/sets ownership of the pointer"},
        {"append", m_append, METH_O, "appends another 'this' object"},
        {"next", m_next, METH_NOARGS, "returns the next 'this' object"},
        {"__repr__", m_repr, METH_NOARGS, "returns object representation"},
        {nullptr, nullptr, 0, nullptr},
    };
    static PyTypeObject t;
    number.nb_int = obj_int;
    number.nb_long = obj_int;
    number.nb_oct = obj_oct;
    number.nb_hex = obj_hex;
    t.ob_refcnt = 1;
    t.ob_type = &PyType_Type;
    t.tp_name = "PySwigObject";
    t.tp_basicsize = sizeof(PySwigObject);
    t.tp_dealloc = obj_dealloc;
    t.tp_print = obj_print;
    t.tp_compare = obj_compare;
    t.tp_repr = obj_repr;
    t.tp_as_number = &number;
    t.tp_str = obj_str;
    t.tp_getattro = PyObject_GenericGetAttr;
    t.tp_flags = Py_TPFLAGS_DEFAULT;
    t.tp_doc = kObjectDoc;
    t.tp_methods = methods;
    return &t;
}

// ---- PySwigPacked -----------------------------------------------------------

const char *PackedName(PyObject *v) { return Packed(v)->ty ? Packed(v)->ty->name : ""; }

PyObject *packed_repr(PyObject *v) {
    char hex[1024];
    if (detail::HexText(hex, sizeof hex, Packed(v)->pack, Packed(v)->size))
        return PyString_FromFormat("<Swig Packed at %s%s>", hex, PackedName(v));
    return PyString_FromFormat("<Swig Packed %s>", PackedName(v));
}

PyObject *packed_str(PyObject *v) {
    char hex[1024];
    if (detail::HexText(hex, sizeof hex, Packed(v)->pack, Packed(v)->size))
        return PyString_FromFormat("%s%s", hex, PackedName(v));
    return PyString_FromString(PackedName(v));
}

int packed_print(PyObject *v, FILE *fp, int) {
    char hex[1024];
    std::fputs("<Swig Packed ", fp);
    if (detail::HexText(hex, sizeof hex, Packed(v)->pack, Packed(v)->size)) {
        std::fputs("at ", fp);
        std::fputs(hex, fp);
    }
    std::fputs(PackedName(v), fp);
    std::fputs(">", fp);
    return 0;
}

int packed_compare(PyObject *a, PyObject *b) {
    size_t x = Packed(a)->size, y = Packed(b)->size;
    if (x != y) return x < y ? -1 : 1;
    int c = x ? std::memcmp(Packed(a)->pack, Packed(b)->pack, x) : 0;
    return c < 0 ? -1 : (c > 0 ? 1 : 0);
}

void packed_dealloc(PyObject *v) {
    std::free(Packed(v)->pack);
    PyObject_Del(v);
}

PyTypeObject *MakePackedType() {
    static PyTypeObject t;
    t.ob_refcnt = 1;
    t.ob_type = &PyType_Type;
    t.tp_name = "PySwigPacked";
    t.tp_basicsize = sizeof(PySwigPacked);
    t.tp_dealloc = packed_dealloc;
    t.tp_print = packed_print;
    t.tp_compare = packed_compare;
    t.tp_repr = packed_repr;
    t.tp_str = packed_str;
    t.tp_flags = Py_TPFLAGS_DEFAULT;
    t.tp_doc = kObjectDoc;
    return &t;
}

}  // namespace

namespace detail {

bool HexText(char *buf, size_t bufsize, const void *p, size_t n) {
    static const char digits[] = "0123456789abcdef";
    if (2 * n + 2 > bufsize) return false;
    const unsigned char *b = static_cast<const unsigned char *>(p);
    char *o = buf;
    *o++ = '_';
    for (size_t i = 0; i < n; ++i) {
        *o++ = digits[b[i] >> 4];
        *o++ = digits[b[i] & 0xf];
    }
    *o = '\0';
    return true;
}

}  // namespace detail

bool PackedText(char *buf, size_t bufsize, const void *p, size_t n, const char *name) {
    size_t lead = 2 * n + 1;
    if (bufsize < lead + 1 || std::strlen(name) + 1 > bufsize - lead) return false;
    detail::HexText(buf, bufsize, p, n);
    std::strcpy(buf + lead, name);
    return true;
}

PyTypeObject *PySwigObject_Type() {
    static PyTypeObject *type = MakeObjectType();
    return type;
}

PyTypeObject *PySwigPacked_Type() {
    static PyTypeObject *type = MakePackedType();
    return type;
}

namespace detail {

bool IsFamilyObject(const PySwigObject *s) {
    const PyTypeObject *t = Py_TYPE(s);
    return t == PySwigObject_Type() ||
           (t->tp_basicsize == static_cast<Py_ssize_t>(sizeof(PySwigObject)) &&
            std::strcmp(t->tp_name, "PySwigObject") == 0);
}

}  // namespace detail

bool IsSwigObject(PyObject *obj) {
    PyTypeObject *t = Py_TYPE(obj);
    return t == PySwigObject_Type() || std::strcmp(t->tp_name, "PySwigObject") == 0;
}

void RegisterDeleter(swig_type_info *ty, Deleter fn) {
    if (ty) Deleters()[ty] = fn;
}

PyObject *NewSwigObject(void *p, swig_type_info *ty, int own) {
    PySwigObject *s = PyObject_NEW(PySwigObject, PySwigObject_Type());
    if (!s) return nullptr;
    s->ptr = p;
    s->ty = ty;
    s->own = own;
    s->next = nullptr;
    s->dead = 0;
    s->keep = nullptr;
    return reinterpret_cast<PyObject *>(s);
}

PyObject *NewSwigPacked(void *bytes, size_t size, swig_type_info *ty) {
    PySwigPacked *v = PyObject_NEW(PySwigPacked, PySwigPacked_Type());
    if (!v) return nullptr;
    v->pack = std::malloc(size ? size : 1);
    v->ty = ty;
    v->size = size;
    if (!v->pack) {
        PyObject_Del(v);
        return PyErr_NoMemory();
    }
    if (size) std::memcpy(v->pack, bytes, size);
    return reinterpret_cast<PyObject *>(v);
}

}  // namespace qr
