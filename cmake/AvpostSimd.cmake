# The kernels' faster variants live in one file per instruction set, compiled with that file's own
# flags; everything else is built for the baseline, so the library runs on any x86 CPU with SSE2
# and picks a variant at run time (support/CpuFeatures.h).
set(AVPOST_SIMD_FLAGS_sse2 -msse2)
set(AVPOST_SIMD_FLAGS_ssse3 -mssse3)
set(AVPOST_SIMD_FLAGS_sse41 -msse4.1)
set(AVPOST_SIMD_FLAGS_avx2 -mavx2)

# avpost_simd_sources(<sse2|ssse3|sse41|avx2> <sources>...): adds one instruction set's variant
# files to the library. Such a file may define no inline function or template instance that other
# files share (the linker could pick its copy for every caller); a test checks their objects.
function(avpost_simd_sources level)
  if(NOT DEFINED AVPOST_SIMD_FLAGS_${level})
    message(FATAL_ERROR "avpost_simd_sources: unknown instruction set '${level}'")
  endif()
  target_sources(avpost_obj PRIVATE ${ARGN})
  set_source_files_properties(${ARGN} TARGET_DIRECTORY avpost_obj
    PROPERTIES COMPILE_OPTIONS "${AVPOST_SIMD_FLAGS_${level}}")
  foreach(source IN LISTS ARGN)
    file(RELATIVE_PATH relative "${PROJECT_SOURCE_DIR}" "${CMAKE_CURRENT_SOURCE_DIR}/${source}")
    set_property(GLOBAL APPEND PROPERTY AVPOST_SIMD_SOURCES "${relative}")
  endforeach()
endfunction()
