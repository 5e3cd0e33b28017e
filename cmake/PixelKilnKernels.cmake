# pixelkiln_add_kernels(LIBRARY TARGETS FILE...)
#
# Compiles each X.kernels.cpp once per target of the list, in the namespace named after it, and adds the objects to
# LIBRARY. The names are those of enum Target; a further one is one more word in a list below, its flags, and its vector
# file in Src/primitives/simd/.

# The offers: chosen by the library's capability flags, or by the processor alone.
set(PIXELKILN_FLAG_TARGETS plain sse2 ssse3 sse41 avx2 avx512)
set(PIXELKILN_PROCESSOR_TARGETS plain sse2 sse41 avx avx2fma)

# Every target begins with what each processor of the architecture has, whatever a packager's flags say: what a body may
# use follows from its target alone.
set(baseline -march=x86-64 -mtune=generic -mno-sse3)
# Loops of a few instructions run at up to 1.5 times the rate where they lie in one line of the decoder; without this
# any change to a source would make others faster or slower.
list(APPEND baseline -falign-loops=32)
# The plain bodies stay scalar: they are the form to debug, and the one that no vectoriser has touched.
set(PIXELKILN_KERNEL_FLAGS_plain ${baseline} -fno-tree-vectorize -fno-tree-slp-vectorize)
set(PIXELKILN_KERNEL_FLAGS_sse2 ${baseline})
set(PIXELKILN_KERNEL_FLAGS_ssse3 ${baseline} -mssse3)
set(PIXELKILN_KERNEL_FLAGS_sse41 ${baseline} -msse4.1)
set(PIXELKILN_KERNEL_FLAGS_avx ${baseline} -mavx)
set(PIXELKILN_KERNEL_FLAGS_avx2 ${baseline} -mavx2)
set(PIXELKILN_KERNEL_FLAGS_avx2fma ${baseline} -mavx2 -mfma)
# The C library copies what tails need: groups of this size g++ would copy by string instructions, which start slowly.
# And g++ forgets in a precompiled header that its intrinsics leave registers open on purpose.
set(PIXELKILN_KERNEL_FLAGS_avx512 ${baseline} -mavx512f -mavx512bw -mavx512vl -mavx512dq
                                  $<$<CXX_COMPILER_ID:GNU>:-mstringop-strategy=libcall -Wno-uninitialized
                                                              -Wno-maybe-uninitialized>)
set(PIXELKILN_KERNEL_HEADER_plain plain)
set(PIXELKILN_KERNEL_HEADER_sse2 vector128)
set(PIXELKILN_KERNEL_HEADER_ssse3 vector128)
set(PIXELKILN_KERNEL_HEADER_sse41 vector128)
set(PIXELKILN_KERNEL_HEADER_avx avx)
set(PIXELKILN_KERNEL_HEADER_avx2 avx2)
set(PIXELKILN_KERNEL_HEADER_avx2fma avx2)
set(PIXELKILN_KERNEL_HEADER_avx512 avx512)

function(pixelkiln_add_kernels library targets)
  foreach(target IN LISTS targets)
    set(objects ${library}_kernels_${target})
    if(TARGET ${objects})
      target_sources(${objects} PRIVATE ${ARGN})
      continue()
    endif()
    add_library(${objects} OBJECT ${ARGN})
    target_link_libraries(${objects} PRIVATE pixelkiln_flags)
    target_include_directories(${objects} PRIVATE ${PROJECT_SOURCE_DIR}/Src ${PROJECT_SOURCE_DIR}/include
                                                  ${CMAKE_CURRENT_SOURCE_DIR})
    target_compile_definitions(${objects} PRIVATE PK_TARGET=${target}
                               PK_TARGET_HEADER="primitives/simd/${PIXELKILN_KERNEL_HEADER_${target}}.h")
    target_compile_options(${objects} PRIVATE ${PIXELKILN_KERNEL_FLAGS_${target}})
    target_sources(${library} PRIVATE $<TARGET_OBJECTS:${objects}>)
  endforeach()
endfunction()
