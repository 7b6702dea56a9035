// Shared pieces of the runtime tests: the embedded interpreter, small Python
// helpers, a class hierarchy with virtual bases, and two hand-made module
// records (type tables) that the fixture joins into one ring.
#ifndef QORCTL_TESTS_RUNTIME_SUPPORT_H
#define QORCTL_TESTS_RUNTIME_SUPPORT_H

#include "qorrt.h"

#include <gtest/gtest.h>

#include <string>

namespace rtest {

// Python helpers. Run and Eval report a Python error as a test failure.
bool RunPy(const char *code);
PyObject *Eval(const char *expr);            // new reference or null
PyObject *TryEval(const char *expr);         // leaves a Python error pending
PyObject *Global(const char *name);          // borrowed
void SetGlobal(const char *name, PyObject *obj);  // steals obj
std::string TakeError();                     // "TypeError: text" or ""
std::string Str(PyObject *obj);              // str(obj), obj not consumed
std::string Repr(PyObject *obj);

// Classes with virtual inheritance: Deep -> Leaf -> Mid -> Root are all
// virtual bases, so each up-cast reads an offset from the vtable.
struct Root { virtual ~Root() {} int r = 11; };
struct Mid : virtual Root { int m = 22; };
struct Twig { virtual ~Twig() {} int t = 33; };
struct Leaf : virtual Mid, virtual Twig { int l = 44; };
struct Deep : virtual Leaf { int d = 55; };
struct Stick : virtual Root { int s = 66; };
struct Plain { int p = 77; };

// Record A (created first) and record B, indices into their tables.
enum { A_Deep, A_Exc, A_Leaf, A_Mid, A_Plain, A_Root, A_RootAlias, A_RootAlias2, A_RootAlias3,
       A_char, A_string, A_N };
enum { B_Leaf, B_Root, B_Stick, B_Twig, B_N };

struct Ring {
    swig_module_record *a, *b;
    swig_type_info *a_types, *b_types;   // own descriptors
    swig_cast_entry **a_casts, **b_casts;  // initial cast lists
    PyMethodDef *a_methods, *b_methods;
    PyObject *dict_a, *dict_b;
    bool runtime_module_was_absent;
    Plain *ptr_const;                    // the pointer of constant PTR_CONST
};

// Starts the interpreter and joins both records, once per process.
const Ring &TestRing();

// Base fixture of the runtime tests.
class RuntimeTest : public ::testing::Test {
protected:
    void SetUp() override { ring = &TestRing(); }
    const Ring *ring = nullptr;
    swig_type_info *A(int i) const { return &ring->a_types[i]; }
    swig_type_info *B(int i) const { return &ring->b_types[i]; }
};

}  // namespace rtest

#endif
