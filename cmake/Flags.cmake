# What every target of this tree is built with. Results are IEEE doubles in the order that
# the source writes, so contraction to fused multiply-add is off.
add_library(vorkel_flags INTERFACE)
target_compile_options(vorkel_flags INTERFACE
  -Wall -Wextra -Wconversion -Wshadow -Werror -ffp-contract=off)
if(CMAKE_CXX_COMPILER_ID STREQUAL GNU AND CMAKE_CXX_COMPILER_VERSION VERSION_LESS 13)
  # GCC 12 sees overlaps in plain additions of strings (GCC bug 105651), and uninitialised parts in
  # optionals that are moved (GCC bug 80635).
  target_compile_options(vorkel_flags INTERFACE -Wno-restrict -Wno-maybe-uninitialized)
endif()
cmake_path(GET CMAKE_CURRENT_LIST_DIR PARENT_PATH vorkel_root)
target_include_directories(vorkel_flags INTERFACE ${vorkel_root})
if(VORKEL_FUZZ)
  target_compile_options(vorkel_flags INTERFACE -fsanitize=fuzzer-no-link)
endif()
if(VORKEL_SANITIZE)
  # The check of virtual tables refers to the types of libraries that are not linked everywhere.
  target_compile_options(vorkel_flags INTERFACE
    -fsanitize=address,undefined -fno-sanitize=vptr -fno-sanitize-recover=all
    -fno-omit-frame-pointer)
  target_link_options(vorkel_flags INTERFACE -fsanitize=address,undefined)
else()
  # What overruns a buffer ends the process at once.
  target_compile_options(vorkel_flags INTERFACE
    "$<$<PLATFORM_ID:Linux>:-fstack-protector-strong;$<$<CONFIG:Release>:-D_FORTIFY_SOURCE=2>>")
endif()
# Tables that the loader has filled are not written any more.
target_link_options(vorkel_flags INTERFACE "$<$<PLATFORM_ID:Linux>:-Wl,-z,relro;-Wl,-z,now>")
