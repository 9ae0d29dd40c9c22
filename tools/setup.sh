# shellcheck shell=bash
# Set-up shared by ./vorkel and ./test: the Debian packages that are missing, then a build
# that is up to date. Sourced by scripts that run under `set -euo pipefail`; everything said
# here goes to standard error, because standard output belongs to the program that follows.
#
# What has been built is known by a stamp in the build folder: the list of the sources, each
# with its size and time of change, as they were before the build began. A source that is
# changed, added or removed, even while the build runs, makes the next run build again.

VORKEL_ROOT=$(cd -P -- "$(dirname -- "${BASH_SOURCE[0]}")/.." && pwd -P)

# The folders that the package is built from. A tree that is configured with tests builds the
# package alone by the targets of these folders.
readonly PROGRAM_FOLDERS=(hardware host engine planner cli tcl binding)
readonly PROGRAM_SOURCES=(CMakeLists.txt cmake devices doc examples hdl library packaging python
  "${PROGRAM_FOLDERS[@]}")
readonly TEST_SOURCES=(fuzz tests)

# The exit status of a script whose set-up fails. Those that call ./vorkel take 1 for an answer of
# the program.
readonly SET_UP_FAILED=5

# Without it there is nothing to run, whatever the stamp says.
readonly PACKAGE_LIBRARY=ip_vorkel1.1/libIp_Vorkel.so

say() {
  printf 'vorkel: %s\n' "$*" >&2
}

fail() {
  say "$@"
  exit "$SET_UP_FAILED"
}

# Runs when a script ends in its set-up, and makes one failure of all: a command that has failed has
# said why itself. What was killed ends as that does.
end_set_up() {
  local status=$?
  if ((status > 0 && status < 128 && status != SET_UP_FAILED)); then
    fail "the set-up failed; the reason stands above"
  fi
}

# --- Debian packages ---------------------------------------------------------------------

# Prints the Debian packages that a job needs:
# `packages_for program|tests|coverage|benchmarks|packages|libcxx|fuzz|ports|tcl9`.
packages_for() {
  printf '%s\n' g++ cmake ninja-build tcl8.6 tcl8.6-dev tcllib libtomlplusplus-dev \
    libboost-dev libcli11-dev libfmt-dev nlohmann-json3-dev
  case $1 in
    tests | coverage)
      printf '%s\n' libgtest-dev libgmock-dev opensta iverilog verilator make ghdl yosys \
        parallel procps valgrind \
        pkg-config pybind11-dev python3-dev python3-pytest python3-yaml man-db
      [[ $1 == tests ]] || printf '%s\n' gcovr
      ;;
    benchmarks) printf '%s\n' libbenchmark-dev ;;
    packages) printf '%s\n' pybind11-dev python3-dev dpkg-dev file ;;
    libcxx) printf '%s\n' clang-14 libc++-14-dev libc++abi-14-dev ;;
    fuzz)
      packages_for tests
      printf '%s\n' clang-14 libclang-rt-14-dev
      ;;
    ports) printf '%s\n' clang-14 libc++-14-dev libc++abi-14-dev llvm-14 lld-14 \
      g++-aarch64-linux-gnu qemu-user-static g++-i686-linux-gnu g++-mingw-w64-x86-64-posix wine64 \
      wine ;;
    tcl9) printf '%s\n' mmdebstrap dpkg-dev ;;
  esac
}

# Prints those of the given packages that are not installed, one on a line.
missing_packages() {
  local installed package
  installed=$(dpkg-query --show --showformat='${Package} ${db:Status-Status}\n' "$@" \
    2>/dev/null || true)
  for package in "$@"; do
    grep -qxF -- "$package installed" <<<"$installed" || printf '%s\n' "$package"
  done
}

# Installs what a job lacks: `install_packages WHAT`. Ends the script when
# that cannot be done. On a system without dpkg the tools are taken as they are, and CMake
# says what it lacks.
install_packages() {
  command -v dpkg-query >/dev/null || return 0
  local wanted missing
  mapfile -t wanted < <(packages_for "$1")
  mapfile -t missing < <(missing_packages "${wanted[@]}")
  ((${#missing[@]} > 0)) || return 0

  local count="${#missing[@]} Debian packages" as_root=()
  ((${#missing[@]} == 1)) && count="1 Debian package"
  if [[ $(id -u) != 0 ]]; then
    as_root=(sudo -n)
    if ! sudo -n true >/dev/null 2>&1; then
      local sudo=''
      ! command -v sudo >/dev/null || sudo='sudo '
      say "$count must be installed first, and this user may not do it. Please run, as root:"
      printf '  %sapt-get update && %sapt-get install --yes %s\n' \
        "$sudo" "$sudo" "${missing[*]}" >&2
      exit "$SET_UP_FAILED"
    fi
  fi

  # One log for both steps; it is shown only when a step fails. The lock of the build folder
  # is not handed on: what the installation starts may outlive this script.
  local log
  log=$(mktemp)
  say "updating the list of Debian packages"
  apt_get update || say "the list could not be updated; trying with the one that is there"
  say "installing $count: ${missing[*]}"
  if ! apt_get install --yes --no-install-recommends "${missing[@]}"; then
    tail -n 30 -- "$log" >&2
    rm -f -- "$log"
    fail "apt-get could not install them; the reason stands above"
  fi
  rm -f -- "$log"
  mapfile -t missing < <(missing_packages "${wanted[@]}")
  ((${#missing[@]} == 0)) || fail "still missing after the installation: ${missing[*]}"
}

# Runs apt-get as `as_root` says, without questions, its output in `log`.
apt_get() {
  "${as_root[@]}" env DEBIAN_FRONTEND=noninteractive \
    apt-get -q -o Dpkg::Use-Pty=0 -o DPkg::Lock::Timeout=600 "$@" \
    </dev/null >>"$log" 2>&1 9>&-
}

# --- The stamp ---------------------------------------------------------------------------

# Prints the state of the sources of a build: `fingerprint program|tests|...`.
fingerprint() {
  local sources=("${PROGRAM_SOURCES[@]}") present=() name
  [[ $1 == program ]] || sources+=("${TEST_SOURCES[@]}")
  cd -- "$VORKEL_ROOT" || return
  for name in "${sources[@]}" tools/setup.sh; do
    [[ -e $name ]] && present+=("$name")
  done
  pwd -P
  # Editors keep hidden files and backups beside what is edited.
  find "${present[@]}" ! -type d ! -name '.*' ! -name '*~' -printf '%p %s %T@\n' | LC_ALL=C sort
}

# Whether the folder holds the build of the sources as they are: `is_current FOLDER WHAT`. It can be
# asked without the lock: another run takes the stamp away before it builds.
is_current() {
  local stamp
  # $(<FILE) would end the script when the file is not there any more.
  stamp=$(cat -- "$1/.built-$2" 2>/dev/null) || return 1
  [[ -e $1/$PACKAGE_LIBRARY && -x $1/vorkel ]] || return 1
  command -v tclsh8.6 >/dev/null || return 1
  [[ $(fingerprint "$2") == "$stamp" ]]
}

# --- Configuring and building ------------------------------------------------------------

# Waits until no other run builds or tests in the folder and keeps it for this one, until
# `unlock` or the end of the script.
lock() {
  local reason
  reason=$(mkdir -p -- "$1" 2>&1 && { : >>"$1/.lock"; } 2>&1) ||
    fail "nothing can be built in ${1##*/}/: ${reason##*: }"
  exec 9>>"$1/.lock"
  if ! flock --nonblock 9; then
    say "waiting for another run that is using ${1##*/}/"
    flock 9
  fi
}

unlock() {
  exec 9>&-
}

# Empties the folder when its configuration cannot be used any more: CMake writes absolute
# paths, so a checkout that was moved or copied starts afresh.
discard_foreign_configuration() {
  local cache=$1/CMakeCache.txt
  [[ -f $cache ]] || return 0
  if grep -qxF -- "CMAKE_HOME_DIRECTORY:INTERNAL=$VORKEL_ROOT" "$cache" &&
    grep -qxF -- "CMAKE_CACHEFILE_DIR:INTERNAL=$1" "$cache" &&
    grep -qxF -- "CMAKE_GENERATOR:INTERNAL=Ninja" "$cache"; then
    return 0
  fi
  say "${1##*/}/ was configured for another folder; building afresh"
  find "$1" -mindepth 1 -maxdepth 1 ! -name .lock -exec rm -rf -- {} +
}

# `configure FOLDER OPTION...`: runs CMake unless its last complete run had these options.
configure() {
  local folder=$1 marker=$1/.configured
  shift
  if [[ -f $marker && -f $folder/build.ninja && $(<"$marker") == "$*" ]]; then
    return 0
  fi
  say "configuring in ${folder##*/}/"
  rm -f -- "$marker"
  if ! cmake -G Ninja -S "$VORKEL_ROOT" -B "$folder" "$@" >"$folder/configure.log" 2>&1; then
    cat -- "$folder/configure.log" >&2
    fail "CMake could not configure the build; the reason stands above"
  fi
  printf '%s\n' "$*" >"$marker"
}

# `bring_up_to_date FOLDER program|tests|... OPTION...`: packages, configuration and build, as
# far as they are needed. The folder must be locked by the caller.
bring_up_to_date() {
  local folder=$1 what=$2 state targets=(all)
  shift 2
  rm -f -- "$folder/.built-$what"
  state=$(fingerprint "$what")
  discard_foreign_configuration "$folder"
  install_packages "$what"
  if [[ $what == tests || $what == coverage ]]; then
    configure "$folder" -DVORKEL_TESTS=ON "$@"
  else
    # A tree with tests stays one: going back and forth would configure it every time.
    if [[ -f $folder/.configured && $(<"$folder/.configured") == "-DVORKEL_TESTS=ON $*" ]]; then
      configure "$folder" -DVORKEL_TESTS=ON "$@"
      targets=("${PROGRAM_FOLDERS[@]/%//all}")
    else
      configure "$folder" -DVORKEL_TESTS=OFF "$@"
    fi
  fi
  say "building in ${folder##*/}/"
  # A build that was killed can leave files that are torn and look finished. Without its log
  # Ninja makes everything again. A build that fails or is interrupted tidies up itself.
  [[ ! -e $folder/.building ]] || rm -f -- "$folder/.ninja_log"
  : >"$folder/.building"
  if ! (cd -- "$folder" &&
    NINJA_STATUS='vorkel: [%f/%t] ' ninja -j "$(nproc)" "${targets[@]}") >&2; then
    rm -f -- "$folder/.building"
    fail "the build failed; the reason stands above"
  fi
  rm -f -- "$folder/.building"
  printf '%s\n' "$state" >"$folder/.built-$what"
}

# `set_up FOLDER program|tests|... OPTION...`: keeps the folder for this run, see `lock`, and has what
# it is to hold in it. Whatever fails ends the script.
set_up() {
  trap end_set_up EXIT
  lock "$1"
  # Another run may have built it while this one waited.
  is_current "$1" "$2" || bring_up_to_date "$@"
  trap - EXIT
}
