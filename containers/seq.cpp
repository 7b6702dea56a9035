#include "seq.h"

#include <cstring>

namespace qr {

std::string ElementName(swig_type_info *ety) {
    if (!ety) return "element";
    const char *s = ety->str ? ety->str : ety->name;
    const char *bar = std::strchr(s, '|');
    std::string name(s, bar ? (size_t)(bar - s) : std::strlen(s));
    if (name.size() > 2 && name.compare(name.size() - 2, 2, " *") == 0) name.resize(name.size() - 2);
    return name;
}

void ElementError(swig_type_info *ety, Py_ssize_t index) {
    if (!PyErr_Occurred()) PyErr_SetString(PyExc_TypeError, ElementName(ety).c_str());
    char text[64];
    snprintf(text, sizeof text, "in sequence element %d ", (int)index);
    AppendErrorMessage(text);
}

}  // namespace qr
