#include "adv/option_impl.h"

#include "registry.h"
#include "../host/model.h"
#include "lib/exception.h"
#include "util/object_printer.h"

using HostCtl::Lib::HostCtlException;
using HostCtl::Lib::VobMessage;

namespace HostCtl {
namespace Adv {

int AdvancedIntegerOption::GetType() const {
    return ADV_OPTION_INT_TYPE;
}

int AdvancedStringOption::GetType() const {
    return ADV_OPTION_STRING_TYPE;
}

}  // namespace Adv
}  // namespace HostCtl

namespace QorCtl {
namespace Adv {

namespace {

void PrintOption(Util::ObjectPrinter *printer, std::string const &path) {
    Model::OptionState o = Model::GetOption(path);
    Util::ObjectPrinter fallback;
    Util::ObjectPrinter &p = printer ? *printer : fallback;
    p.Begin("Option " + o.path);
    p.Field("Type", o.isString ? "string" : "integer");
    p.Field("Value", o.ValueText());
    if (o.isString) {
        p.Field("Default", Model::Quote(o.strDefault));
        p.Field("Valid characters", Model::Quote(o.validChars));
    } else {
        p.Field("Default", o.intDefault);
        p.Field("Minimum", o.intMin);
        p.Field("Maximum", o.intMax);
    }
    p.Field("Hidden", o.hidden);
    p.Field("Description", o.description);
    p.End();
}

// A name within one branch: not empty and without '/'.
bool IsPlainName(std::string const &name) {
    return !name.empty() && name.find('/') == std::string::npos;
}

}  // namespace

// ---- AdvancedOptionImpl ----

AdvancedOptionImpl::AdvancedOptionImpl(std::vector<std::string> const &branch,
                                       std::string const &name, int type) {
    Model::OptionState o = Model::GetOption(Model::JoinPath(branch, name));
    int actual = o.isString ? ADV_OPTION_STRING_TYPE : ADV_OPTION_INT_TYPE;
    if (actual != type)
        throw HostCtlException("Option " + o.path + " is " +
                                   (o.isString ? "a string option, not an integer option"
                                               : "an integer option, not a string option"),
                               VobMessage("adv.option.type", {o.path}));
    path_ = o.path;
    name_ = o.name;
}

std::string AdvancedOptionImpl::GetOptionName() {
    return name_;
}

std::string AdvancedOptionImpl::GetOptionPath() {
    return path_;
}

std::string AdvancedOptionImpl::GetDescription() {
    return Model::GetOption(path_).description;
}

void AdvancedOptionImpl::SetToDefault() {
    Model::SetToDefault(path_);
}

void AdvancedOptionImpl::Refresh() {
    Model::GetOption(path_);  // throws if the option is gone
}

bool AdvancedOptionImpl::IsHidden() {
    return Model::GetOption(path_).hidden;
}

std::string AdvancedOptionImpl::GetName() const {
    return path_;
}

void AdvancedOptionImpl::Print(Util::ObjectPrinter *printer) {
    PrintOption(printer, path_);
}

HostCtl::Adv::AdvancedOption *AdvancedOptionImpl::FindOption(std::string const &path) {
    return LibraryOption(path);
}

// ---- AdvancedIntegerOptionImpl ----

AdvancedIntegerOptionImpl::AdvancedIntegerOptionImpl(std::vector<std::string> const &branch,
                                                     std::string const &name)
    : AdvancedOptionImpl(branch, name, ADV_OPTION_INT_TYPE) {}

AdvancedIntegerOptionImpl::AdvancedIntegerOptionImpl(AdvancedIntegerOptionImpl const &other) =
    default;

uint32 AdvancedIntegerOptionImpl::GetDefaultValue() {
    return Model::GetOption(path_).intDefault;
}

uint32 AdvancedIntegerOptionImpl::GetMinimum() {
    return Model::GetOption(path_).intMin;
}

uint32 AdvancedIntegerOptionImpl::GetMaximum() {
    return Model::GetOption(path_).intMax;
}

uint32 AdvancedIntegerOptionImpl::GetValue() {
    return Model::GetOption(path_).intValue;
}

void AdvancedIntegerOptionImpl::SetValue(uint32 value) {
    Model::SetIntValue(path_, value);
}

void AdvancedIntegerOptionImpl::Print(Util::ObjectPrinter *printer) {
    PrintOption(printer, path_);
}

bool AdvancedIntegerOptionImpl::IsHidden() {
    return AdvancedOptionImpl::IsHidden();
}

void AdvancedIntegerOptionImpl::SetToDefault() {
    AdvancedOptionImpl::SetToDefault();
}

void AdvancedIntegerOptionImpl::Refresh() {
    AdvancedOptionImpl::Refresh();
}

std::string AdvancedIntegerOptionImpl::GetName() const {
    return AdvancedOptionImpl::GetName();
}

// ---- AdvancedStringOptionImpl ----

AdvancedStringOptionImpl::AdvancedStringOptionImpl(std::vector<std::string> const &branch,
                                                   std::string const &name)
    : AdvancedOptionImpl(branch, name, ADV_OPTION_STRING_TYPE) {}

AdvancedStringOptionImpl::AdvancedStringOptionImpl(AdvancedStringOptionImpl const &other) =
    default;

std::string AdvancedStringOptionImpl::GetDefaultValue() {
    return Model::GetOption(path_).strDefault;
}

std::string AdvancedStringOptionImpl::GetValidCharacters() {
    return Model::GetOption(path_).validChars;
}

std::string AdvancedStringOptionImpl::GetValue() {
    return Model::GetOption(path_).strValue;
}

void AdvancedStringOptionImpl::SetValue(std::string const &value) {
    Model::SetStringValue(path_, value);
}

bool AdvancedStringOptionImpl::IsHidden() {
    return AdvancedOptionImpl::IsHidden();
}

void AdvancedStringOptionImpl::Print(Util::ObjectPrinter *printer) {
    PrintOption(printer, path_);
}

void AdvancedStringOptionImpl::SetToDefault() {
    AdvancedOptionImpl::SetToDefault();
}

void AdvancedStringOptionImpl::Refresh() {
    AdvancedOptionImpl::Refresh();
}

std::string AdvancedStringOptionImpl::GetName() const {
    return AdvancedOptionImpl::GetName();
}

// ---- AdvancedOptionBranchImpl ----

AdvancedOptionBranchImpl::AdvancedOptionBranchImpl() : path_("/") {}

AdvancedOptionBranchImpl::AdvancedOptionBranchImpl(std::vector<std::string> const &path,
                                                   std::string const &name)
    : path_(Model::GetBranch(Model::JoinPath(path, name)).path) {}

AdvancedOptionBranchImpl::AdvancedOptionBranchImpl(AdvancedOptionBranchImpl const &other) =
    default;

std::string AdvancedOptionBranchImpl::GetBranchName() {
    return Model::GetBranch(path_).name;
}

std::vector<HostCtl::Adv::AdvancedOption *> AdvancedOptionBranchImpl::GetOptions() {
    return GetOptions(false);
}

std::vector<HostCtl::Adv::AdvancedOption *> AdvancedOptionBranchImpl::GetOptions(
    bool includeHidden) {
    std::vector<HostCtl::Adv::AdvancedOption *> result;
    for (std::string const &p : Model::GetBranch(path_).options)
        if (includeHidden || !Model::GetOption(p).hidden)
            result.push_back(LibraryOption(p));
    return result;
}

HostCtl::Adv::AdvancedOption *AdvancedOptionBranchImpl::GetOptionByName(std::string const &name) {
    std::string path = Model::JoinPath(SplitPath(path_), name);
    if (!IsPlainName(name) || !Model::HasOption(path))
        throw HostCtlException("No advanced option " + Model::Quote(name) + " in branch " + path_,
                               VobMessage("adv.option.unknown", {path_, name}));
    return LibraryOption(path);
}

std::vector<HostCtl::Adv::AdvancedOptionBranch *> AdvancedOptionBranchImpl::GetBranches() {
    std::vector<HostCtl::Adv::AdvancedOptionBranch *> result;
    for (std::string const &p : Model::GetBranch(path_).branches)
        result.push_back(LibraryBranch(p));
    return result;
}

HostCtl::Adv::AdvancedOptionBranch *AdvancedOptionBranchImpl::GetBranchByName(
    std::string const &name) {
    std::string path = Model::JoinPath(SplitPath(path_), name);
    if (!IsPlainName(name) || !Model::HasBranch(path))
        throw HostCtlException("No advanced option branch " + Model::Quote(name) + " in branch " +
                                   path_,
                               VobMessage("adv.branch.unknown", {path_, name}));
    return LibraryBranch(path);
}

void AdvancedOptionBranchImpl::Print(Util::ObjectPrinter *printer) {
    Util::ObjectPrinter fallback;
    Util::ObjectPrinter &p = printer ? *printer : fallback;
    Model::BranchState b = Model::GetBranch(path_);
    p.Begin("Branch " + b.path);
    for (std::string const &path : b.options) {
        Model::OptionState o = Model::GetOption(path);
        p.Field(o.name, o.ValueText() + (o.hidden ? " (hidden)" : ""));
    }
    for (std::string const &path : b.branches)
        AdvancedOptionBranchImpl(SplitPath(path), "").Print(&p);
    p.End();
}

void AdvancedOptionBranchImpl::Refresh() {
    Model::GetBranch(path_);  // throws if the branch is gone
}

std::string AdvancedOptionBranchImpl::GetName() const {
    return path_;
}

std::vector<HostCtl::Lib::HostCtlObject *> AdvancedOptionBranchImpl::GetChildren() {
    std::vector<HostCtl::Lib::HostCtlObject *> children;
    for (HostCtl::Adv::AdvancedOptionBranch *b : GetBranches())
        children.push_back(b);
    for (HostCtl::Adv::AdvancedOption *o : GetOptions(true))
        children.push_back(o);
    return children;
}

}  // namespace Adv
}  // namespace QorCtl
