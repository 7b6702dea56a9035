// Open handles on a logical unit.
#ifndef HOSTCTL_STORAGE_LUN_HANDLE_H
#define HOSTCTL_STORAGE_LUN_HANDLE_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

// One open handle on a logical unit (an element of Lun::GetHandles): the
// world that holds it and the partition it is open on (0 for the whole
// device). A new handle is 0, 0.
class LunHandle {
public:
    LunHandle();
    LunHandle(uint32 worldId, uint32 partition);
    uint32 GetWorldID() const;
    uint32 GetPartition() const;

private:
    uint32 worldId_;
    uint32 partition_;
};

}  // namespace Storage
}  // namespace HostCtl

#endif
