# Compile flags that every target of the project shares.
#
# Floating-point results are part of the interface: no contraction into fused multiply-adds, no fast-math.

add_library(pixelkiln_flags INTERFACE)
target_compile_options(pixelkiln_flags INTERFACE -ffp-contract=off -Wall -Wextra -Wshadow -Wconversion
                       -Wno-sign-conversion
                       -Wno-restrict) # g++ 12 sees overlaps in std::string's operator+ that are not there
if(PIXELKILN_WARNINGS_AS_ERRORS)
  target_compile_options(pixelkiln_flags INTERFACE -Werror)
endif()
if(PIXELKILN_SANITIZE)
  target_compile_options(pixelkiln_flags INTERFACE -fsanitize=${PIXELKILN_SANITIZE} -fno-omit-frame-pointer
                         -fno-sanitize-recover=all)
  target_link_options(pixelkiln_flags INTERFACE -fsanitize=${PIXELKILN_SANITIZE})
endif()
# libFuzzer comes with Clang and wants to see which branches of the library its inputs reach.
if(PIXELKILN_BUILD_FUZZ AND CMAKE_CXX_COMPILER_ID MATCHES Clang)
  set(PIXELKILN_LIBFUZZER ON)
  target_compile_options(pixelkiln_flags INTERFACE -fsanitize=fuzzer-no-link)
endif()
