# Fuzz targets of the foundation library.
wbt_add_fuzzer(fuzz_utf8 SOURCES ${CMAKE_CURRENT_LIST_DIR}/kern/Utf8Fuzz.cpp DEPS wbt::kern)
wbt_add_fuzzer(fuzz_integer SOURCES ${CMAKE_CURRENT_LIST_DIR}/kern/IntegerFuzz.cpp DEPS wbt::kern)
wbt_add_fuzzer(fuzz_guid SOURCES ${CMAKE_CURRENT_LIST_DIR}/kern/GuidFuzz.cpp DEPS wbt::kern)
wbt_add_fuzzer(fuzz_code_page SOURCES ${CMAKE_CURRENT_LIST_DIR}/kern/CodePageFuzz.cpp
               DEPS wbt::kern)
