# The calendar against another reading of the same zone: daylight saving on both halves of the globe, half
# an hour of it, none, quarters of an hour, a history of many changes.
set(zones UTC America/New_York Europe/Berlin Asia/Kathmandu Australia/Sydney)
if(NOT WIN32)
  list(APPEND zones Australia/Lord_Howe America/Sao_Paulo Africa/Monrovia)
endif()
foreach(zone ${zones})
  add_test(NAME system.zone.${zone} COMMAND test_system --gtest_filter=Zones.*:Times.*:OleDates.*)
  set_tests_properties(system.zone.${zone} PROPERTIES ENVIRONMENT TZ=${zone})
endforeach()
if(NOT WIN32)
  target_link_libraries(test_system PRIVATE ICU::uc ICU::i18n SQLite::SQLite3)
endif()
