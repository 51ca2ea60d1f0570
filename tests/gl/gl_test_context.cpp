#include "gl_test_context.h"

#include <cstdlib>
#include <cstring>

#include "headless_gl.h"

namespace waveform_test {

std::string makeTestContextCurrent() {
  static const vtpl::host::HeadlessContext context = vtpl::host::createCurrentContext(nullptr);
  if (context.error.empty()) {
    vtpl::host::makeCurrent(context.context);
  }
  return context.error;
}

void GlTest::SetUp() {
  const std::string failure = makeTestContextCurrent();
  if (failure.empty()) {
    return;
  }
  const char* ci = std::getenv("CI");
  if (ci != nullptr && std::strcmp(ci, "true") == 0) {
    FAIL() << "GL is required under CI: " << failure;
  }
  GTEST_SKIP() << "no GL: " << failure;
}

}  // namespace waveform_test
