#!/usr/bin/env bash
# Arguments as a shell gives them reach a Windows program as paths it can open, and the rest unchanged,
# whatever the caller's locale is.
set -euo pipefail
tools=$(cd "$(dirname "$0")/../../tools" && pwd)
. "$tools/lib/windows_arguments.sh"

folder=$(mktemp -d)/"Fotos für 写真"
trap 'rm -rf "$(dirname "$folder")"' EXIT
mkdir "$folder"
cd "$folder"
touch 'été 1.png' "it's 100% & (new)=[1].png" 'größer.png'

windows_arguments --exposure -1.5 "--trace=$folder/calls" 'été 1.png' "./it's 100% & (new)=[1].png" \
    "$folder/größer.png" 'a "quoted" word' "$folder/missing.png"
unset LANG LC_CTYPE LC_MESSAGES
actual=$("$tools/wine-run" "$1" "${WINDOWS_ARGUMENTS[@]}" 2>&1 >/dev/null | tr -d '\r' || true)

expected="develop: été 1.png: is empty
develop: ./it's 100% & (new)=[1].png: is empty
develop: Z:$folder/größer.png: is empty
develop: a \"quoted\" word: no such file
develop: Z:$folder/missing.png: no such file"
diff <(printf '%s\n' "$expected") <(printf '%s\n' "$actual")
test -s calls
