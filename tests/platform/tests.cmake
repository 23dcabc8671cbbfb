# The C library's wide characters are not the library's: none of its wide functions may be called.
if(NOT WIN32)
  add_test(NAME platform.no_wide_runtime COMMAND sh -c
    "! nm -D --undefined-only '$<TARGET_FILE:qxcore11e>' | grep -E ' (wcs|wmem|wprintf|v?[fs]wprintf|isw|tow[lu]|fputw|fgetw|putw|getw|btowc|wctob|mbs|mbr|wcr)|basic_stringIw'")
endif()

# File times in zones that are not UTC.
foreach(zone America/New_York Asia/Kathmandu Australia/Sydney)
  add_test(NAME platform.zone.${zone} COMMAND test_platform --gtest_filter=FileTimes.*)
  set_tests_properties(platform.zone.${zone} PROPERTIES ENVIRONMENT TZ=${zone})
endforeach()

# Each in a process of its own.
if(NOT WIN32)
  foreach(case RegistryProcesses.EveryAcknowledgedWriteIsThere RegistryProcesses.ReadersSeeWritesAtOnce
      RegistryProcesses.ReadersOfAForeignDatabase ProfileProcesses.EveryAcknowledgedWriteIsThere)
    add_test(NAME platform.${case} COMMAND test_platform --gtest_also_run_disabled_tests --gtest_filter=DISABLED_${case})
  endforeach()
endif()
