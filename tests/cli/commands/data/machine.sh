# Sourced by the cases: lets the example commands see machine/ in place of this machine.
export SYS_ROOT=here/data/machine/sys PROC_ROOT=here/data/machine/proc ETC_ROOT=here/data/machine/etc
export DPKG_STATUS=here/data/machine/dpkg-status
PATH=here/data/machine/bin:$PATH

kelvash() {
    command kelvash --plugin-dir commands "$@"
}
