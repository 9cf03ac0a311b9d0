# Sourced by the other scripts: installs the Debian packages named in
# FIF_PACKAGES that are missing, as root directly or else through sudo.
fif_install_packages() {
  local missing=()
  local pkg
  for pkg in "$@"; do
    dpkg-query -W -f='${Status}' "$pkg" 2>/dev/null | grep -q "ok installed" || missing+=("$pkg")
  done
  [ ${#missing[@]} -eq 0 ] && return 0
  echo "Installing missing packages: ${missing[*]}"
  local sudo=""
  if [ "$(id -u)" -ne 0 ]; then
    command -v sudo >/dev/null || { echo "error: need root or sudo to install ${missing[*]}" >&2; return 1; }
    sudo="sudo"
  fi
  $sudo apt-get update -qq
  DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y -qq --no-install-recommends "${missing[@]}"
}

# What building the library, the application and the tests needs.
FIF_BUILD_PACKAGES=(cmake ninja-build g++ pkg-config libgl-dev libpcre2-dev
  qt6-base-dev qt6-5compat-dev qt6-tools-dev qt6-tools-dev-tools qt6-l10n-tools
  libqt6svg6 qt6-qpa-plugins fonts-dejavu-core)
# What the sanitizer builds and the fuzz targets need besides: clang with its
# runtime libraries (libFuzzer, ASan, UBSan, TSan).
FIF_CHECK_PACKAGES=(clang libclang-rt-14-dev)

# What docs/screenshot.sh needs besides: a virtual X display, a way to type
# into the application, and a camera.
FIF_SCREENSHOT_PACKAGES=(xvfb xauth xdotool imagemagick)
