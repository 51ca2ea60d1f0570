#include "text/data_file_lines.h"

#include <limits>
#include <system_error>

namespace vesk::plugin::lib {

bool DataFileLines::open(const std::filesystem::path& path, uint64_t offset) {
  // Opening a FIFO for reading blocks until a writer comes, and a folder opens but cannot be
  // read: only a regular file is opened at all.
  std::error_code error;
  if (!std::filesystem::is_regular_file(path, error)) {
    return false;
  }
  in_.open(path, std::ios::binary);
  if (!in_.is_open()) {
    return false;
  }
  in_.seekg(static_cast<std::streamoff>(offset));
  offset_ = lineStart_ = offset;
  return static_cast<bool>(in_);
}

DataFileLines::Status DataFileLines::next() {
  lineStart_ = offset_;
  if (!in_) {
    return Status::kEnd;
  }
  in_.getline(buffer_.data(), static_cast<std::streamsize>(buffer_.size()), '\n');
  const auto extracted = static_cast<uint64_t>(in_.gcount());
  offset_ += extracted;
  if (in_.fail() && !in_.eof() && extracted == kMaxLineLength) {
    // The buffer filled before the line ended: pass over the rest of the line without keeping it.
    in_.clear();
    in_.ignore(std::numeric_limits<std::streamsize>::max(), '\n');
    offset_ += static_cast<uint64_t>(in_.gcount());
    return Status::kOverlong;
  }
  if (extracted == 0 && !in_) {
    return Status::kEnd;
  }
  // gcount counts the line end, which getline does not store; a NUL byte ends the text too.
  std::string_view text(buffer_.data(), std::char_traits<char>::length(buffer_.data()));
  line_ = text.substr(0, text.find('#'));
  return Status::kLine;
}

DataFields splitFields(std::string_view line) {
  DataFields fields;
  for (size_t start = 0;;) {
    const size_t end = line.find(';', start);
    std::string_view field = line.substr(start, end == std::string_view::npos ? end : end - start);
    const size_t first = field.find_first_not_of(" \t\r");
    field = first == std::string_view::npos
                ? std::string_view()
                : field.substr(first, field.find_last_not_of(" \t\r") - first + 1);
    if (fields.count < DataFields::kCapacity) {
      fields.at[fields.count] = field;
    }
    ++fields.count;
    if (end == std::string_view::npos) {
      return fields;
    }
    start = end + 1;
  }
}

std::optional<uint32_t> parseCodePoint(std::string_view field) {
  if (field.empty() || field.size() > 8) {
    return std::nullopt;
  }
  uint32_t value = 0;
  for (const char c : field) {
    const int digit = c >= '0' && c <= '9'   ? c - '0'
                      : c >= 'A' && c <= 'F' ? c - 'A' + 10
                      : c >= 'a' && c <= 'f' ? c - 'a' + 10
                                             : -1;
    if (digit < 0) {
      return std::nullopt;
    }
    value = value * 16 + static_cast<uint32_t>(digit);
  }
  if (value > 0x10FFFF) {
    return std::nullopt;
  }
  return value;
}

const DataFields* DataFileLines::nextFields(size_t& skipped) {
  for (Status status; (status = next()) != Status::kEnd;) {
    if (status == Status::kOverlong) {
      ++skipped;
    } else if (line_.find_first_not_of(" \t\r") != std::string_view::npos) {
      fields_ = splitFields(line_);
      return &fields_;
    }
  }
  return nullptr;
}

}  // namespace vesk::plugin::lib
