// Path selection policies of the native multipathing plugin and their
// per-device configurations. The storage bindings define the classes here.
#ifndef HOSTCTL_STORAGE_NMP_PSP_H
#define HOSTCTL_STORAGE_NMP_PSP_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {
namespace Nmp {

// A path selection policy plugin.
class PathSelectionPolicy;

}  // namespace Nmp
}  // namespace Storage
}  // namespace HostCtl

#endif
