// Record layouts, the descriptor ring, lookups, casts and the two boundary
// crossings (GetThisObject / ConvertPtrAndOwn / WrapPointer).
#include "test_runtime_support.h"

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <vector>

using namespace rtest;

// The records are read by other modules in the process: fixed 64-bit layout.
static_assert(offsetof(swig_type_info, name) == 0 && offsetof(swig_type_info, str) == 8 &&
              offsetof(swig_type_info, dcast) == 16 && offsetof(swig_type_info, cast) == 24 &&
              offsetof(swig_type_info, clientdata) == 32 && offsetof(swig_type_info, owndata) == 40 &&
              sizeof(swig_type_info) == 48, "swig_type_info layout");
static_assert(offsetof(swig_cast_entry, type) == 0 && offsetof(swig_cast_entry, converter) == 8 &&
              offsetof(swig_cast_entry, next) == 16 && offsetof(swig_cast_entry, prev) == 24 &&
              sizeof(swig_cast_entry) == 32, "swig_cast_entry layout");
static_assert(offsetof(swig_module_record, types) == 0 && offsetof(swig_module_record, size) == 8 &&
              offsetof(swig_module_record, next) == 16 && offsetof(swig_module_record, type_initial) == 24 &&
              offsetof(swig_module_record, cast_initial) == 32 && offsetof(swig_module_record, clientdata) == 40,
              "swig_module_record layout");
static_assert(offsetof(swig_class_data, klass) == 0 && offsetof(swig_class_data, newraw) == 8 &&
              offsetof(swig_class_data, newargs) == 16 && offsetof(swig_class_data, destroy) == 24 &&
              offsetof(swig_class_data, delargs) == 32 && offsetof(swig_class_data, implicitconv) == 36,
              "swig_class_data layout");
// After the object header: 16 bytes, or 32 for the debug interpreter, whose
// header also links every object into a list.
constexpr size_t kHead = sizeof(PyObject);
static_assert(offsetof(PySwigObject, ptr) == kHead && offsetof(PySwigObject, ty) == kHead + 8 &&
              offsetof(PySwigObject, own) == kHead + 16 && offsetof(PySwigObject, next) == kHead + 24 &&
              offsetof(PySwigObject, dead) == kHead + 32, "PySwigObject layout: shared prefix, then dead");
static_assert(offsetof(PySwigPacked, pack) == kHead && offsetof(PySwigPacked, ty) == kHead + 8 &&
              offsetof(PySwigPacked, size) == kHead + 16, "PySwigPacked layout");

namespace {

// Releases class data made by a test for a descriptor of its own, which no
// module teardown will see.
void FreeTestClassData(swig_class_data *d) {
    if (!d) return;
    Py_XDECREF(d->klass);
    Py_XDECREF(d->newraw);
    Py_XDECREF(d->newargs);
    Py_XDECREF(d->destroy);
    std::free(d);
}

std::vector<swig_cast_entry *> CastList(swig_type_info *ty) {
    std::vector<swig_cast_entry *> v;
    for (swig_cast_entry *e = ty->cast; e; e = e->next) {
        EXPECT_EQ(e->prev, v.empty() ? nullptr : v.back()) << "broken back link in " << ty->name;
        v.push_back(e);
    }
    return v;
}

PySwigObject *Obj(PyObject *o) { return reinterpret_cast<PySwigObject *>(o); }

}  // namespace

using RuntimeRing = RuntimeTest;

TEST_F(RuntimeRing, FirstRecordCreatesTheSharingModuleAndBothJoinOneRing) {
    EXPECT_TRUE(ring->runtime_module_was_absent);
    EXPECT_EQ(qr::OwnRecord(), ring->b);
    void *head = PyCObject_Import(const_cast<char *>("swig_runtime_data4"), const_cast<char *>("type_pointer"));
    EXPECT_EQ(head, ring->a) << TakeError();
    EXPECT_EQ(ring->a->next, ring->b);
    EXPECT_EQ(ring->b->next, ring->a);
    for (int i = 0; i < A_N; ++i) EXPECT_EQ(ring->a->types[i], A(i));
    EXPECT_EQ(ring->a->types[A_N], nullptr);
    // B shares Leaf and Root with A and keeps its own Stick and Twig.
    swig_type_info *expect_b[] = {A(A_Leaf), A(A_Root), B(B_Stick), B(B_Twig), nullptr};
    for (int i = 0; i <= B_N; ++i) EXPECT_EQ(ring->b->types[i], expect_b[i]) << i;
    // B's class data for Leaf moved into the shared descriptor.
    ASSERT_NE(B(B_Leaf)->clientdata, nullptr);
    EXPECT_EQ(A(A_Leaf)->clientdata, B(B_Leaf)->clientdata);
}

TEST_F(RuntimeRing, CastListsMergeWithoutDuplicates) {
    std::vector<swig_cast_entry *> mid = CastList(A(A_Mid));
    ASSERT_EQ(mid.size(), 3u);
    for (int k = 0; k < 3; ++k)
        EXPECT_NE(std::find(mid.begin(), mid.end(), &ring->a_casts[A_Mid][k]), mid.end()) << k;
    // Root: A's five entries plus B's Stick entry; B's self and Leaf entries
    // duplicate A's and are not linked.
    std::vector<swig_cast_entry *> root = CastList(A(A_Root));
    ASSERT_EQ(root.size(), 6u);
    int leaf_entries = 0, stick_entries = 0;
    for (swig_cast_entry *e : root) {
        leaf_entries += std::strcmp(e->type->name, "_p_Leaf") == 0;
        stick_entries += e == &ring->b_casts[B_Root][2];
        EXPECT_NE(e, &ring->b_casts[B_Root][0]);
    }
    EXPECT_EQ(leaf_entries, 1);
    EXPECT_EQ(stick_entries, 1);
    EXPECT_EQ(ring->b_casts[B_Root][2].type, B(B_Stick));
    // Twig is B's own: its Leaf entry now names A's shared Leaf descriptor.
    std::vector<swig_cast_entry *> twig = CastList(B(B_Twig));
    ASSERT_EQ(twig.size(), 2u);
    EXPECT_EQ(ring->b_casts[B_Twig][1].type, A(A_Leaf));
}

TEST_F(RuntimeRing, PointerConstantsAndDocPatch) {
    PyObject *p = PyDict_GetItemString(ring->dict_a, "PTR_CONST");
    ASSERT_TRUE(p && qr::IsSwigObject(p));
    EXPECT_EQ(Obj(p)->ptr, ring->ptr_const);
    EXPECT_EQ(Obj(p)->ty, A(A_Plain));
    EXPECT_EQ(Obj(p)->own, 0);
    PyObject *packed = PyDict_GetItemString(ring->dict_a, "PACKED_CONST");
    ASSERT_TRUE(packed && Py_TYPE(packed) == qr::PySwigPacked_Type());
    EXPECT_EQ(Str(packed), "_0102abff_p_Plain");
    EXPECT_EQ(PyDict_GetItemString(ring->dict_a, "NULL_PTR"), Py_None);
    EXPECT_EQ(PyDict_GetItemString(ring->dict_a, "SKIPPED"), nullptr);
    char packed_ptr[64];
    void *pv = ring->ptr_const;
    ASSERT_TRUE(qr::PackedText(packed_ptr, sizeof packed_ptr, &pv, sizeof pv, "_p_Plain"));
    EXPECT_EQ(std::string(ring->a_methods[0].ml_doc), std::string("Gives a thing. swig_ptr: ") + packed_ptr);
    EXPECT_STREQ(ring->a_methods[1].ml_doc, "swig_ptr: PACKED_CONST");  // kind 5 rows are not used
    EXPECT_EQ(ring->a_methods[2].ml_doc, nullptr);
}

TEST_F(RuntimeRing, SecondInitialisationKeepsRingAndTables) {
    swig_cast_entry *root_head = A(A_Root)->cast;
    std::string doc = ring->a_methods[0].ml_doc;
    ASSERT_NE(qr::InitModule("_qrt_a", ring->a_methods, ring->a, nullptr), nullptr);
    EXPECT_EQ(qr::OwnRecord(), ring->a);
    ASSERT_NE(qr::InitModule("_qrt_b", ring->b_methods, ring->b, nullptr), nullptr);
    EXPECT_EQ(qr::OwnRecord(), ring->b);
    EXPECT_EQ(ring->a->next, ring->b);
    EXPECT_EQ(ring->b->next, ring->a);
    EXPECT_EQ(ring->b->types[B_Root], A(A_Root));
    EXPECT_EQ(ring->a->types[A_Root], A(A_Root));
    EXPECT_EQ(A(A_Root)->cast, root_head);
    EXPECT_EQ(CastList(A(A_Root)).size(), 6u);
    EXPECT_EQ(doc, ring->a_methods[0].ml_doc);
}

using RuntimeFind = RuntimeTest;

TEST_F(RuntimeFind, MangledNamesAcrossTheRing) {
    for (int i = 0; i < A_N; ++i) EXPECT_EQ(qr::FindTypeByMangledName(ring->b, A(i)->name), A(i));
    EXPECT_EQ(qr::FindTypeByMangledName(ring->b, "_p_Stick"), B(B_Stick));
    EXPECT_EQ(qr::FindTypeByMangledName(ring->b, "_p_A"), nullptr);    // below every name
    EXPECT_EQ(qr::FindTypeByMangledName(ring->b, "_p_zzz"), nullptr);  // above every name
    EXPECT_EQ(qr::FindTypeByMangledName(ring->b, "_p_Mie"), nullptr);
    // Starting after the own record stops before it.
    EXPECT_EQ(qr::FindTypeByMangledName(ring->a, "_p_Stick"), nullptr);
    EXPECT_EQ(qr::FindTypeByMangledName(ring->a, "_p_Exc"), A(A_Exc));
}

TEST_F(RuntimeFind, HumanNamesIgnoreBlanks) {
    EXPECT_EQ(qr::FindTypeByName("std::string *"), A(A_string));
    EXPECT_EQ(qr::FindTypeByName("std::string*"), A(A_string));
    EXPECT_EQ(qr::FindTypeByName(" std :: string * "), A(A_string));
    EXPECT_EQ(qr::FindTypeByName("string*"), A(A_string));
    EXPECT_EQ(qr::FindTypeByName("RootRef*"), A(A_Root));
    EXPECT_EQ(qr::FindTypeByName("Twig *"), B(B_Twig));
    EXPECT_EQ(qr::FindTypeByName("_p_char"), A(A_char));
    EXPECT_EQ(qr::FindTypeByName("std::strin *"), nullptr);
    EXPECT_EQ(qr::FindTypeByName("char"), nullptr);
    EXPECT_EQ(qr::FindTypeByName("Root * *"), nullptr);
}

TEST_F(RuntimeFind, FindCastMovesTheMatchToTheFront) {
    swig_type_info *mid = A(A_Mid);
    swig_cast_entry *leaf = qr::FindCast("_p_Leaf", mid);
    ASSERT_NE(leaf, nullptr);
    EXPECT_EQ(leaf->type, A(A_Leaf));
    EXPECT_EQ(mid->cast, leaf);
    swig_cast_entry *self = qr::FindCast("_p_Mid", mid);
    EXPECT_EQ(mid->cast, self);
    EXPECT_EQ(self->next, leaf);
    EXPECT_EQ(CastList(mid).size(), 3u);
    EXPECT_EQ(qr::FindCast("_p_Stick", mid), nullptr);
    EXPECT_EQ(mid->cast, self);
    EXPECT_EQ(qr::DisplayName(A(A_Root)), std::string("RootRef *"));
}

using RuntimeConvertPtr = RuntimeTest;

TEST_F(RuntimeConvertPtr, VirtualBasesTwoAndThreeLevelsDeep) {
    Deep deep;
    Leaf leaf;
    Stick stick;
    struct Case { void *p; swig_type_info *from, *to; void *want; };
    Case cases[] = {
        {&deep, A(A_Deep), A(A_Root), static_cast<Root *>(&deep)},  // three levels
        {&deep, A(A_Deep), A(A_Mid), static_cast<Mid *>(&deep)},
        {&leaf, A(A_Leaf), A(A_Root), static_cast<Root *>(&leaf)},  // two levels
        {&leaf, A(A_Leaf), B(B_Twig), static_cast<Twig *>(&leaf)},  // through B's entry
        {&stick, B(B_Stick), A(A_Root), static_cast<Root *>(&stick)},
        {&deep, A(A_Deep), A(A_Deep), &deep},
        {&deep, A(A_Deep), nullptr, &deep},
        {nullptr, A(A_Deep), A(A_Root), nullptr},
    };
    for (const Case &c : cases) {
        PyObject *o = qr::NewSwigObject(c.p, c.from, 0);
        void *out = &out;
        EXPECT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(o, &out, c.to, 0), 0) << c.from->name;
        EXPECT_EQ(out, c.want) << c.from->name << " -> " << (c.to ? c.to->name : "any");
        Py_DECREF(o);
    }
    EXPECT_NE(static_cast<void *>(static_cast<Root *>(&deep)), static_cast<void *>(&deep));
    void *out = nullptr;
    PyObject *o = qr::NewSwigObject(&deep, A(A_Deep), 0);
    ASSERT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(o, &out, A(A_Root), 0), 0);
    EXPECT_EQ(static_cast<Root *>(out)->r, 11);
    EXPECT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(o, &out, A(A_Plain), 0), qr::ERR_GENERIC);
    EXPECT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(o, &out, B(B_Stick), 0), qr::ERR_GENERIC);
    Py_DECREF(o);
}

TEST_F(RuntimeConvertPtr, NoneNumbersAppendedViewsAndOwnership) {
    void *out = &out;
    EXPECT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(Py_None, &out, A(A_Root), 0), 0);
    EXPECT_EQ(out, nullptr);
    EXPECT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(nullptr, &out, A(A_Root), 0), qr::ERR_GENERIC);
    PyObject *five = PyInt_FromLong(5);
    EXPECT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(five, &out, A(A_Root), 0), qr::ERR_GENERIC);
    Py_DECREF(five);
    EXPECT_EQ(TakeError(), "");
    // A Plain object carrying an appended Leaf view converts through the view.
    Plain plain;
    Leaf leaf;
    PyObject *o = qr::NewSwigObject(&plain, A(A_Plain), 1);
    PyObject *view = qr::NewSwigObject(&leaf, A(A_Leaf), 1);
    Obj(o)->next = view;
    ASSERT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(o, &out, A(A_Root), qr::POINTER_DISOWN), 0);
    EXPECT_EQ(out, static_cast<Root *>(&leaf));
    EXPECT_EQ(Obj(view)->own, 0);  // the view that converted is disowned
    EXPECT_EQ(Obj(o)->own, 1);
    Obj(o)->own = 0;
    Py_DECREF(o);
}

TEST_F(RuntimeConvertPtr, DestroyedObjectsAreRefused) {
    Deep deep;
    PyObject *o = qr::NewSwigObject(&deep, A(A_Deep), 1);
    void *out = nullptr;
    ASSERT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(o, &out, A(A_Root), qr::POINTER_DISOWN | qr::POINTER_DESTROY), 0);
    EXPECT_EQ(Obj(o)->own, 0);
    EXPECT_EQ(Obj(o)->dead, 1);
    EXPECT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(o, &out, A(A_Root), 0), qr::ERR_VALUE);
    EXPECT_EQ(qr::SWIG_Python_ConvertPtrAndOwn(o, &out, A(A_Plain), 0), qr::ERR_GENERIC);
    EXPECT_FALSE(qr::ArgSelf(o, &out, A(A_Root), "Root_Get", "Root *"));
    EXPECT_EQ(TakeError(), "ValueError: in method 'Root_Get', argument 1 of type 'Root *'");
    EXPECT_FALSE(qr::ArgRef(o, &out, A(A_Deep), "f", 2, "Deep const &"));
    EXPECT_EQ(TakeError(), "ValueError: in method 'f', argument 2 of type 'Deep const &'");
    EXPECT_TRUE(qr::ProbePtr(o, A(A_Root)));  // selects the overload that reports it
    EXPECT_FALSE(qr::ProbePtr(o, A(A_Plain)));
    Py_DECREF(o);
}

using RuntimeThis = RuntimeTest;

namespace {
Plain g_made_target;
PyObject *MakeObj(PyObject *, PyObject *) { return qr::NewSwigObject(&g_made_target, nullptr, 0); }
PyMethodDef make_obj = {"make_obj", MakeObj, METH_NOARGS, nullptr};
}  // namespace

TEST_F(RuntimeThis, FindsTheWrappedObjectBehindEveryKindOfHolder) {
    Plain plain;
    SetGlobal("so", qr::NewSwigObject(&plain, A(A_Plain), 0));
    SetGlobal("make_obj", PyCFunction_New(&make_obj, nullptr));
    ASSERT_TRUE(RunPy(
        "import weakref\n"
        "class New(object): pass\n"
        "class Old: pass\n"
        "class Callable(object):\n"
        "    def __call__(self): pass\n"
        "class Slotted(object):\n"
        "    __slots__ = ('this',)\n"
        "class Raising(object):\n"
        "    __slots__ = ()\n"
        "    def __getattr__(self, name): raise KeyError(name)\n"
        "class Computed(object):\n"
        "    __slots__ = ()\n"
        "    this = property(lambda self: make_obj())\n"
        "n = New(); n.this = so\n"
        "o = Old(); o.this = so\n"
        "c = Callable(); c.this = so\n"
        "s = Slotted(); s.this = so\n"
        "nested = New(); nested.this = n\n"
        "proxy = weakref.proxy(n); cproxy = weakref.proxy(c)\n"
        "gone = New(); gone.this = so; dead_proxy = weakref.proxy(gone); del gone\n"
        "loop = New(); loop.this = loop\n"
        "r = Raising(); empty = New(); comp = Computed()\n"));
    PyObject *so = Global("so");
    for (const char *name : {"so", "n", "o", "c", "s", "nested", "proxy", "cproxy"})
        EXPECT_EQ(qr::GetThisObject(Global(name)), Obj(so)) << name;
    // A "this" that only the attribute lookup referenced would die before
    // the call that converts it is over (with two such arguments the first
    // one's library object was destroyed while the second was looked up):
    // it does not count as wrapped.
    for (const char *name : {"dead_proxy", "loop", "r", "empty", "comp"}) {
        EXPECT_EQ(qr::GetThisObject(Global(name)), nullptr) << name;
        EXPECT_EQ(TakeError(), "") << name;
    }
}

using RuntimeWrap = RuntimeTest;

TEST_F(RuntimeWrap, BareObjectsShadowInstancesAndNull) {
    Plain plain;
    Leaf leaf;
    PyObject *none = qr::WrapPointer(nullptr, A(A_Leaf), qr::POINTER_OWN);
    EXPECT_EQ(none, Py_None);
    Py_DECREF(none);
    PyObject *bare = qr::WrapPointer(&plain, A(A_Plain), 0);  // no class data
    ASSERT_TRUE(qr::IsSwigObject(bare));
    EXPECT_EQ(Obj(bare)->own, 0);
    Py_DECREF(bare);
    // Leaf has B's class data (LeafCls, a new-style class).
    PyObject *inst = qr::WrapPointer(&leaf, A(A_Leaf), 0);
    ASSERT_NE(inst, nullptr);
    EXPECT_EQ(PyObject_IsInstance(inst, Global("LeafCls")), 1);
    PySwigObject *this_obj = qr::GetThisObject(inst);
    ASSERT_NE(this_obj, nullptr);
    EXPECT_EQ(this_obj->ptr, &leaf);
    EXPECT_EQ(PyDict_GetItemString(*_PyObject_GetDictPtr(inst), "this"), reinterpret_cast<PyObject *>(this_obj));
    Py_DECREF(inst);
    PyObject *no_shadow = qr::WrapPointer(&leaf, A(A_Leaf), qr::POINTER_OWN | qr::POINTER_NO_SHADOW);
    ASSERT_TRUE(qr::IsSwigObject(no_shadow));
    EXPECT_EQ(Obj(no_shadow)->own, 1);
    Obj(no_shadow)->own = 0;
    Py_DECREF(no_shadow);
}

TEST_F(RuntimeWrap, OldStyleClassesAndFailingMakers) {
    ASSERT_TRUE(RunPy("class OldCls: pass\n"
                    "class NoNew(object):\n"
                    "    def __new__(cls): raise RuntimeError('no')\n"));
    swig_type_info old_ty = {"_p_Old", "Old *", nullptr, nullptr, nullptr, 0};
    swig_type_info fail_ty = {"_p_Fail", "Fail *", nullptr, nullptr, nullptr, 0};
    qr::RegisterClass(&old_ty, Global("OldCls"));
    qr::RegisterClass(&fail_ty, Global("NoNew"));
    Plain plain;
    PyObject *o = qr::WrapPointer(&plain, &old_ty, 0);
    ASSERT_TRUE(PyInstance_Check(o));
    EXPECT_EQ(qr::GetThisObject(o)->ptr, &plain);
    Py_DECREF(o);
    PyObject *f = qr::WrapPointer(&plain, &fail_ty, 0);
    EXPECT_TRUE(f && qr::IsSwigObject(f));
    EXPECT_EQ(TakeError(), "");
    Py_XDECREF(f);
    FreeTestClassData(static_cast<swig_class_data *>(old_ty.clientdata));
    FreeTestClassData(static_cast<swig_class_data *>(fail_ty.clientdata));
}

using RuntimeRegister = RuntimeTest;

TEST_F(RuntimeRegister, ClassDataFollowsConverterlessEntriesDepthFirst) {
    swig_class_data preset = {};
    A(A_RootAlias)->clientdata = A(A_RootAlias2)->clientdata = nullptr;  // repeatable
    A(A_RootAlias3)->clientdata = &preset;
    ASSERT_TRUE(RunPy("class RootCls(object): pass\n"));
    PyObject *args = Py_BuildValue("(O)", Global("RootCls"));
    PyObject *r = qr::SwigRegister(args, A(A_Root));
    Py_DECREF(args);
    ASSERT_EQ(r, Py_None) << TakeError();
    Py_DECREF(r);
    swig_class_data *d = static_cast<swig_class_data *>(A(A_Root)->clientdata);
    ASSERT_NE(d, nullptr);
    EXPECT_EQ(A(A_Root)->owndata, 1);
    EXPECT_EQ(A(A_RootAlias)->clientdata, d);
    EXPECT_EQ(A(A_RootAlias2)->clientdata, d);  // reached through RootAlias
    EXPECT_EQ(A(A_RootAlias3)->clientdata, &preset);
    EXPECT_EQ(A(A_RootAlias)->owndata, 0);
    EXPECT_EQ(A(A_Mid)->clientdata, nullptr);  // entries with converters are not followed
    EXPECT_EQ(A(A_Deep)->clientdata, nullptr);
    EXPECT_EQ(d->klass, Global("RootCls"));
    EXPECT_TRUE(d->newraw && PyTuple_Check(d->newargs) && PyTuple_GET_ITEM(d->newargs, 0) == d->klass);
    EXPECT_EQ(d->destroy, nullptr);
    EXPECT_EQ(d->delargs, 0);
    A(A_RootAlias3)->clientdata = nullptr;
    PyObject *bad = Py_BuildValue("()");
    EXPECT_EQ(qr::SwigRegister(bad, A(A_Root)), nullptr);
    EXPECT_NE(TakeError().find("TypeError: swigregister"), std::string::npos);
    Py_DECREF(bad);
}

namespace {
PyObject *DelVarargs(PyObject *, PyObject *) { return qr::NoneResult(); }
PyObject *DelO(PyObject *, PyObject *) { return qr::NoneResult(); }
PyMethodDef del_varargs = {"del_varargs", DelVarargs, METH_VARARGS, nullptr};
PyMethodDef del_o = {"del_o", DelO, METH_O, nullptr};
}  // namespace

TEST_F(RuntimeRegister, ClassDataOfOldStyleClassesAndDestroyStyles) {
    SetGlobal("del_varargs", PyCFunction_New(&del_varargs, nullptr));
    SetGlobal("del_o", PyCFunction_New(&del_o, nullptr));
    ASSERT_TRUE(RunPy("class OldReg:\n    __swig_destroy__ = del_o\n"
                    "class NewReg(object):\n    __swig_destroy__ = del_varargs\n"));
    swig_class_data *old = qr::MakeClassData(Global("OldReg"));
    EXPECT_EQ(old->newraw, nullptr);
    EXPECT_EQ(old->newargs, Global("OldReg"));
    EXPECT_EQ(old->destroy, Global("del_o"));
    EXPECT_EQ(old->delargs, 0);
    swig_class_data *nw = qr::MakeClassData(Global("NewReg"));
    EXPECT_EQ(nw->destroy, Global("del_varargs"));
    EXPECT_EQ(nw->delargs, 1);
    EXPECT_EQ(TakeError(), "");
    FreeTestClassData(old);
    FreeTestClassData(nw);
}

using RuntimeTeardownDeathTest = RuntimeTest;

TEST_F(RuntimeTeardownDeathTest, TypePointerDestroyReleasesClassData) {
    GTEST_FLAG_SET(death_test_style, "fast");
    // Runs in a forked child: the teardown ends the shared state for good.
    auto teardown = [this]() {
        if (!RunPy("class PlainCls(object): pass\n")) std::_Exit(2);
        PyObject *cls = Global("PlainCls");
        qr::RegisterClass(A(A_Plain), cls);
        swig_class_data *d = static_cast<swig_class_data *>(A(A_Plain)->clientdata);
        Py_ssize_t before = Py_REFCNT(cls);
        PyObject *m = PyImport_AddModule("swig_runtime_data4");
        if (!m || PyObject_DelAttrString(m, "type_pointer") != 0) std::_Exit(3);
        // klass and the maker-argument tuple each held the class.
        if (d->klass || d->newraw || d->newargs || d->destroy || Py_REFCNT(cls) != before - 2) std::_Exit(4);
        // The "this" key was released; the next lookup creates it again.
        Plain p;
        SetGlobal("after", qr::NewSwigObject(&p, nullptr, 0));
        if (!RunPy("class H(object): pass\nh = H(); h.this = after\n")) std::_Exit(5);
        std::_Exit(qr::GetThisObject(Global("h")) == reinterpret_cast<PySwigObject *>(Global("after")) ? 0 : 6);
    };
    EXPECT_EXIT(teardown(), ::testing::ExitedWithCode(0), "");
}
