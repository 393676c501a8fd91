#!/usr/bin/python3
# SPDX-License-Identifier: GPL-3.0-or-later
"""The words in the texts that show in the application's window; asked in a process of its own, as accessibility_tree.py is."""
import subprocess
import sys

MOST = 10000


def words(app):
    done = subprocess.run(["/usr/bin/python3", __file__], env=app.desktop.environment, capture_output=True, text=True, timeout=20)
    return done.stdout


def main():
    import gi
    gi.require_version("Atspi", "2.0")
    from gi.repository import Atspi

    def walk(node, depth=0):
        if depth > 40:
            return
        for i in range(min(node.get_child_count(), 200)):
            child = node.get_child_at_index(i)
            if child is None:
                continue
            if child.get_role() == Atspi.Role.TEXT and child.get_state_set().contains(Atspi.StateType.VISIBLE):
                length = min(Atspi.Text.get_character_count(child), MOST)
                print(Atspi.Text.get_text(child, 0, length))
            walk(child, depth + 1)

    Atspi.init()
    desktop = Atspi.get_desktop(0)
    for i in range(desktop.get_child_count()):
        application = desktop.get_child_at_index(i)
        if application and "vaelo" in (application.get_name() or ""):
            walk(application)


if __name__ == "__main__":
    sys.exit(main())
