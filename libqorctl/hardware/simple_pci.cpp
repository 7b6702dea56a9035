#include "hardware/pci.h"

#include <cstdio>
#include <tuple>

namespace QorCtl {
namespace Hardware {

namespace {

int HexDigit(char c)
{
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    return -1;
}

// A hex field of 1..maxDigits digits from text[pos], up to the next stop
// character (or the end when stop is 0). Advances pos past the field.
bool HexField(std::string const &text, size_t &pos, size_t maxDigits, char stop, unsigned &out)
{
    unsigned v = 0;
    size_t n = 0;
    while (pos < text.size() && text[pos] != stop) {
        int d = HexDigit(text[pos]);
        if (d < 0 || ++n > maxDigits) return false;
        v = v * 16 + static_cast<unsigned>(d);
        ++pos;
    }
    if (n == 0) return false;
    out = v;
    return true;
}

}  // namespace

SimplePciDevice::SimplePciDevice() : SimplePciDevice(0, 0, 0, 0) {}

SimplePciDevice::SimplePciDevice(uint16 seg_, uint8 bus_, uint8 slot_, uint8 func_)
    : seg(seg_), bus(bus_), slot(slot_), func(func_), vendorId(0), deviceId(0), subVendorId(0),
      subDeviceId(0), baseClass(0), subClass(0), progIF(0), revisionId(0)
{
}

std::string SimplePciDevice::GetSBDFString() const
{
    char buf[32];
    std::snprintf(buf, sizeof buf, "%04x:%02x:%02x.%x", unsigned(seg), unsigned(bus), unsigned(slot),
                  unsigned(func));
    return buf;
}

bool SimplePciDevice::SetSBDFString(std::string const &text)
{
    // Two colons: segment, bus, slot; one colon: bus, slot (segment 0).
    size_t colons = 0;
    for (char c : text) colons += c == ':';
    if (colons != 1 && colons != 2) return false;
    size_t pos = 0;
    unsigned s = 0, b = 0, d = 0, f = 0;
    if (colons == 2) {
        if (!HexField(text, pos, 4, ':', s)) return false;
        ++pos;
    }
    if (!HexField(text, pos, 2, ':', b)) return false;
    ++pos;
    if (!HexField(text, pos, 2, '.', d) || pos == text.size()) return false;
    ++pos;
    if (!HexField(text, pos, 1, '\0', f) || pos != text.size()) return false;
    if (d > 0x1f || f > 7) return false;
    seg = static_cast<uint16>(s);
    bus = static_cast<uint8>(b);
    slot = static_cast<uint8>(d);
    func = static_cast<uint8>(f);
    return true;
}

bool SimplePciDevice::operator==(SimplePciDevice const &other) const
{
    return seg == other.seg && bus == other.bus && slot == other.slot && func == other.func;
}

bool SimplePciDevice::operator<(SimplePciDevice const &other) const
{
    return std::tie(seg, bus, slot, func) < std::tie(other.seg, other.bus, other.slot, other.func);
}

}  // namespace Hardware
}  // namespace QorCtl
