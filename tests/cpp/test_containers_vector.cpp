// The vector operations called as the generated wrappers call them: index
// and slice rules, element kinds, ownership of results, overload dispatch
// and the protocol's messages.
#include "test_containers_support.h"

using namespace ctest;
using rtest::RunPy;

namespace {

class ContainersVector : public ContainersTest {
protected:
    void SetUp() override {
        ContainersTest::SetUp();
        RunPy("def items(cls, v):\n"
              "    get = globals()[cls + '___getitem__']\n"
              "    out = [get(v, i) for i in range(globals()[cls + '___len__'](v))]\n"
              "    return [int(x) if isinstance(x, (int, long)) else x for x in out]\n"
              "def u64(*xs):\n"
              "    return new_Uint64Vector(list(xs))\n");
    }
};

TEST_F(ContainersVector, IndexRule) {
    RunPy("v = u64(1, 2, 3)");
    EXPECT_EQ(Show("Uint64Vector___getitem__(v, -1)"), "3");
    EXPECT_EQ(Show("Uint64Vector___getitem__(v, -3)"), "1");
    EXPECT_EQ(Err("Uint64Vector___getitem__(v, 3)"), "IndexError: index out of range");
    EXPECT_EQ(Err("Uint64Vector___getitem__(v, -4)"), "IndexError: index out of range");
    EXPECT_EQ(Err("Uint64Vector___getitem__(v, 'x')"),
              "TypeError: in method 'Uint64Vector___getitem__', argument 2 of type "
              "'std::vector< uint64 >::difference_type'");

    RunPy("Uint64Vector___setitem__(v, -3, 9)\nUint64Vector___delitem__(v, -1)");
    EXPECT_EQ(Show("items('Uint64Vector', v)"), "[9, 2]");
    EXPECT_EQ(Err("Uint64Vector___delitem__(v, 2)"), "IndexError: index out of range");
    // The element is converted before the index is tested.
    EXPECT_EQ(Err("Uint64Vector___setitem__(v, 5, -1)"),
              "OverflowError: in method 'Uint64Vector___setitem__', argument 3 of type "
              "'std::vector< uint64 >::value_type const &'");
    EXPECT_EQ(Err("Uint64Vector___setitem__(v, 5, 1)"), "IndexError: index out of range");
}

TEST_F(ContainersVector, GetAndDeleteSlices) {
    RunPy("v = u64(1, 2, 3)\ne = u64()");
    EXPECT_EQ(Err("Uint64Vector___getslice__(e, 0, 0)"), "IndexError: index out of range");
    EXPECT_EQ(Show("items('Uint64Vector', Uint64Vector___getslice__(v, 1, 100))"), "[2, 3]");
    EXPECT_EQ(Show("items('Uint64Vector', Uint64Vector___getslice__(v, 2, 1))"), "[]");
    EXPECT_EQ(Show("items('Uint64Vector', Uint64Vector___getslice__(v, -2, -1))"), "[2]");
    EXPECT_EQ(Err("Uint64Vector___getslice__(v, 3, 3)"), "IndexError: index out of range");
    EXPECT_EQ(Err("Uint64Vector___getslice__(v, 0, -4)"), "IndexError: index out of range");
    // A slice is a new vector owned by its wrapped object, an instance of
    // the registered class.
    RunPy("s = Uint64Vector___getslice__(v, 0, 2)\nUint64Vector___setitem__(s, 0, 7)");
    EXPECT_EQ(Show("(type(s).__name__, own(s), items('Uint64Vector', v))"), "('Uint64Vector', 1, [1, 2, 3])");

    RunPy("Uint64Vector___delslice__(v, 2, 1)\nUint64Vector___delslice__(v, 3, 3)");
    EXPECT_EQ(Show("items('Uint64Vector', v)"), "[1, 2, 3]");
    EXPECT_EQ(Err("Uint64Vector___delslice__(v, 4, 5)"), "IndexError: index out of range");
    EXPECT_EQ(Err("Uint64Vector___delslice__(v, 0, -4)"), "IndexError: index out of range");
    RunPy("Uint64Vector___delslice__(v, -2, 100)");
    EXPECT_EQ(Show("items('Uint64Vector', v)"), "[1]");
}

TEST_F(ContainersVector, SetSlices) {
    const char *cases[][2] = {
        {"3, 3, [9]", "[1, 2, 3, 9]"},   {"0, 1, [7, 8]", "[7, 8, 2, 3]"}, {"0, 3, [5]", "[5]"},
        {"2, 1, [7]", "[1, 2, 7, 3]"},   {"-1, 100, []", "[1, 2]"},        {"1, 2, v", "[1, 1, 2, 3, 3]"},
        {"0, 2, (4, 5, 6)", "[4, 5, 6, 3]"},
    };
    for (auto &c : cases) {
        RunPy("v = u64(1, 2, 3)");
        RunPy((std::string("Uint64Vector___setslice__(v, ") + c[0] + ")").c_str());
        EXPECT_EQ(Show("items('Uint64Vector', v)"), c[1]) << c[0];
    }
    RunPy("v = u64(1, 2, 3)");
    EXPECT_EQ(Err("Uint64Vector___setslice__(v, 4, 4, [1])"), "IndexError: index out of range");
    EXPECT_EQ(Err("Uint64Vector___setslice__(v, 0, 1, [1, -1])"),
              "TypeError: in method 'Uint64Vector___setslice__', argument 4 of type "
              "'std::vector< uint64,std::allocator< uint64 > > const &'");
    EXPECT_EQ(Show("items('Uint64Vector', v)"), "[1, 2, 3]");
}

TEST_F(ContainersVector, EmptyVectorRefusesElementAccess) {
    RunPy("e = u64()\nw = new_ValueVector()");
    EXPECT_EQ(Err("Uint64Vector_pop(e)"), "IndexError: pop from empty container");
    EXPECT_EQ(Err("Uint64Vector_front(e)"), "IndexError: front of empty container");
    EXPECT_EQ(Err("Uint64Vector_back(e)"), "IndexError: back of empty container");
    EXPECT_EQ(Err("Uint64Vector_pop_back(e)"), "IndexError: pop_back from empty container");
    EXPECT_EQ(Err("ValueVector_front(w)"), "IndexError: front of empty container");
    EXPECT_EQ(Show("(Uint64Vector___len__(e), Uint64Vector_empty(e), Uint64Vector___nonzero__(e))"), "(0, True, False)");
}

TEST_F(ContainersVector, ConstructorDispatch) {
    RunPy("a = new_Uint64Vector()\nb = new_Uint64Vector(3)\nc = new_Uint64Vector(2, 7)\nd = new_Uint64Vector([4, 5])\n"
          "f = new_Uint64Vector(d)\nUint64Vector_push_back(f, 6)");
    EXPECT_EQ(Show("(type(a).__name__, own(a), items('Uint64Vector', a))"), "('PySwigObject', 1, [])");
    EXPECT_EQ(Show("[items('Uint64Vector', x) for x in (b, c, d, f)]"), "[[0, 0, 0], [7, 7], [4, 5], [4, 5, 6]]");
    // One argument: a count is tried before a sequence.
    EXPECT_EQ(Show("items('Uint32Vector', new_Uint32Vector(3))"), "[0, 0, 0]");
    EXPECT_EQ(Err("new_Uint32Vector([3])"),
              "TypeError: in method 'new_Uint32Vector', argument 1 of type 'std::vector< uint32 > const &'");
    EXPECT_EQ(Err("new_Uint64Vector(None)"),
              "ValueError: invalid null reference in method 'new_Uint64Vector', argument 1 of type "
              "'std::vector< uint64 > const &'");
    EXPECT_EQ(Err("new_Uint64Vector(1, 2, 3)"),
              "NotImplementedError: Wrong number of arguments for overloaded function 'new_Uint64Vector'.\n"
              "  Possible C/C++ prototypes are:\n"
              "    std::vector< uint64 >()\n"
              "    std::vector< uint64 >(std::vector< uint64 > const &)\n"
              "    std::vector< uint64 >(std::vector< uint64 >::size_type)\n"
              "    std::vector< uint64 >(std::vector< uint64 >::size_type,std::vector< uint64 >::value_type const &)\n");
    EXPECT_EQ(Err("Uint64Vector_resize(b, 'x')"),
              "NotImplementedError: Wrong number of arguments for overloaded function 'Uint64Vector_resize'.\n"
              "  Possible C/C++ prototypes are:\n"
              "    resize(std::vector< uint64 > *,std::vector< uint64 >::size_type)\n"
              "    resize(std::vector< uint64 > *,std::vector< uint64 >::size_type,"
              "std::vector< uint64 >::value_type const &)\n");
}

TEST_F(ContainersVector, SelfAndArgumentMessages) {
    RunPy("v = u64(1)\nu = new_Uint32Vector()");
    EXPECT_EQ(Err("Uint64Vector_size(u)"),
              "TypeError: in method 'Uint64Vector_size', argument 1 of type 'std::vector< uint64 > *'");
    EXPECT_EQ(Err("Uint64Vector_size(None)"),
              "ValueError: invalid null reference in method 'Uint64Vector_size', argument 1 of type "
              "'std::vector< uint64 > *'");
    EXPECT_EQ(Err("Uint64Vector_size(v, 1)"), "TypeError: Uint64Vector_size() takes exactly 1 argument (2 given)");
    EXPECT_EQ(Err("Uint64Vector_swap(v, None)"),
              "ValueError: invalid null reference in method 'Uint64Vector_swap', argument 2 of type "
              "'std::vector< uint64 > &'");
    EXPECT_EQ(Err("Uint64Vector_reserve(v, -1)"),
              "OverflowError: in method 'Uint64Vector_reserve', argument 2 of type 'std::vector< uint64 >::size_type'");
}

TEST_F(ContainersVector, SizeAndContentMethods) {
    RunPy("v = u64(1, 2)\nw = u64(9)\nUint64Vector_swap(v, w)");
    EXPECT_EQ(Show("(items('Uint64Vector', v), items('Uint64Vector', w))"), "([9], [1, 2])");
    RunPy("Uint64Vector_assign(v, 3, 4)\nUint64Vector_reserve(v, 50)");
    EXPECT_EQ(Show("(items('Uint64Vector', v), Uint64Vector_capacity(v) >= 50, Uint64Vector_size(v))"),
              "([4, 4, 4], True, 3)");
    RunPy("Uint64Vector_resize(v, 5)\nUint64Vector_resize(w, 3, 8)");
    EXPECT_EQ(Show("(items('Uint64Vector', v), items('Uint64Vector', w))"), "([4, 4, 4, 0, 0], [1, 2, 8])");
    RunPy("Uint64Vector_clear(v)");
    EXPECT_EQ(Show("Uint64Vector_empty(v)"), "True");
    RunPy("u = new_Uint32Vector()\na = Uint32Vector_get_allocator(u)");
    EXPECT_EQ(Show("(type(a).__name__, own(a))"), "('Allocator', 1)");
}

TEST_F(ContainersVector, Uint32ElementsAreNumbersOneByOne) {
    RunPy("v = new_Uint32Vector()\nUint32Vector_append(v, 5)\nUint32Vector_push_back(v, 4000000000)");
    EXPECT_EQ(Show("(Uint32Vector_front(v), Uint32Vector_back(v), Uint32Vector___getitem__(v, 0))"),
              "(5, 4000000000L, 5)");
    EXPECT_EQ(Show("Uint32Vector_pop(v)"), "4000000000L");
    EXPECT_EQ(Err("Uint32Vector_append(v, -1)"),
              "OverflowError: in method 'Uint32Vector_append', argument 2 of type "
              "'std::vector< uint32 >::value_type const &'");
    EXPECT_EQ(Err("Uint32Vector_append(v, u32(3))"),
              "TypeError: in method 'Uint32Vector_append', argument 2 of type "
              "'std::vector< uint32 >::value_type const &'");
    // Whole sequences hold wrapped uint32 pointers.
    EXPECT_EQ(Show("items('Uint32Vector', new_Uint32Vector([u32(7), u32(8)]))"), "[7, 8]");
    EXPECT_EQ(Err("Uint32Vector___setslice__(v, 0, 0, [1])"),
              "TypeError: in method 'Uint32Vector___setslice__', argument 4 of type "
              "'std::vector< uint32,std::allocator< uint32 > > const &'");
    RunPy("Uint32Vector___setslice__(v, 0, 0, [u32(9)])");
    EXPECT_EQ(Show("items('Uint32Vector', v)"), "[9, 5]");
}

TEST_F(ContainersVector, EnumerationElements) {
    RunPy("r = new_ReasonVector()\nReasonVector_append(r, 7)\nReasonVector_insert(r, ReasonVector_begin(r), 1)");
    EXPECT_EQ(Show("(items('ReasonVector', r), ReasonVector_front(r), ReasonVector_pop(r))"), "([1, 7], 1, 7)");
    EXPECT_EQ(Err("ReasonVector_append(r, reason(1))"),
              "TypeError: in method 'ReasonVector_append', argument 2 of type "
              "'std::vector< Reason >::value_type const &'");
    EXPECT_EQ(Err("new_ReasonVector([7])"),
              "TypeError: in method 'new_ReasonVector', argument 1 of type 'std::vector< Reason > const &'");
    RunPy("r = new_ReasonVector([reason(7), reason(1)])\nit = ReasonVector_iterator(r)");
    PyObject *first = It("it")->next();
    EXPECT_EQ(Show("items('ReasonVector', r)"), "[7, 1]");
    rtest::SetGlobal("first", first);
    EXPECT_EQ(Show("(reason_of(first), own(first), type(first).__name__)"), "(7, 1, 'Reason_p')");
}

TEST_F(ContainersVector, ClassValuesBorrowedInPlaceOwnedWhenPopped) {
    int base = Value::live;
    RunPy("v = new_ValueVector()\na = value(5)\nValueVector_append(v, a)\nValueVector_append(v, value(6))");
    EXPECT_EQ(Value::live, base + 3);
    auto *vec = static_cast<ValueVec *>(qr::GetThisObject(rtest::Global("v"))->ptr);
    RunPy("g = ValueVector___getitem__(v, 0)\nf = ValueVector_front(v)\nb = ValueVector_back(v)");
    EXPECT_EQ(Show("(own(g), value_of(g), ptr(g) == ptr(f), value_of(b))"), "(0, 5, True, 6)");
    PyObject *addr = rtest::Eval("ptr(g)");
    EXPECT_EQ(addr ? PyLong_AsVoidPtr(addr) : nullptr, static_cast<void *>(&(*vec)[0]));
    Py_XDECREF(addr);
    RunPy("del g, f, b\np = ValueVector_pop(v)");
    EXPECT_EQ(Show("(own(p), value_of(p), ValueVector___len__(v))"), "(1, 6, 1)");
    EXPECT_EQ(Value::live, base + 3);  // a, v[0] and the popped copy
    RunPy("del p");
    EXPECT_EQ(Value::live, base + 2);  // the copy was destroyed with its wrapper

    EXPECT_EQ(Err("ValueVector_append(v, None)"),
              "ValueError: invalid null reference in method 'ValueVector_append', argument 2 of type "
              "'std::vector< Value >::value_type const &'");
    EXPECT_EQ(Err("ValueVector_append(v, u32(1))"),
              "TypeError: in method 'ValueVector_append', argument 2 of type 'std::vector< Value >::value_type const &'");
    // An element of the vector itself may be passed back in.
    RunPy("ValueVector_resize(v, 3, ValueVector___getitem__(v, 0))\nValueVector_resize(v, 4)");
    EXPECT_EQ(Show("[value_of(x) for x in [ValueVector___getitem__(v, i) for i in range(4)]]"), "[5, 5, 5, 0]");
}

TEST_F(ContainersVector, ConvertedSequencesAreFreed) {
    RunPy("seq = [value(i) for i in range(4)]\nw = new_ValueVector()");
    int base = Value::live;
    RunPy("ValueVector___setslice__(w, 0, 0, seq)");
    EXPECT_EQ(Value::live, base + 4);
    RunPy("n = new_ValueVector(seq)");
    EXPECT_EQ(Value::live, base + 8);
    RunPy("ValueVector___setslice__(w, 0, 4, w)");  // the vector as its own sequence
    EXPECT_EQ(Value::live, base + 8);
    // A failing element frees what was built so far.
    RunPy("bad = [value(1), value(2), 3]");
    base = Value::live;
    EXPECT_EQ(Err("new_ValueVector(bad)"),
              "TypeError: in method 'new_ValueVector', argument 1 of type 'std::vector< Value > const &'");
    EXPECT_EQ(Err("ValueVector___setslice__(w, 0, 0, bad)"),
              "TypeError: in method 'ValueVector___setslice__', argument 4 of type "
              "'std::vector< Value,std::allocator< Value > > const &'");
    EXPECT_EQ(Value::live, base);
    RunPy("del seq, w, n, bad");
}

TEST_F(ContainersVector, PointerAndStringElements) {
    RunPy("v = new_ObjVector([obj(0), None, obj(2)])\nObjVector_append(v, None)\nObjVector_resize(v, 5)");
    EXPECT_EQ(Show("[obj_id(x) for x in [ObjVector___getitem__(v, i) for i in range(5)]]"),
              "[100, None, 102, None, None]");
    EXPECT_EQ(Show("(own(ObjVector_front(v)), obj_id(ObjVector_pop(v)), ObjVector___len__(v))"), "(0, None, 4)");
    EXPECT_EQ(Err("ObjVector_append(v, 5)"),
              "TypeError: in method 'ObjVector_append', argument 2 of type 'std::vector< Obj * >::value_type const &'");

    RunPy("s = new_StringVector('ab')\nStringVector_append(s, 'cd')");
    EXPECT_EQ(Show("items('StringVector', s)"), "['a', 'b', 'cd']");
    EXPECT_EQ(Err("StringVector_append(s, None)"),
              "ValueError: invalid null reference in method 'StringVector_append', argument 2 of type "
              "'std::vector< std::string >::value_type const &'");
    EXPECT_EQ(Err("StringVector_append(s, 5)"),
              "TypeError: in method 'StringVector_append', argument 2 of type "
              "'std::vector< std::string >::value_type const &'");
}

}  // namespace
