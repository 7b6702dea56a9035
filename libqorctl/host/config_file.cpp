// Saving and loading the host configuration (format: lib/config_file.h).
#include "lib/config_file.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <set>
#include <sys/stat.h>
#include <unistd.h>

#include "model.h"
#include "lib/exception.h"

namespace QorCtl {
namespace Config {

using HostCtl::Lib::HostCtlException;
using HostCtl::Lib::VobMessage;

namespace {

char const kMagic[] = "QORCTL-HOST-CONFIG";
int const kVersion = 1;
size_t const kMaxFileSize = 4 << 20;

uint32 Crc32(std::string const &data) {
    static uint32 table[256];
    static bool ready = [] {
        for (uint32 i = 0; i < 256; ++i) {
            uint32 c = i;
            for (int k = 0; k < 8; ++k)
                c = c & 1 ? 0xEDB88320u ^ (c >> 1) : c >> 1;
            table[i] = c;
        }
        return true;
    }();
    (void)ready;
    uint32 crc = 0xFFFFFFFFu;
    for (unsigned char ch : data)
        crc = table[(crc ^ ch) & 0xFF] ^ (crc >> 8);
    return crc ^ 0xFFFFFFFFu;
}

std::string Hex8(uint32 v) {
    char buf[16];
    std::snprintf(buf, sizeof buf, "%08x", v);
    return buf;
}

std::string SysError(std::string const &what) {
    return what + ": " + std::strerror(errno);
}

[[noreturn]] void Fail(std::string const &path, std::string const &why) {
    throw HostCtlException("Configuration file " + path + " " + why,
                           VobMessage("config.file", {path, why}));
}

std::string DirOf(std::string const &path) {
    size_t slash = path.rfind('/');
    if (slash == std::string::npos)
        return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

bool WriteAll(int fd, std::string const &data) {
    size_t done = 0;
    while (done < data.size()) {
        ssize_t n = ::write(fd, data.data() + done, data.size() - done);
        if (n < 0 && errno == EINTR)
            continue;
        if (n <= 0)
            return false;
        done += size_t(n);
    }
    return true;
}

// Parses the double-quoted, escaped text at s; false if malformed or if
// anything but the closing quote ends it.
bool Unquote(std::string const &s, std::string &out) {
    if (s.size() < 2 || s.front() != '"' || s.back() != '"')
        return false;
    out.clear();
    for (size_t i = 1; i + 1 < s.size(); ++i) {
        char c = s[i];
        if (c == '"')
            return false;
        if (c != '\\') {
            out += c;
            continue;
        }
        if (++i + 1 >= s.size())
            return false;
        switch (s[i]) {
        case '\\': out += '\\'; break;
        case '"': out += '"'; break;
        case 'n': out += '\n'; break;
        case 'r': out += '\r'; break;
        case 't': out += '\t'; break;
        case 'x': {
            if (i + 3 >= s.size() || !isxdigit((unsigned char)s[i + 1]) ||
                !isxdigit((unsigned char)s[i + 2]))
                return false;
            out += char(std::strtoul(s.substr(i + 1, 2).c_str(), nullptr, 16));
            i += 2;
            break;
        }
        default: return false;
        }
    }
    return true;
}

std::string Escape(std::string const &text) {
    std::string q = "\"";
    for (unsigned char c : text) {
        switch (c) {
        case '\\': q += "\\\\"; break;
        case '"': q += "\\\""; break;
        case '\n': q += "\\n"; break;
        case '\r': q += "\\r"; break;
        case '\t': q += "\\t"; break;
        default:
            if (c < 0x20 || c >= 0x7f) {
                char buf[8];
                std::snprintf(buf, sizeof buf, "\\x%02x", c);
                q += buf;
            } else {
                q += char(c);
            }
        }
    }
    return q + "\"";
}

bool ParseUint32(std::string const &s, uint32 &v) {
    if (s.empty() || s.size() > 10 || s.find_first_not_of("0123456789") != std::string::npos)
        return false;
    unsigned long long n = std::strtoull(s.c_str(), nullptr, 10);
    if (n > 0xFFFFFFFFull)
        return false;
    v = uint32(n);
    return true;
}

}  // namespace

ConfigFile::ConfigFile(std::string path) : path_(std::move(path)) {}

std::string ConfigFile::DefaultPath() {
    char const *env = std::getenv("QORCTL_CONFIG");
    return env && *env ? env : "/var/lib/qorctl/host.conf";
}

void ConfigFile::Save() const {
    if (path_.empty())
        Fail("\"\"", "cannot be written: the path is empty");
    std::string text = std::string(kMagic) + " " + std::to_string(kVersion) + "\n";
    text += "# Host configuration written by libqorctl. The checksum covers every line above it;\n"
            "# change settings through the library, not by editing this file.\n";
    text += "host " + Model::HostName() + "\n";
    for (Model::OptionState const &o : Model::AllOptions()) {
        if (o.IsDefault())
            continue;
        text += "option " + o.path +
                (o.isString ? " string " + Escape(o.strValue) : " int " + std::to_string(o.intValue)) +
                "\n";
    }
    text += "checksum crc32 " + Hex8(Crc32(text)) + "\n";

    std::string dir = DirOf(path_);
    struct stat st;
    if (::stat(dir.c_str(), &st) != 0 && errno == ENOENT && ::mkdir(dir.c_str(), 0755) != 0 &&
        errno != EEXIST)
        Fail(path_, "cannot be written: " + SysError("cannot create directory " + dir));

    std::string tmpl = path_ + ".tmp.XXXXXX";
    std::vector<char> name(tmpl.begin(), tmpl.end());
    name.push_back('\0');
    int fd = ::mkostemp(name.data(), O_CLOEXEC);
    if (fd < 0)
        Fail(path_, "cannot be written: " + SysError("cannot create a temporary file in " + dir));
    std::string tmp(name.data());
    std::string error;
    if (!WriteAll(fd, text))
        error = SysError("cannot write " + tmp);
    else if (::fchmod(fd, 0644) != 0)
        error = SysError("cannot set the mode of " + tmp);
    else if (::fsync(fd) != 0)
        error = SysError("cannot flush " + tmp + " to disk");
    if (::close(fd) != 0 && error.empty())
        error = SysError("cannot close " + tmp);
    if (error.empty() && ::rename(tmp.c_str(), path_.c_str()) != 0)
        error = SysError("cannot rename " + tmp + " to " + path_);
    if (!error.empty()) {
        ::unlink(tmp.c_str());
        Fail(path_, "cannot be written: " + error);
    }
    // Make the rename itself durable.
    int dfd = ::open(dir.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (dfd >= 0) {
        ::fsync(dfd);
        ::close(dfd);
    }
}

void ConfigFile::Load() const {
    int fd = ::open(path_.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0)
        Fail(path_, "cannot be read: " + SysError("open"));
    std::string data;
    char buf[65536];
    std::string error;
    bool tooLarge = false;
    for (;;) {
        ssize_t n = ::read(fd, buf, sizeof buf);
        if (n < 0 && errno == EINTR)
            continue;
        if (n < 0) {
            error = SysError("read");
            break;
        }
        if (n == 0)
            break;
        data.append(buf, size_t(n));
        if (data.size() > kMaxFileSize) {
            error = "is larger than " + std::to_string(kMaxFileSize) + " bytes";
            tooLarge = true;
            break;
        }
    }
    ::close(fd);
    std::string const refused = "; nothing was loaded";
    if (!error.empty())
        Fail(path_, (tooLarge ? error : "cannot be read: " + error) + refused);
    if (data.empty())
        Fail(path_, "is empty" + refused);

    std::string header = std::string(kMagic) + " ";
    if (data.compare(0, header.size(), header) != 0)
        Fail(path_, "is not a qorctl host configuration file" + refused);
    size_t eol = data.find('\n');
    int version = 0;
    if (eol == std::string::npos || std::sscanf(data.c_str() + header.size(), "%d", &version) != 1 ||
        data.substr(header.size(), eol - header.size()) != std::to_string(version))
        Fail(path_, "has a damaged header line" + refused);
    if (version != kVersion)
        Fail(path_, "has format version " + std::to_string(version) +
                        "; this library reads version " + std::to_string(kVersion) + refused);

    // The checksum line must be the last one, complete with its newline.
    size_t last = data.size() >= 2 ? data.rfind('\n', data.size() - 2) : std::string::npos;
    std::string const prefix = "checksum crc32 ";
    if (data.back() != '\n' || last == std::string::npos ||
        data.compare(last + 1, prefix.size(), prefix) != 0)
        Fail(path_, "is truncated or damaged (its checksum line is missing)" + refused);
    std::string body = data.substr(0, last + 1);
    std::string stored = data.substr(last + 1 + prefix.size(), data.size() - last - 2 - prefix.size());
    std::string computed = Hex8(Crc32(body));
    if (stored != computed)
        Fail(path_, "is damaged (checksum " + stored + " recorded, " + computed + " computed)" +
                        refused);

    std::vector<Model::Setting> settings;
    std::set<std::string> seen;
    size_t pos = eol + 1;
    for (unsigned lineNo = 2; pos < body.size(); ++lineNo) {
        size_t end = body.find('\n', pos);
        std::string line = body.substr(pos, end - pos);
        pos = end + 1;
        auto bad = [&](std::string const &why) {
            Fail(path_, "line " + std::to_string(lineNo) + ": " + why + refused);
        };
        if (line.empty() || line[0] == '#')
            continue;
        if (line.compare(0, 5, "host ") == 0)
            continue;
        if (line.compare(0, 7, "option ") != 0)
            bad("unknown entry \"" + line.substr(0, line.find(' ')) + "\"");
        size_t p1 = line.find(' ', 7);
        size_t p2 = p1 == std::string::npos ? p1 : line.find(' ', p1 + 1);
        if (p2 == std::string::npos)
            bad("an option entry needs a path, a type and a value");
        Model::Setting s;
        s.path = line.substr(7, p1 - 7);
        std::string type = line.substr(p1 + 1, p2 - p1 - 1);
        std::string value = line.substr(p2 + 1);
        if (!Model::HasOption(s.path) || Model::NormalizePath(s.path) != s.path)
            bad("no advanced option " + s.path + " on this host");
        Model::OptionState o = Model::GetOption(s.path);
        std::string why;
        if (type == "int") {
            if (!ParseUint32(value, s.intValue))
                bad("\"" + value + "\" is not an unsigned 32-bit number");
            why = Model::CheckInt(o, s.intValue);
        } else if (type == "string") {
            s.isString = true;
            if (!Unquote(value, s.strValue))
                bad("the value of " + s.path + " is not a well-formed quoted string");
            why = Model::CheckString(o, s.strValue);
        } else {
            bad("unknown option type \"" + type + "\"");
        }
        if (!why.empty())
            bad(why);
        if (!seen.insert(s.path).second)
            bad("option " + s.path + " appears twice");
        settings.push_back(s);
    }
    Model::ReplaceSettings(settings);
}

}  // namespace Config
}  // namespace QorCtl
