# Active code pages other than 1252, which a process keeps once it has asked for them.
if(NOT WIN32)
  foreach(page 932 65001)
    add_test(NAME string.page.${page} COMMAND test_string --gtest_filter=OtherPages.*)
    set_tests_properties(string.page.${page} PROPERTIES ENVIRONMENT QXCORE_ACP=${page})
  endforeach()
  # OEM pages of two bytes, and with escapes that make texts longer still.
  foreach(page 932 50220)
    add_test(NAME string.oem.${page} COMMAND test_string --gtest_filter=OemConversion.LongTexts*)
    set_tests_properties(string.oem.${page} PROPERTIES ENVIRONMENT QXCORE_OEMCP=${page})
  endforeach()
endif()
