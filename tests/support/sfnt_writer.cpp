#include "sfnt_writer.h"

#include <algorithm>
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

uint32_t getU32(const std::vector<uint8_t>& bytes, size_t offset) {
  return static_cast<uint32_t>(bytes[offset] << 24 | bytes[offset + 1] << 16 |
                               bytes[offset + 2] << 8 | bytes[offset + 3]);
}

std::vector<uint8_t> resized(std::vector<uint8_t> bytes, size_t length) {
  bytes.resize(length, 0);
  return bytes;
}

}  // namespace

SfntFont& SfntFont::addName(uint16_t platformID, uint16_t languageID, uint16_t nameID,
                            const std::u16string& text) {
  const bool utf16 = platformID == 0 || platformID == 3;
  std::vector<uint8_t> bytes;
  for (char16_t unit : text) {
    if (utf16) {
      appendU16(bytes, unit);
    } else {
      bytes.push_back(static_cast<uint8_t>(unit));
    }
  }
  return addNameBytes(platformID, utf16 ? (platformID == 0 ? 3 : 1) : 0, languageID, nameID, bytes);
}

SfntFont& SfntFont::addNameBytes(uint16_t platformID, uint16_t encodingID, uint16_t languageID,
                                 uint16_t nameID, const std::vector<uint8_t>& bytes) {
  std::vector<uint8_t> record;
  for (uint16_t field : {platformID, encodingID, languageID, nameID}) {
    appendU16(record, field);
  }
  appendU16(record, static_cast<uint16_t>(bytes.size()));
  record.insert(record.end(), bytes.begin(), bytes.end());
  nameRecords_.push_back(record);
  return *this;
}

SfntFont& SfntFont::setOs2(const Os2Fields& f, size_t length) {
  std::vector<uint8_t> table;
  // version, xAvgCharWidth, weight and width class
  for (uint16_t value : {uint16_t{4}, uint16_t{500}, f.weightClass, f.widthClass}) {
    appendU16(table, value);
  }
  appendU16(table, f.fsType);
  for (int16_t value : {f.subscriptXSize, f.subscriptYSize, f.subscriptXOffset, f.subscriptYOffset,
                        f.superscriptXSize, f.superscriptYSize, f.superscriptXOffset,
                        f.superscriptYOffset, f.strikeoutSize, f.strikeoutPosition}) {
    appendU16(table, static_cast<uint16_t>(value));
  }
  table.resize(62, 0);  // up to fsSelection
  appendU16(table, f.fsSelection);
  return setTable("OS/2", resized(table, length));
}

SfntFont& SfntFont::setHead(uint16_t unitsPerEm, int16_t yMax, size_t length) {
  std::vector<uint8_t> table;
  appendU32(table, 0x00010000);  // version
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
  const uint16_t instanceSize = 4 + 4 * fvar.axisCount + (fvar.postScriptNameIDs ? 2 : 0);
  std::vector<uint8_t> table;
  // Version 1.0, axesArrayOffset 16, reserved 2, axisCount, axisSize 20, instance count and size.
  const uint16_t header[] = {
      1, 0, 16, 2, fvar.axisCount, 20, static_cast<uint16_t>(fvar.instances.size()), instanceSize};
  for (uint16_t value : header) {
    appendU16(table, value);
  }
  table.resize(table.size() + 20 * fvar.axisCount, 0);
  for (const auto& [subfamily, postScript] : fvar.instances) {
    appendU16(table, subfamily);
    table.resize(table.size() + 2 + 4 * fvar.axisCount, 0);  // flags, coordinates
    if (fvar.postScriptNameIDs) {
      appendU16(table, postScript);
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

std::vector<uint8_t> SfntFont::build(uint32_t fontOffset) const {
  std::vector<Table> tables = tables_;
  if (!nameRecords_.empty()) {
    // Format 0: the header, the records, then every string in record order.
    const auto count = static_cast<uint16_t>(nameRecords_.size());
    std::vector<uint8_t> name, strings;
    appendU16(name, 0);
    appendU16(name, count);
    appendU16(name, static_cast<uint16_t>(6 + 12 * count));
    for (const std::vector<uint8_t>& record : nameRecords_) {
      name.insert(name.end(), record.begin(), record.begin() + 10);
      appendU16(name, static_cast<uint16_t>(strings.size()));
      strings.insert(strings.end(), record.begin() + 10, record.end());
    }
    name.insert(name.end(), strings.begin(), strings.end());
    tables.push_back({"name", name});
  }
  std::vector<size_t> order(tables.size());
  std::iota(order.begin(), order.end(), 0);
  std::stable_sort(order.begin(), order.end(),
                   [&](size_t a, size_t b) { return tables[a].tag < tables[b].tag; });

  // The offset table (search fields left zero: the reader does not use them), records, tables.
  std::vector<uint8_t> file;
  appendU32(file, sfntVersion_);
  appendU16(file, static_cast<uint16_t>(tables.size()));
  file.resize(12 + 16 * tables.size(), 0);
  std::vector<uint32_t> offsets(tables.size());
  for (size_t i = 0; i < tables.size(); ++i) {
    offsets[i] = static_cast<uint32_t>(fontOffset + file.size());
    file.insert(file.end(), tables[i].bytes.begin(), tables[i].bytes.end());
    file.resize((file.size() + 3) / 4 * 4, 0);
  }
  for (size_t k = 0; k < order.size(); ++k) {
    const Table& table = tables[order[k]];
    const size_t record = 12 + 16 * k;
    std::copy(table.tag.begin(), table.tag.begin() + 4, file.begin() + record);
    putU32(file, record + 8, offsets[order[k]]);
    putU32(file, record + 12, static_cast<uint32_t>(table.bytes.size()));
  }
  file.insert(file.end(), trailing_.begin(), trailing_.end());
  return file;
}

std::vector<uint8_t> buildCollection(const std::vector<SfntFont>& fonts) {
  std::vector<uint8_t> file = {'t', 't', 'c', 'f', 0, 1, 0, 0};
  appendU32(file, static_cast<uint32_t>(fonts.size()));
  file.resize(file.size() + 4 * fonts.size(), 0);
  for (size_t i = 0; i < fonts.size(); ++i) {
    putU32(file, 12 + 4 * i, static_cast<uint32_t>(file.size()));
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

SfntFont variableFont(bool postScriptNameIDs) {
  SfntFont font = namedFont(u"Var", u"Regular", u"Var Regular", u"Var-Regular");
  font.setFvar({2, {{258, 300}, {259, 301}, {260, 0}}, postScriptNameIDs})
      .addName(3, 1033, 256, u"Weight")
      .addName(3, 1033, 258, u"Regular")
      .addName(3, 1033, 259, u"Bold")
      .addName(3, 1031, 259, u"Fett")
      .addName(3, 1033, 260, u"Bold Condensed")
      .addName(3, 1033, 300, u"Var-Regular")
      .addName(3, 1033, 301, u"Var-Bold")
      .addName(3, 1033, 999, u"unreferenced");
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
  const size_t numTables =
      fontOffset + 6 <= file.size() ? file[fontOffset + 4] << 8 | file[fontOffset + 5] : 0;
  for (size_t record = fontOffset + 12;
       record < fontOffset + 12 + 16 * numTables && record + 16 <= file.size(); record += 16) {
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
