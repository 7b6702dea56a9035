#include "host.h"

#include "../adv/registry.h"
#include "area_roots.h"
#include "model.h"
#include "lib/config_file.h"
#include "util/object_printer.h"

namespace HostCtl {

Host *HostFactory::GetHost() {
    static QorCtl::HostImpl *host = new QorCtl::HostImpl;  // owned by the library
    return host;
}

}  // namespace HostCtl

namespace QorCtl {

HostImpl::HostImpl() {}

HostImpl::HostImpl(HostImpl const &) = default;

HostCtl::Hardware::HardwareInfo *HostImpl::GetHardwareInfo() { return Area::Roots().hardware; }
HostCtl::Resource::ResourceInfo *HostImpl::GetResourceInfo() { return Area::Roots().resource; }
HostCtl::Storage::StorageInfo *HostImpl::GetStorageInfo() { return Area::Roots().storage; }
HostCtl::Network::NetworkInfo *HostImpl::GetNetworkInfo() { return Area::Roots().network; }
HostCtl::Adv::AdvancedOptionBranch *HostImpl::GetAdvancedOptions() { return Adv::LibraryBranch("/"); }
HostCtl::Security::QorAccessInfo *HostImpl::GetQorAccessInfo() { return Area::Roots().qorAccess; }
HostCtl::Security::SecurityInfo *HostImpl::GetSecurityInfo() { return Area::Roots().security; }
HostCtl::System::SystemInfo *HostImpl::GetSystemInfo() { return Area::Roots().system; }
HostCtl::Drivers::DeviceInfo *HostImpl::GetDeviceInfo() { return Area::Roots().device; }
HostCtl::Melvar::MelvarInfo *HostImpl::GetMelvarInfo() { return Area::Roots().melvar; }
HostCtl::Orlume::OrlumeInfo *HostImpl::GetOrlumeInfo() { return Area::Roots().orlume; }
HostCtl::Graphics::GraphicsInfo *HostImpl::GetGraphicsInfo() { return Area::Roots().graphics; }

void HostImpl::Refresh() {
    for (HostCtl::Lib::HostCtlObject *area : Area::Roots().all)
        area->Refresh();
}

void HostImpl::LoadConfig() {
    Lib::QorCtlObject::LoadConfig();
}

void HostImpl::Print(Util::ObjectPrinter *printer) {
    Util::ObjectPrinter fallback;
    Util::ObjectPrinter &p = printer ? *printer : fallback;
    std::vector<Model::OptionState> options = Model::AllOptions();
    unsigned changed = 0;
    for (Model::OptionState const &o : options)
        changed += !o.IsDefault();
    std::string areas;
    for (HostCtl::Lib::HostCtlObject *area : Area::Roots().all)
        areas += (areas.empty() ? "" : ", ") +
                 (area == GetAdvancedOptions() ? "advanced options" : area->GetName());
    p.Begin("Host " + Model::HostName());
    p.Field("Configuration file", GetConfigFile()->GetPath());
    p.Field("Advanced options",
            std::to_string(options.size()) + " (" + std::to_string(changed) + " changed)");
    p.Field("Areas", areas);
    p.End();
}

std::string HostImpl::GetName() const {
    return Model::HostName();
}

std::vector<HostCtl::Lib::HostCtlObject *> HostImpl::GetChildren() {
    return Area::Roots().all;
}

}  // namespace QorCtl
