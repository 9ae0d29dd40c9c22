#include "engine/pll/VcoCandidate.h"

#include <memory>

namespace Ip::Pll {

// The records are left as they are until a slot is taken: those of slots that no run takes cost no
// memory pages.
VcoCandidate* VcoCandidateTable::RecordsOfThread() {
  static constinit thread_local std::unique_ptr<VcoCandidate[]> records;
  if (records == nullptr) {
    records.reset(new VcoCandidate[MAX_VCO_CANDIDATES]);  // libc++ 14 has no ..._for_overwrite
  }
  return records.get();
}

}  // namespace Ip::Pll
