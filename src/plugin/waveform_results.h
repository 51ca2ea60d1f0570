// The waveforms one effect publishes: which layers to analyse, the textures that hold the
// results, and storing them in the shared data for the other thread.
#ifndef WAVEFORM_PLUGIN_WAVEFORM_RESULTS_H
#define WAVEFORM_PLUGIN_WAVEFORM_RESULTS_H

#include <cstdint>
#include <memory>

#include "gl/texture.h"
#include "plugin/scopes_shared_data.h"
#include "scope/scope_layout.h"
#include "scope/waveform_analysis.h"

namespace plugin::Scopes {

class ScopesEffectData;

// True for a null identifier or the all-zero form: a render without identifier, which analyses
// the whole frame.
bool isNoIdentifier(const char* identifier);

// A new texture with storage of this size and format, created under the resource lock.
std::shared_ptr<Plugin::gl::Texture> acquireTexture(ScopesEffectData& instance, uint32_t width,
                                                    uint32_t height, uint32_t internalFormat,
                                                    float scale);

// What the analysis pass uses of the instance.
AnalysisResources analysisResources(ScopesEffectData& instance);

// Publishes a result: fenced first, so that a reader on the other context waits for it.
void storeResult(ScopesSharedData& shared, WaveformResult ScopesSharedData::*slot,
                 std::shared_ptr<Plugin::gl::Texture> texture, int32_t width, int32_t height);

// The published waveforms, taken under the shared data's lock; this context waits on the GPU
// for the commands that produced them before anything samples them. None without shared data.
ScopeWaveforms takePublishedWaveforms(ScopesSharedData* shared);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_WAVEFORM_RESULTS_H
