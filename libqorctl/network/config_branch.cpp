#include "config_branch.h"

namespace QorCtl {
namespace Config {

bool ConfigBranch::GetValue(std::string const &key, std::string &value) const
{
    auto it = values_.find(key);
    if (it == values_.end()) return false;
    value = it->second;
    return true;
}

void ConfigBranch::SetValue(std::string const &key, std::string const &value) { values_[key] = value; }

ConfigBranchPtr ConfigBranch::GetBranch(std::string const &name, bool create)
{
    auto it = branches_.find(name);
    if (it != branches_.end()) return it->second;
    if (!create) return ConfigBranchPtr();
    ConfigBranchPtr child(new ConfigBranch);
    branches_[name] = child;
    return child;
}

std::vector<std::string> ConfigBranch::GetKeys() const
{
    std::vector<std::string> keys;
    for (auto const &kv : values_) keys.push_back(kv.first);
    return keys;
}

std::vector<std::string> ConfigBranch::GetBranchNames() const
{
    std::vector<std::string> names;
    for (auto const &kv : branches_) names.push_back(kv.first);
    return names;
}

void ConfigBranch::Clear()
{
    values_.clear();
    branches_.clear();
}

} // namespace Config
} // namespace QorCtl
