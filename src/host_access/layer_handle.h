// A texture the host lends the effect for the length of one message: a layer fetched from the
// host or a working texture it allocated. The handle hands it back with releaseLayer when it goes,
// on every path, exceptions included.
#ifndef WAVEFORM_HOST_ACCESS_LAYER_HANDLE_H
#define WAVEFORM_HOST_ACCESS_LAYER_HANDLE_H

#include "host_access/host_calls.h"
#include "vtpl/host_interface.h"

namespace Plugin::host {

class LayerHandle {
 public:
  LayerHandle() = default;
  // Takes over `texture`; `messageRecord` is what releaseLayer is given with it. A texture
  // without a name is an empty handle.
  LayerHandle(const HostCalls& host, const void* messageRecord, const vtpl::HostTexture& texture);
  // Hands the texture back; a host failure there is swallowed, as nothing can be done about it.
  ~LayerHandle();
  LayerHandle(LayerHandle&& other) noexcept;
  LayerHandle& operator=(LayerHandle&&) = delete;
  LayerHandle(const LayerHandle&) = delete;
  LayerHandle& operator=(const LayerHandle&) = delete;

  // All zero for an empty handle.
  const vtpl::HostTexture& texture() const { return texture_; }
  bool empty() const { return texture_.name == 0; }

  // Hands the texture back now, at the point the message order asks for; leaves the handle
  // empty. A failing host callback throws from here.
  void release();

 private:
  vtpl::HostEffectRecord* record_ = nullptr;
  vtpl::HostContext context_ = nullptr;
  const void* messageRecord_ = nullptr;
  vtpl::HostTexture texture_{};
};

}  // namespace Plugin::host

#endif  // WAVEFORM_HOST_ACCESS_LAYER_HANDLE_H
