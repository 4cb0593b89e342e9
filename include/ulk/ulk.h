// The ULK interface: everything a host application or an effect plug-in needs.
//
// A host includes this header and links libulk; a plug-in includes it too,
// derives its classes from the plug-in bases (ulkModel_v1, ulkInstance_v1,
// ulkOverlay_v1) and exports its entry points with ULK_PLUGIN_EXPORT.
#ifndef ULK_ULK_H
#define ULK_ULK_H

#include "ulk/export.h"

// Core services: lists, errors, process-wide host services.
#include "ulk/core/types.h"
#include "ulk/core/list.h"
#include "ulk/core/error.h"
#include "ulk/core/host_global.h"

// Plug-in modules and the module registry.
#include "ulk/modules/entry_points.h"
#include "ulk/modules/dll.h"
#include "ulk/modules/dll_maker.h"

// Images: formats, image buffers, media objects.
#include "ulk/image/image_format.h"
#include "ulk/image/media_object.h"
#include "ulk/image/image.h"

// Parameters: key frames, the parameter kinds, value text.
#include "ulk/params/param_key.h"
#include "ulk/params/file.h"
#include "ulk/params/parameter.h"
#include "ulk/params/number.h"
#include "ulk/params/boolean.h"
#include "ulk/params/param_list.h"
#include "ulk/params/compound.h"
#include "ulk/params/param_string.h"
#include "ulk/params/group.h"

// Effect models.
#include "ulk/model/model_description.h"
#include "ulk/model/host_model.h"
#include "ulk/model/model.h"

// Effect instances.
#include "ulk/instance/state.h"
#include "ulk/instance/render_context.h"
#include "ulk/instance/host_instance.h"
#include "ulk/instance/instance.h"

// Overlays.
#include "ulk/overlay/overlay_context.h"
#include "ulk/overlay/overlay_mode.h"
#include "ulk/overlay/host_overlay.h"
#include "ulk/overlay/overlay.h"

#endif  // ULK_ULK_H
