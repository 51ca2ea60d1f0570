// A host that refuses, throws or leaves slots empty gets a result code, never a crash.
#include <gtest/gtest.h>

#include <string>
#include <tuple>

#include "host_error.h"
#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::host::EffectHost;

// Messages 3 and 0, then the declarations; returns the result of message 2.
int32_t declareWith(EffectHost& host) {
  EXPECT_EQ(host.send(vtpl::kMessageCreateSharedData), 1);
  EXPECT_EQ(host.send(vtpl::kMessageCreateInstance), 1);
  return host.send(vtpl::kMessageDeclareParameters);
}

// A refused declaration ends the declarations there with result 5, except the custom control: a
// host without custom controls still gets every other parameter. The instance survives either way.
TEST(Failures, RefusedDeclarationEndsTheDeclarationsThere) {
  for (int refused = 1; refused <= 25; ++refused) {
    EffectHost host(waveformModule(), declaredStateSettings());
    host.faults().rejectDeclaration = refused;
    EXPECT_EQ(declareWith(host), refused == 1 ? 1 : 5) << refused;
    const auto& declared = host.parameters().parameters();
    ASSERT_EQ(declared.size(), refused == 1 ? 24u : refused - 1u) << refused;
    EXPECT_EQ(host.parameters().find("waveformControl") != nullptr, refused > 1) << refused;
    EXPECT_EQ(host.send(vtpl::kMessageDestroyInstance), 1) << refused;
  }
}

TEST(Failures, ExceptionsThrownByHostCallbacksBecomeResultFive) {
  // The failing callback, whether it throws a non-standard exception, the message, the parameter.
  const std::tuple<const char*, bool, int32_t, const char*> cases[] = {
      {"getInt", false, 7, "waveformMode"},
      {"getInt", true, 7, "blendType"},
      {"setParamVisible", false, 7, "scopeComparisonType"},
      {"setBool", true, 13, "colorSpace"},
      {"setBool", false, 14, "colorSpace"},
  };
  for (const auto& [callback, nonStandard, message, id] : cases) {
    auto host = openHost();
    host->faults().throwInCallback = callback;
    host->faults().throwNonStandard = nonStandard;
    EXPECT_EQ(host->editParameter(id, message), 5) << callback;
    host->faults().throwInCallback.clear();
    EXPECT_EQ(host->changeParameter(id), 1) << "module unusable after " << callback;
  }
  for (const bool nonStandard : {false, true}) {  // during the declarations
    EffectHost host(waveformModule(), declaredStateSettings());
    host.faults().throwInCallback = "defineBool";
    host.faults().throwNonStandard = nonStandard;
    EXPECT_EQ(declareWith(host), 5);
    EXPECT_EQ(host.parameters().parameters().size(), 8u);  // up to "showComparison"
  }
}

// Both flows with everything on: a comparison layer, an attached control, the scope rendered
// into the layer; then a stale frame the control analyses itself on the interface thread.
void renderAndDrawEverything(EffectHost& host) {
  host.parameters().writeInt("blendType", 4);  // Screen
  host.parameters().setFromText("scopePositionTL", "-16, 8");
  host.parameters().setFromText("scopePositionBR", "16, -8");
  host.setComparisonLayer(greyPicture(32, 16))->info.frameCount = 2;
  host.attachControl();
  vtpl::host::FrameOptions second;
  second.frameIndex = 1;
  for (const bool attached : {true, false}) {
    try {
      host.renderFrame(greyPicture(32, 16), false, second);
    } catch (const vtpl::host::HostError&) {
      // The render answered 5; what it borrowed is counted by the caller.
    }
    // Then nothing attached and nothing blended: the results go stale.
    host.send(attached ? vtpl::kMessageDetach : vtpl::kMessageAcknowledged);
    host.parameters().writeInt("blendType", 0);
  }
  vtpl::host::ControlOptions first;
  first.frameCount = 2;
  host.drawControl(first);
}

// Whatever callback fails, every texture the host lent (a fetched layer, the own layer, a working
// texture) and every buffer it created goes back to it.
TEST(Failures, EveryFailingCallbackLeavesNothingBorrowed) {
  const char* const callbacks[] = {
      "progress",      "getInt",          "getBool",     "getFloat",     "getAngle",
      "getPoint",      "getColor",        "getLayer",    "getLayerInfo", "fetchLayer",
      "fetchOwnLayer", "allocateTexture", "vertexArray", "createBuffer", "releaseBuffer",
      "releaseLayer",  "redrawControl",
  };
  for (const char* failing : callbacks) {
    auto host = openHost(glSettings());
    host->faults().throwInCallback = failing;
    renderAndDrawEverything(*host);
    EXPECT_GT(host->callbackCount(failing), 0) << failing << " was never called";
    // The failing callback fails every time it is called: a host that refuses every texture back
    // has still been offered each one.
    const std::string name = failing;
    EXPECT_EQ(host->texturesNotHandedBack(),
              name == "releaseLayer" ? static_cast<size_t>(host->callbackCount(failing)) : 0u)
        << "failing " << failing;
    const int buffers = name == "createBuffer" ? 0 : host->callbackCount("createBuffer");
    EXPECT_EQ(host->callbackCount("releaseBuffer"), buffers) << "failing " << failing;
  }
}

}  // namespace
}  // namespace waveform_test
