# Installs the build, moves what was installed, and builds and runs the outside project by CMake and by pkg-config:
#   cmake -D build=… -D work=… -D project=… -D picture=… -D sample=… -D model=… -D compiler=… -D flags=… -P Consume.cmake
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

# Through installed headers alone: a model is opened, an interference read and drawn. Other settings than the installed
# ones would be found first.
Run(${CMAKE_COMMAND} -S ${picture} -B ${work}/picture -DCMAKE_PREFIX_PATH=${prefix}
  -DCMAKE_CXX_COMPILER=${compiler} -DCMAKE_CXX_FLAGS=${flags})
Run(${CMAKE_COMMAND} --build ${work}/picture)
Run(${work}/picture/picture ${model} ${sample} 1 ${work}/picture.png)
if(NOT output MATCHES "^Contact: .+ and .+\n$")
  message(FATAL_ERROR "the program that draws printed: ${output}")
endif()
file(READ ${work}/picture.png bytes HEX)
# The signature, and in the header 300 by 200 pixels.
if(NOT bytes MATCHES "^89504e470d0a1a0a0000000d494844520000012c000000c8")
  message(FATAL_ERROR "the picture is none")
endif()

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
