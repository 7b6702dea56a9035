// The roots of the library's object model.
//
// Every live host object (options and branches, the host, the area roots and
// everything below them) is a HostCtlObject; every implementation object is
// also a QorCtlObject. Both are virtual bases, so a pointer to any of them is
// found through the object's virtual table.
//
// The configuration is host-wide: SaveConfig and LoadConfig on any object
// write or read the configuration of the whole host, in the file named by
// SetConfigFile, else by the environment variable QORCTL_CONFIG, else
// /var/lib/qorctl/host.conf.
#ifndef HOSTCTL_LIB_OBJECT_H
#define HOSTCTL_LIB_OBJECT_H

#include <iosfwd>
#include <string>
#include <vector>

#include <boost/shared_ptr.hpp>

#include "annotate.h"
#include "types.h"

namespace QorCtl {
namespace Util {
class ObjectPrinter;
}
namespace Config {
class ConfigFile;
}
}  // namespace QorCtl

namespace HostCtl {
namespace Lib {

class HostCtlObject {
public:
    virtual ~HostCtlObject();
    // Re-reads the object from the host; throws if it no longer exists.
    HC_THROWS virtual void Refresh() = 0;
    // Writes the host's configuration to the configuration file.
    HC_THROWS virtual void SaveConfig() = 0;
    // Replaces the host's configuration by the one in the configuration
    // file; a file that fails any check is refused and nothing changes.
    HC_THROWS virtual void LoadConfig() = 0;
    // Writes the object as indented "label: value" lines.
    HC_THROWS virtual void Print(std::ostream &out) = 0;
    // The object's name (for options and branches, their path).
    virtual std::string GetName() const = 0;
    // The objects below this one; they belong to the library.
    HC_THROWS virtual std::vector<HostCtl::Lib::HostCtlObject *> GetChildren() = 0;
};

}  // namespace Lib
}  // namespace HostCtl

namespace QorCtl {
namespace Lib {

class QorCtlObject : public virtual HostCtl::Lib::HostCtlObject {
public:
    // Initialises the library once per process: the first successful call
    // loads the configuration file over the built-in defaults if the file
    // exists; later calls do nothing.
    HC_THROWS static void Init();

    HC_THROWS void Refresh() override = 0;
    HC_THROWS void SaveConfig() override;
    HC_THROWS void LoadConfig() override;
    HC_THROWS void Print(std::ostream &out) override;
    std::string GetName() const override = 0;
    HC_THROWS std::vector<HostCtl::Lib::HostCtlObject *> GetChildren() override;
    // Prints under a heading line "label:" (none when label is empty), every
    // line starting with prefix.
    HC_THROWS virtual void Print(std::ostream &out, std::string label, std::string prefix);
    // Prints through printer; a null printer prints to standard output.
    HC_THROWS virtual void Print(QorCtl::Util::ObjectPrinter *printer) = 0;
    // Chooses the configuration file for the whole host; an empty path goes
    // back to QORCTL_CONFIG or the default.
    virtual void SetConfigFile(std::string path);

    void MarkConfigDirty() {}
    bool IsConfigDirty() { return true; }

    // The configuration file in use (shared; see lib/config_file.h).
    static boost::shared_ptr<QorCtl::Config::ConfigFile> GetConfigFile();
};

}  // namespace Lib
}  // namespace QorCtl

#endif
