// Fills the host's plug-in information record: the effect's identity, names and versions.
#ifndef WAVEFORM_PLUGIN_PLUGIN_INFO_H
#define WAVEFORM_PLUGIN_PLUGIN_INFO_H

#include <cstddef>

#include "vtpl/host_interface.h"

namespace plugin::Scopes {

// Copies at most `bound` characters of the NUL-terminated `source` into `target`, adding a
// terminator only when there is room for it within the bound. A null target is left alone.
void copyBounded(char16_t* target, const char16_t* source, size_t bound);
void copyBounded(char* target, const char* source, size_t bound);

void fillPluginInfo(vtpl::PluginInfoRecord& info);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_PLUGIN_INFO_H
