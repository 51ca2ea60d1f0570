// Reading the Unicode data files line by line with bounded memory: a line is at most 4095 bytes
// in a fixed buffer, a longer one is passed over without being kept, and only regular files are
// opened (a folder or a FIFO in the file's place must neither fail nor block a render).
#ifndef WAVEFORM_TEXT_DATA_FILE_LINES_H
#define WAVEFORM_TEXT_DATA_FILE_LINES_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <optional>
#include <string_view>

namespace vesk::plugin::lib {

// The fields of a data line split at ";", each trimmed of spaces, tabs and carriage returns.
// Fields beyond the capacity are counted but not kept.
struct DataFields {
  static constexpr size_t kCapacity = 16;
  std::array<std::string_view, kCapacity> at;
  size_t count = 0;
  std::string_view operator[](size_t i) const { return i < count && i < kCapacity ? at[i] : ""; }
};
DataFields splitFields(std::string_view line);

class DataFileLines {
 public:
  static constexpr size_t kMaxLineLength = 4095;
  enum class Status { kLine, kOverlong, kEnd };

  // Opens `path` when it names a regular file (links followed) and places the reading at byte
  // `offset`; false when the file is missing, not a regular file or cannot be read.
  bool open(const std::filesystem::path& path, uint64_t offset);

  // Reads the next line. kLine: line() holds it; kOverlong: a line longer than kMaxLineLength
  // bytes was passed over; kEnd: the file ends (or cannot be read on).
  Status next();
  // The fields of the next line that holds data, valid until the next read: blank and
  // comment-only lines are passed over, and so are overlong ones, counted in `skipped`. Null at
  // the file's end.
  const DataFields* nextFields(size_t& skipped);
  // The last line read, without its line end and without a comment ("#" to the end).
  std::string_view line() const { return line_; }
  // The byte offset at which the last line read starts (the file's end after kEnd).
  uint64_t lineStart() const { return lineStart_; }

 private:
  std::ifstream in_;
  std::array<char, kMaxLineLength + 1> buffer_{};
  std::string_view line_;
  DataFields fields_;
  uint64_t lineStart_ = 0;
  uint64_t offset_ = 0;
};


// A code point written as 1 to 8 hexadecimal digits and nothing else, at most U+10FFFF; none for
// anything else (an empty field, other characters, a number too large).
std::optional<uint32_t> parseCodePoint(std::string_view field);

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_TEXT_DATA_FILE_LINES_H
