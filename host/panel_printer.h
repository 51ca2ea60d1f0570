// Prints an effect's information and its parameter panel as the host shows them.
#ifndef VTPL_HOST_PANEL_PRINTER_H
#define VTPL_HOST_PANEL_PRINTER_H

#include <ostream>

#include "parameter_store.h"
#include "plugin_module.h"

namespace vtpl::host {

void printInformation(std::ostream& out, const PluginInformation& info);

// A tree of groups; per parameter: label, id, kind, value and default, range or choices, and
// whether the panel shows it.
void printPanel(std::ostream& out, const ParameterStore& store);

}  // namespace vtpl::host

#endif  // VTPL_HOST_PANEL_PRINTER_H
