# qelo_platform_exports(TARGET): links TARGET with the version script exports.map of the
# current folder. Hidden visibility alone leaves the weak symbols of standard library
# templates in the dynamic symbol table.
function(qelo_platform_exports target)
  set(map ${CMAKE_CURRENT_SOURCE_DIR}/exports.map)
  target_link_options(${target} PRIVATE LINKER:--version-script=${map})
  set_property(TARGET ${target} APPEND PROPERTY LINK_DEPENDS ${map})
endfunction()
