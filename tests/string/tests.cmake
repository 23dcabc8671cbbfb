# Active code pages other than 1252, which a process keeps once it has asked for them.
if(NOT WIN32)
  foreach(page 932 65001)
    add_test(NAME string.page.${page} COMMAND test_string --gtest_filter=OtherPages.*)
    set_tests_properties(string.page.${page} PROPERTIES ENVIRONMENT QXCORE_ACP=${page})
  endforeach()
endif()
