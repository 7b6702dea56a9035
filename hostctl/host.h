// The host: the entry to the whole object graph.
//
//     HostCtl::Host *host = HostCtl::HostFactory::GetHost();
//     host->GetAdvancedOptions()->GetBranchByName("Net")->GetOptions();
//
// The host object and every object reached from it belong to the library.
#ifndef HOSTCTL_HOST_H
#define HOSTCTL_HOST_H

#include <string>

#include "adv/option.h"
#include "annotate.h"
#include "hardware/info.h"
#include "lib/object.h"
#include "network/info.h"
#include "resource/info.h"
#include "storage/info.h"
#include "system/info.h"
#include "types.h"

// Areas that scripts can hold but not look into.
namespace HostCtl {
namespace Security {
class QorAccessInfo;
class SecurityInfo;
}  // namespace Security
namespace Drivers {
class DeviceInfo;
}
namespace Melvar {
class MelvarInfo;
}
namespace Orlume {
class OrlumeInfo;
}
namespace Graphics {
class GraphicsInfo;
}
}  // namespace HostCtl

namespace HostCtl {

class Host;

class HostFactory {
public:
    // The host this process controls (owned by the library).
    HC_THROWS static HostCtl::Host *GetHost();
};

class Host : public virtual HostCtl::Lib::HostCtlObject {
public:
    HC_THROWS virtual HostCtl::Hardware::HardwareInfo *GetHardwareInfo() = 0;
    HC_THROWS virtual HostCtl::Resource::ResourceInfo *GetResourceInfo() = 0;
    HC_THROWS virtual HostCtl::Storage::StorageInfo *GetStorageInfo() = 0;
    HC_THROWS virtual HostCtl::Network::NetworkInfo *GetNetworkInfo() = 0;
    // The root branch of the advanced-option tree.
    HC_THROWS virtual HostCtl::Adv::AdvancedOptionBranch *GetAdvancedOptions() = 0;
    HC_THROWS virtual HostCtl::Security::QorAccessInfo *GetQorAccessInfo() = 0;
    HC_THROWS virtual HostCtl::Security::SecurityInfo *GetSecurityInfo() = 0;
    HC_THROWS virtual HostCtl::System::SystemInfo *GetSystemInfo() = 0;
    HC_THROWS virtual HostCtl::Drivers::DeviceInfo *GetDeviceInfo() = 0;
    HC_THROWS virtual HostCtl::Melvar::MelvarInfo *GetMelvarInfo() = 0;
    HC_THROWS virtual HostCtl::Orlume::OrlumeInfo *GetOrlumeInfo() = 0;
    HC_THROWS virtual HostCtl::Graphics::GraphicsInfo *GetGraphicsInfo() = 0;
};

}  // namespace HostCtl

namespace QorCtl {

// A handle on the host: every HostImpl sees the same host, and its getters
// return the same library-owned area roots as the factory's host.
class HostImpl : public virtual HostCtl::Host, public virtual QorCtl::Lib::QorCtlObject {
public:
    HostImpl();
    HostImpl(QorCtl::HostImpl const &other);

    HC_THROWS HostCtl::Hardware::HardwareInfo *GetHardwareInfo() override;
    HC_THROWS HostCtl::Resource::ResourceInfo *GetResourceInfo() override;
    HC_THROWS HostCtl::Storage::StorageInfo *GetStorageInfo() override;
    HC_THROWS HostCtl::Network::NetworkInfo *GetNetworkInfo() override;
    HC_THROWS HostCtl::Adv::AdvancedOptionBranch *GetAdvancedOptions() override;
    HC_THROWS HostCtl::Security::QorAccessInfo *GetQorAccessInfo() override;
    HC_THROWS HostCtl::Security::SecurityInfo *GetSecurityInfo() override;
    HC_THROWS HostCtl::System::SystemInfo *GetSystemInfo() override;
    HC_THROWS HostCtl::Drivers::DeviceInfo *GetDeviceInfo() override;
    HC_THROWS HostCtl::Melvar::MelvarInfo *GetMelvarInfo() override;
    HC_THROWS HostCtl::Orlume::OrlumeInfo *GetOrlumeInfo() override;
    HC_THROWS HostCtl::Graphics::GraphicsInfo *GetGraphicsInfo() override;
    HC_THROWS void Refresh() override;
    HC_THROWS void LoadConfig() override;
    HC_THROWS void Print(QorCtl::Util::ObjectPrinter *printer) override;
    // The host name.
    std::string GetName() const override;

protected:
    // The area roots, in the order of the getters.
    std::vector<HostCtl::Lib::HostCtlObject *> GetChildren() override;
};

}  // namespace QorCtl

#endif
