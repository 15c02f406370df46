# cmake/Install.cmake -- what `cmake --install` puts in place under the prefix:
#   lib/libOrvQ7Maths.so.1.0.0 (SONAME libOrvQ7Maths.so.1) and the three platform libraries,
#       each found by the others through RUNPATH $ORIGIN; no symbol versions, so a host's own
#       platform libraries of the same SONAME load in their place;
#   include/OrvQ7Maths/<dir>/<dir>_api.h and include/OrvQ7Maths/companions/<lib>/<lib>_api.h,
#       at their paths in the source tree, so that their own #include lines
#       ("frame/frame_api.h") resolve with -I<prefix>/include/OrvQ7Maths;
#   include/OrvQ7Maths/OrvQ7Maths.h, the umbrella header (#include <OrvQ7Maths/OrvQ7Maths.h>
#       with -I<prefix>/include, or "OrvQ7Maths.h" with -I<prefix>/include/OrvQ7Maths);
#   include/OrvQ7Maths/fortran/ (Fortran module, from fortran/CMakeLists.txt);
#   lib/cmake/OrvQ7Maths/ (find_package(OrvQ7Maths CONFIG): targets OrvQ7Maths::OrvQ7Maths,
#       ::OrvQ7System, ::Q7SysCOMD, ::OrvMathematics, and ::Fortran when the module is there);
#   lib/pkgconfig/orvq7maths.pc; share/doc/OrvQ7Maths/ (LICENSE, CHANGELOG.md, README.md,
#       and the manual's html/ when the docs target was built);
#   bin/orvq7, the demonstration program (RUNPATH $ORIGIN/../lib).
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

set(ORVQ7_INSTALL_INCLUDEDIR "${CMAKE_INSTALL_INCLUDEDIR}/OrvQ7Maths")
set(ORVQ7_INSTALL_CMAKEDIR "${CMAKE_INSTALL_LIBDIR}/cmake/OrvQ7Maths")
set(ORVQ7_INSTALL_FORTRANDIR "${ORVQ7_INSTALL_INCLUDEDIR}/fortran")
set(ORVQ7_INSTALL_DOCDIR "${CMAKE_INSTALL_DATADIR}/doc/OrvQ7Maths")
set(ORVQ7_LIBRARIES OrvQ7Maths OrvQ7System Q7SysCOMD OrvMathematics)

# ---- The umbrella header: every public header, generated from the list ----
set(umbrella "/* OrvQ7Maths.h -- every public header of OrvQ7Maths and of its platform libraries\n")
string(APPEND umbrella " * (generated at configure time; compiles as C11 and as C++). */\n")
string(APPEND umbrella "#ifndef ORVQ7MATHS_ORVQ7MATHS_H\n#define ORVQ7MATHS_ORVQ7MATHS_H\n\n")
foreach(header IN LISTS ORVQ7_ALL_HEADERS)
  string(APPEND umbrella "#include \"${header}\"\n")
endforeach()
string(APPEND umbrella "\n#endif /* ORVQ7MATHS_ORVQ7MATHS_H */\n")
set(ORVQ7_UMBRELLA "${CMAKE_BINARY_DIR}/include/OrvQ7Maths/OrvQ7Maths.h")
file(CONFIGURE OUTPUT "${ORVQ7_UMBRELLA}" CONTENT "${umbrella}" @ONLY)

# ---- Libraries ----
foreach(lib IN LISTS ORVQ7_LIBRARIES)
  target_include_directories(${lib} INTERFACE
    $<BUILD_INTERFACE:${CMAKE_BINARY_DIR}/include>
    $<INSTALL_INTERFACE:${ORVQ7_INSTALL_INCLUDEDIR}>
    $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>)
  set_target_properties(${lib} PROPERTIES INSTALL_RPATH "$ORIGIN")
endforeach()
install(TARGETS ${ORVQ7_LIBRARIES} EXPORT OrvQ7MathsTargets
        LIBRARY DESTINATION "${CMAKE_INSTALL_LIBDIR}")

# ---- Headers, at their source paths ----
foreach(header IN LISTS ORVQ7_ALL_HEADERS)
  get_filename_component(subdir "${header}" DIRECTORY)
  install(FILES "${CMAKE_SOURCE_DIR}/${header}" DESTINATION "${ORVQ7_INSTALL_INCLUDEDIR}/${subdir}")
endforeach()
install(FILES "${ORVQ7_UMBRELLA}" DESTINATION "${ORVQ7_INSTALL_INCLUDEDIR}")

# ---- CMake package ----
install(EXPORT OrvQ7MathsTargets NAMESPACE OrvQ7Maths:: FILE OrvQ7MathsTargets.cmake
        DESTINATION "${ORVQ7_INSTALL_CMAKEDIR}")
configure_package_config_file("${CMAKE_SOURCE_DIR}/cmake/OrvQ7MathsConfig.cmake.in"
  "${CMAKE_BINARY_DIR}/OrvQ7MathsConfig.cmake"
  INSTALL_DESTINATION "${ORVQ7_INSTALL_CMAKEDIR}"
  PATH_VARS ORVQ7_INSTALL_INCLUDEDIR ORVQ7_INSTALL_FORTRANDIR ORVQ7_INSTALL_DOCDIR)
write_basic_package_version_file("${CMAKE_BINARY_DIR}/OrvQ7MathsConfigVersion.cmake"
  VERSION "${PROJECT_VERSION}" COMPATIBILITY SameMajorVersion)
install(FILES "${CMAKE_BINARY_DIR}/OrvQ7MathsConfig.cmake"
              "${CMAKE_BINARY_DIR}/OrvQ7MathsConfigVersion.cmake"
        DESTINATION "${ORVQ7_INSTALL_CMAKEDIR}")

# ---- pkg-config: paths relative to the .pc file, so the installed tree can move ----
set(pcdir "${CMAKE_INSTALL_LIBDIR}/pkgconfig")
if(IS_ABSOLUTE "${pcdir}")
  set(ORVQ7_PC_PREFIX "${CMAKE_INSTALL_PREFIX}")
else()
  string(REGEX REPLACE "[^/]+" ".." up "${pcdir}")
  set(ORVQ7_PC_PREFIX "\${pcfiledir}/${up}")
endif()
configure_file("${CMAKE_SOURCE_DIR}/cmake/orvq7maths.pc.in" "${CMAKE_BINARY_DIR}/orvq7maths.pc"
               @ONLY)
install(FILES "${CMAKE_BINARY_DIR}/orvq7maths.pc" DESTINATION "${pcdir}")

# ---- Licence, changelog, readme ----
install(FILES "${CMAKE_SOURCE_DIR}/LICENSE" "${CMAKE_SOURCE_DIR}/CHANGELOG.md"
              "${CMAKE_SOURCE_DIR}/README.md"
        DESTINATION "${ORVQ7_INSTALL_DOCDIR}")

# ---- The demonstration program. Its target is made later (tools/), so the rule is added when
#      the top directory has been read. ----
function(orvq7_install_tool)
  if(TARGET orvq7)
    install(TARGETS orvq7 RUNTIME DESTINATION "${CMAKE_INSTALL_BINDIR}")
  endif()
endfunction()
cmake_language(DEFER DIRECTORY "${CMAKE_SOURCE_DIR}" CALL orvq7_install_tool)
