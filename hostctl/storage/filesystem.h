// Mounted file systems. The storage bindings define the classes here.
#ifndef HOSTCTL_STORAGE_FILESYSTEM_H
#define HOSTCTL_STORAGE_FILESYSTEM_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

// A mounted file system.
class FileSystem;
// A file system for virtual machines.
class VmFileSystem;
// A network file system volume.
class NetworkFileSystem;
// A FAT file system.
class VFATFileSystem;
// A UFS file system.
class UFSFileSystem;

}  // namespace Storage
}  // namespace HostCtl

#endif
