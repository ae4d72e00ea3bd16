# Installs the build into a scratch prefix, then builds a consumer with find_package
cmake_minimum_required(VERSION 3.25)
# and checks the pkg-config file.
file(REMOVE_RECURSE ${WORK_DIR})
execute_process(COMMAND ${CMAKE_COMMAND} --install ${BUILD_DIR} --prefix ${WORK_DIR}/prefix
    RESULT_VARIABLE rc OUTPUT_QUIET)
if(NOT rc EQUAL 0)
    message(FATAL_ERROR "install failed")
endif()
execute_process(COMMAND ${CMAKE_COMMAND} -S ${SOURCE_DIR} -B ${WORK_DIR}/consumer
    -DCMAKE_PREFIX_PATH=${WORK_DIR}/prefix RESULT_VARIABLE rc OUTPUT_QUIET)
if(NOT rc EQUAL 0)
    message(FATAL_ERROR "find_package(lite_vrx) failed")
endif()
execute_process(COMMAND ${CMAKE_COMMAND} --build ${WORK_DIR}/consumer RESULT_VARIABLE rc
    OUTPUT_QUIET)
if(NOT rc EQUAL 0)
    message(FATAL_ERROR "consumer build failed")
endif()
file(GLOB pc ${WORK_DIR}/prefix/*/pkgconfig/lite_vrx.pc ${WORK_DIR}/prefix/*/*/pkgconfig/lite_vrx.pc)
if(NOT pc)
    message(FATAL_ERROR "lite_vrx.pc not installed")
endif()
file(READ ${pc} text)
if(NOT text MATCHES "Libs: -L\\$\\{libdir\\} -llite_vrx")
    message(FATAL_ERROR "lite_vrx.pc lacks the link line")
endif()
