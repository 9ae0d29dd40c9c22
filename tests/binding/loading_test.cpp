// The package when memory runs out: while it is loaded, and in calls, with the devices that they
// read. Nothing of this ends the process. It comes back as an error, or is made up for, and works
// once there is memory again.
//
// This program has an allocator of its own, and loads the package as a host does.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <tcl.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <string>
#include <type_traits>

#include "tests/support/RefusingAllocator.h"

// Implementation objects live until the process ends; the leak checker need not tell.
extern "C" const char* __asan_default_options() { return "detect_leaks=0"; }

namespace {

constexpr int kFarTooMany = 20000;

class Interp {
 public:
  Interp() : interp_(Tcl_CreateInterp()) {}
  ~Interp() { Tcl_DeleteInterp(interp_); }
  Interp(const Interp&) = delete;
  Interp& operator=(const Interp&) = delete;

  int Run(const std::string& script) const { return Tcl_Eval(interp_, script.c_str()); }
  std::string Result() const { return Tcl_GetStringResult(interp_); }

  // Status and result.
  std::string Eval(const std::string& script) const {
    const int status = Run(script);
    return std::to_string(status) + ' ' + Result();
  }

 private:
  Tcl_Interp* interp_;
};

const std::string kLoad = "load " VORKEL_PACKAGE_DIR "/libIp_Vorkel.so";

// Runs a script while memory is refused after so many allocations; how often it was.
template <typename Refuse>
int RunWithout(const Interp& interp, const std::string& script, int allocations) {
  const Refuse refuse(allocations);
  interp.Run(script);
  return Refusals();
}

// 445.5 MHz is 6 times the input, and the smallest VCO from 400 MHz on that has both outputs.
constexpr char kSession[] =
    "set h [Ip::Vorkel::Init]; $h SetDevice vk40\n"
    "$h PLLCalculateActualOutFreqs {148.5 74.25} 74.25 0 2 false false false\n"
    "$h GetChosenVCO";

// The statuses of a process that loads the package.
enum Loaded { kRefusedSome = 0, kRefusedNone = 1, kFailed = 2 };

// Loads the package without the memory, and again with it where that has failed, and uses it.
template <typename Refuse>
Loaded LoadAndUse(int allocations) {
  const Interp interp;
  const int refused = RunWithout<Refuse>(interp, kLoad, allocations);
  if (interp.Eval(kLoad) != "0 " || interp.Eval(kSession) != "0 445.500") {
    std::fprintf(stderr, "after %d allocations: %s\n", allocations, interp.Result().c_str());
    return kFailed;
  }
  return refused > 0 ? kRefusedSome : kRefusedNone;
}

// The status of that in a process of its own: a library can be loaded for the first time only once.
template <typename Refuse>
int StatusOfLoad(int allocations) {
  const pid_t child = fork();
  // By way of what libraries do at the end, such as writing down what has been run of them.
  if (child == 0) std::exit(LoadAndUse<Refuse>(allocations));
  int status = 0;
  EXPECT_EQ(waitpid(child, &status, 0), child);
  return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

template <typename Refuse>
void ExpectLoads() {
  int allocations = 0;
  int status = kRefusedSome;
  for (; status == kRefusedSome && allocations < kFarTooMany; ++allocations) {
    status = StatusOfLoad<Refuse>(allocations);
    EXPECT_TRUE(status == kRefusedSome || status == kRefusedNone)
        << "status " << status << " after " << allocations << " allocations";
    if (status != kRefusedNone) status = kRefusedSome;
  }
  EXPECT_EQ(status, kRefusedNone);
  EXPECT_GT(allocations, 30);
}

TEST(Loading, WithoutAnyOneOfItsAllocations) { ExpectLoads<RefuseAfter>(); }

TEST(Loading, WithoutAllAllocationsFromAnyOneOn) { ExpectLoads<RefuseFrom>(); }

// --- Calls ---------------------------------------------------------------------------------

// Whether an answer tells that something could not be had.
bool IsFailure(const std::string& answer) {
  return answer.starts_with("1 ") || answer == "0 Could not get data from speedsfile.";
}

// Runs `prepare` and then, without one allocation after the other, `call`. It fails or has the
// answer that it has with memory, and blames no file for it. Once there is memory again, it has
// that answer.
template <typename Refuse>
void ExpectFailures(const std::string& prepare, const std::string& call) {
  const Interp interp;
  ASSERT_EQ(interp.Eval(kLoad), "0 ");
  ASSERT_EQ(interp.Run(prepare), TCL_OK) << interp.Result();
  const std::string expected = interp.Eval(call);
  int refused = 1;
  int failures = 0;
  int allocations = 0;
  for (; refused > 0; ++allocations) {
    ASSERT_LT(allocations, kFarTooMany);
    ASSERT_EQ(interp.Run(prepare), TCL_OK) << interp.Result();
    refused = RunWithout<Refuse>(interp, "set status [catch {" + call + "} answer]", allocations);
    ASSERT_EQ(interp.Run("set all \"$status $answer\""), TCL_OK) << interp.Result();
    const std::string answer = interp.Result();
    if (answer != expected) {
      ++failures;
      ASSERT_TRUE(IsFailure(answer)) << answer << " after " << allocations;
      ASSERT_EQ(answer.find(".toml:"), std::string::npos) << answer << " after " << allocations;
    }
    ASSERT_EQ(interp.Eval(call), expected) << "after " << allocations << " allocations";
  }
  EXPECT_GT(allocations, 1) << call;
  EXPECT_GT(failures, 0) << call;
}

// The same, without all the messages.
template <typename Refuse>
void ExpectFailuresAreTold(const std::string& prepare, const std::string& call) {
  testing::internal::CaptureStderr();
  ExpectFailures<Refuse>(prepare, call);
  testing::internal::GetCapturedStderr();
}

template <typename Refuse>
class CallsWithout : public testing::Test {};
using Refusers = testing::Types<RefuseAfter, RefuseFrom>;
class RefuserNames {
 public:
  template <typename Refuse>
  static std::string GetName(int) {
    return std::is_same_v<Refuse, RefuseAfter> ? "One" : "All";
  }
};
TYPED_TEST_SUITE(CallsWithout, Refusers, RefuserNames);

// The bundled devices, on a path with a folder that has none.
TYPED_TEST(CallsWithout, OfTheDevices) {
  const std::string path = "set env(VORKEL_DEVICES) /proc/self/fd:/";
  ExpectFailuresAreTold<TypeParam>(path, "::Vorkel::Devices names");
  ExpectFailuresAreTold<TypeParam>(path, "::Vorkel::Devices describe vk40");
  ExpectFailuresAreTold<TypeParam>(path, "::Vorkel::Devices describe absent");
}

// Of files that are no device files, each in its own way. They fail with memory, too.
TYPED_TEST(CallsWithout, OfBadDeviceFiles) {
  std::string folder = testing::TempDir() + "vorkel_loading_XXXXXX";
  ASSERT_NE(mkdtemp(folder.data()), nullptr);
  const std::string path = folder + "/bad.toml";
  for (const char* text :
       {"packages = [", "device = 3.125.5\n", "device = \"bad\"\ndevice = \"bad\"\n",
        "device = \"\xff\"\n", "device = \"b\\qad\"\n", "[grade.1]\nVCOCLK_FREQ_MAX = 3.125e\n",
        "[grade.1]\nNO_SUCH_KEYWORD = 3.125\n[grade.1.calculator]\nNO_SUCH_COEFFICIENT = 1\n"}) {
    std::FILE* const file = std::fopen(path.c_str(), "w");
    ASSERT_NE(file, nullptr);
    std::fputs(text, file);
    std::fclose(file);
    ExpectFailuresAreTold<TypeParam>("set env(VORKEL_DEVICES) " + folder,
                                     "::Vorkel::Devices describe bad");
  }
  std::remove(path.c_str());
  rmdir(folder.c_str());
}

// Each on a handle that has read nothing yet, of a file that was read before, and of one that has
// changed.
TYPED_TEST(CallsWithout, OfTheFirstReadOfADevice) {
  ExpectFailuresAreTold<TypeParam>("set h [Ip::Vorkel::Init]; $h SetDevice vk20-2",
                                   "$h GetSpdKeyValue TSYN_VCOCLK_FREQ_MAX");
}

TYPED_TEST(CallsWithout, OfTheFirstReadOfAChangedDevice) {
  std::string folder = testing::TempDir() + "vorkel_loading_XXXXXX";
  ASSERT_NE(mkdtemp(folder.data()), nullptr);
  const std::string path = folder + "/changing.toml";
  ExpectFailuresAreTold<TypeParam>("set env(VORKEL_DEVICES) " + folder + "\nset path " + path + R"(
      set file [open $path w]
      puts $file "# [incr changes]
        device = \"changing\"
        packages = \[\"p\"]
        default_grade = \"1\"
        \[grade.1]
        O_MAX_HT_LT = 64"
      close $file
      set h [Ip::Vorkel::Init]
      $h SetDevice changing)",
                                   "$h GetSpdKeyValue O_MAX_HT_LT");
  std::remove(path.c_str());
  rmdir(folder.c_str());
}

TYPED_TEST(CallsWithout, OfAHandle) {
  ASSERT_NO_FATAL_FAILURE(
      ExpectFailuresAreTold<TypeParam>("if {![info exists h]} {set h [Ip::Vorkel::Init]}",
                                       "$h SetDevice a_device_of_which_the_name_is_long"));
  for (const char* call :
       {"$h GetSpdKeyValue D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD",
        "$h GetSpdKeyValue AN_UNKNOWN_KEYWORD", "$h AnUnknownMethodOfAHandle",
        "$h PLLCalculateActualOutFreqs {148.5 74.25 148.5} 74.25 0 3 false false false",
        "$h TSYNCalculateActualOutFreqs {148.5 74.25 148.5} 74.25 0 3 false false false",
        "$h GetClosestSolution {148.5 74.25} {22.50 180.00 45.0} {37.5 50.00 25.0} 74.25 0 2 false "
        "false true false",
        "$h KruCalculateActuals {37.125 55.6875} {0.000000 0.000000} 74.25 2 true false",
        "$h KruClkgenCalculateActuals {55.6875 27.84375} {0.000000 0.000000} 74.25 2 false",
        "$h GetPLLPkToPkJitter 74.25 100 1 OPTIMIZED 5 12.5", "$h GetVcoFreq 1e9 1 1 1",
        "$h GetKRUPkToPkJitter 74.25 NO_SUCH_PIN_AS_THIS true true true 3 2"}) {
    ASSERT_NO_FATAL_FAILURE(ExpectFailuresAreTold<TypeParam>(
        "if {![info exists h]} {set h [Ip::Vorkel::Init]; $h SetDevice vk40; $h GetKRUPhaseError}",
        call));
  }
}

}  // namespace
