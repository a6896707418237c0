#!/usr/bin/env bash
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
# The main job's start-up in a private world: with no daemon, scripts/start-quillond starts one
# (decided by 'cadenza status' exiting with 3) and it answers; run again, it starts no second one.
# Then cadenza-settings --screenshots, on that daemon, leaves a picture of a download in progress.
# Usage: main-startup.sh BUILD_DIR SOURCE_DIR
set -euo pipefail

build=$1
source=$2
world=$(mktemp -d -t cadenza-main.XXXXXX)
pids=()
cleanup() {
  for pid in "${pids[@]}"; do kill "$pid" 2>/dev/null || true; done
  [ -n "${KEEP_WORLD:-}" ] || rm -rf "$world"
}
trap cleanup EXIT
mkdir -p "$world"/{home,config,data,cache,root}
mkdir -m 0700 "$world/runtime"
export HOME="$world/home" XDG_CONFIG_HOME="$world/config" XDG_DATA_HOME="$world/data"
export XDG_CACHE_HOME="$world/cache" XDG_RUNTIME_DIR="$world/runtime" CADENZA_ROOT="$world/root"
export LANGUAGE=en_US LANG=C.UTF-8 QT_QPA_PLATFORM=offscreen
cli="$build/apps/cadenza/cadenza"
fail() {
  echo "FAIL: $*" >&2
  exit 1
}

"$source/scripts/install-sample-voices" --root "$CADENZA_ROOT" >/dev/null

set +e
"$cli" status >/dev/null 2>&1
before=$?
set -e
[ "$before" = 3 ] || fail "'cadenza status' without a daemon exited with $before, not 3"

pid=$("$source/scripts/start-quillond" "$build" --repository "file://$build/data/repository" --file-rate 64)
[ -n "$pid" ] || fail "start-quillond started no daemon"
pids+=("$pid")
kill -0 "$pid" || fail "the daemon it started is not running"
"$cli" status >/dev/null || fail "'cadenza status' does not reach the daemon that was started"

again=$("$source/scripts/start-quillond" "$build" --repository "file://$build/data/repository")
[ -z "$again" ] || { pids+=("$again"); fail "a second daemon was started (pid $again)"; }

shots="$world/shots"
"$build/apps/cadenza-settings/cadenza-settings" --screenshots "$shots" >/dev/null
for picture in customize-voices.png customize-voices-ticked.png main-window-downloading.png customize-voices-downloading.png; do
  [ -s "$shots/$picture" ] || fail "no $picture"
done
"$cli" status | grep -q "downloading" || fail "the daemon is not downloading what the settings asked for"
echo "PASS"
