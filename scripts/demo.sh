#!/usr/bin/env bash
# Sets everything up on a Debian machine (the packages the build needs), builds the avpost
# command-line tool and runs its demo, which writes its results into a folder.
# Usage: scripts/demo.sh [FOLDER]   (default: avpost-demo in the current folder)
set -euo pipefail
folder=$(realpath -m "${1:-avpost-demo}")
tool=$("$(dirname "$0")/build-tool.sh")
"$tool" demo "$folder"
