// Pictures the host reads and writes: RGBA with straight (not premultiplied) alpha, as floats
// from 0 to 1, rows from the top. `bitDepth` remembers the file's depth (8 or 16).
#ifndef VTPL_HOST_IMAGE_H
#define VTPL_HOST_IMAGE_H

#include <filesystem>
#include <vector>

namespace vtpl::host {

struct Image {
  int width = 0;
  int height = 0;
  int bitDepth = 8;
  std::vector<float> rgba;  // width * height * 4

  float* pixel(int x, int y) { return &rgba[4 * (static_cast<size_t>(y) * width + x)]; }
  const float* pixel(int x, int y) const { return &rgba[4 * (static_cast<size_t>(y) * width + x)]; }
};

// Any PNG: palette, grey and missing alpha are expanded to RGBA. Throws HostError naming the file.
Image readPng(const std::filesystem::path& path);
// Writes 8- or 16-bit RGBA as the image's depth says. Throws HostError naming the file.
void writePng(const std::filesystem::path& path, const Image& image);

}  // namespace vtpl::host

#endif  // VTPL_HOST_IMAGE_H
