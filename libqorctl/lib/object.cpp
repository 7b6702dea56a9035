#include "lib/object.h"

#include <iostream>
#include <mutex>
#include <sys/stat.h>

#include <boost/make_shared.hpp>

#include "lib/config_file.h"
#include "util/object_printer.h"

namespace HostCtl {
namespace Lib {

HostCtlObject::~HostCtlObject() {}

}  // namespace Lib
}  // namespace HostCtl

namespace QorCtl {
namespace Lib {

namespace {
std::mutex configMutex;
std::string configOverride;                          // from SetConfigFile
boost::shared_ptr<Config::ConfigFile> configCurrent;  // the handle last handed out
bool initialised = false;
}  // namespace

void QorCtlObject::Init() {
    std::lock_guard<std::mutex> lock(configMutex);
    if (initialised)
        return;
    std::string path = configOverride.empty() ? Config::ConfigFile::DefaultPath() : configOverride;
    struct stat st;
    if (::stat(path.c_str(), &st) == 0)
        Config::ConfigFile(path).Load();
    initialised = true;
}

boost::shared_ptr<Config::ConfigFile> QorCtlObject::GetConfigFile() {
    std::lock_guard<std::mutex> lock(configMutex);
    std::string path = configOverride.empty() ? Config::ConfigFile::DefaultPath() : configOverride;
    if (!configCurrent || configCurrent->GetPath() != path)
        configCurrent = boost::make_shared<Config::ConfigFile>(path);
    return configCurrent;
}

void QorCtlObject::SetConfigFile(std::string path) {
    std::lock_guard<std::mutex> lock(configMutex);
    configOverride = path;
}

void QorCtlObject::SaveConfig() {
    GetConfigFile()->Save();
}

void QorCtlObject::LoadConfig() {
    GetConfigFile()->Load();
}

void QorCtlObject::Print(std::ostream &out) {
    Util::ObjectPrinter printer(out);
    Print(&printer);
}

void QorCtlObject::Print(std::ostream &out, std::string label, std::string prefix) {
    Util::ObjectPrinter printer(out, prefix);
    if (!label.empty())
        printer.Begin(label);
    Print(&printer);
    if (!label.empty())
        printer.End();
}

std::vector<HostCtl::Lib::HostCtlObject *> QorCtlObject::GetChildren() {
    return {};
}

}  // namespace Lib
}  // namespace QorCtl
