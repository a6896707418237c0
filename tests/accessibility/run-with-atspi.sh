#!/usr/bin/env bash
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
# Runs cadenza-settings under Xvfb with the accessibility bus, the real daemon and the sample repository
# (served slowly over loopback HTTP, so a download stays in progress for a while), then runs a Python
# script that reads the application over AT-SPI and drives it with xdotool key events.
# Usage: run-with-atspi.sh BUILD_DIR SOURCE_DIR SCRIPT.py
set -euo pipefail

if [ -z "${CADENZA_UNDER_XVFB:-}" ]; then
  export CADENZA_UNDER_XVFB=1
  exec xvfb-run -a -s "-screen 0 1280x1024x24" "$0" "$@"
fi

build=$1
source=$2
script=$3
world=$(mktemp -d -t cadenza-a11y.XXXXXX)
pids=()
cleanup() {
  for ((i = ${#pids[@]} - 1; i >= 0; i--)); do kill "${pids[$i]}" 2>/dev/null || true; done
  wait 2>/dev/null || true
  rm -rf "$world"
}
trap cleanup EXIT
mkdir -p "$world"/{home,config,data,root,shots}
mkdir -m 0700 "$world/runtime"
export HOME="$world/home" XDG_CONFIG_HOME="$world/config" XDG_DATA_HOME="$world/data"
export XDG_RUNTIME_DIR="$world/runtime" CADENZA_ROOT="$world/root" LANGUAGE=en_US LANG=C.UTF-8
export QT_QPA_PLATFORM=xcb QT_LINUX_ACCESSIBILITY_ALWAYS_ON=1 PYTHONDONTWRITEBYTECODE=1
export CADENZA_CLI="$build/apps/cadenza/cadenza" CADENZA_SHOTS="${CADENZA_SCREENSHOTS:-$world/shots}"
mkdir -p "$CADENZA_SHOTS"

# The accessibility bus of this private session.
if [ -z "${DBUS_SESSION_BUS_ADDRESS:-}" ]; then
  echo "run-with-atspi.sh needs a session bus (run it under dbus-run-session)" >&2
  exit 1
fi
/usr/libexec/at-spi-bus-launcher --launch-immediately >"$world/atspi.log" 2>&1 &
pids+=($!)

"$source/scripts/install-sample-voices" --root "$CADENZA_ROOT" >/dev/null
/usr/bin/python3 "$source/tests/accessibility/slow_repository.py" "$build/data/repository" 20 >"$world/port" &
pids+=($!)
for _ in $(seq 50); do [ -s "$world/port" ] && break; sleep 0.1; done
port=$(cat "$world/port")
"$build/daemon/quillond" --repository "http://127.0.0.1:$port" 2>"$world/quillond.log" &
pids+=($!)
for _ in $(seq 100); do "$CADENZA_CLI" status >/dev/null 2>&1 && break; sleep 0.1; done

"$build/apps/cadenza-settings/cadenza-settings" 2>"$world/settings.log" &
pids+=($!)
main=$(timeout 20 xdotool search --sync --onlyvisible --name '^Speech$' | head -1)
xdotool windowfocus --sync "$main"

status=0
/usr/bin/python3 "$script" || status=$?
if [ "$status" -ne 0 ]; then
  import -window root "$CADENZA_SHOTS/failure.png" 2>/dev/null || true
  echo "--- cadenza-settings log"; tail -20 "$world/settings.log"
  echo "--- quillond log"; tail -20 "$world/quillond.log"
fi
exit "$status"
