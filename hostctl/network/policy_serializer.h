// Moving network policies between the configuration tree and the value
// objects. A configuration branch holds one policy: Save replaces the
// branch's contents, Load reads them back.
#ifndef HOSTCTL_NETWORK_POLICY_SERIALIZER_H
#define HOSTCTL_NETWORK_POLICY_SERIALIZER_H

#include <boost/shared_ptr.hpp>

#include "annotate.h"
#include "network/address.h"
#include "network/policy.h"
#include "types.h"

namespace QorCtl {
namespace Config {
class ConfigBranch;
}
}

// A branch of the configuration tree (scripts only hold it).
typedef boost::shared_ptr<QorCtl::Config::ConfigBranch> ConfigBranchPtr;

namespace HostCtl {
namespace Network {
// The routing part of a network stack's configuration (scripts only hold it).
class IpRouting;
}
}

namespace QorCtl {
namespace Network {

// Load returns false, leaving the policy untouched, when the branch holds
// nothing; otherwise the policy is replaced by what the branch holds.
// Both throw HostCtlException for a null branch, a value that does not
// parse or is refused by the policy (the policy is then untouched), and
// Save for a teaming policy outside the known values.
class NetworkPolicySerializer {
public:
    // Names of the teaming policies, indexed by TeamPolicyType.
    static char const *TeamPolicyStr[];

    NetworkPolicySerializer();
    HC_THROWS static bool LoadConfiguration(ConfigBranchPtr branch, HostCtl::Network::IpConfig &policy);
    HC_THROWS static bool LoadConfiguration(ConfigBranchPtr branch, HostCtl::Network::IpRouting &policy);
    HC_THROWS static bool LoadConfiguration(ConfigBranchPtr branch, HostCtl::Network::LinkCriteriaSelectionPolicy &policy);
    HC_THROWS static bool LoadConfiguration(ConfigBranchPtr branch, HostCtl::Network::NicCapabilities &policy);
    HC_THROWS static bool LoadConfiguration(ConfigBranchPtr branch, HostCtl::Network::NicTeamingPolicy &policy);
    HC_THROWS static bool LoadConfiguration(ConfigBranchPtr branch, HostCtl::Network::PortSecurityPolicy &policy);
    HC_THROWS static bool LoadConfiguration(ConfigBranchPtr branch, HostCtl::Network::ShapingPolicy &policy);
    HC_THROWS static void SaveConfiguration(ConfigBranchPtr branch, HostCtl::Network::IpConfig &policy);
    HC_THROWS static void SaveConfiguration(ConfigBranchPtr branch, HostCtl::Network::IpRouting &policy);
    HC_THROWS static void SaveConfiguration(ConfigBranchPtr branch, HostCtl::Network::LinkCriteriaSelectionPolicy &policy);
    HC_THROWS static void SaveConfiguration(ConfigBranchPtr branch, HostCtl::Network::NicCapabilities &policy);
    HC_THROWS static void SaveConfiguration(ConfigBranchPtr branch, HostCtl::Network::NicTeamingPolicy &policy);
    HC_THROWS static void SaveConfiguration(ConfigBranchPtr branch, HostCtl::Network::PortSecurityPolicy &policy);
    HC_THROWS static void SaveConfiguration(ConfigBranchPtr branch, HostCtl::Network::ShapingPolicy &policy);
};

} // namespace Network
} // namespace QorCtl

#endif
