// Everything generated container wrappers need: the interface and the
// vector, set and iterator templates.
#ifndef QORCTL_CONTAINERS_CONTAINER_OPS_H
#define QORCTL_CONTAINERS_CONTAINER_OPS_H

#include "container.h"
#include "iterator.h"
#include "set_ops.h"
#include "vector_ops.h"

#endif
