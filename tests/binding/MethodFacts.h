// The 40 methods as scripts know them: order, number of arguments, and what a handle without
// an implementation object answers.
#ifndef VORKEL_TESTS_BINDING_METHODFACTS_H_
#define VORKEL_TESTS_BINDING_METHODFACTS_H_

#include <array>
#include <ostream>
#include <string>

struct MethodFacts {
  const char* name;
  int arguments;
  // The whole text, or null for the method that needs no object.
  const char* missingObject;
};

#define VORKEL_UNABLE "Unable to obtain Implementation object for VorkelPtrHandle::"

// The texts do not follow from the names: some are spelled differently, and two methods have
// a sentence of their own.
inline constexpr std::array<MethodFacts, 40> kMethodFacts = {{
    {"GetSpdKeyValue", 1, VORKEL_UNABLE "GetSpdKeyValue"},
    {"SetDevice", 1, "Unable to set device for VorkelPtrHandle::SetDevice"},
    {"SetLowBandwidth", 1, "Unable to set bandwidth for VorkelPtrHandle::SetLowBandwidth"},
    {"SetVcoMinThreshold", 1, nullptr},
    {"GetVcoFreq", 4, VORKEL_UNABLE "GetVcoFreq"},
    {"GetPLLPkToPkJitter", 6, VORKEL_UNABLE "GetPLLPkToPkJitter"},
    {"GetKRUPkToPkJitter", 7, VORKEL_UNABLE "GetKruPkToPkJitter"},
    {"GetKRU_CLKGENPkToPkJitter", 7, VORKEL_UNABLE "GetKRU_CLKGENPkToPkJitter"},
    {"GetPLLPhaseError", 3, VORKEL_UNABLE "GetPLLPhaseError"},
    {"GetKRUPhaseError", 0, VORKEL_UNABLE "GetKRUPhaseError"},
    {"GetKRUPeriodPhaseDutyCycle", 6, VORKEL_UNABLE "GetKruPeriodPhaseDutyCycle"},
    {"GetPLLPeriodPhaseDutyCycle", 7, VORKEL_UNABLE "GetPllPeriodPhaseDutyCycle"},
    {"GetLatestPhase", 0, VORKEL_UNABLE "GetLatestPhase"},
    {"GetLatestDutyCycle", 0, VORKEL_UNABLE "GetLatestDutyCycle"},
    {"TSYNCalculateActualOutFreqs", 7, VORKEL_UNABLE "TSYNCalculateActualOutFreq"},
    {"PLLCalculateActualOutFreqs", 7, VORKEL_UNABLE "PLLCalculateActualOutFreq"},
    {"KruCalculateActuals", 6, VORKEL_UNABLE "KruCalculateActuals"},
    {"KruClkgenCalculateActuals", 5, VORKEL_UNABLE "KruClkgenCalculateActuals"},
    {"GetClosestSolution", 10, VORKEL_UNABLE "GetClosestSolution"},
    {"GetChosenM", 0, VORKEL_UNABLE "GetChosenM"},
    {"GetChosenMInt", 0, VORKEL_UNABLE "GetChosenMInt"},
    {"GetChosenD", 0, VORKEL_UNABLE "GetChosenD"},
    {"GetChosenDiv0", 0, VORKEL_UNABLE "GetChosenDiv0"},
    {"GetChosenDiv0Int", 0, VORKEL_UNABLE "GetChosenDiv0Int"},
    {"GetChosenDivN", 1, VORKEL_UNABLE "GetChosenDivN"},
    {"GetChosenVCO", 0, VORKEL_UNABLE "GetChosenVCO"},
    {"GetChosenOutFreqN", 1, VORKEL_UNABLE "GetChosenOutFreqN"},
    {"GetChosenPhaseN", 1, VORKEL_UNABLE "GetChosenPhaseN"},
    {"GetChosenDutyCycleN", 1, VORKEL_UNABLE "GetChosenDutyCycleN"},
    {"GetKruChosenM", 0, VORKEL_UNABLE "GetKruChosenM"},
    {"GetKruChosenD", 0, VORKEL_UNABLE "GetKruChosenD"},
    {"GetKruChosenPhaseShift", 0, VORKEL_UNABLE "GetKruChosenPhaseShift"},
    {"GetKruChosenPhaseOffset", 0, VORKEL_UNABLE "GetKruChosenPhaseOffset"},
    {"GetKruChosenClkdv", 0, VORKEL_UNABLE "GetKruChosenClkdv"},
    {"GetKruChosenClkfxdv", 0, VORKEL_UNABLE "GetKruChosenClkfxdv"},
    {"GetKruChosenDivBy2", 0, VORKEL_UNABLE "GetKruChosenDivBy2"},
    {"GetKruChosenPinname", 1, VORKEL_UNABLE "GetKruChosenPinname"},
    {"GetKruChosenOutFreqN", 2, VORKEL_UNABLE "GetKruChosenOutFreqN"},
    {"TSYNCalculateActualPhase", 3, VORKEL_UNABLE "TSYNCalculateActualPhase"},
    {"TSYNCalculateActualDutyCycle", 3, VORKEL_UNABLE "TSYNCalculateActualDutyCycle"},
}};

#undef VORKEL_UNABLE

// How a test names its method.
inline void PrintTo(const MethodFacts& method, std::ostream* out) { *out << method.name; }

inline std::string WrongCount(const MethodFacts& method) {
  return std::string(method.name) + ": Invalid number of arguments.";
}

#endif  // VORKEL_TESTS_BINDING_METHODFACTS_H_
