// The global-variable link object and module constants.
#include "test_runtime_support.h"

#include <cstdio>

using namespace rtest;

namespace {

long g_value = 5;
int g_setter_calls = 0;

PyObject *GetValue() { return qr::FromInt(g_value); }
int SetValue(PyObject *v) {
    ++g_setter_calls;
    int32_t x;
    int r = qr::ToInt32(v, &x);
    if (!qr::IsOk(r)) return qr::VariableError(r, "ns::value", "int");
    g_value = x;
    return 0;
}
PyObject *GetNothing() { return nullptr; }  // no value and no error
int SetRefused(PyObject *) { return 1; }   // failure without an error
PyObject *GetRaises() {
    PyErr_SetString(PyExc_KeyError, "getter");
    return nullptr;
}
int ReadOnlyMtu(PyObject *) { return qr::ReadOnlyVariable("Portset_DEF_MTU"); }
int ReadOnlyCdp(PyObject *) { return qr::ReadOnlyArrayVariable("HostCtl::Network::CDP_STATUS", "std::string []"); }

}  // namespace

using RuntimeVarLink = RuntimeTest;

TEST_F(RuntimeVarLink, ReadWriteAndErrors) {
    g_value = 5;
    PyObject *link = qr::NewGlobalVarLink();
    qr::AddGlobalVariable(link, "value", GetValue, SetValue);
    qr::AddGlobalVariable(link, "Portset_DEF_MTU", GetValue, ReadOnlyMtu);
    qr::AddGlobalVariable(link, "CDP_STATUS", GetNothing, ReadOnlyCdp);
    qr::AddGlobalVariable(link, "quiet", GetNothing, SetRefused);
    qr::AddGlobalVariable(link, "raising", GetRaises, SetRefused);
    SetGlobal("cv", link);

    PyObject *r = Eval("(cv.value, str(cv), repr(cv))");
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(Repr(r), "(5, '(raising, quiet, CDP_STATUS, Portset_DEF_MTU, value)', '<Swig global variables>')");
    Py_DECREF(r);
    g_value = 6;  // nothing is cached
    ASSERT_TRUE(RunPy("assert cv.value == 6\ncv.value = 9\n"));
    EXPECT_EQ(g_value, 9);

    struct E { const char *code, *error; };
    E errors[] = {
        {"cv.missing", "NameError: Unknown C global variable"},
        {"cv.quiet", "NameError: Unknown C global variable"},
        {"cv.raising", "KeyError: 'getter'"},
        {"cv.missing = 1", "NameError: Unknown C global variable"},
        {"cv.quiet = 1", "NameError: Unknown C global variable"},
        {"cv.value = 'x'", "TypeError: in variable 'ns::value' of type 'int'"},
        {"cv.value = 2**40", "TypeError: in variable 'ns::value' of type 'int'"},
        {"cv.Portset_DEF_MTU = 1", "AttributeError: Variable Portset_DEF_MTU is read-only."},
        {"cv.CDP_STATUS = 1",
         "AttributeError: in variable 'read-only HostCtl::Network::CDP_STATUS' of type 'std::string []'"},
    };
    for (const E &e : errors) {
        PyObject *res = PyRun_String(e.code, Py_single_input, PyModule_GetDict(PyImport_AddModule("__main__")),
                                     PyModule_GetDict(PyImport_AddModule("__main__")));
        EXPECT_EQ(res, nullptr) << e.code;
        Py_XDECREF(res);
        EXPECT_EQ(TakeError(), e.error) << e.code;
    }
    // Deleting a variable is refused before any setter runs.
    g_setter_calls = 0;
    EXPECT_EQ(PyObject_DelAttrString(Global("cv"), "value"), 1);
    EXPECT_EQ(TakeError(), "TypeError: C global variable 'value' cannot be deleted");
    EXPECT_EQ(g_setter_calls, 0);
    EXPECT_EQ(g_value, 9);
    PyObject_DelAttrString(Global("cv"), "missing");
    EXPECT_EQ(TakeError(), "NameError: Unknown C global variable");

    std::FILE *f = std::tmpfile();
    ASSERT_EQ(PyObject_Print(Global("cv"), f, 0), 0);
    char buf[128] = {};
    std::rewind(f);
    std::fread(buf, 1, sizeof buf - 1, f);
    std::fclose(f);
    EXPECT_STREQ(buf, "Swig global variables (raising, quiet, CDP_STATUS, Portset_DEF_MTU, value)\n");
}

TEST_F(RuntimeVarLink, OneCvarPerProcessAndConstants) {
    PyObject *cvar = qr::GlobalVarLink();
    ASSERT_NE(cvar, nullptr);
    EXPECT_EQ(qr::GlobalVarLink(), cvar);
    EXPECT_STREQ(Py_TYPE(cvar)->tp_name, "swigvarlink");
    PyObject *plain = PyDict_New();
    qr::AddGlobalVariable(plain, "x", GetValue, SetValue);  // not a link: ignored
    EXPECT_EQ(PyDict_Size(plain), 0);
    PyObject *value = PyInt_FromLong(123456789);  // not a cached small int
    Py_INCREF(value);
    qr::InstallConstant(plain, "SystemInfoImpl_TELMOR_PARTITION_STORE", value);
    EXPECT_EQ(PyDict_GetItemString(plain, "SystemInfoImpl_TELMOR_PARTITION_STORE"), value);
    EXPECT_EQ(Py_REFCNT(value), 2);  // the dictionary's and ours: the creator's was dropped
    Py_DECREF(value);
    qr::InstallConstant(plain, "FAILED", nullptr);  // a failed creation installs nothing
    EXPECT_EQ(PyDict_Size(plain), 1);
    Py_DECREF(plain);
}
