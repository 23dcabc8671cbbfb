target_sources(test_layout PRIVATE ${CMAKE_CURRENT_LIST_DIR}/pane_view.cpp
  ${CMAKE_CURRENT_LIST_DIR}/../ui/time_limit.cpp)

# Splitters and tab windows have scroll bars, which the portable layer has with its controls.
if(NOT WIN32 AND NOT EXISTS ${PROJECT_SOURCE_DIR}/qxcore/platform/posix/controls)
  get_target_property(layout_tests test_layout SOURCES)
  list(FILTER layout_tests EXCLUDE REGEX "(splitter|tab_window|tab_beam)_test")
  set_target_properties(test_layout PROPERTIES SOURCES "${layout_tests}")
endif()
