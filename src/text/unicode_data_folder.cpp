// The plug-in's data files lie two folders above the module: the module sits in
// <root>/plugins/scopes/ and the files in <root>/.
#include "platform/system_services.h"
#include "platform/utf16_text.h"
#include "text/unicode_helper.h"

namespace vesk::plugin::lib {

std::filesystem::path defaultUnicodeDataFolder() {
  const std::filesystem::path moduleFolder =
      platform::toUtf8(platform::systemServices()->moduleFolder());
  return moduleFolder / ".." / "..";
}

}  // namespace vesk::plugin::lib
