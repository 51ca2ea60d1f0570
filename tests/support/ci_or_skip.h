// Prerequisites that scripts/setup.sh installs (fonts, a GL display): under CI (CI=true) a
// missing one fails the test, elsewhere it skips the test with the reason.
#ifndef WAVEFORM_TESTS_SUPPORT_CI_OR_SKIP_H
#define WAVEFORM_TESTS_SUPPORT_CI_OR_SKIP_H

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <filesystem>

namespace waveform_test {

inline bool underCi() {
  const char* ci = std::getenv("CI");
  return ci != nullptr && std::strcmp(ci, "true") == 0;
}

}  // namespace waveform_test

// Ends the test: a failure under CI, a skip elsewhere. `message` is streamed: "a " << b.
#define CI_OR_SKIP(message)           \
  do {                                \
    if (::waveform_test::underCi()) { \
      FAIL() << message;              \
    }                                 \
    GTEST_SKIP() << message;          \
  } while (false)

// Ends the test that way when the file is missing.
#define REQUIRE_FILE(path)                                                       \
  do {                                                                           \
    if (!std::filesystem::exists(path)) {                                        \
      CI_OR_SKIP("missing " << (path) << " (install it with scripts/setup.sh)"); \
    }                                                                            \
  } while (false)

#endif  // WAVEFORM_TESTS_SUPPORT_CI_OR_SKIP_H
