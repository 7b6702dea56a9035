// The firmware boot order: one BootDevice record per boot entry, as
// HardwareInfo::GetBootDevices hands them out (copies, in boot order).
#ifndef HOSTCTL_HARDWARE_BOOT_H
#define HOSTCTL_HARDWARE_BOOT_H

#include <string>

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Hardware {

// One entry of the firmware boot order. A new record is all zero: index 0,
// no description, priority 0, type BOOT_DEV_RESERVED, disabled.
class BootDevice {
public:
    // The firmware's device classes.
    enum BootDeviceType : int {
        BOOT_DEV_RESERVED = 0,
        BOOT_DEV_FLOPPY = 1,
        BOOT_DEV_HARDDISK = 2,
        BOOT_DEV_CDROM = 3,
        BOOT_DEV_PCMCIA = 4,
        BOOT_DEV_USB = 5,
        BOOT_DEV_EMBNET = 6,
        BOOT_DEV_ZIP = 7,
        BOOT_DEV_USB_FLOPPY = 8,
        BOOT_DEV_USB_CDROM = 9,
        BOOT_DEV_BEV = 10,
        BOOT_DEV_UNK = 11
    };

    // Display names, indexed by BootDeviceType (BOOT_DEV_UNK + 1 of them).
    static std::string BootNames[];

    BootDevice();
    // The display name of the record's type; a type outside BootDeviceType
    // (scripts set the field from any int) reads as BOOT_DEV_UNK's name.
    std::string GetTypeString() const;

    uint32 deviceIndex;
    std::string description;
    uint32 priority;
    BootDeviceType type;
    bool enabled;
};

}  // namespace Hardware
}  // namespace HostCtl

#endif
