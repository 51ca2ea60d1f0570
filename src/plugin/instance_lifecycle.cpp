#include "plugin/instance_lifecycle.h"

#include <new>

#include "plugin/scopes_effect_data.h"
#include "plugin/scopes_shared_data.h"

namespace plugin::Scopes {

ScopesEffectData* instanceOf(const vtpl::HostEffectRecord& record) {
  return static_cast<ScopesEffectData*>(record.instance);
}

ScopesSharedData* sharedDataOf(const vtpl::HostEffectRecord& record) {
  return static_cast<ScopesSharedData*>(record.sharedData);
}

void createInstance(vtpl::HostEffectRecord& record) {
  record.instance = new (std::nothrow) ScopesEffectData();
}

void createSharedData(vtpl::HostEffectRecord& record) {
  record.sharedData = new (std::nothrow) ScopesSharedData();
}

int32_t destroyInstance(vtpl::HostEffectRecord& record) noexcept {
  try {
    // Deleted through the EffectData base, whose destructor is virtual.
    Plugin::gl::EffectData* instance = instanceOf(record);
    delete instance;
    record.instance = nullptr;
    return vtpl::kResultHandled;
  } catch (...) {
    return vtpl::kResultNotHandled;
  }
}

void destroySharedData(vtpl::HostEffectRecord& record) {
  delete sharedDataOf(record);
  record.sharedData = nullptr;
}

void attachControl(vtpl::HostEffectRecord& record) {
  if (ScopesSharedData* shared = sharedDataOf(record)) {
    shared->attachmentCount.fetch_add(1);
  }
}

void detachControl(vtpl::HostEffectRecord& record) {
  if (ScopesSharedData* shared = sharedDataOf(record)) {
    shared->attachmentCount.fetch_sub(1);
  }
}

}  // namespace plugin::Scopes
