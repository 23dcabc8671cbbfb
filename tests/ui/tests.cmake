target_sources(test_ui PRIVATE ${CMAKE_CURRENT_LIST_DIR}/time_limit.cpp)

# A handler of a wrong shape does not compile: each case is compiled on its own.
find_package(Python3 REQUIRED COMPONENTS Interpreter)
add_test(NAME ui.compile_fail COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/compile_fail.py
  ${PROJECT_SOURCE_DIR} ${CMAKE_CURRENT_LIST_DIR}/compile_fail.cpp ${CMAKE_CXX_COMPILER})

# The guide's program, for its picture.
add_custom_command(OUTPUT ${CMAKE_CURRENT_BINARY_DIR}/ui/windows_guide.inc
  COMMAND ${CMAKE_COMMAND} -E make_directory ${CMAKE_CURRENT_BINARY_DIR}/ui
  COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_SOURCE_DIR}/docs/make_program.py ${PROJECT_SOURCE_DIR}/docs/windows.md
    ${CMAKE_CURRENT_BINARY_DIR}/ui/windows_guide.inc
  DEPENDS ${PROJECT_SOURCE_DIR}/docs/windows.md ${CMAKE_CURRENT_SOURCE_DIR}/docs/make_program.py ${CMAKE_CURRENT_SOURCE_DIR}/docs/guide_blocks.py)
target_sources(test_ui PRIVATE ${CMAKE_CURRENT_BINARY_DIR}/ui/windows_guide.inc)
target_include_directories(test_ui PRIVATE ${CMAKE_CURRENT_BINARY_DIR}/ui)
