// The methods that run the KRU solvers and read what they have chosen.

#include "binding/Call.h"

namespace Ip {

int VorkelPtrHandle::KruCalculateActuals(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 6, "KruCalculateActuals") == nullptr) return TCL_ERROR;
  return call.Fail("KruCalculateActuals: not available.");
}

int VorkelPtrHandle::KruClkgenCalculateActuals(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 5, "KruClkgenCalculateActuals") == nullptr) return TCL_ERROR;
  return call.Fail("KruClkgenCalculateActuals: not available.");
}

int VorkelPtrHandle::GetKruChosenM(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 0, "GetKruChosenM") == nullptr) return TCL_ERROR;
  return call.Fail("GetKruChosenM: not available.");
}

int VorkelPtrHandle::GetKruChosenD(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 0, "GetKruChosenD") == nullptr) return TCL_ERROR;
  return call.Fail("GetKruChosenD: not available.");
}

int VorkelPtrHandle::GetKruChosenPhaseShift(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 0, "GetKruChosenPhaseShift") == nullptr) return TCL_ERROR;
  return call.Fail("GetKruChosenPhaseShift: not available.");
}

int VorkelPtrHandle::GetKruChosenPhaseOffset(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 0, "GetKruChosenPhaseOffset") == nullptr) return TCL_ERROR;
  return call.Fail("GetKruChosenPhaseOffset: not available.");
}

int VorkelPtrHandle::GetKruChosenClkdv(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 0, "GetKruChosenClkdv") == nullptr) return TCL_ERROR;
  return call.Fail("GetKruChosenClkdv: not available.");
}

int VorkelPtrHandle::GetKruChosenClkfxdv(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 0, "GetKruChosenClkfxdv") == nullptr) return TCL_ERROR;
  return call.Fail("GetKruChosenClkfxdv: not available.");
}

int VorkelPtrHandle::GetKruChosenDivBy2(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 0, "GetKruChosenDivBy2") == nullptr) return TCL_ERROR;
  return call.Fail("GetKruChosenDivBy2: not available.");
}

int VorkelPtrHandle::GetKruChosenPinname(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 1, "GetKruChosenPinname") == nullptr) return TCL_ERROR;
  return call.Fail("GetKruChosenPinname: not available.");
}

int VorkelPtrHandle::GetKruChosenOutFreqN(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  if (call.Object(*this, 2, "GetKruChosenOutFreqN") == nullptr) return TCL_ERROR;
  return call.Fail("GetKruChosenOutFreqN: not available.");
}

}  // namespace Ip
