#!/bin/sh
# Formatting of every tracked source, and clang-tidy on those changed since the published branch's last commit but one, the
# work tree included. A changed header is looked at through one source that includes it.
set -eu
cd "$(dirname "$0")/.."
root=$(pwd)

# The clone may belong to somebody else than the one who checks it.
git() { command git -c safe.directory="$root" "$@"; }

git ls-files '*.cpp' '*.h' | xargs -r clang-format --dry-run -Werror
echo "formatting: $(git ls-files '*.cpp' '*.h' | wc -l) files are as .clang-format wants them"

base=$(git rev-parse -q --verify 'origin/HEAD~' || git rev-parse -q --verify 'HEAD~' ||
  git hash-object -t tree /dev/null)

changed() {
  git diff --name-only --diff-filter=d "$base" -- '*.cpp'
  git diff --name-only --diff-filter=d "$base" -- '*.h' | while read -r header; do
    git grep -l --fixed-strings "/${header##*/}\"" -- '*.cpp' | head -n 1
  done
}

cmake --preset tidy >/dev/null
# Only what the build compiles: the install test's program belongs to another project.
sources=$(changed | sort -u | while read -r source; do
  ! grep -qF "\"file\": \"$root/$source\"" build/tidy/compile_commands.json || echo "$source"
done)
echo "$sources" | xargs -r -n 4 -P "$(nproc)" clang-tidy --quiet -p build/tidy
echo "clang-tidy: $(echo "$sources" | grep -c .) sources are clean"
