#include "plugin/draw_control.h"

#include <cstring>

#include "gl/pass_state_guard.h"
#include "gl/quad_maths.h"
#include "gl/texture_units.h"
#include "plugin/comparison_layer.h"
#include "plugin/instance_lifecycle.h"
#include "plugin/parameter_ids.h"
#include "plugin/scope_settings_reader.h"
#include "plugin/scopes_effect_data.h"
#include "plugin/waveform_results.h"
#include "scope/scope_composition.h"
#include "scope/waveform_analysis.h"

namespace plugin::Scopes {
namespace {

using Plugin::host::HostCalls;
using vtpl::HostEffectRecord;

constexpr char kControlId[] = "waveformControl";
constexpr int32_t kDisplayTime = 0;

// A fetched layer analysed with "WaveformUI" over its own size.
std::shared_ptr<Plugin::gl::Texture> analyseFetchedLayer(const HostCalls& host,
                                                         ScopesEffectData& instance,
                                                         const AnalysisSettings& settings,
                                                         const vtpl::HostTexture& layer) {
  const float width = static_cast<float>(layer.width);
  const float height = static_cast<float>(layer.height);
  const Plugin::gl::Matrix4 projection = Plugin::gl::orthographicMatrix(width, height);
  AnalysisInput input;
  input.layer = layer;
  input.target = acquireTexture(
      instance, layer.width, waveformTextureHeight(layer.format, layer.height), layer.format, 1.0f);
  input.frameWidth = static_cast<int32_t>(layer.width);
  input.frameHeight = static_cast<int32_t>(layer.height);
  input.projection = projection.data();
  input.modelView = Plugin::gl::kIdentityMatrix.data();
  input.interfaceProgram = true;
  analyseLayer(host, analysisResources(instance), settings, input);
  return input.target;
}

// Stores the analysis of a fetched layer, measured over the layer's own size.
void storeFetchedResult(const HostCalls& host, ScopesEffectData& instance,
                        const AnalysisSettings& settings, ScopesSharedData& shared,
                        WaveformResult ScopesSharedData::*slot, const vtpl::HostTexture& layer) {
  storeResult(shared, slot, analyseFetchedLayer(host, instance, settings, layer),
              static_cast<int32_t>(layer.width), static_cast<int32_t>(layer.height));
}

// The control's frame analysed on this thread: the comparison layer and the own layer, fetched
// from the host and handed back afterwards.
void analyseOnInterfaceThread(const HostCalls& host, ScopesEffectData& instance,
                              ScopesSharedData& shared, const vtpl::HostControlRecord& control) {
  Plugin::host::LayerHandle comparison =
      fetchComparisonLayer(host, control.time, 0, control.frameIndex, nullptr);
  const AnalysisSettings settings = readAnalysisSettings(host, control.time);
  const ComparisonSettings choice = readComparisonSettings(host, control.time);
  const LayerChoice layers = chooseLayers(!comparison.empty(), choice.type, choice.showComparison);
  shared.analysedFrame = control.frameIndex;
  if (layers.comparison) {
    storeFetchedResult(host, instance, settings, shared, &ScopesSharedData::comparison,
                       comparison.texture());
  } else {
    storeResult(shared, &ScopesSharedData::comparison, nullptr, 1, 1);
  }
  comparison.release();
  if (!layers.own) {
    storeResult(shared, &ScopesSharedData::primary, nullptr, 1, 1);
    return;
  }
  vtpl::HostTexture fetched{};
  host.call(&HostEffectRecord::fetchOwnLayer, 0, control.frameIndex, &fetched);
  Plugin::host::LayerHandle own(host, nullptr, fetched);
  if (own.empty()) {
    // No layer for this frame: no waveform either, rather than the last frame's shown as this one's.
    storeResult(shared, &ScopesSharedData::primary, nullptr, 1, 1);
    return;
  }
  storeFetchedResult(host, instance, settings, shared, &ScopesSharedData::primary, own.texture());
  own.release();
}

// The scope as the control shows it: the panel's background around a black waveform panel, the
// display flags read at time 0, labels in the interface thread's text state.
ScopeDrawing controlScopeDrawing(const HostCalls& host, const vtpl::HostControlRecord& control) {
  const auto flag = [&host](const char* id) { return readBool(host, id, kDisplayTime); };
  ScopeDrawing drawing;
  drawing.composition = readCompositionSettings(host);
  drawing.background = {static_cast<float>(control.backgroundRed),
                        static_cast<float>(control.backgroundGreen),
                        static_cast<float>(control.backgroundBlue), 1.0f};
  drawing.showGuidelines = flag(ParamId::kShowGuidelines);
  drawing.showColourBars = flag(ParamId::kShowStandardColorBars);
  drawing.labels = {flag(ParamId::kShowsAxisLabel), static_cast<float>(control.labelScaleX),
                    static_cast<float>(control.labelScaleY), true};
  drawing.width = static_cast<float>(control.width);
  drawing.height = static_cast<float>(control.height);
  drawing.fillPanel = true;
  return drawing;
}

// The control analyses its frame itself when the render's results do not match it: asked to,
// or stale, for a frame inside the clip that it has not analysed last.
bool analysesOwnFrame(const ScopesSharedData& shared, const vtpl::HostControlRecord& control) {
  return !isNoIdentifier(control.identifier) &&
         (control.force != 0 || shared.resultsFresh.load() == 0) && control.frameIndex >= 0 &&
         control.frameIndex < control.frameCount && control.frameIndex != shared.analysedFrame;
}

}  // namespace

int32_t drawControl(const HostCalls& host, ScopesEffectData& instance) {
  const auto* control = static_cast<const vtpl::HostControlRecord*>(host.record().messageRecord);
  if (control == nullptr || control->controlId == nullptr ||
      std::strcmp(control->controlId, kControlId) != 0) {
    return vtpl::kResultHandled;
  }
  ScopesSharedData* shared = sharedDataOf(host.record());
  if (shared != nullptr && analysesOwnFrame(*shared, *control)) {
    // The analysis draws into targets of its own; the host's drawing target comes back after it.
    const Plugin::gl::PassStateGuard hostTarget(Plugin::gl::PassStateGuard::Restore::kAlways);
    analyseOnInterfaceThread(host, instance, *shared, *control);
    shared->resultsFresh.exchange(1);
  }
  drawScope(host, instance, takePublishedWaveforms(shared), controlScopeDrawing(host, *control));
  instance.releaseProgram();
  Plugin::gl::unbindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, false);
  glFlush();
  glFinish();
  return vtpl::kResultHandled;
}

}  // namespace plugin::Scopes
