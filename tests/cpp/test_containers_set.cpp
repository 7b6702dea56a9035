// The string set class: set semantics, insert's (iterator, inserted) pair,
// the erase forms, lookups, constructor dispatch and messages.
#include "test_containers_support.h"

using namespace ctest;
using rtest::RunPy;

namespace {

class ContainersSet : public ContainersTest {
protected:
    void SetUp() override {
        ContainersTest::SetUp();
        RunPy("def items(s):\n    return [StringSet___getitem__(s, i) for i in range(StringSet___len__(s))]\n"
              "s = new_StringSet(['b', 'a', 'a', 'c'])");
    }
    std::string At(const char *expr) { return Take(It(expr)->value()); }
};

TEST_F(ContainersSet, InsertReportsWhetherItInserted) {
    RunPy("z = new_StringSet()\nfirst = StringSet_insert(z, 'a')\nsecond = StringSet_insert(z, 'a')\n"
          "fi = first[0]\nsi = second[0]");
    EXPECT_EQ(Show("(len(first), first[1], second[1], StringSet___len__(z))"), "(2, True, False, 1)");
    EXPECT_EQ(At("fi") + At("si"), "'a''a'");
    EXPECT_EQ(Show("own(fi)"), "1");
    RunPy("StringSet_append(z, 'b')\nStringSet_append(z, 'b')");
    EXPECT_EQ(Show("items(z)"), "['a', 'b']");
}

TEST_F(ContainersSet, OrderIndexAndMembership) {
    EXPECT_EQ(Show("items(s)"), "['a', 'b', 'c']");
    EXPECT_EQ(Show("(StringSet___getitem__(s, -1), StringSet___contains__(s, 'b'), StringSet___contains__(s, 'x'))"),
              "('c', True, False)");
    EXPECT_EQ(Show("(StringSet_count(s, 'a'), StringSet_count(s, 'x'), StringSet_size(s), StringSet_empty(s))"),
              "(1, 0, 3, False)");
    EXPECT_EQ(Err("StringSet___getitem__(s, 3)"), "IndexError: index out of range");
    EXPECT_EQ(Err("StringSet___getitem__(s, -4)"), "IndexError: index out of range");
    // By-value and reference string parameters refuse None differently.
    EXPECT_EQ(Err("StringSet_append(s, None)"),
              "TypeError: in method 'StringSet_append', argument 2 of type 'std::set< std::string >::value_type'");
    EXPECT_EQ(Err("StringSet___contains__(s, None)"),
              "TypeError: in method 'StringSet___contains__', argument 2 of type "
              "'std::set< std::string >::value_type'");
    EXPECT_EQ(Err("StringSet_count(s, None)"),
              "ValueError: invalid null reference in method 'StringSet_count', argument 2 of type "
              "'std::set< std::string >::key_type const &'");
    EXPECT_EQ(Err("StringSet_insert(s, None)"),
              "ValueError: invalid null reference in method 'StringSet_insert', argument 2 of type "
              "'std::set< std::string >::value_type const &'");
}

TEST_F(ContainersSet, Lookups) {
    RunPy("f = StringSet_find(s, 'b')\nm = StringSet_find(s, 'x')\nlo = StringSet_lower_bound(s, 'bb')\n"
          "up = StringSet_upper_bound(s, 'b')\nr = StringSet_equal_range(s, 'c')\nr0 = r[0]\nr1 = r[1]\n"
          "e = StringSet_end(s)");
    EXPECT_EQ(At("f") + At("lo") + At("up") + At("r0"), "'b''c''c''c'");
    EXPECT_TRUE(It("m")->equal(*It("e")));
    EXPECT_TRUE(It("r1")->equal(*It("e")));
    EXPECT_EQ(Err("StringSet_find(s, None)"),
              "ValueError: invalid null reference in method 'StringSet_find', argument 2 of type "
              "'std::set< std::string >::key_type const &'");
}

TEST_F(ContainersSet, EraseForms) {
    EXPECT_EQ(Show("(StringSet_erase(s, 'a'), StringSet_erase(s, 'x'))"), "(1, 0)");
    EXPECT_EQ(Show("StringSet_erase(s, StringSet_find(s, 'c'))"), "None");
    EXPECT_EQ(Show("items(s)"), "['b']");
    RunPy("t = new_StringSet(['b', 'q'])");
    EXPECT_EQ(Err("StringSet_erase(s, StringSet_begin(t))"), "ValueError: iterator does not belong to this container");
    EXPECT_EQ(Err("StringSet_erase(s, StringSet_end(s))"), "ValueError: iterator out of range");
    EXPECT_EQ(Err("StringSet_erase(s, StringSet_end(s), StringSet_begin(s))"), "ValueError: invalid iterator range");
    // An iterator is tried before a key, so None reaches the iterator form.
    EXPECT_EQ(Err("StringSet_erase(s, None)"),
              "TypeError: in method 'StringSet_erase', argument 2 of type 'std::set< std::string >::iterator'");
    EXPECT_EQ(Err("StringSet_erase(s, StringSet_rbegin(s))"),
              "TypeError: in method 'StringSet_erase', argument 2 of type 'std::set< std::string >::iterator'");
    EXPECT_EQ(Err("StringSet_erase(s, 5)"),
              "NotImplementedError: Wrong number of arguments for overloaded function 'StringSet_erase'.\n"
              "  Possible C/C++ prototypes are:\n"
              "    erase(std::set< std::string > *,std::set< std::string >::key_type const &)\n"
              "    erase(std::set< std::string > *,std::set< std::string >::iterator)\n"
              "    erase(std::set< std::string > *,std::set< std::string >::iterator,"
              "std::set< std::string >::iterator)\n");
    RunPy("StringSet_erase(t, StringSet_begin(t), StringSet_end(t))");
    EXPECT_EQ(Show("(items(t), StringSet___nonzero__(t))"), "([], False)");
}

TEST_F(ContainersSet, ConstructorsSwapAndClear) {
    RunPy("c = new_StringSet(less())\nd = new_StringSet(s)\ng = new_StringSet('abca')\nStringSet_swap(c, g)");
    EXPECT_EQ(Show("(items(c), items(g), items(d), type(d).__name__)"),
              "(['a', 'b', 'c'], [], ['a', 'b', 'c'], 'PySwigObject')");
    RunPy("StringSet_clear(d)");
    EXPECT_EQ(Show("(items(d), items(s))"), "([], ['a', 'b', 'c'])");
    EXPECT_EQ(Err("new_StringSet(None)"),
              "ValueError: invalid null reference in method 'new_StringSet', argument 1 of type "
              "'std::less< std::string > const &'");
    const std::string no_match =
        "NotImplementedError: Wrong number of arguments for overloaded function 'new_StringSet'.\n"
        "  Possible C/C++ prototypes are:\n"
        "    std::set< std::string >(std::less< std::string > const &)\n"
        "    std::set< std::string >()\n"
        "    std::set< std::string >(std::set< std::string > const &)\n";
    EXPECT_EQ(Err("new_StringSet(1, 2)"), no_match);
    // The sequence probe tests string elements.
    EXPECT_EQ(Err("new_StringSet([1])"), no_match);
    EXPECT_EQ(Err("StringSet_swap(s, None)"),
              "ValueError: invalid null reference in method 'StringSet_swap', argument 2 of type "
              "'std::set< std::string > &'");
}

}  // namespace
