// The root of the system area (boot, time, logging, kernel options and
// modules). The system bindings complete this interface.
#ifndef HOSTCTL_SYSTEM_INFO_H
#define HOSTCTL_SYSTEM_INFO_H

#include "annotate.h"
#include "lib/object.h"
#include "types.h"

namespace HostCtl {
namespace System {

class SystemInfo : public virtual HostCtl::Lib::HostCtlObject {
};

}  // namespace System
}  // namespace HostCtl

#endif
