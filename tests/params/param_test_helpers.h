// Shared by the parameter suites: parameters that delete themselves, and a value's text.
#ifndef ULK_TESTS_PARAM_TEST_HELPERS_H
#define ULK_TESTS_PARAM_TEST_HELPERS_H

#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "ulk/ulk.h"

struct ParameterDeleter {
    void operator()(ulkParameter* p) const { ulkParameter::Delete(p); }
};
template <class Kind>
using Owned = std::unique_ptr<Kind, ParameterDeleter>;

/// The parameter's value at the time as WriteValue prints it.
inline std::string Written(ulkParameter* p, double time) {
    ulkMemoryFile file;
    EXPECT_TRUE(p->WriteValue(time, &file)) << p->ClassName();
    return file.GetText();
}

#endif  // ULK_TESTS_PARAM_TEST_HELPERS_H
