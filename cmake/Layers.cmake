# The layers, lowest first: each entry is "<library>=<folder>". A library links only libraries of
# earlier entries, and a file includes headers only of its own entry or earlier ones. A file
# belongs to the entry with the longest folder that contains it (src/host/binding before
# src/host). Shared by the configure step and by the layering test.
set(WBT_LAYERS
    kern=src/kern
    com=src/com
    hostrt=src/host/binding
    host_errors=src/host/errors
    host=src/host
    resource_tree=src/resource_tree
    attribute_bag=src/attribute_bag
    framework=src/framework
    items=src/items
    provider=src/provider
    wbtangio=src/exports
    wbhost_runtime=wbhost/runtime
    wbhost_core=wbhost
    wbhost=wbhost/main.cpp)

# wbt_write_layer_links(FILE): writes "<library> <dependency>" for every library of the table
# that this build defines, so that the layering test can check the links without a build.
function(wbt_write_layer_links file)
  set(lines "")
  foreach(entry IN LISTS WBT_LAYERS)
    string(REGEX REPLACE "=.*" "" lib "${entry}")
    if(NOT TARGET ${lib})
      continue()
    endif()
    set(all_deps "")
    foreach(property LINK_LIBRARIES INTERFACE_LINK_LIBRARIES)
      get_target_property(deps ${lib} ${property})
      if(deps)
        list(APPEND all_deps ${deps})
      endif()
    endforeach()
    list(REMOVE_DUPLICATES all_deps)
    foreach(dep IN LISTS all_deps)
      # wbt::x and $<TARGET_NAME_IF_EXISTS:x> name the library x; $<LINK_LIBRARY:...,x> too.
      string(REGEX REPLACE "^\\$<[A-Z_]+:([^,>]*,)?([^>]+)>$" "\\2" dep "${dep}")
      string(REGEX REPLACE "^wbt::" "" dep "${dep}")
      string(APPEND lines "${lib} ${dep}\n")
    endforeach()
  endforeach()
  file(WRITE ${file} "${lines}")
endfunction()
