// The machine-readable companion of an exception's text: a message id such
// as "adv.option.range" and the message's arguments, so that tools can react
// to a failure without parsing the human-readable text. Scripts only hold it
// and pass it back; it has no wrapper class of its own.
#ifndef HOSTCTL_LIB_VOB_MESSAGE_H
#define HOSTCTL_LIB_VOB_MESSAGE_H

#include <string>
#include <utility>
#include <vector>

namespace HostCtl {
namespace Lib {

class VobMessage {
public:
    VobMessage() {}
    VobMessage(std::string id, std::vector<std::string> args)
        : id_(std::move(id)), args_(std::move(args)) {}
    VobMessage(VobMessage const &) = default;
    VobMessage &operator=(VobMessage const &) = default;
    ~VobMessage() {}

    std::string const &GetId() const { return id_; }
    std::vector<std::string> const &GetArgs() const { return args_; }
    bool IsEmpty() const { return id_.empty(); }
    // "id(arg1, arg2, ...)", or "" for an empty message.
    std::string ToString() const;

private:
    std::string id_;
    std::vector<std::string> args_;
};

}  // namespace Lib
}  // namespace HostCtl

#endif
