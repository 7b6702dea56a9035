// Converters at their boundaries (with 32-bit interpreter semantics by
// value), builders, and the wrapper protocol's messages and exceptions.
#include "test_runtime_support.h"

#include <stdexcept>

using namespace rtest;

namespace {

struct Case {
    const char *expr;
    int code;
    long long value;
};

// Runs conv on each expression; checks the code, the value on success, and
// that no Python error is left behind.
template <class T>
void Check(int (*conv)(PyObject *, T *), std::initializer_list<Case> cases) {
    for (const Case &c : cases) {
        PyObject *o = Eval(c.expr);
        ASSERT_NE(o, nullptr) << c.expr;
        T v = T();
        EXPECT_EQ(conv(o, &v), c.code) << c.expr;
        if (c.code == 0) {
            EXPECT_EQ(static_cast<long long>(v), c.value) << c.expr;
        }
        EXPECT_EQ(conv(o, nullptr), c.code) << c.expr << " (no output)";
        EXPECT_EQ(TakeError(), "") << c.expr;
        Py_DECREF(o);
    }
}

const int TYPE = qr::ERR_TYPE, OVER = qr::ERR_OVERFLOW;

}  // namespace

using RuntimeConvert = RuntimeTest;

TEST_F(RuntimeConvert, SignedIntegers) {
    Check<int32_t>(qr::ToInt32, {{"2**31-1", 0, 2147483647}, {"-2**31", 0, -2147483648LL}, {"5L", 0, 5},
                                 {"True", 0, 1}, {"2**31", TYPE, 0}, {"2L**31", TYPE, 0}, {"-2**31-1", TYPE, 0},
                                 {"3.0", TYPE, 0}, {"'1'", TYPE, 0}, {"None", TYPE, 0}});
    Check<int64_t>(qr::ToInt64, {{"2**63-1", 0, 9223372036854775807LL}, {"-2**63", 0, -9223372036854775807LL - 1},
                                 {"-2**40", 0, -1099511627776LL}, {"7", 0, 7}, {"False", 0, 0},
                                 {"2**63", TYPE, 0}, {"-2**63-1", TYPE, 0}, {"1.5", TYPE, 0}, {"'x'", TYPE, 0}});
}

TEST_F(RuntimeConvert, UnsignedIntegers) {
    Check<uint32_t>(qr::ToUint32, {{"4294967295L", 0, 4294967295LL}, {"2**31", 0, 2147483648LL}, {"0", 0, 0},
                                   {"True", 0, 1}, {"4294967296L", TYPE, 0}, {"2**32", TYPE, 0}, {"-1", OVER, 0},
                                   {"-2**31", OVER, 0}, {"-1L", TYPE, 0}, {"-2**31-1", TYPE, 0},
                                   {"1.0", TYPE, 0}, {"None", TYPE, 0}});
    Check<uint16_t>(qr::ToUint16, {{"65535", 0, 65535}, {"65536", OVER, 0}, {"-1", OVER, 0}, {"2**32", TYPE, 0}});
    Check<uint8_t>(qr::ToUint8, {{"255L", 0, 255}, {"256", OVER, 0}, {"-1", OVER, 0}, {"'a'", TYPE, 0}});
    Check<uint64_t>(qr::ToUint64, {{"2**64-1", 0, -1}, {"2**40", 0, 1099511627776LL}, {"7", 0, 7}, {"7L", 0, 7},
                                   {"2**64", TYPE, 0}, {"-1", OVER, 0}, {"-1L", TYPE, 0}, {"-2**40", TYPE, 0},
                                   {"[]", TYPE, 0}});
}

TEST_F(RuntimeConvert, BoolAndChar) {
    Check<bool>(qr::ToBool, {{"[]", 0, 0}, {"[0]", 0, 1}, {"None", 0, 0}, {"''", 0, 0}, {"object()", 0, 1}});
    ASSERT_TRUE(RunPy("class BadTruth(object):\n    def __nonzero__(self): raise KeyError('truth')\n"));
    PyObject *bad = Eval("BadTruth()");
    EXPECT_EQ(qr::ToBool(bad, nullptr), qr::ERR_GENERIC);
    EXPECT_EQ(TakeError(), "KeyError: 'truth'");  // left for the wrapper to replace
    EXPECT_FALSE(qr::ProbeBool(bad));
    EXPECT_EQ(TakeError(), "");
    EXPECT_FALSE(qr::ArgBool(bad, nullptr, "f", 2, "bool"));
    EXPECT_EQ(TakeError(), "TypeError: in method 'f', argument 2 of type 'bool'");
    Py_DECREF(bad);
    Check<char>(qr::ToChar, {{"'x'", 0, 'x'}, {"''", 0, 0}, {"'\\xff'", 0, -1}, {"1", 0, 1}, {"127", 0, 127},
                             {"-128", 0, -128}, {"None", 0, 0}, {"128", OVER, 0}, {"-129", OVER, 0},
                             {"'ab'", TYPE, 0}, {"u'x'", TYPE, 0}, {"2**40", TYPE, 0}});
}

TEST_F(RuntimeConvert, CharArraysAndBuffers) {
    char out[5] = {'?', '?', '?', '?', '?'};
    PyObject *s = PyString_FromString("abcd");
    EXPECT_EQ(qr::ToCharArray(s, out, 4), 0);
    EXPECT_EQ(std::string(out, 5), std::string("abcd?", 5));  // exactly N characters fit
    Py_DECREF(s);
    s = PyString_FromString("ab");
    EXPECT_EQ(qr::ToCharArray(s, out, 4), 0);
    EXPECT_EQ(std::string(out, 4), std::string("ab\0\0", 4));
    Py_DECREF(s);
    s = PyString_FromString("abcde");
    EXPECT_EQ(qr::ToCharArray(s, out, 4), TYPE);
    Py_DECREF(s);

    s = PyString_FromStringAndSize("a\0b", 3);
    char *p = nullptr;
    size_t n = 0;
    EXPECT_EQ(qr::ToCharBuffer(s, &p, &n, false), 0);
    EXPECT_EQ(p, PyString_AS_STRING(s));
    EXPECT_EQ(n, 4u);
    EXPECT_EQ(qr::ToCharBuffer(s, &p, &n, true), qr::RESULT_NEW_OBJECT);
    EXPECT_NE(p, PyString_AS_STRING(s));
    EXPECT_EQ(std::string(p, 4), std::string("a\0b\0", 4));
    delete[] p;
    Py_DECREF(s);
    char text[] = "wrapped";
    PyObject *w = qr::NewSwigObject(text, A(A_char), 0);
    EXPECT_EQ(qr::ToCharBuffer(w, &p, &n, false), 0);
    EXPECT_EQ(p, text);
    EXPECT_EQ(n, 8u);
    EXPECT_EQ(qr::ToCharBuffer(w, &p, &n, true), qr::RESULT_NEW_OBJECT);
    EXPECT_STREQ(p, "wrapped");
    EXPECT_NE(p, text);
    delete[] p;
    Py_DECREF(w);
    EXPECT_EQ(qr::ToCharBuffer(Py_None, &p, &n, true), 0);
    EXPECT_EQ(p, nullptr);
    EXPECT_EQ(n, 0u);
    PyObject *u = Eval("u'x'");
    EXPECT_EQ(qr::ToCharBuffer(u, &p, &n, false), TYPE);
    Py_DECREF(u);
    EXPECT_EQ(TakeError(), "");
}

TEST_F(RuntimeConvert, StdStrings) {
    std::string *out = nullptr;
    PyObject *s = PyString_FromStringAndSize("a\0b", 3);
    ASSERT_EQ(qr::ToStdString(s, &out), qr::RESULT_NEW_OBJECT);
    EXPECT_EQ(*out, std::string("a\0b", 3));
    delete out;
    Py_DECREF(s);
    EXPECT_EQ(qr::ToStdString(Py_None, &out), 0);
    EXPECT_EQ(out, nullptr);
    std::string held = "held";
    PyObject *w = qr::NewSwigObject(&held, A(A_string), 0);
    EXPECT_EQ(qr::ToStdString(w, &out), 0);
    EXPECT_EQ(out, &held);  // borrowed, not copied
    Py_DECREF(w);
    PyObject *u = Eval("u'x'");
    EXPECT_LT(qr::ToStdString(u, &out), 0);
    EXPECT_FALSE(qr::ProbeString(u));
    EXPECT_TRUE(qr::ProbeString(Py_None));

    qr::StrArg by_value, by_ref, unicode, good;
    EXPECT_FALSE(by_value.Convert(Py_None, true, "f", 2, "std::string"));
    EXPECT_EQ(TakeError(), "TypeError: in method 'f', argument 2 of type 'std::string'");
    EXPECT_FALSE(by_ref.Convert(Py_None, false, "f", 3, "std::string const &"));
    EXPECT_EQ(TakeError(), "ValueError: invalid null reference in method 'f', argument 3 of type 'std::string const &'");
    EXPECT_FALSE(unicode.Convert(u, false, "f", 2, "std::string const &"));
    EXPECT_EQ(TakeError(), "TypeError: in method 'f', argument 2 of type 'std::string const &'");
    Py_DECREF(u);
    s = PyString_FromString("text");
    ASSERT_TRUE(good.Convert(s, true, "f", 2, "std::string"));
    EXPECT_EQ(good.get(), "text");
    qr::CharPtrArg cp;
    ASSERT_TRUE(cp.Convert(s, "f", 2, "char *"));
    EXPECT_STREQ(cp.get(), "text");
    EXPECT_NE(cp.get(), PyString_AS_STRING(s));  // the library never writes into a Python string
    Py_DECREF(s);
}

TEST_F(RuntimeConvert, BuildersFollowThe32BitThresholds) {
    struct B { PyObject *o; const char *repr; };
    static char buf[4] = "abc";
    B cases[] = {
        {qr::FromUint32(2147483647u), "2147483647"},   {qr::FromUint32(2147483648u), "2147483648L"},
        {qr::FromUint64(5), "5"},                      {qr::FromUint64(2147483648ull), "2147483648L"},
        {qr::FromUint64(~0ull), "18446744073709551615L"}, {qr::FromInt64(-2147483648LL), "-2147483648"},
        {qr::FromInt64(-2147483649LL), "-2147483649L"}, {qr::FromInt64(2147483648LL), "2147483648L"},
        {qr::FromInt(-5), "-5"},                       {qr::FromBool(true), "True"},
        {qr::FromChar('\1'), "'\\x01'"},               {qr::FromCString(nullptr), "None"},
        {qr::FromCString("hi"), "'hi'"},               {qr::FromStdString(std::string("a\0b", 3)), "'a\\x00b'"},
        {qr::FromCharArray("ab\0c\0\0", 6), "'ab\\x00c'"}, {qr::FromCharArray(nullptr, 3), "None"},
        {qr::FromCharBuffer(nullptr, 3), "None"},
    };
    for (const B &c : cases) {
        ASSERT_NE(c.o, nullptr) << c.repr;
        EXPECT_EQ(Repr(c.o), c.repr);
        Py_DECREF(c.o);
    }
    // Over 2,147,483,647 bytes the buffer is wrapped as a char pointer.
    PyObject *huge = qr::FromCharBuffer(buf, 2147483648u);
    ASSERT_TRUE(huge && qr::IsSwigObject(huge));
    EXPECT_EQ(reinterpret_cast<PySwigObject *>(huge)->ptr, buf);
    EXPECT_EQ(reinterpret_cast<PySwigObject *>(huge)->ty, A(A_char));
    Py_DECREF(huge);
}

using RuntimeProtocol = RuntimeTest;

TEST_F(RuntimeProtocol, ErrorClassesAndMessages) {
    struct E { int code; PyObject *cls; };
    E table[] = {{-1, PyExc_RuntimeError}, {-2, PyExc_IOError}, {-3, PyExc_RuntimeError},
                 {-4, PyExc_IndexError}, {-5, PyExc_TypeError}, {-6, PyExc_ZeroDivisionError},
                 {-7, PyExc_OverflowError}, {-8, PyExc_SyntaxError}, {-9, PyExc_ValueError},
                 {-10, PyExc_SystemError}, {-11, PyExc_AttributeError}, {-12, PyExc_MemoryError},
                 {-13, PyExc_RuntimeError}, {0, PyExc_RuntimeError}};
    for (const E &e : table) EXPECT_EQ(qr::ErrorClassFor(e.code), e.cls) << e.code;

    qr::ArgError(qr::ERR_GENERIC, "Portset_GetFlags", 1, "HostCtl::Network::Portset *");
    EXPECT_EQ(TakeError(), "TypeError: in method 'Portset_GetFlags', argument 1 of type 'HostCtl::Network::Portset *'");
    qr::ArgError(qr::ERR_OVERFLOW, "f", 2, "uint8");
    EXPECT_EQ(TakeError(), "OverflowError: in method 'f', argument 2 of type 'uint8'");
    qr::NullVarError("paramDesc::vals", "uint32 [4]");
    EXPECT_EQ(TakeError(), "ValueError: invalid null reference in variable 'paramDesc::vals' of type 'uint32 [4]'");
    const char *protos[] = {"incr(swig::PySwigIterator *,size_t)", "incr(swig::PySwigIterator *)", nullptr};
    EXPECT_EQ(qr::OverloadError("PySwigIterator_incr", protos), nullptr);
    EXPECT_EQ(TakeError(), "NotImplementedError: Wrong number of arguments for overloaded function "
                           "'PySwigIterator_incr'.\n  Possible C/C++ prototypes are:\n"
                           "    incr(swig::PySwigIterator *,size_t)\n    incr(swig::PySwigIterator *)\n");

    uint32_t v;
    PyObject *neg = PyInt_FromLong(-1);
    EXPECT_FALSE(qr::ArgUint32(neg, &v, "f", 3, "uint32"));
    EXPECT_EQ(TakeError(), "OverflowError: in method 'f', argument 3 of type 'uint32'");
    EXPECT_FALSE(qr::ProbeUint32(neg));
    EXPECT_TRUE(qr::ProbeInt32(neg));
    Py_DECREF(neg);
}

TEST_F(RuntimeProtocol, AppendErrorMessage) {
    PyErr_SetString(PyExc_ValueError, "bad value");
    qr::AppendErrorMessage("in element 2");
    EXPECT_EQ(TakeError(), "ValueError: bad value in element 2");
    qr::AppendErrorMessage("alone");
    EXPECT_EQ(TakeError(), "RuntimeError: alone");
    PyErr_SetNone(PyExc_KeyError);
    qr::AppendErrorMessage("no value");
    EXPECT_EQ(TakeError(), "RuntimeError: no value");
}

TEST_F(RuntimeProtocol, NullSelfAndReferences) {
    void *out = &out;
    EXPECT_FALSE(qr::ArgSelf(Py_None, &out, A(A_Root), "Root_Get", "Root *"));
    EXPECT_EQ(TakeError(), "ValueError: invalid null reference in method 'Root_Get', argument 1 of type 'Root *'");
    PyObject *null_obj = qr::NewSwigObject(nullptr, A(A_Root), 0);
    EXPECT_FALSE(qr::ArgSelf(null_obj, &out, A(A_Root), "Root_Get", "Root *"));
    EXPECT_NE(TakeError().find("invalid null reference"), std::string::npos);
    Py_DECREF(null_obj);
    EXPECT_TRUE(qr::ArgPtr(Py_None, &out, A(A_Root), "Root_r_set", 1, "Root *"));  // setters skip
    EXPECT_EQ(out, nullptr);
    EXPECT_FALSE(qr::ArgRef(Py_None, &out, A(A_Root), "f", 2, "Root const &"));
    EXPECT_EQ(TakeError(), "ValueError: invalid null reference in method 'f', argument 2 of type 'Root const &'");
    PyObject *five = PyInt_FromLong(5);
    EXPECT_FALSE(qr::ArgSelf(five, &out, A(A_Root), "Root_Get", "Root *"));
    EXPECT_EQ(TakeError(), "TypeError: in method 'Root_Get', argument 1 of type 'Root *'");
    Py_DECREF(five);
}

namespace {
struct Exc {
    std::string msg;
};
int g_exc_deleted = 0;
PyObject *DeleteExc(PyObject *, PyObject *args) {
    PyObject *o;
    void *p;
    if (!PyArg_ParseTuple(args, "O:delete_Exc", &o)) return nullptr;
    if (!qr::ArgPtr(o, &p, &rtest::TestRing().a_types[A_Exc], "delete_Exc", 1, "Exc *",
                    qr::POINTER_DISOWN | qr::POINTER_DESTROY))
        return nullptr;
    delete static_cast<Exc *>(p);
    ++g_exc_deleted;
    return qr::NoneResult();
}
PyMethodDef delete_exc = {"delete_Exc", DeleteExc, METH_VARARGS, nullptr};
}  // namespace

TEST_F(RuntimeProtocol, LibraryExceptionsBeforeAndAfterRegistration) {
    A(A_Exc)->clientdata = nullptr;  // repeatable: not registered yet
    Exc *first = new Exc{"first"};
    EXPECT_EQ(qr::RaiseLibraryException(first, A(A_Exc)), nullptr);
    PyObject *t, *v, *tb;
    PyErr_Fetch(&t, &v, &tb);
    EXPECT_EQ(t, PyExc_RuntimeError);
    ASSERT_TRUE(v && qr::IsSwigObject(v));
    EXPECT_EQ(reinterpret_cast<PySwigObject *>(v)->ptr, first);
    EXPECT_EQ(reinterpret_cast<PySwigObject *>(v)->own, 1);
    reinterpret_cast<PySwigObject *>(v)->own = 0;
    delete first;
    Py_XDECREF(t);
    Py_XDECREF(v);
    Py_XDECREF(tb);

    SetGlobal("delete_Exc", PyCFunction_New(&delete_exc, nullptr));
    ASSERT_TRUE(RunPy("class ExcCls(Exception):\n    __swig_destroy__ = delete_Exc\n"));
    qr::RegisterClass(A(A_Exc), Global("ExcCls"));
    Exc *second = new Exc{"second"};
    qr::RaiseLibraryException(second, A(A_Exc));
    PyErr_Fetch(&t, &v, &tb);
    EXPECT_EQ(t, Global("ExcCls"));
    ASSERT_EQ(PyObject_IsInstance(v, Global("ExcCls")), 1);
    EXPECT_EQ(qr::GetThisObject(v)->ptr, second);
    Py_XDECREF(t);
    Py_XDECREF(tb);
    g_exc_deleted = 0;
    Py_DECREF(v);  // the owned copy goes with the exception
    EXPECT_EQ(g_exc_deleted, 1);
}

TEST_F(RuntimeProtocol, StandardAndForeignExceptions) {
    qr::RaiseStdOutOfRange("index 7");
    EXPECT_EQ(TakeError(), "IndexError: index 7");
    qr::RaiseStdInvalidArgument("bad arg");
    EXPECT_EQ(TakeError(), "ValueError: bad arg");
    try {
        throw std::length_error("too long");
    } catch (...) {
        EXPECT_EQ(qr::RaiseForeign(), nullptr);
    }
    EXPECT_EQ(TakeError(), "RuntimeError: too long");
    try {
        throw 42;
    } catch (...) {
        qr::RaiseForeign();
    }
    EXPECT_EQ(TakeError(), "RuntimeError: unknown C++ exception");
}
