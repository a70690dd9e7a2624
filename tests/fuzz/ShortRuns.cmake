# A short run of each fuzzer: always the same inputs, so that what it finds is found again. The fuzzers are built by a
# preset of their own, when a test first needs them.
file(GLOB seeds RELATIVE ${CMAKE_CURRENT_LIST_DIR}/seeds CONFIGURE_DEPENDS ${CMAKE_CURRENT_LIST_DIR}/seeds/*.seeds)
set(fuzzBuild ${CMAKE_SOURCE_DIR}/build/fuzz)

add_test(NAME fuzz.build COMMAND ${CMAKE_SOURCE_DIR}/scripts/build fuzz fuzzers)
set_tests_properties(fuzz.build PROPERTIES FIXTURES_SETUP fuzzers LABELS fuzz TIMEOUT 1200 PROCESSORS 2)
foreach(seed ${seeds})
  string(REPLACE .seeds "" name ${seed})
  add_test(NAME fuzz.${name} COMMAND ${fuzzBuild}/bin/fuzz_${name}
    -runs=20000 -seed=1 -timeout=10 -rss_limit_mb=2048 -artifact_prefix=${fuzzBuild}/found-${name}-
    ${fuzzBuild}/seeds/${name})
  set_tests_properties(fuzz.${name} PROPERTIES FIXTURES_REQUIRED fuzzers LABELS fuzz TIMEOUT 300)
endforeach()
