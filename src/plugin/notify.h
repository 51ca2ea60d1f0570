// The two entry points behind the module's exports. Neither lets an exception out: an exception
// crossing the C boundary would terminate the host.
#ifndef WAVEFORM_PLUGIN_NOTIFY_H
#define WAVEFORM_PLUGIN_NOTIFY_H

#include <cstdint>

#include "vtpl/host_interface.h"

namespace plugin::Scopes {

void pluginInfo(vtpl::PluginInfoRecord* info) noexcept;

// Dispatches one host message. Results: 1 handled, 2 not handled, 5 failed with an error.
int32_t notify(vtpl::HostContext context, vtpl::HostEffectRecord* record, int32_t message) noexcept;

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_NOTIFY_H
