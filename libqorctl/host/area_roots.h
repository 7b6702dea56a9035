// The roots of the host's areas. The hardware, resource, storage, network
// and system roots gain their methods with their own bindings; the access,
// security, device, virtual-SAN, flash-cache and graphics roots are opaque
// to scripts and defined only here.
#ifndef LIBQORCTL_HOST_AREA_ROOTS_H
#define LIBQORCTL_HOST_AREA_ROOTS_H

#include <string>
#include <vector>

#include "host.h"
#include "lib/object.h"

namespace HostCtl {
namespace Security {
class QorAccessInfo : public virtual HostCtl::Lib::HostCtlObject {};
class SecurityInfo : public virtual HostCtl::Lib::HostCtlObject {};
}  // namespace Security
namespace Drivers {
class DeviceInfo : public virtual HostCtl::Lib::HostCtlObject {};
}
namespace Melvar {
class MelvarInfo : public virtual HostCtl::Lib::HostCtlObject {};
}
namespace Orlume {
class OrlumeInfo : public virtual HostCtl::Lib::HostCtlObject {};
}
namespace Graphics {
class GraphicsInfo : public virtual HostCtl::Lib::HostCtlObject {};
}
}  // namespace HostCtl

namespace QorCtl {
namespace Area {

struct AreaRoots {
    HostCtl::Hardware::HardwareInfo *hardware;
    HostCtl::Resource::ResourceInfo *resource;
    HostCtl::Storage::StorageInfo *storage;
    HostCtl::Network::NetworkInfo *network;
    HostCtl::Security::QorAccessInfo *qorAccess;
    HostCtl::Security::SecurityInfo *security;
    HostCtl::System::SystemInfo *system;
    HostCtl::Drivers::DeviceInfo *device;
    HostCtl::Melvar::MelvarInfo *melvar;
    HostCtl::Orlume::OrlumeInfo *orlume;
    HostCtl::Graphics::GraphicsInfo *graphics;
    // The same objects in the order of the host's getters, with the
    // advanced-option root in its place.
    std::vector<HostCtl::Lib::HostCtlObject *> all;
};

// Made on first use, kept for the life of the process.
AreaRoots const &Roots();

}  // namespace Area
}  // namespace QorCtl

#endif
