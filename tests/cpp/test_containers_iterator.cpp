// Iterator objects: bounds of bounded and unbounded iterators, comparison
// across iterator types, arithmetic, following a changing vector, and the
// iterator arguments of erase and insert.
#include "test_containers_support.h"

#include <memory>

using namespace ctest;
using rtest::RunPy;

namespace {

typedef ContainersTest ContainersIterator;

// The element an iterator reads, as repr ("<stop>" when it is at a bound).
std::string ValueAt(swig::PySwigIterator *it) {
    try {
        return Take(it->value());
    } catch (const swig::stop_iteration &) {
        return "<stop>";
    }
}

// Values of next() until StopIteration.
std::string Drain(swig::PySwigIterator *it) {
    std::string out;
    try {
        for (int i = 0; i < 100; ++i) out += Take(it->next()) + " ";
    } catch (const swig::stop_iteration &) {
        out += "<stop>";
    }
    return out;
}

TEST_F(ContainersIterator, BoundedStopsAtBothEnds) {
    RunPy("v = new_Uint64Vector([1, 2])\nit = Uint64Vector_iterator(v)");
    swig::PySwigIterator *it = It("it");
    EXPECT_EQ(Drain(it), "1 2 <stop>");
    EXPECT_EQ(ValueAt(it), "<stop>");  // stays at end
    EXPECT_EQ(Take(it->previous()), "2");

    RunPy("it = Uint64Vector_iterator(v)");
    it = It("it");
    EXPECT_THROW(it->previous(), swig::stop_iteration);
    RunPy("w = new_Uint64Vector([1, 2, 3])\nit = Uint64Vector_iterator(w)");
    it = It("it");
    EXPECT_THROW(it->incr(5), swig::stop_iteration);
    EXPECT_EQ(ValueAt(it), "<stop>");  // the steps taken stay taken
    it->decr(3);
    EXPECT_EQ(ValueAt(it), "1");
    EXPECT_THROW(it->advance(-1), swig::stop_iteration);
}

TEST_F(ContainersIterator, BoundedKeepsItsSequenceAlive) {
    RunPy("import sys\nv = new_Uint64Vector([1])\nbefore = sys.getrefcount(v)\nit = Uint64Vector_iterator(v)");
    EXPECT_EQ(Show("sys.getrefcount(v) - before"), "1");
    int destroyed = iterators_destroyed;
    RunPy("del it");
    EXPECT_EQ(iterators_destroyed, destroyed + 1);
    EXPECT_EQ(Show("sys.getrefcount(v) - before"), "0");
}

TEST_F(ContainersIterator, UnboundedMovesFreelyButReadsOnlyInside) {
    RunPy("v = new_Uint64Vector([1, 2, 3])\nb = Uint64Vector_begin(v)\ne = Uint64Vector_end(v)\n"
          "r = Uint64Vector_rbegin(v)\nre = Uint64Vector_rend(v)");
    swig::PySwigIterator *b = It("b");
    EXPECT_EQ(ValueAt(b), "1");
    EXPECT_NO_THROW(b->incr(10));
    EXPECT_EQ(ValueAt(b), "<stop>");
    b->decr(9);
    EXPECT_EQ(ValueAt(b), "2");
    EXPECT_EQ(ValueAt(It("e")), "<stop>");
    EXPECT_EQ(ValueAt(It("re")), "<stop>");
    swig::PySwigIterator *r = It("r");
    EXPECT_EQ(Drain(r), "3 2 1 <stop>");
    EXPECT_TRUE(r->equal(*It("re")));
    // A value read is an owned copy for wrapped scalars.
    RunPy("u = new_Uint32Vector([u32(4)])\nub = Uint32Vector_begin(u)");
    PyObject *x = It("ub")->value();
    EXPECT_EQ(qr::GetThisObject(x)->own, 1);
    RunPy("Uint32Vector___setitem__(u, 0, 5)");
    EXPECT_EQ(TakeU32(x), 4u);
}

TEST_F(ContainersIterator, ComparisonAndDistance) {
    RunPy("v = new_Uint64Vector([1, 2, 3])\nw = new_Uint64Vector([1, 2, 3])\ns = new_StringVector(['x'])\n"
          "a = Uint64Vector_begin(v)\nb = Uint64Vector_begin(v)\nc = Uint64Vector_begin(w)\n"
          "k = Uint64Vector_iterator(v)\nt = StringVector_begin(s)");
    swig::PySwigIterator *a = It("a"), *b = It("b");
    EXPECT_TRUE(*a == *b);
    EXPECT_TRUE(a->equal(*It("k")));  // bounded and unbounded share the iterator type
    b->incr(2);
    EXPECT_TRUE(*a != *b);
    EXPECT_EQ(b->sub(*a), 2);
    EXPECT_EQ(a->sub(*b), -2);
    EXPECT_EQ(a->distance(*b), 2);
    try {
        a->equal(*It("t"));
        ADD_FAILURE() << "no exception";
    } catch (const std::invalid_argument &e) {
        EXPECT_STREQ(e.what(), "bad iterator type");
    }
    try {
        a->distance(*It("c"));
        ADD_FAILURE() << "no exception";
    } catch (const std::invalid_argument &e) {
        EXPECT_STREQ(e.what(), "iterators of different containers");
    }
}

TEST_F(ContainersIterator, Arithmetic) {
    RunPy("v = new_Uint64Vector([1, 2, 3])\na = Uint64Vector_iterator(v)");
    swig::PySwigIterator *a = It("a");
    std::unique_ptr<swig::PySwigIterator> c(a->add(2));
    EXPECT_EQ(ValueAt(c.get()), "3");
    EXPECT_EQ(ValueAt(a), "1");
    EXPECT_THROW(std::unique_ptr<swig::PySwigIterator>(a->add(4)), swig::stop_iteration);
    std::unique_ptr<swig::PySwigIterator> d(c->sub(1));
    EXPECT_EQ(ValueAt(d.get()), "2");
    EXPECT_EQ(a->iadd(1), a);
    EXPECT_EQ(ValueAt(a), "2");
    EXPECT_EQ(a->isub(-1), a);
    EXPECT_EQ(ValueAt(a), "3");
    EXPECT_EQ(a->advance(-2), a);
    EXPECT_EQ(ValueAt(a), "1");
}

TEST_F(ContainersIterator, BoundedFollowsAChangingVector) {
    RunPy("v = new_Uint64Vector([1, 2, 3])\nit = Uint64Vector_iterator(v)");
    swig::PySwigIterator *it = It("it");
    EXPECT_EQ(Take(it->next()), "1");
    // New storage and a new element: the position is kept as an index.
    RunPy("Uint64Vector_reserve(v, 1000)\nUint64Vector_append(v, 4)");
    EXPECT_EQ(Drain(it), "2 3 4 <stop>");

    RunPy("it = Uint64Vector_iterator(v)");
    it = It("it");
    it->incr(3);
    RunPy("Uint64Vector___delslice__(v, 1, 4)");
    EXPECT_EQ(ValueAt(it), "<stop>");
    EXPECT_EQ(Take(it->previous()), "1");

    // A destroyed vector ends the iteration.
    RunPy("u = new_Uint32Vector([u32(1), u32(2)])\nui = Uint32Vector_iterator(u)\ndelete_Uint32Vector(u)");
    EXPECT_THROW(It("ui")->next(), swig::stop_iteration);
}

TEST_F(ContainersIterator, SetIteratorsStayInsideTheTree) {
    RunPy("s = new_StringSet(['b', 'c', 'a'])\ne = StringSet_end(s)\nz = new_StringSet()\nze = StringSet_begin(z)\n"
          "r = StringSet_rbegin(s)\nfa = StringSet_find(s, 'a')\nfc = StringSet_find(s, 'c')\n"
          "t = new_StringSet(['a'])\nta = StringSet_begin(t)\nit = StringSet_iterator(s)");
    EXPECT_THROW(It("e")->incr(), swig::stop_iteration);
    EXPECT_THROW(It("ze")->incr(), swig::stop_iteration);
    EXPECT_THROW(It("ze")->decr(), swig::stop_iteration);
    EXPECT_EQ(ValueAt(It("ze")), "<stop>");
    EXPECT_EQ(Drain(It("r")), "'c' 'b' 'a' <stop>");
    EXPECT_EQ(Drain(It("it")), "'a' 'b' 'c' <stop>");
    EXPECT_EQ(It("fa")->distance(*It("fc")), 2);
    EXPECT_EQ(It("fc")->distance(*It("fa")), -2);
    EXPECT_EQ(It("fc")->sub(*It("e")), -1);
    EXPECT_THROW(It("fa")->distance(*It("ta")), std::invalid_argument);
}

TEST_F(ContainersIterator, StopIterationCarriesNone) {
    EXPECT_EQ(qr::RaiseStopIteration(), nullptr);
    PyObject *t, *v, *tb;
    PyErr_Fetch(&t, &v, &tb);
    EXPECT_EQ(t, PyExc_StopIteration);
    EXPECT_EQ(v, Py_None);
    PyErr_Restore(t, v, tb);
    EXPECT_EQ(rtest::TakeError(), "StopIteration: ");
}

class ContainersIteratorArgs : public ContainersTest {
protected:
    void SetUp() override {
        ContainersTest::SetUp();
        RunPy("def items(v):\n    return [int(Uint32Vector___getitem__(v, i)) for i in range(Uint32Vector___len__(v))]\n"
              "v = new_Uint32Vector(5)\nfor i in range(5): Uint32Vector___setitem__(v, i, i)\n"
              "w = new_Uint32Vector(2)\ns = new_StringVector(['x'])");
    }
};

TEST_F(ContainersIteratorArgs, EraseAndInsertAtPositions) {
    RunPy("r = Uint32Vector_erase(v, Uint32Vector_begin(v))");
    EXPECT_EQ(Show("items(v)"), "[1, 2, 3, 4]");
    EXPECT_EQ(TakeU32(It("r")->value()), 1u);  // the element after the removed one
    RunPy("b = Uint32Vector_begin(v)");
    It("b")->incr(1);
    RunPy("x = Uint32Vector_erase(v, b, Uint32Vector_end(v))");
    EXPECT_EQ(Show("items(v)"), "[1]");
    RunPy("i = Uint32Vector_insert(v, Uint32Vector_begin(v), 9)");
    EXPECT_EQ(TakeU32(It("i")->value()), 9u);  // the inserted element
    RunPy("n = Uint32Vector_insert(v, Uint32Vector_end(v), 2, 5)\nk = Uint32Vector_erase(v, Uint32Vector_iterator(v))");
    EXPECT_EQ(Show("(n, items(v))"), "(None, [1, 5, 5])");
}

TEST_F(ContainersIteratorArgs, RefusesForeignAndStaleIterators) {
    EXPECT_EQ(Err("Uint32Vector_erase(v, Uint32Vector_begin(w))"),
              "ValueError: iterator does not belong to this container");
    EXPECT_EQ(Err("Uint32Vector_insert(v, Uint32Vector_begin(w), 1)"),
              "ValueError: iterator does not belong to this container");
    EXPECT_EQ(Err("Uint32Vector_erase(v, Uint32Vector_end(v))"), "ValueError: iterator out of range");
    EXPECT_EQ(Err("Uint32Vector_erase(v, Uint32Vector_end(v), Uint32Vector_begin(v))"),
              "ValueError: invalid iterator range");
    RunPy("b = Uint32Vector_begin(v)\nUint32Vector_reserve(v, 1000)");
    EXPECT_EQ(Err("Uint32Vector_erase(v, b)"), "ValueError: iterator out of range");
    RunPy("b = Uint32Vector_begin(v)");
    It("b")->incr(7);  // an unbounded iterator may stand outside
    EXPECT_EQ(Err("Uint32Vector_insert(v, b, 1)"), "ValueError: iterator out of range");
    EXPECT_EQ(Show("items(v)"), "[0, 1, 2, 3, 4]");
}

TEST_F(ContainersIteratorArgs, IteratorTypeIsChecked) {
    const char *wrong = "TypeError: in method 'Uint32Vector_erase', argument 2 of type 'std::vector< uint32 >::iterator'";
    EXPECT_EQ(Err("Uint32Vector_erase(v, StringVector_begin(s))"), wrong);
    EXPECT_EQ(Err("Uint32Vector_erase(v, Uint32Vector_rbegin(v))"), wrong);
    EXPECT_EQ(Err("Uint32Vector_erase(v, None)"), wrong);
    EXPECT_EQ(Err("Uint32Vector_erase(v, 5)"),
              "NotImplementedError: Wrong number of arguments for overloaded function 'Uint32Vector_erase'.\n"
              "  Possible C/C++ prototypes are:\n"
              "    erase(std::vector< uint32 > *,std::vector< uint32 >::iterator)\n"
              "    erase(std::vector< uint32 > *,std::vector< uint32 >::iterator,std::vector< uint32 >::iterator)\n");
    EXPECT_EQ(Err("Uint32Vector_insert(v)"),
              "NotImplementedError: Wrong number of arguments for overloaded function 'Uint32Vector_insert'.\n"
              "  Possible C/C++ prototypes are:\n"
              "    insert(std::vector< uint32 > *,std::vector< uint32 >::iterator,"
              "std::vector< uint32 >::value_type const &)\n"
              "    insert(std::vector< uint32 > *,std::vector< uint32 >::iterator,std::vector< uint32 >::size_type,"
              "std::vector< uint32 >::value_type const &)\n");
}

}  // namespace
