# Installs the build to a fresh prefix and builds a project against it, by the CMake package and by
# pkg-config. Both programs must run and print the build's version.
#
#   cmake -DBUILD=build-folder -DSOURCE=project -DWORK=scratch -DCXX=c++
#     -DGENERATOR=Ninja -DVERSION=x.y.z -P run.cmake

set(prefix ${WORK}/prefix)
file(REMOVE_RECURSE ${WORK})

function(run)
  execute_process(COMMAND ${ARGN} OUTPUT_VARIABLE output COMMAND_ERROR_IS_FATAL ANY)
  string(STRIP "${output}" output)
  set(output "${output}" PARENT_SCOPE)
endfunction()

function(check_program program)
  run(${CMAKE_COMMAND} -E env LD_LIBRARY_PATH=${library_dir} ${program})
  message(STATUS "${output}")
  if(NOT output MATCHES "^haze_preview ${VERSION}: luma 128 is now [0-9]+$")
    message(FATAL_ERROR "unexpected output of ${program}")
  endif()
endfunction()

run(${CMAKE_COMMAND} --install ${BUILD} --prefix ${prefix})
file(GLOB_RECURSE pc_file ${prefix}/*/haze_preview.pc)
cmake_path(GET pc_file PARENT_PATH pc_dir)
cmake_path(GET pc_dir PARENT_PATH library_dir)

run(${CMAKE_COMMAND} -S ${SOURCE} -B ${WORK}/cmake -G ${GENERATOR}
  -DCMAKE_CXX_COMPILER=${CXX} -DCMAKE_PREFIX_PATH=${prefix})
run(${CMAKE_COMMAND} --build ${WORK}/cmake)
check_program(${WORK}/cmake/consumer)

set(ENV{PKG_CONFIG_PATH} ${pc_dir})
set(pkg_config pkg-config haze_preview)
run(${pkg_config} --modversion)
if(NOT output STREQUAL VERSION)
  message(FATAL_ERROR "pkg-config says version ${output}, not ${VERSION}")
endif()
run(${pkg_config} --cflags --libs --static)
separate_arguments(flags UNIX_COMMAND "${output}")
run(${CXX} -std=c++17 ${SOURCE}/consumer.cpp -o ${WORK}/by_pkg_config ${flags})
check_program(${WORK}/by_pkg_config)
