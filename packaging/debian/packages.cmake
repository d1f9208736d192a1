# Debian packages by `cpack`, from any build: a component is a package.
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_DIRECTORY ${PROJECT_BINARY_DIR}/packages)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_PACKAGE_CONTACT "The vetra developers <maintainers@vetra.example>" CACHE STRING
    "Maintainer of the packages: a name and an address")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS OWNER_READ OWNER_WRITE OWNER_EXECUTE
    GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)
set(CPACK_PRE_BUILD_SCRIPTS ${CMAKE_CURRENT_LIST_DIR}/finish.cmake)

set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_ENABLE_COMPONENT_DEPENDS ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(vetra_description
    "vetra resamples raster images of any sample type, with validity masks, by\nmany methods, and gives the same bits on every processor and with any\nnumber of threads.")

set(CPACK_COMPONENTS_ALL development)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libvetra-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_DEVELOPMENT_DESCRIPTION
    "raster resampling library, development files\n${vetra_description}\n\nThis package has the headers, the libraries to link with, and what CMake and\npkg-config need to find them.")
if(VETRA_SHARED)
    list(APPEND CPACK_COMPONENTS_ALL library)
    get_target_property(soversion vetra SOVERSION)
    # A package per binary interface, so that those of two versions can be installed together.
    set(CPACK_DEBIAN_LIBRARY_PACKAGE_NAME libvetra${soversion})
    set(CPACK_DEBIAN_LIBRARY_PACKAGE_CONTROL_EXTRA ${CMAKE_CURRENT_LIST_DIR}/triggers)
    set(CPACK_DEBIAN_LIBRARY_PACKAGE_SECTION libs)
    set(CPACK_DEBIAN_LIBRARY_DESCRIPTION
        "raster resampling library\n${vetra_description}\n\nThis package has the shared library.")
    set(CPACK_COMPONENT_DEVELOPMENT_DEPENDS library)
    set(CPACK_COMPONENT_TOOL_DEPENDS library)
    # Where dpkg-shlibdeps finds the library that the tool is linked to.
    set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${PROJECT_BINARY_DIR}/src/vetra)
endif()
if(VETRA_TOOL)
    list(APPEND CPACK_COMPONENTS_ALL tool)
    set(CPACK_DEBIAN_TOOL_PACKAGE_NAME vetra-tools)
    set(CPACK_DEBIAN_TOOL_PACKAGE_SECTION science)
    set(CPACK_DEBIAN_TOOL_DESCRIPTION
        "resample raster files of any size\n${vetra_description}\n\nThis package has the command line tool, which reads and writes the files that\nGDAL knows, and kernel files for it.")
endif()
include(CPack)
