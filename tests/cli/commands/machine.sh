# Sourced by the cases: lets the example commands see machine/ in place of this machine.
export SYS_ROOT=here/machine/sys PROC_ROOT=here/machine/proc ETC_ROOT=here/machine/etc
export DPKG_STATUS=here/machine/dpkg-status
PATH=here/machine/bin:$PATH

kelvash() {
    command kelvash --plugin-dir commands "$@"
}
