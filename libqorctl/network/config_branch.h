// A node of the library's configuration tree: named text values and named
// child branches. Network policies are kept in branches of their own
// (see NetworkPolicySerializer).
#ifndef LIBQORCTL_NETWORK_CONFIG_BRANCH_H
#define LIBQORCTL_NETWORK_CONFIG_BRANCH_H

#include <map>
#include <string>
#include <vector>

#include "network/policy_serializer.h"

namespace QorCtl {
namespace Config {

class ConfigBranch {
public:
    // No values and no child branches.
    bool IsEmpty() const { return values_.empty() && branches_.empty(); }
    bool GetValue(std::string const &key, std::string &value) const;
    void SetValue(std::string const &key, std::string const &value);
    bool HasBranch(std::string const &name) const { return branches_.count(name) != 0; }
    // The child branch; when it is missing, a new empty one if create is
    // set, else a null pointer.
    ConfigBranchPtr GetBranch(std::string const &name, bool create);
    std::vector<std::string> GetKeys() const;
    std::vector<std::string> GetBranchNames() const;
    void Clear();

private:
    std::map<std::string, std::string> values_;
    std::map<std::string, ConfigBranchPtr> branches_;
};

} // namespace Config
} // namespace QorCtl

#endif
