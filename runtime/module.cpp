// Module creation, joining the process-wide ring of module records, class
// registration and the teardown that runs when the interpreter exits.
#include "qrinternal.h"

#include <cstdlib>
#include <cstring>

namespace qr {

namespace {

const int kApiVersion = 1013;
const char kRuntimeModule[] = "swig_runtime_data4";
const char kRuntimePointer[] = "type_pointer";
const char kPtrMarker[] = "swig_ptr: ";

enum { CONST_POINTER = 4, CONST_PACKED = 5 };

// The record carried by swig_runtime_data4.type_pointer, once known.
swig_module_record *g_head = nullptr;

// Destroy function of the type_pointer object: drop the Python references
// held by registered class data.
void Teardown(void *p) {
    swig_module_record *rec = static_cast<swig_module_record *>(p);
    for (size_t i = 0; rec->types && i < rec->size; ++i) {
        swig_type_info *ty = rec->types[i];
        if (!ty || !ty->owndata || !ty->clientdata) continue;
        swig_class_data *d = static_cast<swig_class_data *>(ty->clientdata);
        Py_CLEAR(d->klass);
        Py_CLEAR(d->newraw);
        Py_CLEAR(d->newargs);
        Py_CLEAR(d->destroy);
    }
    detail::ReleaseThisKey();
}

swig_module_record *RingHead() {
    if (!g_head) {
        void *p = PyCObject_Import(const_cast<char *>(kRuntimeModule), const_cast<char *>(kRuntimePointer));
        if (PyErr_Occurred()) {
            PyErr_Clear();
            p = nullptr;
        }
        g_head = static_cast<swig_module_record *>(p);
    }
    return g_head;
}

// Publishes record as the ring head through a new swig_runtime_data4.
void CreateRuntimeModule(swig_module_record *record) {
    static PyMethodDef no_methods[] = {{nullptr, nullptr, 0, nullptr}};
    PyObject *m = Py_InitModule4(kRuntimeModule, no_methods, nullptr, nullptr, kApiVersion);
    if (!m) return;
    PyObject *c = PyCObject_FromVoidPtr(record, Teardown);
    if (!c) return;
    if (PyModule_AddObject(m, kRuntimePointer, c) < 0) {
        Py_DECREF(c);
        return;
    }
    g_head = record;
}

void Link(swig_type_info *ty, swig_cast_entry *e) {
    e->prev = nullptr;
    e->next = ty->cast;
    if (ty->cast) ty->cast->prev = e;
    ty->cast = e;
}

// Fills the in-use array, sharing descriptors of the same mangled name with
// the other records of the ring.
void FillTypes(swig_module_record *record) {
    swig_module_record *others = record->next != record ? record->next : nullptr;
    for (size_t i = 0; i < record->size; ++i) {
        swig_type_info *own = record->type_initial[i];
        swig_type_info *use = own;
        if (others) {
            if (swig_type_info *found = FindTypeByMangledName(others, own->name)) {
                use = found;
                if (own->clientdata) use->clientdata = own->clientdata;
            }
        }
        for (swig_cast_entry *e = record->cast_initial[i]; e->type; ++e) {
            swig_type_info *src = others ? FindTypeByMangledName(others, e->type->name) : nullptr;
            if (src) {
                if (use != own && FindCast(src->name, use)) continue;  // already known
                e->type = src;
            }
            Link(use, e);
        }
        record->types[i] = use;
    }
    record->types[record->size] = nullptr;
}

void JoinRing(swig_module_record *record) {
    bool first = !record->next;
    if (first) record->next = record;
    swig_module_record *head = RingHead();
    if (!head) {
        CreateRuntimeModule(record);
    } else {
        swig_module_record *r = head;
        do {
            if (r == record) return;
            r = r->next;
        } while (r && r != head);
        record->next = head->next;
        head->next = record;
    }
    if (first) FillTypes(record);
}

void PatchDocs(PyMethodDef *methods, const swig_const_entry *constants) {
    for (PyMethodDef *md = methods; md && md->ml_name; ++md) {
        const char *at = md->ml_doc ? std::strstr(md->ml_doc, kPtrMarker) : nullptr;
        if (!at) continue;
        const char *rest = at + sizeof kPtrMarker - 1;
        const swig_const_entry *row = constants;
        while (row && row->type && !(row->name && std::strncmp(row->name, rest, std::strlen(row->name)) == 0))
            ++row;
        if (!row || row->type != CONST_POINTER || !row->pvalue || !row->ptype || !*row->ptype) continue;
        char packed[1024];
        if (!PackedText(packed, sizeof packed, &row->pvalue, sizeof row->pvalue, (*row->ptype)->name)) continue;
        size_t keep = static_cast<size_t>(rest - md->ml_doc);
        char *doc = static_cast<char *>(std::malloc(keep + std::strlen(packed) + 1));
        if (!doc) continue;
        std::memcpy(doc, md->ml_doc, keep);
        std::strcpy(doc + keep, packed);
        md->ml_doc = doc;
    }
}

void InstallPointerConstants(PyObject *dict, const swig_const_entry *constants) {
    for (const swig_const_entry *c = constants; c && c->type; ++c) {
        swig_type_info *ty = c->ptype ? *c->ptype : nullptr;
        PyObject *o;
        if (c->type == CONST_POINTER)
            o = WrapPointer(c->pvalue, ty, 0);
        else if (c->type == CONST_PACKED)
            o = c->pvalue ? NewSwigPacked(c->pvalue, static_cast<size_t>(c->lvalue), ty) : NoneResult();
        else
            continue;
        InstallConstant(dict, c->name, o);
    }
}

// Attaches data to ty and to the typedef-equivalent descriptors that have no
// class data yet, or still have ty's previous data (old).
void AttachClassData(swig_type_info *ty, swig_class_data *data, swig_class_data *old) {
    ty->clientdata = data;
    for (swig_cast_entry *e = ty->cast; e; e = e->next) {
        swig_type_info *alias = e->type;
        if (e->converter || !alias || alias == ty) continue;
        if (!alias->clientdata || (old && alias->clientdata == old)) AttachClassData(alias, data, old);
    }
}

void FreeClassData(swig_class_data *d) {
    Py_CLEAR(d->klass);
    Py_CLEAR(d->newraw);
    Py_CLEAR(d->newargs);
    Py_CLEAR(d->destroy);
    std::free(d);
}

}  // namespace

PyObject *InitModule(const char *name, PyMethodDef *methods, swig_module_record *record,
                     swig_const_entry *constants) {
    PatchDocs(methods, constants);
    PyObject *m = Py_InitModule4(name, methods, nullptr, nullptr, kApiVersion);
    if (!m) return nullptr;
    PyObject *dict = PyModule_GetDict(m);
    detail::SetOwnRecord(record);
    JoinRing(record);
    InstallPointerConstants(dict, constants);
    return dict;
}

swig_class_data *MakeClassData(PyObject *cls) {
    swig_class_data *d = static_cast<swig_class_data *>(std::calloc(1, sizeof(swig_class_data)));
    if (!d) return nullptr;
    Py_INCREF(cls);
    d->klass = cls;
    if (!PyClass_Check(cls)) {
        d->newraw = PyObject_GetAttrString(cls, "__new__");
        if (d->newraw) d->newargs = PyTuple_Pack(1, cls);
        if (!d->newargs) {
            PyErr_Clear();
            Py_CLEAR(d->newraw);
        }
    }
    if (!d->newargs) {
        Py_INCREF(cls);
        d->newargs = cls;
    }
    d->destroy = PyObject_GetAttrString(cls, "__swig_destroy__");
    if (PyErr_Occurred()) {
        PyErr_Clear();
        Py_CLEAR(d->destroy);
    }
    if (d->destroy) {
        int flags = PyCFunction_Check(d->destroy) ? PyCFunction_GET_FLAGS(d->destroy) : 0;
        d->delargs = (flags & METH_O) ? 0 : 1;
    }
    return d;
}

void RegisterClass(swig_type_info *ty, PyObject *cls) {
    swig_class_data *data = MakeClassData(cls);
    if (!data) return;
    // Registering again (a reloaded shadow module) replaces the class data
    // this descriptor made before; data it only shares with another
    // registered descriptor stays with that one.
    swig_class_data *old = ty->owndata ? static_cast<swig_class_data *>(ty->clientdata) : nullptr;
    AttachClassData(ty, data, old);
    ty->owndata = 1;
    if (old && old != data) FreeClassData(old);
}

PyObject *SwigRegister(PyObject *args, swig_type_info *ty) {
    PyObject *cls;
    if (!PyArg_ParseTuple(args, "O:swigregister", &cls)) return nullptr;
    RegisterClass(ty, cls);
    return NoneResult();
}

}  // namespace qr
