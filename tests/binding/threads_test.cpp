// The package in several threads, each with an interpreter and handles of its own.
#include "tests/binding/ScriptCalls.h"

#include <gtest/gtest.h>

#include <array>
#include <atomic>
#include <cstddef>
#include <string>
#include <thread>
#include <vector>

#include "binding/VorkelPtrHandle.h"

// Defined in binding/PackageEntry.cpp.
extern "C" int Ip_vorkel_Init(Tcl_Interp* interp);

// Implementation objects live until the process ends; the leak checker need not tell.
extern "C" const char* __asan_default_options() { return "detect_leaks=0"; }

namespace {

constexpr int kThreads = 3;

// What each thread runs: rounds of ten calls.
constexpr std::array<const char*, kThreads> kRounds = {
    R"(
      $h PLLCalculateActualOutFreqs "148.5 74.25" 74.25 0 2 false false false
      $h GetChosenVCO; $h GetChosenM; $h GetChosenDivN 1
      $h PLLCalculateActualOutFreqs "300 600" 300 0 2 false false false
      $h GetChosenVCO; $h GetChosenM
      $h GetVcoFreq 74.25 10 1 1
      $h GetPLLPkToPkJitter 74.25 10 1 OPTIMIZED 5 12.5
      $h GetSpdKeyValue VCOCLK_FREQ_MAX
    )",
    R"(
      $h TSYNCalculateActualOutFreqs "300 600" 300 0 2 false false false
      $h GetChosenVCO; $h GetChosenM; $h GetChosenDiv0
      $h GetClosestSolution "148.5 74.25" "22.5 0" "37.5 50" 74.25 0 2 false false false false
      $h GetChosenVCO; $h GetChosenPhaseN 0
      $h GetVcoFreq 74.25 9 1 1
      $h GetPLLPkToPkJitter 74.25 9 1 HIGH 5 0
      $h GetSpdKeyValue TSYN_VCOCLK_FREQ_MAX
    )",
    R"(
      $h KruCalculateActuals "37.125 55.6875" "0 0" 74.25 2 true false
      $h GetKruChosenClkdv; $h GetKruChosenPinname 0; $h GetKruChosenOutFreqN 74.25 1
      $h KruClkgenCalculateActuals "55.6875 27.84375" "0 0" 74.25 2 false
      $h GetKruChosenClkfxdv; $h GetKruChosenM
      $h GetKRUPhaseError
      $h GetKRUPkToPkJitter 74.25 CLKFX false true false 3 2
      $h GetSpdKeyValue NO_SUCH_KEYWORD
    )",
};

// The answers of one round, in an interpreter with the package.
std::string Round(TestInterp& interp, int thread, bool isNewHandle) {
  const std::string device = thread == 0 ? "vk40-1" : "vk40";
  const std::string begin =
      isNewHandle ? "set h [Ip::Vorkel::Init]; $h SetDevice " + device + "\n" : "";
  interp.Eval(begin +
              "set answers {}\n"
              "foreach call [split [string map {\\n ;} {" +
              kRounds[static_cast<std::size_t>(thread)] +
              "}] \\;] {\n"
              "  if {[string trim $call] ne {}} {\n"
              "    lappend answers [catch $call answer] $answer\n"
              "  }\n"
              "}\n"
              "set answers");
  return interp.Result();
}

// The answers of the first round of a thread, in an interpreter of its own.
std::string Alone(int thread) {
  TestInterp interp;
  EXPECT_EQ(Ip_vorkel_Init(interp.get()), TCL_OK);
  return Round(interp, thread, true);
}

// The threads come first, so that they meet in all that is found or made once.
TEST(ThreadsTest, HaveTheAnswersOfOne) {
  constexpr int kRoundsOfThread = 300;
  constexpr int kRoundsOfHandle = 3;
  std::array<std::vector<std::string>, kThreads> answers;
  std::atomic<int> waiting = kThreads;
  const auto run = [&](int t) {
    TestInterp interp;
    --waiting;
    while (waiting > 0) std::this_thread::yield();
    std::vector<std::string>& mine = answers[static_cast<std::size_t>(t)];
    mine.push_back(Ip_vorkel_Init(interp.get()) == TCL_OK ? "" : interp.Result());
    for (int round = 0; round < kRoundsOfThread; ++round) {
      mine.push_back(Round(interp, t, round % kRoundsOfHandle == 0));
    }
    interp.End();
    Tcl_FinalizeThread();
  };
  std::vector<std::thread> threads;
  for (int t = 0; t < kThreads; ++t) threads.emplace_back(run, t);
  for (std::thread& thread : threads) thread.join();

  for (int t = 0; t < kThreads; ++t) {
    const std::vector<std::string>& mine = answers[static_cast<std::size_t>(t)];
    const std::string expected = Alone(t);
    EXPECT_EQ(mine.front(), "");
    for (std::size_t i = 1; i < mine.size(); ++i) ASSERT_EQ(mine[i], expected) << "round " << i;
  }
}

// There is one prototype, whoever asks first, and its interpreter can end while others ask.
TEST(ThreadsTest, ShareOnePrototype) {
  constexpr int kTimes = 1000;
  std::array<Script::PtrHandleBase*, kThreads> prototypes{};
  std::atomic<int> waiting = kThreads;
  const auto run = [&](std::size_t t) {
    TestInterp interp;
    {
      const Ip::VorkelPtrHandle handle(interp.get());
      --waiting;
      while (waiting > 0) std::this_thread::yield();
      prototypes[t] = handle.GetPtrHandleBase();
      for (int i = 0; i < kTimes; ++i) {
        Tcl_Interp* const owner = prototypes[t]->GetTclInterp();
        EXPECT_EQ(handle.GetPtrHandleBase(), prototypes[t]);
        if (owner == nullptr) break;
      }
    }
    interp.End();
    Tcl_FinalizeThread();
  };
  std::vector<std::thread> threads;
  for (std::size_t t = 0; t < kThreads; ++t) threads.emplace_back(run, t);
  for (std::thread& thread : threads) thread.join();
  EXPECT_NE(prototypes[0], nullptr);
  EXPECT_EQ(prototypes[1], prototypes[0]);
  EXPECT_EQ(prototypes[2], prototypes[0]);
  EXPECT_EQ(prototypes[0]->GetTclInterp(), nullptr);
}

}  // namespace
