#include "hardware/boot.h"

namespace HostCtl {
namespace Hardware {

std::string BootDevice::BootNames[BOOT_DEV_UNK + 1] = {
    "Reserved",
    "Floppy",
    "Hard Disk",
    "CD-ROM",
    "PCMCIA",
    "USB",
    "Embedded Network",
    "ZIP",
    "USB Floppy",
    "USB CD-ROM",
    "BEV",
    "Unknown",
};

BootDevice::BootDevice()
    : deviceIndex(0), priority(0), type(BOOT_DEV_RESERVED), enabled(false)
{
}

std::string BootDevice::GetTypeString() const
{
    // The field is an int on the script side; never index past the table.
    int t = static_cast<int>(type);
    if (t < BOOT_DEV_RESERVED || t > BOOT_DEV_UNK) t = BOOT_DEV_UNK;
    return BootNames[t];
}

}  // namespace Hardware
}  // namespace HostCtl
