#!/usr/bin/env bash
# Makes the Debian packages from the committed tree, and uses them: the samples are built against what the
# packages hold and run. Needs debhelper, dpkg-dev and fakeroot besides the packages of ./dev setup linux.
set -euo pipefail
cd "$(dirname "$0")/.."
top=$PWD/build/debian
rm -rf "$top"
mkdir -p "$top/source"
git archive HEAD | tar -x -C "$top/source"
cp -r packaging/debian "$top/source/debian"
(cd "$top/source" && dpkg-buildpackage --build=binary --no-sign --jobs=auto) >"$top/build.log" 2>&1 || {
  tail -n 30 "$top/build.log" >&2
  exit 1
}
for package in "$top"/*.deb; do dpkg-deb --extract "$package" "$top/root"; done
cmake -S samples -B "$top/samples" -G Ninja -DCMAKE_PREFIX_PATH="$top/root/usr" >>"$top/build.log"
cmake --build "$top/samples" >>"$top/build.log"
library=$(dirname "$(find "$top/root" -name 'libqxcore11e.so.11')")
LD_LIBRARY_PATH=$library "$top/samples/hello" samples/texts/files/utf8-french.txt
ls "$top"/*.deb
