// The user's locale, as POSIX names it, turned into the Windows language identifier that font
// name tables are keyed by.
#include <algorithm>
#include <cctype>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "platform/system_services.h"

namespace platform {
namespace {

constexpr uint16_t kEnglishUnitedStates = 0x0409;

// One locale: a language (ISO 639, lower case), a territory (ISO 3166, upper case; empty for a
// regional variant that has no territory code) and a script or variant modifier as glibc writes
// it after '@' (empty for the usual form). For every language the first row is its primary
// identifier, answered when the territory is missing or unknown.
struct LocaleRow {
  const char* language;
  const char* territory;
  const char* modifier;
  uint16_t id;
};

// Spanish of Spain is the modern (international) sort, 0x0C0A, the identifier Windows gives a
// new Spanish installation; the traditional sort, 0x040A, has no POSIX spelling.
// Serbian is Cyrillic unless the modifier says "latin", as glibc's sr_RS and sr_RS@latin;
// Uzbek and Azerbaijani the other way round, as uz_UZ and uz_UZ@cyrillic.
constexpr LocaleRow kLocales[] = {
    {"af", "ZA", "", 0x0436},         {"am", "ET", "", 0x045E},
    {"ar", "SA", "", 0x0401},         {"ar", "IQ", "", 0x0801},
    {"ar", "EG", "", 0x0C01},         {"ar", "LY", "", 0x1001},
    {"ar", "DZ", "", 0x1401},         {"ar", "MA", "", 0x1801},
    {"ar", "TN", "", 0x1C01},         {"ar", "OM", "", 0x2001},
    {"ar", "YE", "", 0x2401},         {"ar", "SY", "", 0x2801},
    {"ar", "JO", "", 0x2C01},         {"ar", "LB", "", 0x3001},
    {"ar", "KW", "", 0x3401},         {"ar", "AE", "", 0x3801},
    {"ar", "BH", "", 0x3C01},         {"ar", "QA", "", 0x4001},
    {"arn", "CL", "", 0x047A},        {"as", "IN", "", 0x044D},
    {"az", "AZ", "", 0x042C},         {"az", "AZ", "cyrillic", 0x082C},
    {"ba", "RU", "", 0x046D},         {"be", "BY", "", 0x0423},
    {"bg", "BG", "", 0x0402},         {"bn", "IN", "", 0x0445},
    {"bn", "BD", "", 0x0845},         {"bo", "CN", "", 0x0451},
    {"br", "FR", "", 0x047E},         {"bs", "BA", "", 0x141A},
    {"bs", "BA", "cyrillic", 0x201A}, {"ca", "ES", "", 0x0403},
    {"ca", "ES", "valencia", 0x0803}, {"chr", "US", "", 0x045C},
    {"ckb", "IQ", "", 0x0492},        {"co", "FR", "", 0x0483},
    {"cs", "CZ", "", 0x0405},         {"cy", "GB", "", 0x0452},
    {"da", "DK", "", 0x0406},         {"de", "DE", "", 0x0407},
    {"de", "CH", "", 0x0807},         {"de", "AT", "", 0x0C07},
    {"de", "LU", "", 0x1007},         {"de", "LI", "", 0x1407},
    {"dsb", "DE", "", 0x082E},        {"dv", "MV", "", 0x0465},
    {"dz", "BT", "", 0x0C51},         {"el", "GR", "", 0x0408},
    {"en", "US", "", 0x0409},         {"en", "GB", "", 0x0809},
    {"en", "AU", "", 0x0C09},         {"en", "CA", "", 0x1009},
    {"en", "NZ", "", 0x1409},         {"en", "IE", "", 0x1809},
    {"en", "ZA", "", 0x1C09},         {"en", "JM", "", 0x2009},
    {"en", "BZ", "", 0x2809},         {"en", "TT", "", 0x2C09},
    {"en", "ZW", "", 0x3009},         {"en", "PH", "", 0x3409},
    {"en", "HK", "", 0x3C09},         {"en", "IN", "", 0x4009},
    {"en", "MY", "", 0x4409},         {"en", "SG", "", 0x4809},
    {"es", "ES", "", 0x0C0A},         {"es", "MX", "", 0x080A},
    {"es", "GT", "", 0x100A},         {"es", "CR", "", 0x140A},
    {"es", "PA", "", 0x180A},         {"es", "DO", "", 0x1C0A},
    {"es", "VE", "", 0x200A},         {"es", "CO", "", 0x240A},
    {"es", "PE", "", 0x280A},         {"es", "AR", "", 0x2C0A},
    {"es", "EC", "", 0x300A},         {"es", "CL", "", 0x340A},
    {"es", "UY", "", 0x380A},         {"es", "PY", "", 0x3C0A},
    {"es", "BO", "", 0x400A},         {"es", "SV", "", 0x440A},
    {"es", "HN", "", 0x480A},         {"es", "NI", "", 0x4C0A},
    {"es", "PR", "", 0x500A},         {"es", "US", "", 0x540A},
    {"es", "419", "", 0x580A},        {"es", "CU", "", 0x5C0A},
    {"et", "EE", "", 0x0425},         {"eu", "ES", "", 0x042D},
    {"fa", "IR", "", 0x0429},         {"ff", "SN", "", 0x0867},
    {"fi", "FI", "", 0x040B},         {"fil", "PH", "", 0x0464},
    {"fo", "FO", "", 0x0438},         {"fr", "FR", "", 0x040C},
    {"fr", "BE", "", 0x080C},         {"fr", "CA", "", 0x0C0C},
    {"fr", "CH", "", 0x100C},         {"fr", "LU", "", 0x140C},
    {"fr", "MC", "", 0x180C},         {"fr", "RE", "", 0x200C},
    {"fr", "CD", "", 0x240C},         {"fr", "SN", "", 0x280C},
    {"fr", "CM", "", 0x2C0C},         {"fr", "CI", "", 0x300C},
    {"fr", "ML", "", 0x340C},         {"fr", "MA", "", 0x380C},
    {"fr", "HT", "", 0x3C0C},         {"fy", "NL", "", 0x0462},
    {"ga", "IE", "", 0x083C},         {"gd", "GB", "", 0x0491},
    {"gl", "ES", "", 0x0456},         {"gn", "PY", "", 0x0474},
    {"gsw", "FR", "", 0x0484},        {"gu", "IN", "", 0x0447},
    {"ha", "NG", "", 0x0468},         {"haw", "US", "", 0x0475},
    {"he", "IL", "", 0x040D},         {"hi", "IN", "", 0x0439},
    {"hr", "HR", "", 0x041A},         {"hr", "BA", "", 0x101A},
    {"hsb", "DE", "", 0x042E},        {"hu", "HU", "", 0x040E},
    {"hy", "AM", "", 0x042B},         {"id", "ID", "", 0x0421},
    {"ig", "NG", "", 0x0470},         {"ii", "CN", "", 0x0478},
    {"is", "IS", "", 0x040F},         {"it", "IT", "", 0x0410},
    {"it", "CH", "", 0x0810},         {"iu", "CA", "", 0x045D},
    {"iu", "CA", "latin", 0x085D},    {"ja", "JP", "", 0x0411},
    {"ka", "GE", "", 0x0437},         {"kk", "KZ", "", 0x043F},
    {"kl", "GL", "", 0x046F},         {"km", "KH", "", 0x0453},
    {"kn", "IN", "", 0x044B},         {"ko", "KR", "", 0x0412},
    {"kok", "IN", "", 0x0457},        {"ky", "KG", "", 0x0440},
    {"lb", "LU", "", 0x046E},         {"lo", "LA", "", 0x0454},
    {"lt", "LT", "", 0x0427},         {"lv", "LV", "", 0x0426},
    {"mi", "NZ", "", 0x0481},         {"mk", "MK", "", 0x042F},
    {"ml", "IN", "", 0x044C},         {"mn", "MN", "", 0x0450},
    {"mn", "CN", "", 0x0850},         {"mni", "IN", "", 0x0458},
    {"moh", "CA", "", 0x047C},        {"mr", "IN", "", 0x044E},
    {"ms", "MY", "", 0x043E},         {"ms", "BN", "", 0x083E},
    {"mt", "MT", "", 0x043A},         {"my", "MM", "", 0x0455},
    {"nb", "NO", "", 0x0414},         {"ne", "NP", "", 0x0461},
    {"ne", "IN", "", 0x0861},         {"nl", "NL", "", 0x0413},
    {"nl", "BE", "", 0x0813},         {"nn", "NO", "", 0x0814},
    {"nso", "ZA", "", 0x046C},        {"oc", "FR", "", 0x0482},
    {"om", "ET", "", 0x0472},         {"or", "IN", "", 0x0448},
    {"pa", "IN", "", 0x0446},         {"pa", "PK", "", 0x0846},
    {"pl", "PL", "", 0x0415},         {"ps", "AF", "", 0x0463},
    {"prs", "AF", "", 0x048C},        {"pt", "BR", "", 0x0416},
    {"pt", "PT", "", 0x0816},         {"quc", "GT", "", 0x0486},
    {"quz", "BO", "", 0x046B},        {"quz", "EC", "", 0x086B},
    {"quz", "PE", "", 0x0C6B},        {"rm", "CH", "", 0x0417},
    {"ro", "RO", "", 0x0418},         {"ro", "MD", "", 0x0818},
    {"ru", "RU", "", 0x0419},         {"ru", "MD", "", 0x0819},
    {"rw", "RW", "", 0x0487},         {"sa", "IN", "", 0x044F},
    {"sah", "RU", "", 0x0485},        {"sd", "PK", "", 0x0859},
    {"se", "NO", "", 0x043B},         {"se", "SE", "", 0x083B},
    {"se", "FI", "", 0x0C3B},         {"si", "LK", "", 0x045B},
    {"sk", "SK", "", 0x041B},         {"sl", "SI", "", 0x0424},
    {"sma", "NO", "", 0x183B},        {"sma", "SE", "", 0x1C3B},
    {"smj", "NO", "", 0x103B},        {"smj", "SE", "", 0x143B},
    {"smn", "FI", "", 0x243B},        {"sms", "FI", "", 0x203B},
    {"so", "SO", "", 0x0477},         {"sq", "AL", "", 0x041C},
    {"sr", "RS", "", 0x281A},         {"sr", "RS", "latin", 0x241A},
    {"sr", "ME", "", 0x301A},         {"sr", "ME", "latin", 0x2C1A},
    {"sr", "BA", "", 0x1C1A},         {"sr", "BA", "latin", 0x181A},
    {"sr", "CS", "", 0x0C1A},         {"sr", "CS", "latin", 0x081A},
    {"st", "ZA", "", 0x0430},         {"sv", "SE", "", 0x041D},
    {"sv", "FI", "", 0x081D},         {"sw", "KE", "", 0x0441},
    {"syr", "SY", "", 0x045A},        {"ta", "IN", "", 0x0449},
    {"ta", "LK", "", 0x0849},         {"te", "IN", "", 0x044A},
    {"tg", "TJ", "", 0x0428},         {"th", "TH", "", 0x041E},
    {"ti", "ET", "", 0x0473},         {"ti", "ER", "", 0x0873},
    {"tk", "TM", "", 0x0442},         {"tn", "ZA", "", 0x0432},
    {"tn", "BW", "", 0x0832},         {"tr", "TR", "", 0x041F},
    {"ts", "ZA", "", 0x0431},         {"tt", "RU", "", 0x0444},
    {"tzm", "DZ", "", 0x085F},        {"ug", "CN", "", 0x0480},
    {"uk", "UA", "", 0x0422},         {"ur", "PK", "", 0x0420},
    {"ur", "IN", "", 0x0820},         {"uz", "UZ", "", 0x0443},
    {"uz", "UZ", "cyrillic", 0x0843}, {"ve", "ZA", "", 0x0433},
    {"vi", "VN", "", 0x042A},         {"wo", "SN", "", 0x0488},
    {"xh", "ZA", "", 0x0434},         {"yi", "", "", 0x043D},
    {"yo", "NG", "", 0x046A},         {"zh", "TW", "", 0x0404},
    {"zh", "CN", "", 0x0804},         {"zh", "HK", "", 0x0C04},
    {"zh", "SG", "", 0x1004},         {"zh", "MO", "", 0x1404},
    {"zu", "ZA", "", 0x0435},
};

// Older or alternative language codes that locales still use, and the code the table uses.
struct LanguageAlias {
  const char* alias;
  const char* language;
};
constexpr LanguageAlias kLanguageAliases[] = {
    {"iw", "he"}, {"in", "id"}, {"ji", "yi"}, {"no", "nb"}, {"tl", "fil"}, {"qu", "quz"},
};

// The parts of a locale name "language[_-]territory.codeset@modifier"; a BCP 47 script subtag
// ("sr-Latn-RS") is read as the matching modifier.
struct LocaleName {
  std::string language;
  std::string territory;
  std::string modifier;
};

std::string lowerCase(std::string text) {
  std::transform(text.begin(), text.end(), text.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return text;
}

std::string upperCase(std::string text) {
  std::transform(text.begin(), text.end(), text.begin(),
                 [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
  return text;
}

std::string modifierOfScript(const std::string& script) {
  const std::string lower = lowerCase(script);
  if (lower == "latn") {
    return "latin";
  }
  if (lower == "cyrl") {
    return "cyrillic";
  }
  return lower;
}

LocaleName parseLocale(const std::string& locale) {
  LocaleName name;
  std::string rest = locale;
  const size_t at = rest.find('@');
  if (at != std::string::npos) {
    name.modifier = lowerCase(rest.substr(at + 1));
    rest.erase(at);
  }
  const size_t dot = rest.find('.');
  if (dot != std::string::npos) {
    rest.erase(dot);
  }
  std::replace(rest.begin(), rest.end(), '-', '_');
  size_t start = 0;
  for (int part = 0; start <= rest.size(); ++part) {
    size_t end = rest.find('_', start);
    if (end == std::string::npos) {
      end = rest.size();
    }
    const std::string piece = rest.substr(start, end - start);
    if (part == 0) {
      name.language = lowerCase(piece);
    } else if (piece.size() == 4 && std::isalpha(static_cast<unsigned char>(piece[0]))) {
      name.modifier = modifierOfScript(piece);
    } else if (name.territory.empty()) {
      name.territory = upperCase(piece);
    }
    start = end + 1;
  }
  for (const LanguageAlias& alias : kLanguageAliases) {
    if (name.language == alias.alias) {
      name.language = alias.language;
    }
  }
  return name;
}

}  // namespace

uint16_t languageIdForLocale(const std::string& locale) {
  const LocaleName name = parseLocale(locale);
  const LocaleRow* sameTerritory = nullptr;
  const LocaleRow* sameModifier = nullptr;
  const LocaleRow* primary = nullptr;
  for (const LocaleRow& row : kLocales) {
    if (name.language != row.language) {
      continue;
    }
    const bool territoryMatches = name.territory == row.territory;
    const bool modifierMatches = name.modifier == row.modifier;
    if (territoryMatches && modifierMatches) {
      return row.id;
    }
    // A modifier the table does not know ("@euro") leaves the plain row of the territory.
    if (territoryMatches && row.modifier[0] == '\0' && sameTerritory == nullptr) {
      sameTerritory = &row;
    }
    if (modifierMatches && row.modifier[0] != '\0' && sameModifier == nullptr) {
      sameModifier = &row;
    }
    if (primary == nullptr) {
      primary = &row;
    }
  }
  if (sameTerritory != nullptr) {
    return sameTerritory->id;
  }
  if (sameModifier != nullptr) {
    return sameModifier->id;
  }
  return primary != nullptr ? primary->id : kEnglishUnitedStates;
}

uint16_t userLanguageIdFromEnvironment() {
  for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
    const char* value = std::getenv(variable);
    if (value != nullptr && value[0] != '\0') {
      return languageIdForLocale(value);
    }
  }
  return kEnglishUnitedStates;
}

}  // namespace platform
