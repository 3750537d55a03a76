#!/usr/bin/env bash
# PublishSample.sh INSTALLED WORK [LYRA]: the installed command publishes the sample as1 with its model under Wine; what it
# drew is compared with what LYRA, a command for this system, draws of it.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/../.."
installed=$1 work=$2 lyra=${3-}
rm -rf "$work"
mkdir -p "$work"
result=samples/as1.clash.xml model=samples/as1-oc-214.stp

Fail() { echo "windows: $1" >&2; exit 1; }
start=$(date +%s.%N)
/usr/lib/wine/wine64 "$installed/bin/lyra.exe" publish $result --model $model -o "Z:${work//\//\\}\\windows"
seconds=$(awk "BEGIN { printf \"%.1f\", $(date +%s.%N) - $start }")
[ -s "$work/windows/index.html" ] || Fail "no page was published"
left=$(find "$work/windows" -name '.lyra-unfinished')
[ -z "$left" ] || Fail "publishing left $left behind"
drawn=$(find "$work/windows/pictures" -name '*.jpg' -o -name '*.png' | wc -l)
echo "windows: the zip's command published a page and $drawn pictures in $seconds s"

if [ -z "$lyra" ]; then
  echo "windows: no command for this system was found, so the pictures were not compared: see --compare-with"
  exit 0
fi
"$lyra" publish $result --model $model -o "$work/own" || Fail "$lyra did not publish it, so the pictures were not compared"
/usr/bin/python3 packaging/windows/ComparePictures.py "$work/windows/pictures" "$work/own/pictures"
