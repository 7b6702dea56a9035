// Setters of writable library variables, used by the generated cvar entries.
#ifndef QORCTL_RUNTIME_VARSETTERS_H
#define QORCTL_RUNTIME_VARSETTERS_H

#include "qorrt.h"

namespace qr {

// A writable C string: a str (copied) or a wrapped char pointer (copied;
// None gives null). On failure raises "in variable '%s' of type '%s'".
bool VarCString(PyObject *value, char **out, const char *qname, const char *type);
// A writable record: value converted as a pointer to the record; failure
// raises "in variable '%s' of type '%s'", null the invalid-null-reference
// variable error.
bool VarRecord(PyObject *value, void **out, swig_type_info *ty, const char *qname, const char *type);

}  // namespace qr

#endif
