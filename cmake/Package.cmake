# What is installed, and the package that CPack makes of it. The program, the module and their shared libraries lie beside
# each other in lib/graphplots, where they look for one another; bin has a link to the program.
install(TARGETS graphplots-studio RUNTIME DESTINATION lib/graphplots)
install(TARGETS graphplots TQL CoreGraphics ChannelSystemSelection LIBRARY DESTINATION lib/graphplots)
install(CODE "
    file(MAKE_DIRECTORY \"\$ENV{DESTDIR}\${CMAKE_INSTALL_PREFIX}/bin\")
    file(CREATE_LINK ../lib/graphplots/graphplots-studio \"\$ENV{DESTDIR}\${CMAKE_INSTALL_PREFIX}/bin/graphplots-studio\" SYMBOLIC)
")
install(FILES samples/walk.c3d DESTINATION share/graphplots/samples)
install(FILES packaging/graphplots-studio.desktop DESTINATION share/applications)
install(FILES packaging/graphplots-studio.svg DESTINATION share/icons/hicolor/scalable/apps)
install(FILES packaging/graphplots.xml DESTINATION share/mime/packages)
install(FILES packaging/graphplots-studio.1 DESTINATION share/man/man1)

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME graphplots-studio)
set(CPACK_PACKAGE_CONTACT "Graph Plots developers <graphplots@localhost>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "Plotter for recordings and live captures of motion")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION science)
# Libraries are found by what the programs are linked with; what QML loads by name is not.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS "${CMAKE_BINARY_DIR}/bin")
string(CONCAT CPACK_DEBIAN_PACKAGE_DEPENDS "qml6-module-qtqml, qml6-module-qtqml-workerscript, qml6-module-qtquick, "
    "qml6-module-qtquick-controls, qml6-module-qtquick-layouts, qml6-module-qtquick-templates, qml6-module-qtquick-window, "
    "libqt6svg6, libgl1-mesa-dri, fonts-dejavu-core")
include(CPack)
