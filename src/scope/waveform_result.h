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

// The two waveforms a scope can show.
struct ScopeWaveforms {
  WaveformResult primary;
  WaveformResult comparison;
};

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_WAVEFORM_RESULT_H
