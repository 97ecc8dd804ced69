# The Debian packages and the cross-built libraries behind tools/setup. Source it; it runs nothing.
# shellcheck shell=bash

ORU_PACKAGES=(
    ca-certificates git cmake dpkg-dev ninja-build ccache python3 xz-utils
    g++-mingw-w64-x86-64-posix libz-mingw-w64-dev nasm
    clang clang-tools-14 clang-format-14 clang-tidy-14 libc++-14-dev llvm-14 lld-14 pkgconf
    libboost-dev libcli11-dev nlohmann-json3-dev opencl-headers opencl-clhpp-headers googletest
    wine wine64 xvfb libgl1 libgl1-mesa-dri ocl-icd-libopencl1 pocl-opencl-icd
    apitrace doxygen)
# What tools/docs needs where nothing is built, and for its look at the site.
ORU_SITE_PACKAGES=(git python3 doxygen)
ORU_BROWSER_PACKAGES=(chromium chromium-driver python3-selenium)
# What tools/coverage needs beside them.
ORU_COVERAGE_PACKAGES=(gcovr)

as_root() {
    if [ "$(id -u)" -eq 0 ]; then
        "$@"
    elif command -v sudo >/dev/null; then
        sudo "$@"
    else
        echo "installing packages needs root or sudo" >&2
        return 1
    fi
}

install_packages() { # PACKAGE...
    local package missing=()
    local installed
    installed=$(dpkg-query -W -f '${db:Status-Abbrev} ${Package}\n' "$@" 2>/dev/null || true)
    for package in "$@"; do
        grep -q "^ii  *$package\$" <<<"$installed" || missing+=("$package")
    done
    [ ${#missing[@]} -gt 0 ] || return 0
    command -v apt-get >/dev/null || die "this is no Debian machine; please install: ${missing[*]}"
    logged apt-update "Updating the package lists" as_root apt-get update
    logged apt-install "Installing Debian packages: ${missing[*]}" \
        as_root env DEBIAN_FRONTEND=noninteractive apt-get install -y --no-install-recommends "${missing[@]}"
}

deps_lock() {
    mkdir -p "$ORU_DEPS_DIR"
    printf '%s' "$ORU_DEPS_DIR/.lock"
}

# Links to header-only packages: the build machine's own include folder must stay out of sight.
link_headers() {
    local name
    mkdir -p "$ORU_DEPS_DIR/include"
    for name in boost CL CLI nlohmann; do
        [ -e "/usr/include/$name/." ] || die "/usr/include/$name is missing though its package is installed"
        [ -e "$ORU_DEPS_DIR/include/$name/." ] || ln -sfn "/usr/include/$name" "$ORU_DEPS_DIR/include/$name"
    done
}

# apt_source ARGUMENT...: apt-get with a source list and package lists of its own, made from the mirror
# that the system uses for its main suite. The system's own lists stay as they are.
apt_source() {
    local apt=$ORU_DEPS_DIR/apt
    apt-get -o "Dir::Etc::SourceList=$apt/sources.list" -o Dir::Etc::SourceParts=/nonexistent \
        -o "Dir::State::Lists=$apt/lists" -o "Dir::Cache=$apt/cache" \
        -o APT::Sandbox::User=root -o APT::Get::List-Cleanup=false "$@"
}

prepare_source_list() {
    local apt=$ORU_DEPS_DIR/apt codename line
    local keyring=/usr/share/keyrings/debian-archive-keyring.gpg
    codename=$(. /etc/os-release && printf '%s' "${VERSION_CODENAME:-}")
    line=$(apt-get indextargets --format '$(REPO_URI) $(RELEASE) $(COMPONENT)' 'Created-By: Packages' |
        awk -v suite="$codename" '($2 == suite || $2 == "stable") && $3 == "main" { print; exit }')
    [ -n "$line" ] || { echo "no apt source for $codename main is configured" >&2; return 1; }
    mkdir -p "$apt/lists/partial" "$apt/cache/archives/partial"
    printf 'deb-src [signed-by=%s] %s\n' "$keyring" "$line" >"$apt/sources.list"
    apt_source update
}

# fetch_source PACKAGE: the package's source, patched as Debian does, in build/deps/src/PACKAGE. Checked
# by apt against the signed package lists.
fetch_source() {
    local package=$1 into=$ORU_DEPS_DIR/src
    rm -rf "${into:?}/$package" "$into/$package.download"
    mkdir -p "$into/$package.download"
    (cd "$into/$package.download" && apt_source source --only-source "$package") || return 1
    local unpacked
    unpacked=$(find "$into/$package.download" -mindepth 1 -maxdepth 1 -type d)
    mv "$unpacked" "$into/$package" || return 1
    rm -rf "$into/$package.download"
}

cross_build() { # NAME SOURCE CMAKE_ARGUMENT...
    local name=$1 source=$2
    shift 2
    local build=$ORU_DEPS_DIR/obj/$name
    rm -rf "$build"
    cmake -S "$source" -B "$build" -G Ninja \
        "-DCMAKE_TOOLCHAIN_FILE=$ORU_ROOT/cmake/toolchain-mingw64.cmake" \
        -DCMAKE_BUILD_TYPE=Release -DBUILD_SHARED_LIBS=OFF \
        "-DCMAKE_INSTALL_PREFIX=$ORU_DEPS_DIR" -DCMAKE_INSTALL_LIBDIR:STRING=lib \
        "-DCMAKE_CXX_FLAGS=\"-ffile-prefix-map=$source/=$name/\"" \
        "-DCMAKE_C_FLAGS=\"-ffile-prefix-map=$source/=$name/\"" \
        "$@" || return 1
    cmake --build "$build" || return 1
    cmake --install "$build" || return 1
    rm -rf "$build"
}

# dependency NAME PACKAGE CMAKE_ARGUMENT...: fetches, builds and installs one library, and again when its
# arguments, the way it is built or the toolchain file change. A package without a CMakeLists.txt gets
# cmake/deps/PACKAGE.cmake.
dependency() {
    local name=$1 package=$2
    shift 2
    local stamp=$ORU_DEPS_DIR/stamps/$name recipe own=$ORU_ROOT/cmake/deps/$package.cmake
    local recipes=("$ORU_ROOT/cmake/toolchain-mingw64.cmake")
    [ ! -f "$own" ] || recipes+=("$own")
    recipe="$package $* $(declare -f cross_build | cat - "${recipes[@]}" | cksum)"
    [ "$(cat "$stamp" 2>/dev/null)" != "$recipe" ] || return 0
    local source=$ORU_DEPS_DIR/src/$package
    if [ "$package" = googletest ]; then
        source=/usr/src/googletest
    elif [ ! -d "$source/debian" ]; then
        [ -n "${ORU_SOURCES_LISTED:-}" ] ||
            logged apt-sources "Listing Debian's source packages (in build/deps)" prepare_source_list
        ORU_SOURCES_LISTED=yes
        logged "fetch-$name" "Fetching the Debian source of $name" fetch_source "$package"
    fi
    [ ! -f "$own" ] || cp "$own" "$source/CMakeLists.txt"
    logged "dep-$name" "Cross-building $name" cross_build "$name" "$source" "$@"
    mkdir -p "$ORU_DEPS_DIR/stamps"
    printf '%s' "$recipe" >"$stamp"
}

build_dependencies() {
    local zlib=/usr/x86_64-w64-mingw32
    dependency tbb onetbb \
        -DTBB_TEST=OFF -DTBB_STRICT=OFF -DTBBMALLOC_BUILD=OFF -DTBB_EXAMPLES=OFF
    dependency png libpng1.6 -DPNG_SHARED=OFF -DPNG_TESTS=OFF \
        "-DZLIB_LIBRARY=$zlib/lib/libz.a" "-DZLIB_INCLUDE_DIR=$zlib/include"
    dependency jpeg libjpeg-turbo -DENABLE_SHARED=OFF -DWITH_TURBOJPEG=OFF
    dependency lcms lcms2
    # Its programs and tests, and what it would compress with that hardly any photo is.
    dependency tiff tiff -Dtiff-tools=OFF -Dtiff-tests=OFF -Dtiff-contrib=OFF -Dtiff-docs=OFF -Dcxx=OFF \
        -Dlibdeflate=OFF -Djbig=OFF -Dlerc=OFF -Dlzma=OFF -Dzstd=OFF -Dwebp=OFF -Dpixarlog=OFF -Dold-jpeg=OFF \
        -Djpeg12=OFF -Dccitt=OFF -Dthunder=OFF -Dnext=OFF -Dlogluv=OFF -Dmdi=OFF \
        "-DZLIB_LIBRARY=$zlib/lib/libz.a" "-DZLIB_INCLUDE_DIR=$zlib/include"
    dependency gtest googletest -DBUILD_GMOCK=ON
    dependency benchmark benchmark -DGIT_VERSION=1.7.1 \
        -DBENCHMARK_ENABLE_TESTING=OFF -DBENCHMARK_ENABLE_WERROR=OFF
}
