# Test registration shared by every folder.
#
# Native suites build with the host compiler (sanitizers on) and run directly.
# Wine suites build in the win64 tree; that tree writes wine_tests.cmake, which the
# native tree includes, so one ctest run in build/native runs every suite.

set(BR_DOCTEST_MAIN ${BR_ROOT}/tests/doctest_main.cpp)
if(BR_WINDOWS)
  set(BR_CRASH_REPORT ${BR_ROOT}/tests/wine/common/crash_report.cpp)
  list(APPEND BR_DOCTEST_MAIN ${BR_CRASH_REPORT})
endif()

if(BR_WINDOWS)
  # doctest is header-only; expose just its folder to the cross compiler.
  set(BR_DOCTEST_INCLUDE ${CMAKE_BINARY_DIR}/third_party)
  file(MAKE_DIRECTORY ${BR_DOCTEST_INCLUDE})
  file(CREATE_LINK /usr/include/doctest ${BR_DOCTEST_INCLUDE}/doctest SYMBOLIC)
  set(BR_WINE_TEST_LIST ${CMAKE_BINARY_DIR}/wine_tests.cmake)
  file(WRITE ${BR_WINE_TEST_LIST} "# generated: Wine suites of ${CMAKE_BINARY_DIR}\n")
else()
  set(BR_DOCTEST_INCLUDE /usr/include)
endif()

# Shared by both kinds of suite: a doctest program from SOURCES and LIBS.
macro(_br_test_program name)
  cmake_parse_arguments(T "NO_MAIN;SERIAL" "" "SOURCES;LIBS" ${ARGN})
  set(srcs ${T_SOURCES})
  if(NOT T_NO_MAIN)
    list(APPEND srcs ${BR_DOCTEST_MAIN})
  endif()
  add_executable(${name} ${srcs})
  target_include_directories(${name} PRIVATE ${BR_DOCTEST_INCLUDE} ${BR_ROOT})
  target_link_libraries(${name} PRIVATE ${T_LIBS})
endmacro()

# br_add_native_test(name SOURCES ... [LIBS ...] [NO_MAIN])
function(br_add_native_test name)
  if(BR_WINDOWS)
    return()
  endif()
  _br_test_program(${name} ${ARGN})
  add_test(NAME native.${name} COMMAND ${name})
  set_tests_properties(native.${name} PROPERTIES ENVIRONMENT "BR_SOURCE_DIR=${BR_ROOT}")
endfunction()

# br_add_wine_test(name SOURCES ... [LIBS ...] [NO_MAIN] [SERIAL])
# Builds a Windows test program; in the 64-bit tree it is also listed for ctest under Wine.
function(br_add_wine_test name)
  if(NOT BR_WINDOWS)
    return()
  endif()
  _br_test_program(${name} ${ARGN})
  if(BR_RUNS_UNDER_WINE)
    file(APPEND ${BR_WINE_TEST_LIST}
      "br_wine_test(wine.${name} ${T_SERIAL} \"$<TARGET_FILE:${name}>\")\n")
  endif()
endfunction()

# br_add_script_test(name file.vbs|file.js [SERIAL]): a script run by Wine's cscript.
function(br_add_script_test name file)
  if(NOT BR_RUNS_UNDER_WINE)
    return()
  endif()
  cmake_parse_arguments(T "SERIAL" "" "" ${ARGN})
  get_filename_component(abs ${file} ABSOLUTE)
  file(APPEND ${BR_WINE_TEST_LIST} "br_wine_script_test(script.${name} ${T_SERIAL} \"${abs}\")\n")
endfunction()

# Generator expressions in the list need one final pass per configuration.
function(br_finish_wine_tests)
  if(BR_RUNS_UNDER_WINE)
    file(READ ${BR_WINE_TEST_LIST} content)
    file(GENERATE OUTPUT ${BR_WINE_TEST_LIST}.resolved CONTENT "${content}")
  endif()
endfunction()

# In the native tree: register the Wine suites of the 64-bit tree, if it was given.
if(NOT BR_WINDOWS AND BR_WIN64_DIR)
  set(BR_WINEPREFIX "${BR_WIN64_DIR}/../wineprefix" CACHE PATH "Wine prefix the suites run in")
  set(BR_WINE_ENV "WINEPREFIX=${BR_WINEPREFIX};WINEDEBUG=-all;TZ=UTC0;WINEDLLOVERRIDES=mscoree,mshtml=;BR_SOURCE_DIR=${BR_ROOT};BR_WIN64_DIR=${BR_WIN64_DIR}")
  function(br_wine_test name)
    list(GET ARGN -1 exe)
    add_test(NAME ${name} COMMAND ${BR_ROOT}/tools/wine-exec ${exe})
    set_tests_properties(${name} PROPERTIES ENVIRONMENT "${BR_WINE_ENV}" TIMEOUT 600)
    if("SERIAL" IN_LIST ARGN OR "TRUE" IN_LIST ARGN)
      set_tests_properties(${name} PROPERTIES RUN_SERIAL TRUE)
    endif()
  endfunction()
  function(br_wine_script_test name)
    list(GET ARGN -1 file)
    add_test(NAME ${name} COMMAND ${BR_ROOT}/tools/wine-exec cscript //nologo ${file})
    set_tests_properties(${name} PROPERTIES ENVIRONMENT "${BR_WINE_ENV}" TIMEOUT 300)
    if("SERIAL" IN_LIST ARGN OR "TRUE" IN_LIST ARGN)
      set_tests_properties(${name} PROPERTIES RUN_SERIAL TRUE)
    endif()
  endfunction()
  if(EXISTS ${BR_WIN64_DIR}/wine_tests.cmake.resolved)
    include(${BR_WIN64_DIR}/wine_tests.cmake.resolved)
  endif()
endif()
