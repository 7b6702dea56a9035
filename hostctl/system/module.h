// Kernel modules. The system bindings define the classes here.
#ifndef HOSTCTL_SYSTEM_MODULE_H
#define HOSTCTL_SYSTEM_MODULE_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace System {

// One kernel module, loaded or not.
class Module;

}  // namespace System
}  // namespace HostCtl

#endif
