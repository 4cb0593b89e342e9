// The host attribute callback that module start-up hands over (internal).
#ifndef ULK_SRC_MODULES_HOST_ATTRIBUTE_H
#define ULK_SRC_MODULES_HOST_ATTRIBUTE_H

#include "ulk/modules/entry_points.h"

namespace ulk {

ulkHostAttributeCallback GetHostAttributeCallback();

}  // namespace ulk

#endif  // ULK_SRC_MODULES_HOST_ATTRIBUTE_H
