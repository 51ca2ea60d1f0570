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

// Creating the instance and the shared data: a failed allocation leaves the slot null.
void createInstance(vtpl::HostEffectRecord& record);
void createSharedData(vtpl::HostEffectRecord& record);

// Destroying the instance: handled, or not handled with the slot left as it was when
// destruction fails.
int32_t destroyInstance(vtpl::HostEffectRecord& record) noexcept;
// Destroying the shared data.
void destroySharedData(vtpl::HostEffectRecord& record);

// A scope control attached or detached; nothing to count without shared data.
void attachControl(vtpl::HostEffectRecord& record);
void detachControl(vtpl::HostEffectRecord& record);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_INSTANCE_LIFECYCLE_H
