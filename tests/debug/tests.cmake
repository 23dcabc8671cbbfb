# What a debugger shows of strings and containers.
find_package(Python3 REQUIRED COMPONENTS Interpreter)
set(natvis_file ${PROJECT_SOURCE_DIR}/tools/debug/qxcore11e.natvis)
set(natvis_views ${PROJECT_BINARY_DIR}/natvis/natvis_views.h)
file(MAKE_DIRECTORY ${PROJECT_BINARY_DIR}/natvis)
add_custom_command(OUTPUT ${natvis_views}
  COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/natvis_views.py ${natvis_file} ${natvis_views}
  DEPENDS ${CMAKE_CURRENT_LIST_DIR}/natvis_views.py ${natvis_file} VERBATIM)
target_sources(test_debug PRIVATE ${natvis_views})
target_include_directories(test_debug PRIVATE ${PROJECT_BINARY_DIR}/natvis)
target_compile_options(test_debug PRIVATE -fno-access-control)

if(NOT WIN32)
  add_executable(debug_shown ${CMAKE_CURRENT_LIST_DIR}/shown.cpp)
  target_link_libraries(debug_shown PRIVATE qxcore11e qxcore_options)
  target_compile_options(debug_shown PRIVATE -O0 -g)
  add_test(NAME debug.printers COMMAND ${Python3_EXECUTABLE} ${CMAKE_CURRENT_LIST_DIR}/printers_test.py
    ${PROJECT_SOURCE_DIR}/tools/debug/qxcore_printers.py $<TARGET_FILE:debug_shown>)
endif()
