// A headless OpenGL 4.1 core context for GL tests, made as the host makes its own (Mesa's
// software renderer on machines without a GPU), current on the test thread with GLEW loaded.
// Under CI a missing GL fails the test; elsewhere the test is skipped with the reason.
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
