# The kernel shows its parameters as files. Their names are written with a dot for each slash of
# the path and with a slash for each dot in it: net.ipv4.conf.eth0/100.forwarding

: "${PROC_ROOT:=/proc}"
cd -- "$PROC_ROOT/sys" 2>/dev/null || fail "No kernel parameters below $PROC_ROOT"

swap_separators() {
    printf '%s\n' "$1" | tr './' '/.'
}
