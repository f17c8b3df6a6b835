#!/bin/sh
# symbols.sh LIBRARY: the exported symbols of the library, as a package lists them. After a wanted
# change: packaging/symbols.sh build/release/lib/libzelmar.so >packaging/libzelmar1.symbols
set -eu
echo 'libzelmar.so.1 libzelmar1 #MINVER#'
nm --dynamic --defined-only "$1" | LC_ALL=C awk '
    { sub(/@@/, "@", $3); print " " ($3 ~ /@/ ? $3 : $3 "@" $3) " 1.0.0" }' | LC_ALL=C sort
