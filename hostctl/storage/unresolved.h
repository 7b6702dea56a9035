// File-system volumes whose extents the host found but could not resolve
// (copies, snapshots, missing extents). The storage bindings define the
// classes here.
#ifndef HOSTCTL_STORAGE_UNRESOLVED_H
#define HOSTCTL_STORAGE_UNRESOLVED_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

// An unresolved volume.
class UnresolvedKobfsVolume;
// One extent of an unresolved volume.
class UnresolvedKobfsExtent;

}  // namespace Storage
}  // namespace HostCtl

#endif
