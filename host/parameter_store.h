// The host's parameter panel: every declaration an effect made, in order, with its group path,
// current value and visibility. Values are not animated: reads ignore their time argument.
#ifndef VTPL_HOST_PARAMETER_STORE_H
#define VTPL_HOST_PARAMETER_STORE_H

#include <array>
#include <cstdint>
#include <string>
#include <vector>

namespace vtpl::host {

enum class ParameterKind { Control, Float, Slider, Bool, Choice, Point, Angle, Color, Layer };

const char* kindName(ParameterKind kind);

struct ChoiceEntry {
  std::u16string text;
  int32_t value = 0;
};

struct ParameterDeclaration {
  ParameterKind kind = ParameterKind::Float;
  std::string id;
  std::u16string label;
  std::vector<std::u16string> groupPath;  // outermost group first
  uint32_t flags = 0;
  // Float, slider, angle: [0]; bool: [0] is 0 or 1; choice: [0] is the item index;
  // point: x, y; colour: red, green, blue.
  std::array<double, 3> defaults{};
  double min = 0, max = 0;              // float and slider
  double sliderMin = 0, sliderMax = 0;  // slider only
  int32_t decimals = 0;
  std::u16string unit;
  std::vector<ChoiceEntry> choices;  // in display order
  uint8_t angleOption = 0;
  std::u16string secondText;  // control
  double aspect = 0;          // control
  std::array<int32_t, 4> controlSizes{};
};

struct Parameter {
  ParameterDeclaration declaration;
  std::array<double, 3> value{};  // same layout as the defaults
  bool visible = true;
};

// Status codes the declaration side answers with.
constexpr int32_t kDeclarationAccepted = 0;
constexpr int32_t kDeclarationRefused = 1;

class ParameterStore {
 public:
  // Declaration side. A declaration with an empty or repeated id, or an endGroup without an open
  // group, is refused.
  int32_t beginGroup(const std::u16string& label);
  int32_t endGroup();
  int32_t declare(ParameterDeclaration declaration);
  size_t openGroupCount() const { return openGroups_.size(); }

  const std::vector<Parameter>& parameters() const { return parameters_; }
  const Parameter* find(const std::string& id) const;
  Parameter* find(const std::string& id);

  // Reads and writes by id; an unknown id reads as zero and writes nothing, answering false.
  // For a choice, ints are item values, never positions.
  bool readInt(const std::string& id, int32_t& value) const;
  bool readNumbers(const std::string& id, std::array<double, 3>& value) const;
  bool writeInt(const std::string& id, int32_t value);
  bool writeBool(const std::string& id, bool value);
  bool setVisible(const std::string& id, bool visible);

  // Sets a value from user text: a choice by item text or value, a bool as true/false/on/off/1/0,
  // numbers as decimals, points as "x,y", colours as "r,g,b". Throws HostError saying what
  // is accepted.
  void setFromText(const std::string& id, const std::string& text);

 private:
  std::vector<Parameter> parameters_;
  std::vector<std::u16string> openGroups_;
};

// The value in the form setFromText accepts ("Luminance", "true", "0.50", "-640, -360").
std::string formatValue(const ParameterDeclaration& declaration,
                        const std::array<double, 3>& value);

}  // namespace vtpl::host

#endif  // VTPL_HOST_PARAMETER_STORE_H
