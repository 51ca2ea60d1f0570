#include "plugin/notify.h"

#include <cstdio>

#include "gl/glew_setup.h"
#include "gl/glsl_exception.h"
#include "host_access/host_calls.h"
#include "plugin/draw_control.h"
#include "plugin/instance_lifecycle.h"
#include "plugin/parameter_declarations.h"
#include "plugin/parameter_reactions.h"
#include "plugin/plugin_info.h"
#include "plugin/render.h"
#include "plugin/set_up.h"

namespace plugin::Scopes {
namespace {

using namespace vtpl;

void reportShaderFailure(const Plugin::gl::QvGLSLexception& failure) noexcept {
  std::fprintf(stderr, "Waveform: %s\n", failure.what());
  if (!failure.log().empty()) {
    std::fprintf(stderr, "%s\n", failure.log().c_str());
  }
  std::fflush(stderr);
}

const char* changedParameterId(const HostEffectRecord& record) {
  return record.changed != nullptr ? record.changed->id : nullptr;
}

int32_t handleMessage(HostContext context, HostEffectRecord& record, int32_t message) {
  const Plugin::host::HostCalls host(context, record);
  switch (message) {
    case kMessageCreateInstance:
      createInstance(record);
      return kResultHandled;
    case kMessageDestroyInstance:
      return destroyInstance(record);
    case kMessageDeclareParameters:
      declareParameters(host);
      return kResultHandled;
    case kMessageCreateSharedData:
      createSharedData(record);
      return kResultHandled;
    case kMessageDestroySharedData:
      destroySharedData(record);
      return kResultHandled;
    case kMessageParameterChanged:
      parameterChanged(host, changedParameterId(record));
      return kResultHandled;
    case kMessageSetUp:
      if (instanceOf(record) == nullptr) {
        return kResultNotHandled;
      }
      setUp(host, *instanceOf(record));
      return kResultHandled;
    case kMessageRender:
      if (instanceOf(record) == nullptr || !Plugin::gl::glewLoaded()) {
        return kResultNotHandled;
      }
      return render(host, *instanceOf(record));
    case kMessageParameterEdited:
    case kMessageParameterEditedAlt:
      parameterEdited(host, changedParameterId(record));
      return kResultHandled;
    case kMessageAcknowledged:
      return kResultHandled;
    case kMessageAttach:
      attachControl(record);
      return kResultHandled;
    case kMessageDetach:
      detachControl(record);
      return kResultHandled;
    case kMessageDrawControl:
      if (instanceOf(record) == nullptr || !Plugin::gl::glewLoaded()) {
        return kResultNotHandled;
      }
      return drawControl(host, *instanceOf(record));
    default:
      if (message >= kMessageAcknowledgedFirst && message <= kMessageAcknowledgedLast) {
        return kResultHandled;
      }
      return kResultNotHandled;
  }
}

}  // namespace

void pluginInfo(PluginInfoRecord* info) noexcept {
  if (info != nullptr) {
    fillPluginInfo(*info);
  }
}

int32_t notify(HostContext context, HostEffectRecord* record, int32_t message) noexcept {
  if (record == nullptr) {
    return kResultNotHandled;
  }
  try {
    return handleMessage(context, *record, message);
  } catch (const Plugin::gl::QvGLSLexception& failure) {
    // A driver that cannot build a program says why only in its log: the user sees it whether or
    // not the host asked for verbose output.
    reportShaderFailure(failure);
    return kResultFailed;
  } catch (...) {
    // The effect's own failures ("Plugin Error", shader failures) and anything a host callback or
    // the runtime throws alike: the host gets a failed result instead of a terminated process.
    return kResultFailed;
  }
}

}  // namespace plugin::Scopes
