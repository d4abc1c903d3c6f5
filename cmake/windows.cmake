# The Windows side: the platform, the DLL with its type library, and what the host tests need.
file(GLOB win32_sources CONFIGURE_DEPENDS src/platform/win32/*.cpp)
if(win32_sources)
  add_library(talutil_platform STATIC ${win32_sources})
  target_link_libraries(talutil_platform PUBLIC talutil_core)
  target_compile_definitions(talutil_platform PUBLIC UNICODE _UNICODE WINVER=0x0601 _WIN32_WINNT=0x0601)
endif()
