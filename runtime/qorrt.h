// The binding runtime: records shared with other extension modules of the
// same runtime family, the wrapped-pointer object, conversions, and the
// helpers every generated wrapper calls.
//
// The record layouts below (swig_type_info, swig_cast_entry,
// swig_module_record, swig_class_data, PySwigObject) are a binary contract
// with other modules in the process: never reorder or resize their fields.
#ifndef QORCTL_RUNTIME_QORRT_H
#define QORCTL_RUNTIME_QORRT_H

// Python 2.7's headers use 'register', which C++17 rejects.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wregister"
#include <Python.h>
#pragma GCC diagnostic pop

#include <cstddef>
#include <cstdint>
#include <string>

extern "C" {

struct swig_type_info;
struct swig_cast_entry;

typedef void *(*swig_converter_func)(void *p, int *new_memory);
typedef swig_type_info *(*swig_dycast_func)(void **p);

struct swig_type_info {
    const char *name;            // mangled name, the sort key
    const char *str;             // human names separated by '|', or null
    swig_dycast_func dcast;      // always null here
    swig_cast_entry *cast;       // head of the cast list
    void *clientdata;            // swig_class_data*, null until registered
    int owndata;                 // set by registration
};

struct swig_cast_entry {
    swig_type_info *type;        // source type
    swig_converter_func converter;  // null: pointer used unchanged
    swig_cast_entry *next;
    swig_cast_entry *prev;
};

struct swig_module_record {
    swig_type_info **types;          // in-use descriptors, size + 1 slots
    size_t size;
    swig_module_record *next;        // ring link
    swig_type_info **type_initial;   // own descriptors, sorted by name
    swig_cast_entry **cast_initial;  // parallel cast lists, null-terminated
    void *clientdata;                // always null
};

struct swig_class_data {
    PyObject *klass;
    PyObject *newraw;
    PyObject *newargs;
    PyObject *destroy;
    int delargs;
    int implicitconv;
};

struct PySwigObject {
    PyObject_HEAD
    void *ptr;
    swig_type_info *ty;
    int own;
    PyObject *next;
    // Not part of the shared layout: only read on objects whose type is this
    // runtime's own PySwigObject type. Set when delete_<Class> destroyed the
    // library object, so later calls through the object are refused.
    int dead;
    // Also ours only: an object kept alive while this one lives, for
    // borrowed pointers into another object's storage (a record field, a
    // reference result). Null for most objects.
    PyObject *keep;
};

struct PySwigPacked {
    PyObject_HEAD
    void *pack;
    swig_type_info *ty;
    size_t size;
};

// Pointer-constant table rows (kinds 4 and 5), ended by kind 0.
struct swig_const_entry {
    int type;
    const char *name;
    long lvalue;
    double dvalue;
    void *pvalue;
    swig_type_info **ptype;
};

}  // extern "C"

namespace qr {

// Result and error codes of the converters.
enum {
    ERR_GENERIC = -1,
    ERR_IO = -2,
    ERR_RUNTIME = -3,
    ERR_INDEX = -4,
    ERR_TYPE = -5,
    ERR_DIVISION_BY_ZERO = -6,
    ERR_OVERFLOW = -7,
    ERR_SYNTAX = -8,
    ERR_VALUE = -9,
    ERR_SYSTEM = -10,
    ERR_ATTRIBUTE = -11,
    ERR_MEMORY = -12,
};
const int RESULT_NEW_OBJECT = 0x200;
inline bool IsOk(int r) { return r >= 0; }

// WrapPointer flags; ConvertPtrAndOwn flags.
const int POINTER_OWN = 1;
const int POINTER_NO_SHADOW = 2;
const int POINTER_DISOWN = 1;
// Internal: the caller is about to destroy the object (delete_<Class>);
// the wrapped object is disowned and marked dead. An object that does not
// own its pointer is refused (ERR_VALUE): it is not Python's to destroy.
const int POINTER_DESTROY = 0x100;

PyObject *ErrorClassFor(int code);
void AppendErrorMessage(const char *text);

// ---- Descriptors, ring and casts ----------------------------------------
swig_type_info *FindTypeByMangledName(swig_module_record *start, const char *name);
swig_type_info *FindTypeByName(const char *name);
swig_cast_entry *FindCast(const char *source_mangled, swig_type_info *target);
void *CastPointer(swig_cast_entry *entry, void *p);
// The last '|' alternative of the human names, the mangled name when there
// are none, "unknown" for a null descriptor.
const char *DisplayName(const swig_type_info *ty);

// The own module record of the module being initialised / running. Set by
// InitModule; FindTypeByName starts there.
swig_module_record *OwnRecord();

// The wrapped-pointer object behind obj (borrowed), or null.
PySwigObject *GetThisObject(PyObject *obj);
// Returns 0 on success, ERR_GENERIC (-1) when obj carries no convertible
// pointer, ERR_VALUE when the wrapped library object was destroyed.
int SWIG_Python_ConvertPtrAndOwn(PyObject *obj, void **out, swig_type_info *ty, int flags);
PyObject *WrapPointer(void *p, swig_type_info *ty, int flags);
// A borrowed pointer into parent's storage: wrapped without ownership, and
// the wrapped object keeps parent alive so the pointer cannot dangle.
PyObject *WrapPointerKeep(void *p, swig_type_info *ty, PyObject *parent);

// ---- Wrapped-pointer and packed objects ----------------------------------
PyTypeObject *PySwigObject_Type();
PyTypeObject *PySwigPacked_Type();
bool IsSwigObject(PyObject *obj);
PyObject *NewSwigObject(void *p, swig_type_info *ty, int own);
// How to delete an owned object of a type that has no wrapper class (so no
// registered destroy function): scalar copies, opaque records, standard
// exceptions. Without one, freeing such an owned object only reports the leak.
typedef void (*Deleter)(void *p);
void RegisterDeleter(swig_type_info *ty, Deleter fn);
PyObject *NewSwigPacked(void *bytes, size_t size, swig_type_info *ty);
// Packed text "_<hex bytes of p in memory order><mangled name>", or false
// when it does not fit into bufsize.
bool PackedText(char *buf, size_t bufsize, const void *p, size_t n, const char *name);

// ---- Module entry --------------------------------------------------------
// Creates the module from the method table and joins the descriptor ring;
// returns the module dictionary (borrowed) or null. The record's descriptors
// must start with a null cast list and be sorted by mangled name; wrappers
// then use record->types[i] (the in-use descriptors), which may belong to
// another module of the ring.
PyObject *InitModule(const char *name, PyMethodDef *methods, swig_module_record *record,
                     swig_const_entry *constants);
void RegisterClass(swig_type_info *ty, PyObject *cls);
swig_class_data *MakeClassData(PyObject *cls);
// The body of every <Class>_swigregister: parses "O:swigregister". Pass the
// in-use descriptor.
PyObject *SwigRegister(PyObject *args, swig_type_info *ty);

// ---- Global variables and constants -------------------------------------
typedef PyObject *(*VarGetter)();
typedef int (*VarSetter)(PyObject *value);
PyObject *GlobalVarLink();  // the process's cvar object (borrowed)
PyObject *NewGlobalVarLink();  // a fresh, empty link object (new reference)
void AddGlobalVariable(PyObject *link, const char *name, VarGetter get, VarSetter set);
void InstallConstant(PyObject *dict, const char *name, PyObject *obj);
// Setter of a read-only variable: AttributeError "Variable %s is read-only."
int ReadOnlyVariable(const char *name);
// Setter of a read-only array variable: AttributeError
// "in variable 'read-only %s' of type '%s'". Returns 1.
int ReadOnlyArrayVariable(const char *qualified_name, const char *type);
// A setter whose conversion failed: ErrorClassFor(code) (-1 reported as
// ERR_TYPE) with "in variable '%s' of type '%s'". Returns 1.
int VariableError(int code, const char *qualified_name, const char *type);

// ---- Conversions (never raise, return codes) -----------------------------
// Every out pointer may be null: the call then only checks the object.
int ToBool(PyObject *obj, bool *out);
int ToInt32(PyObject *obj, int32_t *out);
int ToUint32(PyObject *obj, uint32_t *out);
int ToUint16(PyObject *obj, uint16_t *out);
int ToUint8(PyObject *obj, uint8_t *out);
int ToUint64(PyObject *obj, uint64_t *out);
int ToInt64(PyObject *obj, int64_t *out);
int ToChar(PyObject *obj, char *out);
int ToCharArray(PyObject *obj, char *out, size_t n);
// *out points into obj or at the wrapped char buffer; with copy, a non-null
// result is a new[] copy and the code carries RESULT_NEW_OBJECT. *size is the
// byte count including the terminator (0 for a null pointer).
int ToCharBuffer(PyObject *obj, char **out, size_t *size, bool copy);
// *out is a new std::string (RESULT_NEW_OBJECT), a borrowed wrapped one (0),
// or null (0) for a null char pointer.
int ToStdString(PyObject *obj, std::string **out);

PyObject *FromBool(bool v);
PyObject *FromInt(long v);
PyObject *FromUint32(uint32_t v);
PyObject *FromUint64(uint64_t v);
PyObject *FromInt64(int64_t v);
PyObject *FromChar(char c);
PyObject *FromCharBuffer(const char *p, size_t n);
PyObject *FromCString(const char *p);
PyObject *FromStdString(const std::string &s);
PyObject *FromCharArray(const char *p, size_t n);
PyObject *NoneResult();

// ---- Wrapper protocol -----------------------------------------------------
// Unpacks exactly n objects from the argument tuple into o. The format is the
// wrapper's PyArg_ParseTuple format ("OO:name"), used for the interpreter's
// own message when the count is wrong.
bool Unpack(PyObject *args, const char *format, Py_ssize_t n, PyObject **o);

// Message patterns.
PyObject *ArgError(int code, const char *fn, int argn, const char *type);
PyObject *NullRefError(const char *fn, int argn, const char *type);
PyObject *NullVarError(const char *var, const char *type);
// "Wrong number of arguments for overloaded function '%s'..." with the
// prototypes (null-terminated array).
PyObject *OverloadError(const char *fn, const char *const *prototypes);

// Argument conversion with the protocol's messages. Each returns false with
// a Python exception set.
//   ArgSelf: self of a method. None, a null pointer or a destroyed object
//            raise ValueError instead of reaching the library.
//   ArgPtr:  T* parameter (None gives null).
//   ArgRef:  T& / T const & / T by value (null raises invalid null reference).
bool ArgSelf(PyObject *obj, void **out, swig_type_info *ty, const char *fn, const char *type);
bool ArgPtr(PyObject *obj, void **out, swig_type_info *ty, const char *fn, int argn,
            const char *type, int flags = 0);
bool ArgRef(PyObject *obj, void **out, swig_type_info *ty, const char *fn, int argn,
            const char *type);

bool ArgBool(PyObject *o, bool *v, const char *fn, int argn, const char *type);
bool ArgInt32(PyObject *o, int32_t *v, const char *fn, int argn, const char *type);
bool ArgUint32(PyObject *o, uint32_t *v, const char *fn, int argn, const char *type);
bool ArgUint16(PyObject *o, uint16_t *v, const char *fn, int argn, const char *type);
bool ArgUint8(PyObject *o, uint8_t *v, const char *fn, int argn, const char *type);
bool ArgUint64(PyObject *o, uint64_t *v, const char *fn, int argn, const char *type);
bool ArgInt64(PyObject *o, int64_t *v, const char *fn, int argn, const char *type);
bool ArgChar(PyObject *o, char *v, const char *fn, int argn, const char *type);
bool ArgCharArray(PyObject *o, char *v, size_t n, const char *fn, int argn, const char *type);

// A std::string parameter. Holds the converted string and frees a new one
// when it goes out of scope, so every return path releases it.
class StrArg {
public:
    StrArg() : p_(nullptr), owned_(false) {}
    ~StrArg() { if (owned_) delete p_; }
    StrArg(const StrArg &) = delete;
    StrArg &operator=(const StrArg &) = delete;
    // by_value: std::string (no string is a TypeError); otherwise
    // std::string const & (no string is the invalid-null-reference error).
    bool Convert(PyObject *o, bool by_value, const char *fn, int argn, const char *type);
    const std::string &get() const { return *p_; }
private:
    std::string *p_;
    bool owned_;
};

// A char* parameter; frees a copy on scope exit.
class CharPtrArg {
public:
    CharPtrArg() : p_(nullptr), owned_(false) {}
    ~CharPtrArg() { if (owned_) delete[] p_; }
    CharPtrArg(const CharPtrArg &) = delete;
    CharPtrArg &operator=(const CharPtrArg &) = delete;
    bool Convert(PyObject *o, const char *fn, int argn, const char *type);
    char *get() const { return p_; }
private:
    char *p_;
    bool owned_;
};

// Probes used by overload dispatchers: convert without output.
bool ProbePtr(PyObject *o, swig_type_info *ty);
bool ProbeBool(PyObject *o);
bool ProbeInt32(PyObject *o);
bool ProbeUint32(PyObject *o);
bool ProbeUint16(PyObject *o);
bool ProbeUint8(PyObject *o);
bool ProbeUint64(PyObject *o);
bool ProbeInt64(PyObject *o);
bool ProbeChar(PyObject *o);
bool ProbeString(PyObject *o);

// Exceptions. RaiseLibraryException takes ownership of the heap copy.
PyObject *RaiseLibraryException(void *copy, swig_type_info *ty);
PyObject *RaiseStdOutOfRange(const char *what);   // IndexError
PyObject *RaiseStdInvalidArgument(const char *what);  // ValueError
// Called inside a catch (...) block: an exception the method does not
// declare becomes RuntimeError with its what() text.
PyObject *RaiseForeign();

}  // namespace qr

#endif
