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
ORU_LOG_DIR=$ORU_BUILD_DIR/logs

# Another release of these would lay out and judge the same code otherwise.
ORU_CLANG_FORMAT=clang-format-14
ORU_CLANG_TIDY=clang-tidy-14

say() { printf '==> %s\n' "$*"; }

die() {
    printf '%s: %s\n' "$(basename "$0")" "$*" >&2
    exit 1
}

# refuse ARGUMENT: ends the script for an argument that it does not know.
refuse() {
    printf '%s: unknown argument %s (see tools/%s --help)\n' "$(basename "$0")" "$1" "$(basename "$0")" >&2
    exit 2
}

# show_help: the comment block at the top of the script, without its marks.
show_help() { sed -n '2,/^[^#]/ { s/^# \{0,1\}//p }' "$0"; }

# logged NAME WHAT COMMAND...: runs a long step with its output in a log; a failure ends the script with
# the first errors in the log (or its last lines), what failed and where the log is. Descriptors 8 and 9,
# locks of the scripts, stay out of what outlives the step.
logged() {
    local log=$ORU_LOG_DIR/$1.log what=$2
    shift 2
    mkdir -p "$ORU_LOG_DIR"
    say "$what"
    if ! "$@" >"$log" 2>&1 </dev/null 8>&- 9>&-; then
        grep -m 10 -A 3 -E '(^E|error):|CMake Error|^FAILED' "$log" >&2 || tail -n 20 "$log" >&2
        die "failed: $what (whole log: $(shown_path "$log"))"
    fi
}

# configure: configures the build folder when it is not configured yet. Later Ninja itself does it when a
# CMake file changed.
configure() {
    [ -f "$ORU_BUILD_DIR/build.ninja" ] ||
        logged configure "Configuring $(shown_path "$ORU_BUILD_DIR")" \
            cmake -S "$ORU_ROOT" --preset "${ORU_PRESET:-mingw}" -B "$ORU_BUILD_DIR"
}

# compile [TARGET...]: builds, with Ninja's progress on a terminal and with a log elsewhere.
compile() {
    local what="Building ${*:-everything} in $(shown_path "$ORU_BUILD_DIR")"
    local command=(cmake --build "$ORU_BUILD_DIR")
    [ $# -eq 0 ] || command+=(--target "$@")
    if [ -t 1 ]; then
        say "$what"
        "${command[@]}" || die "failed: $what"
    else
        logged build "$what" "${command[@]}"
    fi
}

# shown_path PATH: relative to the repository where it lies inside.
shown_path() { printf '%s' "${1#"$ORU_ROOT"/}"; }
