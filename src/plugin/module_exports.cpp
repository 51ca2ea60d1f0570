// The module's only two public symbols.
#include <cstdint>

#include "plugin/notify.h"

extern "C" {

__attribute__((visibility("default"))) void PluginInfo(void* /*first*/, void* /*second*/,
                                                       vtpl::PluginInfoRecord* info) {
  plugin::Scopes::pluginInfo(info);
}

__attribute__((visibility("default"))) int32_t Notify(vtpl::HostContext context,
                                                      vtpl::HostEffectRecord* record,
                                                      int32_t message) {
  return plugin::Scopes::notify(context, record, message);
}

}  // extern "C"
