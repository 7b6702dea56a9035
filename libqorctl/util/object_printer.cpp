#include "util/object_printer.h"

namespace QorCtl {
namespace Util {

ObjectPrinter::ObjectPrinter(std::ostream &out, std::string prefix, unsigned indentWidth)
    : out_(&out), prefix_(std::move(prefix)), indentWidth_(indentWidth), depth_(0) {}

void ObjectPrinter::Line(std::string const &text) {
    *out_ << prefix_ << std::string(depth_ * indentWidth_, ' ') << text << '\n';
}

void ObjectPrinter::Begin(std::string const &label) {
    Line(label + ":");
    ++depth_;
}

void ObjectPrinter::End() {
    if (depth_ > 0)
        --depth_;
    out_->flush();
}

void ObjectPrinter::Field(std::string const &label, std::string const &value) {
    size_t eol = value.find('\n');
    if (eol == std::string::npos) {
        Line(label + ": " + value);
        return;
    }
    Begin(label);
    for (size_t pos = 0; pos < value.size(); pos = eol + 1) {
        eol = value.find('\n', pos);
        if (eol == std::string::npos)
            eol = value.size();
        Line(value.substr(pos, eol - pos));
    }
    End();
}

void ObjectPrinter::Field(std::string const &label, char const *value) {
    Field(label, std::string(value ? value : ""));
}

void ObjectPrinter::Field(std::string const &label, bool value) {
    Field(label, std::string(value ? "yes" : "no"));
}

}  // namespace Util
}  // namespace QorCtl
