# Debian packages of what is installed: doc/install.md tells which, and tools/make_packages makes
# them. Packages have their files below /usr, and some places depend on that, so there are none of a
# tree that is configured for another prefix.
if(NOT CMAKE_INSTALL_PREFIX STREQUAL /usr)
  return()
endif()

set(packaging ${PROJECT_SOURCE_DIR}/packaging)
set(runtime libvorkel${PROJECT_VERSION})
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME vorkel)
set(CPACK_PACKAGE_VENDOR vorkel)
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_PACKAGE_CONTACT "The vorkel maintainers <maintainers@vorkel.example>")
set(CPACK_STRIP_FILES ON)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_ALL program common tcl library development)
if(VORKEL_PYTHON)
  list(APPEND CPACK_COMPONENTS_ALL python)
endif()
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_PRE_BUILD_SCRIPTS ${packaging}/compress.cmake)

# What packages of this version need of each other is of the same version.
set(same "(= ${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE})")

# deb_package(COMPONENT NAME SECTION DEPENDS SYNOPSIS TEXT): the package of a component. `TEXT` is
# what stands below the synopsis, in lines.
macro(deb_package component name section depends synopsis text)
  string(TOUPPER ${component} upper)
  set(CPACK_DEBIAN_${upper}_PACKAGE_NAME ${name})
  set(CPACK_DEBIAN_${upper}_PACKAGE_SECTION ${section})
  set(CPACK_DEBIAN_${upper}_PACKAGE_DEPENDS "${depends}")
  set(CPACK_COMPONENT_${upper}_DESCRIPTION "${synopsis}\n${text}")
  install(FILES ${packaging}/copyright DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${name}
    COMPONENT ${component} EXCLUDE_FROM_ALL)
  install(FILES ${packaging}/changelog RENAME changelog.Debian
    DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${name} COMPONENT ${component} EXCLUDE_FROM_ALL)
endmacro()

deb_package(program vorkel electronics "vorkel-common ${same}, tcl8.6"
  "planner for the clocks of FPGA designs"
  "Given the input clock of a device and the clocks that a design needs, it finds
the settings of the device's clock primitives: VCO, multiplier, dividers and
pins, with their errors and their jitter. All settings that the hardware has
are searched, in exact arithmetic. It writes reports, JSON, timing constraints
and HDL, and explains what stands in the way of a request.")
set(CPACK_DEBIAN_PROGRAM_PACKAGE_SUGGESTS bash-completion)

deb_package(common vorkel-common electronics ""
  "planner for the clocks of FPGA designs - devices and documents"
  "The device files that the vorkel program and its libraries read, models for
simulation, documents and examples.")
set(CPACK_DEBIAN_COMMON_PACKAGE_ARCHITECTURE all)
# What runs the models.
set(CPACK_DEBIAN_COMMON_PACKAGE_SUGGESTS "iverilog | verilator | ghdl")
set(CPACK_DEBIAN_COMMON_PACKAGE_SHLIBDEPS OFF)

deb_package(tcl tcl-vorkel interpreters "vorkel-common ${same}, tcl8.6"
  "planner for the clocks of FPGA designs - Tcl packages"
  "The Tcl package vorkel plans the clocks of a device. The package Ip_vorkel
answers the questions of an existing design flow about its clock primitives.")

deb_package(library ${runtime} libs "vorkel-common ${same}"
  "planner for the clocks of FPGA designs - library"
  "The library that plans the clocks of a device, for programs in C++.")
# Which package has the library, for those of programs that are linked with it; and that the loader
# has to know of it.
set(control ${PROJECT_BINARY_DIR}/packaging)
file(WRITE ${control}/shlibs
  "libvorkel ${PROJECT_VERSION} ${runtime} (>= ${PROJECT_VERSION})\n")
file(WRITE ${control}/triggers "activate-noawait ldconfig\n")
set(CPACK_DEBIAN_LIBRARY_PACKAGE_CONTROL_EXTRA ${control}/shlibs ${control}/triggers)

deb_package(development libvorkel-dev libdevel "${runtime} ${same}"
  "planner for the clocks of FPGA designs - development files"
  "Headers of the library that plans the clocks of a device, and the files by
which CMake and pkg-config find it.")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SHLIBDEPS OFF)

if(VORKEL_PYTHON)
  # An extension is of one version of Python.
  math(EXPR next "${VORKEL_PYTHON_VERSION_MINOR} + 1")
  string(CONCAT python_depends "vorkel-common ${same}, "
    "python3 (>= 3.${VORKEL_PYTHON_VERSION_MINOR}~), python3 (<< 3.${next})")
  deb_package(python python3-vorkel python "${python_depends}"
    "planner for the clocks of FPGA designs - Python module"
    "The Python module vorkel plans the clocks of a device, with exact frequencies
and typed answers.")
  set(CPACK_DEBIAN_PYTHON_PACKAGE_CONTROL_EXTRA
    ${packaging}/python/postinst ${packaging}/python/prerm)
  set(CPACK_DEBIAN_PYTHON_PACKAGE_CONTROL_STRICT_PERMISSION ON)
endif()

foreach(component IN LISTS CPACK_COMPONENTS_ALL)
  string(TOUPPER ${component} upper)
  set(overrides ${packaging}/overrides/${CPACK_DEBIAN_${upper}_PACKAGE_NAME})
  if(EXISTS ${overrides})
    install(FILES ${overrides} DESTINATION ${CMAKE_INSTALL_DATADIR}/lintian/overrides
      COMPONENT ${component} EXCLUDE_FROM_ALL)
  endif()
endforeach()

include(CPack)
