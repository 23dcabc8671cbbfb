# The real screen on Linux: a module that the library loads when QXCORE_DISPLAY asks for it, so that the library itself
# depends on no window system. Without SDL's headers, installed or unpacked by ./dev into build/sdl, it is left out.
find_package(X11 QUIET)
pkg_check_modules(SDL2 QUIET IMPORTED_TARGET sdl2>=2.26)
if(SDL2_FOUND)
  add_library(qxcore_sdl ALIAS PkgConfig::SDL2)
else()
  set(sdl_headers ${PROJECT_SOURCE_DIR}/build/sdl/usr/include)
  find_library(QXCORE_SDL_LIBRARY NAMES libSDL2-2.0.so.0)
  if(QXCORE_SDL_LIBRARY AND EXISTS ${sdl_headers}/SDL2/SDL.h)
    add_library(qxcore_sdl INTERFACE)
    target_include_directories(qxcore_sdl SYSTEM INTERFACE ${sdl_headers}/SDL2 ${sdl_headers}/${CMAKE_LIBRARY_ARCHITECTURE})
    target_link_libraries(qxcore_sdl INTERFACE ${QXCORE_SDL_LIBRARY})
  endif()
endif()

if(TARGET qxcore_sdl AND X11_FOUND)
  file(GLOB display_sources CONFIGURE_DEPENDS qxcore/platform/posix/display/sdl/*.cpp)
  add_library(qxcore-display-sdl MODULE ${display_sources})
  target_link_libraries(qxcore-display-sdl PRIVATE qxcore11e qxcore_options qxcore_sdl X11::X11)
  set_target_properties(qxcore-display-sdl PROPERTIES PREFIX "" CXX_VISIBILITY_PRESET hidden
    VISIBILITY_INLINES_HIDDEN ON CXX_EXTENSIONS OFF LIBRARY_OUTPUT_DIRECTORY ${PROJECT_BINARY_DIR}
    INSTALL_RPATH "$ORIGIN/..")
  install(TARGETS qxcore-display-sdl LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}/qxcore11e COMPONENT runtime)
else()
  message(STATUS "The screen of an X server is left out: it needs SDL 2.26 (libsdl2-dev, or ./dev setup screen)")
endif()
