// The simulated host: one in-process model, seeded from the built-in default
// host. Every library object is a handle that reads and changes it through
// these functions, which are safe to call from several threads.
#ifndef LIBQORCTL_HOST_MODEL_H
#define LIBQORCTL_HOST_MODEL_H

#include <string>
#include <vector>

#include "types.h"

namespace QorCtl {
namespace Model {

struct OptionState {
    std::string path;    // "/Net/TcpipHeapSize"
    std::string branch;  // "/Net"
    std::string name;    // "TcpipHeapSize"
    bool isString = false;
    uint32 intDefault = 0, intMin = 0, intMax = 0, intValue = 0;
    std::string strDefault, validChars, strValue;
    bool hidden = false;
    std::string description;

    bool IsDefault() const;
    // The value as text: the number, or the string in double quotes.
    std::string ValueText() const;
};

struct BranchState {
    std::string path;  // "/Net/Tcpip", "/" for the root
    std::string name;  // "Tcpip", "" for the root
    std::vector<std::string> branches;  // paths of the sub-branches, in order
    std::vector<std::string> options;   // paths of the options, in order
};

// One entry of the built-in default host (host/default_host.cpp).
struct DefaultEntry {
    char kind;  // 'i' integer option, 's' string option, 'b' branch
    char const *path;
    uint32 intDefault, intMin, intMax;
    char const *strDefault;
    char const *validChars;
    bool hidden;
    char const *description;
};
extern char const *const kDefaultHostName;
extern DefaultEntry const kDefaultHost[];
extern unsigned const kDefaultHostSize;

// Longest string value an option accepts.
constexpr size_t kMaxStringValue = 1024;

std::string HostName();

// Lookups; the unknown ones throw HostCtlException.
bool HasOption(std::string const &path);
bool HasBranch(std::string const &path);
OptionState GetOption(std::string const &path);
BranchState GetBranch(std::string const &path);
std::vector<OptionState> AllOptions();

// Changes; a refused value throws HostCtlException and changes nothing.
void SetIntValue(std::string const &path, uint32 value);
void SetStringValue(std::string const &path, std::string const &value);
void SetToDefault(std::string const &path);

// "" when value is acceptable for option, else why not (a sentence).
std::string CheckInt(OptionState const &option, uint32 value);
std::string CheckString(OptionState const &option, std::string const &value);

// A whole configuration: listed options get their value, all others their
// default. Every entry is checked before anything changes.
struct Setting {
    std::string path;
    bool isString = false;
    uint32 intValue = 0;
    std::string strValue;
};
void ReplaceSettings(std::vector<Setting> const &settings);

// Puts every option back to its built-in default (for tests).
void ResetToDefault();

// "/Net" + "X" -> "/Net/X"; components {"Net","Tcpip"} -> "/Net/Tcpip".
std::string JoinPath(std::vector<std::string> const &branch, std::string const &name);
// Adds the leading '/' and drops a trailing one: "Net/X/" -> "/Net/X".
std::string NormalizePath(std::string const &path);
// Quotes text for a message: "abc", with non-printable bytes as \xHH.
std::string Quote(std::string const &text);

}  // namespace Model
}  // namespace QorCtl

#endif
