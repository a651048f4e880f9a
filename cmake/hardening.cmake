# Makes the build static and hardened.
include(CheckCXXSourceCompiles)
include(CheckLinkerFlag)

# The checks below compile with the program's optimisation: without any, the C library warns of every
# level.
set(CMAKE_TRY_COMPILE_CONFIGURATION ${CMAKE_BUILD_TYPE})

# The C library warns of a level that the compiler does not know, and the next one is tried. Debian's
# compiler may define the macro already, at a lower level: it is undefined first.
foreach(level 3 2)
  set(fortify -U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=${level})
  list(JOIN fortify " " CMAKE_REQUIRED_FLAGS)
  string(APPEND CMAKE_REQUIRED_FLAGS " -Werror")
  check_cxx_source_compiles("#include <cstdlib>\nint main() {}" VORL_FORTIFY_${level})
  if(VORL_FORTIFY_${level})
    target_compile_options(vorl_options INTERFACE ${fortify})
    break()
  endif()
endforeach()
unset(CMAKE_REQUIRED_FLAGS)

# Without the paths of this machine the program is the same wherever it is built.
target_compile_options(vorl_options INTERFACE
  -ffunction-sections -fdata-sections
  -ffile-prefix-map=${PROJECT_SOURCE_DIR}=. -ffile-prefix-map=${PROJECT_BINARY_DIR}=.)
target_link_options(vorl_executable INTERFACE
  -Wl,--gc-sections -Wl,-z,relro,-z,now,-z,noexecstack)

# Static: the program needs nothing else of the system. Position-independent: this hardens it, and
# saves time. In a static program at a fixed address the first exception sorts all frame tables, which
# costs several times the whole start-up. riscv64 pays that; armhf has tables that are sorted already.
check_linker_flag(CXX -static-pie VORL_STATIC_PIE)
if(VORL_STATIC_PIE)
  target_link_options(vorl_executable INTERFACE -static-pie)
else()
  message(STATUS "No static-pie here: the program will be static at a fixed address")
  target_link_options(vorl_executable INTERFACE -static)
endif()
