// The script handle of an implementation object, and the 40 methods that scripts call on it.
//
// A method turns script words into values, makes one call into the engine and turns the
// answer into the interpreter's result; Call has what all of them do alike.
#ifndef VORKEL_BINDING_VORKELPTRHANDLE_H_
#define VORKEL_BINDING_VORKELPTRHANDLE_H_

#include "engine/Ip_VorkelImp.h"
#include "host/Script_PtrHandle.h"

namespace Ip {

// The words of a script call: the handle, the method name and the method's arguments.
using Words = const Script::Handle* const*;

class VorkelPtrHandle : public Script::PtrHandle<VorkelImp> {
 public:
  // A handle without an implementation object.
  explicit VorkelPtrHandle(Tcl_Interp* interp);
  // The object is held by plain pointer; the handle never deletes it.
  VorkelPtrHandle(VorkelImp* imp, Tcl_Interp* interp);
  ~VorkelPtrHandle() override;

  // Calls the method that objv[1] names. Its status; TCL_ERROR when there is none.
  int Execute(int objc, Words objv, Tcl_Interp* interp) override;

  Script::Handle* CreateHandle(Tcl_Interp* interp) const override;
  Script::PtrHandleBase* GetPtrHandleBase() const override;

  // DeviceMethods.cpp
  int GetSpdKeyValue(int objc, Words objv, Tcl_Interp* interp);
  int SetDevice(int objc, Words objv, Tcl_Interp* interp);
  int SetLowBandwidth(int objc, Words objv, Tcl_Interp* interp);
  int SetVcoMinThreshold(int objc, Words objv, Tcl_Interp* interp);

  // TimingMethods.cpp
  int GetVcoFreq(int objc, Words objv, Tcl_Interp* interp);
  int GetPLLPkToPkJitter(int objc, Words objv, Tcl_Interp* interp);
  int GetKRUPkToPkJitter(int objc, Words objv, Tcl_Interp* interp);
  int GetKRU_CLKGENPkToPkJitter(int objc, Words objv, Tcl_Interp* interp);
  int GetPLLPhaseError(int objc, Words objv, Tcl_Interp* interp);
  int GetKRUPhaseError(int objc, Words objv, Tcl_Interp* interp);
  int GetKRUPeriodPhaseDutyCycle(int objc, Words objv, Tcl_Interp* interp);
  int GetPLLPeriodPhaseDutyCycle(int objc, Words objv, Tcl_Interp* interp);
  int GetLatestPhase(int objc, Words objv, Tcl_Interp* interp);
  int GetLatestDutyCycle(int objc, Words objv, Tcl_Interp* interp);
  int TSYNCalculateActualPhase(int objc, Words objv, Tcl_Interp* interp);
  int TSYNCalculateActualDutyCycle(int objc, Words objv, Tcl_Interp* interp);

  // PllMethods.cpp
  int TSYNCalculateActualOutFreqs(int objc, Words objv, Tcl_Interp* interp);
  int PLLCalculateActualOutFreqs(int objc, Words objv, Tcl_Interp* interp);
  int GetClosestSolution(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenM(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenMInt(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenD(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenDiv0(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenDiv0Int(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenDivN(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenVCO(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenOutFreqN(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenPhaseN(int objc, Words objv, Tcl_Interp* interp);
  int GetChosenDutyCycleN(int objc, Words objv, Tcl_Interp* interp);

  // KruMethods.cpp
  int KruCalculateActuals(int objc, Words objv, Tcl_Interp* interp);
  int KruClkgenCalculateActuals(int objc, Words objv, Tcl_Interp* interp);
  int GetKruChosenM(int objc, Words objv, Tcl_Interp* interp);
  int GetKruChosenD(int objc, Words objv, Tcl_Interp* interp);
  int GetKruChosenPhaseShift(int objc, Words objv, Tcl_Interp* interp);
  int GetKruChosenPhaseOffset(int objc, Words objv, Tcl_Interp* interp);
  int GetKruChosenClkdv(int objc, Words objv, Tcl_Interp* interp);
  int GetKruChosenClkfxdv(int objc, Words objv, Tcl_Interp* interp);
  int GetKruChosenDivBy2(int objc, Words objv, Tcl_Interp* interp);
  int GetKruChosenPinname(int objc, Words objv, Tcl_Interp* interp);
  int GetKruChosenOutFreqN(int objc, Words objv, Tcl_Interp* interp);
};

}  // namespace Ip

#endif  // VORKEL_BINDING_VORKELPTRHANDLE_H_
