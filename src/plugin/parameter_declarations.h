// Declares the effect's 25 parameters, with their groups, to the host (kMessageDeclareParameters).
#ifndef WAVEFORM_PLUGIN_PARAMETER_DECLARATIONS_H
#define WAVEFORM_PLUGIN_PARAMETER_DECLARATIONS_H

#include <cstdint>
#include <string>

#include "host_access/host_calls.h"

namespace plugin::Scopes {

// The label of the comparison layer parameter depends on the host's version.
const char16_t* overlayLayerLabel(int32_t hostVersion);

// Item texts joined with a single vertical bar, as the host takes a choice list.
template <typename Items>
std::u16string joinChoiceTexts(const Items& items) {
  std::u16string joined;
  bool first = true;
  for (const auto& item : items) {
    if (!first) {
      joined += u'|';
    }
    joined += item.text;
    first = false;
  }
  return joined;
}

// Raises PluginException "Plugin Error" at the first declaration the host refuses; the
// declarations before it stay with the host.
void declareParameters(const Plugin::host::HostCalls& host);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_PARAMETER_DECLARATIONS_H
