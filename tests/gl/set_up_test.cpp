// Message 8 with a context current: the instance's programs exist afterwards.
#include <gtest/gtest.h>

#include "gl/copy_pass.h"
#include "gl_test_context.h"
#include "plugin/instance_lifecycle.h"
#include "plugin/notify.h"
#include "plugin/scopes_effect_data.h"
#include "scope/blend_shader.h"
#include "scope/graticule_drawing.h"
#include "scope/waveform_analysis.h"
#include "scope/waveform_display.h"

namespace waveform_test {
namespace {

using namespace plugin::Scopes;

class SetUp : public GlTest {};

TEST_F(SetUp, BuildsTheProgramsOnceAndEnablesInstancedDrawing) {
  vtpl::HostEffectRecord record{};
  ASSERT_EQ(notify(nullptr, &record, vtpl::kMessageCreateInstance), 1);
  ScopesEffectData& instance = *instanceOf(record);
  EXPECT_EQ(notify(nullptr, &record, vtpl::kMessageSetUp), 1);
  EXPECT_TRUE(instance.instancedDrawing);
  EXPECT_GE(instance.programId(Plugin::gl::kCopyProgram), 0);
  EXPECT_GE(instance.programId(Plugin::gl::kClearProgram), 0);
  EXPECT_GE(instance.programId(kCopyWaveformProgram), 0);
  EXPECT_GE(instance.programId(kFillWaveformBackgroundProgram), 0);
  EXPECT_GE(instance.programId(kGuidelineProgram), 0);
  EXPECT_GE(instance.programId(kBlendShaderProgram), 0);
  EXPECT_EQ(notify(nullptr, &record, vtpl::kMessageSetUp), 1);
  EXPECT_GE(instance.programId(kWaveformProgram), 0);
  EXPECT_GE(instance.programId(kWaveformUIProgram), 0);
  EXPECT_EQ(instance.programCount(), 8);
  EXPECT_EQ(notify(nullptr, &record, vtpl::kMessageDestroyInstance), 1);
}

}  // namespace
}  // namespace waveform_test
