#include "binding/MethodTable.h"

#include <atomic>
#include <mutex>
#include <new>

#include "host/Initialisers.h"

namespace Ip {

namespace {

// Static initialisation brings the host's services up in this order, then builds the table;
// they go down the other way round. All of it stands in this file so that the order is that
// of the lines.
const Port::FileInit fileInit;
const Port::PathListInit pathListInit;
const CitP::InstanceTableInit instanceTableInit;
const CitP::FactoryInit factoryInit;
const Port_MsgManInit msgManInit;

std::array<Method, kMethods> methods;

// The search goes from the first entry to the last. KRU and Kru stand as scripts know them.
void Build() {
  methods = {{
      {"GetSpdKeyValue", &VorkelPtrHandle::GetSpdKeyValue},
      {"SetDevice", &VorkelPtrHandle::SetDevice},
      {"SetLowBandwidth", &VorkelPtrHandle::SetLowBandwidth},
      {"SetVcoMinThreshold", &VorkelPtrHandle::SetVcoMinThreshold},
      {"GetVcoFreq", &VorkelPtrHandle::GetVcoFreq},
      {"GetPLLPkToPkJitter", &VorkelPtrHandle::GetPLLPkToPkJitter},
      {"GetKRUPkToPkJitter", &VorkelPtrHandle::GetKRUPkToPkJitter},
      {"GetKRU_CLKGENPkToPkJitter", &VorkelPtrHandle::GetKRU_CLKGENPkToPkJitter},
      {"GetPLLPhaseError", &VorkelPtrHandle::GetPLLPhaseError},
      {"GetKRUPhaseError", &VorkelPtrHandle::GetKRUPhaseError},
      {"GetKRUPeriodPhaseDutyCycle", &VorkelPtrHandle::GetKRUPeriodPhaseDutyCycle},
      {"GetPLLPeriodPhaseDutyCycle", &VorkelPtrHandle::GetPLLPeriodPhaseDutyCycle},
      {"GetLatestPhase", &VorkelPtrHandle::GetLatestPhase},
      {"GetLatestDutyCycle", &VorkelPtrHandle::GetLatestDutyCycle},
      {"TSYNCalculateActualOutFreqs", &VorkelPtrHandle::TSYNCalculateActualOutFreqs},
      {"PLLCalculateActualOutFreqs", &VorkelPtrHandle::PLLCalculateActualOutFreqs},
      {"KruCalculateActuals", &VorkelPtrHandle::KruCalculateActuals},
      {"KruClkgenCalculateActuals", &VorkelPtrHandle::KruClkgenCalculateActuals},
      {"GetClosestSolution", &VorkelPtrHandle::GetClosestSolution},
      {"GetChosenM", &VorkelPtrHandle::GetChosenM},
      {"GetChosenMInt", &VorkelPtrHandle::GetChosenMInt},
      {"GetChosenD", &VorkelPtrHandle::GetChosenD},
      {"GetChosenDiv0", &VorkelPtrHandle::GetChosenDiv0},
      {"GetChosenDiv0Int", &VorkelPtrHandle::GetChosenDiv0Int},
      {"GetChosenDivN", &VorkelPtrHandle::GetChosenDivN},
      {"GetChosenVCO", &VorkelPtrHandle::GetChosenVCO},
      {"GetChosenOutFreqN", &VorkelPtrHandle::GetChosenOutFreqN},
      {"GetChosenPhaseN", &VorkelPtrHandle::GetChosenPhaseN},
      {"GetChosenDutyCycleN", &VorkelPtrHandle::GetChosenDutyCycleN},
      {"GetKruChosenM", &VorkelPtrHandle::GetKruChosenM},
      {"GetKruChosenD", &VorkelPtrHandle::GetKruChosenD},
      {"GetKruChosenPhaseShift", &VorkelPtrHandle::GetKruChosenPhaseShift},
      {"GetKruChosenPhaseOffset", &VorkelPtrHandle::GetKruChosenPhaseOffset},
      {"GetKruChosenClkdv", &VorkelPtrHandle::GetKruChosenClkdv},
      {"GetKruChosenClkfxdv", &VorkelPtrHandle::GetKruChosenClkfxdv},
      {"GetKruChosenDivBy2", &VorkelPtrHandle::GetKruChosenDivBy2},
      {"GetKruChosenPinname", &VorkelPtrHandle::GetKruChosenPinname},
      {"GetKruChosenOutFreqN", &VorkelPtrHandle::GetKruChosenOutFreqN},
      {"TSYNCalculateActualPhase", &VorkelPtrHandle::TSYNCalculateActualPhase},
      {"TSYNCalculateActualDutyCycle", &VorkelPtrHandle::TSYNCalculateActualDutyCycle},
  }};
}

// Whether the table is built. An exception in static initialisation would end the process.
std::atomic<bool> built = [] {
  try {
    Build();
    return true;
  } catch (const std::bad_alloc&) {
    return false;
  }
}();

// Builds the table where there was no memory for it when the library was loaded.
void EnsureBuilt() {
  if (built) return;
  static constinit std::mutex building;
  const std::lock_guard lock(building);
  if (built) return;
  Build();
  built = true;
}

}  // namespace

const std::array<Method, kMethods>& MethodTable() { return methods; }

const Method* FindMethod(std::string_view name) {
  EnsureBuilt();
  for (const Method& method : methods) {
    if (method.name.View() == name) return &method;
  }
  return nullptr;
}

}  // namespace Ip
