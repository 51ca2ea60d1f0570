#include "effect_host.h"

#include <GL/glew.h>

#include <array>
#include <cstdio>
#include <stdexcept>

#include "host_callbacks.h"
#include "host_error.h"
#include "layer_textures.h"

namespace vtpl::host {

namespace {

constexpr char kParentLayerName[] = "Effect_Parent_Layer";
// The identifier of the frames this host renders, and the all-zero form of a render without one.
constexpr char kRenderIdentifier[] = "5c0e1f2a-3b4c-4d5e-8f60-718293a4b5c6";
constexpr char kNoIdentifier[] = "00000000-0000-0000-0000-000000000000";
constexpr char kControlId[] = "waveformControl";

std::array<float, 16> orthographic(float width, float height) {
  return {2.0f / width, 0, 0, 0, 0, 2.0f / height, 0, 0, 0, 0, -1, 0, -1, -1, 0, 1};
}

// The editor's panel for a control: an 8-bit picture of the control's size as the colour
// target of the interface thread's framebuffer, cleared to transparent black, with the viewport
// covering it. Whatever the effect leaves there is the control's picture.
HostTexture attachControlTarget(GLuint framebuffer, const HostControlRecord& control) {
  HostTexture target = allocateLayerTexture(static_cast<uint32_t>(control.width),
                                            static_cast<uint32_t>(control.height), false, false);
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer);
  glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, target.name, 0);
  glViewport(0, 0, control.width, control.height);
  glDisable(GL_SCISSOR_TEST);
  glColorMask(GL_TRUE, GL_TRUE, GL_TRUE, GL_TRUE);
  glClearColor(0, 0, 0, 0);
  glClear(GL_COLOR_BUFFER_BIT);
  return target;
}

void detachControlTarget(GLuint framebuffer) {
  glBindFramebuffer(GL_FRAMEBUFFER, framebuffer);
  glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, 0, 0);
}

}  // namespace

EffectHost::EffectHost(const PluginModule& module, HostSettings settings, std::ostream* trace)
    : module_(module), settings_(std::move(settings)), trace_(trace) {
  record_.verbose = settings_.verbose ? 1 : 0;
  installCallbacks(record_);
  if (settings_.gl) {
    renderThread_ = std::make_unique<GlThread>("render");
    interfaceThread_ = std::make_unique<GlThread>("interface", renderThread_.get());
  }
}

EffectHost::~EffectHost() {
  close();
}

void EffectHost::open() {
  try {
    expectHandled(kMessageCreateSharedData, send(kMessageCreateSharedData), "create shared data");
    expectHandled(kMessageCreateInstance, send(kMessageCreateInstance), "create its instance");
    if (record_.instance == nullptr) {
      throw HostError("the effect did not create its instance");
    }
    expectHandled(kMessageDeclareParameters, send(kMessageDeclareParameters),
                  "declare its parameters");
    if (store_.openGroupCount() != 0) {
      throw HostError("the effect left " + std::to_string(store_.openGroupCount()) +
                      " parameter group(s) open");
    }
    if (settings_.announceInitialValues) {
      std::vector<std::string> ids;
      for (const Parameter& parameter : store_.parameters()) {
        ids.push_back(parameter.declaration.id);
      }
      for (const std::string& id : ids) {
        expectHandled(kMessageParameterChanged, changeParameter(id), "react to '" + id + "'");
      }
    }
    if (settings_.gl) {
      expectHandled(kMessageSetUp, send(kMessageSetUp), "set up its GL programs");
    }
  } catch (...) {
    close();
    throw;
  }
}

void EffectHost::close() noexcept {
  if (record_.instance != nullptr) {
    send(kMessageDestroyInstance);
  }
  if (record_.sharedData != nullptr) {
    send(kMessageDestroySharedData);
  }
}

int32_t EffectHost::send(int32_t message) {
  return sendWithDetail(message, "");
}

int32_t EffectHost::sendWithDetail(int32_t message, const std::string& detail) {
  trace_.messageSent(message, detail);
  int32_t result = 0;
  const auto deliver = [&] { result = module_.notifyEntry()(this, &record_, message); };
  GlThread* thread = message == kMessageDrawControl ? interfaceThread_.get() : renderThread_.get();
  if (thread != nullptr) {
    thread->run([&] {
      // Effects draw into whatever framebuffer the host has bound.
      glBindFramebuffer(GL_FRAMEBUFFER, thread->framebuffer());
      deliver();
    });
  } else {
    deliver();
  }
  trace_.messageAnswered(message, result);
  return result;
}

int32_t EffectHost::changeParameter(const std::string& id) {
  return sendNamingParameter(kMessageParameterChanged, id);
}

int32_t EffectHost::editParameter(const std::string& id, int32_t message) {
  return sendNamingParameter(message, id);
}

int32_t EffectHost::sendNamingParameter(int32_t message, const std::string& id) {
  changedId_ = id;
  changed_.id = changedId_.c_str();
  record_.changed = &changed_;
  const int32_t result = sendWithDetail(message, inQuotes(id));
  record_.changed = nullptr;
  return result;
}

int32_t EffectHost::changeParentLayer(int32_t width, int32_t height) {
  auto layer = std::make_unique<HostLayer>();
  layer->info.frameCount = 1;
  layer->info.width = width;
  layer->info.height = height;
  layerReference_ = HostLayerReference{};
  layerReference_.layer = layer.get();
  layers_.push_back(std::move(layer));
  record_.messageRecord = &layerReference_;
  const int32_t result = changeParameter(kParentLayerName);
  record_.messageRecord = nullptr;
  return result;
}

HostLayer* EffectHost::setComparisonLayer(const Image& picture, bool asFloat) {
  constexpr char kOverlayLayer[] = "overlayLayer";
  HostLayer* chosen = nullptr;
  if (picture.rgba.empty()) {
    chosenLayers_.erase(kOverlayLayer);
  } else {
    auto layer = std::make_unique<HostLayer>();
    layer->info.frameCount = 1;
    layer->info.width = picture.width;
    layer->info.height = picture.height;
    char identifier[40];
    std::snprintf(identifier, sizeof identifier, "c0a1b2c3-0000-4000-8000-%012zu", layers_.size());
    layer->identifier = identifier;
    layer->picture = picture;
    layer->asFloat = asFloat || picture.bitDepth == 16;
    chosen = layer.get();
    chosenLayers_[kOverlayLayer] = chosen;
    layers_.push_back(std::move(layer));
  }
  expectHandled(kMessageParameterChanged, changeParameter(kOverlayLayer), "react to the layer");
  return chosen;
}

const HostLayer* EffectHost::chosenLayer(const std::string& id) const {
  const auto found = chosenLayers_.find(id);
  return found != chosenLayers_.end() ? found->second : nullptr;
}

const HostLayer* EffectHost::findLayer(const std::string& identifier) const {
  for (const auto& layer : layers_) {
    if (!identifier.empty() && layer->identifier == identifier) {
      return layer.get();
    }
  }
  return nullptr;
}

HostTexture EffectHost::fetchLayer(const HostLayer& layer, int32_t frameIndex) {
  if (layer.picture.rgba.empty() || frameIndex < 0 || frameIndex >= layer.info.frameCount) {
    return HostTexture{};
  }
  workingTextures_.push_back(uploadLayer(layer.picture, layer.asFloat, settings_.padTextures));
  return workingTextures_.back();
}

void EffectHost::setValueFromText(const std::string& id, const std::string& text) {
  store_.setFromText(id, text);
  expectHandled(kMessageParameterChanged, changeParameter(id), "react to '" + id + "'");
  expectHandled(kMessageParameterEdited, editParameter(id), "take the edit of '" + id + "'");
}

Image EffectHost::renderFrame(const Image& layer, bool asFloat, const FrameOptions& options) {
  if (renderThread_ == nullptr) {
    throw HostError("rendering needs a host with GL");
  }
  const bool floatStorage = asFloat || layer.bitDepth == 16;
  ownLayer_ = layer;
  ownLayerIsFloat_ = floatStorage;
  HostTexture source{};
  HostTexture destination{};
  renderThread_->run([&] {
    source = uploadLayer(layer, floatStorage, settings_.padTextures);
    destination =
        allocateLayerTexture(source.width, source.height, floatStorage, settings_.padTextures);
  });
  const std::array<float, 16> projection =
      orthographic(static_cast<float>(layer.width), static_cast<float>(layer.height));
  const std::array<float, 16> identity = {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1};
  HostRenderRecord frame{};
  frame.identifier = options.noIdentifier ? kNoIdentifier : kRenderIdentifier;
  frame.frameIndex = options.frameIndex;
  frame.unwatched = options.unwatched ? 1 : 0;
  frame.source = &source;
  frame.destination = &destination;
  frame.textureScale = 1.0f;
  frame.renderScaleX = frame.renderScaleY = 1.0f;
  frame.projection = projection.data();
  frame.modelView = identity.data();
  frame.frameWidth = layer.width;
  frame.frameHeight = layer.height;
  record_.messageRecord = &frame;
  const int32_t result = send(kMessageRender);
  record_.messageRecord = nullptr;

  Image output;
  renderThread_->run([&] {
    output = readLayer(destination, layer.bitDepth);
    deleteLayerTexture(source);
    deleteLayerTexture(destination);
    texturesReclaimed_ += workingTextures_.size();
    for (HostTexture& texture : workingTextures_) {
      deleteLayerTexture(texture);
    }
    workingTextures_.clear();
  });
  expectHandled(kMessageRender, result, "render the frame");
  return output;
}

int32_t EffectHost::drawControl(const ControlOptions& options) {
  HostControlRecord control{};
  control.identifier = options.noIdentifier ? kNoIdentifier : kRenderIdentifier;
  control.controlId = kControlId;
  control.width = options.width;
  control.height = options.height;
  control.labelScaleX = control.labelScaleY = options.labelScale;
  control.backgroundRed = options.background[0];
  control.backgroundGreen = options.background[1];
  control.backgroundBlue = options.background[2];
  control.frameIndex = options.frameIndex;
  control.frameCount = options.frameCount;
  control.force = options.force ? 1 : 0;

  GlThread* thread = interfaceThread_.get();
  const bool drawsPicture = thread != nullptr && options.width > 0 && options.height > 0;
  controlPicture_ = Image{};
  HostTexture target{};
  if (drawsPicture) {
    thread->run([&] { target = attachControlTarget(thread->framebuffer(), control); });
  }
  const auto finish = [&] {
    if (drawsPicture) {
      thread->run([&] {
        controlPicture_ = readLayer(target, 8);
        detachControlTarget(thread->framebuffer());
        deleteLayerTexture(target);
      });
    }
  };
  record_.messageRecord = &control;
  int32_t result = 0;
  try {
    result = send(kMessageDrawControl);
  } catch (...) {
    record_.messageRecord = nullptr;
    finish();
    throw;
  }
  record_.messageRecord = nullptr;
  finish();
  return result;
}

HostTexture EffectHost::allocateWorkingTexture(uint32_t width, uint32_t height, bool asFloat) {
  workingTextures_.push_back(allocateLayerTexture(width, height, asFloat, settings_.padTextures));
  return workingTextures_.back();
}

HostTexture EffectHost::fetchOwnLayer(int32_t frameIndex) {
  if (frameIndex != 0 || ownLayer_.rgba.empty()) {
    return HostTexture{};
  }
  workingTextures_.push_back(uploadLayer(ownLayer_, ownLayerIsFloat_, settings_.padTextures));
  return workingTextures_.back();
}

bool EffectHost::releaseWorkingTexture(uint32_t name) {
  for (auto texture = workingTextures_.begin(); texture != workingTextures_.end(); ++texture) {
    if (texture->name == name) {
      deleteLayerTexture(*texture);
      workingTextures_.erase(texture);
      return true;
    }
  }
  return false;
}

void EffectHost::expectHandled(int32_t message, int32_t result, const std::string& what) {
  if (result != kResultHandled) {
    throw HostError("the effect failed to " + what + " (Notify " + std::to_string(message) +
                    " returned " + std::to_string(result) + ")");
  }
}

int EffectHost::callbackCount(const std::string& name) const {
  const auto found = callbacksByName_.find(name);
  return found != callbacksByName_.end() ? found->second : 0;
}

void EffectHost::enterCallback(std::string_view name) {
  ++callbackCount_;
  ++callbacksByName_[std::string(name)];
  if (name != faults_.throwInCallback) {
    return;
  }
  if (faults_.throwNonStandard) {
    throw 42;
  }
  throw std::runtime_error("host fault injected in " + std::string(name));
}

int32_t EffectHost::declareParameter(ParameterDeclaration declaration) {
  if (++declarationsSeen_ == faults_.rejectDeclaration) {
    return kDeclarationRefused;
  }
  return store_.declare(std::move(declaration));
}

void EffectHost::noteUnknownId(const char* id) {
  unknownIds_.push_back(id != nullptr ? id : "(null)");
}

const HostLayer* EffectHost::findLayer(const void* handle) const {
  for (const auto& layer : layers_) {
    if (layer.get() == handle) {
      return layer.get();
    }
  }
  return nullptr;
}

}  // namespace vtpl::host
