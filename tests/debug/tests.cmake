# What a debugger shows of strings and containers.
if(NOT WIN32)
  add_executable(debug_shown ${CMAKE_CURRENT_LIST_DIR}/shown.cpp)
  target_link_libraries(debug_shown PRIVATE qxcore11e qxcore_options)
  target_compile_options(debug_shown PRIVATE -O0 -g)
  find_package(Python3 REQUIRED COMPONENTS Interpreter)
  add_test(NAME debug.printers COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/printers_test.py
    ${PROJECT_SOURCE_DIR}/tools/debug/qxcore_printers.py $<TARGET_FILE:debug_shown>)
endif()
