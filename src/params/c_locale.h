// Private to the parameter sources: the C locale around number conversion.
//
// The text form of values is exchanged between hosts, so a number must read
// and print the same ("0.5", never "0,5") whatever locale the host process
// runs under. The scope switches only the calling thread's locale.
#ifndef ULK_SRC_PARAMS_C_LOCALE_H
#define ULK_SRC_PARAMS_C_LOCALE_H

#include <clocale>
#include <locale.h>

class ulkCLocaleScope {
  public:
    ulkCLocaleScope();
    ~ulkCLocaleScope();
    ulkCLocaleScope(const ulkCLocaleScope&) = delete;
    ulkCLocaleScope& operator=(const ulkCLocaleScope&) = delete;

  private:
    locale_t mPrevious;
};

#endif  // ULK_SRC_PARAMS_C_LOCALE_H
