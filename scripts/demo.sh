#!/usr/bin/env bash
# Runs a recording through the sensor hub, the library and three clients, and prints what each client receives:
#
#   scripts/demo.sh TOOL [OPTION...]    options of `senseloom sense`, such as --plot
#
# Somebody sits, gets up, walks to the stairs and climbs them; then somebody draws a digit.
set -euo pipefail
tool=$1
data=$(realpath --relative-to=. "$(dirname "$0")/../data")
"$tool" sense "$data/activity/continuous_09_person5.csv.gz" "$data/demo/digit_3.csv.gz" \
  --session 'nav=PHYAC:{"mode":1,"logN":3,"weightVar":2}' \
  --session 'fitness=SCOUN:{"mode":0,"logN":1}' \
  --session dial=GSPX "${@:2}" | "$tool" replay -
