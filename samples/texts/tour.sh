#!/usr/bin/env bash
# Shows what qxtool makes of the sample texts: detects all of them, converts a few to UTF-8 in a
# temporary folder and prints the beginning of what came out. Usage: tour.sh QXTOOL [WRAPPER...]
set -euo pipefail
if [ $# -lt 1 ]; then
  echo "usage: tour.sh QXTOOL" >&2
  exit 2
fi
tool=$(realpath "$1")
cd "$(dirname "$0")/files"

echo "What the sample texts are, as detected from their bytes alone:"
echo
"$tool" detect -- *

out=$(mktemp -d)
trap 'rm -rf "$out"' EXIT

# show FILE [OPTIONS]: converts FILE to UTF-8 and prints its first two lines.
show() {
  local file=$1
  shift
  echo
  echo "\$ qxtool convert${*:+ $*} $file OUT"
  # 3: converted, but some characters were lost.
  "$tool" convert "$@" "$file" "$out/$file" || [ $? = 3 ]
  head -n 2 "$out/$file" | tr -d '\r' | sed 's/^/    /'
}

echo
echo "A few of them as UTF-8. Detected:"
show utf16le-bom-japanese.txt
show windows1252-spanish.txt
show late-accent.txt
echo
echo "Named, where the bytes alone do not tell one code page from another:"
show windows1251-russian.txt --from windows-1251
show shiftjis-japanese.txt --from shift_jis
show koi8r-russian.txt --from koi8-r
show oem437-menu.txt --from Cp437
echo
echo "Damaged: what could not be read is replaced, and the tool says so."
show damaged-utf8.txt --from UTF-8
