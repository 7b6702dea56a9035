#include "test_containers_support.h"

#include <deque>
#include <functional>

using rtest::Eval;
using rtest::Global;
using rtest::Repr;
using rtest::RunPy;
using rtest::SetGlobal;
using rtest::TakeError;

namespace ctest {

int Value::live = 0;
Obj objs[4] = {{100}, {101}, {102}, {103}};
int iterators_destroyed = 0;

#define TY(mangled, human) {mangled, human, nullptr, nullptr, nullptr, 0}
swig_type_info ty_iterator = TY("_p_swig__PySwigIterator", "swig::PySwigIterator *");

namespace {

swig_type_info ty_u32vec = TY("_p_std__vectorT_uint32_std__allocatorT_uint32_t_t",
                              "std::vector< uint32,std::allocator< uint32 > > *|std::vector< uint32 > *");
swig_type_info ty_u64vec = TY("_p_std__vectorT_uint64_std__allocatorT_uint64_t_t",
                              "std::vector< uint64,std::allocator< uint64 > > *|std::vector< uint64 > *");
swig_type_info ty_strvec = TY("_p_std__vectorT_std__string_std__allocatorT_std__string_t_t",
                              "std::vector< std::string,std::allocator< std::string > > *");
swig_type_info ty_reasonvec = TY("_p_std__vectorT_Reason_std__allocatorT_Reason_t_t",
                                 "std::vector< Reason,std::allocator< Reason > > *");
swig_type_info ty_valuevec = TY("_p_std__vectorT_Value_std__allocatorT_Value_t_t",
                                "std::vector< Value,std::allocator< Value > > *");
swig_type_info ty_objvec = TY("_p_std__vectorT_Obj_p_std__allocatorT_Obj_p_t_t",
                              "std::vector< Obj *,std::allocator< Obj * > > *");
swig_type_info ty_strset = TY("_p_std__setT_std__string_std__lessT_std__string_t_std__allocatorT_std__string_t_t",
                              "std::set< std::string,std::less< std::string >,std::allocator< std::string > > *");
swig_type_info ty_u32 = TY("_p_unsigned_int", "uint32 *|unsigned int *");
swig_type_info ty_u64 = TY("_p_unsigned_long", "uint64 *|unsigned long *");
swig_type_info ty_string = TY("_p_std__string", "std::string *");
swig_type_info ty_reason = TY("_p_Reason", "Reason *");
swig_type_info ty_value = TY("_p_Value", "Value *");
swig_type_info ty_obj = TY("_p_Obj", "Obj *");
swig_type_info ty_alloc_u32 = TY("_p_std__allocatorT_uint32_t", "std::allocator< uint32 > *");
swig_type_info ty_alloc_other = TY("_p_std__allocatorT_other_t", "std::allocator< other > *");
swig_type_info ty_less = TY("_p_std__lessT_std__string_t", "std::less< std::string > *");
#undef TY

// In-use slots, as a module's type table would hold them.
swig_type_info *s_u32vec = &ty_u32vec, *s_u64vec = &ty_u64vec, *s_strvec = &ty_strvec, *s_reasonvec = &ty_reasonvec,
               *s_valuevec = &ty_valuevec, *s_objvec = &ty_objvec, *s_strset = &ty_strset, *s_u32 = &ty_u32,
               *s_u64 = &ty_u64, *s_string = &ty_string, *s_reason = &ty_reason, *s_value = &ty_value,
               *s_obj = &ty_obj, *s_iterator = &ty_iterator, *s_alloc_u32 = &ty_alloc_u32,
               *s_alloc_other = &ty_alloc_other, *s_less = &ty_less;

const char *n_u32[qr::VM_COUNT], *n_u64[qr::VM_COUNT], *n_str[qr::VM_COUNT], *n_reason[qr::VM_COUNT],
    *n_value[qr::VM_COUNT], *n_obj[qr::VM_COUNT], *n_set[qr::SM_COUNT];

}  // namespace

const qr::ContainerInfo ci_u32 = {n_u32, "std::vector< uint32 >", &s_u32vec, &s_u32, &s_iterator, &s_alloc_u32};
const qr::ContainerInfo ci_u64 = {n_u64, "std::vector< uint64 >", &s_u64vec, &s_u64, &s_iterator, &s_alloc_other};
const qr::ContainerInfo ci_str = {n_str, "std::vector< std::string >", &s_strvec, &s_string, &s_iterator,
                                  &s_alloc_other};
const qr::ContainerInfo ci_reason = {n_reason, "std::vector< Reason >", &s_reasonvec, &s_reason, &s_iterator,
                                     &s_alloc_other};
const qr::ContainerInfo ci_value = {n_value, "std::vector< Value >", &s_valuevec, &s_value, &s_iterator,
                                    &s_alloc_other};
const qr::ContainerInfo ci_obj = {n_obj, "std::vector< Obj * >", &s_objvec, &s_obj, &s_iterator, &s_alloc_other};
const qr::ContainerInfo ci_set = {n_set, "std::set< std::string >", &s_strset, &s_string, &s_iterator,
                                  &s_alloc_other, &s_less};

namespace {

typedef PyObject *(*OpFn)(PyObject *, const qr::ContainerInfo &);

// Every slot's function, in slot order: the names the generator calls.
template <class C>
std::vector<OpFn> VectorFns() {
    typedef qr::VectorOps<C> O;
    std::vector<OpFn> f = {&O::iterator, &O::nonzero,  &O::len,       &O::pop,      &O::getslice,      &O::setslice,
                           &O::delslice, &O::delitem,  &O::getitem,   &O::setitem,  &O::append,        &O::empty,
                           &O::size,     &O::clear,    &O::swap,      &O::get_allocator, &O::begin,    &O::end,
                           &O::rbegin,   &O::rend,     &O::pop_back,  &O::erase,    &O::push_back,     &O::front,
                           &O::back,     &O::assign,   &O::resize,    &O::insert,   &O::reserve,       &O::capacity,
                           &O::new_};
    EXPECT_EQ(f.size(), size_t(qr::VM_COUNT));
    return f;
}

template <class C>
std::vector<OpFn> SetFns() {
    typedef qr::SetOps<C> O;
    std::vector<OpFn> f = {&O::iterator, &O::nonzero,     &O::len,         &O::append,      &O::contains,
                           &O::getitem,  &O::empty,       &O::size,        &O::clear,       &O::swap,
                           &O::count,    &O::begin,       &O::end,         &O::rbegin,      &O::rend,
                           &O::erase,    &O::find,        &O::lower_bound, &O::upper_bound, &O::equal_range,
                           &O::insert,   &O::new_};
    EXPECT_EQ(f.size(), size_t(qr::SM_COUNT));
    return f;
}

struct Binding {
    OpFn fn;
    const qr::ContainerInfo *ci;
};

std::deque<std::string> g_names;
std::deque<Binding> g_bindings;
std::deque<PyMethodDef> g_defs;

PyObject *Trampoline(PyObject *self, PyObject *args) {
    Binding *b = static_cast<Binding *>(PyCObject_AsVoidPtr(self));
    return b->fn(args, *b->ci);
}

void AddFunction(const std::string &name, PyCFunction fn, int flags, PyObject *self) {
    g_names.push_back(name);
    g_defs.push_back(PyMethodDef{g_names.back().c_str(), fn, flags, nullptr});
    SetGlobal(g_names.back().c_str(), PyCFunction_NewEx(&g_defs.back(), self, nullptr));
    Py_XDECREF(self);
}

void InstallClass(const std::string &cls, const char *const *methods, int count, int new_slot, const char **names,
                  const std::vector<OpFn> &fns, const qr::ContainerInfo *ci) {
    for (int k = 0; k < count; ++k) {
        std::string name = k == new_slot ? "new_" + cls : cls + "_" + methods[k];
        g_bindings.push_back(Binding{fns[k], ci});
        AddFunction(name, Trampoline, METH_VARARGS, PyCObject_FromVoidPtr(&g_bindings.back(), nullptr));
        names[k] = g_names.back().c_str();
    }
}

// __swig_destroy__ of a registered class: frees the object.
template <class T>
PyObject *DestroyO(PyObject *, PyObject *o) {
    PySwigObject *s = qr::GetThisObject(o);
    if (s && s->ptr) {
        T *p = static_cast<T *>(s->ptr);
        s->ptr = nullptr;
        s->own = 0;
        if constexpr (std::is_same<T, swig::PySwigIterator>::value) ++iterators_destroyed;
        delete p;
    }
    return qr::NoneResult();
}

template <class T>
void Register(const char *cls, swig_type_info *ty) {
    static PyMethodDef def = {"destroy", &DestroyO<T>, METH_O, nullptr};
    SetGlobal("_destroy", PyCFunction_New(&def, nullptr));
    RunPy((std::string("class ") + cls + "(object):\n    __swig_destroy__ = _destroy\n").c_str());
    qr::RegisterClass(ty, Global(cls));
}

// delete_<Class>(o), as generated for any class.
template <class C, swig_type_info *Ty>
PyObject *DeleteContainer(PyObject *, PyObject *args) {
    PyObject *o;
    void *p = nullptr;
    if (!PyArg_ParseTuple(args, "O:delete", &o) ||
        !qr::ArgPtr(o, &p, Ty, "delete", 1, "container *", qr::POINTER_DISOWN | qr::POINTER_DESTROY))
        return nullptr;
    delete static_cast<C *>(p);
    return qr::NoneResult();
}

void *PtrOf(PyObject *o, swig_type_info *ty) {
    void *p = nullptr;
    if (qr::SWIG_Python_ConvertPtrAndOwn(o, &p, ty, 0) != 0 || !p) {
        PyErr_SetString(PyExc_TypeError, "wrong object");
        return nullptr;
    }
    return p;
}

PyObject *H_ptr(PyObject *, PyObject *o) {
    PySwigObject *s = qr::GetThisObject(o);
    if (!s) return PyErr_Format(PyExc_TypeError, "not wrapped");
    return PyLong_FromVoidPtr(s->ptr);
}
PyObject *H_own(PyObject *, PyObject *o) {
    PySwigObject *s = qr::GetThisObject(o);
    if (!s) return PyErr_Format(PyExc_TypeError, "not wrapped");
    return PyInt_FromLong(s->own);
}
PyObject *H_u32(PyObject *, PyObject *o) {
    return qr::WrapPointer(new uint32_t(static_cast<uint32_t>(PyInt_AsLong(o))), &ty_u32, qr::POINTER_OWN);
}
PyObject *H_u32_of(PyObject *, PyObject *o) {
    void *p = PtrOf(o, &ty_u32);
    return p ? qr::FromUint32(*static_cast<uint32_t *>(p)) : nullptr;
}
PyObject *H_reason(PyObject *, PyObject *o) {
    return qr::WrapPointer(new Reason(static_cast<Reason>(PyInt_AsLong(o))), &ty_reason, qr::POINTER_OWN);
}
PyObject *H_reason_of(PyObject *, PyObject *o) {
    void *p = PtrOf(o, &ty_reason);
    return p ? qr::FromInt(*static_cast<Reason *>(p)) : nullptr;
}
PyObject *H_value(PyObject *, PyObject *o) {
    return qr::WrapPointer(new Value(static_cast<int>(PyInt_AsLong(o))), &ty_value, qr::POINTER_OWN);
}
PyObject *H_value_of(PyObject *, PyObject *o) {
    void *p = PtrOf(o, &ty_value);
    return p ? qr::FromInt(static_cast<Value *>(p)->v) : nullptr;
}
PyObject *H_obj(PyObject *, PyObject *o) { return qr::WrapPointer(&objs[PyInt_AsLong(o)], &ty_obj, 0); }
PyObject *H_obj_id(PyObject *, PyObject *o) {
    void *p = nullptr;
    if (qr::SWIG_Python_ConvertPtrAndOwn(o, &p, &ty_obj, 0) != 0) return PyErr_Format(PyExc_TypeError, "no Obj");
    return p ? qr::FromInt(static_cast<Obj *>(p)->id) : qr::NoneResult();
}
PyObject *H_live(PyObject *, PyObject *) { return qr::FromInt(Value::live); }
PyObject *H_less(PyObject *, PyObject *) {
    return qr::WrapPointer(new std::less<std::string>(), &ty_less, qr::POINTER_OWN);
}

}  // namespace

void InstallContainers() {
    static bool done = false;
    if (done) return;
    done = true;
    Register<U32Vec>("Uint32Vector", &ty_u32vec);
    Register<U64Vec>("Uint64Vector", &ty_u64vec);
    Register<StrVec>("StringVector", &ty_strvec);
    Register<ReasonVec>("ReasonVector", &ty_reasonvec);
    Register<ValueVec>("ValueVector", &ty_valuevec);
    Register<ObjVec>("ObjVector", &ty_objvec);
    Register<StrSet>("StringSet", &ty_strset);
    Register<uint32_t>("uint32_p", &ty_u32);
    Register<Reason>("Reason_p", &ty_reason);
    Register<Value>("Value", &ty_value);
    Register<swig::PySwigIterator>("PySwigIterator", &ty_iterator);
    Register<std::allocator<uint32_t>>("Allocator", &ty_alloc_u32);
    Register<std::less<std::string>>("Less", &ty_less);

    InstallClass("Uint32Vector", qr::VectorMethodNames, qr::VM_COUNT, qr::VM_new, n_u32, VectorFns<U32Vec>(), &ci_u32);
    InstallClass("Uint64Vector", qr::VectorMethodNames, qr::VM_COUNT, qr::VM_new, n_u64, VectorFns<U64Vec>(), &ci_u64);
    InstallClass("StringVector", qr::VectorMethodNames, qr::VM_COUNT, qr::VM_new, n_str, VectorFns<StrVec>(), &ci_str);
    InstallClass("ReasonVector", qr::VectorMethodNames, qr::VM_COUNT, qr::VM_new, n_reason, VectorFns<ReasonVec>(),
                 &ci_reason);
    InstallClass("ValueVector", qr::VectorMethodNames, qr::VM_COUNT, qr::VM_new, n_value, VectorFns<ValueVec>(),
                 &ci_value);
    InstallClass("ObjVector", qr::VectorMethodNames, qr::VM_COUNT, qr::VM_new, n_obj, VectorFns<ObjVec>(), &ci_obj);
    InstallClass("StringSet", qr::SetMethodNames, qr::SM_COUNT, qr::SM_new, n_set, SetFns<StrSet>(), &ci_set);

    AddFunction("delete_Uint32Vector", &DeleteContainer<U32Vec, &ty_u32vec>, METH_VARARGS, nullptr);
    AddFunction("delete_ValueVector", &DeleteContainer<ValueVec, &ty_valuevec>, METH_VARARGS, nullptr);
    AddFunction("delete_StringSet", &DeleteContainer<StrSet, &ty_strset>, METH_VARARGS, nullptr);
    AddFunction("ptr", H_ptr, METH_O, nullptr);
    AddFunction("own", H_own, METH_O, nullptr);
    AddFunction("u32", H_u32, METH_O, nullptr);
    AddFunction("u32_of", H_u32_of, METH_O, nullptr);
    AddFunction("reason", H_reason, METH_O, nullptr);
    AddFunction("reason_of", H_reason_of, METH_O, nullptr);
    AddFunction("value", H_value, METH_O, nullptr);
    AddFunction("value_of", H_value_of, METH_O, nullptr);
    AddFunction("obj", H_obj, METH_O, nullptr);
    AddFunction("obj_id", H_obj_id, METH_O, nullptr);
    AddFunction("live", H_live, METH_NOARGS, nullptr);
    AddFunction("less", H_less, METH_NOARGS, nullptr);
}

std::string Show(const char *expr) {
    PyObject *r = rtest::TryEval(expr);
    if (!r) return "<error: " + TakeError() + ">";
    std::string s = Repr(r);
    Py_DECREF(r);
    return s;
}

std::string Err(const char *expr) {
    PyObject *r = rtest::TryEval(expr);
    if (r) {
        Py_DECREF(r);
        return "";
    }
    return TakeError();
}

swig::PySwigIterator *It(const char *expr) {
    PyObject *o = Eval(expr);
    if (!o) return nullptr;
    void *p = nullptr;
    int rc = qr::SWIG_Python_ConvertPtrAndOwn(o, &p, &ty_iterator, 0);
    Py_DECREF(o);
    EXPECT_EQ(rc, 0) << expr << " is no iterator";
    return static_cast<swig::PySwigIterator *>(p);
}

std::string Take(PyObject *o) {
    if (!o) return "<null: " + TakeError() + ">";
    std::string s = Repr(o);
    Py_DECREF(o);
    return s;
}

uint32_t TakeU32(PyObject *o) {
    void *p = o ? PtrOf(o, &ty_u32) : nullptr;
    uint32_t v = p ? *static_cast<uint32_t *>(p) : 0xdeadbeef;
    Py_XDECREF(o);
    if (!p) ADD_FAILURE() << "no wrapped uint32: " << TakeError();
    return v;
}

}  // namespace ctest
