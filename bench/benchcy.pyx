# distutils: language = c++
# A comparison point for the benchmarks: the bench library and the product
# calls of the timing table bound by hand with Cython, as cdef classes, the
# way a user who picked Cython would write them.
from libc.stdint cimport uint32_t, uint64_t
from libcpp.string cimport string
from libcpp.vector cimport vector


cdef extern from "benchlib.h":
    cdef cppclass CItem "Bench::Item":
        uint32_t GetId()

    cdef cppclass CWidget "Bench::Widget":
        string GetName()
        uint32_t GetSize()
        void SetSize(uint32_t)
        vector[CItem *] GetItems()
        uint64_t Sum(const vector[uint64_t] &)
        void Fail() except +

    cdef cppclass CWidgetImpl "Bench::WidgetImpl"(CWidget):
        pass

    CWidgetImpl *SharedImpl "Bench::WidgetImpl::Shared"()
    CWidget *SharedWidget "Bench::WidgetImpl::SharedWidget"()


cdef extern from "hostopt.h":
    cdef cppclass CAdvancedOption "HostCtl::Adv::AdvancedOption":
        string GetOptionName() except +

    cdef cppclass CAdvancedIntegerOption "HostCtl::Adv::AdvancedIntegerOption":
        uint32_t GetValue() except +
        void SetValue(uint32_t) except +

    cdef cppclass CAdvancedIntegerOptionImpl "QorCtl::Adv::AdvancedIntegerOptionImpl"(CAdvancedIntegerOption):
        pass

    CAdvancedOption *FindOption "BenchHost::FindOption"(const char *, const char *) except +
    CAdvancedIntegerOptionImpl *FindIntOption "BenchHost::FindIntOption"(const char *, const char *) except +


cdef class Item:
    cdef CItem *p

    def GetId(self):
        return self.p.GetId()


cdef Item wrap_item(CItem *p):
    cdef Item it = Item.__new__(Item)
    it.p = p
    return it


cdef class Widget:
    # The interface pointer, adjusted once when the object is wrapped.
    cdef CWidget *w

    def GetName(self):
        return self.w.GetName()

    def GetSize(self):
        return self.w.GetSize()

    def SetSize(self, uint32_t size):
        self.w.SetSize(size)


cdef class WidgetImpl(Widget):
    cdef CWidgetImpl *impl

    def GetName(self):
        return self.impl.GetName()

    def GetSize(self):
        return self.impl.GetSize()

    def SetSize(self, uint32_t size):
        self.impl.SetSize(size)

    def GetItems(self):
        cdef vector[CItem *] items = self.impl.GetItems()
        return tuple([wrap_item(p) for p in items])

    def Sum(self, vector[uint64_t] values):
        return self.impl.Sum(values)

    def Fail(self):
        self.impl.Fail()


def shared_impl():
    cdef WidgetImpl w = WidgetImpl.__new__(WidgetImpl)
    w.impl = SharedImpl()
    w.w = w.impl
    return w


def shared_widget():
    cdef Widget w = Widget.__new__(Widget)
    w.w = SharedWidget()
    return w


cdef class AdvancedOption:
    cdef CAdvancedOption *p

    def GetOptionName(self):
        return self.p.GetOptionName()


cdef class AdvancedIntegerOption:
    cdef CAdvancedIntegerOption *p

    def GetValue(self):
        return self.p.GetValue()


cdef class AdvancedIntegerOptionImpl(AdvancedIntegerOption):
    cdef CAdvancedIntegerOptionImpl *impl

    def GetValue(self):
        return self.impl.GetValue()

    def SetValue(self, uint32_t value):
        self.impl.SetValue(value)


def option(bytes branch, bytes name):
    cdef AdvancedOption o = AdvancedOption.__new__(AdvancedOption)
    o.p = FindOption(branch, name)
    return o


def int_option(bytes branch, bytes name):
    cdef AdvancedIntegerOptionImpl o = AdvancedIntegerOptionImpl.__new__(AdvancedIntegerOptionImpl)
    o.impl = FindIntOption(branch, name)
    o.p = o.impl
    return o
