# Flags every target of the project shares; applied per target so that the installed
# package carries none of them to consumers.
function(avpost_compile_options target)
  target_compile_options(${target} PRIVATE
    -Wall -Wextra
    # Pixel and sample arithmetic must give the same bits on every build.
    -ffp-contract=off)
  if(CMAKE_SIZEOF_VOID_P EQUAL 4)
    # x87 extended precision would change rounding; use SSE for all floating point.
    target_compile_options(${target} PRIVATE -msse2 -mfpmath=sse)
  endif()
endfunction()
