// Names of the states a storage device passes through when it loses its
// paths: all paths down (and the timeout that ends it), permanent device
// loss, degraded, off. The library reports device states with these names;
// scripts may replace them (cvar), and a name set to null reads as None.
#ifndef HOSTCTL_STORAGE_DEVICE_STATE_H
#define HOSTCTL_STORAGE_DEVICE_STATE_H

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {

extern char const *APD_START;
extern char const *APD_TIMEOUT;
extern char const *PDL;
extern char const *DEGRADED;
extern char const *OFF;

}  // namespace Storage
}  // namespace HostCtl

#endif
