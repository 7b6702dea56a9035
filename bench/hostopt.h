// Finds the advanced options of the default host that the product rows of
// the benchmarks time; shared by the comparison modules (floor, Cython,
// ctypes shim), which reach the library without the generated bindings.
#ifndef QORCTL_BENCH_HOSTOPT_H
#define QORCTL_BENCH_HOSTOPT_H

#include "adv/option_impl.h"
#include "host.h"
#include "lib/exception.h"

namespace BenchHost {

// The option `name` of branch `branch` ("Net"), or null.
inline HostCtl::Adv::AdvancedOption *FindOption(const char *branch, const char *name) {
    HostCtl::Adv::AdvancedOptionBranch *b = HostCtl::HostFactory::GetHost()->GetAdvancedOptions()->GetBranchByName(branch);
    return b ? b->GetOptionByName(name) : nullptr;
}

inline QorCtl::Adv::AdvancedIntegerOptionImpl *FindIntOption(const char *branch, const char *name) {
    return dynamic_cast<QorCtl::Adv::AdvancedIntegerOptionImpl *>(FindOption(branch, name));
}

}  // namespace BenchHost

#endif
