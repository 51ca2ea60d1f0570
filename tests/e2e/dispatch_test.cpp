// Notify's answer to every class of message code, and what each leaves behind.
#include <gtest/gtest.h>

#include <climits>
#include <cstring>
#include <vector>

#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::HostEffectRecord;

// Everything a message could change that the host can see.
struct Observable {
  std::vector<uint8_t> recordBytes;
  std::vector<std::array<double, 3>> values;
  std::vector<bool> visibility;
  int callbacks;

  explicit Observable(vtpl::host::EffectHost& host)
      : recordBytes(sizeof(HostEffectRecord)), callbacks(host.callbackCount()) {
    std::memcpy(recordBytes.data(), &host.record(), sizeof(HostEffectRecord));
    for (const vtpl::host::Parameter& parameter : host.parameters().parameters()) {
      values.push_back(parameter.value);
      visibility.push_back(parameter.visible);
    }
  }
  bool operator==(const Observable& other) const {
    return recordBytes == other.recordBytes && values == other.values &&
           visibility == other.visibility && callbacks == other.callbacks;
  }
};

struct CodeCase {
  int32_t code;
  int32_t result;
};

TEST(Dispatch, CodesWithoutActionAnswerAndTouchNothing) {
  // Acknowledged; gaps inside the handled range and everything outside it; reactions with no
  // parameter named.
  const CodeCase cases[] = {
      {11, 1},    {1004, 1},      {1007, 1}, {1011, 1}, {5, 2},    {6, 2},         {9, 2},
      {12, 2},    {15, 2},        {101, 2},  {1000, 2}, {1012, 2}, {INT32_MAX, 2}, {-1, 2},
      {-1001, 2}, {INT32_MIN, 2}, {7, 1},    {13, 1},   {14, 1},
  };
  auto host = openHost();
  for (const CodeCase& c : cases) {
    const Observable before(*host);
    testing::internal::CaptureStdout();
    EXPECT_EQ(host->send(c.code), c.result) << "code " << c.code;
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "") << "code " << c.code;
    EXPECT_TRUE(Observable(*host) == before) << "code " << c.code << " changed the host's state";
  }
}

TEST(Dispatch, ReactionsToUnrelatedIdsTouchNothing) {
  auto host = openHost();
  for (const char* id : {"waveformBrightness", "colorSpaceX", "", "showComparison"}) {
    for (int32_t message : {7, 13, 14}) {
      const Observable before(*host);
      EXPECT_EQ(host->editParameter(id, message), 1) << id << " " << message;
      EXPECT_TRUE(Observable(*host) == before) << id << " " << message;
    }
  }
}

TEST(Dispatch, SetUpPrintsTheBannerOnlyWhenVerbose) {
  for (const bool verbose : {false, true}) {
    vtpl::host::HostSettings settings = declaredStateSettings();
    settings.verbose = verbose;
    settings.gl = true;
    vtpl::host::EffectHost host(waveformModule(), settings);
    testing::internal::CaptureStdout();
    host.open();                                   // ends with message 8
    EXPECT_EQ(host.send(vtpl::kMessageSetUp), 1);  // set up twice builds nothing twice
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              verbose ? "Waveform Plugin\nWaveform Plugin\n" : "");
  }
}

TEST(Dispatch, SetUpWithoutAGlContextFailsInsteadOfCrashing) {
  auto host = openHost();  // no GL threads: nothing is current
  EXPECT_EQ(host->send(vtpl::kMessageSetUp), 5);
}

TEST(Dispatch, SetUpWithoutAnInstanceIsNotHandled) {
  vtpl::host::EffectHost host(waveformModule(), declaredStateSettings());
  EXPECT_EQ(host.send(vtpl::kMessageSetUp), 2);
  EXPECT_EQ(host.record().instance, nullptr);
}

TEST(Lifecycle, EachMessageActsOnItsOwnSlot) {
  vtpl::host::EffectHost host(waveformModule(), declaredStateSettings());
  EXPECT_EQ(host.send(vtpl::kMessageCreateSharedData), 1);
  EXPECT_NE(host.record().sharedData, nullptr);
  EXPECT_EQ(host.record().instance, nullptr);

  EXPECT_EQ(host.send(vtpl::kMessageCreateInstance), 1);
  void* const instance = host.record().instance;
  EXPECT_NE(instance, nullptr);

  EXPECT_EQ(host.send(vtpl::kMessageDestroySharedData), 1);
  EXPECT_EQ(host.record().sharedData, nullptr);
  EXPECT_EQ(host.record().instance, instance);

  EXPECT_EQ(host.send(vtpl::kMessageDestroyInstance), 1);
  EXPECT_EQ(host.record().instance, nullptr);
}

TEST(Lifecycle, DestroyingEmptySlotsIsHandled) {
  vtpl::host::EffectHost host(waveformModule(), declaredStateSettings());
  EXPECT_EQ(host.send(vtpl::kMessageDestroyInstance), 1);
  EXPECT_EQ(host.send(vtpl::kMessageDestroySharedData), 1);
  EXPECT_EQ(host.record().instance, nullptr);
  EXPECT_EQ(host.record().sharedData, nullptr);
}

TEST(Lifecycle, AttachAndDetachWithoutSharedDataAreHandled) {
  vtpl::host::EffectHost host(waveformModule(), declaredStateSettings());
  EXPECT_EQ(host.send(vtpl::kMessageAttach), 1);
  EXPECT_EQ(host.send(vtpl::kMessageDetach), 1);
  EXPECT_EQ(host.record().sharedData, nullptr);
}

TEST(Lifecycle, HostSendsTheLifecycleInOrder) {
  std::ostringstream trace;
  {
    vtpl::host::HostSettings settings;  // with the initial announcements
    auto host = openHost(settings, &trace);
  }
  std::vector<int> messages;
  std::istringstream lines(trace.str());
  for (std::string line; std::getline(lines, line);) {
    if (line.rfind("> Notify ", 0) == 0) {
      messages.push_back(std::stoi(line.substr(9)));
    }
  }
  ASSERT_GE(messages.size(), 5u);
  EXPECT_EQ(std::vector<int>(messages.begin(), messages.begin() + 3), (std::vector<int>{3, 0, 2}));
  EXPECT_EQ(std::vector<int>(messages.end() - 2, messages.end()), (std::vector<int>{1, 4}));
  for (size_t i = 3; i + 2 < messages.size(); ++i) {
    EXPECT_EQ(messages[i], 7);  // the initial announcements, one per parameter
  }
  EXPECT_EQ(messages.size(), 3 + 25 + 2u);
}

}  // namespace
}  // namespace waveform_test
