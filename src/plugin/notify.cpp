#include "plugin/notify.h"

#include "gl/glew_setup.h"
#include "gl/host_calls.h"
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

const char* changedParameterId(const HostEffectRecord& record) {
  return record.changed != nullptr ? record.changed->id : nullptr;
}

int32_t handleMessage(HostContext context, HostEffectRecord& record, int32_t message) {
  const Plugin::gl::HostCalls host(context, record);
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
  } catch (...) {
    // The effect's own failures ("Plugin Error", shader failures) and anything a host callback or
    // the runtime throws alike: the host gets a failed result instead of a terminated process.
    return kResultFailed;
  }
}

}  // namespace plugin::Scopes
