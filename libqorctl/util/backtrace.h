// Capturing and formatting call stacks.
#ifndef LIBQORCTL_UTIL_BACKTRACE_H
#define LIBQORCTL_UTIL_BACKTRACE_H

#include <string>
#include <vector>

namespace QorCtl {
namespace Util {

// The return addresses of the calling thread's stack, innermost first,
// leaving out the skip innermost frames (besides this function's own).
std::vector<void *> CaptureStack(int skip);
// "#n function+offset (object)\n" per frame, names demangled.
std::string FormatStack(std::vector<void *> const &frames);

}  // namespace Util
}  // namespace QorCtl

#endif
