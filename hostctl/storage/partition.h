// Partitions of disks, including the diagnostic partitions. The storage
// bindings define the classes here.
#ifndef HOSTCTL_STORAGE_PARTITION_H
#define HOSTCTL_STORAGE_PARTITION_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

// A partition table entry (number, sectors, type, GUID).
class Partition;
// A partition of a disk logical unit.
class DiskLunPartition;
// A partition that holds core dumps.
class DiagnosticPartition;

}  // namespace Storage
}  // namespace HostCtl

#endif
