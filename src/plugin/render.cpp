#include "plugin/render.h"

#include <array>

#include "gl/copy_pass.h"
#include "gl/texture_units.h"
#include "plugin/comparison_layer.h"
#include "plugin/instance_lifecycle.h"
#include "plugin/scope_settings_reader.h"
#include "plugin/scopes_effect_data.h"
#include "plugin/waveform_results.h"
#include "scope/parameter_choices.h"
#include "scope/render_to_layer.h"
#include "scope/waveform_analysis.h"

namespace plugin::Scopes {
namespace {

using Plugin::host::HostCalls;
using vtpl::HostEffectRecord;

constexpr int32_t kProgressTotal = 100;
constexpr char kControlId[] = "waveformControl";

// Asks the host how far the render is; once it asks to stop, the render stays stopped.
class Progress {
 public:
  explicit Progress(const HostCalls& host) : host_(host) {}
  bool report(int32_t done) {
    stopped_ = host_.call(&HostEffectRecord::progress, done, kProgressTotal) != 0 || stopped_;
    return stopped_;
  }
  bool stopped() const { return stopped_; }

 private:
  const HostCalls& host_;
  bool stopped_ = false;
};

// A layer of the frame analysed into a new waveform texture of the output's format, as wide as
// the reference size and as high as the output's format and the reference height ask.
std::shared_ptr<Plugin::gl::Texture> analyseFrameLayer(
    const HostCalls& host, ScopesEffectData& instance, const AnalysisSettings& settings,
    const vtpl::HostRenderRecord& frame, const vtpl::HostTexture& layer,
    const vtpl::HostTexture& reference, bool fullFrame) {
  const uint32_t format = frame.destination->format;
  AnalysisInput input;
  input.layer = layer;
  input.target =
      acquireTexture(instance, reference.width, waveformTextureHeight(format, reference.height),
                     format, frame.textureScale);
  input.fullFrame = fullFrame;
  input.frameWidth = frame.frameWidth;
  input.frameHeight = frame.frameHeight;
  input.layerScale[0] = frame.frameWidth > 0 ? float(layer.width) / frame.frameWidth : 1;
  input.layerScale[1] = frame.frameHeight > 0 ? float(layer.height) / frame.frameHeight : 1;
  input.renderScaleX = frame.renderScaleX;
  input.renderScaleY = frame.renderScaleY;
  input.projection = frame.projection;
  input.modelView = frame.modelView;
  input.linearInput = frame.linearLight != 0;
  analyseLayer(host, analysisResources(instance), settings, input);
  return input.target;
}

// Whether this frame's waveforms are needed: by an attached control (unless the host will not
// show the frame), by a render without identifier, or by the scope rendered into the layer.
bool needsAnalysis(const vtpl::HostRenderRecord& frame, const ScopesSharedData& shared,
                   bool noIdentifier, bool blending) {
  if (frame.unwatched != 0) {
    return blending;
  }
  return shared.attachmentCount.load() > 0 || noIdentifier || blending;
}

// Analyses the comparison layer and the own layer as the comparison settings choose, and
// publishes each result unless the host stopped the render meanwhile.
void analyseAndPublish(const HostCalls& host, ScopesEffectData& instance, ScopesSharedData& shared,
                       const vtpl::HostRenderRecord& frame, bool noIdentifier, bool blending,
                       Progress& progress) {
  if (!needsAnalysis(frame, shared, noIdentifier, blending) || progress.stopped()) {
    if (frame.unwatched == 0 && shared.attachmentCount.load() <= 0 && !noIdentifier) {
      shared.resultsFresh.exchange(0);
    }
    return;
  }
  Plugin::host::LayerHandle comparison =
      fetchComparisonLayer(host, frame.time, frame.layerArgument, frame.frameIndex, &frame);
  const AnalysisSettings settings = readAnalysisSettings(host, frame.time);
  const ComparisonSettings choice = readComparisonSettings(host, frame.time);
  const LayerChoice layers = chooseLayers(!comparison.empty(), choice.type, choice.showComparison);

  // Once stopped, nothing more is analysed or stored; the fetched layer goes back all the same.
  if (progress.report(10)) {
    return;
  }
  shared.analysedFrame = frame.frameIndex;
  if (layers.comparison) {
    auto waveform = analyseFrameLayer(host, instance, settings, frame, comparison.texture(),
                                      comparison.texture(), noIdentifier);
    if (!progress.report(40)) {
      storeResult(shared, &ScopesSharedData::comparison, std::move(waveform), frame.frameWidth,
                  frame.frameHeight);
    }
  } else {
    storeResult(shared, &ScopesSharedData::comparison, nullptr, 1, 1);
  }
  comparison.release();
  if (progress.report(50)) {
    return;
  }
  if (layers.own) {
    auto waveform = analyseFrameLayer(host, instance, settings, frame, *frame.source,
                                      *frame.destination, noIdentifier);
    if (!progress.report(80)) {
      storeResult(shared, &ScopesSharedData::primary, std::move(waveform), frame.frameWidth,
                  frame.frameHeight);
    }
  } else {
    storeResult(shared, &ScopesSharedData::primary, nullptr, 1, 1);
  }
  if (frame.unwatched == 0 && !progress.stopped()) {
    shared.resultsFresh.exchange(1);
    host.call(&HostEffectRecord::redrawControl, kControlId);
  }
}

}  // namespace

int32_t render(const HostCalls& host, ScopesEffectData& instance) {
  const auto* frame = static_cast<const vtpl::HostRenderRecord*>(host.record().messageRecord);
  if (frame == nullptr || frame->source == nullptr || frame->destination == nullptr) {
    return vtpl::kResultNotHandled;
  }
  const bool noIdentifier = isNoIdentifier(frame->identifier);
  Progress progress(host);
  progress.report(0);
  const int32_t blend = readBlendType(host, frame->time);
  ScopesSharedData* shared = sharedDataOf(host.record());
  if (shared != nullptr) {
    analyseAndPublish(host, instance, *shared, *frame, noIdentifier, blend != kBlendNone, progress);
  }

  Plugin::gl::copyPass(host, instance, *frame->source, *frame->destination);
  if (!progress.report(90) && blend != kBlendNone) {
    renderToLayer(host, instance, takePublishedWaveforms(shared), *frame,
                  readRenderToLayerSettings(host, frame->time), readCompositionSettings(host));
  }

  // The host expects its output attached, nothing bound on unit 0 and no program in use.
  Plugin::gl::attachTexture(*frame->destination, 0, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D);
  Plugin::gl::unbindTextureUnit(GL_TEXTURE0, GL_TEXTURE_2D, false);
  instance.releaseProgram();
  return vtpl::kResultHandled;
}

}  // namespace plugin::Scopes
