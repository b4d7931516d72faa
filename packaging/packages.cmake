# Debian packages of the components, one each, for the architecture of the word size.

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_VENDOR "Vorlan")
set(CPACK_PACKAGE_CONTACT "Vorlan CNA management <mpca@vorlan.example>")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_COMPONENTS_ALL provider tools simulator)
set(CPACK_PACKAGE_DIRECTORY "${CMAKE_BINARY_DIR}/packages")
set(CPACK_STRIP_FILES ON)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_ENABLE_COMPONENT_DEPENDS OFF)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_COMPRESSION_TYPE xz)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_PACKAGE_SECTION admin)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_DEBIAN_PACKAGE_ARCHITECTURE amd64)
if(VLN_WORD_SIZE EQUAL 32)
    set(CPACK_DEBIAN_PACKAGE_ARCHITECTURE i386)
endif()

# Stated rather than computed: dpkg-shlibdeps knows the libraries of the architecture that it runs on,
# and the packages for i386 are made on amd64. The test of the packages holds these against the files.
set(runtime "libc6 (>= 2.34), libgcc-s1 (>= 7), libstdc++6 (>= 12)")
set(line_editing "")
if(MPCACTL_HAS_EDITLINE)
    set(line_editing ", libedit2 (>= 2.11)")
endif()

# A package: vln_package(COMPONENT DEPENDS text DESCRIPTION text, its first line the short one).
macro(vln_package component depends description)
    string(TOUPPER ${component} upper)
    set(CPACK_DEBIAN_${upper}_PACKAGE_NAME vorlan-mpca-${component})
    set(CPACK_DEBIAN_${upper}_PACKAGE_DEPENDS "${depends}")
    set(CPACK_DEBIAN_${upper}_DESCRIPTION "${description}")
    set(documents "${CMAKE_CURRENT_BINARY_DIR}/${component}")
    file(MAKE_DIRECTORY "${documents}")
    configure_file(debian/changelog.in "${documents}/changelog" @ONLY)
    execute_process(COMMAND gzip -9nf "${documents}/changelog" COMMAND_ERROR_IS_FATAL ANY)
    install(FILES "${documents}/changelog.gz" debian/copyright
            DESTINATION share/doc/vorlan-mpca-${component} COMPONENT ${component})
endmacro()

vln_package(provider "${runtime}" "CMPI provider for Vorlan converged network adapters
Lets a CIM object manager show and change the converged network adapters of
a host: cards, ports, endpoints, targets, sessions and logical units, in
namespace root/vorlan. Installing it registers its classes with the object
manager that is there; removing it takes them back.")
set(CPACK_DEBIAN_PROVIDER_PACKAGE_SUGGESTS libcurl4) # firmware from an address
set(CPACK_DEBIAN_PROVIDER_PACKAGE_CONTROL_EXTRA
    "${CMAKE_CURRENT_SOURCE_DIR}/debian/postinst;${CMAKE_CURRENT_SOURCE_DIR}/debian/prerm;${CMAKE_CURRENT_SOURCE_DIR}/debian/postrm")

vln_package(tools "vorlan-mpca-provider (= ${PROJECT_VERSION}), ${runtime}${line_editing}"
"command line for the Vorlan adapter provider
mpcactl loads the provider for Vorlan converged network adapters into an
object manager of its own and asks it anything that a client could ask. It
needs no other object manager and, with the package vorlan-mpca-simulator,
no adapter.")
set(CPACK_DEBIAN_TOOLS_PACKAGE_SUGGESTS vorlan-mpca-simulator)

vln_package(simulator "${runtime}" "simulated hosts for the Vorlan adapter provider
Simulated converged network adapters, described by scenario files, behind the
same libraries that real ones are managed through, and the provider built for
them. For trying mpcactl, consoles and object managers on any machine.")
set(CPACK_DEBIAN_SIMULATOR_PACKAGE_ENHANCES "vorlan-mpca-tools, vorlan-mpca-provider")

include(CPack)
