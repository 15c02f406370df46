# cmake/Exports.cmake -- export lists taken from the public headers.
#
# orvq7_exports(<target> <macro> <header>...)
#   Collects the names declared with <macro> in the headers (functions: `<macro> type name(`;
#   data: `<macro> extern type name...;`), writes <target>.symbols (one name a line, used by
#   the export check) and <target>.map (version script: exactly those names global, all
#   else local, no version node), and links <target> with the script.
function(orvq7_exports target macro)
  set(names "")
  foreach(header IN LISTS ARGN)
    set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS "${header}")
    file(STRINGS "${header}" lines REGEX "^${macro}[ ]")
    foreach(line IN LISTS lines)
      if(line MATCHES "^${macro}[ ]+extern[ ]+[^;]*[ *]([A-Za-z_][A-Za-z0-9_]*)(\\[[^]]*\\])?[ ]*;")
        list(APPEND names "${CMAKE_MATCH_1}")
      elseif(line MATCHES "^${macro}[ ]+[^(]*[ *]([A-Za-z_][A-Za-z0-9_]*)\\(")
        list(APPEND names "${CMAKE_MATCH_1}")
      endif()
    endforeach()
  endforeach()
  list(REMOVE_DUPLICATES names)
  list(SORT names)
  set(map "{\n  global:\n")
  foreach(n IN LISTS names)
    string(APPEND map "    ${n};\n")
  endforeach()
  string(APPEND map "  local:\n    *;\n};\n")
  list(JOIN names "\n" symbols)
  file(CONFIGURE OUTPUT "${CMAKE_CURRENT_BINARY_DIR}/${target}.map" CONTENT "${map}")
  file(CONFIGURE OUTPUT "${CMAKE_CURRENT_BINARY_DIR}/${target}.symbols" CONTENT "${symbols}\n")
  target_link_options(${target} PRIVATE
    "LINKER:--version-script=${CMAKE_CURRENT_BINARY_DIR}/${target}.map")
  set_property(TARGET ${target} APPEND PROPERTY LINK_DEPENDS
    "${CMAKE_CURRENT_BINARY_DIR}/${target}.map")
  set_property(TARGET ${target} PROPERTY ORVQ7_SYMBOLS
    "${CMAKE_CURRENT_BINARY_DIR}/${target}.symbols")
endfunction()
