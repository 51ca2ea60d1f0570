#include "panel_printer.h"

#include <cstdio>
#include <iomanip>
#include <sstream>
#include <string>
#include <vector>

#include "utf16_text.h"

namespace vtpl::host {
namespace {

constexpr int kLabelColumn = 34;
constexpr int kIdColumn = 36;
constexpr int kKindColumn = 9;

std::string general(double value) {
  char text[32];
  std::snprintf(text, sizeof text, "%g", value);
  return text;
}

std::string rangeOrChoices(const ParameterDeclaration& d) {
  switch (d.kind) {
    case ParameterKind::Float:
      return "range " + general(d.min) + " to " + general(d.max);
    case ParameterKind::Slider:
      return "range " + general(d.min) + " to " + general(d.max) + ", slider " +
             general(d.sliderMin) + " to " + general(d.sliderMax);
    case ParameterKind::Choice: {
      std::string items;
      for (const ChoiceEntry& choice : d.choices) {
        items +=
            (items.empty() ? "" : " | ") + toUtf8(choice.text) + "=" + std::to_string(choice.value);
      }
      return "items " + items;
    }
    case ParameterKind::Control: {
      char text[96];
      std::snprintf(text, sizeof text, "aspect %.4f, sizes %d %d %d %d", d.aspect,
                    d.controlSizes[0], d.controlSizes[1], d.controlSizes[2], d.controlSizes[3]);
      return text;
    }
    default:
      return "";
  }
}

std::string valueText(const Parameter& parameter) {
  const ParameterDeclaration& d = parameter.declaration;
  if (d.kind == ParameterKind::Control || d.kind == ParameterKind::Layer) {
    return "";
  }
  const std::string current = formatValue(d, parameter.value);
  const std::string initial = formatValue(d, d.defaults);
  return current == initial ? "= " + current : "= " + current + " (default " + initial + ")";
}

void printParameter(std::ostream& out, const Parameter& parameter, size_t depth) {
  const ParameterDeclaration& d = parameter.declaration;
  const std::string indent(2 * depth + 2, ' ');
  const std::string label = d.label.empty() ? "(unlabelled)" : toUtf8(d.label);
  std::string details = valueText(parameter);
  const std::string range = rangeOrChoices(d);
  if (!range.empty()) {
    details += (details.empty() ? "" : "; ") + range;
  }
  std::ostringstream line;
  line << std::left << std::setw(kLabelColumn) << indent + label << ' ' << std::setw(kIdColumn)
       << d.id << ' ' << std::setw(kKindColumn) << kindName(d.kind) << ' '
       << (parameter.visible ? "shown " : "hidden") << "  " << details;
  std::string text = line.str();
  text.erase(text.find_last_not_of(' ') + 1);
  out << text << '\n';
}

}  // namespace

void printInformation(std::ostream& out, const PluginInformation& info) {
  out << toUtf8(info.name) << '\n'
      << "  category   " << toUtf8(info.category) << '\n'
      << "  maker      " << toUtf8(info.maker) << '\n'
      << "  copyright  " << toUtf8(info.copyright) << '\n'
      << "  version    " << info.version[0] << '.' << info.version[1] << '.' << info.version[2]
      << '.' << info.version[3] << '\n'
      << "  GUID       " << guidText(info.guid) << '\n'
      << "  bundle     " << info.bundleIdentifier << '\n';
}

void printPanel(std::ostream& out, const ParameterStore& store) {
  std::vector<std::u16string> openPath;
  for (const Parameter& parameter : store.parameters()) {
    const std::vector<std::u16string>& path = parameter.declaration.groupPath;
    size_t common = 0;
    while (common < path.size() && common < openPath.size() && path[common] == openPath[common]) {
      ++common;
    }
    for (size_t depth = common; depth < path.size(); ++depth) {
      out << std::string(2 * depth + 2, ' ') << toUtf8(path[depth]) << '\n';
    }
    openPath = path;
    printParameter(out, parameter, path.size());
  }
}

}  // namespace vtpl::host
