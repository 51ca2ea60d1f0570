// A finished waveform as the scope drawing receives it: the texture the analysis filled and the
// size of the frame it measured.
#ifndef WAVEFORM_SCOPE_WAVEFORM_RESULT_H
#define WAVEFORM_SCOPE_WAVEFORM_RESULT_H

#include <cstdint>
#include <memory>

#include "gl/texture.h"

namespace plugin::Scopes {

struct WaveformResult {
  std::shared_ptr<Plugin::gl::Texture> texture;  // null: no waveform
  int32_t width = 0;
  int32_t height = 0;
};

// The signal values a waveform's rows span, bottom to top. The waveform texture's format decides
// it, whatever the format of the layer measured into it: an eight-bit waveform spans 0 to 1, any
// other -0.25 to 1.25, room for super-whites and sub-blacks.
struct ValueRange {
  float low = 0;
  float high = 1;
};
inline ValueRange waveformValueRange(uint32_t waveformFormat) {
  return waveformFormat == GL_RGBA ? ValueRange{0.0f, 1.0f} : ValueRange{-0.25f, 1.25f};
}
inline bool isExtended(const WaveformResult& result) {
  return result.texture != nullptr && result.texture->internalFormat() != GL_RGBA;
}

// The two waveforms a scope can show.
struct ScopeWaveforms {
  WaveformResult primary;
  WaveformResult comparison;
};

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_WAVEFORM_RESULT_H
