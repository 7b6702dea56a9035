#include "resource/allocation.h"

#include <cstdint>

#include "lib/exception.h"
#include "lib/vob_message.h"

namespace HostCtl {
namespace Resource {

namespace {

using HostCtl::Lib::HostCtlException;
using HostCtl::Lib::VobMessage;

const uint32 kUnlimited = static_cast<uint32>(ResourceAllocation::RESOURCE_VALUE_UNLIMITED);

uint32 Level(ResourceAllocation::ResourceShares level) { return static_cast<uint32>(level); }

bool SameText(std::string const &a, std::string const &b)
{
    if (a.size() != b.size()) return false;
    for (size_t i = 0; i != a.size(); ++i) {
        char x = a[i], y = b[i];
        if (x >= 'A' && x <= 'Z') x = static_cast<char>(x - 'A' + 'a');
        if (y >= 'A' && y <= 'Z') y = static_cast<char>(y - 'A' + 'a');
        if (x != y) return false;
    }
    return true;
}

// A decimal number that fits uint32: digits only, no sign, no blanks.
bool ParseNumber(std::string const &text, uint32 &out)
{
    if (text.empty()) return false;
    uint64_t v = 0;
    for (char c : text) {
        if (c < '0' || c > '9') return false;
        v = v * 10 + static_cast<uint64_t>(c - '0');
        if (v > UINT32_MAX) return false;
    }
    out = static_cast<uint32>(v);
    return true;
}

[[noreturn]] void BadText(std::string const &what, std::string const &text, std::string const &expected)
{
    throw HostCtlException("Invalid " + what + " \"" + text + "\": expected " + expected,
                           VobMessage("resource.allocation.badText", {what, text}));
}

// A maximum or minimum limit: a number or "unlimited".
uint32 ParseBound(std::string const &what, std::string const &text)
{
    uint32 v = 0;
    if (ParseNumber(text, v)) return v;
    if (SameText(text, ResourceAllocation::RESOURCE_VALUE_UNLIMITED_STR)) return kUnlimited;
    BadText(what, text, "a number or \"" + ResourceAllocation::RESOURCE_VALUE_UNLIMITED_STR + "\"");
}

std::string BoundString(bool set, uint32 value)
{
    if (!set) return std::string();
    return value == kUnlimited ? ResourceAllocation::RESOURCE_VALUE_UNLIMITED_STR : std::to_string(value);
}

const char kNoShares[] = "none";

std::string SharesString(uint32 shares)
{
    if (shares == Level(ResourceAllocation::RESOURCE_SHARES_NONE)) return kNoShares;
    if (shares == Level(ResourceAllocation::RESOURCE_SHARES_LOW)) return ResourceAllocation::RESOURCE_SHARES_LOW_STR;
    if (shares == Level(ResourceAllocation::RESOURCE_SHARES_NORMAL)) return ResourceAllocation::RESOURCE_SHARES_NORMAL_STR;
    if (shares == Level(ResourceAllocation::RESOURCE_SHARES_HIGH)) return ResourceAllocation::RESOURCE_SHARES_HIGH_STR;
    return std::to_string(shares);
}

bool ValidUnit(int units) { return units >= 0 && units < ResourceAllocation::RESOURCE_UNITS_INVALID; }

bool CpuUnit(int units)
{
    return units == ResourceAllocation::RESOURCE_UNITS_PERCENT || units == ResourceAllocation::RESOURCE_UNITS_MHZ ||
           units == ResourceAllocation::RESOURCE_UNITS_BSHARES;
}

bool MemoryUnit(int units)
{
    return ValidUnit(units) && units != ResourceAllocation::RESOURCE_UNITS_MHZ;
}

std::string UnitText(int units)
{
    return ValidUnit(units) ? ResourceAllocation::ResourceUnitStr[units] : std::to_string(units);
}

[[noreturn]] void BadUnit(std::string const &kind, int units)
{
    throw HostCtlException("Units " + UnitText(units) + " are not valid for " + kind,
                           VobMessage("resource.allocation.badUnits", {kind, std::to_string(units)}));
}

}  // namespace

const std::string ResourceAllocation::ResourceUnitStr[RESOURCE_UNITS_INVALID + 1] = {
    "percent", "MHz", "bshares", "MB", "KB", "pages", "bytes", "invalid",
};
const std::string ResourceAllocation::RESOURCE_SHARES_LOW_STR = "low";
const std::string ResourceAllocation::RESOURCE_SHARES_NORMAL_STR = "normal";
const std::string ResourceAllocation::RESOURCE_SHARES_HIGH_STR = "high";
const std::string ResourceAllocation::RESOURCE_VALUE_UNLIMITED_STR = "unlimited";

// ---- ResourceAllocation ----

ResourceAllocation::ResourceAllocation()
    : minimum_(0), maximum_(0), shares_(0), minLimit_(0), units_(RESOURCE_UNITS_PERCENT), set_(0)
{
}

ResourceAllocation::ResourceAllocation(uint32 minimum, uint32 maximum, uint32 shares, uint32 minLimit,
                                       ResourceUnits units)
    : minimum_(minimum), maximum_(maximum), shares_(shares), minLimit_(minLimit), units_(units),
      set_(MINIMUM_SET | MAXIMUM_SET | SHARES_SET | MINLIMIT_SET | UNITS_SET)
{
}

ResourceAllocation::~ResourceAllocation() {}

bool ResourceAllocation::IsValid() const
{
    return CheckIfValid() == RA_OK && (!HasUnits() || ValidUnit(units_));
}

bool ResourceAllocation::IsInitialized() const
{
    const uint8 all = MINIMUM_SET | MAXIMUM_SET | SHARES_SET | UNITS_SET;
    return (set_ & all) == all;
}

ResourceAllocation::ValidityResult ResourceAllocation::CheckIfValid() const
{
    if (set_ == 0) return RA_EMPTY;
    if (set_ == UNITS_SET) return RA_ONLY_UNITS_SET;
    if ((set_ & (MINIMUM_SET | MAXIMUM_SET | MINLIMIT_SET)) && !HasUnits()) return RA_UNITS_NOT_SET;
    if (HasMinimum() && HasMaximum() && maximum_ != kUnlimited && minimum_ > maximum_) return RA_MIN_GT_MAX;
    if (HasMinimum() && HasMinLimit() && minLimit_ != kUnlimited && minLimit_ < minimum_) return RA_MINLIMIT_LT_MIN;
    return RA_OK;
}

std::string ResourceAllocation::GetCheckResultString(ValidityResult result)
{
    switch (result) {
    case RA_OK: return "The allocation is valid";
    case RA_EMPTY: return "No value of the allocation is set";
    case RA_UNITS_NOT_SET: return "A reservation, limit or minimum limit is set without units";
    case RA_ONLY_UNITS_SET: return "Only the units of the allocation are set";
    case RA_MIN_GT_MAX: return "The reservation is above the limit";
    case RA_MINLIMIT_LT_MIN: return "The minimum limit is below the reservation";
    }
    return "unknown validity result";
}

void ResourceAllocation::SetMinimum(uint32 minimum)
{
    minimum_ = minimum;
    set_ |= MINIMUM_SET;
}

std::string ResourceAllocation::GetMaximumString() const { return BoundString(HasMaximum(), maximum_); }

std::string ResourceAllocation::GetSharesString() const
{
    return HasShares() ? SharesString(shares_) : std::string();
}

std::string ResourceAllocation::GetMinLimitString() const { return BoundString(HasMinLimit(), minLimit_); }

std::string ResourceAllocation::GetUnitsString() const
{
    if (!HasUnits()) return std::string();
    return ValidUnit(units_) ? ResourceUnitStr[units_] : ResourceUnitStr[RESOURCE_UNITS_INVALID];
}

void ResourceAllocation::SetMaximum(uint32 maximum)
{
    maximum_ = maximum;
    set_ |= MAXIMUM_SET;
}

void ResourceAllocation::SetMaximum(std::string maximum) { SetMaximum(ParseBound("limit", maximum)); }

void ResourceAllocation::SetMinLimit(uint32 minLimit)
{
    minLimit_ = minLimit;
    set_ |= MINLIMIT_SET;
}

void ResourceAllocation::SetMinLimit(std::string minLimit) { SetMinLimit(ParseBound("minimum limit", minLimit)); }

void ResourceAllocation::SetShares(uint32 shares)
{
    shares_ = shares;
    set_ |= SHARES_SET;
}

void ResourceAllocation::SetShares(std::string shares)
{
    uint32 v = 0;
    if (ParseNumber(shares, v)) return SetShares(v);
    static const struct {
        std::string const *name;
        ResourceShares level;
    } levels[] = {
        {&RESOURCE_SHARES_LOW_STR, RESOURCE_SHARES_LOW},
        {&RESOURCE_SHARES_NORMAL_STR, RESOURCE_SHARES_NORMAL},
        {&RESOURCE_SHARES_HIGH_STR, RESOURCE_SHARES_HIGH},
    };
    for (auto const &l : levels)
        if (SameText(shares, *l.name)) return SetShares(Level(l.level));
    if (SameText(shares, kNoShares)) return SetShares(Level(RESOURCE_SHARES_NONE));
    BadText("shares", shares, "a number, \"low\", \"normal\", \"high\" or \"none\"");
}

void ResourceAllocation::SetUnits(ResourceUnits units)
{
    if (!ValidUnit(units)) BadUnit("an allocation", units);
    units_ = units;
    set_ |= UNITS_SET;
}

void ResourceAllocation::SetUnits(std::string units)
{
    for (int u = 0; u != RESOURCE_UNITS_INVALID; ++u)
        if (SameText(units, ResourceUnitStr[u])) return SetUnits(static_cast<ResourceUnits>(u));
    BadText("units", units, "percent, MHz, bshares, MB, KB, pages or bytes");
}

// ---- CPU and memory allocations ----

CpuResourceAllocation::CpuResourceAllocation() {}

CpuResourceAllocation::CpuResourceAllocation(uint32 minimum, uint32 maximum, uint32 shares, uint32 minLimit,
                                             ResourceUnits units)
    : ResourceAllocation(minimum, maximum, shares, minLimit, units)
{
}

bool CpuResourceAllocation::IsValid() const
{
    return ResourceAllocation::IsValid() && (!HasUnits() || CpuUnit(units_));
}

void CpuResourceAllocation::SetUnits(ResourceUnits units)
{
    if (!CpuUnit(units)) BadUnit("a CPU allocation", units);
    ResourceAllocation::SetUnits(units);
}

MemoryResourceAllocation::MemoryResourceAllocation() {}

MemoryResourceAllocation::MemoryResourceAllocation(uint32 minimum, uint32 maximum, uint32 shares,
                                                   uint32 minLimit, ResourceUnits units)
    : ResourceAllocation(minimum, maximum, shares, minLimit, units)
{
}

bool MemoryResourceAllocation::IsValid() const
{
    return ResourceAllocation::IsValid() && (!HasUnits() || MemoryUnit(units_));
}

void MemoryResourceAllocation::SetUnits(ResourceUnits units)
{
    if (!MemoryUnit(units)) BadUnit("a memory allocation", units);
    ResourceAllocation::SetUnits(units);
}

// ---- disk shares ----

DiskResourceAllocation::DiskResourceAllocation(uint32 shares) : shares_(shares) {}

DiskResourceAllocation::DiskResourceAllocation() : shares_(Level(ResourceAllocation::RESOURCE_SHARES_NORMAL)) {}

uint32 DiskResourceAllocation::GetShares() { return shares_; }

std::string DiskResourceAllocation::GetSharesString() { return SharesString(shares_); }

void DiskResourceAllocation::SetShares(uint32 shares) { shares_ = shares; }

// ---- new group settings ----

ResourceGroupSpec::ResourceGroupSpec() {}

}  // namespace Resource
}  // namespace HostCtl
