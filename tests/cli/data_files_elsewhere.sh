#!/usr/bin/env bash
# Other programs understand our data files: GDAL the place, also turned, and the values; netCDF's own tools the rest.
set -euo pipefail
tervane="$1" make="$2"
for tool in gdalinfo gdallocationinfo ncdump ncgen; do
  command -v "$tool" >/dev/null || { echo "skipped: $tool is missing"; exit 77; }
done
folder="$(mktemp -d)"
trap 'rm -rf "$folder"' EXIT
cd "$folder"
"$make" .

expect() { # expect "where it should stand" "what" TEXT
  [[ "$3" == *"$2"* ]] || { printf '%s should tell %s, but tells\n%s\n' "$1" "$2" "$3"; exit 1; }
}
straight="$(gdalinfo straight.nds2 2>&1)"
expect "gdalinfo" "Driver: netCDF" "$straight"
expect "gdalinfo" "Origin = (500000." "$straight"
expect "gdalinfo" "Pixel Size = (50.000000000000000,-50.000000000000000)" "$straight"
expect "gdalinfo" "UTM zone 32N" "$straight"
expect "gdalinfo" "NoData Value=-1" "$straight"
# Row 0 is the south: the second row from there is the second from below.
[ "$(gdallocationinfo -valonly -geoloc straight.nds2 500125 6000075)" = 7 ]

turned="$(gdalinfo turned.nds2 2>&1)"
expect "gdalinfo" "GeoTransform" "$turned"
expect "gdalinfo" "Local plane" "$turned"
# The corners of a grid of 5 x 3 cells of 50 m around 1000, 2000, turned by 30 degrees.
expect "gdalinfo" "1216.506, 2125.000" "$(tr -s ' ' <<<"$turned" | sed 's/( /(/g')"

layers="$(ncdump -t -v time,time_bnds layers.nds3)"
expect "ncdump" 'Rain:cell_methods = "time: mean"' "$layers"
expect "ncdump" 'time = "2001-01-02", "2001-01-03"' "$layers"
expect "ncdump" '"2001-01-01", "2001-01-02"' "$layers"
[ "$(ncdump -k layers.nds3)" = "64-bit offset" ]
[ "$(ncdump -k packed.nds2)" = "netCDF-4" ]

# What passed through another program's hands is still understood.
ncdump layers.nds3 | ncgen -k nc4 -o again.nds3
for command in info stats; do
  before="$("$tervane" data $command layers.nds3)" after="$("$tervane" data $command again.nds3)"
  expect "data $command of the copy" "${before//layers.nds3/again.nds3}" "$after"
done
gdal_translate -q -of netCDF straight.nds2 foreign.nc
expect "data info" "cells of 50 m from 500000, 6000000" "$("$tervane" data info foreign.nc 2>&1)"
[ "$("$tervane" data stats foreign.nc 2>/dev/null | sed 's/.*: smallest/smallest/')" = \
  "$("$tervane" data stats straight.nds2 | sed 's/.*: smallest/smallest/')" ]

# A turned grid as GeoTIFF: the corners, the missing values and the rows are where they were.
"$tervane" export turned.nds2 turned.tif
tif="$(gdalinfo turned.tif 2>&1)"
expect "gdalinfo" "Driver: GTiff" "$tif"
expect "gdalinfo" "1216.506, 2125.000" "$(tr -s ' ' <<<"$tif" | sed 's/( /(/g')"
expect "gdalinfo" "NoData Value=-1e+30" "$tif"
# Cell (2, 1) of the south is in the second row of three from the north as well; cell (0, 2) in the first.
[ "$(gdallocationinfo -valonly turned.tif 2 1)" = 7 ]
[ "$(gdallocationinfo -valonly turned.tif 0 0)" = 10 ]
