#include "image.h"

#include <png.h>

#include <cmath>
#include <cstdio>
#include <memory>

#include "host_error.h"

namespace vtpl::host {
namespace {

struct FileCloser {
  void operator()(FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<FILE, FileCloser>;

File openFile(const std::filesystem::path& path, const char* mode, const char* what) {
  File file(std::fopen(path.c_str(), mode));
  if (!file) {
    throw HostError(std::string("cannot open '") + path.string() + "' " + what);
  }
  return file;
}

[[noreturn]] void pngError(png_structp png, png_const_charp message) {
  auto* text = static_cast<std::string*>(png_get_error_ptr(png));
  *text = message;
  png_longjmp(png, 1);
}

void pngWarning(png_structp, png_const_charp) {}

}  // namespace

Image readPng(const std::filesystem::path& path) {
  File file = openFile(path, "rb", "for reading");
  std::string error;
  png_structp png = png_create_read_struct(PNG_LIBPNG_VER_STRING, &error, pngError, pngWarning);
  png_infop info = png_create_info_struct(png);
  // Everything libpng's error jump may leave behind is declared before the jump target.
  Image image;
  std::vector<png_byte> rows;
  std::vector<png_bytep> rowPointers;
  if (setjmp(png_jmpbuf(png))) {
    png_destroy_read_struct(&png, &info, nullptr);
    throw HostError("'" + path.string() + "' is not a readable PNG: " + error);
  }
  png_init_io(png, file.get());
  png_read_info(png, info);
  const int depth = png_get_bit_depth(png, info) == 16 ? 16 : 8;
  png_set_expand(png);
  png_set_gray_to_rgb(png);
  png_set_add_alpha(png, depth == 16 ? 0xFFFF : 0xFF, PNG_FILLER_AFTER);
  if (depth == 16) {
    png_set_swap(png);  // host byte order
  }
  png_set_interlace_handling(png);
  png_read_update_info(png, info);
  image.width = static_cast<int>(png_get_image_width(png, info));
  image.height = static_cast<int>(png_get_image_height(png, info));
  image.bitDepth = depth;
  const size_t rowBytes = png_get_rowbytes(png, info);
  rows.resize(rowBytes * image.height);
  rowPointers.resize(image.height);
  for (int y = 0; y < image.height; ++y) {
    rowPointers[y] = rows.data() + rowBytes * y;
  }
  png_read_image(png, rowPointers.data());
  png_destroy_read_struct(&png, &info, nullptr);

  const size_t values = 4 * static_cast<size_t>(image.width) * image.height;
  image.rgba.resize(values);
  for (size_t i = 0; i < values; ++i) {
    image.rgba[i] = depth == 16 ? reinterpret_cast<const uint16_t*>(rows.data())[i] / 65535.0f
                                : rows[i] / 255.0f;
  }
  return image;
}

void writePng(const std::filesystem::path& path, const Image& image) {
  File file = openFile(path, "wb", "for writing");
  std::string error;
  png_structp png = png_create_write_struct(PNG_LIBPNG_VER_STRING, &error, pngError, pngWarning);
  png_infop info = png_create_info_struct(png);
  const int depth = image.bitDepth == 16 ? 16 : 8;
  const float scale = depth == 16 ? 65535.0f : 255.0f;
  const size_t rowValues = 4 * static_cast<size_t>(image.width);
  const size_t valueBytes = depth / 8;
  std::vector<png_byte> rows(rowValues * valueBytes * image.height);
  for (size_t i = 0; i < rowValues * image.height; ++i) {
    const float clamped = std::fmin(std::fmax(image.rgba[i], 0.0f), 1.0f);
    const auto value = static_cast<uint32_t>(std::lround(clamped * scale));
    if (depth == 16) {
      rows[2 * i] = static_cast<png_byte>(value >> 8);  // PNG stores big-endian
      rows[2 * i + 1] = static_cast<png_byte>(value & 0xFF);
    } else {
      rows[i] = static_cast<png_byte>(value);
    }
  }
  std::vector<png_bytep> rowPointers(image.height);
  for (int y = 0; y < image.height; ++y) {
    rowPointers[y] = rows.data() + rowValues * valueBytes * y;
  }
  if (setjmp(png_jmpbuf(png))) {
    png_destroy_write_struct(&png, &info);
    throw HostError("cannot write '" + path.string() + "': " + error);
  }
  png_init_io(png, file.get());
  png_set_IHDR(png, info, image.width, image.height, depth, PNG_COLOR_TYPE_RGBA, PNG_INTERLACE_NONE,
               PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
  png_write_info(png, info);
  png_write_image(png, rowPointers.data());
  png_write_end(png, nullptr);
  png_destroy_write_struct(&png, &info);
}

}  // namespace vtpl::host
