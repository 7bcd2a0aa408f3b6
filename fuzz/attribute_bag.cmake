# Fuzz targets of the attribute bag: its XML reader and the cluster-XML reader.
wbt_add_fuzzer(fuzz_attr_bag_xml SOURCES ${CMAKE_CURRENT_LIST_DIR}/attribute_bag/AttrBagXmlFuzz.cpp
               DEPS wbt::attribute_bag)
wbt_add_fuzzer(fuzz_attr_cluster SOURCES ${CMAKE_CURRENT_LIST_DIR}/attribute_bag/AttrClusterFuzz.cpp
               DEPS wbt::attribute_bag)
