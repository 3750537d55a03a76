# What the project stands on, built for Windows from Debian's source packages. Taken in by scripts/windows, which sets
# `top`, `work`, `sysroot` and `jobs`. What is built once stays.
mkdir -p "$work/sources" "$work/objects" "$sysroot/include" "$sysroot/lib" "$sysroot/share"

# Lists of source packages of our own: the system's sources stay as they are, and no root is needed.
PrepareSources() {
  [ ! -e "$work/apt/ready" ] || return 0
  mkdir -p "$work/apt/lists/partial" "$work/apt/cache/archives/partial"
  local suite
  suite=$(. /etc/os-release && echo "$VERSION_CODENAME")
  echo "deb-src [signed-by=/usr/share/keyrings/debian-archive-keyring.gpg] http://deb.debian.org/debian $suite main" \
    >"$work/apt/sources.list"
  Apt update -qq
  touch "$work/apt/ready"
}
Apt() {
  apt-get -o Dir::Etc::SourceList="$work/apt/sources.list" -o Dir::Etc::SourceParts=/dev/null \
    -o Dir::State::Lists="$work/apt/lists" -o Dir::Cache="$work/apt/cache" -o APT::Sandbox::User="" \
    -o Acquire::Retries=5 "$@"
}

# Fetch PACKAGE: unpacks a source package, with Debian's changes to it, into sources/PACKAGE. With ORIGINAL set, the
# original archive alone.
Fetch() {
  [ ! -e "$work/sources/$1" ] || return 0
  PrepareSources
  local unpacking=$work/sources/$1.unpacking
  rm -rf "$unpacking"
  mkdir -p "$unpacking"
  (
    cd "$unpacking"
    Apt source -qq ${ORIGINAL:+--download-only --tar-only} "$1" >/dev/null
    [ -z "${ORIGINAL-}" ] || tar xf ./*.orig.tar.*
  )
  mv "$unpacking"/*/ "$work/sources/$1"
  rm -rf "$unpacking"
}

# Build PACKAGE FUNCTION [argument…]: what the function says goes to a log, of which the end is shown when it fails.
Build() {
  local package=$1
  shift
  [ ! -e "$work/objects/$package.built" ] || return 0
  echo "windows: building $package" >&2
  local log=$work/objects/$package.log
  # In a process of its own, which ends at the first error: "if" would let the function go on.
  (set -e; "$@") >"$log" 2>&1 &
  wait $! || {
    tail -20 "$log" >&2
    echo "windows: $package was not built; see $log" >&2
    return 1
  }
  touch "$work/objects/$package.built"
}

# BuildWithCMake PACKAGE FOLDER [option…]: builds a CMake project into the sysroot: that in a folder of a source package,
# or that in a folder of this project. With PART set, a folder of it alone, without its tests and samples.
BuildWithCMake() {
  local package=$1 folder=$2
  shift 2
  [[ $folder == /* ]] || { Fetch "$package"; folder=$work/sources/$package/$folder; }
  Build "$package" CMakeInto "$work/objects/$package" "$folder" "$@"
}
CMakeInto() {
  local objects=$1 folder=$2
  shift 2
  cmake -S "$folder" -B "$objects" -G Ninja -Wno-dev -DCMAKE_TOOLCHAIN_FILE="$top/cmake/mingw-w64.cmake" \
    -DZOR_SYSROOT="$sysroot" -DCMAKE_INSTALL_PREFIX="$sysroot" -DCMAKE_BUILD_TYPE=Release \
    -DBUILD_SHARED_LIBS=OFF -DCMAKE_EXPORT_NO_PACKAGE_REGISTRY=ON "$@"
  cmake --build "$objects" --parallel "$jobs" --target "${PART:+$PART/}all"
  cmake --install "$objects${PART:+/$PART}"
}

BuildNettle() {
  Fetch nettle
  Build nettle NettleInto "$work/objects/nettle"
}
NettleInto() {
  rm -rf "$1"
  mkdir -p "$1"
  cd "$1"
  "$work/sources/nettle/configure" --host=x86_64-w64-mingw32 --prefix="$sysroot" --libdir="$sysroot/lib" \
    --disable-shared --enable-mini-gmp --disable-documentation --disable-openssl CC=x86_64-w64-mingw32-gcc-posix
  make -j "$jobs"
  make install
}

# The headers of what is headers only, as Debian has them.
CopyHeaders() {
  [ ! -e "$work/objects/headers.built" ] || return 0
  cp -r /usr/include/nlohmann /usr/include/toml++ /usr/include/CLI /usr/include/xxhash.h "$sysroot/include"
  cp -r /usr/share/cmake "$sysroot/share"
  mkdir -p "$sysroot/lib/cmake/tomlplusplus"
  printf '%s\n' 'add_library(tomlplusplus::tomlplusplus INTERFACE IMPORTED)' \
    'set_target_properties(tomlplusplus::tomlplusplus PROPERTIES' \
    '  INTERFACE_INCLUDE_DIRECTORIES "${CMAKE_CURRENT_LIST_DIR}/../../../include")' \
    >"$sysroot/lib/cmake/tomlplusplus/tomlplusplusConfig.cmake"
  touch "$work/objects/headers.built"
}

zlib=(-DZLIB_LIBRARY=/usr/x86_64-w64-mingw32/lib/libz.a -DZLIB_INCLUDE_DIR=/usr/x86_64-w64-mingw32/include)

BuildDependencies() {
  CopyHeaders
  BuildWithCMake googletest . -DBUILD_GMOCK=ON
  Fetch icu
  BuildWithCMake icu-common "$top/packaging/windows/icu" -DICU_SOURCE="$work/sources/icu/source"
  # It reads other encodings as on Unix, by ICU, whose tables are in its one library here.
  PART=src BuildWithCMake xerces-c . -Dnetwork=OFF -Dtranscoder=icu -DICU_DATA_LIBRARY_RELEASE="$sysroot/lib/libicuuc.a" \
    -DCMAKE_CXX_FLAGS=-DU_STATIC_IMPLEMENTATION -Dmessage-loader=inmemory -Dxmlch-type=char16_t
  BuildWithCMake pugixml . -DPUGIXML_BUILD_TESTS=OFF
  BuildWithCMake libpng1.6 . "${zlib[@]}" -DPNG_SHARED=OFF -DPNG_TESTS=OFF -DPNG_EXECUTABLES=OFF
  BuildWithCMake libjpeg-turbo . -DENABLE_SHARED=OFF -DWITH_SIMD=OFF
  BuildWithCMake libzip . "${zlib[@]}" -DENABLE_OPENSSL=OFF -DENABLE_GNUTLS=OFF -DENABLE_MBEDTLS=OFF \
    -DENABLE_BZIP2=OFF -DENABLE_LZMA=OFF -DBUILD_TOOLS=OFF -DBUILD_REGRESS=OFF -DBUILD_EXAMPLES=OFF -DBUILD_DOC=OFF
  BuildWithCMake libxlsxwriter . "${zlib[@]}"
}

# What models, pictures and pages need besides.
BuildModelDependencies() {
  BuildWithCMake meshoptimizer . -DMESHOPT_BUILD_SHARED_LIBS=OFF
  BuildWithCMake libwebp . "${zlib[@]}" \
    -DWEBP_BUILD_{ANIM_UTILS,CWEBP,DWEBP,EXTRAS,GIF2WEBP,IMG2WEBP,VWEBP,WEBPINFO,WEBPMUX}=OFF
  BuildWithCMake libxml2 . -DLIBXML2_WITH_{FTP,HTTP,ICONV,LZMA,PROGRAMS,PYTHON,TESTS,ZLIB}=OFF
  BuildWithCMake libxslt . -DLIBXSLT_WITH_{CRYPTO,MODULES,PROGRAMS,PYTHON,TESTS}=OFF
  BuildNettle
  # The mirror lacks Debian's changes to it. The compiler is Debian's, which makes code for AVX that needs no aligned stack.
  ORIGINAL=yes BuildWithCMake embree . -DEMBREE_MAX_ISA=AVX2 -DEMBREE_STATIC_LIB=ON \
    -DCMAKE_PROJECT_embree3_INCLUDE="$top/packaging/windows/embree/Project.cmake" -DEMBREE_TASKING_SYSTEM=INTERNAL \
    -DEMBREE_{ISPC_SUPPORT,TUTORIALS}=OFF -DBUILD_TESTING=OFF \
    -DEMBREE_GEOMETRY_{CURVE,GRID,POINT,QUAD,SUBDIVISION,USER}=OFF
  BuildCadKernel
}

# The toolkits that the model reader names, and those that these name.
BuildCadKernel() {
  mkdir -p "$sysroot/include/rapidjson"
  cp -r /usr/include/rapidjson/. "$sysroot/include/rapidjson"
  BuildWithCMake opencascade . -DCMAKE_PROJECT_OCCT_INCLUDE="$top/packaging/windows/opencascade/Project.cmake" \
    -DBUILD_ADDITIONAL_TOOLKITS="TKXDESTEP;TKXDEIGES;TKRWMesh;TKSTL" -DBUILD_LIBRARY_TYPE=Static \
    -DBUILD_MODULE_{ApplicationFramework,DataExchange,Draw,FoundationClasses,ModelingAlgorithms,ModelingData,Visualization}=OFF \
    -DUSE_{FREEIMAGE,FREETYPE,OPENGL,TBB,TCL,TK,VTK}=OFF -DUSE_RAPIDJSON=ON \
    -D3RDPARTY_RAPIDJSON_INCLUDE_DIR="$sysroot/include" -DBUILD_DOC_Overview=OFF \
    -DBUILD_RELEASE_DISABLE_EXCEPTIONS=OFF -DCMAKE_CXX_FLAGS_RELEASE="-O2 -DNDEBUG -w" \
    -DINSTALL_DIR="$sysroot" -DINSTALL_DIR_LAYOUT=Unix
}
