"""Compares a trace of the OpenGL tracer with what apitrace recorded of the same program.

    witness.py TRACE DUMP

The dump is the text of `apitrace dump`. Every call of the trace must be in it, with the same arguments and
in the same order, and the contexts of the library must hold no other call. Not compared: what the library
calls past its tracer or apitrace does not print (glGetError and the strings), and the contents behind
pointers, of which the trace has the address only.
"""
import difflib
import pathlib
import re
import struct
import sys

CATALOGUE = pathlib.Path(__file__).resolve().parents[2] / "catalogue"
sys.path.insert(0, str(CATALOGUE))

import emit_tracer  # noqa: E402
import gl_catalogue  # noqa: E402
import tables  # noqa: E402

UNSEEN = {"glGetError", "glGetString", "glGetStringi"}


class Call:
    def __init__(self, text, name, arguments):
        self.text, self.name, self.arguments = text, name, arguments


def read_trace(path):
    """The calls of the tracer's file."""
    calls = []
    for line in path.read_text(encoding="utf-8", errors="surrogateescape").splitlines():
        match = re.fullmatch(r".*:\d+: (gl\w+)\((.*)\)", line)
        if not match:
            raise SystemExit(f"not a line of the tracer: {line}")
        if match[1] not in UNSEEN:
            calls.append(Call(line, match[1], match[2].split(", ") if match[2] else []))
    return calls


def split_arguments(text):
    """`name = value` texts up to the parenthesis that closes the call, split at its own commas."""
    arguments, start, depth, quoted, i = [], 0, 0, False, 0
    while i < len(text):
        c = text[i]
        if quoted:
            i += c == "\\"
            quoted = c != '"'
        elif c == '"':
            quoted = True
        elif c in "({":
            depth += 1
        elif c in ")}" and depth:
            depth -= 1
        elif c in ",)" and not depth:
            arguments.append(text[start:i].strip())
            start = i + 1
            if c == ")":
                break
        i += 1
    return [a.partition(" = ")[2] for a in arguments if a]


def read_dump(path):
    """The calls of each context in the dump: lists in the order of the contexts' first use."""
    contexts, current = [], {}
    lines = path.read_text(encoding="utf-8", errors="surrogateescape")
    for text in re.split(r"\n(?=\d+ (?:@\d+ )?\w+\()", lines):
        match = re.match(r"\d+ (?:@(\d+) )?(\w+)\((.*)", text, re.DOTALL)
        if not match:
            continue
        thread, name = match[1], match[2]
        if name == "glXMakeCurrent":
            context = re.search(r"ctx = (\w+)", text)[1]
            current[thread] = current.get("of " + context)
            if current[thread] is None:
                current[thread] = current["of " + context] = []
                contexts.append(current[thread])
        elif name == "glXDestroyContext":
            current.pop("of " + re.search(r"ctx = (\w+)", text)[1], None)
        elif not name.startswith("glX") and not text.rstrip().endswith("// fake"):
            if name not in UNSEEN:
                current.setdefault(thread, []).append(Call(text, name, split_arguments(match[3])))
    return contexts


class Comparer:
    """Whether an argument as the tracer writes it is the one that apitrace shows."""

    def __init__(self):
        self.values = {name: int(value, 16) for value, name, _ in tables.rows(CATALOGUE / "gl_tokens.tsv", 3)}
        self.entries = {e.name: e for e in gl_catalogue.Catalogue(CATALOGUE).entry_points}

    def number(self, text):
        """A number, a constant or several with | between them; None for anything else."""
        try:
            return sum(self.values[part] if part in self.values else int(part, 0)
                       for part in text.split(" | "))
        except ValueError:
            return None

    def same(self, form, ours, theirs):
        if form == "text":
            return theirs == f'"{ours}"'
        if form == "address":
            if ours == "0" or theirs == "NULL":
                return ours == "0" and theirs == "NULL"
            return not theirs.startswith("0x") or int(ours, 16) == int(theirs, 16)
        if form == "single":
            pattern = struct.pack("<i", int(re.match(r"makeFloat\((-?\d+)\)", ours)[1]))
            return "%.7g" % struct.unpack("<f", pattern) == "%.7g" % float(theirs)  # all it shows
        if form == "real":
            return "%g" % float(theirs) == ours
        if form == "byte":
            return self.number(theirs) % 256 == ord(ours)
        value = self.number(ours.removeprefix("(GLhandleARB)"))
        seen = self.number(theirs)
        if value is None or seen is None or value == seen:
            return value == seen is not None
        # One of them may show 32 bits as signed, the other as unsigned.
        return all(-1 << 31 <= v < 1 << 32 for v in (value, seen)) and (value - seen) % (1 << 32) == 0

    def same_call(self, ours, theirs):
        if ours.name != theirs.name or len(ours.arguments) != len(theirs.arguments):
            return False
        entry = self.entries[ours.name]
        forms = [emit_tracer.form(entry, p) for p in entry.parameters]
        return len(forms) == len(ours.arguments) and all(map(self.same, forms, ours.arguments, theirs.arguments))


def is_subsequence(names, whole):
    rest = iter(whole)
    return all(name in rest for name in names)


def main(trace_path, dump_path):
    trace = read_trace(pathlib.Path(trace_path))
    traced_names = [call.name for call in trace]
    contexts = read_dump(pathlib.Path(dump_path))
    # Wine's own contexts make calls that are in no trace of the library.
    seen = [call for calls in contexts if is_subsequence([c.name for c in calls], traced_names)
            for call in calls]

    comparer = Comparer()
    for ours, theirs in zip(trace, seen):
        if not comparer.same_call(ours, theirs):
            raise SystemExit(f"The traces differ.\ntracer:  {ours.text}\nwitness: {theirs.text}")
    if len(trace) != len(seen):
        best = max(contexts, key=lambda calls: difflib.SequenceMatcher(
            None, [c.name for c in calls[-1000:]], traced_names, False).ratio(), default=[])
        print("\n".join(difflib.unified_diff(traced_names, [c.name for c in best], "tracer", "witness", lineterm="")))
        raise SystemExit(f"The tracer wrote {len(trace)} calls, the witness saw {len(seen)}.")
    if not trace:
        raise SystemExit("The trace is empty.")
    arguments = sum(len(call.arguments) for call in trace)
    print(f"The witness saw the same {len(trace)} calls of {len(set(traced_names))} functions with the same "
          f"{arguments} arguments, and {sum(map(len, contexts)) - len(seen)} more in contexts of Wine's own.")


if __name__ == "__main__":
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    main(*sys.argv[1:])
