// The floor for the benchmarks: the bench library (and the few product
// calls the table times) bound by hand with the Python C API, using the same
// calling convention as the generated wrappers (METH_VARARGS and
// PyArg_ParseTuple) and the same checks on arguments, but nothing else: no
// type table, no shadow instances, one plain handle object per pointer.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wregister"
#include <Python.h>
#pragma GCC diagnostic pop

#include <cstdint>
#include <exception>
#include <string>
#include <vector>

#include "benchlib.h"
#include "hostopt.h"

namespace {

enum Kind { K_WIDGET, K_WIDGET_IMPL, K_ITEM, K_OPTION, K_INT_OPTION_IMPL };

struct Handle {
    PyObject_HEAD
    void *ptr;
    int kind;
};

PyTypeObject HandleType = {PyVarObject_HEAD_INIT(nullptr, 0) "_benchfloor.Handle", sizeof(Handle)};
PyObject *FloorError = nullptr;

PyObject *NewHandle(void *p, Kind kind) {
    if (!p) {
        Py_INCREF(Py_None);
        return Py_None;
    }
    Handle *h = PyObject_New(Handle, &HandleType);
    if (!h) return nullptr;
    h->ptr = p;
    h->kind = kind;
    return reinterpret_cast<PyObject *>(h);
}

PyObject *WrongKind(const char *fn) {
    PyErr_Format(PyExc_TypeError, "%s: argument 1 has the wrong type", fn);
    return nullptr;
}

// The pointer of a handle of `kind`, or null with TypeError set.
template <class T>
T *Arg(PyObject *o, Kind kind, const char *fn) {
    Handle *h = reinterpret_cast<Handle *>(o);
    if (h->kind != kind) {
        WrongKind(fn);
        return nullptr;
    }
    return static_cast<T *>(h->ptr);
}

// A Widget: the interface handle as it is, or the implementation handle
// adjusted through the virtual base.
Bench::Widget *WidgetArg(PyObject *o, const char *fn) {
    Handle *h = reinterpret_cast<Handle *>(o);
    if (h->kind == K_WIDGET) return static_cast<Bench::Widget *>(h->ptr);
    if (h->kind == K_WIDGET_IMPL) return static_cast<Bench::WidgetImpl *>(h->ptr);
    WrongKind(fn);
    return nullptr;
}

HostCtl::Adv::AdvancedIntegerOption *IntOptionArg(PyObject *o, const char *fn) {
    Handle *h = reinterpret_cast<Handle *>(o);
    if (h->kind == K_INT_OPTION_IMPL) return static_cast<QorCtl::Adv::AdvancedIntegerOptionImpl *>(h->ptr);
    WrongKind(fn);
    return nullptr;
}

// uint32 with the range check the generated converter makes.
bool ToU32(PyObject *o, uint32_t *v) {
    if (PyInt_Check(o)) {
        long x = PyInt_AS_LONG(o);
        if (x < 0 || x > 0xFFFFFFFFL) {
            PyErr_SetString(PyExc_OverflowError, "value out of range for uint32");
            return false;
        }
        *v = static_cast<uint32_t>(x);
        return true;
    }
    if (PyLong_Check(o)) {
        unsigned long x = PyLong_AsUnsignedLong(o);
        if (x == static_cast<unsigned long>(-1) && PyErr_Occurred()) return false;
        if (x > 0xFFFFFFFFUL) {
            PyErr_SetString(PyExc_OverflowError, "value out of range for uint32");
            return false;
        }
        *v = static_cast<uint32_t>(x);
        return true;
    }
    PyErr_SetString(PyExc_TypeError, "an integer is required");
    return false;
}

bool ToU64(PyObject *o, uint64_t *v) {
    if (PyInt_Check(o)) {
        long x = PyInt_AS_LONG(o);
        if (x < 0) {
            PyErr_SetString(PyExc_OverflowError, "negative value for uint64");
            return false;
        }
        *v = static_cast<uint64_t>(x);
        return true;
    }
    if (PyLong_Check(o)) {
        unsigned long long x = PyLong_AsUnsignedLongLong(o);
        if (x == static_cast<unsigned long long>(-1) && PyErr_Occurred()) return false;
        *v = x;
        return true;
    }
    PyErr_SetString(PyExc_TypeError, "an integer is required");
    return false;
}

PyObject *LibraryError(const std::exception &e) {
    PyErr_SetString(PyExc_RuntimeError, e.what());
    return nullptr;
}

// ---- Bench library -----------------------------------------------------------

PyObject *f_shared_impl(PyObject *, PyObject *args) {
    if (!PyArg_ParseTuple(args, ":shared_impl")) return nullptr;
    return NewHandle(Bench::WidgetImpl::Shared(), K_WIDGET_IMPL);
}

PyObject *f_shared_widget(PyObject *, PyObject *args) {
    if (!PyArg_ParseTuple(args, ":shared_widget")) return nullptr;
    return NewHandle(Bench::WidgetImpl::SharedWidget(), K_WIDGET);
}

PyObject *f_WidgetImpl_GetName(PyObject *, PyObject *args) {
    PyObject *o;
    if (!PyArg_ParseTuple(args, "O!:WidgetImpl_GetName", &HandleType, &o)) return nullptr;
    Bench::WidgetImpl *w = Arg<Bench::WidgetImpl>(o, K_WIDGET_IMPL, "WidgetImpl_GetName");
    if (!w) return nullptr;
    std::string s = w->GetName();
    return PyString_FromStringAndSize(s.data(), static_cast<Py_ssize_t>(s.size()));
}

PyObject *f_WidgetImpl_SetSize(PyObject *, PyObject *args) {
    PyObject *o, *v;
    if (!PyArg_ParseTuple(args, "O!O:WidgetImpl_SetSize", &HandleType, &o, &v)) return nullptr;
    Bench::WidgetImpl *w = Arg<Bench::WidgetImpl>(o, K_WIDGET_IMPL, "WidgetImpl_SetSize");
    uint32_t size;
    if (!w || !ToU32(v, &size)) return nullptr;
    w->SetSize(size);
    Py_RETURN_NONE;
}

PyObject *f_Widget_GetSize(PyObject *, PyObject *args) {
    PyObject *o;
    if (!PyArg_ParseTuple(args, "O!:Widget_GetSize", &HandleType, &o)) return nullptr;
    Bench::Widget *w = WidgetArg(o, "Widget_GetSize");
    if (!w) return nullptr;
    return PyInt_FromLong(static_cast<long>(w->GetSize()));
}

PyObject *f_WidgetImpl_GetItems(PyObject *, PyObject *args) {
    PyObject *o;
    if (!PyArg_ParseTuple(args, "O!:WidgetImpl_GetItems", &HandleType, &o)) return nullptr;
    Bench::WidgetImpl *w = Arg<Bench::WidgetImpl>(o, K_WIDGET_IMPL, "WidgetImpl_GetItems");
    if (!w) return nullptr;
    std::vector<Bench::Item *> items = w->GetItems();
    PyObject *t = PyTuple_New(static_cast<Py_ssize_t>(items.size()));
    if (!t) return nullptr;
    for (size_t i = 0; i < items.size(); ++i) {
        PyObject *h = NewHandle(items[i], K_ITEM);
        if (!h) {
            Py_DECREF(t);
            return nullptr;
        }
        PyTuple_SET_ITEM(t, static_cast<Py_ssize_t>(i), h);
    }
    return t;
}

PyObject *f_WidgetImpl_Sum(PyObject *, PyObject *args) {
    PyObject *o, *seq;
    if (!PyArg_ParseTuple(args, "O!O:WidgetImpl_Sum", &HandleType, &o, &seq)) return nullptr;
    Bench::WidgetImpl *w = Arg<Bench::WidgetImpl>(o, K_WIDGET_IMPL, "WidgetImpl_Sum");
    if (!w) return nullptr;
    PyObject *fast = PySequence_Fast(seq, "WidgetImpl_Sum: argument 2 must be a sequence");
    if (!fast) return nullptr;
    Py_ssize_t n = PySequence_Fast_GET_SIZE(fast);
    PyObject **items = PySequence_Fast_ITEMS(fast);
    std::vector<uint64_t> values(static_cast<size_t>(n));
    for (Py_ssize_t i = 0; i < n; ++i) {
        if (!ToU64(items[i], &values[static_cast<size_t>(i)])) {
            Py_DECREF(fast);
            return nullptr;
        }
    }
    Py_DECREF(fast);
    uint64_t sum = w->Sum(values);
    return sum <= 0x7FFFFFFFu ? PyInt_FromLong(static_cast<long>(sum)) : PyLong_FromUnsignedLongLong(sum);
}

PyObject *f_WidgetImpl_Fail(PyObject *, PyObject *args) {
    PyObject *o;
    if (!PyArg_ParseTuple(args, "O!:WidgetImpl_Fail", &HandleType, &o)) return nullptr;
    Bench::WidgetImpl *w = Arg<Bench::WidgetImpl>(o, K_WIDGET_IMPL, "WidgetImpl_Fail");
    if (!w) return nullptr;
    try {
        w->Fail();
    } catch (Bench::Error &e) {
        PyErr_SetString(FloorError, e.what());
        return nullptr;
    }
    Py_RETURN_NONE;
}

// ---- Product calls -------------------------------------------------------------

PyObject *f_option(PyObject *, PyObject *args) {
    const char *branch, *name;
    if (!PyArg_ParseTuple(args, "ss:option", &branch, &name)) return nullptr;
    try {
        return NewHandle(BenchHost::FindOption(branch, name), K_OPTION);
    } catch (std::exception &e) {
        return LibraryError(e);
    }
}

PyObject *f_int_option(PyObject *, PyObject *args) {
    const char *branch, *name;
    if (!PyArg_ParseTuple(args, "ss:int_option", &branch, &name)) return nullptr;
    try {
        return NewHandle(BenchHost::FindIntOption(branch, name), K_INT_OPTION_IMPL);
    } catch (std::exception &e) {
        return LibraryError(e);
    }
}

PyObject *f_AdvancedOption_GetOptionName(PyObject *, PyObject *args) {
    PyObject *o;
    if (!PyArg_ParseTuple(args, "O!:AdvancedOption_GetOptionName", &HandleType, &o)) return nullptr;
    HostCtl::Adv::AdvancedOption *p = Arg<HostCtl::Adv::AdvancedOption>(o, K_OPTION, "AdvancedOption_GetOptionName");
    if (!p) return nullptr;
    try {
        std::string s = p->GetOptionName();
        return PyString_FromStringAndSize(s.data(), static_cast<Py_ssize_t>(s.size()));
    } catch (HostCtl::Lib::HostCtlException &e) {
        return LibraryError(e);
    }
}

PyObject *f_AdvancedIntegerOptionImpl_GetValue(PyObject *, PyObject *args) {
    PyObject *o;
    if (!PyArg_ParseTuple(args, "O!:AdvancedIntegerOptionImpl_GetValue", &HandleType, &o)) return nullptr;
    QorCtl::Adv::AdvancedIntegerOptionImpl *p =
        Arg<QorCtl::Adv::AdvancedIntegerOptionImpl>(o, K_INT_OPTION_IMPL, "AdvancedIntegerOptionImpl_GetValue");
    if (!p) return nullptr;
    try {
        return PyInt_FromLong(static_cast<long>(p->GetValue()));
    } catch (HostCtl::Lib::HostCtlException &e) {
        return LibraryError(e);
    }
}

PyObject *f_AdvancedIntegerOptionImpl_SetValue(PyObject *, PyObject *args) {
    PyObject *o, *v;
    if (!PyArg_ParseTuple(args, "O!O:AdvancedIntegerOptionImpl_SetValue", &HandleType, &o, &v)) return nullptr;
    QorCtl::Adv::AdvancedIntegerOptionImpl *p =
        Arg<QorCtl::Adv::AdvancedIntegerOptionImpl>(o, K_INT_OPTION_IMPL, "AdvancedIntegerOptionImpl_SetValue");
    uint32_t value;
    if (!p || !ToU32(v, &value)) return nullptr;
    try {
        p->SetValue(value);
    } catch (HostCtl::Lib::HostCtlException &e) {
        return LibraryError(e);
    }
    Py_RETURN_NONE;
}

// The interface method on the implementation handle (adjusted per call).
PyObject *f_AdvancedIntegerOption_GetValue(PyObject *, PyObject *args) {
    PyObject *o;
    if (!PyArg_ParseTuple(args, "O!:AdvancedIntegerOption_GetValue", &HandleType, &o)) return nullptr;
    HostCtl::Adv::AdvancedIntegerOption *p = IntOptionArg(o, "AdvancedIntegerOption_GetValue");
    if (!p) return nullptr;
    try {
        return PyInt_FromLong(static_cast<long>(p->GetValue()));
    } catch (HostCtl::Lib::HostCtlException &e) {
        return LibraryError(e);
    }
}

PyMethodDef methods[] = {
    {"shared_impl", f_shared_impl, METH_VARARGS, nullptr},
    {"shared_widget", f_shared_widget, METH_VARARGS, nullptr},
    {"WidgetImpl_GetName", f_WidgetImpl_GetName, METH_VARARGS, nullptr},
    {"WidgetImpl_SetSize", f_WidgetImpl_SetSize, METH_VARARGS, nullptr},
    {"Widget_GetSize", f_Widget_GetSize, METH_VARARGS, nullptr},
    {"WidgetImpl_GetItems", f_WidgetImpl_GetItems, METH_VARARGS, nullptr},
    {"WidgetImpl_Sum", f_WidgetImpl_Sum, METH_VARARGS, nullptr},
    {"WidgetImpl_Fail", f_WidgetImpl_Fail, METH_VARARGS, nullptr},
    {"option", f_option, METH_VARARGS, nullptr},
    {"int_option", f_int_option, METH_VARARGS, nullptr},
    {"AdvancedOption_GetOptionName", f_AdvancedOption_GetOptionName, METH_VARARGS, nullptr},
    {"AdvancedIntegerOptionImpl_GetValue", f_AdvancedIntegerOptionImpl_GetValue, METH_VARARGS, nullptr},
    {"AdvancedIntegerOptionImpl_SetValue", f_AdvancedIntegerOptionImpl_SetValue, METH_VARARGS, nullptr},
    {"AdvancedIntegerOption_GetValue", f_AdvancedIntegerOption_GetValue, METH_VARARGS, nullptr},
    {nullptr, nullptr, 0, nullptr},
};

}  // namespace

extern "C" __attribute__((visibility("default"))) void init_benchfloor() {
    HandleType.tp_dealloc = reinterpret_cast<destructor>(PyObject_Del);
    HandleType.tp_flags = Py_TPFLAGS_DEFAULT;
    if (PyType_Ready(&HandleType) < 0) return;
    PyObject *m = Py_InitModule("_benchfloor", methods);
    if (!m) return;
    FloorError = PyErr_NewException(const_cast<char *>("_benchfloor.Error"), nullptr, nullptr);
    if (!FloorError) return;
    Py_INCREF(FloorError);
    PyModule_AddObject(m, "Error", FloorError);
    PyObject *type = reinterpret_cast<PyObject *>(&HandleType);
    Py_INCREF(type);
    PyModule_AddObject(m, "Handle", type);
}
