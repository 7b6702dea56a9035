// Identifiers of storage devices: the device's unique ids and the durable
// names read from its inquiry data. The storage bindings define the classes
// here.
#ifndef HOSTCTL_STORAGE_IDENTIFIER_H
#define HOSTCTL_STORAGE_IDENTIFIER_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

// One identifier of a device, with its properties.
class DeviceUid;
// An identifier from the device's inquiry data.
class DurableName;

}  // namespace Storage
}  // namespace HostCtl

#endif
