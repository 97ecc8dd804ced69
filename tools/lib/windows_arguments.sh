# Arguments of a Unix shell for a Windows program under Wine. Source it; it runs nothing.
# shellcheck shell=bash

# windows_arguments ARGUMENT...: sets the array WINDOWS_ARGUMENTS. Absolute paths, alone or as the value
# in --option=PATH, get the letter of the drive that shows the whole file system. Relative paths need no
# change: Wine passes the current folder on, and Windows takes slashes. No option has to be known here.
windows_arguments() {
    local argument
    WINDOWS_ARGUMENTS=()
    for argument in "$@"; do
        case $argument in
            /*) argument=Z:$argument ;;
            --*=/*) argument=${argument%%=*}=Z:${argument#*=} ;;
        esac
        WINDOWS_ARGUMENTS+=("$argument")
    done
}
