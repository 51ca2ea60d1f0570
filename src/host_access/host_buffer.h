// A buffer the host creates from the effect's data (createBuffer) and takes back (releaseBuffer)
// when the handle goes, on every path, exceptions included.
#ifndef WAVEFORM_HOST_ACCESS_HOST_BUFFER_H
#define WAVEFORM_HOST_ACCESS_HOST_BUFFER_H

#include <cstdint>

#include "host_access/host_calls.h"

namespace Plugin::host {

class HostBuffer {
 public:
  // Asks the host for a buffer of `target` (a GL buffer target) holding `sizeBytes` of `data`.
  HostBuffer(const HostCalls& host, uint32_t target, const void* data, uint32_t sizeBytes,
             uint32_t usage);
  // Hands the buffer back; a host failure there is swallowed.
  ~HostBuffer();
  HostBuffer(const HostBuffer&) = delete;
  HostBuffer& operator=(const HostBuffer&) = delete;

  uint32_t name() const { return name_; }

 private:
  vtpl::HostEffectRecord& record_;
  vtpl::HostContext context_;
  uint32_t name_ = 0;
  uint32_t filled_ = 0;  // written by the host's createBuffer
};

}  // namespace Plugin::host

#endif  // WAVEFORM_HOST_ACCESS_HOST_BUFFER_H
