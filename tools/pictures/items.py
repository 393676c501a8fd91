# SPDX-License-Identifier: GPL-3.0-or-later
"""What people do with items, and what the application asks and answers."""
from .stage import furnish

NAMES = ("item-menu", "share", "tags", "rename", "rename-taken", "rename-forbidden", "delete-one", "select", "new-folder",
         "delete-many", "picker-libraries", "move-taken", "moves-taken", "undo", "refusal", "delete-library")
SKETCHBOOK = {"rtl": "دفتر الرسم"}


def prepare(app):
    furnish(app)
    for name in ("Minutes 1.txt", "Minutes 2.txt"):
        (app.drive / "Documents" / "Projects" / name).write_text("Minutes of another meeting\n")


def item_menu(stage, item):
    stage.app.click(item, "list item", button=3)
    stage.wait("_Rename…", "menu item")


def one_item(stage):
    app = stage.app
    item_menu(stage, "Contract.pdf")
    stage.shot("item-menu")
    stage.choose("_Share…")
    stage.wait("Copy Link")
    stage.shot("share")
    app.key("Escape")
    stage.wait_gone("Copy Link")
    item_menu(stage, "Contract.pdf")
    stage.choose("_Tags…")
    stage.wait("New tag")
    stage.shot("tags")
    app.key("Escape")
    stage.wait_gone("New tag")
    stage.to_row("contract")
    app.key("F2")
    stage.wait("Enter a new name for this item.")
    stage.shot("rename")
    app.key("ctrl+a")
    app.type("Thesis.pdf")
    app.key("Return")
    stage.wait("Name is already taken")
    stage.shot("rename-taken")
    app.key("ctrl+a")
    app.type("Draft/Contract.pdf")
    stage.wait("Character not allowed in filename")
    stage.shot("rename-forbidden")
    app.key("Escape")
    stage.wait_gone("Enter a new name for this item.")
    app.key("Delete")
    stage.wait("Delete from Vaelo Drive")
    stage.shot("delete-one")
    app.key("Escape")
    stage.wait_gone("Delete from Vaelo Drive")


def several_items(stage):
    app = stage.app
    stage.click("Select")
    stage.wait("New Folder", "push button")
    for name in ("Minutes 1.txt", "Minutes 2.txt", "Minutes 10.txt"):
        app.click(name, "list item")
    stage.shot("select")
    stage.click("New Folder")
    stage.wait("Enter a name for this folder.")
    stage.shot("new-folder")
    app.key("Escape")
    stage.wait_gone("Enter a name for this folder.")
    stage.click("Delete")
    stage.wait("Delete from Vaelo Drive")
    stage.shot("delete-many")
    app.key("Escape")
    stage.wait_gone("Delete from Vaelo Drive")
    stage.click("Cancel")
    stage.wait("Select", "push button")


def move(stage, item, picture=None):
    """To the folder Projects beside it."""
    item_menu(stage, item)
    stage.choose("_Move…")
    stage.wait("Cancel", "push button")
    stage.settle()
    if picture:
        stage.shot(picture)
    to_projects(stage)


def to_projects(stage):
    app = stage.app
    for folder in ("documents", "projects"):
        stage.to_row(folder)
        app.key("Return")
        app.wait(folder.capitalize(), "label")
    stage.press("Move")


def move_several(stage):
    stage.click("Select")
    stage.wait("New Folder", "push button")
    for name in ("Minutes 1.txt", "Minutes 2.txt", "Minutes 10.txt"):
        stage.app.click(name, "list item")
    stage.click("Move")
    stage.wait("Cancel", "push button")
    stage.settle()
    to_projects(stage)


def play(stage):
    app = stage.start(prepare)
    app.wait("Documents", "list item")
    stage.show("Documents")
    app.wait("Minutes 2.txt", "list item")
    one_item(stage)
    several_items(stage)
    move(stage, "Minutes 1.txt", "picker-libraries")
    stage.wait("An item named “%@” already exists in the new location.")
    stage.shot("move-taken")
    app.key("Escape")
    stage.wait_gone("An item named “%@” already exists in the new location.")
    move_several(stage)
    stage.wait("OK", "push button")
    stage.shot("moves-taken")
    app.key("Escape")
    stage.wait_gone("OK")
    move(stage, "Budget 2026.csv")
    stage.wait("Undo", "push button")
    stage.shot("undo")
    stage.click("Back")
    app.wait_title("Vaelo Drive")
    item_menu(stage, "Documents")
    stage.choose("_Rename…")
    stage.wait("This can’t be done with this item.")
    stage.shot("refusal")
    app.key("Escape")
    stage.wait_gone("This can’t be done with this item.")
    stage.wait_gone("Undo")  # it stands over the last rows
    stage.app.click(SKETCHBOOK.get(stage.style, "Sketchbook"), "list item", button=3)
    stage.choose("_Delete…")
    stage.wait("Delete from Vaelo Drive")
    stage.shot("delete-library")
