// The library's exceptions. Every failure of a library call is reported by
// throwing HostCtlException (or QorCtlException, which adds where it was
// raised). An exception records the call stack at the point it was built.
#ifndef HOSTCTL_LIB_EXCEPTION_H
#define HOSTCTL_LIB_EXCEPTION_H

#include <exception>
#include <string>
#include <vector>

#include "annotate.h"
#include "lib/vob_message.h"
#include "types.h"

namespace HostCtl {
namespace Lib {

class HostCtlException : public std::exception {
public:
    explicit HostCtlException(std::string message,
                              HostCtl::Lib::VobMessage vob = HostCtl::Lib::VobMessage());
    ~HostCtlException() noexcept override;
    char const *what() const noexcept override;
    // The message; with verbose set, followed by the message id and its
    // arguments (when there are any) and the stack trace.
    virtual std::string GetMessage(Bool verbose = false) const;
    // One line per frame, innermost first: "#n function+offset (object)".
    virtual std::string GetStackTrace() const;
    virtual HostCtl::Lib::VobMessage const &GetVobMessage() const;

private:
    std::string message_;
    HostCtl::Lib::VobMessage vob_;
    std::vector<void *> frames_;
};

}  // namespace Lib
}  // namespace HostCtl

namespace QorCtl {
namespace Lib {

class QorCtlException : public HostCtl::Lib::HostCtlException {
public:
    QorCtlException(std::string message, std::string source, uint32 line,
                    HostCtl::Lib::VobMessage vob = HostCtl::Lib::VobMessage());
    QorCtlException(QorCtl::Lib::QorCtlException const &other);
    // "source:line", or just the source when the line is 0.
    virtual std::string GetSource() const;

private:
    std::string source_;
    uint32 line_;
};

}  // namespace Lib
}  // namespace QorCtl

#endif
