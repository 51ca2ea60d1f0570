#include "host_access/layer_handle.h"

#include <utility>

namespace Plugin::host {

LayerHandle::LayerHandle(const HostCalls& host, const void* messageRecord,
                         const vtpl::HostTexture& texture)
    : record_(&host.record()),
      context_(host.context()),
      messageRecord_(messageRecord),
      texture_(texture) {}

LayerHandle::~LayerHandle() {
  try {
    release();
  } catch (...) {
    // The host refused the texture back; a destructor can only let it go.
  }
}

LayerHandle::LayerHandle(LayerHandle&& other) noexcept
    : record_(other.record_),
      context_(other.context_),
      messageRecord_(other.messageRecord_),
      texture_(std::exchange(other.texture_, vtpl::HostTexture{})) {}

void LayerHandle::release() {
  if (texture_.name == 0 || record_ == nullptr) {
    return;
  }
  const uint32_t name = std::exchange(texture_, vtpl::HostTexture{}).name;
  HostCalls(context_, *record_).call(&vtpl::HostEffectRecord::releaseLayer, messageRecord_, name);
}

}  // namespace Plugin::host
