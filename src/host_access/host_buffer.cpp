#include "host_access/host_buffer.h"

namespace Plugin::host {

HostBuffer::HostBuffer(const HostCalls& host, uint32_t target, const void* data, uint32_t sizeBytes,
                       uint32_t usage)
    : record_(host.record()), context_(host.context()) {
  name_ =
      host.call(&vtpl::HostEffectRecord::createBuffer, target, sizeBytes, data, usage, &filled_, 0);
}

HostBuffer::~HostBuffer() {
  try {
    HostCalls(context_, record_).call(&vtpl::HostEffectRecord::releaseBuffer, name_);
  } catch (...) {
    // The host refused the buffer back; a destructor can only let it go.
  }
}

}  // namespace Plugin::host
