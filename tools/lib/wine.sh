# One Xvfb and one warm Wine prefix for the programs of a build folder. Source it; it runs nothing.
# shellcheck shell=bash
#
# Everything lives in $ORU_BUILD_DIR/wine, so build folders do not disturb each other.

ORU_WINE_DIR=$ORU_BUILD_DIR/wine

# The environment of every Windows program. UTF-8 carries file names and arguments whatever the caller's
# locale is; the overrides leave out .NET, HTML and the crash dialog, whose debugger waits for ever, and
# let an OpenCL.dll beside a program win over Wine's.
wine_environment() {
    export WINEARCH=win64 WINEDEBUG=${WINEDEBUG:--all} WINEPREFIX=$ORU_WINE_DIR/prefix
    export WINEDLLOVERRIDES="mscoree,mshtml,winemenubuilder.exe=;winedbg.exe=d;opencl=n,b"
    export LC_ALL=C.UTF-8
    export LIBGL_ALWAYS_SOFTWARE=1
    export MESA_SHADER_CACHE_DIR=$ORU_WINE_DIR/cache/mesa POCL_CACHE_DIR=$ORU_WINE_DIR/cache/pocl
}

# find_program NAME...: the first that exists.
find_program() {
    local candidate
    for candidate in "$@"; do
        command -v "$candidate" && return
    done
    die "Wine is not installed; run tools/setup"
}

# start_detached LOG COMMAND...: in a session of its own without our pipes, which Wine's services would
# inherit and keep open after us. Sets DETACHED_PID.
start_detached() {
    local log=$1
    shift
    setsid "$@" </dev/null >"$log" 2>&1 8>&- 9>&- &
    DETACHED_PID=$!
    echo "$DETACHED_PID" >>"$ORU_WINE_DIR/started"
}

# start_xvfb: Xvfb itself takes the first free display number and writes it to the file.
start_xvfb() {
    local number="" tries
    : >"$ORU_WINE_DIR/display"
    start_detached "$ORU_WINE_DIR/xvfb.log" bash -c \
        'exec Xvfb -displayfd 3 -screen 0 1280x1024x24 +extension GLX -nolisten tcp 3>"$1"' \
        - "$ORU_WINE_DIR/display"
    for tries in $(seq 100); do
        number=$(cat "$ORU_WINE_DIR/display")
        [ -n "$number" ] && break
        kill -0 "$DETACHED_PID" 2>/dev/null || break
        sleep 0.1
    done
    [ -n "$number" ] || die "Xvfb did not start (log: $ORU_WINE_DIR/xvfb.log)"
    export DISPLAY=:$number
}

create_prefix() {
    [ ! -f "$ORU_WINE_DIR/prefix.ready" ] || return 0
    rm -rf "$WINEPREFIX"
    logged wine-prefix "Creating a Wine prefix in $(shown_path "$ORU_WINE_DIR")" "$WINE" wineboot --init
    touch "$ORU_WINE_DIR/prefix.ready"
}

start_idle() {
    local idle=$ORU_WINE_DIR/idle.exe tries
    [ "$idle" -nt "$ORU_ROOT/tools/lib/idle.c" ] ||
        x86_64-w64-mingw32-gcc-posix -O2 -s -mwindows -municode -o "$idle" "$ORU_ROOT/tools/lib/idle.c"
    start_detached "$ORU_WINE_DIR/idle.log" "$WINE" "$idle"
    # Waits until the services and the desktop are up. Started later, by a test, they would inherit
    # CTest's pipes, and CTest would wait for them.
    "$WINE" "$idle" once </dev/null >>"$ORU_WINE_DIR/idle.log" 2>&1 8>&- ||
        die "Wine runs no program (log: $ORU_WINE_DIR/idle.log)"
}

# stop_wine: ends what start_wine started, or what a killed script left in this build folder. The prefix
# is this folder's own and its lock is held, so nobody else's programs are met.
stop_wine() {
    local pid
    trap '' INT TERM
    [ ! -d "$WINEPREFIX" ] || "$WINESERVER" -k 2>/dev/null || true
    for pid in $(cat "$ORU_WINE_DIR/started" 2>/dev/null); do
        ! grep -qz -e Xvfb -e idle.exe "/proc/$pid/cmdline" 2>/dev/null || kill "$pid" 2>/dev/null || true
    done
    rm -f "$ORU_WINE_DIR/started"
    wait 2>/dev/null || true
}

# start_wine: makes programs runnable; what it starts ends with the calling script. One caller at a time
# for each build folder: a second one waits. Inside a running one there is nothing to do.
start_wine() {
    [ -z "${ORU_WINE:-}" ] || return 0
    mkdir -p "$ORU_WINE_DIR/cache"
    exec 8>"$ORU_WINE_DIR/lock"
    flock -n 8 || { say "Waiting for another program that uses $(shown_path "$ORU_WINE_DIR")"; flock 8; }
    WINE=$(find_program /usr/lib/wine/wine64 wine64 wine)
    WINESERVER=$(find_program /usr/lib/wine/wineserver64 wineserver)
    wine_environment
    stop_wine
    trap stop_wine EXIT
    trap 'exit 130' INT
    trap 'exit 143' TERM
    start_xvfb
    create_prefix
    start_idle
    export ORU_WINE=$WINE
}

# pass_on: cat that Ctrl-C does not end, for a pipe: the program before it ends by itself.
pass_on() {
    trap '' INT
    exec cat
}

# run_program PROGRAM ARGUMENT...: a Windows program whose output a person may watch. Wine must see no
# terminal, or it draws a console of its own there that garbles UTF-8; ORU_TERMINAL=1 in the environment
# tells the program that there is one all the same. Ctrl-C ends the program; what it says then passes too.
run_program() {
    local command=("$ORU_ROOT/tools/wine-run" "$@")
    if [ -t 1 ] && [ -t 2 ]; then
        ORU_TERMINAL=1 "${command[@]}" 2>&1 8>&- | pass_on
    elif [ -t 1 ]; then
        ORU_TERMINAL=1 "${command[@]}" 8>&- | pass_on
    elif [ -t 2 ]; then
        { "${command[@]}" 2>&1 >&3 8>&- | pass_on >&2; } 3>&1
    else
        "${command[@]}" 8>&-
    fi
}
