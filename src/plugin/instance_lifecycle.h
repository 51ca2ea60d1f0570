// Creating and destroying the two objects the host record owns through its slots: the effect
// instance and the effect's shared data; counting attached scope controls.
#ifndef WAVEFORM_PLUGIN_INSTANCE_LIFECYCLE_H
#define WAVEFORM_PLUGIN_INSTANCE_LIFECYCLE_H

#include <cstdint>

#include "vtpl/host_interface.h"

namespace plugin::Scopes {

class ScopesEffectData;
struct ScopesSharedData;

ScopesEffectData* instanceOf(const vtpl::HostEffectRecord& record);
ScopesSharedData* sharedDataOf(const vtpl::HostEffectRecord& record);

// Messages 0 and 3: a failed allocation leaves the slot null.
void createInstance(vtpl::HostEffectRecord& record);
void createSharedData(vtpl::HostEffectRecord& record);

// Message 1: result 1, or 2 with the slot left as it was when destruction fails.
int32_t destroyInstance(vtpl::HostEffectRecord& record) noexcept;
// Message 4.
void destroySharedData(vtpl::HostEffectRecord& record);

// Messages 1001 and 1002; nothing to count without shared data.
void attachControl(vtpl::HostEffectRecord& record);
void detachControl(vtpl::HostEffectRecord& record);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_INSTANCE_LIFECYCLE_H
