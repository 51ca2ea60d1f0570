// The effect's door to the host: the context handle and the record of the current Notify call,
// and the checked way to call a slot of the record's callback table.
#ifndef WAVEFORM_HOST_ACCESS_HOST_CALLS_H
#define WAVEFORM_HOST_ACCESS_HOST_CALLS_H

#include <utility>

#include "host_access/plugin_exception.h"
#include "vtpl/host_interface.h"

namespace Plugin::host {

class HostCalls {
 public:
  HostCalls(vtpl::HostContext context, vtpl::HostEffectRecord& record)
      : context_(context), record_(record) {}

  vtpl::HostContext context() const { return context_; }
  vtpl::HostEffectRecord& record() const { return record_; }

  // Calls one callback of the table with the host context as its first argument. A host that left
  // the slot empty cannot serve the request: that is a "Plugin Error", never a jump through null.
  template <typename Fn, typename... Args>
  auto call(Fn vtpl::HostEffectRecord::*slot, Args&&... args) const {
    const Fn function = record_.*slot;
    if (function == nullptr) {
      throw PluginException(kPluginErrorText);
    }
    return function(context_, std::forward<Args>(args)...);
  }

  // Calls a declaration callback; a non-zero status means the host refused the declaration.
  template <typename Fn, typename... Args>
  void declare(Fn vtpl::HostEffectRecord::*slot, Args&&... args) const {
    if (call(slot, std::forward<Args>(args)...) != vtpl::kStatusOk) {
      throw PluginException(kPluginErrorText);
    }
  }

 private:
  vtpl::HostContext context_;
  vtpl::HostEffectRecord& record_;
};

}  // namespace Plugin::host

#endif  // WAVEFORM_HOST_ACCESS_HOST_CALLS_H
