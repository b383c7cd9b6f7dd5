# Run at install time: the library's built-in definitions location points at the
# installed definitions, so callers that give VLInit no directory find them.
set(_link "$ENV{DESTDIR}/Tavrel/locale")
set(_target "${CMAKE_INSTALL_PREFIX}/${VL_LOCALE_REL_DIR}")
if(IS_SYMLINK "${_link}" OR NOT EXISTS "${_link}")
  file(MAKE_DIRECTORY "$ENV{DESTDIR}/Tavrel")
  file(REMOVE "${_link}")
  file(CREATE_LINK "${_target}" "${_link}" SYMBOLIC)
  message(STATUS "Linking: ${_link} -> ${_target}")
else()
  message(WARNING "${_link} exists and is not a link; left as it is")
endif()
