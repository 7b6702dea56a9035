// The library's own option and branch objects, one per path, made on first
// use and kept for the life of the process.
#ifndef LIBQORCTL_ADV_REGISTRY_H
#define LIBQORCTL_ADV_REGISTRY_H

#include <string>
#include <vector>

#include "adv/option.h"

namespace QorCtl {
namespace Adv {

// Both throw HostCtlException for an unknown path.
HostCtl::Adv::AdvancedOption *LibraryOption(std::string const &path);
HostCtl::Adv::AdvancedOptionBranch *LibraryBranch(std::string const &path);

// "/Net/Tcpip" -> {"Net", "Tcpip"}; "/" -> {}.
std::vector<std::string> SplitPath(std::string const &path);

}  // namespace Adv
}  // namespace QorCtl

#endif
