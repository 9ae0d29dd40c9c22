// The methods that select a device and read its speed data.

#include <string>

#include "binding/Call.h"

namespace Ip {

int VorkelPtrHandle::GetSpdKeyValue(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 1, "GetSpdKeyValue");
  if (imp == nullptr) return TCL_ERROR;
  const Port::StringBase keyword = call.String(0);
  double value = 0.0;
  if (!imp->GetSpdKeyValue(keyword, &value)) {
    const std::string message =
        std::string("Unable to get value from speedsfile for keyword ") + keyword.CStr();
    return call.Fail(message.c_str());
  }
  return call.AnswerNumber("%3.3f", value);
}

int VorkelPtrHandle::SetDevice(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 1, "SetDevice",
                               "Unable to set device for VorkelPtrHandle::SetDevice");
  if (imp == nullptr) return TCL_ERROR;
  imp->SetDevice(call.String(0));
  return TCL_OK;
}

int VorkelPtrHandle::SetLowBandwidth(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 1, "SetLowBandwidth",
                               "Unable to set bandwidth for VorkelPtrHandle::SetLowBandwidth");
  if (imp == nullptr) return TCL_ERROR;
  imp->SetLowBandwidth(call.Flag(0));
  return TCL_OK;
}

// Accepted and ignored, also by a handle without an implementation object: scripts pass it,
// and no search has a threshold.
int VorkelPtrHandle::SetVcoMinThreshold(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  return call.HasArguments(1, "SetVcoMinThreshold") ? TCL_OK : TCL_ERROR;
}

}  // namespace Ip
