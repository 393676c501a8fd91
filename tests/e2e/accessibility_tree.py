# SPDX-License-Identifier: GPL-3.0-or-later
"""Answers the lines on standard input about the application's windows, a row a thing, and a line "end".

tree: what shows. controls: what shows and can be used, with its description. focus: what has the keyboard.
"""
import sys

import gi

gi.require_version("Atspi", "2.0")
from gi.repository import Atspi  # noqa: E402

CONTROLS = {Atspi.Role.PUSH_BUTTON, Atspi.Role.TOGGLE_BUTTON, Atspi.Role.CHECK_BOX, Atspi.Role.RADIO_BUTTON,
            Atspi.Role.TEXT, Atspi.Role.ENTRY, Atspi.Role.PASSWORD_TEXT, Atspi.Role.SPIN_BUTTON, Atspi.Role.COMBO_BOX,
            Atspi.Role.SLIDER, Atspi.Role.LIST_ITEM, Atspi.Role.TREE_ITEM, Atspi.Role.TABLE_CELL, Atspi.Role.MENU_ITEM,
            Atspi.Role.CHECK_MENU_ITEM, Atspi.Role.RADIO_MENU_ITEM, Atspi.Role.LINK, Atspi.Role.DOCUMENT_TEXT, Atspi.Role.IMAGE}


def on_one_line(text):
    return (text or "").replace("\t", " ").replace("\n", " ")


def area_of(node):
    """None of what doesn't show."""
    try:
        area = node.get_extents(Atspi.CoordType.WINDOW)
    except gi.repository.GLib.Error:
        return None  # a page of a stack has no place of its own
    # What is not on screen has no size, or lies outside the window.
    return area if area.width > 0 and area.height > 0 else None


def tell(node):
    area = area_of(node)
    if not area:
        return
    sensitive = node.get_state_set().contains(Atspi.StateType.SENSITIVE)
    print(node.get_role_name(), on_one_line(node.get_name()), area.x, area.y, area.width, area.height, int(sensitive), sep="\t")


def tell_control(node):
    if node.get_role() not in CONTROLS or not area_of(node):
        return
    focusable = int(node.get_state_set().contains(Atspi.StateType.FOCUSABLE))
    print(node.get_role_name(), on_one_line(node.get_name()), on_one_line(node.get_description()), focusable, sep="\t")


def tell_focus(node):
    if node.get_state_set().contains(Atspi.StateType.FOCUSED):
        print(node.get_role_name(), on_one_line(node.get_name()), sep="\t")


def walk(node, tells, depth=0):
    if depth > 40:
        return
    for i in range(min(node.get_child_count(), 2000)):
        child = node.get_child_at_index(i)
        # What doesn't show holds nothing that does.
        if child is None or not child.get_state_set().contains(Atspi.StateType.VISIBLE):
            continue
        tells(child)
        walk(child, tells, depth + 1)


def main():
    Atspi.init()
    answers = {"tree": tell, "controls": tell_control, "focus": tell_focus}
    for line in sys.stdin:
        try:
            desktop = Atspi.get_desktop(0)
            for i in range(desktop.get_child_count()):
                application = desktop.get_child_at_index(i)
                if application and "vaelo" in (application.get_name() or ""):
                    walk(application, answers[line.strip()])
        except gi.repository.GLib.Error:
            pass
        print("end", flush=True)


if __name__ == "__main__":
    main()
