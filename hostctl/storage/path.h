// Paths from adapters to logical units. The storage bindings define the
// classes here.
#ifndef HOSTCTL_STORAGE_PATH_H
#define HOSTCTL_STORAGE_PATH_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

// One path (adapter, channel, target, LUN) to a logical unit.
class ScsiPath;

}  // namespace Storage
}  // namespace HostCtl

#endif
