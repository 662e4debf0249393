# Functions that create the targets of the library's layers.

# The compiler options of all our code.
add_library(project_build_options INTERFACE)
target_compile_features(project_build_options INTERFACE cxx_std_20)
target_compile_options(project_build_options INTERFACE -Wall -Wextra -Wpedantic -Wconversion -Wshadow
  $<$<BOOL:${PROJECT_MANAGEMENT_WARNINGS_AS_ERRORS}>:-Werror>)

# In a unity build GCC treats each included source as a header, and warns of types in its unnamed namespace.
if(CMAKE_UNITY_BUILD AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  target_compile_options(project_build_options INTERFACE -Wno-subobject-linkage)
endif()

find_package(Threads REQUIRED)

# project_add_layer(<name> [LOADED] DEPENDS <targets>... [LINK <targets>...] [HEADERS <patterns>...])
#
# Creates a layer from the sources that its folders add to project_<name>_compiled. DEPENDS lists the targets that its
# public headers include, LINK those that its sources alone use. HEADERS selects the layer's public headers in an include
# folder that layers share. LOADED marks a layer that is loaded by name at run time: it is always a shared library.
#   project_<name>_compiled  the objects, with hidden visibility
#   project_<name>           the library of them, shared or static, also as project::<name>
#   project_<name>_static    an archive of them, for the tool: a program that is started for each command cannot wait
#                            for the loader to bind a library for each layer
#   project_<name>_objects   the same objects for tests, which may include headers of src/
function(project_add_layer name)
  cmake_parse_arguments(layer "LOADED" "" "DEPENDS;LINK;HEADERS;TEST_INCLUDES" ${ARGN})
  set(include_root "${CMAKE_CURRENT_SOURCE_DIR}/include")
  if(NOT EXISTS "${include_root}")
    # The public headers of src/ are beside it.
    get_filename_component(include_root "${CMAKE_CURRENT_SOURCE_DIR}/../include" ABSOLUTE)
  endif()

  add_library(project_${name}_compiled OBJECT)
  set_target_properties(project_${name}_compiled PROPERTIES
    POSITION_INDEPENDENT_CODE ON CXX_EXTENSIONS OFF
    CXX_VISIBILITY_PRESET hidden VISIBILITY_INLINES_HIDDEN ON)
  target_include_directories(project_${name}_compiled
    PUBLIC "$<BUILD_INTERFACE:${include_root}>" PRIVATE ${layer_TEST_INCLUDES})
  target_link_libraries(project_${name}_compiled PUBLIC ${layer_DEPENDS} PRIVATE ${layer_LINK} project_build_options)

  set(type ${project_library_type})
  if(layer_LOADED)
    set(type SHARED)
  endif()
  add_library(project_${name} ${type} "$<TARGET_OBJECTS:project_${name}_compiled>")
  add_library(project::${name} ALIAS project_${name})
  set_target_properties(project_${name} PROPERTIES
    EXPORT_NAME ${name} LINKER_LANGUAGE CXX VERSION ${PROJECT_VERSION} SOVERSION ${project_soversion}
    INSTALL_RPATH "$ORIGIN") # installed libraries find each other in any folder
  project_add_public_headers(project_${name} "${include_root}" ${layer_HEADERS})
  target_link_libraries(project_${name} PUBLIC ${layer_DEPENDS} PRIVATE ${layer_LINK})
  target_compile_features(project_${name} PUBLIC cxx_std_20)

  if(type STREQUAL "STATIC")
    add_library(project_${name}_static ALIAS project_${name})
    return()
  endif()
  list(TRANSFORM layer_DEPENDS REPLACE "^(project_.*)$" "\\1_static" OUTPUT_VARIABLE static_depends)
  add_library(project_${name}_static STATIC EXCLUDE_FROM_ALL "$<TARGET_OBJECTS:project_${name}_compiled>")
  set_target_properties(project_${name}_static PROPERTIES LINKER_LANGUAGE CXX)
  target_include_directories(project_${name}_static PUBLIC "${include_root}")
  target_link_libraries(project_${name}_static PUBLIC ${static_depends} PRIVATE ${layer_LINK})
  target_compile_features(project_${name}_static PUBLIC cxx_std_20)
endfunction()

# project_add_public_headers(<target> <include root> <patterns>...)
#
# The headers below a root that a target installs, by default all. The target all_verify_interface_header_sets compiles
# each of them alone.
function(project_add_public_headers target root)
  set(patterns ${ARGN})
  if(NOT patterns)
    set(patterns "*.hpp")
  endif()
  list(TRANSFORM patterns PREPEND "${root}/")
  file(GLOB_RECURSE headers CONFIGURE_DEPENDS ${patterns})
  target_sources(${target} PUBLIC FILE_SET HEADERS BASE_DIRS "${root}" FILES ${headers})
  target_include_directories(${target} INTERFACE "$<INSTALL_INTERFACE:${project_headers_folder}>")
  set_target_properties(${target} PROPERTIES VERIFY_INTERFACE_HEADER_SETS ${PROJECT_IS_TOP_LEVEL})
endfunction()

# project_add_objects(<name> LAYERS <layers>... DEPENDS <targets>... INCLUDES <folders>...)
#
# Creates an interface target with the objects of some layers, for tests that include internal headers.
function(project_add_objects name)
  cmake_parse_arguments(objects "" "" "LAYERS;DEPENDS;INCLUDES" ${ARGN})
  add_library(project_${name}_objects INTERFACE)
  target_compile_features(project_${name}_objects INTERFACE cxx_std_20)
  foreach(layer IN LISTS objects_LAYERS)
    target_sources(project_${name}_objects INTERFACE "$<TARGET_OBJECTS:project_${layer}_compiled>")
  endforeach()
  target_include_directories(project_${name}_objects INTERFACE ${objects_INCLUDES})
  target_link_libraries(project_${name}_objects INTERFACE ${objects_DEPENDS})
endfunction()
