// Test classes for the container operations. Seven container classes are
// made callable from the embedded interpreter under the module's names
// ("Uint32Vector___getitem__", "new_StringSet", ...), each bound through a
// hand-made ContainerInfo to its VectorOps / SetOps instantiation:
//
//   Uint32Vector   std::vector< uint32 >     wrapped-scalar elements
//   Uint64Vector   std::vector< uint64 >     numbers
//   StringVector   std::vector< std::string >
//   ReasonVector   std::vector< Reason >     an enumeration (wrapped scalar)
//   ValueVector    std::vector< Value >      class values (counted)
//   ObjVector      std::vector< Obj * >      class pointers
//   StringSet      std::set< std::string >
//
// Every owned type has a registered class whose destroy function frees it,
// so releasing a wrapped object runs the destructor.
#ifndef QORCTL_TESTS_CONTAINERS_SUPPORT_H
#define QORCTL_TESTS_CONTAINERS_SUPPORT_H

#include "test_runtime_support.h"

#include "set_ops.h"
#include "vector_ops.h"

#include <set>
#include <string>
#include <vector>

namespace ctest {

enum Reason { REASON_NONE = 0, REASON_A = 1, REASON_B = 7 };

// A record type whose live instances are counted.
struct Value {
    explicit Value(int x = 0) : v(x) { ++live; }
    Value(const Value &o) : v(o.v) { ++live; }
    Value &operator=(const Value &o) = default;
    ~Value() { --live; }
    int v;
    static int live;
};

struct Obj {
    int id;
};

typedef std::vector<uint32_t> U32Vec;
typedef std::vector<uint64_t> U64Vec;
typedef std::vector<std::string> StrVec;
typedef std::vector<Reason> ReasonVec;
typedef std::vector<Value> ValueVec;
typedef std::vector<Obj *> ObjVec;
typedef std::set<std::string> StrSet;

// The container infos (names "<Class>_<method>").
extern const qr::ContainerInfo ci_u32, ci_u64, ci_str, ci_reason, ci_value, ci_obj, ci_set;
extern swig_type_info ty_iterator;
// Objects that "obj(i)" hands out, i < 4.
extern Obj objs[4];
// Iterators destroyed through their wrapped objects so far.
extern int iterators_destroyed;

// Installs the container functions and these helpers into __main__ once:
//   ptr(o), own(o)           the wrapped pointer as an int, the ownership flag
//   u32(n), u32_of(o)        an owned wrapped uint32 / its value
//   reason(n), reason_of(o)  the same for Reason
//   value(n), value_of(o)    an owned wrapped Value / its v
//   obj(i), obj_id(o)        a borrowed Obj * (objs[i]) / its id (None: null)
//   live()                   Value::live
//   less()                   an owned std::less< std::string >
//   delete_<Class>(o)        destroys a container as delete_<Class> does
void InstallContainers();

class ContainersTest : public rtest::RuntimeTest {
protected:
    void SetUp() override {
        RuntimeTest::SetUp();
        InstallContainers();
    }
    void TearDown() override { PyErr_Clear(); }
};

// repr() of a Python expression's value ("<error: ...>" on failure).
std::string Show(const char *expr);
// The exception an expression raises, "Type: text" ("" when none).
std::string Err(const char *expr);
// The iterator object behind a Python expression's value (borrowed: the
// expression must name an object that stays alive, e.g. a global).
swig::PySwigIterator *It(const char *expr);
// repr() of a new reference, which is released; "<null: error>" for null.
std::string Take(PyObject *o);
// *(uint32_t *) of a wrapped uint32, consuming the reference.
uint32_t TakeU32(PyObject *o);

}  // namespace ctest

#endif
