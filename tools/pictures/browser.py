# SPDX-License-Identifier: GPL-3.0-or-later
"""Walking through a drive."""
import harness

from .stage import furnish

NAMES = ("root", "menu", "shortcuts", "folder", "grid", "search", "empty")


def add_pictures(app):
    furnish(app)
    (app.drive / "Desktop" / "Empty").mkdir()


def are_side_by_side(app, *names):
    rows = [app.find(name) for name in names]
    return all(rows) and len({row[3] for row in rows}) == 1


def play(stage):
    app = stage.start(add_pictures)
    app.wait("Documents", "list item")
    stage.shot("root")
    stage.click("Main Menu", None)
    stage.wait("_Refresh", "menu item")
    stage.shot("menu")
    app.key("Escape")
    stage.wait_gone("_Refresh")
    app.key("ctrl+question")
    stage.wait("Main Menu", "list item")
    stage.shot("shortcuts")
    app.key("Escape")
    stage.wait_gone("Folder Above")
    stage.show("Documents")
    app.wait("Minutes 2.txt", "list item")
    stage.shot("folder")
    stage.show("Pictures")
    app.wait("Photo 2.jpg", "list item")
    if stage.narrow:
        stage.click("Main Menu", None)
        stage.choose("View as _Grid")
    else:
        stage.click("View as grid")
    harness.wait_for("the icons", lambda: are_side_by_side(app, "Photo 1.jpg", "Photo 2.jpg"))
    stage.shot("grid")
    stage.show("Desktop/Empty")
    stage.wait("This folder is empty")
    stage.shot("empty")
    app.key("Escape", "Escape")
    stage.wait_gone("This folder is empty")
    app.wait_title("Vaelo Drive")
    stage.settle()
    stage.click("Search")
    stage.wait("Search below this folder")
    app.type("photo 1")
    app.wait("Photo 1", None)
    stage.shot("search")
