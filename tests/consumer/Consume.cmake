# Installs the build, moves what was installed, and builds and runs the outside project by CMake and by pkg-config:
#   cmake -D build=… -D work=… -D project=… -D sample=… -D compiler=… -D flags=… -P Consume.cmake
set(installed ${work}/installed)
set(prefix "${work}/moved to another place")
file(REMOVE_RECURSE ${work})

function(Run)
  execute_process(COMMAND ${ARGV} COMMAND_ERROR_IS_FATAL ANY OUTPUT_VARIABLE output)
  set(output "${output}" PARENT_SCOPE)
endfunction()

function(ExpectKind inHow)
  if(NOT output STREQUAL "ClashElement 1.2: 32 interferences\n")
    message(FATAL_ERROR "the program built by ${inHow} printed: ${output}")
  endif()
endfunction()

Run(${CMAKE_COMMAND} --install ${build} --prefix ${installed})
file(RENAME ${installed} ${prefix})

Run(${CMAKE_COMMAND} -S ${project} -B ${work}/by-cmake -DCMAKE_PREFIX_PATH=${prefix}
  -DCMAKE_CXX_COMPILER=${compiler} -DCMAKE_CXX_FLAGS=${flags})
Run(${CMAKE_COMMAND} --build ${work}/by-cmake)
Run(${work}/by-cmake/kind ${sample})
ExpectKind(CMake)

set(ENV{PKG_CONFIG_PATH} "${prefix}/lib/pkgconfig")
find_program(shell sh REQUIRED)
Run(${shell} -c "eval \"'${compiler}' -std=c++20 ${flags} '${project}/main.cpp' -o '${work}/by-pkg-config' \
  $(pkg-config --cflags --libs zorlyra)\"")
set(ENV{LD_LIBRARY_PATH} "${prefix}/lib")
Run(${work}/by-pkg-config ${sample})
ExpectKind(pkg-config)
unset(ENV{LD_LIBRARY_PATH})

# The command, its catalogues and its libraries moved along.
if(EXISTS ${prefix}/bin/lyra)
  unset(ENV{ZOR_CATALOGUE_PATH})
  Run(${prefix}/bin/lyra info ${sample})
  foreach(paper man/man1/lyra.1 bash-completion/completions/lyra zsh/site-functions/_lyra fish/vendor_completions.d/lyra.fish)
    if(NOT EXISTS ${prefix}/share/${paper})
      message(FATAL_ERROR "share/${paper} is not installed")
    endif()
  endforeach()
endif()
