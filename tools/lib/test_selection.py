# What tools/test makes of its arguments: a complaint about one that CTest does not know, or the programs
# that a -R needs.
#
#     test_selection.py check TOOL ARGUMENT...       exits with 2 and one line for what CTest would ignore
#     test_selection.py targets BUILD REGEX...       prints the targets whose tests a -R REGEX can choose,
#                                                    nothing where all are needed
#
# The build folder has test_programs.tsv, a line "target<TAB>source;source" for each GoogleTest program.
import pathlib
import re
import subprocess
import sys

CASE = re.compile(r"^TEST(?:_F|_P)?\(\s*(\w+),\s*(\w+)\s*\)", re.MULTILINE)


def complaint(tool, arguments):
    """What is wrong with the arguments of a tool, by CTest's own list of its options; None if nothing is."""
    usage = subprocess.run(["ctest", "--help"], capture_output=True, text=True, check=True).stdout
    options = {}
    for names in re.findall(r"^  (-[^=\n]*?) *(?:= |$)", usage, re.MULTILINE):
        for name in names.split(","):
            option, _, value = name.strip().partition(" ")
            options[option.partition("=")[0].rstrip("[")] = bool(value)
    values = 0
    for argument in arguments:
        name, has_value, _ = argument.partition("=")
        if values:
            values -= 1
        elif name in options:
            values = int(options[name] and not has_value)
        elif not re.fullmatch(r"-j\d+", argument):
            return f"unknown argument {argument} (see tools/{tool} --help, ctest --help)"
    return f"{arguments[-1]} wants a value" if values and arguments[-1] != "-j" else None


def targets(build, patterns):
    """The targets with a test that one of the patterns chooses; what CTest adds to a name is optional.
    None where a test that is no GoogleTest program is among the chosen: it may need any target."""
    chosen = [re.compile(pattern) for pattern in patterns]
    for listing in build.rglob("CTestTestfile.cmake"):
        plain = re.findall(r"^add_test\(\[=\[(.+?)\]=\]", listing.read_text(), re.MULTILINE)
        if any(pattern.search(name) for name in plain for pattern in chosen):
            return
    for line in (build / "test_programs.tsv").read_text(encoding="utf-8").splitlines():
        target, _, sources = line.partition("\t")
        names = {target}
        for source in sources.split(";"):
            names |= {f"{target}/{suite}.{case}" for suite, case in
                      CASE.findall(pathlib.Path(source).read_text(encoding="utf-8"))}
        if any(pattern.search(name) or pattern.search(name.partition("/")[2])
               for name in names for pattern in chosen):
            yield target


if __name__ == "__main__":
    if sys.argv[1] == "check":
        problem = complaint(sys.argv[2], sys.argv[3:])
        if problem:
            print(f"{sys.argv[2]}: {problem}", file=sys.stderr)
            sys.exit(2)
    else:
        print("\n".join(targets(pathlib.Path(sys.argv[2]), sys.argv[3:])))
