// The effect's door to the host: refusals and empty slots become "Plugin Error".
#include "host_access/host_calls.h"

#include <gtest/gtest.h>

namespace {

using Plugin::host::HostCalls;
using Plugin::host::PluginException;
using vtpl::HostEffectRecord;

int32_t refusingEndGroup(vtpl::HostContext) {
  return 3;
}
int32_t acceptingEndGroup(vtpl::HostContext) {
  return 0;
}

TEST(HostCalls, EmptySlotIsAPluginErrorNotAJump) {
  HostEffectRecord record{};
  const HostCalls host(nullptr, record);
  try {
    host.call(&HostEffectRecord::getInt, "waveformMode", 0);
    FAIL() << "no exception";
  } catch (const PluginException& error) {
    EXPECT_STREQ(error.what(), "Plugin Error");
  }
}

TEST(HostCalls, RefusedDeclarationIsAPluginError) {
  HostEffectRecord record{};
  record.endGroup = refusingEndGroup;
  EXPECT_THROW(HostCalls(nullptr, record).declare(&HostEffectRecord::endGroup), PluginException);
  record.endGroup = acceptingEndGroup;
  EXPECT_NO_THROW(HostCalls(nullptr, record).declare(&HostEffectRecord::endGroup));
}

}  // namespace
