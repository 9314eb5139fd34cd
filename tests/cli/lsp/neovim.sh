#!/usr/bin/env bash
# Runs neovim.lua on a copy of the demonstration, and neovim_family.lua in an empty directory:
# neovim.sh TARVIK SOURCE-DIRECTORY SCRIPT
set -euo pipefail
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
tests=$2/tests/cli/lsp
export TARVIK=$1 EDITOR_FILES=$2/editors/vim CLIENT=$tests/neovim_client.lua DATABASE=$scratch/database
export HOME=$scratch XDG_CONFIG_HOME=$scratch/config XDG_DATA_HOME=$scratch/data XDG_STATE_HOME=$scratch/state XDG_CACHE_HOME=$scratch/cache
if [ "$3" = neovim.lua ]; then
  cp -r "$2/database" "$DATABASE"
else
  mkdir "$DATABASE"
fi
nvim --headless -n -u "$tests/$3"
"$TARVIK" lint --strict "$DATABASE"
"$TARVIK" format --check "$DATABASE"
if [ "$3" = neovim_family.lua ]; then
  export TARVIK_DATABASE=$DATABASE
  [ "$("$TARVIK" devices --family sparrow | wc -l)" -eq 11 ]
  "$TARVIK" check SW110 --mode SM --output USB2 --package PQ208 --operation PROGRAM
  if "$TARVIK" check SW20 --mode SM --package TQ100; then exit 1; fi
  [ "$("$TARVIK" operations SW110 --mode BS --output USB2)" = $'PROGRAM  Program\nVERIFY   Verify' ]
  [ "$("$TARVIK" options SW90 --mode BS --output USB2)" = ERASE ]
fi
