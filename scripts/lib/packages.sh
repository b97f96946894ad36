# Debian packages: what is missing, and its installation. Sourced after common.sh.
# shellcheck shell=bash

# shellcheck disable=SC2034  # the commands use these
{
  packages_to_build=(g++ cmake ninja-build libcli11-dev libctemplate-dev libssl-dev libtomlplusplus-dev
    nlohmann-json3-dev pkg-config scdoc)
  packages_to_test=(abigail-tools ansible-core binutils libgtest-dev libldap-dev python3-jsonschema valgrind man-db
    devscripts doxygen chromium chromium-driver poppler-utils python3-selenium
    bash-completion fish pre-commit zsh)
  packages_to_package=(debhelper dpkg-dev devscripts doxygen fakeroot lintian locales xz-utils)
  packages_to_compare=(abigail-tools binutils xz-utils)
  # openssh-server starts a server on a machine that has none: not for the tests of everybody.
  packages_to_check=(clang clang-tidy clang-format libbenchmark-dev openssh-client openssh-server)
}

# missing_packages PACKAGE...: those that are not installed, one on a line.
missing_packages() {
  local package
  for package in "$@"; do
    # A package for more than one architecture has a word for each.
    case " $(dpkg-query --show --showformat='${db:Status-Status} ' "$package" 2>/dev/null) " in
      *' installed '*) ;;
      *) printf '%s\n' "$package" ;;
    esac
  done
}

# as_root COMMAND...: by sudo for anybody but root; without a terminal sudo does not ask.
as_root() {
  if [ "$(id -u)" -eq 0 ]; then
    "$@"
  elif [ -t 0 ]; then
    sudo -- "$@"
  else
    sudo -n -- "$@"
  fi
}

can_install() {
  command -v apt-get >/dev/null || return 1
  [ "$(id -u)" -eq 0 ] && return 0
  command -v sudo >/dev/null || return 1
  [ -t 0 ] || sudo -n true 2>/dev/null
}

apt_get() {
  as_root env DEBIAN_FRONTEND=noninteractive apt-get -q -y -o DPkg::Lock::Timeout=600 \
    -o Acquire::Retries=3 "$@"
}

install_packages() {
  # A source that does not answer matters only when a package is not found afterwards.
  apt_get update || true
  apt_get install --no-install-recommends "$@"
}

# require_packages PACKAGE...: returns when all are installed; otherwise names what is missing and
# ends the program.
require_packages() {
  local missing
  if ! command -v dpkg-query >/dev/null; then
    printf 'Not a Debian system: what these packages hold is taken to be here: %s\n' "$*"
    return
  fi
  mapfile -t missing < <(missing_packages "$@")
  [ "${#missing[@]}" -eq 0 ] && return
  can_install || fail "These packages are missing and cannot be installed without root or sudo: ${missing[*]}
As root: apt-get update && apt-get install ${missing[*]}"
  printf 'Installing %s\n' "${missing[*]}"
  local log
  log=$(mktemp)
  install_packages "${missing[@]}" >"$log" 2>&1 || tail -n 30 "$log" >&2
  rm -f "$log"
  mapfile -t missing < <(missing_packages "$@")
  [ "${#missing[@]}" -eq 0 ] || fail "These packages are missing and could not be installed: ${missing[*]}"
}
