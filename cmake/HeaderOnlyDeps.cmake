# Boost and nlohmann_json for a cross build: both are header-only, so the build machine's
# headers serve any target. Only their own folders are put on the include path (through
# links in the build tree), never the build machine's /usr/include with its C library.
set(NEBU_DEPS_INCLUDE ${CMAKE_BINARY_DIR}/deps/include)
file(MAKE_DIRECTORY ${NEBU_DEPS_INCLUDE})
foreach(dep boost nlohmann)
  find_path(NEBU_${dep}_PARENT ${dep} PATHS /usr/include /usr/local/include
            NO_DEFAULT_PATH NO_CMAKE_FIND_ROOT_PATH)
  if(NOT NEBU_${dep}_PARENT)
    message(FATAL_ERROR "${dep} headers not found on the build machine")
  endif()
  file(CREATE_LINK ${NEBU_${dep}_PARENT}/${dep} ${NEBU_DEPS_INCLUDE}/${dep} SYMBOLIC)
endforeach()
add_library(Boost::headers INTERFACE IMPORTED)
add_library(nlohmann_json::nlohmann_json INTERFACE IMPORTED)
set_target_properties(Boost::headers nlohmann_json::nlohmann_json PROPERTIES
  INTERFACE_INCLUDE_DIRECTORIES ${NEBU_DEPS_INCLUDE})
