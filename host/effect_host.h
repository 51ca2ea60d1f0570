// One effect instance as the editor drives it: the host record with its callback table, the
// parameter panel, and the messages of the effect's life (create the shared data, create the
// instance, declare the parameters, ..., destroy the instance, destroy the shared data).
#ifndef VTPL_HOST_EFFECT_HOST_H
#define VTPL_HOST_EFFECT_HOST_H

#include <array>
#include <cstdint>
#include <map>
#include <memory>
#include <ostream>
#include <string>
#include <string_view>
#include <vector>

#include "gl_thread.h"
#include "image.h"
#include "parameter_store.h"
#include "plugin_module.h"
#include "trace_log.h"
#include "vtpl/host_interface.h"

namespace vtpl::host {

struct HostSettings {
  std::u16string identifier = u"com.vantric.Vantric";
  int32_t version = 5600;
  bool verbose = false;
  // After the declarations, report every parameter once as changed, as the editor does when it
  // opens an effect, so that the effect can set the panel's initial visibility.
  bool announceInitialValues = true;
  // Run messages on a render and an interface thread with shared headless GL contexts (the
  // control drawing, kMessageDrawControl, on the interface thread, all others on the render
  // thread), and send the GL set-up, kMessageSetUp, when opening. Without it messages run on the
  // caller's thread and no GL is needed.
  bool gl = false;
  // Allocate layer and working textures with power-of-two storage instead of exact sizes.
  bool padTextures = false;
};

// Faults the host commits on request, so tests can see how an effect copes with a bad host.
struct HostFaults {
  int rejectDeclaration = 0;      // refuse the Nth parameter declaration (1-based); 0: none
  std::string throwInCallback;    // throw from the callback of this name (as the trace names it)
  bool throwNonStandard = false;  // throw an int instead of a std::runtime_error
  bool failLayerInfo = false;     // getLayerInfo answers with a failure status
  bool failFetchLayer = false;    // fetchLayer answers a failure status and hands out no texture
  int stopAtProgress = -1;        // progress asks to stop from this many steps done on
};

// How a frame is rendered: the editor's marks on the render record.
struct FrameOptions {
  bool unwatched = false;     // no scope control shows this frame
  bool noIdentifier = false;  // the all-zero identifier: analyse the whole frame
  int32_t frameIndex = 0;
};

// What the editor asks of a scope control drawing.
struct ControlOptions {
  int32_t frameIndex = 0;
  int32_t frameCount = 1;
  bool force = false;
  bool noIdentifier = false;
  int32_t width = 250;  // pixels
  int32_t height = 150;
  std::array<double, 3> background = {0.15, 0.15, 0.15};  // the panel's colour, red, green, blue
  double labelScale = 1.0;                                // the interface's text scale
};

// A layer the host can report to the effect (a parameter change of "Effect_Parent_Layer").
struct HostLayer {
  HostLayerInfo info{};
  std::string identifier;  // 36 characters
  Image picture;           // what fetchLayer hands out; empty for layers without pixels
  bool asFloat = false;
};

class EffectHost {
 public:
  explicit EffectHost(const PluginModule& module, HostSettings settings = {},
                      std::ostream* trace = nullptr);
  ~EffectHost();  // closes
  EffectHost(const EffectHost&) = delete;
  EffectHost& operator=(const EffectHost&) = delete;

  // Creates the shared data and the instance and asks for the parameter declarations (then
  // reports every parameter as changed when announceInitialValues is set, and sends the GL set-up
  // with GL). Throws HostError naming the message that failed, after closing again.
  void open();
  // Destroys the instance while the instance slot is set, then the shared data while the shared
  // slot is set.
  void close() noexcept;

  // Sends one message with the record as it stands.
  int32_t send(int32_t message);
  // Reports `id` as changed (kMessageParameterChanged).
  int32_t changeParameter(const std::string& id);
  // Reports `id` as edited by the user (kMessageParameterEdited or kMessageParameterEditedAlt).
  int32_t editParameter(const std::string& id, int32_t message = kMessageParameterEdited);
  // Reports a change of "Effect_Parent_Layer", the effect's parent layer, to a layer of this size.
  int32_t changeParentLayer(int32_t width, int32_t height);
  // Chooses a layer of this picture as the comparison layer ("overlayLayer"), or none for an
  // empty picture, then reports the change as a user's pick. Returns the new layer (null when
  // cleared), which stays the host's and may be changed (its kind, its frame count) later on.
  HostLayer* setComparisonLayer(const Image& picture, bool asFloat = false);
  // The layer chosen for a layer parameter, or null.
  const HostLayer* chosenLayer(const std::string& id) const;
  const HostLayer* findLayer(const std::string& identifier) const;
  // A texture of the layer's picture in the calling thread's context, released like working
  // textures; a name of 0 when the layer has no pixels for that frame.
  HostTexture fetchLayer(const HostLayer& layer, int32_t frameIndex);
  // A user's edit: the value from text, then reports of the change and of the edit. Throws
  // HostError.
  void setValueFromText(const std::string& id, const std::string& text);
  // Renders one frame of `layer` (8-bit storage, or float storage when asked or when the picture
  // has 16 bits); returns the output, read back. Needs GL. Throws HostError.
  Image renderFrame(const Image& layer, bool asFloat = false, const FrameOptions& options = {});
  // Attaches and detaches the scope control (kMessageAttach, kMessageDetach), as the editor does
  // while a scope panel is open.
  int32_t attachControl() { return send(kMessageAttach); }
  int32_t detachControl() { return send(kMessageDetach); }
  // Draws the scope control, on the interface thread. With GL, the control is drawn
  // into an 8-bit texture of its size, attached to the thread's framebuffer, cleared to
  // transparent black and with the viewport set to it, as the editor prepares its panel; the
  // picture is read back into controlPicture(). Returns what Notify answered.
  int32_t drawControl(const ControlOptions& options);
  // The picture of the last control drawing (straight alpha, 8 bits, rows from the top); empty
  // before the first drawing, without GL, or after a drawing of no size.
  const Image& controlPicture() const { return controlPicture_; }

  HostEffectRecord& record() { return record_; }
  ParameterStore& parameters() { return store_; }
  const HostSettings& settings() const { return settings_; }
  HostFaults& faults() { return faults_; }
  // Textures lent to the effect (fetched layers, the own layer, working textures) that it did not
  // hand back with releaseLayer: still lent now, or reclaimed by the host after a render.
  size_t texturesNotHandedBack() const { return texturesReclaimed_ + workingTextures_.size(); }
  TraceLog& trace() { return trace_; }

  // What the callbacks saw.
  const std::vector<std::string>& unknownParameterIds() const { return unknownIds_; }
  int redrawRequests() const { return redrawRequests_; }
  int callbackCount() const { return callbackCount_; }
  // How often the effect called the callback of this name.
  int callbackCount(const std::string& name) const;

  // Bookkeeping for the callback table.
  void enterCallback(std::string_view name);  // counts; commits an injected throw
  int32_t declareParameter(ParameterDeclaration declaration);
  void noteUnknownId(const char* id);
  void noteRedraw() { ++redrawRequests_; }
  const HostLayer* findLayer(const void* handle) const;
  // Working textures allocated for the effect, handed back with releaseLayer or after the frame.
  HostTexture allocateWorkingTexture(uint32_t width, uint32_t height, bool asFloat);
  // The effect's own layer at a frame index, uploaded into the calling thread's context; a
  // texture name of 0 when the host has no such frame. Released like working textures.
  HostTexture fetchOwnLayer(int32_t frameIndex);
  bool releaseWorkingTexture(uint32_t name);

 private:
  int32_t sendWithDetail(int32_t message, const std::string& detail);
  int32_t sendNamingParameter(int32_t message, const std::string& id);
  void expectHandled(int32_t message, int32_t result, const std::string& what);

  const PluginModule& module_;
  HostSettings settings_;
  HostFaults faults_;
  TraceLog trace_;
  ParameterStore store_;
  HostEffectRecord record_{};
  HostChangedParameter changed_{};
  std::string changedId_;
  HostLayerReference layerReference_{};
  std::vector<std::unique_ptr<HostLayer>> layers_;
  std::map<std::string, const HostLayer*> chosenLayers_;  // by layer parameter id
  std::vector<std::string> unknownIds_;
  int declarationsSeen_ = 0;
  int redrawRequests_ = 0;
  int callbackCount_ = 0;
  std::map<std::string, int, std::less<>> callbacksByName_;
  std::vector<HostTexture> workingTextures_;
  size_t texturesReclaimed_ = 0;
  Image ownLayer_;  // the picture of the frame last rendered (frame index 0)
  Image controlPicture_;
  bool ownLayerIsFloat_ = false;
  std::unique_ptr<GlThread> renderThread_;
  std::unique_ptr<GlThread> interfaceThread_;
};

}  // namespace vtpl::host

#endif  // VTPL_HOST_EFFECT_HOST_H
