// The host's panel: declarations it accepts or refuses, and values set from user text.
#include "parameter_store.h"

#include <gtest/gtest.h>

#include "host_error.h"

namespace vtpl::host {
namespace {

ParameterDeclaration choice(const std::string& id, std::vector<ChoiceEntry> entries,
                            double defaultIndex = 0) {
  ParameterDeclaration d;
  d.kind = ParameterKind::Choice;
  d.id = id;
  d.choices = std::move(entries);
  d.defaults[0] = defaultIndex;
  return d;
}

ParameterDeclaration simple(ParameterKind kind, const std::string& id, double min = 0,
                            double max = 1) {
  ParameterDeclaration d;
  d.kind = kind;
  d.id = id;
  d.min = min;
  d.max = max;
  d.decimals = 2;
  return d;
}

ParameterStore sampleStore() {
  ParameterStore store;
  store.declare(choice("mode", {{u"Luminance", 0}, {u"RGB", 1}, {u"CbCr", 4}}));
  store.declare(simple(ParameterKind::Bool, "flag"));
  store.declare(simple(ParameterKind::Float, "scale", 1, 10));
  store.declare(simple(ParameterKind::Slider, "gain", 0.1, 10));
  store.declare(simple(ParameterKind::Angle, "angle"));
  store.declare(simple(ParameterKind::Point, "point"));
  store.declare(simple(ParameterKind::Color, "colour"));
  store.declare(simple(ParameterKind::Layer, "layer"));
  return store;
}

TEST(ParameterStore, GroupsNestAndUnbalancedEndIsRefused) {
  ParameterStore store;
  EXPECT_EQ(store.endGroup(), kDeclarationRefused);
  EXPECT_EQ(store.beginGroup(u"Outer"), kDeclarationAccepted);
  EXPECT_EQ(store.beginGroup(u"Inner"), kDeclarationAccepted);
  EXPECT_EQ(store.declare(simple(ParameterKind::Bool, "a")), kDeclarationAccepted);
  EXPECT_EQ(store.endGroup(), kDeclarationAccepted);
  EXPECT_EQ(store.declare(simple(ParameterKind::Bool, "b")), kDeclarationAccepted);
  EXPECT_EQ(store.endGroup(), kDeclarationAccepted);
  EXPECT_EQ(store.declare(simple(ParameterKind::Bool, "c")), kDeclarationAccepted);
  EXPECT_EQ(store.find("a")->declaration.groupPath,
            (std::vector<std::u16string>{u"Outer", u"Inner"}));
  EXPECT_EQ(store.find("b")->declaration.groupPath, (std::vector<std::u16string>{u"Outer"}));
  EXPECT_TRUE(store.find("c")->declaration.groupPath.empty());
  EXPECT_EQ(store.openGroupCount(), 0u);
}

TEST(ParameterStore, RefusesBadDeclarations) {
  ParameterStore store;
  ASSERT_EQ(store.declare(simple(ParameterKind::Bool, "taken")), kDeclarationAccepted);
  EXPECT_EQ(store.declare(simple(ParameterKind::Float, "taken")), kDeclarationRefused);
  EXPECT_EQ(store.declare(simple(ParameterKind::Float, "")), kDeclarationRefused);
  EXPECT_EQ(store.declare(choice("empty", {})), kDeclarationRefused);
  EXPECT_EQ(store.declare(choice("beyond", {{u"A", 0}}, 1)), kDeclarationRefused);
  EXPECT_EQ(store.declare(choice("negative", {{u"A", 0}}, -1)), kDeclarationRefused);
  EXPECT_EQ(store.parameters().size(), 1u);
}

TEST(ParameterStore, ChoicesReadAndWriteItemValues) {
  ParameterStore store = sampleStore();
  int32_t value = -1;
  EXPECT_TRUE(store.writeInt("mode", 4));
  EXPECT_TRUE(store.readInt("mode", value));
  EXPECT_EQ(value, 4);
  EXPECT_EQ(store.find("mode")->value[0], 2);  // the position of CbCr
  EXPECT_FALSE(store.writeInt("mode", 2));     // no item has the value 2
  EXPECT_TRUE(store.readInt("mode", value));
  EXPECT_EQ(value, 4);
  EXPECT_FALSE(store.readInt("unknown", value));
  EXPECT_EQ(value, 0);
}

TEST(ParameterStore, SetFromTextAcceptsEachKindsForm) {
  struct Case {
    const char* id;
    const char* text;
    std::array<double, 3> value;
  };
  const Case cases[] = {
      {"mode", "RGB", {1, 0, 0}},
      {"mode", "cbcr", {2, 0, 0}},
      {"mode", "4", {2, 0, 0}},
      {"mode", " Luminance ", {0, 0, 0}},
      {"flag", "true", {1, 0, 0}},
      {"flag", "off", {0, 0, 0}},
      {"flag", "1", {1, 0, 0}},
      {"scale", "2.5", {2.5, 0, 0}},
      {"gain", "10", {10, 0, 0}},
      {"angle", "-90", {-90, 0, 0}},
      {"point", "-640, 360", {-640, 360, 0}},
      {"colour", "0.1,0.2,1", {0.1, 0.2, 1}},
  };
  ParameterStore store = sampleStore();
  for (const Case& c : cases) {
    store.setFromText(c.id, c.text);
    EXPECT_EQ(store.find(c.id)->value, c.value) << c.id << "=" << c.text;
  }
}

TEST(ParameterStore, SetFromTextRefusesWithAnExplanation) {
  struct Case {
    const char* id;
    const char* text;
    const char* message;
  };
  const Case cases[] = {
      {"mode", "Purple", "mode: 'Purple' is not one of Luminance (0), RGB (1), CbCr (4)"},
      {"mode", "2", "is not one of"},
      {"mode", "1.5", "is not one of"},
      {"flag", "maybe", "is not a truth value"},
      {"scale", "11", "is outside 1 to 10"},
      {"scale", "abc", "is not a number"},
      {"scale", "nan", "is not a number"},
      {"point", "1", "is not a point"},
      {"point", "1,2,3", "is not a point"},
      {"colour", "1,2,3", "is not a colour"},
      {"layer", "x", "a layer parameter takes no value"},
      {"missing", "1", "no parameter has the id 'missing'"},
  };
  ParameterStore store = sampleStore();
  for (const Case& c : cases) {
    try {
      store.setFromText(c.id, c.text);
      ADD_FAILURE() << c.id << "=" << c.text << " was accepted";
    } catch (const HostError& error) {
      EXPECT_NE(std::string(error.what()).find(c.message), std::string::npos) << error.what();
    }
  }
  EXPECT_EQ(store.find("scale")->value[0], 0);  // refused values leave the old one
}

TEST(ParameterStore, FormatValueRoundTripsThroughSetFromText) {
  ParameterStore store = sampleStore();
  store.setFromText("mode", "CbCr");
  store.setFromText("scale", "3.25");
  store.setFromText("point", "-1.5, 2");
  for (const char* id : {"mode", "scale", "point", "flag"}) {
    const Parameter& parameter = *store.find(id);
    const std::array<double, 3> before = parameter.value;
    store.setFromText(id, formatValue(parameter.declaration, parameter.value));
    EXPECT_EQ(store.find(id)->value, before) << id;
  }
}

}  // namespace
}  // namespace vtpl::host
