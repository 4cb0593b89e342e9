// ulkPBoolean: an on/off parameter.
//
// The value is one byte, 0 for false and 1 for true, and steps from key to
// key. Owned by the instance it is added to; one thread at a time.
#ifndef ULK_PARAMS_BOOLEAN_H
#define ULK_PARAMS_BOOLEAN_H

#include "ulk/params/parameter.h"

/// A boolean parameter.
class ULK_API ulkPBoolean : public ulkParameter {
  public:
    static const char className[];

    /// value: the plug-in's bool (size 1), or null / size 0 to start false.
    static ulkPBoolean* New(const char* label, const char* id, void* value, size_t size);

    // --- value
    /// The value at the time.
    bool GetValue(double time);
    /// Sets the key at the time to the value (one byte).
    void SetValue(double time, bool value);
    /// The value the storage held at construction; false when made without storage.
    bool GetDefaultValue();

    // --- parameter
    const char* ClassName() const override { return className; }
    bool IsBoolean() override { return true; }
    bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) override;
    /// "1" and "true" set true, every other text false; false only for a null text.
    bool ParseValue(double time, const char* text) override;
    /// Prints "true" or "false".
    bool WriteValue(double time, ulkFile* file) override;

  protected:
    ulkPBoolean(const char* label, const char* id, void* value, size_t size);
    ~ulkPBoolean() override;
};

#endif  // ULK_PARAMS_BOOLEAN_H
