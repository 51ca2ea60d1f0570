// The instance and shared data as the dispatcher creates, counts and destroys them.
#include "plugin/instance_lifecycle.h"

#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "plugin/notify.h"
#include "plugin/scopes_effect_data.h"
#include "plugin/scopes_shared_data.h"

namespace {

using namespace plugin::Scopes;

TEST(InstanceLifecycle, AttachAndDetachCount) {
  vtpl::HostEffectRecord record{};
  ASSERT_EQ(notify(nullptr, &record, vtpl::kMessageCreateSharedData), 1);
  for (int32_t message : {1001, 1001, 1001, 1002}) {
    EXPECT_EQ(notify(nullptr, &record, message), 1);
  }
  EXPECT_EQ(sharedDataOf(record)->attachmentCount.load(), 2);
  for (int32_t message : {1002, 1002, 1002}) {
    EXPECT_EQ(notify(nullptr, &record, message), 1);
  }
  EXPECT_EQ(sharedDataOf(record)->attachmentCount.load(), -1);
  notify(nullptr, &record, vtpl::kMessageDestroySharedData);
}

TEST(InstanceLifecycle, AttachmentsFromTwoThreadsAreNotLost) {
  vtpl::HostEffectRecord record{};
  ASSERT_EQ(notify(nullptr, &record, vtpl::kMessageCreateSharedData), 1);
  constexpr int kRounds = 20000;
  auto attachThenDetachHalf = [&record] {
    for (int i = 0; i < kRounds; ++i) {
      notify(nullptr, &record, vtpl::kMessageAttach);
      if (i % 2 == 0) {
        notify(nullptr, &record, vtpl::kMessageDetach);
      }
    }
  };
  std::thread render(attachThenDetachHalf);
  std::thread interface(attachThenDetachHalf);
  render.join();
  interface.join();
  EXPECT_EQ(sharedDataOf(record)->attachmentCount.load(), kRounds);
  notify(nullptr, &record, vtpl::kMessageDestroySharedData);
}

// This test program has no GL: a host that renders or draws the control without having set the
// instance up gets "not handled" instead of a crash in an unloaded GL entry point.
TEST(InstanceLifecycle, RenderAndControlBeforeGlIsSetUpAreNotHandled) {
  vtpl::HostEffectRecord record{};
  ASSERT_EQ(notify(nullptr, &record, vtpl::kMessageCreateSharedData), 1);
  ASSERT_EQ(notify(nullptr, &record, vtpl::kMessageCreateInstance), 1);
  vtpl::HostTexture layer{};
  vtpl::HostRenderRecord frame{};
  frame.source = &layer;
  frame.destination = &layer;
  record.messageRecord = &frame;
  EXPECT_EQ(notify(nullptr, &record, vtpl::kMessageRender), 2);
  vtpl::HostControlRecord control{};
  control.controlId = "waveformControl";
  control.width = 100;
  control.height = 50;
  record.messageRecord = &control;
  EXPECT_EQ(notify(nullptr, &record, vtpl::kMessageDrawControl), 2);
  record.messageRecord = nullptr;
  EXPECT_EQ(notify(nullptr, &record, vtpl::kMessageDestroyInstance), 1);
  EXPECT_EQ(notify(nullptr, &record, vtpl::kMessageDestroySharedData), 1);
}

}  // namespace
