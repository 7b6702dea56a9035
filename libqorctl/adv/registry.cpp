#include "registry.h"

#include <map>
#include <mutex>

#include "adv/option_impl.h"
#include "../host/model.h"

namespace QorCtl {
namespace Adv {

namespace {
struct Registry {
    std::mutex mutex;
    std::map<std::string, HostCtl::Adv::AdvancedOption *> options;
    std::map<std::string, HostCtl::Adv::AdvancedOptionBranch *> branches;
};

// Never destroyed: scripts may hold these objects until the process ends.
Registry &TheRegistry() {
    static Registry *registry = new Registry;
    return *registry;
}
}  // namespace

std::vector<std::string> SplitPath(std::string const &path) {
    std::vector<std::string> parts;
    std::string p = Model::NormalizePath(path);
    for (size_t pos = 1; pos < p.size();) {
        size_t slash = p.find('/', pos);
        if (slash == std::string::npos)
            slash = p.size();
        parts.push_back(p.substr(pos, slash - pos));
        pos = slash + 1;
    }
    return parts;
}

HostCtl::Adv::AdvancedOption *LibraryOption(std::string const &path) {
    Model::OptionState o = Model::GetOption(path);  // throws for an unknown path
    Registry &r = TheRegistry();
    std::lock_guard<std::mutex> lock(r.mutex);
    HostCtl::Adv::AdvancedOption *&slot = r.options[o.path];
    if (!slot) {
        std::vector<std::string> branch = SplitPath(o.branch);
        if (o.isString)
            slot = new AdvancedStringOptionImpl(branch, o.name);
        else
            slot = new AdvancedIntegerOptionImpl(branch, o.name);
    }
    return slot;
}

HostCtl::Adv::AdvancedOptionBranch *LibraryBranch(std::string const &path) {
    Model::BranchState b = Model::GetBranch(path);  // throws for an unknown path
    Registry &r = TheRegistry();
    std::lock_guard<std::mutex> lock(r.mutex);
    HostCtl::Adv::AdvancedOptionBranch *&slot = r.branches[b.path];
    if (!slot) {
        if (b.path == "/") {
            slot = new AdvancedOptionBranchImpl();
        } else {
            std::vector<std::string> parts = SplitPath(b.path);
            std::string name = parts.back();
            parts.pop_back();
            slot = new AdvancedOptionBranchImpl(parts, name);
        }
    }
    return slot;
}

}  // namespace Adv
}  // namespace QorCtl
