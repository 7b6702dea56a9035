// The host's configuration file (C++ only; scripts hold it opaquely).
//
// Format, version 1: text lines, each ending in '\n':
//     QORCTL-HOST-CONFIG 1
//     # comment lines and blank lines are ignored
//     host <host name>                          (informational)
//     option <path> int <decimal uint32>
//     option <path> string "<text>"             (escapes \\ \" \n \r \t \xHH)
//     checksum crc32 <8 lower-case hex digits>
// The checksum is the CRC-32 (IEEE 802.3) of every byte before the checksum
// line, which must be the last line. The file lists the options whose value
// differs from the built-in default; loading it sets every other option back
// to its default.
#ifndef HOSTCTL_LIB_CONFIG_FILE_H
#define HOSTCTL_LIB_CONFIG_FILE_H

#include <string>

namespace QorCtl {
namespace Config {

class ConfigFile {
public:
    explicit ConfigFile(std::string path);
    std::string const &GetPath() const { return path_; }

    // Writes the host's configuration atomically: a temporary file in the
    // same directory, written, flushed to disk and renamed over the file.
    // Creates the file's directory when only that last level is missing.
    // Throws HostCtl::Lib::HostCtlException; the old file is then untouched.
    void Save() const;
    // Reads and checks the whole file, then applies it in one step. A
    // missing, foreign, truncated, damaged or invalid file is refused with
    // HostCtl::Lib::HostCtlException and the host is left unchanged.
    void Load() const;

    // QORCTL_CONFIG when set and not empty, else /var/lib/qorctl/host.conf.
    static std::string DefaultPath();

private:
    std::string path_;
};

}  // namespace Config
}  // namespace QorCtl

#endif
