#!/usr/bin/env bash
# Arguments as a shell gives them reach a Windows program as paths it can open, and the rest unchanged,
# whatever the caller's locale is.
set -euo pipefail
tools=$(cd "$(dirname "$0")/../../tools" && pwd)
. "$tools/lib/windows_arguments.sh"

folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT
mkdir "$folder/Fotos für 写真"
cd "$folder/Fotos für 写真"
touch 'été 1.png' "it's 100% & (new)=[1].png"

windows_arguments --exposure -1.5 --spots=12 0.5 '' 'a "quoted" \\ word\' \
    'été 1.png' './été 1.png' "it's 100% & (new)=[1].png" "$PWD/été 1.png" --output "$folder" \
    "--trace=$PWD/été 1.png" "$PWD/missing.png"
unset LANG LC_CTYPE LC_MESSAGES
actual=$("$tools/wine-run" "$1" "${WINDOWS_ARGUMENTS[@]}" | tr -d '\r')

expected="--exposure|-
-1.5|-
--spots=12|-
0.5|-
|-
a \"quoted\" \\\\ word\\|-
été 1.png|file
./été 1.png|file
it's 100% & (new)=[1].png|file
Z:$PWD/été 1.png|file
--output|-
Z:$folder|file
--trace=Z:$PWD/été 1.png|-
Z:$PWD/missing.png|-"
diff <(printf '%s\n' "$expected") <(printf '%s\n' "$actual")
