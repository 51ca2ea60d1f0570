#include "parameter_store.h"

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <sstream>

#include "host_error.h"
#include "utf16_text.h"

namespace vtpl::host {
namespace {

std::string lowerCase(std::string text) {
  std::transform(text.begin(), text.end(), text.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return text;
}

std::string trimmed(const std::string& text) {
  const size_t first = text.find_first_not_of(" \t");
  const size_t last = text.find_last_not_of(" \t");
  return first == std::string::npos ? std::string() : text.substr(first, last - first + 1);
}

bool parseNumber(const std::string& text, double& number) {
  const std::string clean = trimmed(text);
  if (clean.empty()) {
    return false;
  }
  char* end = nullptr;
  errno = 0;
  number = std::strtod(clean.c_str(), &end);
  return errno == 0 && *end == '\0' && std::isfinite(number);
}

// Parses `count` comma-separated numbers.
bool parseNumbers(const std::string& text, size_t count, std::array<double, 3>& numbers) {
  std::stringstream stream(text);
  std::string part;
  size_t parsed = 0;
  while (std::getline(stream, part, ',')) {
    if (parsed == count || !parseNumber(part, numbers[parsed])) {
      return false;
    }
    ++parsed;
  }
  return parsed == count;
}

std::string choiceList(const ParameterDeclaration& declaration) {
  std::string list;
  for (const ChoiceEntry& choice : declaration.choices) {
    list += (list.empty() ? "" : ", ") + toUtf8(choice.text) + " (" + std::to_string(choice.value) +
            ")";
  }
  return list;
}

std::string formatNumber(double value, int decimals) {
  char text[64];
  std::snprintf(text, sizeof text, "%.*f", std::clamp(decimals, 0, 9), value);
  return text;
}

std::string formatGeneral(double value) {
  char text[64];
  std::snprintf(text, sizeof text, "%g", value);
  return text;
}

}  // namespace

const char* kindName(ParameterKind kind) {
  switch (kind) {
    case ParameterKind::Control:
      return "control";
    case ParameterKind::Float:
      return "float";
    case ParameterKind::Slider:
      return "slider";
    case ParameterKind::Bool:
      return "bool";
    case ParameterKind::Choice:
      return "choice";
    case ParameterKind::Point:
      return "point";
    case ParameterKind::Angle:
      return "angle";
    case ParameterKind::Color:
      return "colour";
    case ParameterKind::Layer:
      return "layer";
  }
  return "?";
}

int32_t ParameterStore::beginGroup(const std::u16string& label) {
  openGroups_.push_back(label);
  return kDeclarationAccepted;
}

int32_t ParameterStore::endGroup() {
  if (openGroups_.empty()) {
    return kDeclarationRefused;
  }
  openGroups_.pop_back();
  return kDeclarationAccepted;
}

int32_t ParameterStore::declare(ParameterDeclaration declaration) {
  if (declaration.id.empty() || find(declaration.id) != nullptr) {
    return kDeclarationRefused;
  }
  if (declaration.kind == ParameterKind::Choice) {
    const double index = declaration.defaults[0];
    if (declaration.choices.empty() || index < 0 || index >= declaration.choices.size()) {
      return kDeclarationRefused;
    }
  }
  declaration.groupPath = openGroups_;
  Parameter parameter;
  parameter.value = declaration.defaults;
  parameter.declaration = std::move(declaration);
  parameters_.push_back(std::move(parameter));
  return kDeclarationAccepted;
}

const Parameter* ParameterStore::find(const std::string& id) const {
  for (const Parameter& parameter : parameters_) {
    if (parameter.declaration.id == id) {
      return &parameter;
    }
  }
  return nullptr;
}

Parameter* ParameterStore::find(const std::string& id) {
  return const_cast<Parameter*>(static_cast<const ParameterStore*>(this)->find(id));
}

bool ParameterStore::readInt(const std::string& id, int32_t& value) const {
  value = 0;
  const Parameter* parameter = find(id);
  if (parameter == nullptr) {
    return false;
  }
  const ParameterDeclaration& declaration = parameter->declaration;
  if (declaration.kind == ParameterKind::Choice) {
    value = declaration.choices[static_cast<size_t>(parameter->value[0])].value;
  } else {
    value = static_cast<int32_t>(std::lround(parameter->value[0]));
  }
  return true;
}

bool ParameterStore::readNumbers(const std::string& id, std::array<double, 3>& value) const {
  const Parameter* parameter = find(id);
  value = parameter != nullptr ? parameter->value : std::array<double, 3>{};
  return parameter != nullptr;
}

bool ParameterStore::writeInt(const std::string& id, int32_t value) {
  Parameter* parameter = find(id);
  if (parameter == nullptr) {
    return false;
  }
  const std::vector<ChoiceEntry>& choices = parameter->declaration.choices;
  if (parameter->declaration.kind != ParameterKind::Choice) {
    parameter->value[0] = value;
    return true;
  }
  for (size_t index = 0; index < choices.size(); ++index) {
    if (choices[index].value == value) {
      parameter->value[0] = static_cast<double>(index);
      return true;
    }
  }
  return false;  // no item carries that value
}

bool ParameterStore::writeBool(const std::string& id, bool value) {
  Parameter* parameter = find(id);
  if (parameter == nullptr) {
    return false;
  }
  parameter->value[0] = value ? 1.0 : 0.0;
  return true;
}

bool ParameterStore::setVisible(const std::string& id, bool visible) {
  Parameter* parameter = find(id);
  if (parameter == nullptr) {
    return false;
  }
  parameter->visible = visible;
  return true;
}

void ParameterStore::setFromText(const std::string& id, const std::string& text) {
  Parameter* parameter = find(id);
  if (parameter == nullptr) {
    throw HostError("no parameter has the id '" + id + "'");
  }
  const ParameterDeclaration& declaration = parameter->declaration;
  const std::string value = trimmed(text);
  const std::string prefix = id + ": '" + value + "' ";
  std::array<double, 3> numbers{};
  switch (declaration.kind) {
    case ParameterKind::Choice: {
      for (size_t index = 0; index < declaration.choices.size(); ++index) {
        if (lowerCase(toUtf8(declaration.choices[index].text)) == lowerCase(value)) {
          parameter->value[0] = static_cast<double>(index);
          return;
        }
      }
      double number = 0;
      if (parseNumber(value, number) && number == std::trunc(number) &&
          writeInt(id, static_cast<int32_t>(number))) {
        return;
      }
      throw HostError(prefix + "is not one of " + choiceList(declaration));
    }
    case ParameterKind::Bool: {
      const std::string word = lowerCase(value);
      if (word == "true" || word == "on" || word == "yes" || word == "1") {
        parameter->value[0] = 1;
      } else if (word == "false" || word == "off" || word == "no" || word == "0") {
        parameter->value[0] = 0;
      } else {
        throw HostError(prefix + "is not a truth value (true, false, on, off, 1, 0)");
      }
      return;
    }
    case ParameterKind::Float:
    case ParameterKind::Slider:
      if (!parseNumbers(value, 1, numbers)) {
        throw HostError(prefix + "is not a number");
      }
      if (numbers[0] < declaration.min || numbers[0] > declaration.max) {
        throw HostError(prefix + "is outside " + formatGeneral(declaration.min) + " to " +
                        formatGeneral(declaration.max));
      }
      parameter->value = numbers;
      return;
    case ParameterKind::Angle:
      if (!parseNumbers(value, 1, numbers)) {
        throw HostError(prefix + "is not an angle in degrees");
      }
      parameter->value = numbers;
      return;
    case ParameterKind::Point:
      if (!parseNumbers(value, 2, numbers)) {
        throw HostError(prefix + "is not a point 'x,y'");
      }
      parameter->value = numbers;
      return;
    case ParameterKind::Color:
      if (!parseNumbers(value, 3, numbers) ||
          std::any_of(numbers.begin(), numbers.end(), [](double c) { return c < 0 || c > 1; })) {
        throw HostError(prefix + "is not a colour 'r,g,b' with components from 0 to 1");
      }
      parameter->value = numbers;
      return;
    case ParameterKind::Control:
    case ParameterKind::Layer:
      break;
  }
  throw HostError(id + ": a " + kindName(declaration.kind) + " parameter takes no value");
}

std::string formatValue(const ParameterDeclaration& declaration,
                        const std::array<double, 3>& value) {
  switch (declaration.kind) {
    case ParameterKind::Choice: {
      const auto index = static_cast<size_t>(value[0]);
      return index < declaration.choices.size() ? toUtf8(declaration.choices[index].text) : "?";
    }
    case ParameterKind::Bool:
      return value[0] != 0 ? "true" : "false";
    case ParameterKind::Float:
    case ParameterKind::Slider:
      return formatNumber(value[0], declaration.decimals);
    case ParameterKind::Angle:
      return formatGeneral(value[0]);
    case ParameterKind::Point:
      return formatGeneral(value[0]) + ", " + formatGeneral(value[1]);
    case ParameterKind::Color:
      return formatNumber(value[0], 4) + ", " + formatNumber(value[1], 4) + ", " +
             formatNumber(value[2], 4);
    case ParameterKind::Control:
    case ParameterKind::Layer:
      break;
  }
  return "";
}

}  // namespace vtpl::host
