// Readable, indented "label: value" output for Print methods. C++ only;
// scripts hold a printer opaquely and pass it back to Print.
//
//     ObjectPrinter p(std::cout);
//     p.Begin("Option /Net/TcpipHeapSize");   // "Option /Net/TcpipHeapSize:"
//     p.Field("Value", 32u);                   // "   Value: 32"
//     p.End();
#ifndef HOSTCTL_UTIL_OBJECT_PRINTER_H
#define HOSTCTL_UTIL_OBJECT_PRINTER_H

#include <iostream>
#include <sstream>
#include <string>
#include <type_traits>

namespace QorCtl {
namespace Util {

class ObjectPrinter {
public:
    // Every line starts with prefix, then indentWidth blanks per open level.
    explicit ObjectPrinter(std::ostream &out = std::cout, std::string prefix = std::string(),
                           unsigned indentWidth = 3);

    std::ostream &GetStream() const { return *out_; }
    unsigned GetDepth() const { return depth_; }

    // "label:" and one level deeper until the matching End().
    void Begin(std::string const &label);
    void End();
    // "label: value"; a value of several lines continues one level deeper.
    void Field(std::string const &label, std::string const &value);
    void Field(std::string const &label, char const *value);
    void Field(std::string const &label, bool value);
    template <class T>
    typename std::enable_if<std::is_arithmetic<T>::value>::type Field(std::string const &label,
                                                                      T value) {
        std::ostringstream s;
        s << +value;  // unary plus: one-byte integers print as numbers
        Field(label, s.str());
    }
    // One line of free text at the current depth.
    void Line(std::string const &text);

private:
    std::ostream *out_;
    std::string prefix_;
    unsigned indentWidth_;
    unsigned depth_;
};

}  // namespace Util
}  // namespace QorCtl

#endif
