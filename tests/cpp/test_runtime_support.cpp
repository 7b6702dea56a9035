#include "test_runtime_support.h"

namespace rtest {

namespace {

template <class D, class B>
void *Up(void *p, int *) {
    return static_cast<B *>(static_cast<D *>(p));
}

swig_type_info a_types[A_N] = {
    {"_p_Deep", "Deep *", nullptr, nullptr, nullptr, 0},
    {"_p_Exc", "Exc *", nullptr, nullptr, nullptr, 0},
    {"_p_Leaf", "Leaf *", nullptr, nullptr, nullptr, 0},
    {"_p_Mid", "Mid *", nullptr, nullptr, nullptr, 0},
    {"_p_Plain", "Plain *", nullptr, nullptr, nullptr, 0},
    {"_p_Root", "Root *|RootRef *", nullptr, nullptr, nullptr, 0},
    {"_p_RootAlias", "RootAlias *", nullptr, nullptr, nullptr, 0},
    {"_p_RootAlias2", "RootAlias2 *", nullptr, nullptr, nullptr, 0},
    {"_p_RootAlias3", "RootAlias3 *", nullptr, nullptr, nullptr, 0},
    {"_p_char", "char *", nullptr, nullptr, nullptr, 0},
    {"_p_std__string", "std::string *|string *", nullptr, nullptr, nullptr, 0},
};

#define SELF(t) {&t, nullptr, nullptr, nullptr}
#define FROM(t, conv) {&t, conv, nullptr, nullptr}
#define END {nullptr, nullptr, nullptr, nullptr}
swig_cast_entry ac_Deep[] = {SELF(a_types[A_Deep]), END};
swig_cast_entry ac_Exc[] = {SELF(a_types[A_Exc]), END};
swig_cast_entry ac_Leaf[] = {SELF(a_types[A_Leaf]), FROM(a_types[A_Deep], (Up<Deep, Leaf>)), END};
swig_cast_entry ac_Mid[] = {SELF(a_types[A_Mid]), FROM(a_types[A_Leaf], (Up<Leaf, Mid>)),
                            FROM(a_types[A_Deep], (Up<Deep, Mid>)), END};
swig_cast_entry ac_Plain[] = {SELF(a_types[A_Plain]), END};
swig_cast_entry ac_Root[] = {SELF(a_types[A_Root]), FROM(a_types[A_Mid], (Up<Mid, Root>)),
                             FROM(a_types[A_Leaf], (Up<Leaf, Root>)), FROM(a_types[A_Deep], (Up<Deep, Root>)),
                             FROM(a_types[A_RootAlias], nullptr), END};
swig_cast_entry ac_RootAlias[] = {SELF(a_types[A_RootAlias]), FROM(a_types[A_RootAlias2], nullptr),
                                  FROM(a_types[A_RootAlias3], nullptr), END};
swig_cast_entry ac_RootAlias2[] = {SELF(a_types[A_RootAlias2]), END};
swig_cast_entry ac_RootAlias3[] = {SELF(a_types[A_RootAlias3]), END};
swig_cast_entry ac_char[] = {SELF(a_types[A_char]), END};
swig_cast_entry ac_string[] = {SELF(a_types[A_string]), END};

swig_type_info b_types[B_N] = {
    {"_p_Leaf", "Leaf *", nullptr, nullptr, nullptr, 0},
    {"_p_Root", "Root *", nullptr, nullptr, nullptr, 0},
    {"_p_Stick", "Stick *", nullptr, nullptr, nullptr, 0},
    {"_p_Twig", "Twig *", nullptr, nullptr, nullptr, 0},
};
swig_cast_entry bc_Leaf[] = {SELF(b_types[B_Leaf]), END};
swig_cast_entry bc_Root[] = {SELF(b_types[B_Root]), FROM(b_types[B_Leaf], (Up<Leaf, Root>)),
                             FROM(b_types[B_Stick], (Up<Stick, Root>)), END};
swig_cast_entry bc_Stick[] = {SELF(b_types[B_Stick]), END};
swig_cast_entry bc_Twig[] = {SELF(b_types[B_Twig]), FROM(b_types[B_Leaf], (Up<Leaf, Twig>)), END};
#undef SELF
#undef FROM
#undef END

swig_type_info *a_initial[A_N] = {&a_types[0], &a_types[1], &a_types[2], &a_types[3], &a_types[4], &a_types[5],
                                  &a_types[6], &a_types[7], &a_types[8], &a_types[9], &a_types[10]};
swig_cast_entry *a_casts[A_N] = {ac_Deep, ac_Exc, ac_Leaf, ac_Mid, ac_Plain, ac_Root,
                                 ac_RootAlias, ac_RootAlias2, ac_RootAlias3, ac_char, ac_string};
swig_type_info *a_in_use[A_N + 1];
swig_module_record rec_a = {a_in_use, A_N, nullptr, a_initial, a_casts, nullptr};

swig_type_info *b_initial[B_N] = {&b_types[0], &b_types[1], &b_types[2], &b_types[3]};
swig_cast_entry *b_casts[B_N] = {bc_Leaf, bc_Root, bc_Stick, bc_Twig};
swig_type_info *b_in_use[B_N + 1];
swig_module_record rec_b = {b_in_use, B_N, nullptr, b_initial, b_casts, nullptr};

PyObject *Nothing(PyObject *, PyObject *) { return qr::NoneResult(); }

PyMethodDef a_methods[] = {
    {"a_func", Nothing, METH_VARARGS, "Gives a thing. swig_ptr: PTR_CONST_and_more"},
    {"a_packed", Nothing, METH_VARARGS, "swig_ptr: PACKED_CONST"},
    {"a_plain", Nothing, METH_VARARGS, nullptr},
    {nullptr, nullptr, 0, nullptr},
};
PyMethodDef b_methods[] = {{"b_func", Nothing, METH_VARARGS, nullptr}, {nullptr, nullptr, 0, nullptr}};

Plain ptr_const_target;
swig_type_info *plain_slot = &a_types[A_Plain];
unsigned char packed_bytes[4] = {0x01, 0x02, 0xab, 0xff};
swig_const_entry a_consts[] = {
    {3, "SKIPPED", 1, 0.0, nullptr, nullptr},
    {4, "PTR_CONST", 0, 0.0, &ptr_const_target, &plain_slot},
    {5, "PACKED_CONST", 4, 0.0, packed_bytes, &plain_slot},
    {4, "NULL_PTR", 0, 0.0, nullptr, &plain_slot},
    {0, nullptr, 0, 0.0, nullptr, nullptr},
};

PyObject *Globals() { return PyModule_GetDict(PyImport_AddModule("__main__")); }

}  // namespace

bool RunPy(const char *code) {
    PyObject *r = PyRun_String(code, Py_file_input, Globals(), Globals());
    if (!r) {
        ADD_FAILURE() << "Python error: " << TakeError() << "\nin:\n" << code;
        return false;
    }
    Py_DECREF(r);
    return true;
}

PyObject *Eval(const char *expr) {
    PyObject *r = PyRun_String(expr, Py_eval_input, Globals(), Globals());
    if (!r) ADD_FAILURE() << "Python error: " << TakeError() << " in: " << expr;
    return r;
}

PyObject *TryEval(const char *expr) { return PyRun_String(expr, Py_eval_input, Globals(), Globals()); }

PyObject *Global(const char *name) { return PyDict_GetItemString(Globals(), name); }

void SetGlobal(const char *name, PyObject *obj) {
    PyDict_SetItemString(Globals(), name, obj);
    Py_DECREF(obj);
}

std::string Str(PyObject *obj) {
    PyObject *s = PyObject_Str(obj);
    std::string r = s ? std::string(PyString_AS_STRING(s), PyString_GET_SIZE(s)) : "<str failed>";
    Py_XDECREF(s);
    return r;
}

std::string Repr(PyObject *obj) {
    PyObject *s = PyObject_Repr(obj);
    std::string r = s ? PyString_AS_STRING(s) : "<repr failed>";
    Py_XDECREF(s);
    return r;
}

std::string TakeError() {
    if (!PyErr_Occurred()) return "";
    PyObject *t, *v, *tb;
    PyErr_Fetch(&t, &v, &tb);
    PyErr_NormalizeException(&t, &v, &tb);
    PyObject *name = PyObject_GetAttrString(t, "__name__");
    std::string r = (name ? PyString_AsString(name) : "?") + std::string(": ") + (v ? Str(v) : "");
    Py_XDECREF(name);
    Py_XDECREF(t);
    Py_XDECREF(v);
    Py_XDECREF(tb);
    PyErr_Clear();
    return r;
}

const Ring &TestRing() {
    static Ring ring;
    static bool done = false;
    if (done) return ring;
    done = true;
    Py_Initialize();
    ring.runtime_module_was_absent = !PyDict_GetItemString(PyImport_GetModuleDict(), "swig_runtime_data4");
    // Record B brings class data for its own Leaf descriptor.
    RunPy("class LeafCls(object):\n    pass\n");
    b_types[B_Leaf].clientdata = qr::MakeClassData(Global("LeafCls"));
    ring.dict_a = qr::InitModule("_qrt_a", a_methods, &rec_a, a_consts);
    ring.dict_b = qr::InitModule("_qrt_b", b_methods, &rec_b, nullptr);
    ring.a = &rec_a;
    ring.b = &rec_b;
    ring.a_types = a_types;
    ring.b_types = b_types;
    ring.a_casts = a_casts;
    ring.b_casts = b_casts;
    ring.a_methods = a_methods;
    ring.b_methods = b_methods;
    ring.ptr_const = &ptr_const_target;
    return ring;
}

}  // namespace rtest
