// The host's side of the callback table: functions that serve an effect's calls from the
// EffectHost given as the context handle.
#ifndef VTPL_HOST_HOST_CALLBACKS_H
#define VTPL_HOST_HOST_CALLBACKS_H

#include "vtpl/host_interface.h"

namespace vtpl::host {

// Fills every slot this host serves. The context handle of each call must be an EffectHost.
void installCallbacks(HostEffectRecord& record);

}  // namespace vtpl::host

#endif  // VTPL_HOST_HOST_CALLBACKS_H
