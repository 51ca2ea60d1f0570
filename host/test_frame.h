// The built-in test frame of the demo and the benchmarks: colour bars over a grey ramp, a
// picture whose waveform is known in advance.
#ifndef VTPL_HOST_TEST_FRAME_H
#define VTPL_HOST_TEST_FRAME_H

#include "image.h"

namespace vtpl::host {

// The nine 75 % colour bars, left to right, as 8-bit red, green, blue: grey 40 %, white, yellow,
// cyan, green, magenta, red, blue, grey 40 %. The scope marks the luma of exactly these bars.
extern const int kColourBars[9][3];

// An opaque 8-bit picture. The top two thirds hold the nine bars in equal widths across the whole
// width (exactly equal when the width is a multiple of nine), so that on a 16:9 frame the scope's
// colour-bar markers sit over their bars' traces. The bottom third is a grey ramp from black at
// the left edge to white at the right edge: in the waveform a straight line from 0 to 100 IRE,
// against which the guidelines and labels can be checked. Throws HostError for a frame narrower than 9 or lower than 3 pixels.
Image colourBarTestFrame(int width, int height);

}  // namespace vtpl::host

#endif  // VTPL_HOST_TEST_FRAME_H
