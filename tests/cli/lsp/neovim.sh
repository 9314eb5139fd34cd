#!/usr/bin/env bash
# Runs neovim.lua on a copy of the demonstration: neovim.sh TARVIK SOURCE-DIRECTORY
set -euo pipefail
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
cp -r "$2/database" "$scratch/database"
export TARVIK=$1 EDITOR_FILES=$2/editors/vim DATABASE=$scratch/database
export HOME=$scratch XDG_CONFIG_HOME=$scratch/config XDG_DATA_HOME=$scratch/data XDG_STATE_HOME=$scratch/state XDG_CACHE_HOME=$scratch/cache
nvim --headless -n -u "$2/tests/cli/lsp/neovim.lua"
"$1" lint "$DATABASE"
