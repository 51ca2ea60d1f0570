#include "fonts/font_file_reader.h"

#include <algorithm>
#include <array>
#include <filesystem>
#include <fstream>
#include <new>
#include <optional>
#include <stdexcept>
#include <system_error>
#include <utility>

#include "fonts/byte_reader.h"
#include "platform/utf16_text.h"

namespace vesk::project {

// The parsed tables of one face. Of OS/2, 'post' and 'head' only the fields the metric queries
// use are kept, each in host order and zero when its table is missing or too short to hold it.
struct FontFileReader::Face {
  NameTable names;
  std::vector<NamedInstance> instances;
  bool embeddable = false;  // stays false without an OS/2 table
  FontFileReader::StyleClass styleClass;
  int16_t subscriptXSize = 0;
  int16_t subscriptYSize = 0;
  int16_t subscriptXOffset = 0;
  int16_t subscriptYOffset = 0;
  int16_t superscriptXSize = 0;
  int16_t superscriptYSize = 0;
  int16_t superscriptXOffset = 0;
  int16_t superscriptYOffset = 0;
  int16_t strikeoutSize = 0;
  int16_t strikeoutPosition = 0;
  int16_t underlinePosition = 0;
  int16_t underlineThickness = 0;
  uint16_t unitsPerEm = 0;
  int16_t yMax = 0;
};

namespace {

constexpr uint32_t tag(const char (&name)[5]) {
  return (static_cast<uint32_t>(static_cast<uint8_t>(name[0])) << 24) |
         (static_cast<uint32_t>(static_cast<uint8_t>(name[1])) << 16) |
         (static_cast<uint32_t>(static_cast<uint8_t>(name[2])) << 8) |
         static_cast<uint32_t>(static_cast<uint8_t>(name[3]));
}

constexpr uint32_t kCollectionTag = tag("ttcf");
constexpr uint64_t kCollectionHeaderSize = 12;
constexpr uint64_t kOffsetTableSize = 12;
constexpr uint64_t kTableRecordSize = 16;
constexpr uint64_t kNameHeaderSize = 6;
constexpr uint64_t kNameRecordSize = 12;
// Every instance record holds at least its subfamily name ID and its flags.
constexpr uint16_t kMinimumInstanceSize = 4;

// How much of each table is read; the rest of a longer table is not needed.
constexpr size_t kOs2Size = 100;
constexpr uint16_t kSlantedBits = 0x0001 | 0x0200;  // fsSelection ITALIC, OBLIQUE
constexpr size_t kPostSize = 32;
constexpr size_t kHeadSize = 54;

constexpr uint16_t kUnicodePlatform = 0;
constexpr uint16_t kWindowsPlatform = 3;

// The name IDs kept besides those the named instances refer to.
constexpr uint16_t kKeptNameIds[] = {1, 2, 3, 4, 6, 16, 17, 19, 25};

// The OS/2 fsType bits that forbid embedding: restricted licence, preview & print, editable,
// bitmap embedding only.
constexpr uint16_t kNoEmbeddingBits = 0x0001 | 0x0002 | 0x0004 | 0x0200;

// Parts of a file can be shared: faces of a collection may point at the same tables, name
// records at the same string, and structures may overlap. So that such a file cannot make the
// reader decode and store the same bytes over and over, every structure read while parsing
// faces is charged its size in the file, and reading stops once four times the file's size has
// been spent. A file whose faces share nothing spends at most its own size.
class ReadBudget {
 public:
  explicit ReadBudget(uint64_t fileSize) : left_(fileSize * 4) {}

  bool spend(uint64_t bytes) {
    if (bytes > left_) {
      left_ = 0;
      return false;
    }
    left_ -= bytes;
    return true;
  }

 private:
  uint64_t left_;
};

struct TableLocation {
  bool present = false;
  uint32_t offset = 0;
  uint32_t length = 0;
};

struct TableDirectory {
  TableLocation name;
  TableLocation fvar;
  TableLocation os2;
  TableLocation post;
  TableLocation head;
};

// The table records of the face whose offset table starts at `faceOffset`. The number of
// records is limited to those that lie inside the file; a repeated tag: the last one wins.
TableDirectory readTableDirectory(const ByteReader& file, uint64_t faceOffset, ReadBudget& budget) {
  TableDirectory directory;
  const uint64_t first = faceOffset + kOffsetTableSize;
  const uint64_t count =
      std::min<uint64_t>(file.u16(faceOffset + 4), file.recordsThatFit(first, kTableRecordSize));
  for (uint64_t i = 0; i < count && budget.spend(kTableRecordSize); ++i) {
    const uint64_t record = first + i * kTableRecordSize;
    const TableLocation location{true, file.u32(record + 8), file.u32(record + 12)};
    switch (file.u32(record)) {
      case tag("name"):
        directory.name = location;
        break;
      case tag("fvar"):
        directory.fvar = location;
        break;
      case tag("OS/2"):
        directory.os2 = location;
        break;
      case tag("post"):
        directory.post = location;
        break;
      case tag("head"):
        directory.head = location;
        break;
      default:
        break;
    }
  }
  return directory;
}

// The first min(length, N) bytes of a table in an N-byte area; what the table or the file does
// not hold stays zero.
template <size_t N>
std::array<uint8_t, N> readArea(const ByteReader& file, const TableLocation& table) {
  std::array<uint8_t, N> area{};
  file.copy(table.offset, std::min<size_t>(table.length, N), area.data());
  return area;
}

void readOs2(const ByteReader& file, const TableLocation& table, FontFileReader::Face& face) {
  const auto area = readArea<kOs2Size>(file, table);
  const ByteReader os2(area.data(), area.size());
  face.embeddable = (os2.u16(8) & kNoEmbeddingBits) == 0;       // fsType
  face.styleClass.weight = os2.u16(4);                          // usWeightClass
  face.styleClass.width = os2.u16(6);                           // usWidthClass
  face.styleClass.slanted = (os2.u16(62) & kSlantedBits) != 0;  // fsSelection
  face.subscriptXSize = os2.s16(10);
  face.subscriptYSize = os2.s16(12);
  face.subscriptXOffset = os2.s16(14);
  face.subscriptYOffset = os2.s16(16);
  face.superscriptXSize = os2.s16(18);
  face.superscriptYSize = os2.s16(20);
  face.superscriptXOffset = os2.s16(22);
  face.superscriptYOffset = os2.s16(24);
  face.strikeoutSize = os2.s16(26);
  face.strikeoutPosition = os2.s16(28);
}

void readPost(const ByteReader& file, const TableLocation& table, FontFileReader::Face& face) {
  const auto area = readArea<kPostSize>(file, table);
  const ByteReader post(area.data(), area.size());
  face.underlinePosition = post.s16(8);
  face.underlineThickness = post.s16(10);
}

void readHead(const ByteReader& file, const TableLocation& table, FontFileReader::Face& face) {
  const auto area = readArea<kHeadSize>(file, table);
  const ByteReader head(area.data(), area.size());
  face.unitsPerEm = head.u16(18);
  face.yMax = head.s16(42);
}

// The named instances of an 'fvar' table, without their names. Only instance records that lie
// wholly inside the file are read.
std::vector<NamedInstance> readInstances(const ByteReader& file, const TableLocation& table,
                                         ReadBudget& budget) {
  const uint64_t base = table.offset;
  const uint16_t axesArrayOffset = file.u16(base + 4);
  const uint16_t axisCount = file.u16(base + 8);
  const uint16_t axisSize = file.u16(base + 10);
  const uint16_t instanceCount = file.u16(base + 12);
  const uint16_t instanceSize = file.u16(base + 14);
  std::vector<NamedInstance> instances;
  if (instanceSize < kMinimumInstanceSize) {
    return instances;
  }
  const uint64_t first = base + axesArrayOffset + static_cast<uint64_t>(axisCount) * axisSize;
  const uint64_t postScriptIdOffset = (static_cast<uint64_t>(axisCount) + 1) * 4;
  const bool hasPostScriptId = postScriptIdOffset + 2 <= instanceSize;
  const uint64_t count =
      std::min<uint64_t>(instanceCount, file.recordsThatFit(first, instanceSize));
  for (uint64_t k = 0; k < count && budget.spend(instanceSize); ++k) {
    const uint64_t record = first + k * instanceSize;
    NamedInstance instance;
    instance.subfamilyNameID = file.u16(record);
    instance.postScriptNameID = hasPostScriptId ? file.u16(record + postScriptIdOffset) : 0;
    instances.push_back(std::move(instance));
  }
  return instances;
}

// The name IDs a face keeps, sorted: the fixed ones and those its instances refer to.
std::vector<uint16_t> keptNameIds(const std::vector<NamedInstance>& instances) {
  std::vector<uint16_t> ids(std::begin(kKeptNameIds), std::end(kKeptNameIds));
  for (const NamedInstance& instance : instances) {
    ids.push_back(instance.subfamilyNameID);
    if (instance.postScriptNameID != 0) {
      ids.push_back(instance.postScriptNameID);
    }
  }
  std::sort(ids.begin(), ids.end());
  ids.erase(std::unique(ids.begin(), ids.end()), ids.end());
  return ids;
}

// The text of a name string of `length` bytes at `start`, which lies inside the file. Unicode
// and Windows strings are UTF-16 big-endian, read up to the first zero unit (an odd last byte is
// the high half of a unit whose low half is zero); they give nothing when they hold an unpaired
// surrogate. Strings of other platforms are their bytes up to the first zero byte, unchanged.
std::optional<std::string> decodeName(const ByteReader& file, uint16_t platformID, uint64_t start,
                                      uint16_t length) {
  if (platformID == kUnicodePlatform || platformID == kWindowsPlatform) {
    std::u16string units;
    for (uint64_t i = 0; i < length; i += 2) {
      const uint8_t high = file.u8(start + i);
      const uint8_t low = i + 1 < length ? file.u8(start + i + 1) : 0;
      const auto unit = static_cast<char16_t>((high << 8) | low);
      if (unit == 0) {
        break;
      }
      units += unit;
    }
    return platform::toUtf8Strict(units);
  }
  std::string bytes;
  for (uint64_t i = 0; i < length && file.u8(start + i) != 0; ++i) {
    bytes += static_cast<char>(file.u8(start + i));
  }
  return bytes;
}

// Reads the records of a 'name' table whose name ID is kept. A record whose string does not lie
// wholly inside the file is skipped, and so is one whose text cannot be decoded or is empty.
void readNames(const ByteReader& file, const TableLocation& table,
               const std::vector<uint16_t>& keptIds, ReadBudget& budget, NameTable& names) {
  const uint64_t base = table.offset;
  const uint64_t strings = base + file.u16(base + 4);
  const uint64_t first = base + kNameHeaderSize;
  const uint64_t count =
      std::min<uint64_t>(file.u16(base + 2), file.recordsThatFit(first, kNameRecordSize));
  for (uint64_t i = 0; i < count && budget.spend(kNameRecordSize); ++i) {
    const uint64_t record = first + i * kNameRecordSize;
    const uint16_t platformID = file.u16(record);
    const uint16_t languageID = file.u16(record + 4);
    const uint16_t nameID = file.u16(record + 6);
    const uint16_t length = file.u16(record + 8);
    const uint64_t start = strings + file.u16(record + 10);
    if (!std::binary_search(keptIds.begin(), keptIds.end(), nameID) ||
        !file.contains(start, length) || !budget.spend(length)) {
      continue;
    }
    std::optional<std::string> text = decodeName(file, platformID, start, length);
    if (text && !text->empty()) {
      names[platformID][nameID][languageID] = std::move(*text);
    }
  }
}

// The Windows-platform text of a name ID in the language platform::preferredNameLanguage picks
// for the user. Null when there is none.
const std::string* chooseName(const NameTable& names, uint16_t nameID, uint16_t userLanguageId) {
  const auto windows = names.find(kWindowsPlatform);
  if (windows == names.end()) {
    return nullptr;
  }
  const auto id = windows->second.find(nameID);
  if (id == windows->second.end() || id->second.empty()) {
    return nullptr;
  }
  const std::map<uint16_t, std::string>& byLanguage = id->second;
  std::vector<uint16_t> languages;
  for (const auto& entry : byLanguage) {
    languages.push_back(entry.first);
  }
  return &byLanguage.at(languages[platform::preferredNameLanguage(languages, userLanguageId)]);
}

// Fills in the names of a face's named instances from its name table. The copies are charged to
// the budget, as the same long name can be named by any number of instances.
void nameInstances(FontFileReader::Face& face, uint16_t userLanguageId, ReadBudget& budget) {
  for (NamedInstance& instance : face.instances) {
    const std::string* subfamily = chooseName(face.names, instance.subfamilyNameID, userLanguageId);
    if (subfamily && budget.spend(subfamily->size())) {
      instance.subfamilyName = *subfamily;
    }
    if (instance.postScriptNameID == 0) {
      continue;
    }
    const std::string* postScript =
        chooseName(face.names, instance.postScriptNameID, userLanguageId);
    if (postScript && budget.spend(postScript->size())) {
      instance.postScriptName = *postScript;
    }
  }
}

// The face whose offset table starts at `offset`, or nothing when that table does not lie inside
// the file.
std::optional<FontFileReader::Face> readFace(const ByteReader& file, uint64_t offset,
                                             uint16_t userLanguageId, ReadBudget& budget) {
  if (!file.contains(offset, kOffsetTableSize) || !budget.spend(kOffsetTableSize)) {
    return std::nullopt;
  }
  const TableDirectory directory = readTableDirectory(file, offset, budget);
  FontFileReader::Face face;
  if (directory.os2.present) {
    readOs2(file, directory.os2, face);
  }
  if (directory.post.present) {
    readPost(file, directory.post, face);
  }
  if (directory.head.present) {
    readHead(file, directory.head, face);
  }
  if (directory.fvar.present) {
    face.instances = readInstances(file, directory.fvar, budget);
  }
  if (directory.name.present) {
    readNames(file, directory.name, keptNameIds(face.instances), budget, face.names);
  }
  nameInstances(face, userLanguageId, budget);
  return face;
}

enum class Layout { kNone, kFontOrCollection, kCollection };

bool equalsIgnoringCase(std::u16string_view text, std::u16string_view lowerCase) {
  if (text.size() != lowerCase.size()) {
    return false;
  }
  for (size_t i = 0; i < text.size(); ++i) {
    const char16_t unit = text[i] >= u'A' && text[i] <= u'Z' ? text[i] - u'A' + u'a' : text[i];
    if (unit != lowerCase[i]) {
      return false;
    }
  }
  return true;
}

// The layout a path's extension (from its last dot in the last component) announces.
Layout layoutOf(const std::u16string& path) {
  const size_t dot = path.find_last_of(u'.');
  const size_t separator = path.find_last_of(u"/\\");
  if (dot == std::u16string::npos || (separator != std::u16string::npos && separator > dot)) {
    return Layout::kNone;
  }
  const std::u16string_view extension = std::u16string_view(path).substr(dot);
  if (equalsIgnoringCase(extension, u".ttf") || equalsIgnoringCase(extension, u".otf")) {
    return Layout::kFontOrCollection;
  }
  if (equalsIgnoringCase(extension, u".ttc") || equalsIgnoringCase(extension, u".otc")) {
    return Layout::kCollection;
  }
  return Layout::kNone;
}

std::vector<FontFileReader::Face> readFaces(Layout layout, const ByteReader& file,
                                            uint16_t userLanguageId) {
  std::vector<FontFileReader::Face> faces;
  ReadBudget budget(file.size());
  const bool collection = file.contains(0, 4) && file.u32(0) == kCollectionTag;
  if (layout == Layout::kNone || (layout == Layout::kCollection && !collection)) {
    return faces;
  }
  if (!collection) {
    if (auto face = readFace(file, 0, userLanguageId, budget)) {
      faces.push_back(std::move(*face));
    }
    return faces;
  }
  // The collection header: tag, major and minor version, the number of fonts; then one offset
  // per font. Offsets past the end of the file are not counted; a face whose offset table lies
  // outside the file is left out.
  const uint64_t count =
      std::min<uint64_t>(file.u32(8), file.recordsThatFit(kCollectionHeaderSize, 4));
  for (uint64_t i = 0; i < count; ++i) {
    const uint32_t offset = file.u32(kCollectionHeaderSize + i * 4);
    if (auto face = readFace(file, offset, userLanguageId, budget)) {
      faces.push_back(std::move(*face));
    }
  }
  return faces;
}

// The whole content of a regular file, or nothing when it cannot be read.
std::vector<uint8_t> readFile(const std::u16string& path) {
  const std::optional<std::string> utf8Path = platform::toUtf8Strict(path);
  if (!utf8Path) {
    return {};
  }
  const std::filesystem::path filePath(*utf8Path);
  std::error_code error;
  // Devices and pipes could be endless; fonts are regular files.
  if (!std::filesystem::is_regular_file(filePath, error)) {
    return {};
  }
  const uintmax_t size = std::filesystem::file_size(filePath, error);
  std::ifstream stream(filePath, std::ios::binary);
  if (error || !stream) {
    return {};
  }
  // A file too large to hold in memory is as unreadable as a missing one.
  try {
    std::vector<uint8_t> bytes(static_cast<size_t>(size));
    stream.read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
    bytes.resize(static_cast<size_t>(stream.gcount()));
    return bytes;
  } catch (const std::bad_alloc&) {
    return {};
  } catch (const std::length_error&) {
    return {};
  }
}

const std::string& emptyText() {
  static const std::string empty;
  return empty;
}

const std::string& nonEmpty(const std::string& first, const std::string& fallback) {
  return first.empty() ? fallback : first;
}

float inEm(int16_t value, uint16_t unitsPerEm) {
  return static_cast<float>(value) / static_cast<float>(unitsPerEm);
}

}  // namespace

FontFileReader::FontFileReader(std::u16string path, uint16_t userLanguageId)
    : FontFileReader(path, readFile(path), userLanguageId) {}

FontFileReader::FontFileReader(std::u16string path, std::vector<uint8_t> bytes,
                               uint16_t userLanguageId)
    : path_(std::move(path)), userLanguageId_(userLanguageId) {
  const ByteReader file(bytes.data(), bytes.size());
  faces_ = readFaces(layoutOf(path_), file, userLanguageId_);
}

FontFileReader::~FontFileReader() = default;
FontFileReader::FontFileReader(const FontFileReader&) = default;
FontFileReader& FontFileReader::operator=(const FontFileReader&) = default;
FontFileReader::FontFileReader(FontFileReader&&) noexcept = default;
FontFileReader& FontFileReader::operator=(FontFileReader&&) noexcept = default;

const std::u16string& FontFileReader::path() const {
  return path_;
}

int32_t FontFileReader::faceCount() const {
  return static_cast<int32_t>(faces_.size());
}

const FontFileReader::Face* FontFileReader::face(int32_t index) const {
  if (index < 0 || static_cast<size_t>(index) >= faces_.size()) {
    return nullptr;
  }
  return &faces_[static_cast<size_t>(index)];
}

const FontFileReader::Face* FontFileReader::faceWithMetrics(int32_t index) const {
  const Face* found = face(index);
  return found && found->unitsPerEm != 0 ? found : nullptr;
}

const std::string& FontFileReader::name(int32_t faceIndex, uint16_t nameID) const {
  const Face* found = face(faceIndex);
  const std::string* text = found ? chooseName(found->names, nameID, userLanguageId_) : nullptr;
  return text ? *text : emptyText();
}

const std::string& FontFileReader::subfamilyName(int32_t face) const {
  return name(face, 2);
}

const std::string& FontFileReader::fullName(int32_t face) const {
  return name(face, 4);
}

const std::string& FontFileReader::postScriptName(int32_t face) const {
  return nonEmpty(name(face, 6), name(face, 4));
}

const std::string& FontFileReader::familyName(int32_t face) const {
  return nonEmpty(name(face, 16), name(face, 1));
}

const std::string& FontFileReader::styleName(int32_t face) const {
  return nonEmpty(name(face, 17), name(face, 2));
}

const std::string& FontFileReader::sampleText(int32_t face) const {
  return name(face, 19);
}

std::u16string FontFileReader::subfamilyNameUtf16(int32_t face) const {
  return utf8ToUtf16(subfamilyName(face));
}

std::u16string FontFileReader::fullNameUtf16(int32_t face) const {
  return utf8ToUtf16(fullName(face));
}

std::u16string FontFileReader::postScriptNameUtf16(int32_t face) const {
  return utf8ToUtf16(postScriptName(face));
}

std::u16string FontFileReader::familyNameUtf16(int32_t face) const {
  return utf8ToUtf16(familyName(face));
}

std::u16string FontFileReader::styleNameUtf16(int32_t face) const {
  return utf8ToUtf16(styleName(face));
}

const NameTable& FontFileReader::names(int32_t faceIndex) const {
  static const NameTable empty;
  const Face* found = face(faceIndex);
  return found ? found->names : empty;
}

const std::vector<NamedInstance>& FontFileReader::namedInstances(int32_t faceIndex) const {
  static const std::vector<NamedInstance> empty;
  const Face* found = face(faceIndex);
  return found ? found->instances : empty;
}

FontFileReader::StyleClass FontFileReader::styleClass(int32_t faceIndex) const {
  const Face* found = face(faceIndex);
  return found ? found->styleClass : StyleClass{};
}

bool FontFileReader::isEmbeddable(int32_t faceIndex) const {
  const Face* found = face(faceIndex);
  return found && found->embeddable;
}

FontVector FontFileReader::subscriptSize(int32_t faceIndex) const {
  const Face* f = faceWithMetrics(faceIndex);
  if (!f) {
    return {0.583f, 0.583f};
  }
  return {inEm(f->subscriptXSize, f->unitsPerEm), inEm(f->subscriptYSize, f->unitsPerEm)};
}

FontVector FontFileReader::subscriptOffset(int32_t faceIndex) const {
  const Face* f = faceWithMetrics(faceIndex);
  if (!f) {
    return {0.0f, -0.1914f};
  }
  return {inEm(f->subscriptXOffset, f->unitsPerEm), inEm(f->subscriptYOffset, f->unitsPerEm)};
}

FontVector FontFileReader::superscriptSize(int32_t faceIndex) const {
  const Face* f = faceWithMetrics(faceIndex);
  if (!f) {
    return {0.583f, 0.583f};
  }
  return {inEm(f->superscriptXSize, f->unitsPerEm), inEm(f->superscriptYSize, f->unitsPerEm)};
}

FontVector FontFileReader::superscriptOffset(int32_t faceIndex) const {
  const Face* f = faceWithMetrics(faceIndex);
  if (!f) {
    return {0.0f, 0.33f};
  }
  return {inEm(f->superscriptXOffset, f->unitsPerEm), inEm(f->superscriptYOffset, f->unitsPerEm)};
}

float FontFileReader::strikeoutSize(int32_t faceIndex) const {
  const Face* f = faceWithMetrics(faceIndex);
  if (!f || f->strikeoutSize == 0) {
    return 0.05f;
  }
  return inEm(f->strikeoutSize, f->unitsPerEm);
}

// Without a strikeout size, the strikeout sits at a third of the font's height.
float FontFileReader::strikeoutPosition(int32_t faceIndex) const {
  const Face* f = faceWithMetrics(faceIndex);
  if (!f) {
    return 0.3f;
  }
  if (f->strikeoutSize == 0) {
    return inEm(static_cast<int16_t>(f->yMax / 3), f->unitsPerEm);
  }
  return inEm(f->strikeoutPosition, f->unitsPerEm);
}

float FontFileReader::underlinePosition(int32_t faceIndex) const {
  const Face* f = faceWithMetrics(faceIndex);
  if (!f || f->underlineThickness == 0) {
    return -0.075f;
  }
  return inEm(f->underlinePosition, f->unitsPerEm);
}

float FontFileReader::underlineThickness(int32_t faceIndex) const {
  const Face* f = faceWithMetrics(faceIndex);
  if (!f || f->underlineThickness == 0) {
    return 0.05f;
  }
  return inEm(f->underlineThickness, f->unitsPerEm);
}

std::u16string utf8ToUtf16(const std::string& text) {
  return platform::toUtf16(text);
}

}  // namespace vesk::project
