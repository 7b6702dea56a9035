// Storage array type plugins of the native multipathing plugin. The
// storage bindings define the classes here.
#ifndef HOSTCTL_STORAGE_NMP_ARRAY_TYPE_H
#define HOSTCTL_STORAGE_NMP_ARRAY_TYPE_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {
namespace Nmp {

// A storage array type plugin with its claim rules.
class StorageArrayType;

}  // namespace Nmp
}  // namespace Storage
}  // namespace HostCtl

#endif
