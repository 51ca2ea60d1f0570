#include "scope/channel_modes.h"

#include "scope/parameter_choices.h"

namespace plugin::Scopes {

DisplayIndex displayIndexFor(int32_t waveformMode, bool overlay) {
  switch (waveformMode) {
    case kModeLuminance:
    case kModeRGB:
      return overlay ? kDisplayAverageGrey : kDisplayAsStored;
    case kModeCbCr:
      return overlay ? kDisplayAverageGrey : kDisplayChroma;
    case kModeRed:
      return overlay ? kDisplayRedAsGrey : kDisplayRedTint;
    case kModeGreen:
      return overlay ? kDisplayGreenAsGrey : kDisplayGreenTint;
    case kModeBlue:
      return overlay ? kDisplayBlueAsGrey : kDisplayBlueTint;
    case kModeAlpha:
    default:
      return kDisplayAsStored;
  }
}

}  // namespace plugin::Scopes
