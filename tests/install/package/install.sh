#!/usr/bin/env bash
# Installs a build into an empty prefix: install.sh CMAKE BUILD PREFIX
set -euo pipefail
rm -rf "$3"
"$1" --install "$2" --prefix "$3"
