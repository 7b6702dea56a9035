// Helpers shared by the runtime's translation units; not for wrappers.
#ifndef QORCTL_RUNTIME_QRINTERNAL_H
#define QORCTL_RUNTIME_QRINTERNAL_H

#include "qorrt.h"

namespace qr {
namespace detail {

// The interned key "this", created on first use.
PyObject *ThisKey();
void ReleaseThisKey();

// The record of the module being initialised; set by InitModule.
void SetOwnRecord(swig_module_record *r);

// "_" followed by two lowercase hex digits per byte, in memory order; false
// when 2 * n + 2 bytes do not fit into bufsize.
bool HexText(char *buf, size_t bufsize, const void *p, size_t n);

// Whether s has this runtime's full object layout (the fields after next):
// made by this module or by another module built from the same runtime,
// each of which has its own copy of the type. A wrapped object of another
// runtime family has only the shared fields.
bool IsFamilyObject(const PySwigObject *s);

// Descriptors the string converters look up once and then keep.
swig_type_info *CharPtrType();    // "_p_char"
swig_type_info *StdStringType();  // "std::string *"

}  // namespace detail
}  // namespace qr

#endif
