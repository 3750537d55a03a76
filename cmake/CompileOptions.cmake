# What every target of this project is compiled with.
add_library(zor_compile_options INTERFACE)
target_compile_options(zor_compile_options INTERFACE
  -Wall -Wextra -Wpedantic -Wshadow -Wnon-virtual-dtor -Wold-style-cast -Wcast-qual
  -ffp-contract=off  # so that results repeat on every processor
  $<$<BOOL:${ZOR_WARNINGS_AS_ERRORS}>:-Werror>)
if(ZOR_SANITIZE)
  add_compile_options(-fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer)
  add_link_options(-fsanitize=address,undefined)
  if(ZOR_FUZZ)
    add_compile_options(-fsanitize=fuzzer-no-link)
  endif()
  # The sanitizers' own code makes the compiler see uninitialised values in the standard library. The other builds warn.
  target_compile_options(zor_compile_options INTERFACE $<$<CXX_COMPILER_ID:GNU>:-Wno-maybe-uninitialized>)
endif()

# zor_compile_lightly(file…): what runs once and takes long to compile, such as the reading of a command line, is not
# optimised to the last.
function(zor_compile_lightly)
  set_source_files_properties(${ARGN} PROPERTIES COMPILE_OPTIONS "$<$<CONFIG:Release>:-O1>")
endfunction()

# zor_add_system_sources(target name…): what is written for each kind of system: NameWindows.cpp there, Name.cpp elsewhere.
# Where there is a NameUnix.cpp, Name.cpp is what all systems share.
function(zor_add_system_sources inTarget)
  foreach(name IN LISTS ARGN)
    set(shared "")
    set(system "")
    if(EXISTS ${CMAKE_CURRENT_SOURCE_DIR}/${name}Unix.cpp)
      set(shared ${name}.cpp)
      set(system Unix)
    endif()
    if(WIN32)
      set(system Windows)
    endif()
    target_sources(${inTarget} PRIVATE ${shared} ${name}${system}.cpp)
  endforeach()
endfunction()
