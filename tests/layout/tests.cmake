target_sources(test_layout PRIVATE ${CMAKE_CURRENT_LIST_DIR}/pane_view.cpp
  ${CMAKE_CURRENT_LIST_DIR}/../ui/time_limit.cpp)

# What programs of the system see of the bars.
if(WIN32)
  target_sources(test_layout PRIVATE ${CMAKE_CURRENT_LIST_DIR}/oleacc_windows.cpp)
  target_link_libraries(test_layout PRIVATE oleacc oleaut32)
endif()

# What draws the pictures of the guides; ./dev pictures runs it.
add_executable(bar_pictures EXCLUDE_FROM_ALL ${CMAKE_CURRENT_LIST_DIR}/bar_pictures.cpp)
target_link_libraries(bar_pictures PRIVATE qxcore11e qxcore_options)
set_target_properties(bar_pictures PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR})
