// The wrapped-pointer object: texts, numbers, ownership methods, appended
// views, and deallocation through the registered destroy function.
#include "test_runtime_support.h"

#include <cstdio>
#include <vector>

using namespace rtest;

namespace {

swig_type_info thing_ty = {"_p_Thing", "Thing *|thing_t *", nullptr, nullptr, nullptr, 0};
swig_type_info plain_ty = {"_p_Bare", nullptr, nullptr, nullptr, nullptr, 0};

// delete_Thing in both calling styles: records what it destroyed.
std::vector<void *> g_deleted;

PyObject *DeleteThing(PyObject *obj) {
    void *p = nullptr;
    if (!qr::ArgPtr(obj, &p, &thing_ty, "delete_Thing", 1, "Thing *", qr::POINTER_DISOWN | qr::POINTER_DESTROY))
        return nullptr;
    g_deleted.push_back(p);
    return qr::NoneResult();
}
PyObject *DeleteVarargs(PyObject *, PyObject *args) {
    PyObject *obj;
    return PyArg_ParseTuple(args, "O:delete_Thing", &obj) ? DeleteThing(obj) : nullptr;
}
PyObject *DeleteO(PyObject *, PyObject *obj) { return DeleteThing(obj); }
PyObject *DeleteRaises(PyObject *, PyObject *) {
    PyErr_SetString(PyExc_KeyError, "from the destroy function");
    return nullptr;
}
PyMethodDef delete_varargs = {"delete_Thing", DeleteVarargs, METH_VARARGS, nullptr};
PyMethodDef delete_o = {"delete_Thing_o", DeleteO, METH_O, nullptr};
PyMethodDef delete_raises = {"delete_raises", DeleteRaises, METH_VARARGS, nullptr};

// Registers a new-style class whose __swig_destroy__ is fn on thing_ty.
void RegisterThing(PyMethodDef *fn) {
    SetGlobal("thing_destroy", PyCFunction_New(fn, nullptr));
    ASSERT_TRUE(RunPy("class Thing(object):\n    __swig_destroy__ = thing_destroy\n"));
    qr::RegisterClass(&thing_ty, Global("Thing"));
}

std::string ReleaseCapturingStdout(PyObject *o) {
    testing::internal::CaptureStdout();
    Py_DECREF(o);
    std::fflush(stdout);
    return testing::internal::GetCapturedStdout();
}

}  // namespace

using RuntimeSwigObject = RuntimeTest;

TEST_F(RuntimeSwigObject, ReprStrAndNumberSlots) {
    PyObject *o = qr::NewSwigObject(reinterpret_cast<void *>(0x0804a0b0), &thing_ty, 0);
    EXPECT_EQ(Repr(o), "<Swig Object of type 'thing_t *' at 0x804a0b0>");
    EXPECT_EQ(Str(o), "_b0a0040800000000_p_Thing");  // pointer bytes in memory order
    SetGlobal("o", o);
    PyObject *r = Eval("(hex(o), oct(o), int(o), long(o), type(int(o)) is int, o.__repr__())");
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(Repr(r), "('804a0b0', '1001120260', 134521008, 134521008L, True, "
                       "\"<Swig Object of type 'thing_t *' at 0x804a0b0>\")");
    Py_DECREF(r);
    // Above 2**31 - 1 the pointer is a long, as on a 32-bit interpreter.
    SetGlobal("high", qr::NewSwigObject(reinterpret_cast<void *>(0x80000000UL), nullptr, 0));
    r = Eval("(int(high), hex(high), repr(high))");
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(Repr(r), "(2147483648L, '80000000', \"<Swig Object of type 'unknown' at 0x80000000>\")");
    Py_DECREF(r);
    PyObject *bare = qr::NewSwigObject(reinterpret_cast<void *>(0x10), &plain_ty, 0);
    EXPECT_EQ(Repr(bare), "<Swig Object of type '_p_Bare' at 0x10>");
    // print writes the repr.
    std::FILE *f = std::tmpfile();
    ASSERT_EQ(PyObject_Print(bare, f, 0), 0);
    char buf[128] = {};
    std::rewind(f);
    ASSERT_NE(std::fgets(buf, sizeof buf, f), nullptr);
    std::fclose(f);
    EXPECT_STREQ(buf, "<Swig Object of type '_p_Bare' at 0x10>");
    Py_DECREF(bare);
}

TEST_F(RuntimeSwigObject, CompareByPointerValueOnly) {
    SetGlobal("a", qr::NewSwigObject(reinterpret_cast<void *>(0x1000), &thing_ty, 0));
    SetGlobal("b", qr::NewSwigObject(reinterpret_cast<void *>(0x1000), &plain_ty, 0));
    SetGlobal("c", qr::NewSwigObject(reinterpret_cast<void *>(0x80000000UL), &thing_ty, 0));
    PyObject *r = Eval("(a == b, a is b, a < c, c > b, cmp(c, a), a != c)");
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(Repr(r), "(True, False, True, True, 1, True)");
    Py_DECREF(r);
}

TEST_F(RuntimeSwigObject, OwnershipMethods) {
    SetGlobal("o", qr::NewSwigObject(reinterpret_cast<void *>(0x20), &plain_ty, 0));
    PyObject *r = Eval("(o.own(), o.own(1), o.own(), o.disown(), o.own(), o.acquire(), o.own(0), o.own())");
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(Repr(r), "(False, False, True, None, False, None, True, False)");
    Py_DECREF(r);
    EXPECT_EQ(TryEval("o.own(1, 2)"), nullptr);
    EXPECT_NE(TakeError().find("TypeError"), std::string::npos);
}

TEST_F(RuntimeSwigObject, AppendedViews) {
    SetGlobal("a", qr::NewSwigObject(reinterpret_cast<void *>(0xa), &thing_ty, 0));
    SetGlobal("b", qr::NewSwigObject(reinterpret_cast<void *>(0xb), &plain_ty, 0));
    ASSERT_TRUE(RunPy("a.append(b)\nassert a.next() is b and b.next() is None\n"));
    EXPECT_EQ(Repr(Global("a")), "<Swig Object of type 'thing_t *' at 0xa><Swig Object of type '_p_Bare' at 0xb>");
    for (const char *bad : {"a.append(5)", "b.append(a)", "a.append(a)"}) {
        EXPECT_EQ(TryEval(bad), nullptr) << bad;
        std::string err = TakeError();
        EXPECT_TRUE(err.rfind("TypeError: append", 0) == 0 || err.rfind("ValueError: append", 0) == 0) << err;
    }
    EXPECT_EQ(Eval("b.next()"), Py_None);
    Py_DECREF(Py_None);
}

using RuntimeDealloc = RuntimeTest;

TEST_F(RuntimeDealloc, DestroyFunctionInBothCallingStyles) {
    static Plain a, b;
    for (PyMethodDef *fn : {&delete_varargs, &delete_o}) {
        RegisterThing(fn);
        g_deleted.clear();
        void *target = fn == &delete_o ? &b : &a;
        PyObject *o = qr::WrapPointer(target, &thing_ty, qr::POINTER_OWN | qr::POINTER_NO_SHADOW);
        EXPECT_EQ(ReleaseCapturingStdout(o), "");
        EXPECT_EQ(g_deleted, std::vector<void *>{target}) << fn->ml_name;
        // Borrowed objects are never destroyed.
        EXPECT_EQ(ReleaseCapturingStdout(qr::WrapPointer(target, &thing_ty, qr::POINTER_NO_SHADOW)), "");
        EXPECT_EQ(g_deleted.size(), 1u);
    }
    EXPECT_EQ(TakeError(), "");
}

TEST_F(RuntimeDealloc, LeakLineWithoutDestroyFunction) {
    static Plain p;
    EXPECT_EQ(ReleaseCapturingStdout(qr::NewSwigObject(&p, &plain_ty, 1)),
              "swig/python detected a memory leak of type '_p_Bare', no destructor found.\n");
    EXPECT_EQ(ReleaseCapturingStdout(qr::NewSwigObject(&p, nullptr, 1)),
              "swig/python detected a memory leak of type 'unknown', no destructor found.\n");
    EXPECT_EQ(ReleaseCapturingStdout(qr::NewSwigObject(&p, &plain_ty, 0)), "");
}

TEST_F(RuntimeDealloc, DeleteMarksDeadAndNothingIsDestroyedTwice) {
    static Plain p;
    RegisterThing(&delete_varargs);
    g_deleted.clear();
    SetGlobal("t", qr::WrapPointer(&p, &thing_ty, qr::POINTER_OWN));  // a Thing shadow instance
    ASSERT_TRUE(RunPy("thing_destroy(t)\n"));
    EXPECT_EQ(g_deleted.size(), 1u);
    EXPECT_EQ(TryEval("thing_destroy(t)"), nullptr);
    EXPECT_EQ(TakeError(), "ValueError: in method 'delete_Thing', argument 1 of type 'Thing *'");
    void *out = nullptr;
    EXPECT_FALSE(qr::ArgPtr(Global("t"), &out, &thing_ty, "Thing_set", 1, "Thing *"));
    EXPECT_EQ(TakeError(), "ValueError: in method 'Thing_set', argument 1 of type 'Thing *'");
    // acquire() on a destroyed object must not lead to a second destroy.
    testing::internal::CaptureStdout();
    ASSERT_TRUE(RunPy("t.this.acquire()\ndel t\n"));
    std::fflush(stdout);
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
    EXPECT_EQ(g_deleted.size(), 1u);
}

TEST_F(RuntimeDealloc, DestroyErrorsDoNotDisturbAPendingException) {
    static Plain p;
    RegisterThing(&delete_raises);
    PyObject *o = qr::WrapPointer(&p, &thing_ty, qr::POINTER_OWN | qr::POINTER_NO_SHADOW);
    PyErr_SetString(PyExc_IndexError, "pending");
    testing::internal::CaptureStderr();
    Py_DECREF(o);
    std::string err = testing::internal::GetCapturedStderr();
    EXPECT_NE(err.find("from the destroy function"), std::string::npos) << err;
    EXPECT_EQ(TakeError(), "IndexError: pending");
}

using RuntimePacked = RuntimeTest;

TEST_F(RuntimePacked, TextsAndCompare) {
    unsigned char v1[3] = {0x00, 0x7f, 0xff}, v2[3] = {0x00, 0x80, 0x00}, v3[2] = {0xff, 0xff};
    PyObject *a = qr::NewSwigPacked(v1, 3, &thing_ty);
    v1[0] = 0x55;  // the object holds its own copy
    SetGlobal("a", a);
    SetGlobal("b", qr::NewSwigPacked(v2, 3, &thing_ty));
    SetGlobal("c", qr::NewSwigPacked(v3, 2, nullptr));
    EXPECT_EQ(Str(a), "_007fff_p_Thing");
    EXPECT_EQ(Repr(a), "<Swig Packed at _007fff_p_Thing>");
    PyObject *r = Eval("(a < b, c < a, a == a, cmp(b, a), str(c))");
    ASSERT_NE(r, nullptr);
    EXPECT_EQ(Repr(r), "(True, True, True, 1, '_ffff')");
    Py_DECREF(r);
    std::vector<unsigned char> big(600, 0xee);  // hex text does not fit 1,024 bytes
    PyObject *large = qr::NewSwigPacked(big.data(), big.size(), &thing_ty);
    EXPECT_EQ(Repr(large), "<Swig Packed _p_Thing>");
    EXPECT_EQ(Str(large), "_p_Thing");
    std::FILE *f = std::tmpfile();
    ASSERT_EQ(PyObject_Print(large, f, 0), 0);
    ASSERT_EQ(PyObject_Print(a, f, 0), 0);
    char buf[128] = {};
    std::rewind(f);
    ASSERT_NE(std::fgets(buf, sizeof buf, f), nullptr);
    std::fclose(f);
    EXPECT_STREQ(buf, "<Swig Packed _p_Thing><Swig Packed at _007fff_p_Thing>");
    Py_DECREF(large);
}

TEST(RuntimePackedText, FitsOrRefuses) {
    char buf[32];
    uint32_t v = 0x0804a0b0;
    ASSERT_TRUE(qr::PackedText(buf, sizeof buf, &v, 4, "_p_Pnic"));
    EXPECT_STREQ(buf, "_b0a00408_p_Pnic");
    EXPECT_FALSE(qr::PackedText(buf, 9, &v, 4, ""));  // needs at least 10 bytes
    EXPECT_TRUE(qr::PackedText(buf, 10, &v, 4, ""));
    EXPECT_TRUE(qr::PackedText(buf, 16, &v, 4, "_p_Pni"));   // 9 + 6 + 1
    EXPECT_FALSE(qr::PackedText(buf, 16, &v, 4, "_p_Pnic"));
}
