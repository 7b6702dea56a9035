// The library's advanced-option objects. Each is a handle on one option or
// branch of the host: any number of handles on the same option see and
// change the same value. Objects returned by branches and FindOption belong
// to the library; objects built with the constructors belong to the caller.
#ifndef HOSTCTL_ADV_OPTION_IMPL_H
#define HOSTCTL_ADV_OPTION_IMPL_H

#include <string>
#include <vector>

#include "adv/option.h"
#include "annotate.h"
#include "lib/object.h"
#include "types.h"

namespace QorCtl {
namespace Adv {

class AdvancedOptionImpl : public virtual HostCtl::Adv::AdvancedOption,
                           public virtual QorCtl::Lib::QorCtlObject {
public:
    HC_THROWS std::string GetOptionName() override;
    HC_THROWS std::string GetOptionPath() override;
    HC_THROWS std::string GetDescription() override;
    HC_THROWS void SetToDefault() override;
    HC_THROWS void Refresh() override;
    // Hidden options are left out of AdvancedOptionBranch::GetOptions().
    HC_THROWS virtual bool IsHidden();
    // The option's path.
    std::string GetName() const override;
    HC_THROWS void Print(QorCtl::Util::ObjectPrinter *printer) override;
    // The library's object for a path such as "/Net/TcpipHeapSize" (the
    // leading '/' may be left out).
    HC_THROWS static HostCtl::Adv::AdvancedOption *FindOption(std::string const &path);

protected:
    // A handle on option name in the branch whose path components are
    // branch; throws HostCtlException if there is no such option.
    AdvancedOptionImpl(std::vector<std::string> const &branch, std::string const &name,
                       int type);
    AdvancedOptionImpl(AdvancedOptionImpl const &other) = default;
    std::string path_;

private:
    std::string name_;
};

class AdvancedIntegerOptionImpl : public virtual HostCtl::Adv::AdvancedIntegerOption,
                                  public virtual QorCtl::Adv::AdvancedOptionImpl {
public:
    // A handle on the integer option name in the branch whose path
    // components are branch ({"Net"}, "TcpipHeapSize").
    AdvancedIntegerOptionImpl(std::vector<std::string> const &branch, std::string const &name);
    AdvancedIntegerOptionImpl(QorCtl::Adv::AdvancedIntegerOptionImpl const &other);

    HC_THROWS uint32 GetDefaultValue() override;
    HC_THROWS uint32 GetMinimum() override;
    HC_THROWS uint32 GetMaximum() override;
    HC_THROWS uint32 GetValue() override;
    HC_THROWS void SetValue(uint32 value) override;
    HC_THROWS void Print(QorCtl::Util::ObjectPrinter *printer) override;
    HC_THROWS bool IsHidden() override;
    HC_THROWS void SetToDefault() override;
    HC_THROWS void Refresh() override;
    std::string GetName() const override;
};

class AdvancedStringOptionImpl : public virtual HostCtl::Adv::AdvancedStringOption,
                                 public virtual QorCtl::Adv::AdvancedOptionImpl {
public:
    AdvancedStringOptionImpl(std::vector<std::string> const &branch, std::string const &name);
    AdvancedStringOptionImpl(QorCtl::Adv::AdvancedStringOptionImpl const &other);

    HC_THROWS std::string GetDefaultValue() override;
    HC_THROWS std::string GetValidCharacters() override;
    HC_THROWS std::string GetValue() override;
    HC_THROWS void SetValue(std::string const &value) override;
    HC_THROWS bool IsHidden() override;
    HC_THROWS void Print(QorCtl::Util::ObjectPrinter *printer) override;
    HC_THROWS void SetToDefault() override;
    HC_THROWS void Refresh() override;
    std::string GetName() const override;
};

class AdvancedOptionBranchImpl : public virtual HostCtl::Adv::AdvancedOptionBranch,
                                 public virtual QorCtl::Lib::QorCtlObject {
public:
    // The root branch.
    AdvancedOptionBranchImpl();
    // The branch name below the branch whose path components are path
    // ({}, "Net" is "/Net"); throws HostCtlException if there is none.
    AdvancedOptionBranchImpl(std::vector<std::string> const &path, std::string const &name);
    AdvancedOptionBranchImpl(QorCtl::Adv::AdvancedOptionBranchImpl const &other);

    HC_THROWS std::string GetBranchName() override;
    HC_THROWS std::vector<HostCtl::Adv::AdvancedOption *> GetOptions() override;
    HC_THROWS HostCtl::Adv::AdvancedOption *GetOptionByName(std::string const &name) override;
    HC_THROWS std::vector<HostCtl::Adv::AdvancedOptionBranch *> GetBranches() override;
    HC_THROWS HostCtl::Adv::AdvancedOptionBranch *GetBranchByName(std::string const &name) override;
    // The branch's options; hidden ones too when includeHidden is set.
    HC_THROWS virtual std::vector<HostCtl::Adv::AdvancedOption *> GetOptions(bool includeHidden);
    // The branch with its options and, recursively, its sub-branches.
    HC_THROWS void Print(QorCtl::Util::ObjectPrinter *printer) override;
    HC_THROWS void Refresh() override;
    // The branch's path, "/Net" ("/" for the root).
    std::string GetName() const override;

protected:
    // Sub-branches, then every option (hidden ones included).
    std::vector<HostCtl::Lib::HostCtlObject *> GetChildren() override;

private:
    std::string path_;
};

}  // namespace Adv
}  // namespace QorCtl

// Run-time checked downcasts from an option to its implementation: null for
// a null argument or an option of the other kind.
QorCtl::Adv::AdvancedIntegerOptionImpl *CastAdvInt(HostCtl::Adv::AdvancedOption *option);
QorCtl::Adv::AdvancedStringOptionImpl *CastAdvString(HostCtl::Adv::AdvancedOption *option);

#endif
