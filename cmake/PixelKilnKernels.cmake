# pixelkiln_add_kernels(TARGET INSTRUCTION_SETS FILE...)
#
# Compiles each X.kernels.cpp once per instruction set of the list, in the namespace named after it, and adds
# the objects to TARGET. A further instruction set is one more word in a list below and one file in
# Src/primitives/simd/.

# Chosen by the library's capability flags.
set(PIXELKILN_INSTRUCTION_SETS plain sse2 ssse3 sse41 avx2 avx512)
# The colour spaces choose by the processor alone, and among other sets.
set(PIXELKILN_COLOUR_INSTRUCTION_SETS plain sse2 sse41 avx avx2fma)

# The plain bodies stay scalar: they are the form to debug, and the one that no vectoriser has touched.
set(PIXELKILN_KERNEL_FLAGS_plain -fno-tree-vectorize -fno-tree-slp-vectorize)
set(PIXELKILN_KERNEL_FLAGS_sse2 -msse2)
set(PIXELKILN_KERNEL_FLAGS_ssse3 -mssse3)
set(PIXELKILN_KERNEL_FLAGS_sse41 -msse4.1)
set(PIXELKILN_KERNEL_FLAGS_avx -mavx)
set(PIXELKILN_KERNEL_FLAGS_avx2 -mavx2)
set(PIXELKILN_KERNEL_FLAGS_avx2fma -mavx2 -mfma)
# The C library copies what tails need: groups of this size the compiler would copy by string instructions, which
# start slowly.
set(PIXELKILN_KERNEL_FLAGS_avx512 -mavx512f -mavx512bw -mavx512vl -mavx512dq -mstringop-strategy=libcall)
set(PIXELKILN_KERNEL_HEADER_plain plain)
set(PIXELKILN_KERNEL_HEADER_sse2 vector128)
set(PIXELKILN_KERNEL_HEADER_ssse3 vector128)
set(PIXELKILN_KERNEL_HEADER_sse41 vector128)
set(PIXELKILN_KERNEL_HEADER_avx avx)
set(PIXELKILN_KERNEL_HEADER_avx2 avx2)
set(PIXELKILN_KERNEL_HEADER_avx2fma avx2)
set(PIXELKILN_KERNEL_HEADER_avx512 avx512)

function(pixelkiln_add_kernels target instruction_sets)
  foreach(isa IN LISTS instruction_sets)
    set(objects ${target}_kernels_${isa})
    if(TARGET ${objects})
      target_sources(${objects} PRIVATE ${ARGN})
      continue()
    endif()
    add_library(${objects} OBJECT ${ARGN})
    target_link_libraries(${objects} PRIVATE pixelkiln_flags)
    target_include_directories(${objects} PRIVATE ${PROJECT_SOURCE_DIR}/Src ${PROJECT_SOURCE_DIR}/include)
    target_compile_definitions(${objects} PRIVATE PK_TARGET=${isa}
                               PK_TARGET_HEADER="primitives/simd/${PIXELKILN_KERNEL_HEADER_${isa}}.h")
    target_compile_options(${objects} PRIVATE ${PIXELKILN_KERNEL_FLAGS_${isa}})
    target_sources(${target} PRIVATE $<TARGET_OBJECTS:${objects}>)
  endforeach()
endfunction()
