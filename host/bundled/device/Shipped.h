// Where files stand that come with a program or a library, wherever that has been installed.
//
// Tested by shipped_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_SHIPPED_H_
#define VORKEL_HOST_BUNDLED_DEVICE_SHIPPED_H_

#include <string>

namespace Device {

// The file or folder `name` that belongs to a program or a library in `folder`, an absolute path:
//   - in that folder itself;
//   - in the build tree, in the package's folder, which is in that folder or beside it;
//   - installed, in PREFIX/share/vorkel, where PREFIX is at most four folders above: as PREFIX/bin,
//     PREFIX/lib/ARCHITECTURE, PREFIX/lib/tcltk/PACKAGE and
//     PREFIX/lib/python3/dist-packages/MODULE.
// The first that is there; empty when none is.
std::string Shipped(const std::string& folder, const std::string& name);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_SHIPPED_H_
