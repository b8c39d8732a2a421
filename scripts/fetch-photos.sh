#!/usr/bin/env bash
# Puts two photographs for the kernel tests in build/photos: camera.png (512x512 grey)
# and astronaut.png (512x512 RGB), taken from Debian's python3-skimage package, which is
# downloaded and unpacked, not installed. The photograph tests skip when they are absent.
set -euo pipefail
cd "$(dirname "$0")/.."
dest=build/photos
if [ -f "$dest/camera.png" ] && [ -f "$dest/astronaut.png" ]; then exit 0; fi
work=$(mktemp -d)
chmod 755 "$work"  # apt downloads as its own user
trap 'rm -rf "$work"' EXIT
(cd "$work" && apt-get download -q python3-skimage >/dev/null && dpkg-deb -x python3-skimage_*.deb unpacked)
mkdir -p "$dest"
for f in camera.png astronaut.png; do
  cp "$(find "$work/unpacked" -path "*skimage/data/$f" | head -1)" "$dest/$f"
done
echo "photographs in $dest"
