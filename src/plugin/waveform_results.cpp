#include "plugin/waveform_results.h"

#include <cstring>

#include "plugin/scopes_effect_data.h"
#include "vtpl/host_interface.h"

namespace plugin::Scopes {

bool isNoIdentifier(const char* identifier) {
  static constexpr char kNoIdentifier[] = "00000000-0000-0000-0000-000000000000";
  return identifier == nullptr ||
         std::memcmp(identifier, kNoIdentifier, vtpl::kIdentifierChars) == 0;
}

std::shared_ptr<Plugin::gl::Texture> acquireTexture(ScopesEffectData& instance, uint32_t width,
                                                    uint32_t height, uint32_t internalFormat,
                                                    float scale) {
  const std::lock_guard<std::recursive_mutex> guard(instance.resourceLock);
  auto texture = Plugin::gl::Texture::create();
  texture->define(width, height, internalFormat, scale);
  return texture;
}

AnalysisResources analysisResources(ScopesEffectData& instance) {
  return {instance, instance.stencilPool, instance.resourceLock, instance.instancedDrawing};
}

void storeResult(ScopesSharedData& shared, WaveformResult ScopesSharedData::*slot,
                 std::shared_ptr<Plugin::gl::Texture> texture, int32_t width, int32_t height) {
  const std::lock_guard<std::mutex> guard(shared.lock);
  if (texture != nullptr) {
    texture->placeFence();
  }
  shared.*slot = WaveformResult{std::move(texture), width, height};
}

ScopeWaveforms takePublishedWaveforms(ScopesSharedData* shared) {
  ScopeWaveforms waveforms;
  if (shared == nullptr) {
    return waveforms;
  }
  const std::lock_guard<std::mutex> guard(shared->lock);
  waveforms.primary = shared->primary;
  waveforms.comparison = shared->comparison;
  for (const WaveformResult* result : {&waveforms.primary, &waveforms.comparison}) {
    if (result->texture != nullptr) {
      result->texture->waitAndDeleteFence();
    }
  }
  return waveforms;
}

}  // namespace plugin::Scopes
