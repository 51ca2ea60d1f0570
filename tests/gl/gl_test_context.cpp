#include "gl_test_context.h"

#include "ci_or_skip.h"
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
  CI_OR_SKIP("no GL: " << failure);
}

}  // namespace waveform_test
