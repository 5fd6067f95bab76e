# The installed tree has the build folder's shape: the programs side by side in the program
# folder, the language files and the user guide beside it, so that the same relative paths
# ("../Languages", "../help") hold in both. Only a link to the navigator goes on the PATH.
# The folders are fixed rather than the platform's library folder, whose name differs between
# distributions, because the desktop entry and the link rely on them.
set(AMBREL_INSTALL_ROOT lib/quillmark-ambrel)
set(AMBREL_PROGRAM_FOLDER ${AMBREL_INSTALL_ROOT}/bin)

install(TARGETS ambrel-navigator RUNTIME DESTINATION ${AMBREL_PROGRAM_FOLDER})
# The companions may be missing from a tree that does not build them yet.
foreach(companion AmbrelStartPanel AmbrelNoteTool AmbrelViewer)
  if(TARGET ${companion})
    install(TARGETS ${companion} RUNTIME DESTINATION ${AMBREL_PROGRAM_FOLDER})
  endif()
endforeach()

install(DIRECTORY ${PROJECT_SOURCE_DIR}/resources/Languages
        DESTINATION ${AMBREL_INSTALL_ROOT})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/resources/help DESTINATION ${AMBREL_INSTALL_ROOT})

# A relative link, so that the tree can be moved (or staged with DESTDIR) as a whole; the
# prefix is read when installing, since `cmake --install --prefix` may change it.
install(CODE "
  set(link \"\$ENV{DESTDIR}\${CMAKE_INSTALL_PREFIX}/bin/ambrel-navigator\")
  get_filename_component(folder \"\${link}\" DIRECTORY)
  file(MAKE_DIRECTORY \"\${folder}\")
  file(REMOVE \"\${link}\")
  message(STATUS \"Installing: \${link}\")
  file(CREATE_LINK \"../${AMBREL_PROGRAM_FOLDER}/ambrel-navigator\" \"\${link}\" SYMBOLIC)
")

install(FILES ${PROJECT_SOURCE_DIR}/resources/desktop/quillmark-ambrel.svg
        DESTINATION share/icons/hicolor/scalable/apps)
install(FILES ${PROJECT_SOURCE_DIR}/resources/desktop/quillmark-ambrel.desktop
        DESTINATION share/applications)
