#include "lib/exception.h"

#include "../util/backtrace.h"

namespace HostCtl {
namespace Lib {

std::string VobMessage::ToString() const {
    if (id_.empty())
        return std::string();
    std::string text = id_ + "(";
    for (size_t i = 0; i < args_.size(); ++i)
        text += (i ? ", " : "") + args_[i];
    return text + ")";
}

HostCtlException::HostCtlException(std::string message, VobMessage vob)
    : message_(std::move(message)), vob_(std::move(vob)), frames_(QorCtl::Util::CaptureStack(1)) {}

HostCtlException::~HostCtlException() noexcept {}

char const *HostCtlException::what() const noexcept {
    return message_.c_str();
}

std::string HostCtlException::GetMessage(Bool verbose) const {
    if (!verbose)
        return message_;
    std::string text = message_;
    if (!vob_.IsEmpty())
        text += "\nMessage: " + vob_.ToString();
    return text + "\nStack trace:\n" + GetStackTrace();
}

std::string HostCtlException::GetStackTrace() const {
    return QorCtl::Util::FormatStack(frames_);
}

VobMessage const &HostCtlException::GetVobMessage() const {
    return vob_;
}

}  // namespace Lib
}  // namespace HostCtl

namespace QorCtl {
namespace Lib {

QorCtlException::QorCtlException(std::string message, std::string source, uint32 line,
                                 HostCtl::Lib::VobMessage vob)
    : HostCtlException(std::move(message), std::move(vob)), source_(std::move(source)), line_(line) {}

QorCtlException::QorCtlException(QorCtlException const &other) = default;

std::string QorCtlException::GetSource() const {
    return line_ ? source_ + ":" + std::to_string(line_) : source_;
}

}  // namespace Lib
}  // namespace QorCtl
