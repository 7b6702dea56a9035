// Hardware records: boot-order entries and their type names, and the PCI
// bus-scan record's address text.
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

#include "hardware/boot.h"
#include "hardware/pci.h"

using HostCtl::Hardware::BootDevice;
using QorCtl::Hardware::SimplePciDevice;

TEST(RecordsBootDevice, NewRecordIsEmptyAndEveryTypeHasItsOwnName)
{
    BootDevice d;
    EXPECT_EQ(0u, d.deviceIndex);
    EXPECT_EQ("", d.description);
    EXPECT_EQ(0u, d.priority);
    EXPECT_EQ(BootDevice::BOOT_DEV_RESERVED, d.type);
    EXPECT_FALSE(d.enabled);

    std::set<std::string> names;
    for (int t = BootDevice::BOOT_DEV_RESERVED; t <= BootDevice::BOOT_DEV_UNK; ++t) {
        d.type = static_cast<BootDevice::BootDeviceType>(t);
        EXPECT_EQ(BootDevice::BootNames[t], d.GetTypeString());
        EXPECT_FALSE(d.GetTypeString().empty());
        names.insert(d.GetTypeString());
    }
    EXPECT_EQ(12u, names.size());
    d.type = BootDevice::BOOT_DEV_HARDDISK;
    EXPECT_EQ("Hard Disk", d.GetTypeString());
}

TEST(RecordsBootDevice, TypeOutsideTheEnumerationReadsAsUnknown)
{
    // Scripts set the type from any int; the name table must not be
    // indexed past either end.
    BootDevice d;
    for (int t : {12, 99, -1, -2147483647 - 1, 2147483647}) {
        d.type = static_cast<BootDevice::BootDeviceType>(t);
        EXPECT_EQ(BootDevice::BootNames[BootDevice::BOOT_DEV_UNK], d.GetTypeString()) << t;
    }
}

TEST(RecordsSimplePciDevice, AddressTextIsZeroPaddedLowerCaseHex)
{
    EXPECT_EQ("0000:00:00.0", SimplePciDevice().GetSBDFString());
    EXPECT_EQ("0000:03:1f.7", SimplePciDevice(0, 3, 0x1f, 7).GetSBDFString());
    EXPECT_EQ("ffff:ff:0a.1", SimplePciDevice(0xffff, 0xff, 0x0a, 1).GetSBDFString());
    SimplePciDevice d(0x12, 0xab, 2, 3);
    EXPECT_EQ(0u, d.vendorId);
    EXPECT_EQ(0u, d.revisionId);
}

TEST(RecordsSimplePciDevice, ParsesFullAndShortFormsAndRoundTrips)
{
    SimplePciDevice d;
    ASSERT_TRUE(d.SetSBDFString("0001:0A:1F.7"));
    EXPECT_EQ(1u, d.seg);
    EXPECT_EQ(0x0au, d.bus);
    EXPECT_EQ(0x1fu, d.slot);
    EXPECT_EQ(7u, d.func);
    ASSERT_TRUE(d.SetSBDFString("3:4.5"));  // no segment: segment 0
    EXPECT_EQ("0000:03:04.5", d.GetSBDFString());
    for (std::string s : {"0000:00:00.0", "abcd:ef:1e.6", "ffff:ff:1f.7"}) {
        SimplePciDevice p;
        ASSERT_TRUE(p.SetSBDFString(s)) << s;
        EXPECT_EQ(s, p.GetSBDFString());
    }
}

TEST(RecordsSimplePciDevice, MalformedOrOutOfRangeTextChangesNothing)
{
    const std::vector<std::string> bad = {
        "", ":", "0:0", "0.0", "00:00:00:00.0", "0000:00:00", "0000:00:00.", "0000:00:.0",
        ":00:00.0", "00000:00:00.0", "0000:000:00.0", "0000:00:000.0", "0000:00:00.00",
        "0000:00:20.0", "0000:00:00.8", "0000:00:00.0 ", " 0000:00:00.0", "0000:0g:00.0",
        "0000:00:00.-1", "+0:00:00.0", "0000:00.00:0", std::string("0000:00:00.1\0", 13),
    };
    SimplePciDevice d(5, 6, 7, 1);
    for (auto const &s : bad) {
        EXPECT_FALSE(d.SetSBDFString(s)) << s;
        EXPECT_EQ("0005:06:07.1", d.GetSBDFString()) << s;
    }
}

TEST(RecordsSimplePciDevice, EqualityAndOrderFollowTheAddressOnly)
{
    SimplePciDevice a(0, 1, 2, 3), b(0, 1, 2, 3);
    b.vendorId = 0x8086;
    EXPECT_TRUE(a == b);
    EXPECT_FALSE(a < b || b < a);
    std::vector<SimplePciDevice> sorted = {SimplePciDevice(0, 1, 2, 3), SimplePciDevice(0, 1, 2, 4),
                                           SimplePciDevice(0, 1, 3, 0), SimplePciDevice(0, 2, 0, 0),
                                           SimplePciDevice(1, 0, 0, 0)};
    for (size_t i = 0; i + 1 < sorted.size(); ++i) {
        EXPECT_TRUE(sorted[i] < sorted[i + 1]) << i;
        EXPECT_FALSE(sorted[i + 1] < sorted[i]) << i;
        EXPECT_FALSE(sorted[i] == sorted[i + 1]) << i;
    }
}
