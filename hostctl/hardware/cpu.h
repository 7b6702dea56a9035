// Processors and the processor view of the hardware area.
//
// Declared here so far: the processor class (by name only) and, of the
// processor view CpuInfo, the reasons that keep hardware-assisted replay
// off. The hardware bindings complete both classes in place: CpuInfo's
// hardware-virtualization support values go before HVReplayDisabledReason,
// its methods after it.
#ifndef HOSTCTL_HARDWARE_CPU_H
#define HOSTCTL_HARDWARE_CPU_H

#include "annotate.h"
#include "lib/object.h"
#include "types.h"

namespace HostCtl {
namespace Hardware {

// One logical processor.
class Cpu;

class CpuInfo : public virtual HostCtl::Lib::HostCtlObject {
public:
    // Why the processors cannot record and replay with hardware assistance;
    // HV_REPLAY_SUPPORTED when nothing stands in the way.
    enum HVReplayDisabledReason : int {
        HV_REPLAY_SUPPORTED = 0,
        HV_REPLAY_INCOMPATIBLE_CPU = 1,
        HV_REPLAY_HV_DISABLED = 2,
        HV_REPLAY_CPUID_MAXVAL = 3,
        HV_REPLAY_OLD_BIOS = 4,
        HV_REPLAY_INTERNAL_ERROR = 5
    };
};

}  // namespace Hardware
}  // namespace HostCtl

#endif
