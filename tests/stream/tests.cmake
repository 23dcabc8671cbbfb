# The tests of archives compress what the library decompresses.
target_link_libraries(test_stream PRIVATE ZLIB::ZLIB)

# The readers once more by the way that processors without AVX-512 take.
add_test(NAME stream.base_processor COMMAND test_stream
  --gtest_filter=Selection.*:Reading.*:Losses.*:CodePages.*:ProvisionalChoice.*:Positions.*:LongInputs.*:FullUnicode.*:RoundTrips.*)
set_tests_properties(stream.base_processor PROPERTIES ENVIRONMENT QXCORE_PROCESSOR=base)
