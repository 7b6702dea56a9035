// Advanced options: the host's tree of named tuning settings.
//
// Branches hold options and further branches. An option is either an integer
// option (a uint32 value with a default, a minimum and a maximum) or a string
// option (a text value with a default and a set of valid characters). An
// option's path is its branch path and name, "/Net/TcpipHeapSize"; the root
// branch is "/". Setting a value outside the range or with a character
// outside the valid ones throws HostCtlException and changes nothing.
#ifndef HOSTCTL_ADV_OPTION_H
#define HOSTCTL_ADV_OPTION_H

#include <string>
#include <vector>

#include "annotate.h"
#include "lib/object.h"
#include "types.h"

namespace HostCtl {
namespace Adv {

class AdvancedOption : public virtual HostCtl::Lib::HostCtlObject {
public:
    // Values of GetType().
    enum {
        ADV_OPTION_INT_TYPE = 0,
        ADV_OPTION_STRING_TYPE = 1
    };

    // The option's name within its branch, "TcpipHeapSize".
    HC_THROWS virtual std::string GetOptionName() = 0;
    // The option's full path, "/Net/TcpipHeapSize".
    HC_THROWS virtual std::string GetOptionPath() = 0;
    virtual int GetType() const = 0;
    HC_THROWS virtual std::string GetDescription() = 0;
    HC_THROWS virtual void SetToDefault() = 0;
};

class AdvancedIntegerOption : public virtual HostCtl::Adv::AdvancedOption {
public:
    int GetType() const override;
    HC_THROWS virtual uint32 GetDefaultValue() = 0;
    HC_THROWS virtual uint32 GetMinimum() = 0;
    HC_THROWS virtual uint32 GetMaximum() = 0;
    HC_THROWS virtual uint32 GetValue() = 0;
    // Accepts GetMinimum() <= value <= GetMaximum().
    HC_THROWS virtual void SetValue(uint32 value) = 0;
};

class AdvancedStringOption : public virtual HostCtl::Adv::AdvancedOption {
public:
    int GetType() const override;
    HC_THROWS virtual std::string GetDefaultValue() = 0;
    // Every character a value may contain.
    HC_THROWS virtual std::string GetValidCharacters() = 0;
    HC_THROWS virtual std::string GetValue() = 0;
    // Accepts values of at most 1024 valid characters.
    HC_THROWS virtual void SetValue(std::string const &value) = 0;
};

class AdvancedOptionBranch : public virtual HostCtl::Lib::HostCtlObject {
public:
    // The branch's name within its parent, "Net" ("" for the root).
    HC_THROWS virtual std::string GetBranchName() = 0;
    // The branch's options that are not hidden, in the host's order.
    HC_THROWS virtual std::vector<HostCtl::Adv::AdvancedOption *> GetOptions() = 0;
    // Any option of this branch, hidden or not.
    HC_THROWS virtual HostCtl::Adv::AdvancedOption *GetOptionByName(std::string const &name) = 0;
    HC_THROWS virtual std::vector<HostCtl::Adv::AdvancedOptionBranch *> GetBranches() = 0;
    HC_THROWS virtual HostCtl::Adv::AdvancedOptionBranch *GetBranchByName(std::string const &name) = 0;
};

}  // namespace Adv
}  // namespace HostCtl

#endif
