// A headless OpenGL 4.1 core context for GL tests: Mesa's surfaceless EGL platform, made current
// on the test thread, with GLEW initialised. Under CI a missing GL fails the test; elsewhere the
// test is skipped with the reason.
#ifndef WAVEFORM_TESTS_GL_GL_TEST_CONTEXT_H
#define WAVEFORM_TESTS_GL_GL_TEST_CONTEXT_H

#include <gtest/gtest.h>

#include <string>

namespace waveform_test {

// Creates the process's test context on first use; empty when it is current, else the reason.
std::string makeTestContextCurrent();

class GlTest : public testing::Test {
 protected:
  void SetUp() override;
};

}  // namespace waveform_test

#endif  // WAVEFORM_TESTS_GL_GL_TEST_CONTEXT_H
