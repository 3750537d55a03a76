#!/usr/bin/env bash
# LinkOutside.sh INSTALLED WORK: a project that knows nothing of this one's build finds the installed package by CMake, is
# linked with it, and its program runs under Wine beside the package's libraries.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/../.."
installed=$1 work=$2

cmake -S tests/consumer/project -B "$work" -G Ninja -DCMAKE_SYSTEM_NAME=Windows -DCMAKE_BUILD_TYPE=Release \
  -DCMAKE_CXX_COMPILER=x86_64-w64-mingw32-g++-posix -DCMAKE_PREFIX_PATH="$installed" >/dev/null
cmake --build "$work" >/dev/null
answer=$(WINEPATH="Z:${installed//\//\\}\\bin" /usr/lib/wine/wine64 "$work/kind.exe" samples/as1.clash.xml | tr -d '\r')
[ "$answer" = "ClashElement 1.2: 32 interferences" ] || {
  echo "windows: the program that was linked outside printed: $answer" >&2
  exit 1
}
echo "windows: a program of another project was linked with the zip and ran"
