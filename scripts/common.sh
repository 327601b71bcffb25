# What the scripts have in common: what the project needs, and how it is built. Sourced, not run.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

# What building, running and testing needs on Debian 12 and its relatives.
build_packages=(g++ cmake ninja-build qt6-base-dev libgl-dev libgtest-dev libgmock-dev
                fonts-dejavu-core cmark-gfm)
# What one test needs besides: a display and an accessibility bus for the program.
test_packages=(xvfb dbus at-spi2-core xdotool)
# What building and testing for Windows needs; GoogleTest is compiled along.
windows_packages=(cmake ninja-build g++-mingw-w64-x86-64-posix googletest wine64)
# What making Qt for Windows needs besides: sources, their licences, and Qt's tools on this computer.
qt_windows_packages=(dpkg-dev python3 qt6-base-dev)
# What packing for Windows needs besides.
windows_package_packages=(cmark-gfm nsis zip)
# What testing these packages needs besides.
test_windows_package_packages=(xvfb xdotool unzip)
# What making the Debian packages needs besides.
package_packages=(dpkg-dev file lintian desktop-file-utils appstream man-db)
# What testing these packages needs besides.
test_package_packages=(debootstrap cmake xvfb xdotool xclip)
fuzz_packages=(clang-14 libclang-rt-14-dev llvm-14 cmake ninja-build qt6-base-dev libgl-dev)
coverage_packages=(gcovr)
check_packages=(clang-format-14 clang-tidy-14 codespell)
icon_packages=(librsvg2-bin optipng icoutils)
picture_packages=(imagemagick optipng)

say() { printf '%s\n' "== $*" >&2; }

# For scripts that go by the list of files that git keeps.
require_clone() {
  git rev-parse --is-inside-work-tree >/dev/null 2>&1 || { say "$0 needs a clone of the repository, with git"; exit 1; }
}

# The commit of the sources. Unknown where they are changed, or no clone.
commit() {
  local commit
  commit=$(git describe --always --abbrev=40 --dirty 2>/dev/null) || commit=-dirty
  [[ $commit != *-dirty ]] && printf '%s\n' "$commit"
}

# quietly COMMAND [ARGUMENT ...]: shows what it prints only when it fails.
quietly() {
  local output
  output=$("$@" 2>&1) || { printf '%s\n' "$output" >&2; say "Failed: $*"; exit 1; }
}

# Installs those of the named packages that are missing. Asks for a password only then.
require_packages() {
  command -v dpkg-query >/dev/null || return 0  # another system: its packages are the user's own affair
  local missing=() package
  for package in "$@"; do
    dpkg-query -W -f='${Status}' "$package" 2>/dev/null | grep -q 'ok installed' || missing+=("$package")
  done
  [ ${#missing[@]} -gt 0 ] || return 0
  local as_root=()
  if [ "$(id -u)" -ne 0 ]; then
    command -v sudo >/dev/null || { say "Please install as root: ${missing[*]}"; exit 1; }
    as_root=(sudo)
    say "Installing packages; this may ask for your password: ${missing[*]}"
  else
    say "Installing packages: ${missing[*]}"
  fi
  "${as_root[@]}" apt-get update -qq
  "${as_root[@]}" env DEBIAN_FRONTEND=noninteractive apt-get install -y -qq --no-install-recommends "${missing[@]}" \
    >/dev/null
}

# The version of the source of the installed Qt.
qt_version() { dpkg-query -W -f '${source:Version}' qt6-base-dev 2>/dev/null; }

# The folder of Qt for Windows. If it exists, it is complete; if not, scripts/qt-windows makes it. Another version of Qt,
# other options or another compiler have a folder of their own.
windows_qt_folder() {
  local version made_of
  version=$(qt_version) || version=none
  made_of=$({
    printf '%s\n' "$version"
    dpkg-query -W -f '${Package} ${Version}\n' g++-mingw-w64-x86-64-posix mingw-w64-x86-64-dev 2>/dev/null || true
    sed 's/ *#.*//' cmake/qt-windows.cmake cmake/mingw-w64.cmake
  } | sha256sum)
  printf '%s\n' "${XDG_CACHE_HOME:-$HOME/.cache}/tendril/qt-${version%%[+-]*}-${made_of:0:8}"
}

# For programs with a window that run without a display. That platform warns of what it cannot do.
without_display() {
  export QT_QPA_PLATFORM="${QT_QPA_PLATFORM:-offscreen}" XDG_RUNTIME_DIR="${XDG_RUNTIME_DIR:-/tmp}"
  export QT_LOGGING_RULES="default.warning=false"
}

# The tests under wine load a library of their own first, whose path has to be one word.
require_plain_path() {
  [[ $PWD != *[[:space:]:]* ]] || { say "The tests under wine need a folder without spaces and colons in its path"; exit 1; }
}

# configure PRESET: when needed.
configure() {
  require_packages "${build_packages[@]}"
  if [ "$1" = windows-qt ]; then
    export TENDRIL_WINDOWS_QT="${TENDRIL_WINDOWS_QT:-$(windows_qt_folder)}"
    [ -d "$TENDRIL_WINDOWS_QT" ] || { say "There is no Qt for Windows yet: scripts/qt-windows makes it"; exit 1; }
    grep -qsxF "CMAKE_PREFIX_PATH:UNINITIALIZED=$TENDRIL_WINDOWS_QT" build/windows-qt/CMakeCache.txt ||
      rm -rf build/windows-qt  # there is none, or it is made with another Qt
  fi
  [ ! -f "build/$1/build.ninja" ] || return 0
  say "Configuring ($1)"
  cmake --preset "$1" >/dev/null
}

# build PRESET [TARGET ...]: configures when needed and brings the build up to date.
build() {
  local preset=$1
  shift
  configure "$preset"
  local targets=()
  [ $# -eq 0 ] || targets=(--target "$@")
  if ! cmake --build --preset "$preset" "${targets[@]}" -- -n | grep -q 'no work to do'; then
    say "Building ($preset); the first time takes a few minutes"
    cmake --build --preset "$preset" "${targets[@]}"
  fi
}
