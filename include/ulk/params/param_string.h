// ulkPString: a text value in a fixed-size buffer of 1 to 256 bytes.
//
// The value is the text followed by zero bytes up to the buffer's end; the
// last byte is always zero, so the text is at most size - 1 characters. It
// steps from key to key. Misuse raises an exception whose object is the
// message text (a const char*): a bad size in New, a text too long in
// SetValue; the parameter is then unchanged. Owned by the instance it is
// added to; one thread at a time.
#ifndef ULK_PARAMS_PARAM_STRING_H
#define ULK_PARAMS_PARAM_STRING_H

#include <cstdint>

#include "ulk/params/parameter.h"

/// How a host presents a text; the host gives the values their meaning and the
/// library only stores them.
enum ulkPStringType : int32_t {
    kPStringTypeDefault = 0,
};

/// A string parameter.
class ULK_API ulkPString : public ulkParameter {
  public:
    static const char className[];

    /// value: the plug-in's char buffer of size bytes holding a text shorter than
    /// size, or null to start empty. Throws "ulkPString::New, size must be > 0!" or
    /// "ulkPString::New, size must be <= 256!"; answers null when memory ran out.
    static ulkPString* New(const char* label, const char* id, void* value, size_t size,
                           ulkPStringType type);

    // --- value
    /// Sets the key at the time to the text (null: an empty text). Throws
    /// "ulkPString::SetValue, string longer then the current parameter buffer!"
    /// when the text does not fit with its terminating zero.
    void SetValue(double time, const char* text);
    /// Copies the value at the time (GetValueSize() bytes); false when the
    /// destination is null or smaller than that.
    bool GetValue(double time, char* destination, size_t destinationSize);
    ulkPStringType GetType() const { return mType; }

    // --- parameter
    const char* ClassName() const override { return className; }
    bool IsString() override { return true; }
    /// Null buffer: into the storage; otherwise the buffer must be larger than the value.
    bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) override;
    /// Sets the text; a text too long raises SetValue's exception.
    bool ParseValue(double time, const char* text) override;
    /// Prints "%s" with the text.
    bool WriteValue(double time, ulkFile* file) override;

  protected:
    ulkPString(const char* label, const char* id, void* value, size_t size, ulkPStringType type);
    ~ulkPString() override;

    ulkPStringType mType;
};

#endif  // ULK_PARAMS_PARAM_STRING_H
