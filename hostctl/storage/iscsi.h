// iSCSI adapters and their targets. The storage bindings define the
// classes here.
#ifndef HOSTCTL_STORAGE_ISCSI_H
#define HOSTCTL_STORAGE_ISCSI_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

// An iSCSI adapter.
class iScsiInterface;
// A statically configured iSCSI target.
class StaticTarget;
// The network address (host and port) of an iSCSI target.
class TargetAddress;

}  // namespace Storage
}  // namespace HostCtl

#endif
