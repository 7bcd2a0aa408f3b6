# Fuzz targets of the resource-tree loader: arbitrary documents, and load-write-load equality.
wbt_add_fuzzer(fuzz_restree_parse SOURCES ${CMAKE_CURRENT_LIST_DIR}/resource_tree/ParseTextFuzz.cpp
               DEPS wbt::resource_tree)
wbt_add_fuzzer(fuzz_restree_roundtrip
               SOURCES ${CMAKE_CURRENT_LIST_DIR}/resource_tree/RoundTripFuzz.cpp
               DEPS wbt::resource_tree)
