// The vector and set classes: what the generated wrappers hand to the
// container templates. One ContainerInfo per Python container class; each
// generated method wrapper is one line:
//
//   PyObject *qw_StringVector_append(PyObject *, PyObject *args) {
//       return qr::VectorOps< std::vector< std::string > >::append(args, qi_StringVector);
//   }
#ifndef QORCTL_CONTAINERS_CONTAINER_H
#define QORCTL_CONTAINERS_CONTAINER_H

#include "qorrt.h"

namespace qr {

// Method slots of a vector class, in method-table order. The Python name of
// slot k is "<Class>_<VectorMethodNames[k]>".
enum VectorMethod {
    VM_iterator, VM_nonzero, VM_len, VM_pop, VM_getslice, VM_setslice, VM_delslice,
    VM_delitem, VM_getitem, VM_setitem, VM_append, VM_empty, VM_size, VM_clear, VM_swap,
    VM_get_allocator, VM_begin, VM_end, VM_rbegin, VM_rend, VM_pop_back, VM_erase,
    VM_push_back, VM_front, VM_back, VM_assign, VM_resize, VM_insert, VM_reserve,
    VM_capacity, VM_new, VM_COUNT
};
extern const char *const VectorMethodNames[VM_COUNT];

// Method slots of the string set class.
enum SetMethod {
    SM_iterator, SM_nonzero, SM_len, SM_append, SM_contains, SM_getitem, SM_empty, SM_size,
    SM_clear, SM_swap, SM_count, SM_begin, SM_end, SM_rbegin, SM_rend, SM_erase, SM_find,
    SM_lower_bound, SM_upper_bound, SM_equal_range, SM_insert, SM_new, SM_COUNT
};
extern const char *const SetMethodNames[SM_COUNT];

struct ContainerInfo {
    // Wrapper names, "<Class>_<method>" per slot (and "new_<Class>" for the
    // constructor), used in argument formats and messages.
    const char *const *names;
    // The container's type spelled as messages show it, without allocator:
    // "std::vector< uint32 >", "std::set< std::string >".
    const char *spelled;
    // In-use descriptor slots (filled at module init): the container
    // ("std::vector< E,std::allocator< E > > *"), its element as wrapped
    // (element type followed by " *"; the pointee for pointer elements), the
    // iterator base class "swig::PySwigIterator *", and the allocator.
    swig_type_info *const *container;
    swig_type_info *const *element;
    swig_type_info *const *iterator;
    swig_type_info *const *allocator;
    // Sets only: the comparator "std::less< K > *" that new_<Set> accepts.
    // May be left out; it is then looked up by that name.
    swig_type_info *const *compare = nullptr;
};

}  // namespace qr

#endif
