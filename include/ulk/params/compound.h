// Compound parameters: RGB and HSV colours, 2D points and rectangles.
//
// Each holds a small record of doubles and names one channel per component;
// channel c is the c-th double of the record, of the storage and of every
// key. Every component is interpolated linearly by itself between keys. No
// range is imposed: colours are not clamped, the hue does not wrap and the
// rectangle's corners are not ordered. The storage, when given, is one record
// of the plug-in's. Owned by the instance they are added to; one thread at a
// time.
#ifndef ULK_PARAMS_COMPOUND_H
#define ULK_PARAMS_COMPOUND_H

#include "ulk/params/parameter.h"

/// An RGB colour: channels "red", "green", "blue".
struct ulkColorRGB {
    double red;
    double green;
    double blue;
};

/// An HSV colour: channels "red" (the hue), "saturation", "value".
struct ulkColorHSV {
    double hue;
    double saturation;
    double value;
};

/// A point in the plane: channels "x", "y".
struct ulkPoint2D {
    double x;
    double y;
};

/// A rectangle given by two corners: channels "x1", "y1", "x2", "y2".
struct ulkRect2D {
    double x1;
    double y1;
    double x2;
    double y2;
};

/// An RGB colour parameter; starts at 0, 0, 0 without storage.
class ULK_API ulkPColorRGB : public ulkParameter {
  public:
    static const char className[];

    /// value: the plug-in's ulkColorRGB (size 24), or null / size 0. Null when it
    /// cannot be made or for storage of another size.
    static ulkPColorRGB* New(const char* label, const char* id, void* value, size_t size);

    /// The value at the time.
    ulkColorRGB GetValue(double time);
    /// Sets the key at the time.
    void SetValue(double time, ulkColorRGB value);
    /// The value the storage held at construction; zeros when made without storage.
    ulkColorRGB GetDefaultValue();

    const char* ClassName() const override { return className; }
    bool IsColorRGB() override { return true; }
    bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) override;
    /// Reads "%lg,%lg,%lg".
    bool ParseValue(double time, const char* text) override;
    /// Prints "%lg,%lg,%lg".
    bool WriteValue(double time, ulkFile* file) override;

    /// Channel -1: every channel into its double of the destination; channel c:
    /// that channel's value at the destination's start (float for size 4, double for 8).
    static bool sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                    size_t size, int channel);

  protected:
    ulkPColorRGB(const char* label, const char* id, void* value, size_t size);
    ~ulkPColorRGB() override;
};

/// An HSV colour parameter; starts at 0, 0, 0 without storage.
class ULK_API ulkPColorHSV : public ulkParameter {
  public:
    static const char className[];

    /// value: the plug-in's ulkColorHSV (size 24), or null / size 0. Null when it
    /// cannot be made or for storage of another size.
    static ulkPColorHSV* New(const char* label, const char* id, void* value, size_t size);

    /// The value at the time.
    ulkColorHSV GetValue(double time);
    /// Sets the key at the time.
    void SetValue(double time, ulkColorHSV value);
    /// The value the storage held at construction; zeros when made without storage.
    ulkColorHSV GetDefaultValue();

    const char* ClassName() const override { return className; }
    bool IsColorHSV() override { return true; }
    bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) override;
    /// Reads "%lg,%lg,%lg" (hue, saturation, value).
    bool ParseValue(double time, const char* text) override;
    /// Prints "%lg,%lg,%lg".
    bool WriteValue(double time, ulkFile* file) override;

    /// As ulkPColorRGB::sLinearInterpolator; the hue does not wrap.
    static bool sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                    size_t size, int channel);

  protected:
    ulkPColorHSV(const char* label, const char* id, void* value, size_t size);
    ~ulkPColorHSV() override;
};

/// A 2D point parameter; starts at 0, 0 without storage.
class ULK_API ulkPPoint2D : public ulkParameter {
  public:
    static const char className[];

    /// value: the plug-in's ulkPoint2D (size 16), or null / size 0. Null when it
    /// cannot be made or for storage of another size.
    static ulkPPoint2D* New(const char* label, const char* id, void* value, size_t size);

    /// The value at the time.
    ulkPoint2D GetValue(double time);
    /// Sets the key at the time.
    void SetValue(double time, ulkPoint2D value);
    /// The value the storage held at construction; zeros when made without storage.
    ulkPoint2D GetDefaultValue();

    const char* ClassName() const override { return className; }
    bool IsPoint2D() override { return true; }
    bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) override;
    /// Reads "%lg,%lg".
    bool ParseValue(double time, const char* text) override;
    /// Prints "%lg,%lg".
    bool WriteValue(double time, ulkFile* file) override;

    /// As ulkPColorRGB::sLinearInterpolator, over two channels.
    static bool sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                    size_t size, int channel);

  protected:
    ulkPPoint2D(const char* label, const char* id, void* value, size_t size);
    ~ulkPPoint2D() override;
};

/// A rectangle parameter; starts at 0, 0, 1, 1 without storage.
class ULK_API ulkPRect2D : public ulkParameter {
  public:
    static const char className[];

    /// value: the plug-in's ulkRect2D (size 32), or null / size 0. Null when it
    /// cannot be made or for storage of another size.
    static ulkPRect2D* New(const char* label, const char* id, void* value, size_t size);

    /// The value at the time.
    ulkRect2D GetValue(double time);
    /// Sets the key at the time.
    void SetValue(double time, ulkRect2D value);
    /// The value the storage held at construction; zeros when made without storage.
    ulkRect2D GetDefaultValue();

    const char* ClassName() const override { return className; }
    bool IsRect2D() override { return true; }
    bool Evaluate(double time, void* buffer, size_t bufferSize, int channel) override;
    /// Reads "%lg,%lg,%lg,%lg" (x1, y1, x2, y2).
    bool ParseValue(double time, const char* text) override;
    /// Prints "%lg,%lg,%lg,%lg".
    bool WriteValue(double time, ulkFile* file) override;

    /// As ulkPColorRGB::sLinearInterpolator, over four channels.
    static bool sLinearInterpolator(ulkParameter* parameter, double time, void* destination,
                                    size_t size, int channel);

  protected:
    ulkPRect2D(const char* label, const char* id, void* value, size_t size);
    ~ulkPRect2D() override;
};

#endif  // ULK_PARAMS_COMPOUND_H
