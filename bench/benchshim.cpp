// A comparison point for the benchmarks: a plain C interface over the bench
// library and the product calls of the timing table, for Python's ctypes.
// Strings are returned from a per-thread buffer that stays valid until the
// next string call; errors are reported by a status and a message buffer.
#include <cstddef>
#include <cstring>
#include <exception>
#include <string>
#include <vector>

#include "benchlib.h"
#include "hostopt.h"

#define SHIM extern "C" __attribute__((visibility("default")))

namespace {

thread_local std::string text;

const char *Keep(std::string s) {
    text = std::move(s);
    return text.c_str();
}

int Report(const std::exception &e, char *msg, size_t cap) {
    if (msg && cap) {
        std::strncpy(msg, e.what(), cap - 1);
        msg[cap - 1] = '\0';
    }
    return 1;
}

Bench::WidgetImpl *Impl(void *p) { return static_cast<Bench::WidgetImpl *>(p); }

}  // namespace

SHIM void *bench_shared_impl() { return Bench::WidgetImpl::Shared(); }
SHIM void *bench_shared_widget() { return Bench::WidgetImpl::SharedWidget(); }

SHIM const char *bench_impl_get_name(void *p) { return Keep(Impl(p)->GetName()); }
SHIM void bench_impl_set_size(void *p, uint32 size) { Impl(p)->SetSize(size); }
SHIM uint32 bench_widget_get_size(void *p) { return static_cast<Bench::Widget *>(p)->GetSize(); }
// The interface method reached from an implementation pointer.
SHIM uint32 bench_impl_widget_get_size(void *p) { return static_cast<Bench::Widget *>(Impl(p))->GetSize(); }

// Copies up to cap item pointers into out; returns the item count.
SHIM size_t bench_impl_get_items(void *p, void **out, size_t cap) {
    std::vector<Bench::Item *> items = Impl(p)->GetItems();
    for (size_t i = 0; i < items.size() && i < cap; ++i) out[i] = items[i];
    return items.size();
}

SHIM uint64 bench_impl_sum(void *p, const uint64 *values, size_t n) {
    return Impl(p)->Sum(std::vector<uint64>(values, values + n));
}

SHIM int bench_impl_fail(void *p, char *msg, size_t cap) {
    try {
        Impl(p)->Fail();
    } catch (Bench::Error &e) {
        return Report(e, msg, cap);
    }
    return 0;
}

// ---- Product calls ---------------------------------------------------------------

SHIM void *bench_option(const char *branch, const char *name, char *msg, size_t cap) {
    try {
        return BenchHost::FindOption(branch, name);
    } catch (std::exception &e) {
        Report(e, msg, cap);
        return nullptr;
    }
}

SHIM void *bench_int_option(const char *branch, const char *name, char *msg, size_t cap) {
    try {
        return BenchHost::FindIntOption(branch, name);
    } catch (std::exception &e) {
        Report(e, msg, cap);
        return nullptr;
    }
}

// Null on a library exception.
SHIM const char *bench_option_name(void *p) {
    try {
        return Keep(static_cast<HostCtl::Adv::AdvancedOption *>(p)->GetOptionName());
    } catch (HostCtl::Lib::HostCtlException &) {
        return nullptr;
    }
}

// The value, or -1 on a library exception.
SHIM int64 bench_int_option_get(void *p) {
    try {
        return static_cast<QorCtl::Adv::AdvancedIntegerOptionImpl *>(p)->GetValue();
    } catch (HostCtl::Lib::HostCtlException &) {
        return -1;
    }
}

// Status 0, or 1 on a library exception.
SHIM int bench_int_option_set(void *p, uint32 value) {
    try {
        static_cast<QorCtl::Adv::AdvancedIntegerOptionImpl *>(p)->SetValue(value);
        return 0;
    } catch (HostCtl::Lib::HostCtlException &) {
        return 1;
    }
}
