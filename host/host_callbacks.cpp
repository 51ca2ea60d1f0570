#include "host_callbacks.h"

#include <GL/glew.h>

#include <cstddef>
#include <cstdio>
#include <cstring>
#include <type_traits>

#include "effect_host.h"
#include "gl_thread.h"

namespace vtpl::host {
namespace {

// Written by getLayer when no layer is chosen.
constexpr char kNoLayerIdentifier[] = "00000000-0000-0000-0000-000000000000";

EffectHost& hostOf(HostContext context) {
  return *static_cast<EffectHost*>(context);
}

std::string number(double value) {
  char text[32];
  std::snprintf(text, sizeof text, "%g", value);
  return text;
}

std::u16string textOrEmpty(const char16_t* text) {
  return text != nullptr ? text : u"";
}

// ---- declarations -------------------------------------------------------------------------

ParameterDeclaration declaration(ParameterKind kind, const char16_t* label, const char* id,
                                 uint32_t flags) {
  ParameterDeclaration result;
  result.kind = kind;
  result.label = textOrEmpty(label);
  result.id = id != nullptr ? id : "";
  result.flags = flags;
  return result;
}

std::string commonArguments(const char16_t* label, const char* id, uint32_t flags) {
  return "label=" + inQuotes(std::u16string_view(textOrEmpty(label))) + ", id=" + inQuotes(id) +
         ", flags=" + hex(flags);
}

int32_t finishDeclaration(EffectHost& host, std::string_view name, ParameterDeclaration d,
                          const std::string& arguments) {
  const int32_t status = host.declareParameter(std::move(d));
  host.trace().callback(name, arguments, std::to_string(status));
  return status;
}

std::vector<ChoiceEntry> choiceEntries(const char16_t* items, const int32_t* values) {
  std::vector<ChoiceEntry> entries;
  const std::u16string list = textOrEmpty(items);
  if (list.empty()) {
    return entries;
  }
  size_t start = 0;
  for (;;) {
    const size_t bar = list.find(u'|', start);
    entries.push_back({list.substr(start, bar - start), 0});
    if (bar == std::u16string::npos) {
      break;
    }
    start = bar + 1;
  }
  for (size_t i = 0; i < entries.size(); ++i) {
    entries[i].value = values != nullptr ? values[i] : static_cast<int32_t>(i);
  }
  return entries;
}

const char16_t* hostIdentifier(HostContext context) {
  EffectHost& host = hostOf(context);
  host.enterCallback("hostIdentifier");
  const std::u16string& identifier = host.settings().identifier;
  host.trace().callback("hostIdentifier", "", inQuotes(std::u16string_view(identifier)));
  return identifier.c_str();
}

int32_t hostVersion(HostContext context) {
  EffectHost& host = hostOf(context);
  host.enterCallback("hostVersion");
  host.trace().callback("hostVersion", "", std::to_string(host.settings().version));
  return host.settings().version;
}

int32_t beginGroup(HostContext context, const char16_t* label) {
  EffectHost& host = hostOf(context);
  host.enterCallback("beginGroup");
  const int32_t status = host.parameters().beginGroup(textOrEmpty(label));
  host.trace().callback("beginGroup", inQuotes(std::u16string_view(textOrEmpty(label))),
                        std::to_string(status));
  return status;
}

int32_t endGroup(HostContext context) {
  EffectHost& host = hostOf(context);
  host.enterCallback("endGroup");
  const int32_t status = host.parameters().endGroup();
  host.trace().callback("endGroup", "", std::to_string(status));
  return status;
}

// Float and slider declarations share everything but the slider's own range.
struct NumberDeclaration {
  const char16_t* label;
  const char16_t* unit;
  const char* id;
  uint32_t flags;
  float min, max, sliderMin, sliderMax, defaultValue;
  int32_t decimals;
};

int32_t declareNumber(HostContext context, std::string_view name, ParameterKind kind,
                      const NumberDeclaration& n) {
  EffectHost& host = hostOf(context);
  host.enterCallback(name);
  ParameterDeclaration d = declaration(kind, n.label, n.id, n.flags);
  d.unit = textOrEmpty(n.unit);
  d.min = n.min;
  d.max = n.max;
  d.defaults[0] = n.defaultValue;
  d.decimals = n.decimals;
  std::string arguments = commonArguments(n.label, n.id, n.flags) +
                          ", unit=" + inQuotes(std::u16string_view(d.unit)) +
                          ", min=" + number(n.min) + ", max=" + number(n.max);
  if (kind == ParameterKind::Slider) {
    d.sliderMin = n.sliderMin;
    d.sliderMax = n.sliderMax;
    arguments += ", sliderMin=" + number(n.sliderMin) + ", sliderMax=" + number(n.sliderMax);
  }
  arguments += ", default=" + number(n.defaultValue) + ", decimals=" + std::to_string(n.decimals);
  return finishDeclaration(host, name, std::move(d), arguments);
}

int32_t defineFloat(HostContext context, const char16_t* label, const char16_t* unit,
                    const char* id, uint32_t flags, float min, float max, float defaultValue,
                    int32_t decimals) {
  return declareNumber(context, "defineFloat", ParameterKind::Float,
                       {label, unit, id, flags, min, max, 0, 0, defaultValue, decimals});
}

int32_t defineSlider(HostContext context, const char16_t* label, const char16_t* unit,
                     const char* id, uint32_t flags, float min, float max, float sliderMin,
                     float sliderMax, float defaultValue, int32_t decimals) {
  return declareNumber(
      context, "defineSlider", ParameterKind::Slider,
      {label, unit, id, flags, min, max, sliderMin, sliderMax, defaultValue, decimals});
}

int32_t defineBool(HostContext context, const char16_t* label, const char* id, uint32_t flags,
                   uint8_t defaultValue) {
  EffectHost& host = hostOf(context);
  host.enterCallback("defineBool");
  ParameterDeclaration d = declaration(ParameterKind::Bool, label, id, flags);
  d.defaults[0] = defaultValue != 0 ? 1 : 0;
  const std::string arguments =
      commonArguments(label, id, flags) + ", default=" + std::to_string(defaultValue);
  return finishDeclaration(host, "defineBool", std::move(d), arguments);
}

int32_t defineChoice(HostContext context, const char16_t* label, const char* id, uint32_t flags,
                     const char16_t* items, const int32_t* values, int32_t defaultIndex) {
  EffectHost& host = hostOf(context);
  host.enterCallback("defineChoice");
  ParameterDeclaration d = declaration(ParameterKind::Choice, label, id, flags);
  d.choices = choiceEntries(items, values);
  d.defaults[0] = defaultIndex;
  std::string valueList;
  for (const ChoiceEntry& entry : d.choices) {
    valueList += (valueList.empty() ? "" : ",") + std::to_string(entry.value);
  }
  const std::string arguments = commonArguments(label, id, flags) +
                                ", items=" + inQuotes(std::u16string_view(textOrEmpty(items))) +
                                ", values=[" + valueList +
                                "], default=" + std::to_string(defaultIndex);
  return finishDeclaration(host, "defineChoice", std::move(d), arguments);
}

int32_t definePoint(HostContext context, const char16_t* label, const char* id, uint32_t flags,
                    float x, float y) {
  EffectHost& host = hostOf(context);
  host.enterCallback("definePoint");
  ParameterDeclaration d = declaration(ParameterKind::Point, label, id, flags);
  d.defaults = {x, y, 0};
  const std::string arguments =
      commonArguments(label, id, flags) + ", default=(" + number(x) + ", " + number(y) + ")";
  return finishDeclaration(host, "definePoint", std::move(d), arguments);
}

int32_t defineAngle(HostContext context, const char16_t* label, const char* id, uint32_t flags,
                    uint8_t option, float degrees) {
  EffectHost& host = hostOf(context);
  host.enterCallback("defineAngle");
  ParameterDeclaration d = declaration(ParameterKind::Angle, label, id, flags);
  d.angleOption = option;
  d.defaults[0] = degrees;
  const std::string arguments = commonArguments(label, id, flags) +
                                ", option=" + std::to_string(option) +
                                ", default=" + number(degrees);
  return finishDeclaration(host, "defineAngle", std::move(d), arguments);
}

int32_t defineColor(HostContext context, const char16_t* label, const char* id, uint32_t flags,
                    float red, float green, float blue) {
  EffectHost& host = hostOf(context);
  host.enterCallback("defineColor");
  ParameterDeclaration d = declaration(ParameterKind::Color, label, id, flags);
  d.defaults = {red, green, blue};
  const std::string arguments = commonArguments(label, id, flags) + ", default=(" + number(red) +
                                ", " + number(green) + ", " + number(blue) + ")";
  return finishDeclaration(host, "defineColor", std::move(d), arguments);
}

int32_t defineLayer(HostContext context, const char16_t* label, const char* id, uint32_t flags) {
  EffectHost& host = hostOf(context);
  host.enterCallback("defineLayer");
  ParameterDeclaration d = declaration(ParameterKind::Layer, label, id, flags);
  return finishDeclaration(host, "defineLayer", std::move(d), commonArguments(label, id, flags));
}

int32_t defineControl(HostContext context, const char16_t* label, const char* id, uint32_t flags,
                      const char16_t* secondText, double aspect, int32_t size1, int32_t size2,
                      int32_t size3, int32_t size4) {
  EffectHost& host = hostOf(context);
  host.enterCallback("defineControl");
  ParameterDeclaration d = declaration(ParameterKind::Control, label, id, flags);
  d.secondText = textOrEmpty(secondText);
  d.aspect = aspect;
  d.controlSizes = {size1, size2, size3, size4};
  char aspectText[32];
  std::snprintf(aspectText, sizeof aspectText, "%.17g", aspect);
  const std::string arguments =
      commonArguments(label, id, flags) + ", text=" + inQuotes(std::u16string_view(d.secondText)) +
      ", aspect=" + aspectText + ", sizes=" + std::to_string(size1) + "," + std::to_string(size2) +
      "," + std::to_string(size3) + "," + std::to_string(size4);
  return finishDeclaration(host, "defineControl", std::move(d), arguments);
}

// ---- panel state --------------------------------------------------------------------------

int32_t setParamVisible(HostContext context, const char* id, const uint8_t* shown) {
  EffectHost& host = hostOf(context);
  host.enterCallback("setParamVisible");
  const bool known =
      id != nullptr && shown != nullptr && host.parameters().setVisible(id, *shown != 0);
  if (!known) {
    host.noteUnknownId(id);
  }
  host.trace().callback("setParamVisible",
                        inQuotes(id) + ", " + (shown == nullptr ? "null" : std::to_string(*shown)),
                        known ? "0" : "1");
  return known ? 0 : 1;
}

// Reads the numbers of a parameter, noting an id the panel does not have.
std::array<double, 3> readNumbers(EffectHost& host, const char* id) {
  std::array<double, 3> value{};
  if (id == nullptr || !host.parameters().readNumbers(id, value)) {
    host.noteUnknownId(id);
  }
  return value;
}

std::string readArguments(const char* id, int32_t time) {
  return inQuotes(id) + ", t=" + std::to_string(time);
}

// What the scalar getters answer for a parameter; an unknown id is noted and reads as zero.
float readFloat(EffectHost& host, const char* id) {
  return static_cast<float>(readNumbers(host, id)[0]);
}

uint8_t readBool(EffectHost& host, const char* id) {
  return readNumbers(host, id)[0] != 0 ? 1 : 0;
}

// A choice answers its item's value, never its position.
int32_t readInt(EffectHost& host, const char* id) {
  int32_t value = 0;
  if (id == nullptr || !host.parameters().readInt(id, value)) {
    host.noteUnknownId(id);
  }
  return value;
}

constexpr char kGetFloat[] = "getFloat";
constexpr char kGetAngle[] = "getAngle";
constexpr char kGetBool[] = "getBool";
constexpr char kGetInt[] = "getInt";

// The getFloat, getAngle, getBool and getInt callbacks: the callback named `name` answers what
// `read` makes of the parameter and traces it (floats as "%g", integers in decimal).
template <const char* name, typename Value, Value (*read)(EffectHost&, const char*)>
Value getScalar(HostContext context, const char* id, int32_t time) {
  EffectHost& host = hostOf(context);
  host.enterCallback(name);
  const Value value = read(host, id);
  if constexpr (std::is_floating_point_v<Value>) {
    host.trace().callback(name, readArguments(id, time), number(value));
  } else {
    host.trace().callback(name, readArguments(id, time), std::to_string(value));
  }
  return value;
}

// The getPoint and getColor callbacks: the callback named `name` writes the parameter's first
// numbers to the outputs that are not null and traces them as "(a, b, ...)".
template <size_t count>
void getNumbers(HostContext context, std::string_view name, const char* id, int32_t time,
                const std::array<float*, count>& outputs) {
  EffectHost& host = hostOf(context);
  host.enterCallback(name);
  const std::array<double, 3> value = readNumbers(host, id);
  std::string traced = "(";
  for (size_t i = 0; i < count; ++i) {
    if (outputs[i] != nullptr) {
      *outputs[i] = static_cast<float>(value[i]);
    }
    traced += (i == 0 ? "" : ", ") + number(value[i]);
  }
  host.trace().callback(name, readArguments(id, time), traced + ")");
}

void getPoint(HostContext context, const char* id, int32_t time, float* x, float* y) {
  getNumbers<2>(context, "getPoint", id, time, {x, y});
}

void getColor(HostContext context, const char* id, int32_t time, float* red, float* green,
              float* blue) {
  getNumbers<3>(context, "getColor", id, time, {red, green, blue});
}

void* getLayer(HostContext context, const char* id, int32_t time, int32_t layerArgument,
               char* identifierOut) {
  EffectHost& host = hostOf(context);
  host.enterCallback("getLayer");
  readNumbers(host, id);  // notes an unknown id
  const HostLayer* layer = id != nullptr ? host.chosenLayer(id) : nullptr;
  if (identifierOut != nullptr) {
    std::memcpy(identifierOut, layer != nullptr ? layer->identifier.c_str() : kNoLayerIdentifier,
                kIdentifierChars);
  }
  host.trace().callback("getLayer", readArguments(id, time) + ", " + std::to_string(layerArgument),
                        layer != nullptr ? inQuotes(layer->identifier) : "none");
  return const_cast<HostLayer*>(layer);
}

int32_t fetchLayer(HostContext context, const void*, const char* identifier, int32_t frameIndex,
                   HostTexture* out) {
  EffectHost& host = hostOf(context);
  host.enterCallback("fetchLayer");
  const std::string name =
      identifier != nullptr ? std::string(identifier, strnlen(identifier, kIdentifierChars)) : "";
  const HostLayer* layer = host.findLayer(name);
  const HostTexture texture = layer != nullptr && !host.faults().failFetchLayer
                                  ? host.fetchLayer(*layer, frameIndex)
                                  : HostTexture{};
  if (out != nullptr) {
    *out = texture;
  }
  const int32_t status = texture.name != 0 ? 0 : 1;
  host.trace().callback("fetchLayer", inQuotes(name) + ", frame " + std::to_string(frameIndex),
                        std::to_string(status));
  return status;
}

// Effects read the kind, the frame count and the height of the record the host fills.
static_assert(offsetof(HostLayerInfo, kind) == 0);
static_assert(offsetof(HostLayerInfo, frameCount) == 4);

int32_t getLayerInfo(HostContext context, const void* layer, int32_t time, HostLayerInfo* out) {
  EffectHost& host = hostOf(context);
  host.enterCallback("getLayerInfo");
  const HostLayer* known = host.findLayer(layer);
  const bool filled = known != nullptr && out != nullptr && !host.faults().failLayerInfo;
  if (filled) {
    *out = known->info;
  }
  char arguments[64];
  std::snprintf(arguments, sizeof arguments, "%p, t=%d", layer, time);
  host.trace().callback("getLayerInfo", arguments,
                        filled ? "0 (height " + std::to_string(known->info.height) + ")" : "1");
  return filled ? 0 : 1;
}

void setBool(HostContext context, const char* id, int32_t time, uint8_t value, int32_t) {
  EffectHost& host = hostOf(context);
  host.enterCallback("setBool");
  if (id == nullptr || !host.parameters().writeBool(id, value != 0)) {
    host.noteUnknownId(id);
  }
  host.trace().callback("setBool", readArguments(id, time) + ", " + std::to_string(value), "");
}

void setInt(HostContext context, const char* id, int32_t time, int32_t value, int32_t) {
  EffectHost& host = hostOf(context);
  host.enterCallback("setInt");
  if (id == nullptr || !host.parameters().writeInt(id, value)) {
    host.noteUnknownId(id);
  }
  host.trace().callback("setInt", readArguments(id, time) + ", " + std::to_string(value), "");
}

// ---- rendering ----------------------------------------------------------------------------

int32_t progress(HostContext context, int32_t done, int32_t total) {
  EffectHost& host = hostOf(context);
  host.enterCallback("progress");
  const int stopAt = host.faults().stopAtProgress;
  const int32_t stop = stopAt >= 0 && done >= stopAt ? 1 : 0;
  host.trace().callback("progress", std::to_string(done) + "/" + std::to_string(total),
                        std::to_string(stop));
  return stop;
}

void redrawControl(HostContext context, const char* id) {
  EffectHost& host = hostOf(context);
  host.enterCallback("redrawControl");
  host.noteRedraw();
  host.trace().callback("redrawControl", inQuotes(id), "");
}

// ---- render interface ---------------------------------------------------------------------

uint32_t vertexArray(HostContext context) {
  EffectHost& host = hostOf(context);
  host.enterCallback("vertexArray");
  GlThread* thread = GlThread::current();
  const uint32_t name = thread != nullptr ? thread->vertexArray() : 0;
  host.trace().callback("vertexArray", "", std::to_string(name));
  return name;
}

uint32_t createBuffer(HostContext context, uint32_t target, uint32_t sizeBytes, const void* data,
                      uint32_t usage, uint32_t* out, int32_t) {
  EffectHost& host = hostOf(context);
  host.enterCallback("createBuffer");
  GLuint buffer = 0;
  glGenBuffers(1, &buffer);
  glBindBuffer(target, buffer);
  glBufferData(target, sizeBytes, data, usage);
  glBindBuffer(target, 0);
  if (out != nullptr) {
    *out = buffer;
  }
  host.trace().callback("createBuffer",
                        hex(target) + ", " + std::to_string(sizeBytes) + " bytes, " + hex(usage),
                        std::to_string(buffer));
  return buffer;
}

void releaseBuffer(HostContext context, uint32_t name) {
  EffectHost& host = hostOf(context);
  host.enterCallback("releaseBuffer");
  glDeleteBuffers(1, &name);
  host.trace().callback("releaseBuffer", std::to_string(name), "");
}

uint32_t allocateTexture(HostContext context, const HostRenderRecord*, uint32_t width,
                         uint32_t height, uint32_t internalFormat, uint32_t format,
                         uint32_t pixelType, uint32_t, uint32_t, uint32_t* allocatedWidth,
                         uint32_t* allocatedHeight, uint8_t flag) {
  EffectHost& host = hostOf(context);
  host.enterCallback("allocateTexture");
  const HostTexture texture = host.allocateWorkingTexture(
      width, height, internalFormat != GL_RGBA && internalFormat != GL_RGBA8);
  if (allocatedWidth != nullptr) {
    *allocatedWidth = texture.allocatedWidth;
  }
  if (allocatedHeight != nullptr) {
    *allocatedHeight = texture.allocatedHeight;
  }
  host.trace().callback(
      "allocateTexture",
      std::to_string(width) + "x" + std::to_string(height) + ", " + hex(internalFormat) + ", " +
          hex(format) + ", " + hex(pixelType) + ", flag " + std::to_string(flag),
      std::to_string(texture.name) + " (" + std::to_string(texture.allocatedWidth) + "x" +
          std::to_string(texture.allocatedHeight) + ")");
  return texture.name;
}

void fetchOwnLayer(HostContext context, int32_t, int32_t frameIndex, HostTexture* out) {
  EffectHost& host = hostOf(context);
  host.enterCallback("fetchOwnLayer");
  const HostTexture texture = host.fetchOwnLayer(frameIndex);
  if (out != nullptr) {
    *out = texture;
  }
  host.trace().callback("fetchOwnLayer", "frame " + std::to_string(frameIndex),
                        std::to_string(texture.name));
}

void releaseLayer(HostContext context, const void*, uint32_t textureName) {
  EffectHost& host = hostOf(context);
  host.enterCallback("releaseLayer");
  host.releaseWorkingTexture(textureName);
  host.trace().callback("releaseLayer", std::to_string(textureName), "");
}

}  // namespace

void installCallbacks(HostEffectRecord& record) {
  record.hostIdentifier = hostIdentifier;
  record.hostVersion = hostVersion;
  record.beginGroup = beginGroup;
  record.endGroup = endGroup;
  record.defineFloat = defineFloat;
  record.defineBool = defineBool;
  record.defineChoice = defineChoice;
  record.definePoint = definePoint;
  record.defineAngle = defineAngle;
  record.defineColor = defineColor;
  record.defineLayer = defineLayer;
  record.setParamVisible = setParamVisible;
  record.getFloat = getScalar<kGetFloat, float, readFloat>;
  record.getBool = getScalar<kGetBool, uint8_t, readBool>;
  record.getInt = getScalar<kGetInt, int32_t, readInt>;
  record.getPoint = getPoint;
  record.getAngle = getScalar<kGetAngle, float, readFloat>;
  record.getColor = getColor;
  record.getLayer = getLayer;
  record.getLayerInfo = getLayerInfo;
  record.progress = progress;
  record.setBool = setBool;
  record.setInt = setInt;
  record.defineSlider = defineSlider;
  record.defineControl = defineControl;
  record.redrawControl = redrawControl;
  record.allocateTexture = allocateTexture;
  record.fetchOwnLayer = fetchOwnLayer;
  record.fetchLayer = fetchLayer;
  record.releaseLayer = releaseLayer;
  record.vertexArray = vertexArray;
  record.createBuffer = createBuffer;
  record.releaseBuffer = releaseBuffer;
}

}  // namespace vtpl::host
