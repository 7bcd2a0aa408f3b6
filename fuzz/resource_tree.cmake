# Fuzz targets of the resource-tree loader: arbitrary documents, load-write-load equality,
# descriptions in files that include others, and the comparison of two texts.
wbt_add_fuzzer(fuzz_restree_parse SOURCES ${CMAKE_CURRENT_LIST_DIR}/resource_tree/ParseTextFuzz.cpp
               DEPS wbt::resource_tree)
wbt_add_fuzzer(fuzz_restree_roundtrip
               SOURCES ${CMAKE_CURRENT_LIST_DIR}/resource_tree/RoundTripFuzz.cpp
               DEPS wbt::resource_tree)
wbt_add_fuzzer(fuzz_restree_file SOURCES ${CMAKE_CURRENT_LIST_DIR}/resource_tree/ParseFileFuzz.cpp
               DEPS wbt::resource_tree)
wbt_add_fuzzer(fuzz_compare_texts
               SOURCES ${CMAKE_CURRENT_LIST_DIR}/resource_tree/CompareTextsFuzz.cpp
               DEPS wbt::resource_tree)
