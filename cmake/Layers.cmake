# Functions that create the targets of the library's layers.

# The compiler options of all our code.
add_library(project_build_options INTERFACE)
target_compile_features(project_build_options INTERFACE cxx_std_20)
target_compile_options(project_build_options INTERFACE -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)

# In a unity build GCC treats each included source as a header, and warns of types in its unnamed namespace.
if(CMAKE_UNITY_BUILD AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  target_compile_options(project_build_options INTERFACE -Wno-subobject-linkage)
endif()

find_package(Threads REQUIRED)

# project_add_layer(<name> DEPENDS <targets>... [LINK <targets>...])
#
# Creates a layer from the sources that its folders add to project_<name>_compiled. DEPENDS lists the targets that its
# public headers include, LINK those that its sources alone use.
#   project_<name>_compiled  the objects, with hidden visibility
#   project_<name>           the shared library of them, also as project::<name>
#   project_<name>_static    an archive of them, for the tool: a program that is started for each command cannot wait
#                            for the loader to bind a library for each layer
#   project_<name>_objects   the same objects for tests, which may include headers of src/
function(project_add_layer name)
  cmake_parse_arguments(layer "" "" "DEPENDS;LINK;TEST_INCLUDES" ${ARGN})
  set(include_root "${CMAKE_CURRENT_SOURCE_DIR}/include")
  if(NOT EXISTS "${include_root}")
    set(include_root "${CMAKE_CURRENT_SOURCE_DIR}/../include") # the public headers of src/ are beside it
  endif()

  add_library(project_${name}_compiled OBJECT)
  set_target_properties(project_${name}_compiled PROPERTIES
    POSITION_INDEPENDENT_CODE ON CXX_EXTENSIONS OFF
    CXX_VISIBILITY_PRESET hidden VISIBILITY_INLINES_HIDDEN ON)
  target_include_directories(project_${name}_compiled
    PUBLIC "$<BUILD_INTERFACE:${include_root}>" PRIVATE ${layer_TEST_INCLUDES})
  target_link_libraries(project_${name}_compiled PUBLIC ${layer_DEPENDS} PRIVATE ${layer_LINK} project_build_options)

  add_library(project_${name} SHARED "$<TARGET_OBJECTS:project_${name}_compiled>")
  add_library(project::${name} ALIAS project_${name})
  set_target_properties(project_${name} PROPERTIES
    EXPORT_NAME ${name} LINKER_LANGUAGE CXX VERSION ${PROJECT_VERSION} SOVERSION ${PROJECT_VERSION_MAJOR}
    INSTALL_RPATH "$ORIGIN") # installed libraries find each other in any folder
  target_include_directories(project_${name}
    PUBLIC "$<BUILD_INTERFACE:${include_root}>" "$<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>")
  target_link_libraries(project_${name} PUBLIC ${layer_DEPENDS} PRIVATE ${layer_LINK})
  target_compile_features(project_${name} PUBLIC cxx_std_20)

  list(TRANSFORM layer_DEPENDS REPLACE "^(project_.*)$" "\\1_static" OUTPUT_VARIABLE static_depends)
  add_library(project_${name}_static STATIC EXCLUDE_FROM_ALL "$<TARGET_OBJECTS:project_${name}_compiled>")
  set_target_properties(project_${name}_static PROPERTIES LINKER_LANGUAGE CXX)
  target_include_directories(project_${name}_static PUBLIC "${include_root}")
  target_link_libraries(project_${name}_static PUBLIC ${static_depends} PRIVATE ${layer_LINK})
  target_compile_features(project_${name}_static PUBLIC cxx_std_20)
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
