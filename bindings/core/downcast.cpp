// The module's own downcast functions. They are part of _qorctl itself and
// exported from it under their C++ names, so other native code that loads
// the module can call them; they are also bound as Python functions.
#include "adv/option_impl.h"

#define QORCTL_EXPORT __attribute__((visibility("default")))

QORCTL_EXPORT QorCtl::Adv::AdvancedIntegerOptionImpl *CastAdvInt(HostCtl::Adv::AdvancedOption *option) {
    return dynamic_cast<QorCtl::Adv::AdvancedIntegerOptionImpl *>(option);
}

QORCTL_EXPORT QorCtl::Adv::AdvancedStringOptionImpl *CastAdvString(HostCtl::Adv::AdvancedOption *option) {
    return dynamic_cast<QorCtl::Adv::AdvancedStringOptionImpl *>(option);
}
