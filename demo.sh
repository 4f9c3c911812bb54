#!/usr/bin/env bash
# Sets up what is missing, builds the library and the tool, sends test patterns and pictures to the GPU and back,
# and draws them with Cg programs on planes, with boxes and polylines over them. With --window it then shows them.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")"
case "${1-}" in
    "" | --window) ;;
    *) echo "usage: $0 [--window]" >&2; exit 2 ;;
esac
scripts/install-packages build
scripts/configure release
cmake --build --preset release
fwzel=build/release/tools/fwzel
"$fwzel" roundtrip demo/mountains.png --interlaced demo/mountains.ppm --out out

# One pixel of the pattern a pixel of the frame: the drawn frame is the pattern.
for size in 1920x1080 1280x720; do
    cmp <("$fwzel" play combi --size "$size" --upload pbo --out - 2>/dev/null) \
        <("$fwzel" pattern combi --size "$size" -o -)
    echo "combi at $size: the drawn frame equals the pattern byte for byte"
done

play() { # NAME OPTION...
    echo "fwzel play ${*:2}"
    "$fwzel" play "${@:2}" --stats --out "out/play-$1-%d.png"
}
lines=(--box -0.6,-0.35,0.6,0.35 --polyline -0.5,-0.2,0,0.3,0.5,-0.2 --closed --colour 1,0.6,0 --line-width 3)
play plane combi "${lines[@]}" --upload producer
play fields circle --size 1280x720 --fields --frames 2
play weave demo/mountains.ppm --fields --program host/Cg/field_weave.cg
play rgb hv-ramp --size 1280x720 --program host/Cg/ycbcr_to_rgb.cg
play key demo/mountains.png --size 640x360 --program host/Cg/key_over_checkerboard.cg --param cell=20
play overlay h-sweep --size 1280x720 --program host/Cg/ycbcr_to_rgb.cg --half --tessellation 16x9 \
    "${lines[@]}" --move --frames 30 --stats-window 10 --overlay
cat <<'END'
Look at
  out/play-plane-0.png        a pattern on a plane, with a box and a polyline over it
  out/play-fields-[01].png    the even and the odd field of a picture, each on its frame lines
  out/play-weave-0.png        both fields woven into the frame by a Cg program
  out/play-rgb-0.png          all chroma values, converted from Y'CbCr by a Cg program
  out/play-key-0.png          a picture over a checkerboard, as far as its key lets it through
  out/play-overlay-29.png     moving lines and the stage times
  out/contact-sheet.png       every pattern after its way to the GPU and back
END
[[ ${1-} != --window ]] || exec "$fwzel" play --surface window --size 1280x720 --overlay "${lines[@]}" --move
