#include "test_frame.h"

#include <cstdint>
#include <string>

#include "host_error.h"

namespace vtpl::host {

const int kColourBars[9][3] = {{102, 102, 102}, {191, 191, 191}, {191, 191, 0},
                               {0, 191, 191},   {0, 191, 0},     {191, 0, 191},
                               {191, 0, 0},     {0, 0, 191},     {102, 102, 102}};

Image colourBarTestFrame(int width, int height) {
  if (width < 9 || height < 3) {
    throw HostError("a test frame needs at least 9 x 3 pixels, not " + std::to_string(width) +
                    " x " + std::to_string(height));
  }
  Image frame;
  frame.width = width;
  frame.height = height;
  frame.bitDepth = 8;
  frame.rgba.resize(4 * static_cast<size_t>(width) * height);
  const int barRows = height * 2 / 3;
  for (int y = 0; y < height; ++y) {
    for (int x = 0; x < width; ++x) {
      float* pixel = frame.pixel(x, y);
      if (y < barRows) {
        const int* bar = kColourBars[static_cast<int64_t>(x) * 9 / width];
        for (int c = 0; c < 3; ++c) {
          pixel[c] = static_cast<float>(bar[c]) / 255.0f;
        }
      } else {
        // Whole 8-bit levels, so that the picture survives a round trip through a file.
        const int64_t level = (static_cast<int64_t>(x) * 255 * 2 + (width - 1)) / (2 * (width - 1));
        pixel[0] = pixel[1] = pixel[2] = static_cast<float>(level) / 255.0f;
      }
      pixel[3] = 1.0f;
    }
  }
  return frame;
}

}  // namespace vtpl::host
