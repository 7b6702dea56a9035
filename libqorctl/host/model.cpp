#include "model.h"

#include <cstdio>
#include <map>
#include <mutex>

#include "lib/exception.h"

namespace QorCtl {
namespace Model {

using HostCtl::Lib::HostCtlException;
using HostCtl::Lib::VobMessage;

namespace {

struct HostModel {
    std::string hostName;
    std::map<std::string, OptionState> options;
    std::map<std::string, BranchState> branches;
    std::mutex mutex;
};

std::string ParentOf(std::string const &path) {
    size_t slash = path.rfind('/');
    return slash == 0 ? "/" : path.substr(0, slash);
}

std::string LeafOf(std::string const &path) {
    return path == "/" ? std::string() : path.substr(path.rfind('/') + 1);
}

// Makes the branch at path and its ancestors known, in order of mention.
void AddBranch(HostModel &m, std::string const &path) {
    if (m.branches.count(path))
        return;
    BranchState &b = m.branches[path];
    b.path = path;
    b.name = LeafOf(path);
    if (path != "/") {
        std::string parent = ParentOf(path);
        AddBranch(m, parent);
        m.branches[parent].branches.push_back(path);
    }
}

void Seed(HostModel &m) {
    m.hostName = kDefaultHostName;
    AddBranch(m, "/");
    for (unsigned i = 0; i < kDefaultHostSize; ++i) {
        DefaultEntry const &e = kDefaultHost[i];
        if (e.kind == 'b') {
            AddBranch(m, e.path);
            continue;
        }
        OptionState o;
        o.path = e.path;
        o.branch = ParentOf(o.path);
        o.name = LeafOf(o.path);
        o.isString = e.kind == 's';
        o.intDefault = o.intValue = e.intDefault;
        o.intMin = e.intMin;
        o.intMax = e.intMax;
        o.strDefault = o.strValue = e.strDefault;
        o.validChars = e.validChars;
        o.hidden = e.hidden;
        o.description = e.description;
        AddBranch(m, o.branch);
        m.branches[o.branch].options.push_back(o.path);
        m.options[o.path] = o;
    }
}

HostModel &TheModel() {
    // Never destroyed: library-owned objects may be used until the very end.
    static HostModel *model = [] {
        HostModel *m = new HostModel;
        Seed(*m);
        return m;
    }();
    return *model;
}

[[noreturn]] void NoOption(std::string const &path) {
    throw HostCtlException("No advanced option " + path + " on this host",
                           VobMessage("adv.option.unknown", {path}));
}

OptionState &Find(HostModel &m, std::string const &path) {
    auto it = m.options.find(NormalizePath(path));
    if (it == m.options.end())
        NoOption(NormalizePath(path));
    return it->second;
}

[[noreturn]] void Refuse(std::string const &reason, std::string const &path) {
    throw HostCtlException(reason, VobMessage("adv.option.refused", {path}));
}

}  // namespace

bool OptionState::IsDefault() const {
    return isString ? strValue == strDefault : intValue == intDefault;
}

std::string OptionState::ValueText() const {
    return isString ? Quote(strValue) : std::to_string(intValue);
}

std::string HostName() {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    return m.hostName;
}

bool HasOption(std::string const &path) {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    return m.options.count(NormalizePath(path)) != 0;
}

bool HasBranch(std::string const &path) {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    return m.branches.count(NormalizePath(path)) != 0;
}

OptionState GetOption(std::string const &path) {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    return Find(m, path);
}

BranchState GetBranch(std::string const &path) {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    auto it = m.branches.find(NormalizePath(path));
    if (it == m.branches.end())
        throw HostCtlException("No advanced option branch " + NormalizePath(path) + " on this host",
                               VobMessage("adv.branch.unknown", {NormalizePath(path)}));
    return it->second;
}

std::vector<OptionState> AllOptions() {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    std::vector<OptionState> all;
    for (auto const &kv : m.options)
        all.push_back(kv.second);
    return all;
}

std::string CheckInt(OptionState const &o, uint32 value) {
    if (o.isString)
        return "Option " + o.path + " is a string option, not an integer option";
    if (value < o.intMin || value > o.intMax)
        return "Value " + std::to_string(value) + " for option " + o.path + " is out of range [" +
               std::to_string(o.intMin) + ", " + std::to_string(o.intMax) + "]";
    return std::string();
}

std::string CheckString(OptionState const &o, std::string const &value) {
    if (!o.isString)
        return "Option " + o.path + " is an integer option, not a string option";
    if (value.size() > kMaxStringValue)
        return "Value for option " + o.path + " is too long (" + std::to_string(value.size()) +
               " characters, at most " + std::to_string(kMaxStringValue) + ")";
    for (size_t i = 0; i < value.size(); ++i) {
        if (o.validChars.find(value[i]) == std::string::npos) {
            std::string shown = value.size() > 60 ? value.substr(0, 57) + "..." : value;
            return "Value " + Quote(shown) + " for option " + o.path + " contains " +
                   Quote(value.substr(i, 1)) + " at position " + std::to_string(i) +
                   ", which is not a valid character; valid characters are " +
                   Quote(o.validChars);
        }
    }
    return std::string();
}

void SetIntValue(std::string const &path, uint32 value) {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    OptionState &o = Find(m, path);
    std::string why = CheckInt(o, value);
    if (!why.empty())
        Refuse(why, o.path);
    o.intValue = value;
}

void SetStringValue(std::string const &path, std::string const &value) {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    OptionState &o = Find(m, path);
    std::string why = CheckString(o, value);
    if (!why.empty())
        Refuse(why, o.path);
    o.strValue = value;
}

void SetToDefault(std::string const &path) {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    OptionState &o = Find(m, path);
    o.intValue = o.intDefault;
    o.strValue = o.strDefault;
}

void ReplaceSettings(std::vector<Setting> const &settings) {
    HostModel &m = TheModel();
    std::lock_guard<std::mutex> lock(m.mutex);
    std::map<std::string, Setting const *> wanted;
    for (Setting const &s : settings) {
        OptionState &o = Find(m, s.path);
        std::string why = s.isString ? CheckString(o, s.strValue) : CheckInt(o, s.intValue);
        if (!why.empty())
            Refuse(why, o.path);
        if (!wanted.emplace(o.path, &s).second)
            Refuse("Option " + o.path + " is given twice", o.path);
    }
    for (auto &kv : m.options) {
        OptionState &o = kv.second;
        auto it = wanted.find(o.path);
        o.intValue = it == wanted.end() || o.isString ? o.intDefault : it->second->intValue;
        o.strValue = it == wanted.end() || !o.isString ? o.strDefault : it->second->strValue;
    }
}

void ResetToDefault() {
    ReplaceSettings({});
}

std::string JoinPath(std::vector<std::string> const &branch, std::string const &name) {
    std::string path;
    for (std::string const &c : branch)
        path += "/" + c;
    if (!name.empty())
        path += "/" + name;
    return path.empty() ? "/" : path;
}

std::string NormalizePath(std::string const &path) {
    std::string p = path.empty() || path[0] != '/' ? "/" + path : path;
    while (p.size() > 1 && p.back() == '/')
        p.pop_back();
    return p;
}

std::string Quote(std::string const &text) {
    std::string q = "\"";
    for (unsigned char c : text) {
        if (c == '"' || c == '\\') {
            q += '\\';
            q += char(c);
        } else if (c < 0x20 || c >= 0x7f) {
            char buf[8];
            std::snprintf(buf, sizeof buf, "\\x%02x", c);
            q += buf;
        } else {
            q += char(c);
        }
    }
    return q + "\"";
}

}  // namespace Model
}  // namespace QorCtl
