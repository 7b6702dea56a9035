// The root of the storage area (adapters, logical units, paths, file
// systems). It has no base class. The storage bindings complete this
// interface.
#ifndef HOSTCTL_STORAGE_INFO_H
#define HOSTCTL_STORAGE_INFO_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

class StorageInfo {
public:
    virtual ~StorageInfo();

protected:
    StorageInfo() {}
};

}  // namespace Storage
}  // namespace HostCtl

#endif
