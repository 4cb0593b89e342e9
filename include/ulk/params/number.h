// ulkPNumber: a real or integer number with a range, a step and a widget hint.
//
// A real number evaluates into the plug-in's double and interpolates linearly
// between keys. An integer number takes the plug-in's int as its target: it
// evaluates into a double of its own (keys hold doubles too), steps from key
// to key, and then stores the value truncated toward zero into the int.
// Values set are clamped to the range. Owned by the instance it is added to;
// one thread at a time.
#ifndef ULK_PARAMS_NUMBER_H
#define ULK_PARAMS_NUMBER_H

#include <cstdint>

#include "ulk/params/parameter.h"

/// The kind of number and so the type of its storage.
enum ulkPNumberType : int32_t {
    kPNumberReal = 0,     ///< storage: a double (8 bytes); linear interpolation
    kPNumberInteger = 1,  ///< storage: an int (4 bytes); step interpolation
};

/// The control a host shows for a number; the host gives the values their
/// meaning and the library only stores them.
enum ulkPNumberWidget : int32_t {
    kPNumberWidgetDefault = 0,
};

/// A number parameter.
class ULK_API ulkPNumber : public ulkParameter {
  public:
    static const char className[];

    // --- creation
    /// A number with widget 0. value: the plug-in's double (size 8) or int (size 4),
    /// or null / size 0 to start at the middle of the range. Null when it cannot be
    /// made, for a size that does not fit the type, or for an unknown type.
    static ulkPNumber* New(const char* label, const char* id, void* value, size_t size,
                           double minimum, double maximum, double increment, ulkPNumberType type,
                           bool textBelow);
    /// The same with the host control to show.
    static ulkPNumber* New(const char* label, const char* id, ulkPNumberWidget widget, void* value,
                           size_t size, double minimum, double maximum, double increment,
                           ulkPNumberType type, bool textBelow);

    // --- value
    /// The value at the time.
    double GetValue(double time);
    /// Sets the key at the time to the value clamped to the range (the minimum wins
    /// an inverted range; a value that is not a number becomes the maximum).
    void SetValue(double time, double value);
    /// The value the storage held at construction; 0 when made without storage.
    double GetDefaultValue();

    // --- description
    double GetMinimum() const { return mMinimum; }
    double GetMaximum() const { return mMaximum; }
    /// The step; (maximum - minimum) / 10 when 0 or less was given.
    double GetIncrement() const { return mIncrement; }
    ulkPNumberType GetType() const { return mType; }
    /// Hint to show the value below the control; forced true for small steps or large ranges.
    bool GetTextBelow() const { return mTextBelow; }
    ulkPNumberWidget GetWidget() const { return mWidget; }

    // --- parameter
    const char* ClassName() const override { return className; }
    bool IsNumber() override { return true; }
    bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) override;
    /// Reads one "%lg" field; the value is clamped as SetValue does.
    bool ParseValue(double time, const char* text) override;
    /// Prints "%lg".
    bool WriteValue(double time, ulkFile* file) override;

    /// Linear interpolation of channel 0, whatever channel is passed.
    static bool sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                    size_t size, int channel);
    /// Step interpolation of the whole value, whatever channel is passed.
    static bool sBasicInterpolator(ulkParameter* parameter, double time, void* destination,
                                   size_t size, int channel);

  protected:
    ulkPNumber(const char* label, const char* id, ulkPNumberWidget widget, void* value, size_t size,
               double minimum, double maximum, double increment, ulkPNumberType type,
               bool textBelow);
    ~ulkPNumber() override;

    ulkPNumberType mType;
    double mMinimum;
    double mMaximum;
    double mIncrement;
    bool mTextBelow;
    int* mIntegerTarget;
    ulkPNumberWidget mWidget;

  private:
    double* mOwnValue;  // the double an integer number evaluates into
};

#endif  // ULK_PARAMS_NUMBER_H
