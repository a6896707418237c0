#!/usr/bin/env bash
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
# Installs the build into a temporary prefix (and staged into a DESTDIR), checks that nothing lands
# outside it and that the units and the policy name the programs there, validates the desktop entry
# and the AppStream metadata, checks that the installed headers are the public ones and name no test
# double and no platform implementation, and builds and runs the example host application and a
# program including every public header against the installed CMake package.
# Usage: check-install.sh BUILD_DIR SOURCE_DIR
set -euo pipefail
build=$1
source=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
prefix="$work/prefix"

# Every installed file must land below the prefix given when installing (not the configured one),
# and the files that name programs must name them there.
check_staged() { # ROOT PREFIX: files were installed into ROOT and will run from PREFIX
  local root=$1 run_prefix=$2 outside
  # The manifest names files as they will run, without DESTDIR.
  outside=$(grep -v "^$run_prefix/" "$build/install_manifest.txt" || true)
  if [ -n "$outside" ]; then
    echo "installed outside $run_prefix:" >&2
    echo "$outside" >&2
    exit 1
  fi
  for f in lib/cmake/Cadenza/CadenzaConfig.cmake include/cadenza/Cadenza/CZVoicePopUpButton \
           include/cadenza/cadenza_export.h bin/quillond bin/cadenza bin/cadenza-settings \
           lib/systemd/user/quillond.service lib/systemd/user/quillond.socket \
           share/applications/org.cadenza.Settings.desktop share/metainfo/org.cadenza.Settings.metainfo.xml \
           share/polkit-1/actions/org.cadenza.remove-speech-bundle.policy share/cadenza/SpeechDataDefaults.plist; do
    [ -e "$root/$f" ] || { echo "not installed: $f" >&2; exit 1; }
  done
  local exec_start helper dictation
  dictation=$(sed -n 's/^Exec=\([^ ]*\).*/\1/p' "$root/share/dbus-1/services/org.cadenza.Dictation.service")
  [ "$dictation" = "$run_prefix/libexec/cadenza-dictation" ] || { echo "the bus would start '$dictation'" >&2; exit 1; }
  [ -x "$root${dictation#"$run_prefix"}" ] || { echo "no dictation engine at $dictation" >&2; exit 1; }
  exec_start=$(sed -n 's/^ExecStart=\([^ ]*\).*/\1/p' "$root/lib/systemd/user/quillond.service")
  [ "$exec_start" = "$run_prefix/bin/quillond" ] || { echo "quillond.service starts '$exec_start'" >&2; exit 1; }
  [ -x "$root${exec_start#"$run_prefix"}" ] || { echo "no daemon at $exec_start" >&2; exit 1; }
  helper=$(sed -n 's/.*policykit.exec.path">\([^<]*\)<.*/\1/p' \
    "$root/share/polkit-1/actions/org.cadenza.remove-speech-bundle.policy")
  case $helper in
    "$run_prefix"/*) [ -x "$root${helper#"$run_prefix"}" ] || { echo "no helper at $helper" >&2; exit 1; } ;;
    *) echo "the policy names '$helper', outside $run_prefix" >&2; exit 1 ;;
  esac
}

# Staged for packaging: DESTDIR holds what will run from another prefix.
DESTDIR="$work/stage" cmake --install "$build" --prefix /opt/cadenza-staged >/dev/null
check_staged "$work/stage/opt/cadenza-staged" /opt/cadenza-staged
outside=$(find "$work/stage" -mindepth 1 -not -path "$work/stage/opt" -not -path "$work/stage/opt/cadenza-staged*")
[ -z "$outside" ] || { echo "staged outside the prefix: $outside" >&2; exit 1; }

cmake --install "$build" --prefix "$prefix" >/dev/null
check_staged "$prefix" "$prefix"
# A session bus that knows only the installed services starts the dictation engine on the first call;
# the engine answers (here with the error for a language that is not installed).
cat >"$work/bus.conf" <<XML
<!DOCTYPE busconfig PUBLIC "-//freedesktop//DTD D-Bus Bus Configuration 1.0//EN"
 "http://www.freedesktop.org/standards/dbus/1.0/busconfig.dtd">
<busconfig>
  <type>session</type>
  <listen>unix:tmpdir=$work</listen>
  <servicedir>$prefix/share/dbus-1/services</servicedir>
  <policy context="default">
    <allow send_destination="*"/><allow receive_sender="*"/><allow own="*"/><allow user="*"/>
  </policy>
</busconfig>
XML
# Installed into a prefix the loader does not search: the bus passes its environment on to the engine.
# The answer goes to a file, not a pipe: the engine the bus starts inherits the bus's output and stays
# until its idle time runs out, so reading a pipe to its end would wait for it. It is stopped below.
LD_LIBRARY_PATH="$(dirname "$(find "$prefix" -name 'libcadenzacore.so.*' -type f | head -1)")" \
  dbus-run-session --config-file="$work/bus.conf" -- dbus-send --session --print-reply \
  --dest=org.cadenza.Dictation /org/cadenza/Dictation org.cadenza.Dictation.PreHeat string:xx_XX \
  >"$work/answer" 2>&1 || true
pkill -f "^$prefix/libexec/cadenza-dictation" || true
answer=$(cat "$work/answer")
case $answer in
  *org.cadenza.Dictation.Error.Failed*xx_XX*) ;;
  *) echo "the bus did not start the dictation engine: $answer" >&2; exit 1 ;;
esac
# The installed library finds its installed engine plugins: a flite voice and an espeak-ng voice speak
# through the installed cadenza.
libdir=$(dirname "$(find "$prefix" -name 'libcadenzacore.so.*' -type f | head -1)")
for plugin in cadenza_espeak_ng.so cadenza_flite.so; do
  [ -e "$libdir/cadenza/speech-engines/$plugin" ] || { echo "not installed: $plugin" >&2; exit 1; }
done
mkdir -p "$work/data/cadenza/voices" "$work/config"
cp -R "$build/data/sample-voices/MarenPremium.SpeechVoice" "$build/data/sample-voices/MarenCompact.SpeechVoice" \
  "$work/data/cadenza/voices/"
for quality in premium compact; do
  env -u CADENZA_PLUGIN_PATH LD_LIBRARY_PATH="$libdir" XDG_DATA_HOME="$work/data" XDG_CONFIG_HOME="$work/config" \
    CADENZA_ROOT="$work/root" "$prefix/bin/cadenza" say --voice "com.vendra.speech.synthesis.voice.maren.$quality" \
    --output "$work/$quality.wav" "Hello from the installed engines."
  [ -s "$work/$quality.wav" ] || { echo "the installed cadenza did not speak with maren.$quality" >&2; exit 1; }
done

if find "$prefix/include" -name '*_p.h' | grep -q .; then
  echo "private headers were installed" >&2
  exit 1
fi
# No installed header names a test double or a platform implementation: the doubles are the classes of
# tests/doubles, the implementations the final classes of the source tree that implement one of the
# platform services (the interfaces Services.h names).
services_h=$(find "$source/src" -name Services.h | head -1)
interfaces=$(sed -n 's/^class \([A-Za-z]*\);$/\1/p' "$services_h" | paste -sd'|')
[ -n "$interfaces" ] || { echo "no service interfaces found in $services_h" >&2; exit 1; }
hidden=$( { grep -rhoE "^class ([A-Z_]+_EXPORT )?[A-Za-z]+ final : public ($interfaces)\b" "$source/src" \
              | sed -E 's/^class ([A-Z_]+_EXPORT )?([A-Za-z]+) .*/\2/'
            grep -rhoE '^class [A-Za-z]+' "$source/tests/doubles" | sed 's/^class //'; } | sort -u)
[ "$(echo "$hidden" | wc -l)" -ge 10 ] || { echo "too few implementations and doubles found: $hidden" >&2; exit 1; }
named=$(grep -rlwF "$hidden" "$prefix/include" || true)
if [ -n "$named" ]; then
  echo "installed headers name a test double or a platform implementation:" >&2
  grep -rnwF "$hidden" "$prefix/include" >&2
  exit 1
fi
desktop-file-validate "$prefix/share/applications/org.cadenza.Settings.desktop"
appstreamcli validate --no-net --pedantic "$prefix/share/metainfo/org.cadenza.Settings.metainfo.xml"

example_args=(-DCMAKE_PREFIX_PATH="$prefix")
if grep -q '^CADENZA_SANITIZE:BOOL=ON' "$build/CMakeCache.txt"; then
  # Libraries built with the sanitizers need a host built with them, so that their runtime loads first.
  example_args+=(-DCMAKE_CXX_FLAGS="-fsanitize=address,undefined" -DCMAKE_EXE_LINKER_FLAGS="-fsanitize=address,undefined")
fi
cmake -S "$source/examples/minimal-host" -B "$work/example" "${example_args[@]}" >/dev/null
cmake --build "$work/example" --parallel "$(nproc)" >/dev/null
LD_LIBRARY_PATH="$prefix/lib" QT_QPA_PLATFORM=offscreen "$work/example/minimal-host" --check

# Every public header compiles on its own against the installed package, so none of them includes a
# header that was left behind.
mkdir -p "$work/all-headers"
cat >"$work/all-headers/CMakeLists.txt" <<'CMAKE'
cmake_minimum_required(VERSION 3.25)
project(AllHeaders LANGUAGES CXX)
set(CMAKE_CXX_STANDARD 20)
set(CMAKE_AUTOMOC ON)
find_package(Cadenza 0.1 REQUIRED)
file(GLOB sources ${CMAKE_CURRENT_SOURCE_DIR}/*.cpp)
add_library(all-headers OBJECT ${sources})
target_link_libraries(all-headers PRIVATE Cadenza::Cadenza)
CMAKE
public_headers=0
for forwarding in "$prefix"/include/cadenza/Cadenza/*; do
  name=$(basename "$forwarding")
  printf '#include <Cadenza/%s>\n#include <Cadenza/%s>\n' "$name" "$name" >"$work/all-headers/$name.cpp"
  public_headers=$((public_headers + 1))
done
[ "$public_headers" -ge 10 ] || { echo "only $public_headers public headers installed" >&2; exit 1; }
cmake -S "$work/all-headers" -B "$work/all-headers/build" "${example_args[@]}" >/dev/null
cmake --build "$work/all-headers/build" --parallel "$(nproc)" >/dev/null

# The library of an installation whose prefix differs from the configured one finds the removal
# helper of that installation, the one its policy names.
mkdir -p "$work/helper-path"
cat >"$work/helper-path/CMakeLists.txt" <<'CMAKE'
cmake_minimum_required(VERSION 3.25)
project(HelperPath LANGUAGES CXX)
set(CMAKE_CXX_STANDARD 20)
find_package(Cadenza 0.1 REQUIRED)
add_executable(helper-path main.cpp)
target_include_directories(helper-path PRIVATE ${PRIVATE_HEADERS_DIR})
target_link_libraries(helper-path PRIVATE Cadenza::Core)
CMAKE
cat >"$work/helper-path/main.cpp" <<'CPP'
#include <core/services/AdministratorService.h>
#include <cstdio>
int main() { std::puts(qPrintable(Cadenza::Platform::PolkitAdministratorService::helperPath())); }
CPP
# The administrator service is private: its declaration comes from the source tree, its code from the
# installed library.
cmake -S "$work/helper-path" -B "$work/helper-path/build" "${example_args[@]}" \
  -DPRIVATE_HEADERS_DIR="$source/src" >/dev/null
cmake --build "$work/helper-path/build" >/dev/null
helper=$(env -u CADENZA_REMOVE_HELPER LD_LIBRARY_PATH="$prefix/lib" "$work/helper-path/build/helper-path")
configured=$(sed -n 's/^CMAKE_INSTALL_PREFIX:PATH=//p' "$build/CMakeCache.txt")
if [ -x "$configured/libexec/cadenza-remove-bundle" ]; then
  echo "skipping the moved helper check: an installation at $configured has a helper"
elif [ "$helper" != "$prefix/libexec/cadenza-remove-bundle" ]; then
  echo "the library looks for the removal helper at '$helper'" >&2
  exit 1
fi
