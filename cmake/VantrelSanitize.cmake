# Instrumented builds. Both are off by default, so the normal build is untouched.
#
#   VANTREL_SANITIZE=ON  every target with AddressSanitizer and
#                        UndefinedBehaviorSanitizer; any report stops the run.
#   VANTREL_FUZZ=ON      (clang only) libraries instrumented for libFuzzer plus
#                        the sanitizers; the fuzz targets live in tests/fuzz.
option(VANTREL_SANITIZE "Build everything with AddressSanitizer and UndefinedBehaviorSanitizer" OFF)
option(VANTREL_FUZZ "Build the libFuzzer targets in tests/fuzz (CC=clang CXX=clang++)" OFF)

set(VANTREL_SANITIZER_FLAGS
  -fsanitize=address,undefined
  -fno-sanitize-recover=undefined
  -fno-omit-frame-pointer)

if(VANTREL_SANITIZE)
  add_compile_options(${VANTREL_SANITIZER_FLAGS})
  add_link_options(-fsanitize=address,undefined)
  # A loadable module stays mapped after dlclose. Unloading it would also unload
  # the libraries it brought (Qt's, and libgomp behind them), whose start-up
  # allocations the leak check then finds with no owner and no names; staying
  # mapped, they are reachable, and a real leak of the module keeps its stack.
  add_link_options($<$<STREQUAL:$<TARGET_PROPERTY:TYPE>,MODULE_LIBRARY>:LINKER:-z,nodelete>)
endif()

if(VANTREL_FUZZ)
  if(NOT CMAKE_CXX_COMPILER_ID STREQUAL "Clang" OR NOT CMAKE_C_COMPILER_ID STREQUAL "Clang")
    message(FATAL_ERROR "VANTREL_FUZZ needs clang: configure with CC=clang CXX=clang++")
  endif()
  # Coverage feedback for the fuzzer in every library the targets reach; the
  # fuzzer's own main is linked into the targets alone.
  add_compile_options(-fsanitize=fuzzer-no-link ${VANTREL_SANITIZER_FLAGS})
  add_link_options(-fsanitize=address,undefined)
endif()

# A libFuzzer target: vantrel_add_fuzzer(NAME SOURCES a.cpp LIBS lib1 lib2)
function(vantrel_add_fuzzer name)
  cmake_parse_arguments(F "" "" "SOURCES;LIBS" ${ARGN})
  add_executable(${name} ${F_SOURCES})
  vantrel_warnings(${name})
  vantrel_clang_layout_warnings(${name})
  target_link_libraries(${name} PRIVATE ${F_LIBS})
  target_link_options(${name} PRIVATE -fsanitize=fuzzer)
endfunction()

# The C layout of the automation values (anonymous structs in unions, as the
# binary interface has them) is an extension that clang's -Wpedantic names and
# gcc's doesn't. Added after vantrel_warnings, so the gcc build keeps them all.
function(vantrel_clang_layout_warnings target)
  target_compile_options(${target} PRIVATE -Wno-nested-anon-types -Wno-gnu-anonymous-struct)
endfunction()
