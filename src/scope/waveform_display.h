// Turning a waveform texture into visible traces: the "copyWaveform" display program, the
// "fillWaveformBackground" program, and the pass that draws a waveform into a rectangle.
#ifndef WAVEFORM_SCOPE_WAVEFORM_DISPLAY_H
#define WAVEFORM_SCOPE_WAVEFORM_DISPLAY_H

#include <array>
#include <string>

#include "gl/effect_data.h"
#include "gl/quad_maths.h"
#include "host_access/host_calls.h"
#include "scope/channel_modes.h"

namespace plugin::Scopes {

inline constexpr char kCopyWaveformProgram[] = "copyWaveform";
inline constexpr char kFillWaveformBackgroundProgram[] = "fillWaveformBackground";

// The fragment stage of "copyWaveform", with the Rec. 2020 conversions of its tinted traces.
const std::string& waveformDisplayFragmentSource();

// Builds whichever of the two programs the registry lacks; a build failure throws
// QvGLSLexception with the driver's log.
void ensureWaveformDisplayPrograms(Plugin::gl::EffectData& programs, bool echo);

struct Rectangle {
  float left, bottom, right, top;
};

// The rows of a waveform texture to show, as texture coordinates from its bottom (0) to top (1).
struct TextureRows {
  float bottom = 0;
  float top = 1;
};

// Draws the waveform texture's `rows` over `destination` with the display index's colours, into
// the bound framebuffer. Blending is the caller's.
void drawWaveformDisplay(const Plugin::host::HostCalls& host, Plugin::gl::EffectData& programs,
                         GLuint waveformTexture, const Rectangle& destination,
                         const TextureRows& rows, DisplayIndex displayIndex, const Plugin::gl::Matrix4& projection,
                         const Plugin::gl::Matrix4& modelView);

// Fills `destination` with one premultiplied colour through "fillWaveformBackground", into the
// bound framebuffer. Blending is the caller's.
void fillWaveformPanel(const Plugin::host::HostCalls& host, Plugin::gl::EffectData& programs,
                       const Rectangle& destination, const std::array<float, 4>& colour,
                       const Plugin::gl::Matrix4& projection, const Plugin::gl::Matrix4& modelView);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_WAVEFORM_DISPLAY_H
