// Methods that exist only in the bindings. Each is a free function whose
// first parameter is the object; the annotation names the class it joins.
#ifndef QORCTL_BINDINGS_CORE_EXTEND_H
#define QORCTL_BINDINGS_CORE_EXTEND_H

#include "lib/exception.h"

// str() of a raised library exception shows its message.
QC_ANNOTATE("extend:HostCtl::Lib::HostCtlException")
inline std::string __str__(HostCtl::Lib::HostCtlException *self) { return self->GetMessage(false); }

#endif
