# qelo_resource_package(NAME LANGUAGES...): compiles resources/<language>.txt into an ICU
# data package and that into NAME_dat.c of the current build folder, which defines NAME_dat.
# The texts are linked into the library, so no file is looked up at run time.

find_program(QELO_GENRB genrb REQUIRED)
find_program(QELO_ICUPKG icupkg PATHS /usr/sbin REQUIRED)
find_program(QELO_GENCCODE genccode PATHS /usr/sbin REQUIRED)

function(qelo_resource_package name)
  set(dir ${CMAKE_CURRENT_BINARY_DIR})
  set(bundles)
  set(list "")
  foreach(language ${ARGN})
    set(source ${CMAKE_CURRENT_SOURCE_DIR}/resources/${language}.txt)
    add_custom_command(OUTPUT ${dir}/${language}.res
      COMMAND ${QELO_GENRB} --quiet --encoding UTF-8 --destdir ${dir} ${source}
      DEPENDS ${source}
      VERBATIM)
    list(APPEND bundles ${dir}/${language}.res)
    string(APPEND list "${language}.res\n")
  endforeach()
  file(CONFIGURE OUTPUT ${dir}/${name}.lst CONTENT "${list}" @ONLY)

  add_custom_command(OUTPUT ${dir}/${name}_dat.c
    COMMAND ${QELO_ICUPKG} --sourcedir ${dir} --add ${dir}/${name}.lst new ${dir}/${name}.dat
    COMMAND ${QELO_GENCCODE} --quiet --destdir ${dir} ${dir}/${name}.dat
    DEPENDS ${bundles} ${dir}/${name}.lst
    VERBATIM)
endfunction()
