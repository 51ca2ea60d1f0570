// Big-endian reads from an untrusted byte buffer. Every read is checked against the buffer's
// size: bytes past the end read as zero, as if a short file read had left them zero-filled.
// Offsets are 64-bit so that sums and products of 32-bit file fields cannot wrap around.
#ifndef WAVEFORM_FONTS_BYTE_READER_H
#define WAVEFORM_FONTS_BYTE_READER_H

#include <cstddef>
#include <cstdint>
#include <cstring>

namespace vesk::project {

class ByteReader {
 public:
  ByteReader(const uint8_t* data, size_t size) : data_(data), size_(size) {}

  uint64_t size() const { return size_; }

  // Whether the `length` bytes starting at `offset` all lie inside the buffer.
  bool contains(uint64_t offset, uint64_t length) const {
    return offset <= size_ && length <= size_ - offset;
  }

  // How many whole records of `recordSize` bytes fit between `offset` and the end (0 for a
  // record size of 0).
  uint64_t recordsThatFit(uint64_t offset, uint64_t recordSize) const {
    if (recordSize == 0 || offset > size_) {
      return 0;
    }
    return (size_ - offset) / recordSize;
  }

  uint8_t u8(uint64_t offset) const { return offset < size_ ? data_[offset] : 0; }

  uint16_t u16(uint64_t offset) const {
    return static_cast<uint16_t>((u8(offset) << 8) | u8(offset + 1));
  }

  int16_t s16(uint64_t offset) const { return static_cast<int16_t>(u16(offset)); }

  uint32_t u32(uint64_t offset) const {
    return (static_cast<uint32_t>(u16(offset)) << 16) | u16(offset + 2);
  }

  // Copies `length` bytes from `offset` to `out`; the part that lies past the end is zeroed.
  void copy(uint64_t offset, size_t length, uint8_t* out) const {
    size_t inside = 0;
    if (offset < size_) {
      inside = static_cast<size_t>(size_ - offset) < length ? static_cast<size_t>(size_ - offset)
                                                            : length;
      std::memcpy(out, data_ + offset, inside);
    }
    std::memset(out + inside, 0, length - inside);
  }

 private:
  const uint8_t* data_;
  uint64_t size_;
};

}  // namespace vesk::project

#endif  // WAVEFORM_FONTS_BYTE_READER_H
