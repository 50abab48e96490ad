#!/usr/bin/env bash
# Real-window check of an installed MorvelGUI.
#
# Installs the build into a temporary prefix (program, stand-ins, their configuration files, the
# .desktop entry, the icon), copies a demo input file (and oxidation.dat) to a temporary folder,
# and starts the program as a launcher does from the installed entry: its Exec= command in the
# folder its Path= names (the home folder without one), on a virtual X display (Xvfb). Then it
# drives a whole job with xdotool:
#   default        Exec= without a file; Browse, the path typed into Qt's file dialog and Return;
#   --open-with    Exec= with %f filled in with the file, as "Open with MorvelGUI" does;
# any message box answered with its default button (OK), "Hand-made" chosen for quartz.in, Run.
# When MORVEL.OUT ends with "Normal end." it takes a screenshot, and a second one with the log
# scrolled to its end (<name>-log-end.png).
#
# Usage:  bash scripts/desktop-check.sh [--open-with] [rutile.cif | nacl.cif | quartz.in]   (default rutile.cif)
#   MORVEL_BUILD_DIR   build folder (default: build/)
#   MORVEL_SCREENSHOT  where the PNG goes (default: <build folder>/desktop-check.png)
#   MORVEL_PAD_RESULT_MB  when set, MORVEL.OUT gets that many MB of extra distance lines (a large result)
# Needs: Xvfb, xdotool, ImageMagick (apt-get install xvfb xdotool imagemagick); exit code 77 (skipped) without them
# or when the virtual display breaks before the program starts.
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
build=${MORVEL_BUILD_DIR:-$root/build}
open_with=0
if [ "${1:-}" = --open-with ]; then open_with=1; shift; fi
input=${1:-rutile.cif}
shot=${MORVEL_SCREENSHOT:-$build/desktop-check.png}

case "$input" in
  *.cif) format=cif; dialog_title="Select an input CIF file" ;;
  *.in) format=handmade; dialog_title="Select an input file" ;;
  *) echo "input must be one of the demo files: rutile.cif, nacl.cif or quartz.in" >&2; exit 2 ;;
esac
[ -f "$root/demo/$input" ] || { echo "no demo/$input" >&2; exit 2; }
for tool in Xvfb xdotool import cmake; do
  command -v "$tool" >/dev/null || { echo "$tool is missing: apt-get install xvfb xdotool imagemagick" >&2; exit 77; }
done

step() { echo "== $*"; }
fail() { echo "FAILED: $*" >&2; exit 1; }

# Polls a command for up to $1 tenths of a second; prints its output once it succeeds.
wait_for() {
  local tries=$1; shift
  local out
  for ((i = 0; i < tries; i++)); do
    if out=$("$@" 2>/dev/null) && [ -n "$out" ]; then
      echo "$out"
      return 0
    fi
    sleep 0.1
  done
  return 1
}
visible_window() { xdotool search --onlyvisible --name "$1" | head -n 1; }

step "build ($build)"
cmake -S "$root" -B "$build" >/dev/null
cmake --build "$build" -j2 --target MorvelGUI cif_parser morvel e2e_layout_probe >/dev/null

tmp=$(mktemp -d "${TMPDIR:-/tmp}/morvelgui-desktop.XXXXXX")
app_pid=
xvfb_pid=
cleanup() {
  local pid
  for pid in $app_pid $xvfb_pid; do
    kill "$pid" 2>/dev/null || true
    wait "$pid" 2>/dev/null || true
  done
  rm -rf "$tmp"
}
trap cleanup EXIT

step "install into a temporary prefix"
prefix="$tmp/pre fix"
cmake --install "$build" --prefix "$prefix" >/dev/null
desktop=$prefix/share/applications/morvelgui.desktop
for f in "$prefix/bin/MorvelGUI" "$prefix/libexec/morvelgui/cif_parser" "$prefix/libexec/morvelgui/morvel" \
         "$prefix/share/morvelgui/binaries.txt" "$desktop" "$prefix/share/icons/hicolor/64x64/apps/morvelgui.png"; do
  [ -e "$f" ] || fail "not installed: ${f#"$prefix"/}"
done
grep -qx 'MimeType=chemical/x-cif;' "$desktop" || fail "the entry declares no CIF file type"
if [ -n "${MORVEL_PAD_RESULT_MB:-}" ]; then
  # The installed stand-in's own result with distance lines added before its last line.
  cat >"$prefix/libexec/morvelgui/morvel-padded" <<WRAP
#!/usr/bin/env bash
"$prefix/libexec/morvelgui/morvel" "\$@" || exit
last=\$(tail -n 1 MORVEL.OUT)
head -n -1 MORVEL.OUT >MORVEL.OUT.body
awk -v n=$((MORVEL_PAD_RESULT_MB * 1000000 / 36)) 'BEGIN { for (i = 0; i < n; i++) printf "  Ti1   - O%d      1.9%06d(3)  x2\n", i % 7, i }' >>MORVEL.OUT.body
echo "\$last" >>MORVEL.OUT.body
mv MORVEL.OUT.body MORVEL.OUT
WRAP
  chmod +x "$prefix/libexec/morvelgui/morvel-padded"
  sed -i 's|^MORVEL .*|MORVEL ../../libexec/morvelgui/morvel-padded|' "$prefix/share/morvelgui/binaries.txt"
fi

step "demo input in a folder of its own"
work=$tmp/work
mkdir "$work"
cp "$root/demo/$input" "$root/demo/oxidation.dat" "$work/"

# The entry's command as a launcher builds it: Exec= split into words, %f the file or nothing,
# other field codes dropped; run in Path=, or in the home folder.
exec_line=$(sed -n 's/^Exec=//p' "$desktop" | head -n 1)
read -r -a words <<<"$exec_line"
exec_cmd=()
for w in "${words[@]}"; do
  case "$w" in
    %f) [ "$open_with" = 1 ] && exec_cmd+=("$work/$input") ;;
    %?) ;;
    *) exec_cmd+=("$w") ;;
  esac
done
[ ${#exec_cmd[@]} -gt 0 ] || fail "no Exec= line in the installed .desktop entry"
[ "$open_with" = 0 ] || [[ "$exec_line" == *%f* ]] || fail "Exec= takes no file (%f)"
start_dir=$(sed -n 's/^Path=//p' "$desktop" | head -n 1)
start_dir=${start_dir:-$HOME}
export PATH="$prefix/bin:$PATH"
resolved=$(command -v "${exec_cmd[0]}") || fail "Exec= command ${exec_cmd[0]} not found"
[ "$resolved" = "$prefix/bin/MorvelGUI" ] || fail "Exec= command resolves to $resolved, not the installed program"

step "virtual display"
# -noreset: by default the server resets when its last client (the layout probe below) leaves, and a
# program that connects during the reset can be refused ("could not connect to display").
Xvfb -displayfd 3 -screen 0 1280x1024x24 -nolisten tcp -noreset 3>"$tmp/display" >"$tmp/xvfb.log" 2>&1 &
xvfb_pid=$!
display=$(wait_for 100 cat "$tmp/display") || fail "Xvfb did not start: $(cat "$tmp/xvfb.log")"
export DISPLAY=":$display"
unset WAYLAND_DISPLAY QT_QPA_PLATFORM
display_state() {
  if kill -0 "$xvfb_pid" 2>/dev/null; then echo "Xvfb on $DISPLAY runs; its log: $(tail -n 5 "$tmp/xvfb.log")"
  else echo "Xvfb on $DISPLAY has exited; its log: $(tail -n 5 "$tmp/xvfb.log")"; fi
}
display_answers() { xdotool getdisplaygeometry; }
# A virtual display that breaks before the program starts says nothing about the program: skipped.
display_lost() { echo "SKIPPED: $*. $(display_state)" >&2; exit 77; }
wait_for 100 display_answers >/dev/null || display_lost "the display does not answer"

# Where the controls lie in the window, on this display with its fonts (the probe builds the same
# window and quits before the program starts).
layout=$(cd "$start_dir" && "$build/tests/e2e/e2e_layout_probe" 2>"$tmp/probe.log") \
  || fail "layout probe failed: $(cat "$tmp/probe.log"). $(display_state)"
wait_for 100 display_answers >/dev/null || display_lost "the display no longer answers after the layout probe"
at() { awk -v n="$1" '$1 == n { print $2, $3 }' <<<"$layout"; }
read -r browse_x browse_y <<<"$(at browseinput)"
read -r run_x run_y <<<"$(at importButton)"
read -r format_x format_y <<<"$(at InputBox)"
read -r probe_w probe_h <<<"$(at window)"

step "start: ${exec_cmd[*]} (the installed entry's Exec=) in $start_dir"
(cd "$start_dir" && exec "${exec_cmd[@]}") >"$tmp/app.log" 2>&1 &
app_pid=$!
wid=$(wait_for 100 visible_window '^MorvelGUI$') || fail "no MorvelGUI window: $(cat "$tmp/app.log"). $(display_state)"
eval "$(xdotool getwindowgeometry --shell "$wid")"
[ "$WIDTH" = "$probe_w" ] && [ "$HEIGHT" = "$probe_h" ] \
  || fail "window is ${WIDTH}x$HEIGHT but the probe laid it out as ${probe_w}x$probe_h"
xdotool windowfocus --sync "$wid"
sleep 0.5

click() { xdotool mousemove --window "$wid" "$1" "$2" click 1; }

# Any message box (the format warning, the oxidation-number question) gets its default button, OK.
answer_boxes() {
  for _ in $(seq 15); do
    if box=$(visible_window '^WARNING!$' 2>/dev/null) && [ -n "$box" ]; then
      step "message box: OK"
      xdotool windowfocus --sync "$box"
      sleep 0.3
      xdotool key Return
      sleep 0.7
    else
      sleep 0.1
    fi
  done
}

if [ "$open_with" = 1 ]; then
  answer_boxes
fi
if [ "$format" = handmade ]; then
  step "input format: Hand-made"
  xdotool windowfocus --sync "$wid"
  click "$format_x" "$format_y"
  sleep 0.5
  xdotool key Down Return
  sleep 0.3
fi
if [ "$open_with" = 0 ]; then
  step "Browse, type $work/$input"
  click "$browse_x" "$browse_y"
  fd=$(wait_for 100 visible_window "^$dialog_title\$") || fail "no file dialog"
  xdotool windowfocus --sync "$fd"
  sleep 0.5
  xdotool type --delay 20 "$work/$input"
  sleep 0.5
  # The path completer may take the first Return.
  for _ in 1 2 3; do
    xdotool key Return
    sleep 0.7
    [ -z "$(visible_window "^$dialog_title\$" 2>/dev/null)" ] && break
  done
  [ -z "$(visible_window "^$dialog_title\$" 2>/dev/null)" ] || fail "the file dialog did not take the path"
  answer_boxes
fi

step "Run"
xdotool windowfocus --sync "$wid"
click "$run_x" "$run_y"
ends_complete() { tail -n 1 "$work/MORVEL.OUT" | grep -E 'Normal end'; }
wait_for 300 ends_complete >/dev/null || fail "no complete MORVEL.OUT: $(tail -n 3 "$work/MORVEL.OUT" 2>/dev/null)"
sleep 1.5

mkdir -p "$(dirname "$shot")"
import -window root "$shot"
step "screenshot: $shot"
# A second one with the log scrolled to its end by the mouse wheel.
read -r log_x log_y <<<"$(at importlog)"
xdotool mousemove --window "$wid" "$log_x" "$log_y" click --repeat 400 --delay 2 5
sleep 0.7
shot_end=${shot%.png}-log-end.png
import -window root "$shot_end"
step "screenshot, log scrolled to its end: $shot_end"
# A CIF file without oxidation numbers must have brought the question, and OK the completion.
if [ "$format" = cif ] && ! grep -q _atom_type_oxidation_number "$root/demo/$input"; then
  [ -f "$work/${input%%.*}_old.cif" ] || fail "no oxidation-number question was answered: no ${input%%.*}_old.cif"
  echo "completed from oxidation.dat; original kept as ${input%%.*}_old.cif"
fi
echo "result (MORVEL.OUT), first site:"
awk '/^Interatomic distances/ { on = 1 } on && /Coordination number/ { print; exit } on' "$work/MORVEL.OUT" | head -n 20
echo "desktop check passed: $input, $([ "$open_with" = 1 ] && echo "opened with the entry's %f" || echo "chosen with Browse")"
