#include "plugin/draw_control.h"

#include <cstring>

#include "gl/host_textures.h"
#include "plugin/instance_lifecycle.h"
#include "plugin/scopes_effect_data.h"
#include "plugin/waveform_results.h"
#include "scope/comparison_layer.h"
#include "scope/parameter_ids.h"
#include "scope/scope_composition.h"
#include "scope/waveform_analysis.h"

namespace plugin::Scopes {
namespace {

using Plugin::gl::HostCalls;
using vtpl::HostEffectRecord;

constexpr char kControlId[] = "waveformControl";

// A fetched layer analysed with "WaveformUI" over its own size.
std::shared_ptr<Plugin::gl::Texture> analyseFetchedLayer(const HostCalls& host,
                                                         ScopesEffectData& instance,
                                                         const vtpl::HostTexture& layer,
                                                         int32_t time) {
  const float width = static_cast<float>(layer.width);
  const float height = static_cast<float>(layer.height);
  const Plugin::gl::Matrix4 projection = Plugin::gl::orthographicMatrix(width, height);
  AnalysisInput input;
  input.layer = layer;
  input.target = acquireTexture(
      instance, layer.width, waveformTextureHeight(layer.format, layer.height), layer.format, 1.0f);
  input.time = time;
  input.frameWidth = static_cast<int32_t>(layer.width);
  input.frameHeight = static_cast<int32_t>(layer.height);
  input.projection = projection.data();
  input.modelView = Plugin::gl::kIdentityMatrix.data();
  input.interfaceProgram = true;
  analyseLayer(host, analysisResources(instance), input);
  return input.target;
}

// The control's frame analysed on this thread: the comparison layer and the own layer, fetched
// from the host and handed back afterwards.
void analyseOnInterfaceThread(const HostCalls& host, ScopesEffectData& instance,
                              ScopesSharedData& shared, const vtpl::HostControlRecord& control) {
  const vtpl::HostTexture comparison =
      fetchComparisonLayer(host, control.time, 0, control.frameIndex);
  const bool showComparison =
      host.call(&HostEffectRecord::getBool, ParamId::kShowComparison, control.time) != 0;
  const int32_t type = host.call(&HostEffectRecord::getInt, ParamId::kScopeComparisonType, 0);
  const LayerChoice layers = chooseLayers(comparison.name != 0, type, showComparison);
  shared.analysedFrame = control.frameIndex;
  if (layers.comparison) {
    storeResult(shared, &ScopesSharedData::comparison,
                analyseFetchedLayer(host, instance, comparison, control.time),
                static_cast<int32_t>(comparison.width), static_cast<int32_t>(comparison.height));
  } else {
    storeResult(shared, &ScopesSharedData::comparison, nullptr, 1, 1);
  }
  if (comparison.name != 0) {
    host.call(&HostEffectRecord::releaseLayer, nullptr, comparison.name);
  }
  if (!layers.own) {
    storeResult(shared, &ScopesSharedData::primary, nullptr, 1, 1);
    return;
  }
  vtpl::HostTexture own{};
  host.call(&HostEffectRecord::fetchOwnLayer, 0, control.frameIndex, &own);
  if (own.name == 0) {
    return;
  }
  storeResult(shared, &ScopesSharedData::primary,
              analyseFetchedLayer(host, instance, own, control.time),
              static_cast<int32_t>(own.width), static_cast<int32_t>(own.height));
  host.call(&HostEffectRecord::releaseLayer, nullptr, own.name);
}

// The scope as the control shows it: the panel's background around a black waveform panel, the
// display flags read at time 0, labels in the interface thread's text state.
ScopeDrawing controlScopeDrawing(const HostCalls& host, const vtpl::HostControlRecord& control) {
  constexpr int32_t kDisplayTime = 0;
  ScopeDrawing drawing;
  drawing.background = {static_cast<float>(control.backgroundRed),
                        static_cast<float>(control.backgroundGreen),
                        static_cast<float>(control.backgroundBlue), 1.0f};
  drawing.showGuidelines =
      host.call(&HostEffectRecord::getBool, ParamId::kShowGuidelines, kDisplayTime) != 0;
  drawing.showAxisLabels =
      host.call(&HostEffectRecord::getBool, ParamId::kShowsAxisLabel, kDisplayTime) != 0;
  drawing.showColourBars =
      host.call(&HostEffectRecord::getBool, ParamId::kShowStandardColorBars, kDisplayTime) != 0;
  drawing.width = static_cast<float>(control.width);
  drawing.height = static_cast<float>(control.height);
  drawing.labelScaleX = static_cast<float>(control.labelScaleX);
  drawing.labelScaleY = static_cast<float>(control.labelScaleY);
  drawing.fillPanel = true;
  drawing.interfaceThread = true;
  return drawing;
}

}  // namespace

int32_t drawControl(const HostCalls& host, ScopesEffectData& instance) {
  const auto* control = static_cast<const vtpl::HostControlRecord*>(host.record().messageRecord);
  if (control == nullptr || control->controlId == nullptr ||
      std::strcmp(control->controlId, kControlId) != 0) {
    return vtpl::kResultHandled;
  }
  ScopesSharedData* shared = sharedDataOf(host.record());
  if (shared != nullptr && !isNoIdentifier(control->identifier) &&
      (control->force != 0 || shared->resultsFresh.load() == 0) && control->frameIndex >= 0 &&
      control->frameIndex < control->frameCount && control->frameIndex != shared->analysedFrame) {
    // The host's own drawing target is put back after the analysis.
    GLint attached = 0;
    GLint viewport[4] = {};
    glGetFramebufferAttachmentParameteriv(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0,
                                          GL_FRAMEBUFFER_ATTACHMENT_OBJECT_NAME, &attached);
    glGetIntegerv(GL_VIEWPORT, viewport);
    analyseOnInterfaceThread(host, instance, *shared, *control);
    shared->resultsFresh.exchange(1);
    if (attached != 0) {
      glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D,
                             static_cast<GLuint>(attached), 0);
      glViewport(viewport[0], viewport[1], viewport[2], viewport[3]);
    }
  }
  drawScope(host, instance, takePublishedWaveforms(shared), controlScopeDrawing(host, *control));
  instance.releaseProgram();
  Plugin::gl::unbindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, false);
  glFlush();
  glFinish();
  return vtpl::kResultHandled;
}

}  // namespace plugin::Scopes
