// The binary interface between the Vantric editor (or the reference host) and an effect module.
//
// Every record here is laid out byte for byte as the editor lays it out on 64-bit platforms; the
// static_asserts pin each offset the two sides rely on. Space whose meaning belongs to the host is
// declared as reserved bytes so that the fields the effect uses land where the host put them.
// Wide strings are UTF-16 (char16_t); identifiers are narrow NUL-terminated ASCII.
#ifndef VTPL_HOST_INTERFACE_H
#define VTPL_HOST_INTERFACE_H

#include <cstddef>
#include <cstdint>

namespace vtpl {

// ---------------------------------------------------------------------------------------------
// Message codes passed as the third argument of Notify.

enum MessageCode : int32_t {
  kMessageCreateInstance = 0,
  kMessageDestroyInstance = 1,
  kMessageDeclareParameters = 2,
  kMessageCreateSharedData = 3,
  kMessageDestroySharedData = 4,
  kMessageParameterChanged = 7,
  kMessageSetUp = 8,
  kMessageRender = 10,
  kMessageAcknowledged = 11,
  kMessageParameterEdited = 13,
  kMessageParameterEditedAlt = 14,
  kMessageAttach = 1001,
  kMessageDetach = 1002,
  kMessageDrawControl = 1003,
  kMessageAcknowledgedFirst = 1004,
  kMessageAcknowledgedLast = 1011,
};

// Results of Notify.
enum NotifyResult : int32_t {
  kResultHandled = 1,
  kResultNotHandled = 2,
  kResultFailed = 5,
};

// Status returned by the declaration callbacks; anything else is a refusal.
constexpr int32_t kStatusOk = 0;

// ---------------------------------------------------------------------------------------------
// Texture record: how the host describes a texture it allocated.

struct HostTexture {
  uint32_t name;            // GL texture object
  uint32_t pixelType;       // GL type enum, GL_FLOAT (0x1406) by default
  uint32_t format;          // GL format enum, GL_RGBA (0x1908) by default
  uint32_t allocatedWidth;  // storage the host allocated
  uint32_t allocatedHeight;
  uint32_t width;  // area in use
  uint32_t height;
  float uMin, vMin, uMax, vMax;  // texture-coordinate rectangle of the area in use
  float factor1, factor2;        // 1.0 by default
};
static_assert(offsetof(HostTexture, name) == 0);
static_assert(offsetof(HostTexture, pixelType) == 4);
static_assert(offsetof(HostTexture, format) == 8);
static_assert(offsetof(HostTexture, allocatedWidth) == 12);
static_assert(offsetof(HostTexture, allocatedHeight) == 16);
static_assert(offsetof(HostTexture, width) == 20);
static_assert(offsetof(HostTexture, height) == 24);
static_assert(offsetof(HostTexture, uMin) == 28);
static_assert(offsetof(HostTexture, vMax) == 40);
static_assert(offsetof(HostTexture, factor1) == 44);
static_assert(offsetof(HostTexture, factor2) == 48);
static_assert(sizeof(HostTexture) == 52);

// ---------------------------------------------------------------------------------------------
// Plug-in information record, filled once by PluginInfo.

struct PluginInfoRecord {
  uint32_t header;   // written as 0
  uint8_t guid[16];  // the effect's GUID in memory order
  uint8_t reserved20[4];
  char16_t* name;  // host buffers the effect copies into, with their bounds below
  char16_t* category;
  char16_t* maker;
  char16_t* copyright;
  uint32_t version[4];      // major, minor, revision, build
  uint32_t descriptorSize;  // written as 16
  uint8_t reserved76[12];
  uint32_t interfaceMagic;       // written as 0x089E31C7
  uint32_t interfaceVersion[2];  // one little-endian u64 split across two aligned words
  uint8_t reserved100[4];
  char* bundleIdentifier;  // narrow buffer; may be null
};
static_assert(offsetof(PluginInfoRecord, header) == 0);
static_assert(offsetof(PluginInfoRecord, guid) == 4);
static_assert(offsetof(PluginInfoRecord, name) == 24);
static_assert(offsetof(PluginInfoRecord, category) == 32);
static_assert(offsetof(PluginInfoRecord, maker) == 40);
static_assert(offsetof(PluginInfoRecord, copyright) == 48);
static_assert(offsetof(PluginInfoRecord, version) == 56);
static_assert(offsetof(PluginInfoRecord, descriptorSize) == 72);
static_assert(offsetof(PluginInfoRecord, interfaceMagic) == 88);
static_assert(offsetof(PluginInfoRecord, interfaceVersion) == 92);
static_assert(offsetof(PluginInfoRecord, bundleIdentifier) == 104);

// Capacities, in characters, of the host buffers of PluginInfoRecord.
constexpr size_t kInfoNameChars = 512;
constexpr size_t kInfoCategoryChars = 300;
constexpr size_t kInfoMakerChars = 100;
constexpr size_t kInfoCopyrightChars = 400;
constexpr size_t kInfoBundleIdentifierChars = 100;

// ---------------------------------------------------------------------------------------------
// Records passed through the message-specific slot of HostEffectRecord.

// Length of the layer and render identifiers ("00000000-0000-0000-0000-000000000000").
constexpr size_t kIdentifierChars = 36;

// Message 7: the layer the effect sits on, sent with "Effect_Parent_Layer".
struct HostLayerReference {
  uint8_t reserved0[8];
  void* layer;  // layer handle, may be null
  uint8_t reserved16[96];
  int32_t time;
  uint8_t reserved116[12];
};
static_assert(offsetof(HostLayerReference, layer) == 8);
static_assert(offsetof(HostLayerReference, time) == 112);

// Filled by getLayerInfo. Only the fields named here are read by effects.
struct HostLayerInfo {
  uint32_t kind;  // layer kind, 0 to 7
  int32_t frameCount;
  uint8_t reserved8[100];
  int32_t width;
  int32_t height;  // layer height in pixels
  uint8_t reserved116[140];
};
static_assert(offsetof(HostLayerInfo, height) == 112);
static_assert(sizeof(HostLayerInfo) == 256);

// Message 10: one frame to render.
struct HostRenderRecord {
  uint8_t reserved0[8];
  const char* identifier;    // 36 characters; all zeros when the render has no identifier
  HostTexture* source;       // the effect's own layer
  HostTexture* destination;  // the output
  uint32_t reserved32;
  float textureScale;
  uint8_t reserved40[4];
  float renderScaleX;
  float renderScaleY;
  uint8_t reserved52[12];
  const float* projection;  // 4x4, column-major
  const float* modelView;   // 4x4, column-major
  uint8_t reserved80[16];
  int32_t frameWidth;
  int32_t frameHeight;
  uint8_t reserved104[4];
  int32_t layerArgument;  // passed on to getLayer
  int32_t time;
  uint8_t reserved116[40];
  int32_t frameIndex;
  uint8_t reserved160[4];
  uint8_t linearLight;  // the layers hold linear-light values
  uint8_t reserved165[27];
  uint8_t unwatched;  // no scope control shows this frame
  uint8_t reserved193[7];
};
static_assert(offsetof(HostRenderRecord, identifier) == 8);
static_assert(offsetof(HostRenderRecord, source) == 16);
static_assert(offsetof(HostRenderRecord, destination) == 24);
static_assert(offsetof(HostRenderRecord, textureScale) == 36);
static_assert(offsetof(HostRenderRecord, renderScaleX) == 44);
static_assert(offsetof(HostRenderRecord, renderScaleY) == 48);
static_assert(offsetof(HostRenderRecord, projection) == 64);
static_assert(offsetof(HostRenderRecord, modelView) == 72);
static_assert(offsetof(HostRenderRecord, frameWidth) == 96);
static_assert(offsetof(HostRenderRecord, frameHeight) == 100);
static_assert(offsetof(HostRenderRecord, layerArgument) == 108);
static_assert(offsetof(HostRenderRecord, time) == 112);
static_assert(offsetof(HostRenderRecord, frameIndex) == 156);
static_assert(offsetof(HostRenderRecord, linearLight) == 164);
static_assert(offsetof(HostRenderRecord, unwatched) == 192);

// Message 1003: draw a custom control.
struct HostControlRecord {
  const char* identifier;  // 36 characters
  const char* controlId;   // the declared id of the control to draw
  int32_t width;           // pixels
  int32_t height;
  double labelScaleX;
  double labelScaleY;
  double backgroundRed;
  double backgroundGreen;
  double backgroundBlue;
  uint8_t reserved64[4];
  int32_t time;
  uint8_t reserved72[4];
  int32_t frameIndex;
  int32_t frameCount;
  uint8_t reserved84[76];
  uint8_t force;  // draw from fresh analysis even if results are current
  uint8_t reserved161[7];
};
static_assert(offsetof(HostControlRecord, identifier) == 0);
static_assert(offsetof(HostControlRecord, controlId) == 8);
static_assert(offsetof(HostControlRecord, width) == 16);
static_assert(offsetof(HostControlRecord, height) == 20);
static_assert(offsetof(HostControlRecord, labelScaleX) == 24);
static_assert(offsetof(HostControlRecord, labelScaleY) == 32);
static_assert(offsetof(HostControlRecord, backgroundRed) == 40);
static_assert(offsetof(HostControlRecord, backgroundGreen) == 48);
static_assert(offsetof(HostControlRecord, backgroundBlue) == 56);
static_assert(offsetof(HostControlRecord, time) == 68);
static_assert(offsetof(HostControlRecord, frameIndex) == 76);
static_assert(offsetof(HostControlRecord, frameCount) == 80);
static_assert(offsetof(HostControlRecord, force) == 160);

// Messages 7, 13 and 14: names the parameter that changed.
struct HostChangedParameter {
  const char* id;  // NUL-terminated
};

// ---------------------------------------------------------------------------------------------
// Host callbacks. The first argument of each is the host context handle given to Notify.

using HostContext = void*;

using HostIdentifierFn = const char16_t* (*)(HostContext);
using HostVersionFn = int32_t (*)(HostContext);
using BeginGroupFn = int32_t (*)(HostContext, const char16_t* label);
using EndGroupFn = int32_t (*)(HostContext);
using DefineFloatFn = int32_t (*)(HostContext, const char16_t* label, const char16_t* unit,
                                  const char* id, uint32_t flags, float min, float max,
                                  float defaultValue, int32_t decimals);
using DefineBoolFn = int32_t (*)(HostContext, const char16_t* label, const char* id, uint32_t flags,
                                 uint8_t defaultValue);
using DefineChoiceFn = int32_t (*)(HostContext, const char16_t* label, const char* id,
                                   uint32_t flags, const char16_t* items, const int32_t* values,
                                   int32_t defaultIndex);
using DefinePointFn = int32_t (*)(HostContext, const char16_t* label, const char* id,
                                  uint32_t flags, float defaultX, float defaultY);
using DefineAngleFn = int32_t (*)(HostContext, const char16_t* label, const char* id,
                                  uint32_t flags, uint8_t option, float defaultDegrees);
using DefineColorFn = int32_t (*)(HostContext, const char16_t* label, const char* id,
                                  uint32_t flags, float red, float green, float blue);
using DefineLayerFn = int32_t (*)(HostContext, const char16_t* label, const char* id,
                                  uint32_t flags);
using SetParamVisibleFn = int32_t (*)(HostContext, const char* id, const uint8_t* shown);
using GetFloatFn = float (*)(HostContext, const char* id, int32_t time);
using GetBoolFn = uint8_t (*)(HostContext, const char* id, int32_t time);
using GetIntFn = int32_t (*)(HostContext, const char* id, int32_t time);
using GetPointFn = void (*)(HostContext, const char* id, int32_t time, float* x, float* y);
using GetAngleFn = float (*)(HostContext, const char* id, int32_t time);
using GetColorFn = void (*)(HostContext, const char* id, int32_t time, float* red, float* green,
                            float* blue);
// Resolves a layer parameter: writes the layer's 36-character identifier (no terminator) and
// returns its handle, null when no layer is chosen.
using GetLayerFn = void* (*)(HostContext, const char* id, int32_t time, int32_t layerArgument,
                             char* identifierOut);
using AllocateTextureFn = uint32_t (*)(HostContext, const HostRenderRecord* render, uint32_t width,
                                       uint32_t height, uint32_t internalFormat, uint32_t format,
                                       uint32_t pixelType, uint32_t zero1, uint32_t zero2,
                                       uint32_t* allocatedWidth, uint32_t* allocatedHeight,
                                       uint8_t flag);
using FetchOwnLayerFn = void (*)(HostContext, int32_t zero, int32_t frameIndex, HostTexture* out);
using ReleaseLayerFn = void (*)(HostContext, const void* messageRecord, uint32_t textureName);
using GetLayerInfoFn = int32_t (*)(HostContext, const void* layer, int32_t time,
                                   HostLayerInfo* out);
using FetchLayerFn = int32_t (*)(HostContext, const void* messageRecord, const char* identifier,
                                 int32_t frameIndex, HostTexture* out);
using ProgressFn = int32_t (*)(HostContext, int32_t done, int32_t total);
using SetBoolFn = void (*)(HostContext, const char* id, int32_t time, uint8_t value, int32_t zero);
using SetIntFn = void (*)(HostContext, const char* id, int32_t time, int32_t value, int32_t zero);
using DefineSliderFn = int32_t (*)(HostContext, const char16_t* label, const char16_t* unit,
                                   const char* id, uint32_t flags, float min, float max,
                                   float sliderMin, float sliderMax, float defaultValue,
                                   int32_t decimals);
using DefineControlFn = int32_t (*)(HostContext, const char16_t* label, const char* id,
                                    uint32_t flags, const char16_t* secondText, double aspect,
                                    int32_t size1, int32_t size2, int32_t size3, int32_t size4);
using RedrawControlFn = void (*)(HostContext, const char* id);
using VertexArrayFn = uint32_t (*)(HostContext);
using CreateBufferFn = uint32_t (*)(HostContext, uint32_t target, uint32_t sizeBytes,
                                    const void* data, uint32_t usage, uint32_t* out, int32_t zero);
using ReleaseBufferFn = void (*)(HostContext, uint32_t bufferName);

// ---------------------------------------------------------------------------------------------
// The record passed with every Notify message.

struct HostEffectRecord {
  uint8_t reserved0[8];
  void* instance;                       // the effect instance, owned through this slot
  void* sharedData;                     // the effect's shared data, owned through this slot
  const HostChangedParameter* changed;  // messages 7, 13, 14
  void* messageRecord;                  // HostLayerReference, HostRenderRecord, HostControlRecord
  uint8_t verbose;                      // print the banner and shader logs
  uint8_t reserved41[23];

  HostIdentifierFn hostIdentifier;  // 0x40
  HostVersionFn hostVersion;        // 0x48
  BeginGroupFn beginGroup;          // 0x50
  EndGroupFn endGroup;              // 0x58
  DefineFloatFn defineFloat;        // 0x60
  void* reserved104;
  DefineBoolFn defineBool;      // 0x70
  DefineChoiceFn defineChoice;  // 0x78
  DefinePointFn definePoint;    // 0x80
  DefineAngleFn defineAngle;    // 0x88
  DefineColorFn defineColor;    // 0x90
  DefineLayerFn defineLayer;    // 0x98
  void* reserved160;
  SetParamVisibleFn setParamVisible;  // 0xA8
  void* reserved176;
  GetFloatFn getFloat;  // 0xB8
  GetBoolFn getBool;    // 0xC0
  GetIntFn getInt;      // 0xC8
  GetPointFn getPoint;  // 0xD0
  GetAngleFn getAngle;  // 0xD8
  GetColorFn getColor;  // 0xE0
  GetLayerFn getLayer;  // 0xE8
  void* reserved240;
  AllocateTextureFn allocateTexture;  // 0xF8
  void* reserved256[3];
  FetchOwnLayerFn fetchOwnLayer;  // 0x118
  ReleaseLayerFn releaseLayer;    // 0x120
  GetLayerInfoFn getLayerInfo;    // 0x128
  FetchLayerFn fetchLayer;        // 0x130
  void* reserved312[8];
  ProgressFn progress;  // 0x178
  void* reserved384[4];
  SetBoolFn setBool;  // 0x1A0
  SetIntFn setInt;    // 0x1A8
  void* reserved432[14];
  DefineSliderFn defineSlider;  // 0x220
  void* reserved552[19];
  DefineControlFn defineControl;  // 0x2C0
  RedrawControlFn redrawControl;  // 0x2C8
  void* reserved720[57];
  uint32_t modeValue;  // 0x498: how layers are queried, which texture to copy
  uint8_t reserved1180[12];
  VertexArrayFn vertexArray;      // 0x4A8
  CreateBufferFn createBuffer;    // 0x4B0
  ReleaseBufferFn releaseBuffer;  // 0x4B8
};
static_assert(offsetof(HostEffectRecord, instance) == 8);
static_assert(offsetof(HostEffectRecord, sharedData) == 16);
static_assert(offsetof(HostEffectRecord, changed) == 24);
static_assert(offsetof(HostEffectRecord, messageRecord) == 32);
static_assert(offsetof(HostEffectRecord, verbose) == 40);
static_assert(offsetof(HostEffectRecord, hostIdentifier) == 0x40);
static_assert(offsetof(HostEffectRecord, hostVersion) == 0x48);
static_assert(offsetof(HostEffectRecord, beginGroup) == 0x50);
static_assert(offsetof(HostEffectRecord, endGroup) == 0x58);
static_assert(offsetof(HostEffectRecord, defineFloat) == 0x60);
static_assert(offsetof(HostEffectRecord, defineBool) == 0x70);
static_assert(offsetof(HostEffectRecord, defineChoice) == 0x78);
static_assert(offsetof(HostEffectRecord, definePoint) == 0x80);
static_assert(offsetof(HostEffectRecord, defineAngle) == 0x88);
static_assert(offsetof(HostEffectRecord, defineColor) == 0x90);
static_assert(offsetof(HostEffectRecord, defineLayer) == 0x98);
static_assert(offsetof(HostEffectRecord, setParamVisible) == 0xA8);
static_assert(offsetof(HostEffectRecord, getFloat) == 0xB8);
static_assert(offsetof(HostEffectRecord, getBool) == 0xC0);
static_assert(offsetof(HostEffectRecord, getInt) == 0xC8);
static_assert(offsetof(HostEffectRecord, getPoint) == 0xD0);
static_assert(offsetof(HostEffectRecord, getAngle) == 0xD8);
static_assert(offsetof(HostEffectRecord, getColor) == 0xE0);
static_assert(offsetof(HostEffectRecord, getLayer) == 0xE8);
static_assert(offsetof(HostEffectRecord, allocateTexture) == 0xF8);
static_assert(offsetof(HostEffectRecord, fetchOwnLayer) == 0x118);
static_assert(offsetof(HostEffectRecord, releaseLayer) == 0x120);
static_assert(offsetof(HostEffectRecord, getLayerInfo) == 0x128);
static_assert(offsetof(HostEffectRecord, fetchLayer) == 0x130);
static_assert(offsetof(HostEffectRecord, progress) == 0x178);
static_assert(offsetof(HostEffectRecord, setBool) == 0x1A0);
static_assert(offsetof(HostEffectRecord, setInt) == 0x1A8);
static_assert(offsetof(HostEffectRecord, defineSlider) == 0x220);
static_assert(offsetof(HostEffectRecord, defineControl) == 0x2C0);
static_assert(offsetof(HostEffectRecord, redrawControl) == 0x2C8);
static_assert(offsetof(HostEffectRecord, modeValue) == 0x498);
static_assert(offsetof(HostEffectRecord, vertexArray) == 0x4A8);
static_assert(offsetof(HostEffectRecord, createBuffer) == 0x4B0);
static_assert(offsetof(HostEffectRecord, releaseBuffer) == 0x4B8);
static_assert(sizeof(HostEffectRecord) == 0x4C0);

// ---------------------------------------------------------------------------------------------
// The two exports of an effect module.

extern "C" {
using PluginInfoFn = void (*)(void* first, void* second, PluginInfoRecord* info);
using NotifyFn = int32_t (*)(HostContext context, HostEffectRecord* record, int32_t message);
}

constexpr const char* kPluginInfoSymbol = "PluginInfo";
constexpr const char* kNotifySymbol = "Notify";

}  // namespace vtpl

#endif  // VTPL_HOST_INTERFACE_H
