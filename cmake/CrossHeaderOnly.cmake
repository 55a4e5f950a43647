# A cross build takes the header-only libraries (CLI11, nlohmann_json) from the build
# machine's /usr/include, through a folder that holds only them: /usr/include itself would
# put the build machine's C library before the target's.
set(QV_CROSS_HEADERS ${CMAKE_BINARY_DIR}/cross-headers)
file(MAKE_DIRECTORY ${QV_CROSS_HEADERS})
foreach(folder CLI nlohmann)
  file(CREATE_LINK /usr/include/${folder} ${QV_CROSS_HEADERS}/${folder} SYMBOLIC)
endforeach()
add_library(CLI11::CLI11 INTERFACE IMPORTED)
add_library(nlohmann_json::nlohmann_json INTERFACE IMPORTED)
set_target_properties(CLI11::CLI11 nlohmann_json::nlohmann_json PROPERTIES
                      INTERFACE_INCLUDE_DIRECTORIES ${QV_CROSS_HEADERS})
