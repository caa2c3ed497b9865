# The touch program: one flat QML module `Quorl` of every view/ folder, the desktop host, and the program that shows
# the product on a simulated phone. Files are found by their folders; a new one needs no edit here.

set(CMAKE_AUTOMOC ON)

get_target_property(own_code_flags quorl_flags INTERFACE_COMPILE_OPTIONS)

# Warnings are for the project's own files: what Qt's tools generate beside them is compiled without.
function(quorl_warn_in)
  set_source_files_properties(${ARGN} PROPERTIES COMPILE_OPTIONS "${own_code_flags}")
endfunction()

file(GLOB view_sources CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/*/view/*.cpp
     ${CMAKE_CURRENT_SOURCE_DIR}/screens/*/view/*.cpp)
file(GLOB view_headers CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/*/view/*.h
     ${CMAKE_CURRENT_SOURCE_DIR}/screens/*/view/*.h)
file(GLOB view_qml CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/*/view/*.qml
     ${CMAKE_CURRENT_SOURCE_DIR}/screens/*/view/*.qml)
quorl_warn_in(${view_sources})

set(view_folders)
foreach(file IN LISTS view_headers)
  get_filename_component(folder ${file} DIRECTORY)
  list(APPEND view_folders ${folder})
endforeach()
list(REMOVE_DUPLICATES view_folders)

foreach(file IN LISTS view_qml)
  get_filename_component(name ${file} NAME)
  set_source_files_properties(${file} PROPERTIES QT_RESOURCE_ALIAS ${name})
  file(STRINGS ${file} singleton REGEX "^pragma Singleton")
  if(singleton)
    set_source_files_properties(${file} PROPERTIES QT_QML_SINGLETON_TYPE TRUE)
  endif()
endforeach()

set(icon_folder ${PROJECT_SOURCE_DIR}/resources/icons)
file(GLOB icons CONFIGURE_DEPENDS ${icon_folder}/*.svg)
foreach(file IN LISTS icons)
  get_filename_component(name ${file} NAME)
  set_source_files_properties(${file} PROPERTIES QT_RESOURCE_ALIAS icons/${name})
endforeach()

qt_add_library(quorl_ui STATIC)
qt_add_qml_module(quorl_ui
  URI Quorl VERSION 1.0 NO_PLUGIN RESOURCE_PREFIX /qt/qml
  OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/qml/Quorl
  SOURCES ${view_sources} ${view_headers}
  QML_FILES ${view_qml}
  RESOURCES ${icons})
target_include_directories(quorl_ui PUBLIC ${CMAKE_CURRENT_SOURCE_DIR} PRIVATE ${view_folders})
target_link_libraries(quorl_ui PUBLIC quorl_core Qt6::Quick Qt6::QuickControls2 Qt6::Svg)

file(GLOB desktop_sources CONFIGURE_DEPENDS hosts/desktop/*.cpp hosts/desktop/*.h)
list(FILTER desktop_sources EXCLUDE REGEX "/main\\.cpp$")
quorl_warn_in(${desktop_sources})
add_library(quorl_desktop STATIC ${desktop_sources})
target_compile_definitions(quorl_desktop PRIVATE QUORL_RESOURCE_DIRECTORY="${PROJECT_SOURCE_DIR}/resources"
                                                 QUORL_VERSION="${PROJECT_VERSION}")
target_link_libraries(quorl_desktop PUBLIC quorl_ui quorl_simulator Qt6::DBus CLI11::CLI11)

add_executable(quorl-simulator hosts/desktop/main.cpp)
target_link_libraries(quorl-simulator PRIVATE quorl_desktop quorl_flags)
add_dependencies(quorl-simulator quorl_strings)

set(CMAKE_AUTOMOC OFF)
