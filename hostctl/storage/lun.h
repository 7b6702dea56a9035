// Logical units (SCSI devices) and disks. The storage bindings define the
// classes here.
#ifndef HOSTCTL_STORAGE_LUN_H
#define HOSTCTL_STORAGE_LUN_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

// A logical unit: disk, CD-ROM, tape and the like.
class Lun;
// A logical unit that is a disk.
class DiskLun;

}  // namespace Storage
}  // namespace HostCtl

#endif
