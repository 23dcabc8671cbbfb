# The script of the project itself, among stand-ins for what installs, builds and tests.
if(NOT WIN32)
  find_package(Python3 REQUIRED COMPONENTS Interpreter)
  add_test(NAME dev.script COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/dev_test.py ${PROJECT_SOURCE_DIR}/dev)
endif()
