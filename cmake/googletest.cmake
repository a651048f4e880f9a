# GoogleTest. For another machine it is built from its source, and the tests are linked statically:
# an emulator then needs no libraries of that machine.
if(CMAKE_CROSSCOMPILING)
  block()
    set(CMAKE_COMPILE_WARNING_AS_ERROR OFF)
    set(INSTALL_GTEST OFF)
    add_subdirectory(/usr/src/googletest/googletest ${PROJECT_BINARY_DIR}/googletest EXCLUDE_FROM_ALL)
  endblock()
  add_link_options(-static)
else()
  find_package(GTest REQUIRED)
endif()
