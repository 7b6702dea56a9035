// PCI: the PCI view of the hardware area, its devices, and the plain
// records of a bus scan. The hardware bindings define PciInfo and
// PciDevice here.
#ifndef HOSTCTL_HARDWARE_PCI_H
#define HOSTCTL_HARDWARE_PCI_H

#include <string>

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Hardware {

// One PCI function of the host.
class PciDevice;

}  // namespace Hardware
}  // namespace HostCtl

namespace QorCtl {
namespace Hardware {

// A PCI function as a bus scan reports it: its address (segment, bus,
// slot, function) and its identity from configuration space. Scripts only
// hold these records (as SimplePciDeviceVector elements); the class has no
// Python-side methods or fields. A new record is all zero.
class QC_HIDDEN SimplePciDevice {
public:
    SimplePciDevice();
    SimplePciDevice(uint16 seg, uint8 bus, uint8 slot, uint8 func);

    // The address as "ssss:bb:dd.f", lower-case hex: "0000:03:1f.7".
    std::string GetSBDFString() const;
    // Reads "ssss:bb:dd.f" or "bb:dd.f" (segment 0): hex fields of at most
    // 4, 2, 2 and 1 digits, either case, slot at most 0x1f, function at
    // most 7, nothing else (no blanks). Sets the address and returns true;
    // returns false and leaves the record unchanged otherwise.
    bool SetSBDFString(std::string const &text);
    // Same address.
    bool operator==(SimplePciDevice const &other) const;
    // Address order: segment, bus, slot, function.
    bool operator<(SimplePciDevice const &other) const;

    uint16 seg;
    uint8 bus;
    uint8 slot;
    uint8 func;
    uint16 vendorId;
    uint16 deviceId;
    uint16 subVendorId;
    uint16 subDeviceId;
    uint8 baseClass;
    uint8 subClass;
    uint8 progIF;
    uint8 revisionId;
};

}  // namespace Hardware
}  // namespace QorCtl

#endif
