# Fuzz targets of the embedded host's own readers: project files, answers, program files,
# attribute sets and the item lists of `project add-items`. Each is a host process (the runtime
# is linked in, as wbhost carries it).
if(TARGET wbhost_core)
  set(wbhost_fuzzers fuzz_project_file=ProjectFileFuzz fuzz_answers=AnswersFuzz
                     fuzz_program_file=ProgramFileFuzz fuzz_attribute_set=AttributeSetFuzz
                     fuzz_item_list=ItemListFuzz)
  foreach(entry IN LISTS wbhost_fuzzers)
    string(REPLACE "=" ";" entry ${entry})
    list(GET entry 0 name)
    list(GET entry 1 source)
    wbt_add_fuzzer(${name} SOURCES ${CMAKE_CURRENT_LIST_DIR}/wbhost/${source}.cpp DEPS wbhost_core)
    wbt_link_host_runtime(${name})
  endforeach()
endif()
