# Fuzz targets of the host layer: host strings and string arrays, built and resized from arbitrary
# bytes inside a host process (the embedded host runtime is linked in and exported).
wbt_add_fuzzer(fuzz_host_strings SOURCES ${CMAKE_CURRENT_LIST_DIR}/host/HostStringFuzz.cpp
               DEPS host)
wbt_link_host_runtime(fuzz_host_strings)
