# cmake -DHOST_RUNNER=<native runner> -DHEXAGON_RUNNER=<hexagon runner> -DEMULATOR=<qemu-hexagon>
#       -P compare_hashes.cmake
# Runs the hash runner under the emulator and natively, once per x86-64 level of the host
# build (CORVANE_HOST_ISA), and fails on any difference. A level that the CPU lacks runs
# the best it has (the host library logs that), so every run is still compared.
if(NOT EXISTS "${HOST_RUNNER}")
  message(FATAL_ERROR "no host hash runner at ${HOST_RUNNER}: build the host tree first "
                      "(cmake --preset host && cmake --build build/host --target hash_runner), "
                      "or point CORVANE_HOST_BUILD_DIR at a host build")
endif()
execute_process(COMMAND ${EMULATOR} ${HEXAGON_RUNNER} OUTPUT_VARIABLE hexagon RESULT_VARIABLE hexagon_rc)
message(STATUS "hexagon:\n${hexagon}")
if(NOT hexagon_rc EQUAL 0)
  message(FATAL_ERROR "the hexagon runner failed: ${hexagon_rc}")
endif()
foreach(isa sse2 avx2 avx512)
  set(ENV{CORVANE_HOST_ISA} ${isa})
  execute_process(COMMAND ${HOST_RUNNER} OUTPUT_VARIABLE host RESULT_VARIABLE host_rc)
  if(NOT host_rc EQUAL 0)
    message(FATAL_ERROR "the host runner failed at ${isa}: ${host_rc}\nhost:\n${host}")
  endif()
  if(NOT host STREQUAL hexagon)
    string(REPLACE "\n" ";" host_lines "${host}")
    string(REPLACE "\n" ";" hexagon_lines "${hexagon}")
    set(only_host ${host_lines})
    list(REMOVE_ITEM only_host ${hexagon_lines})
    set(only_hexagon ${hexagon_lines})
    list(REMOVE_ITEM only_hexagon ${host_lines})
    string(REPLACE ";" "\n  " only_host "${only_host}")
    string(REPLACE ";" "\n  " only_hexagon "${only_hexagon}")
    message(FATAL_ERROR "hashes differ at ${isa}\nhost only:\n  ${only_host}\nhexagon only:\n  ${only_hexagon}")
  endif()
  message(STATUS "host (${isa}) and hexagon hashes are identical")
endforeach()
