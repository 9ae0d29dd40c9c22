// The initialiser objects of the host libraries.
//
// A library that uses the host constructs one of each during its own static initialisation,
// in the order below, and so keeps the service up until its statics are destroyed. Objects
// may be constructed any number of times; each service counts its users.
#ifndef VORKEL_HOST_INITIALISERS_H_
#define VORKEL_HOST_INITIALISERS_H_

namespace Host {

// The counting part that the five initialisers share. `Service` tells the counters apart.
template <typename Service>
class Initialiser {
 public:
  Initialiser();
  ~Initialiser();
  Initialiser(const Initialiser&) = delete;
  Initialiser& operator=(const Initialiser&) = delete;

  // How many initialiser objects of this service live in the process.
  static int UserCount();
};

}  // namespace Host

namespace Port {
class FileInit : public Host::Initialiser<FileInit> {};
class PathListInit : public Host::Initialiser<PathListInit> {};
}  // namespace Port

namespace CitP {
class InstanceTableInit : public Host::Initialiser<InstanceTableInit> {};
class FactoryInit : public Host::Initialiser<FactoryInit> {};
}  // namespace CitP

class Port_MsgManInit : public Host::Initialiser<Port_MsgManInit> {};

// Defined once, by the host.
extern template class Host::Initialiser<Port::FileInit>;
extern template class Host::Initialiser<Port::PathListInit>;
extern template class Host::Initialiser<CitP::InstanceTableInit>;
extern template class Host::Initialiser<CitP::FactoryInit>;
extern template class Host::Initialiser<Port_MsgManInit>;

#endif  // VORKEL_HOST_INITIALISERS_H_
