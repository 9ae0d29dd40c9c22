#include "engine/Ip_VorkelImp.h"

#include "host/Dly_SpeedController.h"
#include "host/PM_PIC.h"
#include "host/Tw_BmCMBCalculator.h"

namespace Ip {

constinit thread_local std::int32_t VorkelImp::_prim = -1;

VorkelImp::VorkelImp(Tcl_Interp* owner) : interp(owner) {}

// The speed controller stays, and its use count with it: it belongs to the registry.
VorkelImp::~VorkelImp() {
  delete pic;
  pic = nullptr;
  delete cmbCalculator;
  cmbCalculator = nullptr;
}

void VorkelImp::SetDevice(const Port::StringBase& name) {
  if (!name.IsEmpty()) partName = name;
}

}  // namespace Ip
