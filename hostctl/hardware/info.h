// The root of the hardware area (processors, memory, NUMA, PCI devices).
// The hardware bindings complete this interface with its methods.
#ifndef HOSTCTL_HARDWARE_INFO_H
#define HOSTCTL_HARDWARE_INFO_H

#include "annotate.h"
#include "lib/object.h"
#include "types.h"

namespace HostCtl {
namespace Hardware {

class HardwareInfo : public virtual HostCtl::Lib::HostCtlObject {
};

}  // namespace Hardware
}  // namespace HostCtl

#endif
