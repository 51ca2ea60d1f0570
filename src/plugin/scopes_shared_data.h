// State one effect shares between the host's render thread and its interface thread: the last
// waveforms the render computed, and how many scope controls are attached.
#ifndef WAVEFORM_PLUGIN_SCOPES_SHARED_DATA_H
#define WAVEFORM_PLUGIN_SCOPES_SHARED_DATA_H

#include <atomic>
#include <cstdint>
#include <memory>
#include <mutex>

#include "scope/waveform_result.h"

namespace plugin::Scopes {

// Members are destroyed in reverse order: the comparison texture reference is dropped before the
// primary one, and the lock last.
struct ScopesSharedData {
  std::mutex lock;  // guards primary and comparison
  WaveformResult primary;
  WaveformResult comparison;
  int32_t analysedFrame = -1;
  std::atomic<int32_t> attachmentCount{0};
  // 1 while the results match what the render last needed; 0 tells the control to analyse.
  std::atomic<uint8_t> resultsFresh{1};
};

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_SCOPES_SHARED_DATA_H
