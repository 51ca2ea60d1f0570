// Notify's answer to every class of message code, and what each leaves behind.
#include <gtest/gtest.h>

#include <climits>
#include <sstream>
#include <tuple>
#include <vector>

#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::HostEffectRecord;

// Everything a message could change that the host can see: the record's bytes, the panel's
// values and visibility, and the number of callbacks made.
auto observable(vtpl::host::EffectHost& host) {
  const auto* record = reinterpret_cast<const uint8_t*>(&host.record());
  std::vector<double> panel;
  for (const vtpl::host::Parameter& p : host.parameters().parameters()) {
    panel.insert(panel.end(), {p.value[0], p.value[1], p.value[2], p.visible ? 1.0 : 0.0});
  }
  return std::make_tuple(std::vector<uint8_t>(record, record + sizeof(HostEffectRecord)), panel,
                         host.callbackCount());
}

TEST(Dispatch, CodesWithoutActionAnswerAndTouchNothing) {
  // Acknowledged; gaps inside the handled range and everything outside it; reactions with no
  // parameter named.
  const std::pair<int32_t, int32_t> cases[] = {
      {11, 1},    {1004, 1},      {1007, 1}, {1011, 1}, {5, 2},    {6, 2},         {9, 2},
      {12, 2},    {15, 2},        {101, 2},  {1000, 2}, {1012, 2}, {INT32_MAX, 2}, {-1, 2},
      {-1001, 2}, {INT32_MIN, 2}, {7, 1},    {13, 1},   {14, 1},
  };
  auto host = openHost();
  for (const auto& [code, result] : cases) {
    const auto before = observable(*host);
    testing::internal::CaptureStdout();
    EXPECT_EQ(host->send(code), result) << "code " << code;
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "") << "code " << code;
    EXPECT_TRUE(observable(*host) == before) << "code " << code << " changed the host's state";
  }
  // Reactions to parameters without a reaction.
  for (const char* id : {"waveformBrightness", "colorSpaceX", "", "showComparison"}) {
    for (const int32_t message : {7, 13, 14}) {
      const auto before = observable(*host);
      EXPECT_EQ(host->editParameter(id, message), 1) << id << " " << message;
      EXPECT_TRUE(observable(*host) == before) << id << " " << message;
    }
  }
}

TEST(Dispatch, NullRecordIsNotHandled) {
  for (const int32_t message :
       {0, 1, 2, 3, 4, 7, 8, 10, 11, 13, 1001, 1002, 1003, 1004, -1, INT32_MAX}) {
    EXPECT_EQ(waveformModule().notifyEntry()(nullptr, nullptr, message), 2) << message;
  }
}

TEST(Dispatch, SetUpPrintsTheBannerOnlyWhenVerboseAndFailsWithoutAGlContext) {
  for (const bool verbose : {false, true}) {
    vtpl::host::HostSettings settings = glSettings();
    settings.verbose = verbose;
    vtpl::host::EffectHost host(waveformModule(), settings);
    testing::internal::CaptureStdout();
    host.open();                                   // ends with message 8
    EXPECT_EQ(host.send(vtpl::kMessageSetUp), 1);  // set up twice builds nothing twice
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              verbose ? "Waveform Plugin\nWaveform Plugin\n" : "");
  }
  EXPECT_EQ(openHost()->send(vtpl::kMessageSetUp), 5);  // no GL threads: nothing is current
}

// Each message acts on its own slot; empty slots are no error, but there is nothing to set up.
TEST(Lifecycle, EachMessageActsOnItsOwnSlot) {
  // The message, its result, and whether the shared data and the instance exist afterwards.
  const std::tuple<int32_t, int32_t, bool, bool> steps[] = {
      {vtpl::kMessageDestroyInstance, 1, false, false},
      {vtpl::kMessageDestroySharedData, 1, false, false},
      {vtpl::kMessageAttach, 1, false, false},
      {vtpl::kMessageDetach, 1, false, false},
      {vtpl::kMessageSetUp, 2, false, false},
      {vtpl::kMessageCreateSharedData, 1, true, false},
      {vtpl::kMessageCreateInstance, 1, true, true},
      {vtpl::kMessageDestroySharedData, 1, false, true},
      {vtpl::kMessageDestroyInstance, 1, false, false},
  };
  vtpl::host::EffectHost host(waveformModule(), declaredStateSettings());
  void* instance = nullptr;
  for (const auto& [message, result, sharedData, hasInstance] : steps) {
    EXPECT_EQ(host.send(message), result) << message;
    EXPECT_EQ(host.record().sharedData != nullptr, sharedData) << message;
    EXPECT_EQ(host.record().instance != nullptr, hasInstance) << message;
    if (instance != nullptr && hasInstance) {
      EXPECT_EQ(host.record().instance, instance) << message;
    }
    instance = host.record().instance;
  }
}

TEST(Lifecycle, HostSendsTheLifecycleInOrder) {
  std::ostringstream trace;
  openHost(vtpl::host::HostSettings(), &trace);  // with the initial announcements; then closed
  std::vector<int> messages;
  std::istringstream lines(trace.str());
  for (std::string line; std::getline(lines, line);) {
    if (line.rfind("> Notify ", 0) == 0) {
      messages.push_back(std::stoi(line.substr(9)));
    }
  }
  std::vector<int> expected = {3, 0, 2};
  expected.insert(expected.end(), 25, 7);  // the initial announcements, one per parameter
  expected.insert(expected.end(), {1, 4});
  EXPECT_EQ(messages, expected);
}

}  // namespace
}  // namespace waveform_test
