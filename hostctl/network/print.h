// Printing of network records through an ObjectPrinter: a heading line
// "label:" and one "name: value" line per attribute below it. Optional
// attributes that are not set print as "not set". A null printer prints to
// standard output.
#ifndef HOSTCTL_NETWORK_PRINT_H
#define HOSTCTL_NETWORK_PRINT_H

#include <string>

#include "annotate.h"
#include "network/address.h"
#include "network/policy.h"
#include "types.h"

namespace QorCtl {
namespace Util {
class ObjectPrinter;
}

namespace Network {

void Network_Print(QorCtl::Util::ObjectPrinter *printer, std::string label,
                   HostCtl::Network::LinkCriteriaSelectionPolicy const &policy);
void Network_Print(QorCtl::Util::ObjectPrinter *printer, std::string label,
                   HostCtl::Network::NicCapabilities const &capabilities);
void Network_Print(QorCtl::Util::ObjectPrinter *printer, std::string label,
                   HostCtl::Network::NicTeamingPolicy const &policy);
void Network_Print(QorCtl::Util::ObjectPrinter *printer, std::string label,
                   HostCtl::Network::PortSecurityPolicy const &policy);
void Network_Print(QorCtl::Util::ObjectPrinter *printer, std::string label,
                   HostCtl::Network::ShapingPolicy const &policy);
void Network_Print(QorCtl::Util::ObjectPrinter *printer, std::string label,
                   HostCtl::Network::IpConfig const &config);

}  // namespace Network
}  // namespace QorCtl

#endif
