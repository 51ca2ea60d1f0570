// The analysis pass: one layer texture into a waveform texture, one point per sampled pixel.
#ifndef WAVEFORM_SCOPE_WAVEFORM_ANALYSIS_H
#define WAVEFORM_SCOPE_WAVEFORM_ANALYSIS_H

#include <memory>
#include <mutex>
#include <string>

#include "gl/effect_data.h"
#include "gl/resource_types.h"
#include "gl/texture.h"
#include "host_access/host_calls.h"
#include "scope/scope_settings.h"
#include "scope/waveform_result.h"
#include "vtpl/host_interface.h"

namespace plugin::Scopes {

inline constexpr char kWaveformProgram[] = "Waveform";
inline constexpr char kWaveformUIProgram[] = "WaveformUI";

// What of the instance the pass uses.
struct AnalysisResources {
  Plugin::gl::EffectData& programs;
  Plugin::gl::StencilBufferList& stencilPool;
  std::recursive_mutex& resourceLock;
  bool instancedDrawing;
};

struct AnalysisInput {
  vtpl::HostTexture layer;
  std::shared_ptr<Plugin::gl::Texture> target;  // defined by the caller (waveformTextureHeight)
  bool fullFrame = false;                       // analyse the whole frame, ignoring the clip points
  int32_t frameWidth = 0;
  int32_t frameHeight = 0;
  float layerScale[2] = {1.0f, 1.0f};  // layer texture size over frame size, per axis
  float renderScaleX = 1.0f;
  float renderScaleY = 1.0f;
  const float* projection = nullptr;
  const float* modelView = nullptr;
  bool linearInput = false;
  bool interfaceProgram = false;  // draw with "WaveformUI" (interface thread)
};

// The vertex stage of the analysis programs.
const std::string& analysisVertexSource();
// Builds "Waveform" and "WaveformUI" when missing; a build failure throws
// QvGLSLexception with the driver's log.
void ensureAnalysisPrograms(Plugin::gl::EffectData& programs, bool echo);

// Rows of the waveform texture: 256 for eight-bit output, else max(reference height, 256).
uint32_t waveformTextureHeight(uint32_t outputFormat, uint32_t referenceHeight);

// Point intensity and the stencil cap n = clamp(ceil(1 / intensity), 1, 100).
float pointIntensity(float brightness, float waveformHeight, const ValueRange& range,
                     float layerHeight);
int32_t saturationCap(float intensity);

// Runs the pass into the bound framebuffer. A pass left by an exception puts the GL state back
// as it found it.
void analyseLayer(const Plugin::host::HostCalls& host, const AnalysisResources& resources,
                  const AnalysisSettings& settings, const AnalysisInput& input);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_WAVEFORM_ANALYSIS_H
