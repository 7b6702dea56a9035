#include "varsetters.h"

#include <cstring>

namespace qr {

bool VarCString(PyObject *value, char **out, const char *qname, const char *type) {
    char *p = nullptr;
    size_t size = 0;
    int r = ToCharBuffer(value, &p, &size, true);
    if (!IsOk(r)) {
        PyErr_Format(ErrorClassFor(r == ERR_GENERIC ? ERR_TYPE : r), "in variable '%s' of type '%s'", qname, type);
        return false;
    }
    if (p && !(r & RESULT_NEW_OBJECT)) {
        // A wrapped char pointer: keep a copy of its bytes.
        char *copy = new char[size ? size : 1];
        std::memcpy(copy, p, size ? size : 1);
        p = copy;
    }
    *out = p;
    return true;
}

bool VarRecord(PyObject *value, void **out, swig_type_info *ty, const char *qname, const char *type) {
    void *p = nullptr;
    int r = SWIG_Python_ConvertPtrAndOwn(value, &p, ty, 0);
    if (r != 0) {
        PyErr_Format(ErrorClassFor(r == ERR_GENERIC ? ERR_TYPE : r), "in variable '%s' of type '%s'", qname, type);
        return false;
    }
    if (!p) {
        NullVarError(qname, type);
        return false;
    }
    *out = p;
    return true;
}

}  // namespace qr
