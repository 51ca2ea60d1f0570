// The finished scope picture: background, one or two waveforms side by side or overlaid in
// separate colour channels, and the graticule, drawn into the bound framebuffer. The same drawing
// serves the scope control and the scope rendered into the layer.
#ifndef WAVEFORM_SCOPE_SCOPE_COMPOSITION_H
#define WAVEFORM_SCOPE_SCOPE_COMPOSITION_H

#include <array>

#include "gl/effect_data.h"
#include "host_access/host_calls.h"
#include "scope/scope_settings.h"
#include "scope/waveform_result.h"

namespace plugin::Scopes {

struct ScopeDrawing {
  CompositionSettings composition;
  std::array<float, 4> background{};  // red, green, blue and alpha, not premultiplied
  bool showGuidelines = false;
  bool showColourBars = false;
  LabelSettings labels;
  float width = 0;  // the scope area, in pixels of the bound target
  float height = 0;
  bool fillPanel = false;  // the control: the waveform panel is opaque black
};

// The empty rows kept above and below the waveform of an eight-bit layer, where the outermost
// guidelines and their labels would otherwise be cut; none for a float layer, whose waveform has
// room beyond 0 and 100 IRE.
float verticalMargin(bool extended, float labelScaleY);

// Draws the scope over (0, 0)..(width, height) of the bound target, whose viewport the caller
// set. Fences of the waveform textures are the caller's.
void drawScope(const Plugin::host::HostCalls& host, Plugin::gl::EffectData& programs,
               const ScopeWaveforms& waveforms, const ScopeDrawing& drawing);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_SCOPE_COMPOSITION_H
