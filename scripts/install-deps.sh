#!/usr/bin/env bash
# Installs the Debian packages the build and the tests need; does nothing when all are there.
# Usage: scripts/install-deps.sh [--i386] [--bench]
#   --i386: also libjpeg for the 32-bit test build
#   --bench: also the libraries the side-by-side benchmark compares with (libyuv, libjpeg-turbo)
set -euo pipefail

with_i386=false
with_bench=false
for arg in "$@"; do
  case "$arg" in
    --i386) with_i386=true ;;
    --bench) with_bench=true ;;
    *) echo "usage: $0 [--i386] [--bench]" >&2; exit 2 ;;
  esac
done

packages=(cmake ninja-build g++ g++-multilib pkg-config googletest libgtest-dev libbenchmark-dev dpkg-dev
          libjpeg62-turbo-dev
          # The command-line tool reads media files through FFmpeg's libraries; its tests use ffmpeg.
          libavformat-dev libavcodec-dev libswscale-dev libswresample-dev libavutil-dev ffmpeg
          # The fuzz targets build with clang's libFuzzer and sanitizers.
          clang libclang-rt-14-dev
          # scripts/format.sh: one clang-format version, so that every machine formats alike.
          clang-format-14)
$with_bench && packages+=(libyuv-dev libturbojpeg0-dev)
# libjpeg for the 32-bit build, from Debian's i386 architecture. Without it the 32-bit build
# still passes: it skips the JPEG decoding tests and does not build IJL15.DLL.
i386_packages=()
$with_i386 && i386_packages=(libjpeg62-turbo-dev:i386)

installed() { dpkg-query -W -f='${Status}' "$1" 2>/dev/null | grep -q "install ok installed"; }

missing=()
for pkg in "${packages[@]}"; do installed "$pkg" || missing+=("$pkg"); done
missing_i386=()
for pkg in "${i386_packages[@]+"${i386_packages[@]}"}"; do installed "$pkg" || missing_i386+=("$pkg"); done
[ ${#missing[@]} -eq 0 ] && [ ${#missing_i386[@]} -eq 0 ] && exit 0

sudo=""
[ "$(id -u)" -eq 0 ] || sudo="sudo"
export DEBIAN_FRONTEND=noninteractive
apt_update() { $sudo apt-get update -qq || echo "warning: apt-get update reported errors" >&2; }
apt_install() { $sudo apt-get install -y -qq --no-install-recommends "$@"; }

if [ ${#missing[@]} -gt 0 ]; then
  echo "Installing: ${missing[*]}"
  apt_update
  apt_install "${missing[@]}"
fi

if [ ${#missing_i386[@]} -gt 0 ]; then
  added_i386=false
  if ! dpkg --print-foreign-architectures | grep -qx i386; then
    $sudo dpkg --add-architecture i386
    added_i386=true
  fi
  echo "Installing: ${missing_i386[*]}"
  apt_update
  if ! apt_install "${missing_i386[@]}"; then
    echo "warning: could not install ${missing_i386[*]}; the 32-bit build skips its JPEG tests" >&2
    # Leave apt as it was, so that later updates do not depend on the i386 package lists.
    i386_installed=$(dpkg-query -W -f='${Architecture}\n' | grep -cx i386 || true)
    if $added_i386 && [ "$i386_installed" -eq 0 ]; then
      $sudo dpkg --remove-architecture i386
      apt_update
    fi
  fi
fi
