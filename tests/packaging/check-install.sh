#!/usr/bin/env bash
# Installs the build into a temporary prefix, validates the desktop entry and the AppStream metadata,
# and builds and runs the example host application against the installed CMake package.
# Usage: check-install.sh BUILD_DIR SOURCE_DIR
set -euo pipefail
build=$1
source=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
prefix="$work/prefix"

cmake --install "$build" --prefix "$prefix" >/dev/null
for f in lib/cmake/Cadenza/CadenzaConfig.cmake include/cadenza/voice-popup/CZVoicePopUpButton.h \
         include/cadenza/cadenza_export.h bin/quillond bin/cadenza bin/cadenza-settings \
         share/applications/org.cadenza.Settings.desktop share/metainfo/org.cadenza.Settings.metainfo.xml \
         share/polkit-1/actions/org.cadenza.remove-speech-bundle.policy share/cadenza/SpeechDataDefaults.plist; do
  [ -e "$prefix/$f" ] || { echo "not installed: $f" >&2; exit 1; }
done
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
