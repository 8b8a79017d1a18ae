# Run as a test: cmake -DNM=<nm> -DOBJECTS=<a|b|...> -DSOURCES=<x|y|...> -P CheckSimdObjects.cmake
# Fails when an object built with one instruction set's flags defines a weak or unique symbol.
# Such a symbol is an inline function or template instance that other files may share; the linker
# keeps one copy for every caller, and if it keeps this one, baseline code runs instructions the
# CPU may lack (seen only on older CPUs, and only in unoptimised builds where nothing is inlined).
string(REPLACE "|" ";" objects "${OBJECTS}")
string(REPLACE "|" ";" sources "${SOURCES}")
set(checked 0)
set(failures "")
foreach(object IN LISTS objects)
  foreach(source IN LISTS sources)
    if(object MATCHES "/${source}\\.o(bj)?$")
      math(EXPR checked "${checked} + 1")
      execute_process(COMMAND "${NM}" --defined-only -C "${object}"
        OUTPUT_VARIABLE symbols RESULT_VARIABLE status)
      if(NOT status EQUAL 0)
        message(FATAL_ERROR "${NM} failed on ${object}")
      endif()
      string(REGEX MATCHALL "[^\n]* [WVu] [^\n]*" shared "${symbols}")
      if(shared)
        string(REPLACE ";" "\n  " shared "${shared}")
        string(APPEND failures "${source} shares:\n  ${shared}\n")
      endif()
    endif()
  endforeach()
endforeach()
list(LENGTH sources expected)
if(NOT checked EQUAL expected)
  message(FATAL_ERROR "found ${checked} of ${expected} instruction-set objects")
endif()
if(failures)
  message(FATAL_ERROR "instruction-set files define shared symbols:\n${failures}")
endif()
message(STATUS "${checked} instruction-set objects define no shared symbols")
