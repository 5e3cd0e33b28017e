# Compile flags that every target of the project shares.
#
# Floating-point results are part of the interface: no contraction into fused multiply-adds, no fast-math.

add_library(pixelkiln_flags INTERFACE)
target_compile_options(pixelkiln_flags INTERFACE -ffp-contract=off -Wall -Wextra -Wshadow -Wconversion
                       -Wno-sign-conversion
                       # g++ 12 sees overlaps in std::string's operator+ that are not there.
                       $<$<CXX_COMPILER_ID:GNU>:-Wno-restrict>
                       # Clang warns of std::make_shared, which destroys what it made: the destructors of colour spaces
                       # are not virtual.
                       $<$<CXX_COMPILER_ID:Clang>:-Wno-delete-non-abstract-non-virtual-dtor>
                       # Clang else writes -(a * b) as (-a) * b, which other rounding modes than that to nearest can tell.
                       $<$<CXX_COMPILER_ID:Clang>:-frounding-math>)
if(PIXELKILN_WARNINGS_AS_ERRORS)
  target_compile_options(pixelkiln_flags INTERFACE -Werror)
endif()
# All that is built here, GoogleTest too: the address sanitizer follows the containers of libc++ through all who use one.
if(PIXELKILN_SANITIZE)
  add_compile_options(-fsanitize=${PIXELKILN_SANITIZE} -fno-omit-frame-pointer -fno-sanitize-recover=all)
  add_link_options(-fsanitize=${PIXELKILN_SANITIZE})
endif()
# What fuzzes wants to see which branches of the library its inputs reach; kernels have few. Clang brings libFuzzer; who
# links another engine gives the flags for it too.
set(LIB_FUZZING_ENGINE "$ENV{LIB_FUZZING_ENGINE}" CACHE STRING "Fuzzing engine to link; empty takes that of the compiler")
set(PIXELKILN_FUZZING_COVERAGE "")
if(PIXELKILN_BUILD_FUZZ AND NOT LIB_FUZZING_ENGINE AND CMAKE_CXX_COMPILER_ID MATCHES Clang)
  set(LIB_FUZZING_ENGINE -fsanitize=fuzzer)
  set(PIXELKILN_FUZZING_COVERAGE -fsanitize=fuzzer-no-link)
  target_link_options(pixelkiln_flags INTERFACE ${PIXELKILN_FUZZING_COVERAGE})
  include(CheckCXXSymbolExists)
  check_cxx_symbol_exists(_LIBCPP_VERSION version PIXELKILN_HAS_LIBCXX)
  if(PIXELKILN_HAS_LIBCXX)
    # libFuzzer itself may be built with libstdc++. That stands last, so that exceptions are those of libc++.
    list(APPEND LIB_FUZZING_ENGINE -lc++ -lc++abi -l:libstdc++.so.6)
  endif()
endif()

# pixelkiln_compile_quickly(TARGET [HEADER...]): for programs, which are not measured themselves. HEADERs are compiled once,
# with those of the standard library that most sources take.
function(pixelkiln_compile_quickly target)
  target_compile_options(${target} PRIVATE $<$<NOT:$<CONFIG:Debug>>:-O1>)
  if(PIXELKILN_SANITIZE)
    # It is the library that is watched. The address sanitizer wants to see both.
    target_compile_options(${target} PRIVATE -fno-sanitize=undefined)
  endif()
  target_precompile_headers(${target} PRIVATE ${ARGN} <algorithm> <cmath> <cstring> <functional> <string> <vector>)
endfunction()
