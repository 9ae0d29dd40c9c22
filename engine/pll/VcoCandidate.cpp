#include "engine/pll/VcoCandidate.h"

namespace Ip::Pll {

namespace {

// Those of the thread. A plain pointer can be used until the thread is gone: a run may come at the
// very end of the process, behind the end of all that has an end.
constinit thread_local VcoCandidate* records = nullptr;

// Frees them with the thread.
struct Owner {
  ~Owner() {
    delete[] records;
    records = nullptr;
  }
};

}  // namespace

// The records are left as they are until a slot is taken: those of slots that no run takes cost no
// memory pages.
VcoCandidate* VcoCandidateTable::RecordsOfThread() {
  if (records == nullptr) {
    [[maybe_unused]] thread_local const Owner owner{};
    records = new VcoCandidate[MAX_VCO_CANDIDATES];
  }
  return records;
}

}  // namespace Ip::Pll
