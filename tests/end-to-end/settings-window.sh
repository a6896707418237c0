#!/usr/bin/env bash
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
# cadenza-settings driven through real X input under Xvfb, with the real daemon on the sample
# repository: open the voice pop-up, choose "Customize…", find and tick a downloadable voice, press OK;
# the daemon installs it; the pop-up lists it and it becomes the system voice. A screenshot is taken
# at every step (into $CADENZA_SCREENSHOTS when set).
# Usage: settings-window.sh BUILD_DIR SOURCE_DIR
set -euo pipefail

if [ -z "${CADENZA_UNDER_XVFB:-}" ]; then
  export CADENZA_UNDER_XVFB=1
  exec xvfb-run -a -s "-screen 0 1280x1024x24" "$0" "$@"
fi

build=$1
source=$2
world=$(mktemp -d -t cadenza-e2e.XXXXXX)
pids=()
cleanup() {
  for pid in "${pids[@]}"; do kill "$pid" 2>/dev/null || true; done
  wait 2>/dev/null || true
  rm -rf "$world"
}
trap cleanup EXIT
mkdir -p "$world"/{home,config,data,root}
mkdir -m 0700 "$world/runtime"
export HOME="$world/home" XDG_CONFIG_HOME="$world/config" XDG_DATA_HOME="$world/data"
export XDG_RUNTIME_DIR="$world/runtime" CADENZA_ROOT="$world/root" LANGUAGE=en_US LANG=C.UTF-8
export QT_QPA_PLATFORM=xcb
shots=${CADENZA_SCREENSHOTS:-$world/shots}
mkdir -p "$shots"
cli="$build/apps/cadenza/cadenza"
step=0
shot() {
  step=$((step + 1))
  import -window root "$shots/$step-$1.png"
  echo "screenshot $shots/$step-$1.png"
}
fail() {
  shot failure || true
  echo "FAIL: $*" >&2
  exit 1
}
wait_for() { # seconds, command...
  local limit=$1
  shift
  for _ in $(seq $((limit * 10))); do
    if "$@" >/dev/null 2>&1; then return 0; fi
    sleep 0.1
  done
  return 1
}

CADENZA_BUILD_DIR="$build" "$source/scripts/install-sample-voices" --root "$CADENZA_ROOT" >/dev/null
"$build/daemon/quillond" --repository "file://$build/data/repository" 2>"$world/quillond.log" &
pids+=($!)
wait_for 10 "$cli" status || fail "quillond did not start"

"$build/apps/cadenza-settings/cadenza-settings" 2>"$world/settings.log" &
pids+=($!)
main=$(xdotool search --sync --onlyvisible --name '^Speech$' | head -1)
xdotool windowfocus --sync "$main"
sleep 1
shot main-window

# The voice pop-up has the focus: open it, go to its last item and choose it.
xdotool key space
sleep 1
shot voice-menu-open
xdotool key End Return
sheet=$(timeout 10 xdotool search --sync --onlyvisible --name '^Customize Voices$' | head -1) \
  || fail "the customise voices sheet did not open"
sleep 1
shot customize-sheet

# Search for Femke, select her row and tick it, then OK (the default button).
xdotool type --delay 50 "Femke"
sleep 1
xdotool key Tab Down space
sleep 1
shot femke-ticked
xdotool key Return
wait_for 5 sh -c "! xdotool search --onlyvisible --name '^Customize Voices$'" || fail "the sheet did not close"

bundle="$XDG_DATA_HOME/cadenza/voices/FemkeCompact.SpeechVoice"
wait_for 30 test -f "$bundle/Info.plist" || fail "Femke was not installed"
sleep 3 # the finished notification rebuilds every voice menu
shot installed

# Femke is in the menu now: choose her as the system voice.
xdotool windowfocus --sync "$main"
xdotool key space
sleep 1
shot menu-with-femke
xdotool type --delay 50 "Femke"
xdotool key Return
sleep 2
shot femke-chosen

"$cli" voices | grep -q '^\* com.vendra.speech.synthesis.voice.femke.compact ' \
  || fail "Femke is not the system voice: $("$cli" voices | grep '^\*')"
echo "PASS: Femke was downloaded through cadenza-settings and is the system voice"
