# Included by the test suite: each fuzz target built as a plain program that
# replays its seed corpus once, so every test run goes through the corpora
# (under the sanitizers in the sanitizer build) without fuzzing.
include(${CMAKE_CURRENT_LIST_DIR}/targets.cmake)
foreach(target IN LISTS CARNET_FUZZ_TARGETS)
  add_executable(replay_${target} ${CMAKE_CURRENT_LIST_DIR}/${target}.cpp ${CMAKE_CURRENT_LIST_DIR}/replay_main.cpp)
  target_link_libraries(replay_${target} PRIVATE carnet::carnet)
  target_include_directories(replay_${target} PRIVATE ${PROJECT_SOURCE_DIR}/src ${CMAKE_CURRENT_LIST_DIR})
  target_compile_options(replay_${target} PRIVATE ${CARNET_WARNINGS})
  add_test(NAME fuzz.${target}.replay COMMAND replay_${target} ${CMAKE_CURRENT_LIST_DIR}/corpus/${target})
endforeach()
