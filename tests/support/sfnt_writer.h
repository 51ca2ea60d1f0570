// Writes small synthetic TrueType/OpenType files and collections for tests and fuzz seeds: name
// tables with records on any platform and language, OS/2, 'post', 'head' and 'fvar' tables, and
// arbitrary extra tables or bytes. Nothing else a real font needs (glyphs, cmap) is written.
//
//   SfntFont font;
//   font.addName(3, 1033, 4, u"Foo Bold").setHead(1000, 800);
//   std::vector<uint8_t> bytes = font.build();
#ifndef WAVEFORM_TESTS_SUPPORT_SFNT_WRITER_H
#define WAVEFORM_TESTS_SUPPORT_SFNT_WRITER_H

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace waveform_test {

// The OS/2 fields the font reader uses, in font units; the rest of the table is written as zero.
struct Os2Fields {
  uint16_t fsType = 0;
  int16_t subscriptXSize = 650, subscriptYSize = 600, subscriptXOffset = 0, subscriptYOffset = 75;
  int16_t superscriptXSize = 650, superscriptYSize = 600;
  int16_t superscriptXOffset = 0, superscriptYOffset = 350;
  int16_t strikeoutSize = 50, strikeoutPosition = 300;
  uint16_t fsSelection = 0;
  uint16_t weightClass = 400, widthClass = 5;
};

// Axis records of 20 zero bytes; instance records of the subfamily name ID, flags and one zero
// coordinate per axis, then the PostScript name ID when the table has them.
struct FvarTable {
  uint16_t axisCount = 1;
  std::vector<std::pair<uint16_t, uint16_t>> instances;  // subfamily, PostScript name ID
  bool postScriptNameIDs = false;
};

class SfntFont {
 public:
  // A name record. Unicode (0) and Windows (3) texts are written as UTF-16 big-endian with encoding
  // 1 (3 for Unicode); other platforms get the low byte of each unit, encoding 0.
  SfntFont& addName(uint16_t platformID, uint16_t languageID, uint16_t nameID,
                    const std::u16string& text);
  // A name record whose string is exactly these bytes.
  SfntFont& addNameBytes(uint16_t platformID, uint16_t encodingID, uint16_t languageID,
                         uint16_t nameID, const std::vector<uint8_t>& bytes);
  // OS/2 version 4, cut or zero-padded to `length` bytes.
  SfntFont& setOs2(const Os2Fields& fields, size_t length = 100);
  // 'head' with these values, magic number and version (the rest zero), cut or padded.
  SfntFont& setHead(uint16_t unitsPerEm, int16_t yMax, size_t length = 54);
  // 'post' version 3 with these values, cut or padded.
  SfntFont& setPost(int16_t underlinePosition, int16_t underlineThickness, size_t length = 32);
  SfntFont& setFvar(const FvarTable& fvar);
  // Replaces the table with this four-character tag, or adds it. A 'name' table given here is
  // written as it is when no names were added.
  SfntFont& setTable(const std::string& tag, std::vector<uint8_t> bytes);
  // Adds one more table record with this tag, even when the tag is already present.
  SfntFont& addTable(const std::string& tag, std::vector<uint8_t> bytes);
  // Bytes written after the last table.
  SfntFont& setTrailingBytes(std::vector<uint8_t> bytes);
  SfntFont& setSfntVersion(uint32_t version);

  // The whole file: the tables follow the directory in the order they were set or added, each
  // 4-byte aligned; their records are sorted by tag (stable for repeated tags) and their offsets
  // count from the start of a file in which this font starts at `fontOffset`.
  std::vector<uint8_t> build(uint32_t fontOffset = 0) const;

 private:
  struct Table {
    std::string tag;
    std::vector<uint8_t> bytes;
  };

  uint32_t sfntVersion_ = 0x00010000;
  std::vector<std::vector<uint8_t>> nameRecords_;  // each record's 10 bytes, then its string
  std::vector<Table> tables_;                      // every table but 'name'
  std::vector<uint8_t> trailing_;
};

// A collection ("ttcf", version 1.0) of these fonts, each whole font after the header in turn.
std::vector<uint8_t> buildCollection(const std::vector<SfntFont>& fonts);

// A font with Windows English (1033) names 1 (family), 2 (style), 4 (full name) and 6 (PostScript
// name), a 'head' with 1000 units per em, an OS/2 and a 'post'.
SfntFont namedFont(const std::u16string& family, const std::u16string& style,
                   const std::u16string& fullName, const std::u16string& postScriptName);

// namedFont "Var" / "Regular" with 2 axes and 3 named instances, 258 "Regular" (PostScript name 300
// "Var-Regular"), 259 "Bold", in German (1031) "Fett" (301 "Var-Bold") and 260 "Bold Condensed"
// (none); 256 and 999 are names no instance refers to.
SfntFont variableFont(bool postScriptNameIDs);

// Big-endian stores into a built file, for damaging it on purpose.
void putU16(std::vector<uint8_t>& bytes, size_t offset, uint16_t value);
void putU32(std::vector<uint8_t>& bytes, size_t offset, uint32_t value);

// Where a table lies in a built file: the offset of its record in the directory of the font that
// starts at `fontOffset`, and the table's offset and length. Nothing when absent.
struct TableInFile {
  size_t recordOffset;
  uint32_t offset;
  uint32_t length;
};
std::optional<TableInFile> findTable(const std::vector<uint8_t>& file, const std::string& tag,
                                     size_t fontOffset = 0);

// Writes the bytes to a file; false when that fails.
bool writeFile(const std::string& path, const std::vector<uint8_t>& bytes);

}  // namespace waveform_test

#endif  // WAVEFORM_TESTS_SUPPORT_SFNT_WRITER_H
