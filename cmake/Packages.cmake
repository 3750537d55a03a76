# Debian packages, a component each: configured by the preset `package`, made by `cpack -G DEB`, tried by scripts/packages.
set(CPACK_PACKAGE_NAME zorlyra)
set(CPACK_PACKAGE_VENDOR "ZORLyra")
set(CPACK_PACKAGE_CONTACT "ZORLyra developers <developers@zorlyra.invalid>")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_VERBATIM_VARIABLES ON)
set(CPACK_STRIP_FILES ON)
set(CPACK_COMPONENTS_ALL libraries development command)
if(ZOR_WITH_PYTHON)
  list(APPEND CPACK_COMPONENTS_ALL python)
endif()

set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_PACKAGE_SOURCE zorlyra)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${PROJECT_BINARY_DIR}/lib)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS_POLICY "=")
# Both have libraries in the folder of the system's libraries.
foreach(component LIBRARIES COMMAND)
  set(CPACK_DEBIAN_${component}_PACKAGE_CONTROL_EXTRA ${PROJECT_SOURCE_DIR}/packaging/debian/triggers)
endforeach()
set(thisVersion "${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE}")

# zor_describe_package(component package section summary description [dependency…])
function(zor_describe_package inComponent inPackage inSection inSummary inDescription)
  string(TOUPPER ${inComponent} component)
  string(REPLACE ";" ", " dependencies "${ARGN}")
  foreach(pair "PACKAGE_NAME|${inPackage}" "PACKAGE_SECTION|${inSection}" "PACKAGE_DEPENDS|${dependencies}"
      "DESCRIPTION|${inSummary}\n${inDescription}")
    string(REGEX MATCH "^[A-Z_]+" name "${pair}")
    string(REGEX REPLACE "^[A-Z_]+[|]" "" value "${pair}")
    set(CPACK_DEBIAN_${component}_${name} "${value}" PARENT_SCOPE)
  endforeach()
  set(CPACK_COMPONENT_${component}_DESCRIPTION "${inSummary}\n${inDescription}" PARENT_SCOPE)
endfunction()

set(about "ZORLyra reads, merges, writes and publishes the interferences, contacts and
clearance violations that clash analyses find between the products of a 3D
assembly.
.
")
zor_describe_package(libraries libzorlyra${PROJECT_VERSION_MAJOR} libs "XML results of clash analyses - shared libraries"
  "${about}This package holds the shared libraries and their resources.")
zor_describe_package(development libzorlyra-dev libdevel "XML results of clash analyses - development files"
  "${about}This package holds the headers, and the files by which CMake and pkg-config\nfind the libraries."
  "libzorlyra${PROJECT_VERSION_MAJOR} (= ${thisVersion})")
zor_describe_package(command zorlyra utils "XML results of clash analyses - command lyra"
  "${about}This package holds the command lyra, and the plugins that read CAD models, draw\npictures, make pages and \
exchange results with other tools."
  "libzorlyra${PROJECT_VERSION_MAJOR} (= ${thisVersion})")
zor_describe_package(python python3-zorlyra python "XML results of clash analyses - Python module"
  "${about}This package holds the module zorlyra for Python 3."
  "libzorlyra${PROJECT_VERSION_MAJOR} (= ${thisVersion})" "zorlyra (= ${thisVersion})"
  "python3 (>= ${Python_VERSION_MAJOR}.${Python_VERSION_MINOR})"
  "python3 (<< ${Python_VERSION_MAJOR}.@nextMinor@)")
if(ZOR_WITH_PYTHON)
  math(EXPR nextMinor "${Python_VERSION_MINOR} + 1")
  string(REPLACE "@nextMinor@" "${nextMinor}" CPACK_DEBIAN_PYTHON_PACKAGE_DEPENDS "${CPACK_DEBIAN_PYTHON_PACKAGE_DEPENDS}")
endif()

# Copyright, change logs and compressed papers, which a prefix that is installed into by hand does without.
set(CPACK_PRE_BUILD_SCRIPTS ${PROJECT_SOURCE_DIR}/packaging/debian/AddPapers.cmake)
set(CPACK_ZOR_SOURCE_DIR ${PROJECT_SOURCE_DIR})
include(CPack)
