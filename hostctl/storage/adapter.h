// Storage adapters by transport. The storage bindings define the classes
// here.
#ifndef HOSTCTL_STORAGE_ADAPTER_H
#define HOSTCTL_STORAGE_ADAPTER_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

// A storage adapter.
class ScsiInterface;
// A block adapter.
class BlockScsiInterface;
// A Fibre Channel adapter.
class FibreChannelInterface;
// An IDE adapter.
class IdeScsiInterface;
// A parallel SCSI adapter.
class ParallelScsiInterface;

}  // namespace Storage
}  // namespace HostCtl

#endif
