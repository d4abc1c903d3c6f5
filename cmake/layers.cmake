# The layers of the code. Each is a folder of src with its own target, which only sees the headers of the layers below
# it: an include root contains a single folder, so that an include in the wrong direction does not compile.
#
#   talutil_layer(NAME [FOLDER folder] BELOW layer... [LIBRARIES library...] [GENERATED source...] [FAST file...])
#
# The folder has the layer's name by default; the libraries are visible to this layer only. What hosts call in long loops
# is compiled for speed: a whole layer with FAST ALL, or the files named; everything else for size.
function(talutil_layer name)
  cmake_parse_arguments(PARSE_ARGV 1 layer "" "FOLDER" "BELOW;LIBRARIES;GENERATED;FAST")
  if(NOT layer_FOLDER)
    set(layer_FOLDER ${name})
  endif()
  file(GLOB headers CONFIGURE_DEPENDS src/${layer_FOLDER}/*.hpp)
  file(GLOB sources CONFIGURE_DEPENDS src/${layer_FOLDER}/*.cpp)
  set(root ${CMAKE_BINARY_DIR}/layers/${name})
  file(REMOVE_RECURSE ${root})
  file(MAKE_DIRECTORY ${root}/${layer_FOLDER})
  foreach(header ${headers})
    get_filename_component(file ${header} NAME)
    file(CREATE_LINK ${header} ${root}/${layer_FOLDER}/${file} SYMBOLIC)
  endforeach()
  add_library(layer_${name} OBJECT ${sources} ${layer_GENERATED})
  target_include_directories(layer_${name} PUBLIC ${root})
  list(TRANSFORM layer_BELOW PREPEND layer_)
  target_link_libraries(layer_${name} PUBLIC talutil_options ${layer_BELOW} PRIVATE ${layer_LIBRARIES})
  if(WIN32)
    # For TALUtil.dll, which is optimised as a whole; programs for tests link the code that the objects hold as well.
    target_compile_options(layer_${name} PRIVATE $<$<CONFIG:Release>:-flto -ffat-lto-objects>)
  endif()
  if(NOT layer_FAST STREQUAL ALL)
    target_compile_options(layer_${name} PRIVATE $<$<CONFIG:Release>:-Os>)
    foreach(file ${layer_FAST})
      set_property(SOURCE src/${layer_FOLDER}/${file} APPEND PROPERTY COMPILE_OPTIONS $<$<CONFIG:Release>:-O2>)
    endforeach()
  endif()
endfunction()

# The texts of all members, read from the doc comments of the headers. Nothing that the DLL needs refers to them.
find_program(python python3 REQUIRED NO_CMAKE_FIND_ROOT_PATH)
file(GLOB text_headers CONFIGURE_DEPENDS src/library/*.hpp src/controls/*.hpp)
set(member_texts ${CMAKE_BINARY_DIR}/member_texts.cpp)
add_custom_command(OUTPUT ${member_texts}
  COMMAND ${python} ${CMAKE_SOURCE_DIR}/tools/member_texts.py ${member_texts}
  DEPENDS tools/member_texts.py ${text_headers}
  COMMENT "Reading the texts of the members")

# The directions and forms of characters, from the distribution's copy of the Unicode Character Database.
set(unicode_data /usr/share/unicode)
if(NOT EXISTS ${unicode_data}/UnicodeData.txt)
  message(FATAL_ERROR "${unicode_data} has no Unicode Character Database: install the package unicode-data")
endif()
set(character_tables ${CMAKE_BINARY_DIR}/character_tables.cpp)
add_custom_command(OUTPUT ${character_tables}
  COMMAND ${python} ${CMAKE_SOURCE_DIR}/tools/character_tables.py ${unicode_data} ${character_tables}
  DEPENDS tools/character_tables.py ${unicode_data}/UnicodeData.txt
  COMMENT "Writing the tables of characters"
  VERBATIM)

# From bottom to top: values, the seam to the platform, what is built on that, and the families of members. If a layer
# is above two others, neither of these knows the other.
talutil_layer(automation FAST ALL)
talutil_layer(platform BELOW automation)
talutil_layer(documents BELOW platform LIBRARIES documents::pdf archives::deflate GENERATED ${character_tables} FAST ALL)
talutil_layer(archives BELOW platform LIBRARIES archives::zip archives::deflate)
talutil_layer(controls BELOW documents archives FAST crypto.cpp delimited_text.cpp grid.cpp name_case.cpp)
talutil_layer(texts GENERATED ${member_texts})
talutil_layer(library BELOW controls texts)
talutil_layer(text BELOW library FAST ALL)
talutil_layer(dates BELOW library FAST ALL)
talutil_layer(services BELOW library FAST sequential_file.cpp text_files.cpp)
talutil_layer(forms BELOW library FAST grid_export.cpp grids.cpp)
talutil_layer(preview BELOW library)
set(families text dates services forms preview)
talutil_layer(infoforms BELOW forms)
talutil_layer(startup BELOW ${families} infoforms)
# The command answers millions of calls, the DLL only writes down those of a user who asked for it.
if(WIN32)
  talutil_layer(calling BELOW startup)
else()
  talutil_layer(calling BELOW startup FAST ALL)
endif()

add_library(talutil_core STATIC)
target_link_libraries(talutil_core
  PUBLIC layer_automation layer_texts layer_platform layer_documents layer_archives layer_controls layer_library
         layer_text layer_dates layer_services layer_forms layer_preview layer_infoforms layer_startup layer_calling
  PRIVATE archives::zip archives::deflate documents::pdf)
