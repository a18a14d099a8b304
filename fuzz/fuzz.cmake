# Each entry is one file. With clang and VEXEL_LIBFUZZER it becomes a fuzzer; in every build it also
# becomes a program that replays inputs, which ./check runs over the kept corpus.
option(VEXEL_LIBFUZZER "Link the fuzz entries with libFuzzer (clang)" OFF)

foreach(entry movie shape image sound actions)
  if(EXISTS ${CMAKE_SOURCE_DIR}/fuzz/${entry}.cpp)
    add_executable(replay_${entry} fuzz/${entry}.cpp fuzz/replay_main.cpp)
    target_link_libraries(replay_${entry} PRIVATE vexel_headless vexel_support)
    if(VEXEL_LIBFUZZER)
      add_executable(fuzz_${entry} fuzz/${entry}.cpp)
      target_link_options(fuzz_${entry} PRIVATE -fsanitize=fuzzer)
      target_link_libraries(fuzz_${entry} PRIVATE vexel_headless vexel_support)
    endif()
  endif()
endforeach()
if(VEXEL_LIBFUZZER)
  # Coverage feedback comes from every library.
  target_compile_options(vexel_flags INTERFACE -fsanitize=fuzzer-no-link)
endif()
