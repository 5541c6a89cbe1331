#!/usr/bin/env bash
# Fails when Android.bp links other libraries than the build, or names a file that does not exist:
# check_blueprint.sh ROOT READELF LIBRARY
set -euo pipefail
blueprint=$1/Android.bp

# The strings of a property, one a line.
property() {
  tr '\n' ' ' <"$blueprint" | grep -oE "\b$1: *(\[[^]]*\]|\"[^\"]*\")" | grep -oE '"[^"]*"' | tr -d '"'
}

# On Android the C++ and the C library are there without being named.
linked=$("$2" --dynamic --wide "$3" | sed -nE 's/.*\(NEEDED\).*\[(lib[a-z]+)\.so.*/\1/p' | grep -vxE 'libc|libm|libgcc_s')
diff <(property shared_libs | sort) <(grep -v '+' <<<"$linked" | sort)
for file in $(property version_script) $(property export_include_dirs) $(property local_include_dirs); do
  [ -e "$1/$file" ] || { echo "Android.bp names $file, which does not exist"; exit 1; }
done
