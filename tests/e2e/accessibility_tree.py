# SPDX-License-Identifier: GPL-3.0-or-later
"""Answers each line on standard input with what shows in the application's window, a row a thing, and a line "end"."""
import sys

import gi

gi.require_version("Atspi", "2.0")
from gi.repository import Atspi  # noqa: E402


def tell(node):
    try:
        area = node.get_extents(Atspi.CoordType.WINDOW)
    except gi.repository.GLib.Error:
        return  # a page of a stack has no place of its own
    # What is not on screen has no size, or lies outside the window.
    if area.width <= 0 or area.height <= 0:
        return
    name = (node.get_name() or "").replace("\t", " ").replace("\n", " ")
    sensitive = node.get_state_set().contains(Atspi.StateType.SENSITIVE)
    print(node.get_role_name(), name, area.x, area.y, area.width, area.height, int(sensitive), sep="\t")


def walk(node, depth=0):
    if depth > 40:
        return
    for i in range(min(node.get_child_count(), 2000)):
        child = node.get_child_at_index(i)
        # What doesn't show holds nothing that does.
        if child is None or not child.get_state_set().contains(Atspi.StateType.VISIBLE):
            continue
        tell(child)
        walk(child, depth + 1)


def main():
    Atspi.init()
    for _ in sys.stdin:
        try:
            desktop = Atspi.get_desktop(0)
            for i in range(desktop.get_child_count()):
                application = desktop.get_child_at_index(i)
                if application and "vaelo" in (application.get_name() or ""):
                    walk(application)
        except gi.repository.GLib.Error:
            pass
        print("end", flush=True)


if __name__ == "__main__":
    main()
