#include "area_roots.h"

#include "../adv/registry.h"
#include "model.h"
#include "lib/config_file.h"
#include "util/object_printer.h"

// Anchors the storage root's virtual table in the library.
HostCtl::Storage::StorageInfo::~StorageInfo() {}

namespace QorCtl {
namespace Area {

namespace {

// An area root: knows its name and what the area covers, and prints both.
template <class Area>
class AreaRoot : public virtual Area, public virtual QorCtl::Lib::QorCtlObject {
public:
    AreaRoot(char const *name, char const *covers) : name_(name), covers_(covers) {}
    // The area keeps no state apart from the host model, so there is
    // nothing to re-read; Refresh only checks that the host answers.
    void Refresh() override { Model::HostName(); }
    std::string GetName() const override { return name_; }
    void Print(Util::ObjectPrinter *printer) override {
        Util::ObjectPrinter fallback;
        Util::ObjectPrinter &p = printer ? *printer : fallback;
        p.Begin("Area " + name_);
        p.Field("Host", Model::HostName());
        p.Field("Covers", covers_);
        p.End();
    }

private:
    std::string name_, covers_;
};

template <class Area>
AreaRoot<Area> *Make(char const *name, char const *covers, std::vector<HostCtl::Lib::HostCtlObject *> &all) {
    AreaRoot<Area> *root = new AreaRoot<Area>(name, covers);
    all.push_back(root);
    return root;
}

}  // namespace

AreaRoots const &Roots() {
    static AreaRoots *roots = [] {
        AreaRoots *r = new AreaRoots;
        auto &all = r->all;
        r->hardware = Make<HostCtl::Hardware::HardwareInfo>(
            "hardware", "processors, memory, NUMA nodes and PCI devices", all);
        r->resource = Make<HostCtl::Resource::ResourceInfo>(
            "resources", "resource groups, virtual machines and host statistics", all);
        r->storage = Make<HostCtl::Storage::StorageInfo>(
            "storage", "adapters, logical units, paths, partitions and file systems", all);
        r->network = Make<HostCtl::Network::NetworkInfo>(
            "network", "virtual switches, NICs, routing and DNS", all);
        all.push_back(Adv::LibraryBranch("/"));
        r->qorAccess = Make<HostCtl::Security::QorAccessInfo>("access", "access control", all);
        r->security = Make<HostCtl::Security::SecurityInfo>("security", "security settings", all);
        r->system = Make<HostCtl::System::SystemInfo>(
            "system", "boot, time, logging, kernel options and modules", all);
        r->device = Make<HostCtl::Drivers::DeviceInfo>("devices", "device drivers", all);
        r->melvar = Make<HostCtl::Melvar::MelvarInfo>("melvar", "the virtual-SAN area", all);
        r->orlume = Make<HostCtl::Orlume::OrlumeInfo>("orlume", "the flash-cache area", all);
        r->graphics = Make<HostCtl::Graphics::GraphicsInfo>("graphics", "graphics devices", all);
        return r;
    }();
    return *roots;
}

}  // namespace Area
}  // namespace QorCtl
