// Sequence conversion facing sequences that change while they are read, and
// the dispatcher probe's promise to leave no exception behind.
#include "seq.h"
#include "test_runtime_support.h"

#include <cstdint>
#include <string>
#include <vector>

using namespace rtest;

namespace {

typedef std::vector<std::string> Strings;
typedef std::vector<uint64_t> Numbers;

class SeqConvert : public RuntimeTest {
protected:
    void SetUp() override {
        RuntimeTest::SetUp();
        ASSERT_TRUE(RunPy(
            "class Moving(object):\n"
            "    def __init__(self, item, start, step):\n"
            "        self.item, self.n, self.step, self.reads = item, start, step, 0\n"
            "    def __len__(self):\n"
            "        self.reads += 1\n"
            "        self.n = max(self.n + self.step, 0)\n"
            "        return self.n\n"
            "    def __getitem__(self, i):\n"
            "        if i >= self.n: raise IndexError(i)\n"
            "        return self.item\n"));
    }
};

TEST_F(SeqConvert, GrowingSequenceIsRefusedAfterOneLook) {
    SetGlobal("grow", Eval("Moving('x', 1, 1)"));
    Strings *out = nullptr;
    EXPECT_EQ(qr::SeqToContainer<Strings>(Global("grow"), &out, nullptr, nullptr), qr::ERR_GENERIC);
    EXPECT_EQ(TakeError(), "TypeError: the sequence grew while it was read");
    PyObject *reads = Eval("grow.reads");
    EXPECT_EQ(PyInt_AsLong(reads), 2);
    Py_XDECREF(reads);

    SetGlobal("grow2", Eval("Moving(1, 1, 1)"));
    EXPECT_FALSE(qr::SeqProbe<Numbers>(Global("grow2"), nullptr, nullptr));
    EXPECT_EQ(TakeError(), "");
}

TEST_F(SeqConvert, ShrinkingSequenceEndsEarly) {
    // Lengths read: 6, then 4, 2, 0 before elements 0, 1 and 2.
    SetGlobal("shrink", Eval("Moving(7, 8, -2)"));
    Numbers *out = nullptr;
    int r = qr::SeqToContainer<Numbers>(Global("shrink"), &out, nullptr, nullptr);
    ASSERT_EQ(r, qr::RESULT_NEW_OBJECT);
    EXPECT_EQ(*out, Numbers({7, 7}));
    EXPECT_EQ(TakeError(), "");
    delete out;
}

TEST_F(SeqConvert, FailedProbeLeavesNoException) {
    // A dispatcher that probes a sequence signature and then calls another
    // one must not return with the probe's error still pending.
    SetGlobal("bad", Eval("['a', None, 'c']"));
    EXPECT_FALSE(qr::SeqProbe<Strings>(Global("bad"), nullptr, nullptr));
    EXPECT_EQ(TakeError(), "");
    SetGlobal("nolen", Eval("Moving('x', 1, 1)"));
    ASSERT_TRUE(RunPy("Moving.__len__ = lambda self: 1 // 0\n"));
    EXPECT_FALSE(qr::SeqProbe<Strings>(Global("nolen"), nullptr, nullptr));
    EXPECT_EQ(TakeError(), "");
    SetGlobal("good", Eval("('a', 'b')"));
    EXPECT_TRUE(qr::SeqProbe<Strings>(Global("good"), nullptr, nullptr));
    EXPECT_EQ(TakeError(), "");
}

}  // namespace
