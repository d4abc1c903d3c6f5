# A screen for programs with windows. Sourced after tools/environment.sh.

# Starts an X server for this script alone, which chooses its own number, and ends it with the script.
start_screen() {
  local number number_pipe
  exec {number_pipe}<> <(:)
  Xvfb -displayfd "$number_pipe" -screen 0 1280x1024x24 -nolisten tcp >/dev/null 2>&1 &
  screen_pid=$!
  trap 'kill $screen_pid 2>/dev/null || true' EXIT
  read -r -t 20 number <&"$number_pipe" || fail "Xvfb did not start"
  export DISPLAY=:$number
}
