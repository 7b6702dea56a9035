// The link object behind `cvar`: attribute access reads and writes library
// variables through getter and setter functions. Also module constants.
#include "qrinternal.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>

namespace qr {

namespace {

struct GlobalVar {
    char *name;
    VarGetter get;
    VarSetter set;
    GlobalVar *next;
};

struct VarLink {
    PyObject_HEAD
    GlobalVar *vars;
};

VarLink *Link(PyObject *o) { return reinterpret_cast<VarLink *>(o); }

GlobalVar *Find(PyObject *o, const char *name) {
    for (GlobalVar *v = Link(o)->vars; v; v = v->next)
        if (std::strcmp(v->name, name) == 0) return v;
    return nullptr;
}

void UnknownVariable() { PyErr_SetString(PyExc_NameError, "Unknown C global variable"); }

PyObject *link_getattr(PyObject *o, char *name) {
    if (GlobalVar *v = Find(o, name)) {
        PyObject *r = v->get();
        if (r || PyErr_Occurred()) return r;
    }
    UnknownVariable();
    return nullptr;
}

int link_setattr(PyObject *o, char *name, PyObject *value) {
    if (GlobalVar *v = Find(o, name)) {
        if (!value) {
            PyErr_Format(PyExc_TypeError, "C global variable '%s' cannot be deleted", name);
            return 1;
        }
        int r = v->set(value);
        if (r == 0 || PyErr_Occurred()) return r;
    }
    UnknownVariable();
    return 1;
}

PyObject *link_str(PyObject *o) {
    std::string s = "(";
    for (GlobalVar *v = Link(o)->vars; v; v = v->next) {
        s += v->name;
        if (v->next) s += ", ";
    }
    s += ")";
    return PyString_FromStringAndSize(s.data(), static_cast<Py_ssize_t>(s.size()));
}

PyObject *link_repr(PyObject *) { return PyString_FromString("<Swig global variables>"); }

int link_print(PyObject *o, FILE *fp, int) {
    PyObject *s = link_str(o);
    if (!s) return 1;
    std::fprintf(fp, "Swig global variables %s\n", PyString_AS_STRING(s));
    Py_DECREF(s);
    return 0;
}

void link_dealloc(PyObject *o) {
    for (GlobalVar *v = Link(o)->vars; v;) {
        GlobalVar *next = v->next;
        std::free(v->name);
        std::free(v);
        v = next;
    }
    PyObject_Del(o);
}

PyTypeObject *MakeLinkType() {
    static PyTypeObject t;
    t.ob_refcnt = 1;
    t.ob_type = &PyType_Type;
    t.tp_name = "swigvarlink";
    t.tp_basicsize = sizeof(VarLink);
    t.tp_dealloc = link_dealloc;
    t.tp_print = link_print;
    t.tp_getattr = link_getattr;
    t.tp_setattr = link_setattr;
    t.tp_repr = link_repr;
    t.tp_str = link_str;
    t.tp_flags = Py_TPFLAGS_DEFAULT;
    t.tp_doc = "Swig var link object";
    return &t;
}

PyTypeObject *LinkType() {
    static PyTypeObject *type = MakeLinkType();
    return type;
}

}  // namespace

PyObject *NewGlobalVarLink() {
    VarLink *l = PyObject_NEW(VarLink, LinkType());
    if (l) l->vars = nullptr;
    return reinterpret_cast<PyObject *>(l);
}

PyObject *GlobalVarLink() {
    static PyObject *cvar = nullptr;
    if (!cvar) cvar = NewGlobalVarLink();
    return cvar;
}

void AddGlobalVariable(PyObject *link, const char *name, VarGetter get, VarSetter set) {
    if (!link || Py_TYPE(link) != LinkType()) return;
    GlobalVar *v = static_cast<GlobalVar *>(std::malloc(sizeof(GlobalVar)));
    char *copy = static_cast<char *>(std::malloc(std::strlen(name) + 1));
    if (!v || !copy) {
        std::free(v);
        std::free(copy);
        return;
    }
    std::strcpy(copy, name);
    v->name = copy;
    v->get = get;
    v->set = set;
    v->next = Link(link)->vars;
    Link(link)->vars = v;
}

void InstallConstant(PyObject *dict, const char *name, PyObject *obj) {
    if (!obj) return;
    PyDict_SetItemString(dict, name, obj);
    Py_DECREF(obj);
}

int ReadOnlyVariable(const char *name) {
    PyErr_Format(PyExc_AttributeError, "Variable %s is read-only.", name);
    return 1;
}

int ReadOnlyArrayVariable(const char *qualified_name, const char *type) {
    PyErr_Format(PyExc_AttributeError, "in variable 'read-only %s' of type '%s'", qualified_name, type);
    return 1;
}

int VariableError(int code, const char *qualified_name, const char *type) {
    PyErr_Format(ErrorClassFor(code == ERR_GENERIC ? ERR_TYPE : code), "in variable '%s' of type '%s'",
                 qualified_name, type);
    return 1;
}

}  // namespace qr
