// The host's GL threads: a task's exception reaches the caller, and the thread knows itself.
#include <gtest/gtest.h>

#include <stdexcept>

#include "gl_thread.h"

namespace waveform_test {
namespace {

TEST(GlThread, RethrowsWhatItsTaskThrows) {
  vtpl::host::GlThread thread("render");
  EXPECT_THROW(thread.run([] { throw std::runtime_error("task failed"); }), std::runtime_error);
  bool ran = false;
  thread.run([&] { ran = vtpl::host::GlThread::current() == &thread; });
  EXPECT_TRUE(ran);
  EXPECT_EQ(vtpl::host::GlThread::current(), nullptr);
}

}  // namespace
}  // namespace waveform_test
