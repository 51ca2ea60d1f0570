// The text style of the scope's labels: the names and file of the font the labels are set in.
#ifndef WAVEFORM_SCOPE_LABEL_TEXT_SETTINGS_H
#define WAVEFORM_SCOPE_LABEL_TEXT_SETTINGS_H

#include <map>
#include <memory>
#include <string>

namespace plugin::Scopes {

struct LabelTextSettings {
  std::u16string familyName;
  std::u16string styleName;
  std::u16string fullName;
  std::u16string postScriptName;
  std::u16string filePath;
  std::string sampleText;
  std::u16string gdiFamilyName;
  std::u16string gdiFullName;
};

// The last rendered form of one label, kept per label text.
class RenderedLabel;
using LabelCache = std::map<std::u16string, std::shared_ptr<RenderedLabel>>;

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_LABEL_TEXT_SETTINGS_H
