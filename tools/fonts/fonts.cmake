# vexel_fonts: the movie of the built-in fonts, made from outline fonts of the system, as bytes.
# Without FreeType or the fonts it holds none, and CMake says so. Releases of these fonts before the
# second are under other terms, which do not fit a program that carries them: they are passed over.
find_package(Freetype QUIET)
set(fonts_folder "")
foreach(name liberation2 liberation)
  set(terms /usr/share/doc/fonts-${name}/copyright)
  if(NOT fonts_folder AND EXISTS ${terms}
      AND EXISTS /usr/share/fonts/truetype/${name}/LiberationSans-Regular.ttf)
    file(STRINGS ${terms} open_font_license REGEX "SIL OPEN FONT LICENSE")
    if(open_font_license)
      set(fonts_folder /usr/share/fonts/truetype/${name})
      set(fonts_terms ${terms})
    endif()
  endif()
endforeach()

# A build for another machine cannot run the maker of the movie: it takes one that is ready, with the
# terms beside it, from a build for this one.
set(VEXEL_FONTS_MOVIE "" CACHE FILEPATH "fonts.vxm of another build, to be used as it is")

set(fonts_movie ${CMAKE_BINARY_DIR}/fonts/fonts.vxm)
set(fonts_source ${CMAKE_BINARY_DIR}/fonts/fonts.cpp)
if(VEXEL_FONTS_MOVIE)
  get_filename_component(ready ${VEXEL_FONTS_MOVIE} DIRECTORY)
  configure_file(${ready}/LICENSE.fonts ${CMAKE_BINARY_DIR}/fonts/LICENSE.fonts COPYONLY)
  configure_file(${VEXEL_FONTS_MOVIE} ${fonts_movie} COPYONLY)
elseif(FREETYPE_FOUND AND fonts_folder)
  add_executable(make_fonts tools/fonts/make_fonts.cpp tests/support/byte_writer.cpp
    tests/support/glyph_writer.cpp tests/support/movie_writer.cpp tests/support/shape_writer.cpp)
  target_link_libraries(make_fonts PRIVATE vexel_flags Freetype::Freetype)
  set(font_files ${fonts_folder}/LiberationSans-Regular.ttf
    ${fonts_folder}/LiberationSerif-Regular.ttf ${fonts_folder}/LiberationMono-Regular.ttf)
  # The terms of the fonts go wherever they go: the text lies beside the movie.
  configure_file(${fonts_terms} ${CMAKE_BINARY_DIR}/fonts/LICENSE.fonts COPYONLY)
  add_custom_command(OUTPUT ${fonts_movie}
    COMMAND make_fonts ${fonts_movie} ${font_files} DEPENDS make_fonts ${font_files})
else()
  message(STATUS "No built-in fonts: FreeType or the Liberation fonts (2.0 or later) are missing")
  set(fonts_source tools/fonts/no_fonts.cpp)
endif()
add_custom_command(OUTPUT ${CMAKE_BINARY_DIR}/fonts/fonts.cpp
  COMMAND ${CMAKE_COMMAND} -DMOVIE=${fonts_movie} -DSOURCE=${CMAKE_BINARY_DIR}/fonts/fonts.cpp
    -P ${CMAKE_SOURCE_DIR}/tools/fonts/embed.cmake
  DEPENDS ${fonts_movie} ${CMAKE_SOURCE_DIR}/tools/fonts/embed.cmake)
add_library(vexel_fonts STATIC ${fonts_source})
target_link_libraries(vexel_fonts PRIVATE vexel_flags)
