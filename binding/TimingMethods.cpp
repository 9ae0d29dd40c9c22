// The methods that query timing figures.

#include "binding/Call.h"

namespace Ip {

int VorkelPtrHandle::GetLatestPhase(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetLatestPhase");
  return imp == nullptr ? TCL_ERROR : call.Answer("%3.3f", imp->GetLatestPhase());
}

int VorkelPtrHandle::GetLatestDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetLatestDutyCycle");
  return imp == nullptr ? TCL_ERROR : call.Answer("%3.3f", imp->GetLatestDutyCycle());
}

int VorkelPtrHandle::GetVcoFreq(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 4, "GetVcoFreq") == nullptr) return TCL_ERROR;
  return call.Fail("GetVcoFreq: not available.");
}

int VorkelPtrHandle::GetPLLPkToPkJitter(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 6, "GetPLLPkToPkJitter") == nullptr) return TCL_ERROR;
  return call.Fail("GetPLLPkToPkJitter: not available.");
}

int VorkelPtrHandle::GetKRUPkToPkJitter(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 7, "GetKRUPkToPkJitter",
                  "Unable to obtain Implementation object for VorkelPtrHandle::GetKruPkToPkJitter") == nullptr) return TCL_ERROR;
  return call.Fail("GetKRUPkToPkJitter: not available.");
}

int VorkelPtrHandle::GetKRU_CLKGENPkToPkJitter(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 7, "GetKRU_CLKGENPkToPkJitter") == nullptr) return TCL_ERROR;
  return call.Fail("GetKRU_CLKGENPkToPkJitter: not available.");
}

int VorkelPtrHandle::GetPLLPhaseError(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 3, "GetPLLPhaseError") == nullptr) return TCL_ERROR;
  return call.Fail("GetPLLPhaseError: not available.");
}

int VorkelPtrHandle::GetKRUPhaseError(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 0, "GetKRUPhaseError") == nullptr) return TCL_ERROR;
  return call.Fail("GetKRUPhaseError: not available.");
}

int VorkelPtrHandle::GetKRUPeriodPhaseDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 6, "GetKRUPeriodPhaseDutyCycle",
                  "Unable to obtain Implementation object for VorkelPtrHandle::GetKruPeriodPhaseDutyCycle") == nullptr) return TCL_ERROR;
  return call.Fail("GetKRUPeriodPhaseDutyCycle: not available.");
}

int VorkelPtrHandle::GetPLLPeriodPhaseDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 7, "GetPLLPeriodPhaseDutyCycle",
                  "Unable to obtain Implementation object for VorkelPtrHandle::GetPllPeriodPhaseDutyCycle") == nullptr) return TCL_ERROR;
  return call.Fail("GetPLLPeriodPhaseDutyCycle: not available.");
}

int VorkelPtrHandle::TSYNCalculateActualPhase(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 3, "TSYNCalculateActualPhase") == nullptr) return TCL_ERROR;
  return call.Fail("TSYNCalculateActualPhase: not available.");
}

int VorkelPtrHandle::TSYNCalculateActualDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 3, "TSYNCalculateActualDutyCycle") == nullptr) return TCL_ERROR;
  return call.Fail("TSYNCalculateActualDutyCycle: not available.");
}

}  // namespace Ip
