# Shared by the scripts in tools/: paths, messages, steps that log. Source it; it runs nothing.
# shellcheck shell=bash

ORU_ROOT=$(cd "$(dirname "${BASH_SOURCE[0]}")/../.." && pwd)
ORU_BUILD_DIR=${ORU_BUILD_DIR:-build/mingw}
case $ORU_BUILD_DIR in
    /*) ;;
    *) ORU_BUILD_DIR=$ORU_ROOT/$ORU_BUILD_DIR ;;
esac
export ORU_BUILD_DIR
ORU_DEPS_DIR=$ORU_ROOT/build/deps
ORU_LOG_DIR=$ORU_ROOT/build/logs

say() { printf '==> %s\n' "$*"; }

die() {
    printf '%s: %s\n' "$(basename "$0")" "$*" >&2
    exit 1
}

# show_help: the comment block at the top of the script, without its marks.
show_help() { sed -n '2,/^[^#]/ { s/^# \{0,1\}//p }' "$0"; }

# logged NAME WHAT COMMAND...: runs a long step with its output in a log; a failure ends the script with
# what failed, the log's last lines and where the log is. (Descriptors 8 and 9 are locks of the scripts.)
logged() {
    local log=$ORU_LOG_DIR/$1.log what=$2
    shift 2
    mkdir -p "$ORU_LOG_DIR"
    say "$what"
    if ! "$@" >"$log" 2>&1 </dev/null 8>&- 9>&-; then
        tail -n 15 "$log" >&2
        die "failed: $what (whole log: $log)"
    fi
}

# configure [PRESET]: configures the build folder when it is not configured yet. Ninja itself configures
# anew when a CMake file changed.
configure() {
    [ -f "$ORU_BUILD_DIR/build.ninja" ] && return
    logged configure "Configuring $(shown_path "$ORU_BUILD_DIR")" \
        cmake -S "$ORU_ROOT" --preset "${1:-mingw}" -B "$ORU_BUILD_DIR"
}

# compile [TARGET...]: builds, showing Ninja's output only when it fails.
compile() {
    local arguments=()
    [ $# -eq 0 ] || arguments=(--target "$@")
    logged build "Building ${*:-everything}" cmake --build "$ORU_BUILD_DIR" "${arguments[@]}"
}

# shown_path PATH: relative to the repository where it lies inside.
shown_path() { printf '%s' "${1#"$ORU_ROOT"/}"; }
