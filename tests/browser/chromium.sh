# Sourced: a Chromium without a screen, without a network and with its own renderer.
skip() {
  echo "skipped: $*"
  exit 77
}

browser=$(command -v chromium || command -v chromium-browser || command -v google-chrome) || skip "there is no Chromium"

# picture URL FILE WIDTH HEIGHT : what a page shows. Waits for the page as long as it needs, not by a clock.
picture() { run_browser "--window-size=$3,$4" "--screenshot=$2" "$1" && [[ -s $2 ]]; }

# state URL : the page's state ("ready" or "error"), once it has been drawn.
state() { run_browser --dump-dom "$1" | grep -a -o -m 1 'data-state="[a-z]*"' | cut -d '"' -f 2; }

run_browser() {
  timeout 120 "$browser" --headless=new --no-sandbox --use-gl=angle --use-angle=swiftshader \
    --enable-unsafe-swiftshader --host-resolver-rules="MAP * ~NOTFOUND" --user-data-dir="$work/profile" \
    --hide-scrollbars --virtual-time-budget=8000 "$@" 2>"$work/browser.log"
}
