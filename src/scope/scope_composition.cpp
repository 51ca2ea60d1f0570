#include "scope/scope_composition.h"

#include <algorithm>
#include <cmath>

#include "gl/pass_state_guard.h"
#include "gl/quad_maths.h"
#include "scope/channel_modes.h"
#include "scope/graticule_drawing.h"
#include "scope/guidelines.h"
#include "scope/parameter_choices.h"
#include "scope/scope_layout.h"
#include "scope/waveform_display.h"

namespace plugin::Scopes {
namespace {

using Plugin::host::HostCalls;

constexpr std::array<float, 4> kPanelBlack = {0, 0, 0, 1};

// One waveform in its part of the panel, and the rows of its texture shown there.
struct PanelPart {
  const WaveformResult* result;
  Rectangle area;
  TextureRows rows;
};

// Fits a waveform into the value range of the scope's graticule, so that a level reads the same
// wherever it is drawn: the rows of a wider range than the graticule's are cut to it, and a
// narrower range fills only its own share of the part's height.
PanelPart fittedToRange(PanelPart part, const ValueRange& scope) {
  const ValueRange own = waveformValueRange(part.result->texture->internalFormat());
  const float low = std::max(own.low, scope.low);
  const float high = std::min(own.high, scope.high);
  const auto share = [](float value, const ValueRange& range) {
    return (value - range.low) / (range.high - range.low);
  };
  const float bottom = part.area.bottom;
  const float height = part.area.top - part.area.bottom;
  part.area.bottom = bottom + share(low, scope) * height;
  part.area.top = bottom + share(high, scope) * height;
  part.rows = {share(low, own), share(high, own)};
  return part;
}

// The parts of the panel each shown waveform fills, and the display index it is drawn with.
std::vector<PanelPart> panelParts(const ScopeLayout& layout, const ScopeWaveforms& waveforms,
                                  const Rectangle& panel) {
  switch (layout.arrangement) {
    case ScopeArrangement::kSideBySide: {
      const float middle = 0.5f * (panel.left + panel.right);
      return {{&waveforms.primary, {panel.left, panel.bottom, middle, panel.top}, {}},
              {&waveforms.comparison, {middle, panel.bottom, panel.right, panel.top}, {}}};
    }
    case ScopeArrangement::kOverlay:
      return {{&waveforms.primary, panel, {}}, {&waveforms.comparison, panel, {}}};
    case ScopeArrangement::kSingle:
      return {{layout.drawPrimary ? &waveforms.primary : &waveforms.comparison, panel, {}}};
    case ScopeArrangement::kEmpty:
    default:
      return {};
  }
}

void setColourMask(const ChannelMask& mask) {
  glColorMask(mask.red, mask.green, mask.blue, GL_TRUE);
}

// Each waveform is screened onto what the target holds: source x (1 - target) + target.
void drawWaveforms(const HostCalls& host, Plugin::gl::EffectData& programs,
                   const CompositionSettings& settings, const ScopeLayout& layout,
                   const std::vector<PanelPart>& parts, const Plugin::gl::Matrix4& projection) {
  const bool overlay = layout.arrangement == ScopeArrangement::kOverlay;
  const OverlayRouting routing = overlayRouting(settings.overlayChannels);
  glEnable(GL_BLEND);
  glBlendEquation(GL_FUNC_ADD);
  glBlendFunc(GL_ONE_MINUS_DST_COLOR, GL_ONE);
  for (size_t i = 0; i < parts.size(); ++i) {
    if (overlay) {
      setColourMask(i == 0 ? routing.primary : routing.comparison);
    }
    drawWaveformDisplay(host, programs, parts[i].result->texture->name(), parts[i].area,
                        parts[i].rows, displayIndexFor(settings.mode, overlay), projection,
                        Plugin::gl::kIdentityMatrix);
  }
  glColorMask(GL_TRUE, GL_TRUE, GL_TRUE, GL_TRUE);
  glBlendEquation(GL_FUNC_ADD);
  glBlendFunc(GL_ONE, GL_ONE);
  glDisable(GL_BLEND);
}

// Markers over each part that has a panel of its own (the overlaid scopes share the first one's),
// each scaled to its own waveform's frame, at the graticule's levels.
void drawMarkers(const HostCalls& host, Plugin::gl::EffectData& programs, int32_t colorSpace,
                 bool extended, const ScopeLayout& layout, const std::vector<PanelPart>& parts,
                 float drawingHeight, const GraticuleFrame& frame) {
  const size_t panels = layout.arrangement == ScopeArrangement::kOverlay ? 1 : parts.size();
  for (size_t i = 0; i < panels; ++i) {
    const WaveformResult& result = *parts[i].result;
    const float scale = result.texture != nullptr ? result.texture->scale() : 1.0f;
    drawColourBarMarkers(
        host, programs,
        colourBarMarkers(colorSpace, extended, static_cast<float>(result.width),
                         static_cast<float>(result.height), scale, parts[i].area.left,
                         parts[i].area.right, drawingHeight),
        frame);
  }
}

}  // namespace

float verticalMargin(bool extended, float labelScaleY) {
  return extended ? 0.0f : std::max(0.0f, std::ceil(10.0f * labelScaleY));
}

void drawScope(const HostCalls& host, Plugin::gl::EffectData& programs,
               const ScopeWaveforms& waveforms, const ScopeDrawing& drawing) {
  if (!(drawing.width >= 1.0f) || !(drawing.height >= 1.0f)) {
    return;
  }
  const Plugin::gl::PassStateGuard stateGuard;
  const bool hasPrimary = waveforms.primary.texture != nullptr;
  const bool hasComparison = waveforms.comparison.texture != nullptr;
  const CompositionSettings& settings = drawing.composition;
  const ScopeLayout layout = decideLayout(hasPrimary, hasComparison, settings.comparison.type,
                                          hasComparison && settings.comparison.showComparison);

  // The graticule's range and margins follow the waveform shown first; the other is fitted to it.
  const WaveformResult* reference = layout.drawPrimary      ? &waveforms.primary
                                    : layout.drawComparison ? &waveforms.comparison
                                                            : nullptr;
  const bool extended = reference != nullptr && isExtended(*reference);
  const float margin = verticalMargin(extended, drawing.labels.scaleY);
  const float drawingHeight = drawing.height - 2.0f * margin;
  const float top = std::ceil(drawingHeight) + margin;
  const Plugin::gl::Matrix4 projection =
      Plugin::gl::orthographicMatrix(0, std::ceil(drawing.width), -margin, top);

  const auto& [red, green, blue, alpha] = drawing.background;
  glClearColor(red * alpha, green * alpha, blue * alpha, alpha);
  glClear(GL_COLOR_BUFFER_BIT);
  glClearColor(0, 0, 0, 0);

  const float labelSize = 10.0f * drawing.labels.scaleY;
  const GuidelineList guidelines = buildGuidelines(extended, labelSize, drawingHeight);
  // The label column stays empty until the scope draws its IRE labels.
  const float labelColumn = 0.0f;
  const Rectangle panel = {1.1f * labelColumn, 0.0f, drawing.width, drawingHeight};

  if (drawing.fillPanel) {
    glEnable(GL_BLEND);
    glBlendEquation(GL_FUNC_ADD);
    glBlendFunc(GL_ONE, GL_ONE_MINUS_SRC_ALPHA);
    fillWaveformPanel(host, programs, panel, kPanelBlack, projection, Plugin::gl::kIdentityMatrix);
  }
  const ValueRange graticuleRange =
      extended ? waveformValueRange(reference->texture->internalFormat()) : ValueRange{};
  std::vector<PanelPart> parts = panelParts(layout, waveforms, panel);
  for (PanelPart& part : parts) {
    part = fittedToRange(part, graticuleRange);
  }
  drawWaveforms(host, programs, settings, layout, parts, projection);

  const GraticuleFrame frame = {projection, Plugin::gl::kIdentityMatrix, -margin, top};
  if (drawing.showGuidelines) {
    drawGuidelines(host, programs, guidelines, labelColumn, drawing.width, frame);
  }
  if (drawing.showColourBars && settings.mode == kModeLuminance) {
    drawMarkers(host, programs, settings.colorSpace, extended, layout, parts, drawingHeight, frame);
  }
}

}  // namespace plugin::Scopes
