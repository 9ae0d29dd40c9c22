// The bundled services need no setting up; what is kept is the count of their users.
//
// Tested by initialisers_test.cpp.
#include "host/Initialisers.h"

#include <atomic>

namespace Host {
namespace {

// Counting starts in the static initialisation of other libraries, so the counters must be
// constants until then.
template <typename Service>
constinit std::atomic<int> user_count = 0;

}  // namespace

template <typename Service>
Initialiser<Service>::Initialiser() {
  ++user_count<Service>;
}

template <typename Service>
Initialiser<Service>::~Initialiser() {
  --user_count<Service>;
}

template <typename Service>
int Initialiser<Service>::UserCount() {
  return user_count<Service>;
}

}  // namespace Host

template class Host::Initialiser<Port::FileInit>;
template class Host::Initialiser<Port::PathListInit>;
template class Host::Initialiser<CitP::InstanceTableInit>;
template class Host::Initialiser<CitP::FactoryInit>;
template class Host::Initialiser<Port_MsgManInit>;
