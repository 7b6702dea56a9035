// The root of the resource area (resource groups, virtual machines, host
// statistics). The resource bindings complete this interface.
#ifndef HOSTCTL_RESOURCE_INFO_H
#define HOSTCTL_RESOURCE_INFO_H

#include "annotate.h"
#include "lib/object.h"
#include "types.h"

namespace HostCtl {
namespace Resource {

class ResourceInfo : public virtual HostCtl::Lib::HostCtlObject {
};

}  // namespace Resource
}  // namespace HostCtl

#endif
