#!/usr/bin/env bash
# Builds the avpost command-line tool, runs its gallery (one test picture through every effect
# of the video stage) and turns the contact sheet into docs/gallery.png for the README.
# Usage: scripts/gallery.sh
set -euo pipefail
cd "$(dirname "$0")/.."
tool=$(scripts/build-tool.sh)

scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
"$tool" gallery "$scratch"
ffmpeg -hide_banner -loglevel error -y -i "$scratch/gallery.bmp" -pix_fmt rgb24 docs/gallery.png
echo "wrote docs/gallery.png"
