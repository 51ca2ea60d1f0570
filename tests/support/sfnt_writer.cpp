#include "sfnt_writer.h"

#include <algorithm>
#include <cmath>
#include <fstream>
#include <numeric>

namespace waveform_test {
namespace {

void appendU16(std::vector<uint8_t>& out, uint16_t value) {
  out.push_back(static_cast<uint8_t>(value >> 8));
  out.push_back(static_cast<uint8_t>(value));
}

void appendU32(std::vector<uint8_t>& out, uint32_t value) {
  appendU16(out, static_cast<uint16_t>(value >> 16));
  appendU16(out, static_cast<uint16_t>(value));
}

void appendTag(std::vector<uint8_t>& out, const std::string& tag) {
  for (size_t i = 0; i < 4; ++i) {
    out.push_back(static_cast<uint8_t>(i < tag.size() ? tag[i] : ' '));
  }
}

// 16.16 fixed point.
void appendFixed(std::vector<uint8_t>& out, float value) {
  appendU32(out, static_cast<uint32_t>(static_cast<int32_t>(std::lround(value * 65536.0f))));
}

uint16_t getU16(const std::vector<uint8_t>& bytes, size_t offset) {
  return static_cast<uint16_t>((bytes[offset] << 8) | bytes[offset + 1]);
}

uint32_t getU32(const std::vector<uint8_t>& bytes, size_t offset) {
  return (static_cast<uint32_t>(getU16(bytes, offset)) << 16) | getU16(bytes, offset + 2);
}

void padTo4(std::vector<uint8_t>& bytes) {
  while (bytes.size() % 4 != 0) {
    bytes.push_back(0);
  }
}

uint32_t checksum(const std::vector<uint8_t>& table) {
  uint32_t sum = 0;
  for (size_t i = 0; i < table.size(); i += 4) {
    uint32_t word = 0;
    for (size_t k = 0; k < 4; ++k) {
      word = (word << 8) | (i + k < table.size() ? table[i + k] : 0);
    }
    sum += word;
  }
  return sum;
}

std::vector<uint8_t> utf16BigEndian(const std::u16string& text) {
  std::vector<uint8_t> bytes;
  for (char16_t unit : text) {
    appendU16(bytes, unit);
  }
  return bytes;
}

std::vector<uint8_t> utf8Bytes(const std::u16string& text) {
  std::vector<uint8_t> bytes;
  for (size_t i = 0; i < text.size(); ++i) {
    char32_t c = text[i];
    if (c >= 0xD800 && c <= 0xDBFF && i + 1 < text.size()) {
      c = 0x10000 + ((c - 0xD800) << 10) + (text[++i] - 0xDC00);
    }
    if (c < 0x80) {
      bytes.push_back(static_cast<uint8_t>(c));
    } else if (c < 0x800) {
      bytes.push_back(static_cast<uint8_t>(0xC0 | (c >> 6)));
      bytes.push_back(static_cast<uint8_t>(0x80 | (c & 0x3F)));
    } else if (c < 0x10000) {
      bytes.push_back(static_cast<uint8_t>(0xE0 | (c >> 12)));
      bytes.push_back(static_cast<uint8_t>(0x80 | ((c >> 6) & 0x3F)));
      bytes.push_back(static_cast<uint8_t>(0x80 | (c & 0x3F)));
    } else {
      bytes.push_back(static_cast<uint8_t>(0xF0 | (c >> 18)));
      bytes.push_back(static_cast<uint8_t>(0x80 | ((c >> 12) & 0x3F)));
      bytes.push_back(static_cast<uint8_t>(0x80 | ((c >> 6) & 0x3F)));
      bytes.push_back(static_cast<uint8_t>(0x80 | (c & 0x3F)));
    }
  }
  return bytes;
}

std::vector<uint8_t> resized(std::vector<uint8_t> bytes, size_t length) {
  bytes.resize(length, 0);
  return bytes;
}

}  // namespace

SfntFont& SfntFont::addName(uint16_t platformID, uint16_t languageID, uint16_t nameID,
                            const std::u16string& text) {
  if (platformID == 0 || platformID == 3) {
    return addNameBytes(platformID, platformID == 0 ? 3 : 1, languageID, nameID,
                        utf16BigEndian(text));
  }
  return addNameBytes(platformID, 0, languageID, nameID, utf8Bytes(text));
}

SfntFont& SfntFont::addNameBytes(uint16_t platformID, uint16_t encodingID, uint16_t languageID,
                                 uint16_t nameID, const std::vector<uint8_t>& bytes) {
  names_.push_back({platformID, encodingID, languageID, nameID, bytes});
  return *this;
}

SfntFont& SfntFont::setOs2(const Os2Fields& fields, size_t length) {
  std::vector<uint8_t> table;
  appendU16(table, fields.version);
  appendU16(table, 500);  // xAvgCharWidth
  appendU16(table, 400);  // usWeightClass
  appendU16(table, 5);    // usWidthClass
  appendU16(table, fields.fsType);
  for (int16_t value : {fields.subscriptXSize, fields.subscriptYSize, fields.subscriptXOffset,
                        fields.subscriptYOffset, fields.superscriptXSize, fields.superscriptYSize,
                        fields.superscriptXOffset, fields.superscriptYOffset, fields.strikeoutSize,
                        fields.strikeoutPosition}) {
    appendU16(table, static_cast<uint16_t>(value));
  }
  return setTable("OS/2", resized(table, length));
}

SfntFont& SfntFont::setHead(uint16_t unitsPerEm, int16_t yMax, size_t length) {
  std::vector<uint8_t> table;
  appendU16(table, 1);           // majorVersion
  appendU16(table, 0);           // minorVersion
  appendU32(table, 0x00010000);  // fontRevision
  appendU32(table, 0);           // checksumAdjustment
  appendU32(table, 0x5F0F3CF5);  // magicNumber
  appendU16(table, 0);           // flags
  appendU16(table, unitsPerEm);
  table.resize(42, 0);  // dates, xMin, yMin, xMax
  appendU16(table, static_cast<uint16_t>(yMax));
  return setTable("head", resized(table, length));
}

SfntFont& SfntFont::setPost(int16_t underlinePosition, int16_t underlineThickness, size_t length) {
  std::vector<uint8_t> table;
  appendU32(table, 0x00030000);  // version 3: no glyph names
  appendU32(table, 0);           // italicAngle
  appendU16(table, static_cast<uint16_t>(underlinePosition));
  appendU16(table, static_cast<uint16_t>(underlineThickness));
  return setTable("post", resized(table, length));
}

SfntFont& SfntFont::setFvar(const FvarTable& fvar) {
  const auto axisCount = static_cast<uint16_t>(fvar.axes.size());
  const uint16_t instanceSize =
      static_cast<uint16_t>(4 + 4 * axisCount) + (fvar.postScriptNameIDs ? 2 : 0);
  std::vector<uint8_t> table;
  appendU16(table, 1);   // majorVersion
  appendU16(table, 0);   // minorVersion
  appendU16(table, 16);  // axesArrayOffset
  appendU16(table, 2);   // reserved
  appendU16(table, axisCount);
  appendU16(table, 20);  // axisSize
  appendU16(table, static_cast<uint16_t>(fvar.instances.size()));
  appendU16(table, instanceSize);
  for (const FvarAxis& axis : fvar.axes) {
    appendTag(table, axis.tag);
    appendFixed(table, axis.minimum);
    appendFixed(table, axis.defaultValue);
    appendFixed(table, axis.maximum);
    appendU16(table, 0);  // flags
    appendU16(table, axis.nameID);
  }
  for (const FvarInstance& instance : fvar.instances) {
    appendU16(table, instance.subfamilyNameID);
    appendU16(table, 0);  // flags
    for (size_t a = 0; a < axisCount; ++a) {
      appendFixed(table, a < instance.coordinates.size() ? instance.coordinates[a] : 0.0f);
    }
    if (fvar.postScriptNameIDs) {
      appendU16(table, instance.postScriptNameID);
    }
  }
  return setTable("fvar", table);
}

SfntFont& SfntFont::setTable(const std::string& tag, std::vector<uint8_t> bytes) {
  const auto existing =
      std::find_if(tables_.begin(), tables_.end(), [&](const Table& t) { return t.tag == tag; });
  if (existing == tables_.end()) {
    return addTable(tag, std::move(bytes));
  }
  existing->bytes = std::move(bytes);
  return *this;
}

SfntFont& SfntFont::addTable(const std::string& tag, std::vector<uint8_t> bytes) {
  tables_.push_back({tag, std::move(bytes)});
  return *this;
}

SfntFont& SfntFont::setTrailingBytes(std::vector<uint8_t> bytes) {
  trailing_ = std::move(bytes);
  return *this;
}

SfntFont& SfntFont::setSfntVersion(uint32_t version) {
  sfntVersion_ = version;
  return *this;
}

// Format 0: header, records, then every string in record order.
std::vector<uint8_t> SfntFont::nameTable() const {
  std::vector<uint8_t> table;
  const auto count = static_cast<uint16_t>(names_.size());
  appendU16(table, 0);
  appendU16(table, count);
  appendU16(table, static_cast<uint16_t>(6 + 12 * count));
  std::vector<uint8_t> strings;
  for (const NameRecord& record : names_) {
    appendU16(table, record.platformID);
    appendU16(table, record.encodingID);
    appendU16(table, record.languageID);
    appendU16(table, record.nameID);
    appendU16(table, static_cast<uint16_t>(record.bytes.size()));
    appendU16(table, static_cast<uint16_t>(strings.size()));
    strings.insert(strings.end(), record.bytes.begin(), record.bytes.end());
  }
  table.insert(table.end(), strings.begin(), strings.end());
  return table;
}

std::vector<uint8_t> SfntFont::build(uint32_t fontOffset) const {
  std::vector<Table> tables = tables_;
  if (!names_.empty()) {
    tables.push_back({"name", nameTable()});
  }
  std::vector<size_t> order(tables.size());
  std::iota(order.begin(), order.end(), 0);
  std::stable_sort(order.begin(), order.end(),
                   [&](size_t a, size_t b) { return tables[a].tag < tables[b].tag; });

  const auto numTables = static_cast<uint16_t>(tables.size());
  uint16_t entrySelector = 0;
  while (numTables >> (entrySelector + 1)) {
    ++entrySelector;
  }
  const auto searchRange = static_cast<uint16_t>(numTables ? 16u << entrySelector : 0);
  std::vector<uint8_t> file;
  appendU32(file, sfntVersion_);
  appendU16(file, numTables);
  appendU16(file, searchRange);
  appendU16(file, entrySelector);
  appendU16(file, static_cast<uint16_t>(numTables * 16 - searchRange));

  // Table data in the order given, after the directory.
  std::vector<uint32_t> offsets(tables.size());
  std::vector<uint8_t> data;
  const size_t dataStart = 12 + 16 * tables.size();
  for (size_t i = 0; i < tables.size(); ++i) {
    offsets[i] = static_cast<uint32_t>(fontOffset + dataStart + data.size());
    data.insert(data.end(), tables[i].bytes.begin(), tables[i].bytes.end());
    padTo4(data);
  }
  for (size_t i : order) {
    appendTag(file, tables[i].tag);
    appendU32(file, checksum(tables[i].bytes));
    appendU32(file, offsets[i]);
    appendU32(file, static_cast<uint32_t>(tables[i].bytes.size()));
  }
  file.insert(file.end(), data.begin(), data.end());
  file.insert(file.end(), trailing_.begin(), trailing_.end());
  return file;
}

std::vector<uint8_t> buildCollection(const std::vector<SfntFont>& fonts) {
  std::vector<uint8_t> file;
  appendTag(file, "ttcf");
  appendU16(file, 1);  // majorVersion
  appendU16(file, 0);  // minorVersion
  appendU32(file, static_cast<uint32_t>(fonts.size()));
  const size_t offsetsAt = file.size();
  file.resize(file.size() + 4 * fonts.size(), 0);
  for (size_t i = 0; i < fonts.size(); ++i) {
    padTo4(file);
    putU32(file, offsetsAt + 4 * i, static_cast<uint32_t>(file.size()));
    const std::vector<uint8_t> font = fonts[i].build(static_cast<uint32_t>(file.size()));
    file.insert(file.end(), font.begin(), font.end());
  }
  return file;
}

SfntFont namedFont(const std::u16string& family, const std::u16string& style,
                   const std::u16string& fullName, const std::u16string& postScriptName) {
  SfntFont font;
  font.addName(3, 1033, 1, family)
      .addName(3, 1033, 2, style)
      .addName(3, 1033, 4, fullName)
      .addName(3, 1033, 6, postScriptName)
      .setHead(1000, 900)
      .setOs2(Os2Fields{})
      .setPost(-100, 50);
  return font;
}

void putU16(std::vector<uint8_t>& bytes, size_t offset, uint16_t value) {
  bytes.at(offset) = static_cast<uint8_t>(value >> 8);
  bytes.at(offset + 1) = static_cast<uint8_t>(value);
}

void putU32(std::vector<uint8_t>& bytes, size_t offset, uint32_t value) {
  putU16(bytes, offset, static_cast<uint16_t>(value >> 16));
  putU16(bytes, offset + 2, static_cast<uint16_t>(value));
}

std::optional<TableInFile> findTable(const std::vector<uint8_t>& file, const std::string& tag,
                                     size_t fontOffset) {
  if (fontOffset + 12 > file.size()) {
    return std::nullopt;
  }
  const uint16_t numTables = getU16(file, fontOffset + 4);
  for (size_t i = 0; i < numTables; ++i) {
    const size_t record = fontOffset + 12 + 16 * i;
    if (record + 16 > file.size()) {
      break;
    }
    if (std::equal(tag.begin(), tag.end(), file.begin() + static_cast<std::ptrdiff_t>(record))) {
      return TableInFile{record, getU32(file, record + 8), getU32(file, record + 12)};
    }
  }
  return std::nullopt;
}

bool writeFile(const std::string& path, const std::vector<uint8_t>& bytes) {
  std::ofstream stream(path, std::ios::binary | std::ios::trunc);
  stream.write(reinterpret_cast<const char*>(bytes.data()),
               static_cast<std::streamsize>(bytes.size()));
  return static_cast<bool>(stream.flush());
}

}  // namespace waveform_test
