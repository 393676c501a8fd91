#!/usr/bin/env python3
# SPDX-License-Identifier: GPL-3.0-or-later
"""Fails when a file of a layer includes what the layer may not know.

    check_layers.py ROOT LAYER [USED_LAYER...]

The application's folders and platform/ are plain C++: a toolkit, a database or a system header in one of them would tie
the logic to one platform and keep it from being tested without a display. Move such code to host/, and reach it through
an interface in platform/.
"""
import pathlib
import re
import sys

STANDARD = set("""algorithm any array atomic bit bitset cassert cctype cerrno cfloat charconv chrono cinttypes climits
cmath codecvt compare complex concepts condition_variable cstdarg cstddef cstdint cstdio cstdlib cstring ctime deque
exception filesystem format forward_list fstream functional future initializer_list iomanip ios iosfwd iostream istream
iterator limits list locale map memory mutex new numbers numeric optional ostream queue random ranges ratio regex set
shared_mutex source_location span sstream stack stdexcept stop_token streambuf string string_view system_error thread
tuple type_traits typeindex typeinfo unordered_map unordered_set utility valarray variant vector version""".split())
INCLUDE = re.compile(r'^\s*#\s*(?:include|include_next|import)\s*(?:<([^>]+)>|"([^"]+)"|(\S.*))')


def problems(root, layer, used):
    allowed = [layer, *used]
    for path in sorted((root / layer).rglob("*")):
        if path.suffix not in (".h", ".cpp"):
            continue
        text = path.read_text(encoding="utf-8", errors="replace").replace("\\\n", " ")
        for number, line in enumerate(text.splitlines(), 1):
            found = INCLUDE.match(line)
            if not found:
                continue
            system, own, computed = found.groups()
            if system and system not in STANDARD:
                yield f"{path}:{number}: <{system}> is not a header of the C++ standard library"
            elif own and (own.split("/")[0] not in allowed or ".." in own):
                yield f'{path}:{number}: "{own}" is outside {", ".join(allowed)}'
            elif computed:
                yield f"{path}:{number}: a computed include can't be checked"
        if re.search(r"__has_include|\bextern\s+\"C\"", text):
            yield f"{path}: declares or probes for what is outside the standard library"


def main():
    root, layer, used = pathlib.Path(sys.argv[1]), sys.argv[2], sys.argv[3:]
    found = list(problems(root, layer, used))
    for line in found:
        print(line, file=sys.stderr)
    if found:
        print(__doc__.strip().split("\n\n")[-1], file=sys.stderr)
    return 1 if found else 0


if __name__ == "__main__":
    sys.exit(main())
