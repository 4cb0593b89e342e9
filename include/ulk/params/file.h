// ulkFile and ulkMemoryFile: sinks for the text form of parameter values.
//
// ulkParameter::WriteValue prints a value through ulkFile::VPrintf with a
// C format ("%lg", "%s", ...) and its arguments. The base class writes
// nothing and answers 2; a host derives its own sink to send the text
// anywhere, or uses ulkMemoryFile, which keeps it in memory. While
// WriteValue prints, the calling thread formats numbers in the C locale, so
// a sink built on vsnprintf writes "0.5" whatever locale the host set.
// A sink is used by one thread at a time.
#ifndef ULK_PARAMS_FILE_H
#define ULK_PARAMS_FILE_H

#include <cstdarg>
#include <cstddef>

#include "ulk/export.h"

/// Output sink of parameter text. Derive from it and override VPrintf.
class ULK_API ulkFile {
  public:
    ulkFile() = default;
    virtual ~ulkFile();

    /// Formatted print in the manner of printf; answers VPrintf's result.
    int Printf(const char* format, ...)
#if defined(__GNUC__)
        __attribute__((format(printf, 2, 3)))
#endif
        ;
    /// The print itself: the base writes nothing and answers 2; non-zero means success.
    virtual int VPrintf(const char* format, va_list args);
};

/// A sink that appends everything printed to a text in memory. Numbers are
/// always formatted in the C locale. Not copyable: it owns its text.
class ULK_API ulkMemoryFile : public ulkFile {
  public:
    ulkMemoryFile() = default;
    ~ulkMemoryFile() override;
    ulkMemoryFile(const ulkMemoryFile&) = delete;
    ulkMemoryFile& operator=(const ulkMemoryFile&) = delete;

    /// Appends the formatted text; 2 when taken, 0 when it could not be (memory, bad format).
    int VPrintf(const char* format, va_list args) override;
    /// Everything printed since construction or the last Clear; never null.
    const char* GetText() const;
    /// Forgets the text.
    void Clear();

  private:
    char* mText = nullptr;
    size_t mLength = 0;
    size_t mCapacity = 0;
};

#endif  // ULK_PARAMS_FILE_H
