# The Windows side: the platform, the type library generated from the interface table, and TALUtil.dll.
add_link_options(-fno-lto)
add_compile_definitions(UNICODE _UNICODE WINVER=0x0601 _WIN32_WINNT=0x0601)

talutil_layer(win32 FOLDER platform/win32 BELOW platform FAST page_renderer.cpp stored_files.cpp win32_files.cpp)
add_library(talutil_platform STATIC)
# The system's cryptography is loaded on first use: most hosts never need it, and it is slow to load.
if(CMAKE_SIZEOF_VOID_P EQUAL 8)
  set(idl_flags -m64 --win64)
  set(manifest_kind manifest64)
  # Without the sizes of the arguments, which 64-bit names do not have.
  file(STRINGS cmake/bcrypt.def bcrypt_lines REGEX "^[A-Z]")
  list(TRANSFORM bcrypt_lines REPLACE "@[0-9]+$" "")
  list(JOIN bcrypt_lines "\n" bcrypt_text)
  set(bcrypt_definition ${CMAKE_BINARY_DIR}/bcrypt.def)
  file(CONFIGURE OUTPUT ${bcrypt_definition} CONTENT "${bcrypt_text}\n" @ONLY)
else()
  set(idl_flags -m32 --win32)
  set(manifest_kind manifest)
  set(bcrypt_definition ${CMAKE_SOURCE_DIR}/cmake/bcrypt.def)
endif()
find_program(dlltool ${talutil_tool_prefix}-dlltool REQUIRED NO_CMAKE_FIND_ROOT_PATH)
set(delayed_bcrypt ${CMAKE_BINARY_DIR}/libbcrypt_delayed.a)
add_custom_command(OUTPUT ${delayed_bcrypt}
  COMMAND ${dlltool} --kill-at --input-def ${bcrypt_definition} --output-delaylib ${delayed_bcrypt}
  DEPENDS ${bcrypt_definition})
add_custom_target(delayed_imports DEPENDS ${delayed_bcrypt})
add_dependencies(talutil_platform delayed_imports)
target_link_libraries(talutil_platform PUBLIC talutil_core layer_win32 PRIVATE ${delayed_bcrypt} delayimp)

# The type library: a program on the build machine prints the table as IDL, which is then compiled and patched. It
# refers to the platform's stdole2.tlb, which the IDL compiler looks for in the folder below.
set(TALUTIL_STDOLE_DIR "" CACHE PATH "The folder with stdole2.tlb (the Wine root has one)")
if(NOT EXISTS "${TALUTIL_STDOLE_DIR}/stdole2.tlb")
  message(FATAL_ERROR "TALUTIL_STDOLE_DIR (\"${TALUTIL_STDOLE_DIR}\") has no stdole2.tlb: source tools/environment.sh "
                      "before cmake, and run ./test wine once so that the Wine root exists")
endif()
find_program(host_compiler NAMES c++ g++ REQUIRED NO_CMAKE_FIND_ROOT_PATH)
find_program(idl_compiler ${talutil_tool_prefix}-widl REQUIRED NO_CMAKE_FIND_ROOT_PATH)
set(generated ${CMAKE_BINARY_DIR}/generated)
file(MAKE_DIRECTORY ${generated})
file(GLOB table_headers CONFIGURE_DEPENDS src/automation/*.hpp src/library/*.hpp src/texts/*.hpp)
set(host_compile ${host_compiler} -std=c++20 -O0 -I${CMAKE_SOURCE_DIR}/src)

add_custom_command(
  OUTPUT ${generated}/write_idl
  COMMAND ${host_compile} ${CMAKE_SOURCE_DIR}/tools/write_idl.cpp
          ${CMAKE_SOURCE_DIR}/src/library/interface_definition.cpp ${CMAKE_SOURCE_DIR}/src/library/cpp_header.cpp
          ${CMAKE_SOURCE_DIR}/src/texts/member_texts.cpp ${member_texts} -o ${generated}/write_idl
  DEPENDS tools/write_idl.cpp src/library/interface_definition.cpp src/library/cpp_header.cpp
          src/texts/member_texts.cpp ${member_texts} ${table_headers})
add_custom_command(
  OUTPUT ${generated}/mend_typelib
  COMMAND ${host_compile} ${CMAKE_SOURCE_DIR}/tools/mend_typelib.cpp -o ${generated}/mend_typelib
  DEPENDS tools/mend_typelib.cpp ${table_headers})
add_custom_command(
  OUTPUT ${generated}/TALUtil.tlb ${generated}/talutil.h ${CMAKE_BINARY_DIR}/TALUtil.manifest
  COMMAND ${generated}/write_idl idl > ${generated}/TALUtil.idl
  COMMAND ${generated}/write_idl header > ${generated}/talutil.h
  COMMAND ${generated}/write_idl ${manifest_kind} > ${CMAKE_BINARY_DIR}/TALUtil.manifest
  # The library would otherwise contain the time at which it was made.
  COMMAND ${CMAKE_COMMAND} -E env WIDL_TIME_OVERRIDE=0
          ${idl_compiler} ${idl_flags} -I${CMAKE_SOURCE_DIR}/tools -L${TALUTIL_STDOLE_DIR} -t -o ${generated}/TALUtil.tlb ${generated}/TALUtil.idl
  COMMAND ${generated}/mend_typelib ${generated}/TALUtil.tlb
  DEPENDS ${generated}/write_idl ${generated}/mend_typelib tools/base.idl
  COMMENT "Making the type library")

# TALUtil.dll is optimised as a whole: the linker alone keeps every function that has unwind information, used or not. In
# one part, because the compiler fails at some aliases between several; its sections are not those of single functions,
# which would be padded to 16 bytes each.
set(whole_link_options -flto -flto-partition=none -fwhole-program -fno-function-sections -fno-data-sections)

# Loaded at any address, data never run as code. Nothing depends on the time: the same sources give the same bytes.
set(dll_link_options -static -s -Wl,--gc-sections -Wl,--enable-stdcall-fixup -Wl,--no-insert-timestamp
    -Wl,--dynamicbase -Wl,--nxcompat)
if(CMAKE_SIZEOF_VOID_P EQUAL 8)
  list(APPEND dll_link_options -Wl,--high-entropy-va)
endif()

enable_language(RC)
# Writes a DLL's version resource, and in front of it what else there is: NAME DESCRIPTION [CONTENTS]
function(talutil_resources name description)
  set(resource_name ${name})
  set(resource_description ${description})
  set(resource_contents "${ARGN}")
  configure_file(src/com/version.rc.in ${generated}/${name}.rc)
endfunction()
talutil_resources(TALUtil "TALUtil common toolkit" "#include \"${CMAKE_SOURCE_DIR}/src/com/talutil.rc\"")
talutil_resources(printhelper "TALUtil print helper")
set_source_files_properties(${generated}/TALUtil.rc PROPERTIES
                            OBJECT_DEPENDS "${generated}/TALUtil.tlb;${CMAKE_SOURCE_DIR}/src/com/talutil.rc")
talutil_layer(com BELOW calling win32
              FAST dispatch_object.cpp early_call.cpp invoke.cpp variant_bridge.cpp write_back.cpp)
add_library(TALUtil SHARED src/com/talutil.def ${generated}/TALUtil.rc ${generated}/talutil.h)
set_target_properties(TALUtil PROPERTIES PREFIX "" RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR})
target_link_libraries(TALUtil PRIVATE layer_com talutil_platform ole32 oleaut32 uuid advapi32 user32 gdi32)
# Page-aligned sections are mapped; others are read and copied, which takes most of the loading time.
target_link_options(TALUtil PRIVATE ${dll_link_options} ${whole_link_options} -Wl,--file-alignment=4096)

# For our own clients of the DLL: headers only, no code.
add_library(client_headers INTERFACE)
foreach(layer com win32 automation platform library)
  target_include_directories(client_headers INTERFACE $<TARGET_PROPERTY:layer_${layer},INTERFACE_INCLUDE_DIRECTORIES>)
endforeach()
target_link_libraries(client_headers INTERFACE talutil_options)

# In a separate folder: the library is to find it where a package would put it, beside the program or TALUtil.dll.
add_library(printhelper SHARED src/printhelper/printhelper.cpp src/printhelper/printhelper.def
            src/platform/win32/exception_frames.cpp ${generated}/printhelper.rc)
target_include_directories(printhelper PRIVATE src)
set_target_properties(printhelper PROPERTIES PREFIX "" RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/printhelper)
target_link_libraries(printhelper PRIVATE talutil_options gdi32 user32)
target_link_options(printhelper PRIVATE ${dll_link_options})
install(TARGETS TALUtil printhelper RUNTIME DESTINATION .)
