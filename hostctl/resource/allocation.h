// Resource allocations: the reservation (minimum), limit (maximum), shares
// and minimum limit of a group's CPU or memory, with the unit they are
// counted in, and the settings of a new resource group.
//
// Every attribute of an allocation is optional: a setter stores the value
// and marks it set, Has<X>() tests the mark, Get<X>() returns the stored
// value (0 when never set). The negative constants are stored as their
// uint32 equivalents: RESOURCE_VALUE_UNLIMITED (4294967295) for a maximum
// or minimum limit without bound, the share levels RESOURCE_SHARES_NONE,
// _LOW, _NORMAL, _HIGH (4294967295 down to 4294967292) for shares. The
// string setters take what the string getters give: a decimal number,
// "unlimited" (maximum, minimum limit), "none", "low", "normal", "high"
// (shares), a unit name from ResourceUnitStr (units); case does not matter,
// blanks do not belong. Text that is none of these throws HostCtlException
// and changes nothing.
#ifndef HOSTCTL_RESOURCE_ALLOCATION_H
#define HOSTCTL_RESOURCE_ALLOCATION_H

#include <string>

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Resource {

class ResourceAllocation {
public:
    enum ResourceUnits : int {
        RESOURCE_UNITS_PERCENT = 0,
        RESOURCE_UNITS_MHZ = 1,
        RESOURCE_UNITS_BSHARES = 2,
        RESOURCE_UNITS_MB = 3,
        RESOURCE_UNITS_KB = 4,
        RESOURCE_UNITS_PAGES = 5,
        RESOURCE_UNITS_BYTES = 6,
        RESOURCE_UNITS_INVALID = 7
    };
    // Share levels, stored in the shares field as their uint32 equivalents.
    enum ResourceShares : int {
        RESOURCE_SHARES_NONE = -1,
        RESOURCE_SHARES_LOW = -2,
        RESOURCE_SHARES_NORMAL = -3,
        RESOURCE_SHARES_HIGH = -4
    };
    // A maximum or minimum limit without bound (stored as 4294967295).
    enum ResourceValue : int {
        RESOURCE_VALUE_UNLIMITED = -1
    };
    // What CheckIfValid finds, in the order it checks.
    enum ValidityResult : int {
        RA_OK = 0,
        RA_EMPTY = 1,
        RA_UNITS_NOT_SET = 2,
        RA_ONLY_UNITS_SET = 3,
        RA_MIN_GT_MAX = 4,
        RA_MINLIMIT_LT_MIN = 5
    };

    // Unit names, indexed by ResourceUnits (RESOURCE_UNITS_INVALID + 1).
    static const std::string ResourceUnitStr[];
    static const std::string RESOURCE_SHARES_LOW_STR;
    static const std::string RESOURCE_SHARES_NORMAL_STR;
    static const std::string RESOURCE_SHARES_HIGH_STR;
    static const std::string RESOURCE_VALUE_UNLIMITED_STR;

    virtual ~ResourceAllocation();
    // CheckIfValid() is RA_OK.
    virtual bool IsValid() const;
    // Minimum, maximum, shares and units are all set (the minimum limit is
    // optional): a complete allocation as the host reports one.
    virtual bool IsInitialized() const;
    // RA_EMPTY: nothing set; RA_ONLY_UNITS_SET: units and nothing else;
    // RA_UNITS_NOT_SET: a minimum, maximum or minimum limit without units;
    // RA_MIN_GT_MAX: a bounded maximum below the minimum; RA_MINLIMIT_LT_MIN:
    // a bounded minimum limit below the minimum; else RA_OK.
    virtual HostCtl::Resource::ResourceAllocation::ValidityResult CheckIfValid() const;
    // One line of text per result; "unknown validity result" for others.
    static std::string GetCheckResultString(HostCtl::Resource::ResourceAllocation::ValidityResult result);

    uint32 GetMinimum() const { return minimum_; }
    bool HasMinimum() const { return (set_ & MINIMUM_SET) != 0; }
    void SetMinimum(uint32 minimum);
    uint32 GetMaximum() const { return maximum_; }
    bool HasMaximum() const { return (set_ & MAXIMUM_SET) != 0; }
    // "unlimited" or the number; "" when not set.
    std::string GetMaximumString() const;
    uint32 GetShares() const { return shares_; }
    bool HasShares() const { return (set_ & SHARES_SET) != 0; }
    // "low", "normal", "high", "none" or the number; "" when not set.
    std::string GetSharesString() const;
    uint32 GetMinLimit() const { return minLimit_; }
    bool HasMinLimit() const { return (set_ & MINLIMIT_SET) != 0; }
    // "unlimited" or the number; "" when not set.
    std::string GetMinLimitString() const;
    HostCtl::Resource::ResourceAllocation::ResourceUnits GetUnits() const { return units_; }
    bool HasUnits() const { return (set_ & UNITS_SET) != 0; }
    // The unit's name from ResourceUnitStr; "" when not set.
    std::string GetUnitsString() const;
    void SetMaximum(uint32 maximum);
    void SetMaximum(std::string maximum);
    void SetMinLimit(uint32 minLimit);
    void SetMinLimit(std::string minLimit);
    void SetShares(uint32 shares);
    void SetShares(std::string shares);
    // Throws HostCtlException for RESOURCE_UNITS_INVALID and values outside
    // ResourceUnits; the CPU and memory allocations accept fewer units.
    virtual void SetUnits(HostCtl::Resource::ResourceAllocation::ResourceUnits units);
    // The unit by name; set through SetUnits(ResourceUnits).
    void SetUnits(std::string units);

protected:
    ResourceAllocation();
    ResourceAllocation(uint32 minimum, uint32 maximum, uint32 shares, uint32 minLimit,
                       HostCtl::Resource::ResourceAllocation::ResourceUnits units);
    ResourceAllocation(ResourceAllocation const &other) = default;
    ResourceAllocation &operator=(ResourceAllocation const &other) = default;

    enum SetBits : int {
        MINIMUM_SET = 1,
        MAXIMUM_SET = 2,
        SHARES_SET = 4,
        MINLIMIT_SET = 8,
        UNITS_SET = 16
    };

    uint32 minimum_;
    uint32 maximum_;
    uint32 shares_;
    uint32 minLimit_;
    HostCtl::Resource::ResourceAllocation::ResourceUnits units_;
    uint8 set_;
};

// A CPU allocation: units percent, MHz or basic shares. (SetUnits by name
// is reached through the ResourceAllocation base; it checks the same.)
class CpuResourceAllocation : public HostCtl::Resource::ResourceAllocation {
public:
    CpuResourceAllocation();
    // Every value given is marked set.
    CpuResourceAllocation(uint32 minimum, uint32 maximum, uint32 shares, uint32 minLimit,
                          HostCtl::Resource::ResourceAllocation::ResourceUnits units);
    // Valid as an allocation, and the units (when set) are CPU units.
    bool IsValid() const override;
    // Throws HostCtlException for a unit that is not a CPU unit.
    HC_THROWS void SetUnits(HostCtl::Resource::ResourceAllocation::ResourceUnits units) override;
};

// A memory allocation: units percent, basic shares, MB, KB, pages or bytes.
// (SetUnits by name is reached through the ResourceAllocation base.)
class MemoryResourceAllocation : public HostCtl::Resource::ResourceAllocation {
public:
    MemoryResourceAllocation();
    // Every value given is marked set.
    MemoryResourceAllocation(uint32 minimum, uint32 maximum, uint32 shares, uint32 minLimit,
                             HostCtl::Resource::ResourceAllocation::ResourceUnits units);
    // Valid as an allocation, and the units (when set) are memory units.
    bool IsValid() const override;
    // Throws HostCtlException for a unit that is not a memory unit.
    HC_THROWS void SetUnits(HostCtl::Resource::ResourceAllocation::ResourceUnits units) override;
};

// The disk bandwidth shares of a virtual machine on one disk. A new one
// has normal shares.
class DiskResourceAllocation {
public:
    DiskResourceAllocation(uint32 shares);
    DiskResourceAllocation();
    uint32 GetShares();
    // As ResourceAllocation::GetSharesString.
    std::string GetSharesString();
    void SetShares(uint32 shares);

private:
    uint32 shares_;
};

// The settings of a new resource group: its name and its CPU and
// memory allocations (nothing set in either when new).
class ResourceGroupSpec {
public:
    ResourceGroupSpec();

    std::string name;
    HostCtl::Resource::CpuResourceAllocation cpu;
    HostCtl::Resource::MemoryResourceAllocation memory;
};

}  // namespace Resource
}  // namespace HostCtl

#endif
