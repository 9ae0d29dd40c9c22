#include "cli/Formats.h"

#include "cli/Hdl.h"
#include "planner/report/Sdc.h"

namespace cli {

std::string DesignText(const Call& call, const planner::Answer& answer) {
  if (IsHdl(call.format)) return HdlText(call, answer);
  return planner::report::Sdc(call.request(), call.device, answer, call.sdc);
}

std::string InFormat(const Call& call, const std::vector<planner::report::Entry>& entries,
                     const planner::Answer& answer,
                     const std::vector<planner::Primitive>& front_cut) {
  if (call.format == Format::kJson) {
    return planner::report::Json(call.request(), call.device, entries, front_cut);
  }
  if (call.format == Format::kTcl) {
    return planner::report::Tcl(call.request(), call.device, entries, front_cut);
  }
  return DesignText(call, answer);
}

}  // namespace cli
