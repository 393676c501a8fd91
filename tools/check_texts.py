#!/usr/bin/python3
# SPDX-License-Identifier: GPL-3.0-or-later
"""Fails when the sources have words for people that no translator would see.

    check_texts.py ROOT

Put texts into _(), ngettext() or another mark of host/support/texts.h, in the application's folders into localized(), and run
tools/translations. A literal in a mark stands alone: of "_(a ? "b" : "c")" only "b" would be found. Say "// not for people" on the
line of what only looks like words.
"""
import pathlib
import re
import sys

FOLDERS = ("app", "fileops", "host", "items", "platform", "preview")
MARKS = {"_", "N_", "C_", "ngettext", "NP_", "localized", "localizedString", "localizedCount", "localizedAmount", "counted",
         "fileError", "cloudError"}
# What is in their arguments is read by programs, or by who reads logs.
TECHNICAL = re.compile(
    r"write|VLO_\w+|g_(?:log|key_file|object|signal|type|param|setenv|getenv|find|variant|dbus|option)\w*|g_(?:warning|debug|error)|keyFile\w+"
    r"|gtk_(?:css_provider|widget_(?:add_css|remove_css|insert|activate|class|install)|icon|image)\w*|find|has|ask|refused|exec\w*|prepare\w*"
    r"|make(?:Serial|Operation)Queue|setClassName|starts_with|ends_with|static_assert|names|recordUserAction|trace\w*|beginUserAction"
    r"|g_(?:simple_)?action\w*|gtk_builder\w*|pango_\w+|gdk_pixbuf\w*|is|run|describe_type|constraintsWithVisualFormat|log\w*")
TOKEN = re.compile(r'//[^\n]*|/\*.*?\*/|R"\(.*?\)"|"(?:[^"\\\n]|\\.)*"|\'(?:[^\'\\\n]|\\.)\'|[A-Za-z_]\w*|[0-9][\w\'.]*|\n|\S', re.S)
SENTENCE = re.compile(r"[“”…]|[A-Za-z][a-z’']+,? [a-z’]{2,}|[A-Z][a-z]+ [A-Z][a-z]+")
WORD = re.compile(r"[A-Z][a-z]{2,}[.:!?…]?$")
# The application's name, which is the same everywhere, keys of the keyboard, names of files and the like.
NAMES = {"Vaelo Drive", "…", "Adwaita", "Alternate", "Cantarell, sans", "Desktop", "Documents", "Escape", "Integers", "Root"}
CODE = re.compile(r"^SELECT | INTO |^public\.|[{}<>=;/\\]|::|--|\$|^\W*$|^[a-z]+(?: [%\w-]+)*$")


class Reader:
    """Follows a source, and knows of each literal which calls it is an argument of."""

    def __init__(self, text):
        self.calls = []  # the name before each open "(", None for an open "{" of statements, "" for other brackets
        self.tokens = [(match[0], match.start()) for match in TOKEN.finditer(text)]
        self.text = text

    def literals(self):
        """(line, literal, enclosing calls from the inside, what comes before it within its argument) of each literal."""
        before, argument = "", []
        for token, place in self.tokens:
            if token == "\n" or token.startswith(("//", "/*")):
                continue
            if token.startswith(('"', 'R"')):
                yield self.text.count("\n", 0, place) + 1, token, self.enclosing(), list(argument)
            elif token in "([":
                self.calls.append(before if re.match(r"[A-Za-z_]", before) and token == "(" else "")
                argument = []
            elif token == "{":
                values = before in ("(", ",", "=", "{", "return") or (before and before[0].isupper())
                self.calls.append("" if values else None)
                argument = []
            elif token in ")]}" and self.calls:
                self.calls.pop()
                argument = []
            elif token in ",;":
                argument = []
            if token not in "([{,;":
                argument.append(token)
            before = token

    def enclosing(self):
        found = []
        for name in reversed(self.calls):
            if name is None:
                break
            if name and name not in ("if", "return", "string", "string_view"):
                found.append(name)
        return found


def is_for_people(literal, path):
    words = literal.strip('"')
    if words in NAMES or CODE.search(words) and not re.search("[“”…]", words):
        return False
    # Files and databases have keys that are words.
    has_keys = path.parts[:2] in (("host", "drive"), ("host", "files"), ("host", "decoder")) or path.parts[0] in ("items", "platform")
    plain = words.replace("_", "")  # before the letter of a menu's entry
    return bool(SENTENCE.search(plain)) or (not has_keys and bool(WORD.match(plain)))


def problems_in(path, text):
    lines = text.splitlines()
    for number, literal, calls, argument in Reader(text).literals():
        line = lines[number - 1]
        if line.lstrip().startswith("#") or "// not for people" in line:
            continue
        marked = next((name for name in calls[:1] if name in MARKS), None)
        if marked and marked not in ("fileError", "cloudError") and "?" in argument:
            yield f"{path}:{number}: {literal} is one of several texts in {marked}(). Mark each by itself."
        elif not any(name in MARKS for name in calls) and is_for_people(literal, path):
            if not (calls and TECHNICAL.fullmatch(calls[0])):
                yield f"{path}:{number}: {literal} is not marked for translation."


def problems(root):
    for folder in FOLDERS:
        for path in sorted((root / folder).rglob("*")):
            if path.suffix in (".h", ".cpp"):
                yield from problems_in(path.relative_to(root), path.read_text(encoding="utf-8"))


def main():
    found = list(problems(pathlib.Path(sys.argv[1])))
    print("\n".join(found))
    if found:
        print(__doc__.strip().split("\n\n")[-1])
    return 1 if found else 0


if __name__ == "__main__":
    sys.exit(main())
