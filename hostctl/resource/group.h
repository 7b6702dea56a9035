// Resource groups and virtual machines. The resource bindings define the
// classes here.
#ifndef HOSTCTL_RESOURCE_GROUP_H
#define HOSTCTL_RESOURCE_GROUP_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Resource {

// A node of the host's resource-group tree.
class ResourceGroup;
// A running virtual machine: a leaf of the resource-group tree.
class VirtualMachine;

}  // namespace Resource
}  // namespace HostCtl

namespace QorCtl {
namespace Resource {

class ResourceGroupImpl;

}  // namespace Resource
}  // namespace QorCtl

#endif
