// Drawing the graticule over the scope with the "guideline" program: anti-aliased horizontal
// lines at the IRE levels, and short lines in the bars' colours at the colour-bar luma levels.
#ifndef WAVEFORM_SCOPE_GRATICULE_DRAWING_H
#define WAVEFORM_SCOPE_GRATICULE_DRAWING_H

#include <vector>

#include "gl/effect_data.h"
#include "gl/quad_maths.h"
#include "host_access/host_calls.h"
#include "scope/guidelines.h"

namespace plugin::Scopes {

inline constexpr char kGuidelineProgram[] = "guideline";

// Builds "guideline" unless the registry has it; a build failure throws
// QvGLSLexception with the driver's log.
void ensureGuidelineProgram(Plugin::gl::EffectData& programs, bool echo);

// The scope's coordinate frame: its matrices, and the vertical extent of the quads a line is
// drawn in (wide enough that a line at either end of the drawing height keeps both halves).
struct GraticuleFrame {
  Plugin::gl::Matrix4 projection;
  Plugin::gl::Matrix4 modelView;
  float bottom;
  float top;
};

// One faint grey line per guideline, from `left` to `right`, blended over the target.
void drawGuidelines(const Plugin::host::HostCalls& host, Plugin::gl::EffectData& programs,
                    const GuidelineList& lines, float left, float right,
                    const GraticuleFrame& frame);

// One opaque line per marker in its bar's colour.
void drawColourBarMarkers(const Plugin::host::HostCalls& host, Plugin::gl::EffectData& programs,
                          const std::vector<ColourBarMarker>& markers, const GraticuleFrame& frame);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_GRATICULE_DRAWING_H
