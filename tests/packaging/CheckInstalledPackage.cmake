# cmake -P script: install, then build and run the consumer both ways.
function(run)
  execute_process(COMMAND ${ARGN} RESULT_VARIABLE rc OUTPUT_VARIABLE out ERROR_VARIABLE err)
  if(NOT rc EQUAL 0)
    message(FATAL_ERROR "failed (${rc}): ${ARGN}\n${out}\n${err}")
  endif()
  set(run_output "${out}" PARENT_SCOPE)
endfunction()

set(prefix "${WORK_DIR}/prefix")
file(REMOVE_RECURSE "${WORK_DIR}")
run(${CMAKE_COMMAND} --install "${BUILD_DIR}" --prefix "${prefix}")

foreach(header avpost.h media/MediaFrame.h media/StreamInfo.h media/Decoder.h video/VideoEvenProcess.h)
  if(NOT EXISTS "${prefix}/include/avpost/${header}")
    message(FATAL_ERROR "not installed: include/avpost/${header}")
  endif()
endforeach()

# The run-time loaded JPEG library lies beside the library that looks for it.
set(consumer_args "")
if(WITH_JPEG_LIBRARY)
  file(GLOB_RECURSE avpost_libs "${prefix}/*/libavpost.so")
  list(GET avpost_libs 0 avpost_lib)
  get_filename_component(avpost_lib_dir "${avpost_lib}" DIRECTORY)
  if(NOT EXISTS "${avpost_lib_dir}/IJL15.DLL")
    message(FATAL_ERROR "IJL15.DLL is not installed beside ${avpost_lib}")
  endif()
  set(consumer_args --jpeg-library)
endif()

# find_package(avpost) + avpost::avpost
set(toolchain_arg "")
if(TOOLCHAIN)
  set(toolchain_arg "-DCMAKE_TOOLCHAIN_FILE=${TOOLCHAIN}")
endif()
run(${CMAKE_COMMAND} -S "${CONSUMER_DIR}" -B "${WORK_DIR}/cmake-consumer" -G "${GENERATOR}"
    "-DCMAKE_PREFIX_PATH=${prefix}" "-DCMAKE_CXX_COMPILER=${CXX_COMPILER}" "-DCMAKE_CXX_FLAGS=${CXX_FLAGS}"
    ${toolchain_arg})
run(${CMAKE_COMMAND} --build "${WORK_DIR}/cmake-consumer")
run("${WORK_DIR}/cmake-consumer/consumer" ${consumer_args})
if(NOT run_output MATCHES "consumer ok")
  message(FATAL_ERROR "unexpected consumer output: ${run_output}")
endif()

# pkg-config --cflags --libs avpost
file(GLOB_RECURSE pc_files "${prefix}/*/avpost.pc")
list(GET pc_files 0 pc_file)
get_filename_component(pc_dir "${pc_file}" DIRECTORY)
set(ENV{PKG_CONFIG_PATH} "${pc_dir}")
run(pkg-config --cflags --libs avpost)
string(STRIP "${run_output}" pc_flags)
separate_arguments(pc_flags UNIX_COMMAND "${pc_flags}")
separate_arguments(extra_flags UNIX_COMMAND "${CXX_FLAGS}")
if(TOOLCHAIN)
  list(APPEND extra_flags -m32)
endif()
get_filename_component(lib_dir "${pc_dir}" DIRECTORY)
run("${CXX_COMPILER}" -std=c++17 ${extra_flags} "${CONSUMER_DIR}/main.cpp" ${pc_flags}
    "-Wl,-rpath,${lib_dir}" -o "${WORK_DIR}/pc-consumer")
run("${WORK_DIR}/pc-consumer" ${consumer_args})
if(NOT run_output MATCHES "consumer ok")
  message(FATAL_ERROR "unexpected consumer output: ${run_output}")
endif()
