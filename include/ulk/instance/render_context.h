// The render context of an effect instance and the callbacks around it: the
// host-owned enumerations of video type, field mode, field and instance type,
// the platform UI record, and the types of the host callbacks an instance
// reaches (abort, meter, video drawing, wait display, alternate frames).
//
// The enumerations are 32-bit and belong to the host: the library names the
// values it gives a meaning to and stores any other 32-bit value unchanged.
#ifndef ULK_INSTANCE_RENDER_CONTEXT_H
#define ULK_INSTANCE_RENDER_CONTEXT_H

#include <cstddef>
#include <cstdint>

#include "ulk/core/types.h"

class ulkHostInstance;
class ulkInstance_v1;
class ulkImage;

/// Video type: 0 renders whole frames; any other value renders two fields per frame.
enum ulkVideoType : int32_t { kVideoTypeProgressive = 0, kVideoTypeInterlaced = 1 };

/// Field mode: 0 treats every field as the top field (ulkInstance_v1::IsTopField).
enum ulkFieldMode : int32_t { kFieldModeFrames = 0, kFieldModeFields = 1 };

/// A field of a frame. Field values are only compared with each other.
enum ulkField : int32_t {
    kFieldOne = 1,  ///< the default field dominance and current field
    kFieldTwo = 2
};

/// How the host uses an instance; -1 (the default) means not said.
enum ulkInstanceType : int32_t { kInstanceTypeNone = -1 };

/// 16 bytes of platform data the host hands to plug-in user interfaces; the
/// library copies them on request and never reads them.
struct ulkPlatformUIInfo {
    unsigned char bytes[16];
};

/// Abort and meter callbacks: called with the plug-in instance and the host's data word.
typedef bool (*ulkAbortCallback)(ulkInstance_v1* instance, void* data);
typedef bool (*ulkMeterCallback)(ulkInstance_v1* instance, void* data);
/// Draws into the host's video buffer; the three integers are the host's.
typedef void (*ulkDrawVideoCallback)(unsigned char* buffer, int32_t a, int32_t b, int32_t c);
/// Shows or hides the host's wait display; the value is the host's.
typedef void (*ulkDisplayWaitCallback)(int32_t value);
/// Fetches an alternate frame into image; arguments and answer are the host's.
typedef bool (*ulkAltFrameCallback)(ulkHostInstance* instance, unsigned short a, unsigned short b,
                                    ulkField field, ulkImage* image);
/// The size of an alternate frame; arguments and answer are the host's.
typedef size_t (*ulkAltFrameSizeCallback)(ulkHostInstance* instance, ulkField field, size_t* first,
                                          size_t* second);

#endif  // ULK_INSTANCE_RENDER_CONTEXT_H
