// How each waveform mode is displayed: the display index the "copyWaveform" program applies.
#ifndef WAVEFORM_SCOPE_CHANNEL_MODES_H
#define WAVEFORM_SCOPE_CHANNEL_MODES_H

#include <cstdint>

namespace plugin::Scopes {

enum DisplayIndex : int32_t {
  kDisplayAsStored = 0,
  kDisplayRedAsGrey = 1,
  kDisplayGreenAsGrey = 2,
  kDisplayBlueAsGrey = 3,
  kDisplayChroma = 4,  // Cr (stored in blue) in red, Cb (stored in green) in blue
  kDisplayAverageGrey = 5,
  kDisplayRedTint = 6,
  kDisplayGreenTint = 7,
  kDisplayBlueTint = 8,
};

// `overlay`: the comparison layout "Overlay" with a comparison layer present, where each scope is
// drawn grey and routed into its own output channels.
DisplayIndex displayIndexFor(int32_t waveformMode, bool overlay);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_CHANNEL_MODES_H
