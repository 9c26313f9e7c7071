# Helpers that declare every target of the repository the same way.

set(NORV_WARNINGS -Wall -Wextra -Werror)

# norv_add_library(NAME <name> SOURCES <src...> [DEPS <targets...>])
# A shared library with public headers in include/ and private ones in src/.
function(norv_add_library)
  cmake_parse_arguments(A "" "NAME" "SOURCES;DEPS;PRIVATE_DEPS" ${ARGN})
  add_library(${A_NAME} SHARED ${A_SOURCES})
  target_include_directories(${A_NAME}
    PUBLIC $<BUILD_INTERFACE:${CMAKE_CURRENT_SOURCE_DIR}/include> $<INSTALL_INTERFACE:include>
    PRIVATE ${CMAKE_CURRENT_SOURCE_DIR}/src)
  target_compile_options(${A_NAME} PRIVATE ${NORV_WARNINGS})
  target_link_libraries(${A_NAME} PUBLIC ${A_DEPS} Threads::Threads PRIVATE ${A_PRIVATE_DEPS})
endfunction()

# norv_add_test(NAME <name> SOURCES <src...> [DEPS <targets...>] [LABELS <labels...>])
# One GoogleTest binary; each test case becomes one CTest test.
function(norv_add_test)
  if(NOT NORV_BUILD_TESTS)
    return()
  endif()
  cmake_parse_arguments(A "" "NAME" "SOURCES;DEPS;LABELS" ${ARGN})
  add_executable(${A_NAME} ${A_SOURCES})
  target_compile_options(${A_NAME} PRIVATE ${NORV_WARNINGS})
  target_link_libraries(${A_NAME} PRIVATE ${A_DEPS} GTest::gtest GTest::gmock GTest::gtest_main)
  set(labels unit ${A_LABELS})
  gtest_discover_tests(${A_NAME} DISCOVERY_TIMEOUT 120 PROPERTIES LABELS "${labels}")
endfunction()

# norv_add_bench(NAME <name> SOURCES <src...> [DEPS <targets...>])
function(norv_add_bench)
  if(NOT NORV_BUILD_BENCH)
    return()
  endif()
  cmake_parse_arguments(A "" "NAME" "SOURCES;DEPS" ${ARGN})
  add_executable(${A_NAME} ${A_SOURCES})
  target_compile_options(${A_NAME} PRIVATE ${NORV_WARNINGS})
  target_link_libraries(${A_NAME} PRIVATE ${A_DEPS} benchmark::benchmark)
endfunction()
