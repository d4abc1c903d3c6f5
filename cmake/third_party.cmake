# The libraries that tools/third_party.sh builds: archives::zip, archives::deflate and documents::pdf. Configuring only
# looks for them; it installs nothing.
set(flavour native)
if(WIN32 AND CMAKE_SIZEOF_VOID_P EQUAL 8)
  set(flavour windows64)
elseif(WIN32)
  set(flavour windows)
elseif(TALUTIL_FUZZ)
  set(flavour fuzz)
endif()
execute_process(COMMAND ${CMAKE_SOURCE_DIR}/tools/third_party.sh --where ${flavour} OUTPUT_VARIABLE third_party
                OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
if(NOT EXISTS ${third_party}/lib)
  message(FATAL_ERROR "The libraries for archives and documents are not in ${third_party}: run "
                      "\"tools/third_party.sh ${flavour}\" once, which installs what it needs and builds them")
endif()
set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS tools/third_party.sh)
# The DLL does not depend on any other.
if(WIN32)
  set(ZLIB_USE_STATIC_LIBS ON)
endif()
find_package(ZLIB REQUIRED)

function(talutil_import name archive)
  add_library(${name} STATIC IMPORTED)
  set_target_properties(${name} PROPERTIES IMPORTED_LOCATION ${third_party}/lib/${archive}
                        INTERFACE_INCLUDE_DIRECTORIES ${third_party}/include)
endfunction()
talutil_import(archives::zip libzip.a)
talutil_import(archives::bzip2 libbz2.a)
talutil_import(archives::deflate libdeflate.a)
talutil_import(documents::pdf libhpdf.a)
target_link_libraries(archives::zip INTERFACE archives::bzip2 ZLIB::ZLIB)
target_link_libraries(documents::pdf INTERFACE ZLIB::ZLIB)
if(WIN32)
  # As in the library's own build: 64-bit times.
  target_compile_definitions(archives::zip INTERFACE __MINGW_USE_VC2005_COMPAT)
else()
  target_link_libraries(archives::zip INTERFACE OpenSSL::Crypto)
endif()
