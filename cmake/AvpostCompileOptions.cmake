# Flags every target of the project shares; applied per target so that the installed
# package carries none of them to consumers.
option(AVPOST_WARNINGS_AS_ERRORS "Fail the build on any compiler warning (CI builds do)" OFF)

function(avpost_compile_options target)
  target_compile_options(${target} PRIVATE
    -Wall -Wextra -Wshadow
    # Narrowing of pixel and sample values must be spelled out where it is meant.
    $<$<CXX_COMPILER_ID:GNU>:-Wconversion>
    # Pixel and sample arithmetic must give the same bits on every build.
    -ffp-contract=off)
  # Media files pass 2 GiB; 32-bit builds need 64-bit file offsets for them.
  target_compile_definitions(${target} PRIVATE _FILE_OFFSET_BITS=64)
  if(AVPOST_WARNINGS_AS_ERRORS)
    target_compile_options(${target} PRIVATE -Werror)
  endif()
  if(CMAKE_SIZEOF_VOID_P EQUAL 4)
    # x87 extended precision would change rounding; use SSE for all floating point.
    target_compile_options(${target} PRIVATE -msse2 -mfpmath=sse)
  endif()
endfunction()
