// Resource records: allocations (set marks, validity, text forms, units per
// resource kind), disk shares and the settings of a new group.
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "lib/exception.h"
#include "resource/allocation.h"

using namespace HostCtl::Resource;
using HostCtl::Lib::HostCtlException;

namespace {

typedef ResourceAllocation RA;

const uint32 kUnlimited = 4294967295u;

// Everything an allocation holds, to show that a refused call changed
// nothing.
std::string State(ResourceAllocation const &a)
{
    return std::to_string(a.GetMinimum()) + "/" + std::to_string(a.GetMaximum()) + "/" +
           std::to_string(a.GetShares()) + "/" + std::to_string(a.GetMinLimit()) + "/" +
           std::to_string(a.GetUnits()) + "/" + std::to_string(a.HasMinimum()) + std::to_string(a.HasMaximum()) +
           std::to_string(a.HasShares()) + std::to_string(a.HasMinLimit()) + std::to_string(a.HasUnits());
}

// Units by name: that overload belongs to the base class (the CPU and
// memory allocations redeclare only the numeric one, as scripts see them).
void SetUnitsText(ResourceAllocation &a, std::string const &units) { a.SetUnits(units); }

}  // namespace

TEST(RecordsResourceAllocation, MarksAreIndependentOfTheValues)
{
    CpuResourceAllocation a;
    EXPECT_EQ("0/0/0/0/0/00000", State(a));
    EXPECT_EQ(RA::RA_EMPTY, a.CheckIfValid());
    EXPECT_FALSE(a.IsValid());
    EXPECT_FALSE(a.IsInitialized());
    EXPECT_EQ("", a.GetMaximumString());
    EXPECT_EQ("", a.GetSharesString());
    EXPECT_EQ("", a.GetUnitsString());

    a.SetMaximum(0u);  // zero, but set
    EXPECT_TRUE(a.HasMaximum());
    EXPECT_FALSE(a.HasMinimum());
    EXPECT_EQ("0", a.GetMaximumString());

    MemoryResourceAllocation full(10, 20, 30, 40, RA::RESOURCE_UNITS_MB);
    EXPECT_EQ("10/20/30/40/3/11111", State(full));
    EXPECT_TRUE(full.IsInitialized());
    EXPECT_TRUE(full.IsValid());
}

TEST(RecordsResourceAllocation, ValidityIsCheckedInOrder)
{
    MemoryResourceAllocation a;
    a.SetUnits(RA::RESOURCE_UNITS_MB);
    EXPECT_EQ(RA::RA_ONLY_UNITS_SET, a.CheckIfValid());

    MemoryResourceAllocation noUnits;
    noUnits.SetShares(100u);
    EXPECT_EQ(RA::RA_OK, noUnits.CheckIfValid());  // shares need no units
    noUnits.SetMinimum(5);
    EXPECT_EQ(RA::RA_UNITS_NOT_SET, noUnits.CheckIfValid());
    EXPECT_FALSE(noUnits.IsValid());

    a.SetMinimum(100);
    a.SetMaximum(50u);
    EXPECT_EQ(RA::RA_MIN_GT_MAX, a.CheckIfValid());
    a.SetMaximum(kUnlimited);  // no upper bound
    EXPECT_EQ(RA::RA_OK, a.CheckIfValid());
    a.SetMinLimit(99u);
    EXPECT_EQ(RA::RA_MINLIMIT_LT_MIN, a.CheckIfValid());
    a.SetMinLimit(100u);
    EXPECT_EQ(RA::RA_OK, a.CheckIfValid());
    a.SetMinLimit(std::string("unlimited"));
    EXPECT_EQ(RA::RA_OK, a.CheckIfValid());
    EXPECT_FALSE(a.IsInitialized());  // no shares yet
    a.SetShares(std::string("normal"));
    EXPECT_TRUE(a.IsInitialized());
    EXPECT_TRUE(a.IsValid());
}

TEST(RecordsResourceAllocation, CheckResultTextsAreDistinct)
{
    std::vector<std::string> seen;
    for (int r = RA::RA_OK; r <= RA::RA_MINLIMIT_LT_MIN; ++r) {
        std::string text = RA::GetCheckResultString(static_cast<RA::ValidityResult>(r));
        EXPECT_FALSE(text.empty());
        for (auto const &s : seen) EXPECT_NE(s, text);
        seen.push_back(text);
    }
    EXPECT_EQ("unknown validity result", RA::GetCheckResultString(static_cast<RA::ValidityResult>(6)));
    EXPECT_EQ("unknown validity result", RA::GetCheckResultString(static_cast<RA::ValidityResult>(-1)));
}

TEST(RecordsResourceAllocation, TextFormsRoundTrip)
{
    CpuResourceAllocation a;
    a.SetShares(std::string("LOW"));
    EXPECT_EQ(static_cast<uint32>(RA::RESOURCE_SHARES_LOW), a.GetShares());
    EXPECT_EQ("low", a.GetSharesString());
    for (std::string s : {"normal", "high", "none", "0", "2000", "4294967291"}) {
        CpuResourceAllocation b;
        b.SetShares(s);
        EXPECT_EQ(s, b.GetSharesString());
    }
    a.SetShares(4294967294u);  // the low level as a number
    EXPECT_EQ("low", a.GetSharesString());

    a.SetMaximum(std::string("Unlimited"));
    EXPECT_EQ(kUnlimited, a.GetMaximum());
    EXPECT_EQ("unlimited", a.GetMaximumString());
    a.SetMaximum(std::string("0042"));
    EXPECT_EQ(42u, a.GetMaximum());
    EXPECT_EQ("42", a.GetMaximumString());
    a.SetMinLimit(std::string("4294967295"));
    EXPECT_EQ("unlimited", a.GetMinLimitString());

    SetUnitsText(a, "mhz");
    EXPECT_EQ(RA::RESOURCE_UNITS_MHZ, a.GetUnits());
    EXPECT_EQ("MHz", a.GetUnitsString());
    MemoryResourceAllocation m;
    for (int u = RA::RESOURCE_UNITS_PERCENT; u < RA::RESOURCE_UNITS_INVALID; ++u) {
        if (u == RA::RESOURCE_UNITS_MHZ) continue;
        SetUnitsText(m, RA::ResourceUnitStr[u]);
        EXPECT_EQ(u, m.GetUnits());
        EXPECT_EQ(RA::ResourceUnitStr[u], m.GetUnitsString());
    }
}

TEST(RecordsResourceAllocation, RefusedTextChangesNothing)
{
    CpuResourceAllocation a(1, 2, 3, 4, RA::RESOURCE_UNITS_MHZ);
    const std::string before = State(a);
    std::vector<std::function<void()>> calls = {
        [&] { a.SetMaximum(std::string("")); },
        [&] { a.SetMaximum(std::string("-1")); },
        [&] { a.SetMaximum(std::string("4294967296")); },
        [&] { a.SetMaximum(std::string(" 5")); },
        [&] { a.SetMaximum(std::string("5 ")); },
        [&] { a.SetMaximum(std::string("+5")); },
        [&] { a.SetMaximum(std::string("0x10")); },
        [&] { a.SetMaximum(std::string("low")); },
        [&] { a.SetMaximum(std::string("5\0", 2)); },
        [&] { a.SetMinLimit(std::string("infinite")); },
        [&] { a.SetShares(std::string("unlimited")); },
        [&] { a.SetShares(std::string("medium")); },
        [&] { a.SetShares(std::string("99999999999")); },
        [&] { a.SetShares(std::string("")); },
        [&] { SetUnitsText(a, "invalid"); },
        [&] { SetUnitsText(a, "GB"); },
        [&] { SetUnitsText(a, ""); },
        [&] { SetUnitsText(a, "MB"); },  // a memory unit
        [&] { a.SetUnits(RA::RESOURCE_UNITS_PAGES); },
        [&] { a.SetUnits(RA::RESOURCE_UNITS_INVALID); },
        [&] { a.SetUnits(static_cast<RA::ResourceUnits>(-3)); },
    };
    for (size_t i = 0; i != calls.size(); ++i) {
        EXPECT_THROW(calls[i](), HostCtlException) << i;
        EXPECT_EQ(before, State(a)) << i;
    }
    MemoryResourceAllocation m;
    EXPECT_THROW(m.SetUnits(RA::RESOURCE_UNITS_MHZ), HostCtlException);
    EXPECT_THROW(SetUnitsText(m, "MHz"), HostCtlException);
    EXPECT_FALSE(m.HasUnits());
    // Through the base class the kind's own rule applies.
    ResourceAllocation &base = m;
    EXPECT_THROW(base.SetUnits(RA::RESOURCE_UNITS_MHZ), HostCtlException);
    EXPECT_FALSE(m.HasUnits());
    base.SetUnits(RA::RESOURCE_UNITS_KB);
    EXPECT_EQ("KB", m.GetUnitsString());
}

TEST(RecordsResourceAllocation, UnitsOfTheWrongKindMakeAnAllocationInvalid)
{
    // The value constructors store what they are given; IsValid judges it.
    CpuResourceAllocation cpuInMb(0, 100, 10, 0, RA::RESOURCE_UNITS_MB);
    EXPECT_EQ(RA::RA_OK, cpuInMb.CheckIfValid());
    EXPECT_FALSE(cpuInMb.IsValid());
    MemoryResourceAllocation memInMhz(0, 100, 10, 0, RA::RESOURCE_UNITS_MHZ);
    EXPECT_FALSE(memInMhz.IsValid());
    MemoryResourceAllocation bogus(0, 100, 10, 0, static_cast<RA::ResourceUnits>(42));
    EXPECT_FALSE(bogus.IsValid());
    EXPECT_EQ("invalid", bogus.GetUnitsString());
    CpuResourceAllocation pct(0, 100, 10, 0, RA::RESOURCE_UNITS_PERCENT);
    EXPECT_TRUE(pct.IsValid());
}

TEST(RecordsResourceAllocation, DiskSharesDefaultToNormal)
{
    DiskResourceAllocation d;
    EXPECT_EQ(static_cast<uint32>(RA::RESOURCE_SHARES_NORMAL), d.GetShares());
    EXPECT_EQ("normal", d.GetSharesString());
    d.SetShares(static_cast<uint32>(RA::RESOURCE_SHARES_HIGH));
    EXPECT_EQ("high", d.GetSharesString());
    DiskResourceAllocation e(750);
    EXPECT_EQ("750", e.GetSharesString());
}

TEST(RecordsResourceGroupSpec, HoldsCopiesOfItsAllocations)
{
    ResourceGroupSpec group;
    EXPECT_EQ("", group.name);
    EXPECT_EQ(RA::RA_EMPTY, group.cpu.CheckIfValid());
    EXPECT_EQ(RA::RA_EMPTY, group.memory.CheckIfValid());

    CpuResourceAllocation cpu(100, 200, 0, 100, RA::RESOURCE_UNITS_MHZ);
    group.cpu = cpu;
    cpu.SetMaximum(1u);
    EXPECT_EQ(200u, group.cpu.GetMaximum());
    // The embedded allocation keeps its own kind's rules.
    EXPECT_THROW(group.cpu.SetUnits(RA::RESOURCE_UNITS_MB), HostCtlException);
    SetUnitsText(group.memory, "MB");
    EXPECT_TRUE(group.memory.HasUnits());

    ResourceGroupSpec copy = group;
    group.memory.SetMaximum(7u);
    EXPECT_FALSE(copy.memory.HasMaximum());
    EXPECT_EQ(200u, copy.cpu.GetMaximum());
}
