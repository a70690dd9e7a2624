# What every target of the project shares, and the few shapes that targets come in.

# GCC 12's warnings that follow the flow of values through inlined library code. They mistake short strings.
set(unreliableWarnings
  -Wno-array-bounds -Wno-free-nonheap-object -Wno-maybe-uninitialized -Wno-restrict -Wno-stringop-overflow
  -Wno-stringop-overread -Wno-use-after-free)

add_library(swinv_options INTERFACE)
target_compile_options(swinv_options INTERFACE
  -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Werror)
if(SWINV_SANITIZE)
  target_compile_options(swinv_options INTERFACE -fsanitize=${SWINV_SANITIZE} -fno-omit-frame-pointer)
  target_link_options(swinv_options INTERFACE -fsanitize=${SWINV_SANITIZE})
  # GCC documents that its flow-based warnings are not reliable on instrumented code; every other build has them on.
  target_compile_options(swinv_options INTERFACE $<$<CXX_COMPILER_ID:GNU>:${unreliableWarnings}>)
  if(SWINV_SANITIZE MATCHES undefined)
    target_compile_options(swinv_options INTERFACE -fno-sanitize-recover=undefined)
  endif()
else()
  target_link_options(swinv_options INTERFACE LINKER:--no-undefined)
endif()
target_link_options(swinv_options INTERFACE LINKER:--as-needed)
link_libraries(swinv_options)

# With CMPI_INCLUDE_DIR the names <cmpi/...> lead to that system's headers, through forwarding files: a compiler's own
# folder such as /usr/include cannot be moved ahead by an -I. Their folder stands before all others, because
# provider/include, which everyone needs for other headers, holds the project's own declarations too.
if(CMPI_INCLUDE_DIR)
  foreach(header cmpidt.h cmpift.h cmpimacs.h)
    find_file(CMPI_HEADER_${header} ${header}
      PATHS ${CMPI_INCLUDE_DIR} PATH_SUFFIXES cmpi NO_DEFAULT_PATH REQUIRED)
    file(CONFIGURE OUTPUT ${CMAKE_BINARY_DIR}/cmpi-forward/cmpi/${header} @ONLY
      CONTENT "#pragma GCC system_header\n#include \"${CMPI_HEADER_${header}}\"\n")
  endforeach()
  include_directories(BEFORE ${CMAKE_BINARY_DIR}/cmpi-forward)
endif()

# swinv_optimize_whole(TARGET...): link-time optimisation, where the compiler has it, for what object managers load. Not
# in sanitized and debug builds.
include(CheckIPOSupported)
check_ipo_supported(RESULT SWINV_HAS_IPO OUTPUT SWINV_IPO_OUTPUT LANGUAGES CXX)
function(swinv_optimize_whole)
  if(SWINV_HAS_IPO AND NOT SWINV_SANITIZE AND CMAKE_BUILD_TYPE STREQUAL Release)
    set_target_properties(${ARGN} PROPERTIES INTERPROCEDURAL_OPTIMIZATION ON)
  endif()
endfunction()

# swinv_export_only(TARGET FILE): exports what the linker map FILE lists, and nothing else.
function(swinv_export_only target map)
  target_link_options(${target} PRIVATE LINKER:--version-script=${map})
  set_property(TARGET ${target} APPEND PROPERTY LINK_DEPENDS ${map})
endfunction()

# swinv_test(NAME SOURCES file... [LIBRARIES target...] [DEPENDS target...] [DEFINITIONS name=value...])
# A GoogleTest program; each of its cases is a test of its own under CTest.
#
# A process may end while the machine is looked at in the background: a thread that is there at its end is no finding.
#
# Sanitized tests take longer to optimise than they run; what they test is optimised.
if(SWINV_SANITIZE)
  set(testOptimisation -O0)
endif()
if(SWINV_SANITIZE MATCHES thread)
  set(testSanitizer ENVIRONMENT_MODIFICATION TSAN_OPTIONS=set:report_thread_leaks=0)
endif()
function(swinv_test name)
  cmake_parse_arguments(ARG "" "" "SOURCES;LIBRARIES;DEPENDS;DEFINITIONS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_LIBRARIES} GTest::gmock GTest::gtest_main)
  target_compile_definitions(${name} PRIVATE ${ARG_DEFINITIONS})
  # GCC 12 takes moves of short constant strings, such as the paths below, for copies out of bounds, or not, by their
  # length, which is the checkout's. Clang and the sanitizers watch the bounds of tests.
  target_compile_options(${name} PRIVATE
    $<$<CXX_COMPILER_ID:GNU>:${unreliableWarnings}> ${testOptimisation})
  target_precompile_headers(${name} REUSE_FROM test_headers)
  if(ARG_DEPENDS)
    add_dependencies(${name} ${ARG_DEPENDS})
  endif()
  gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST DISCOVERY_TIMEOUT 120
    PROPERTIES TIMEOUT 300 ENVIRONMENT "TZ=UTC" ${testSanitizer})
endfunction()
