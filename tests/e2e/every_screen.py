# SPDX-License-Identifier: GPL-3.0-or-later
"""A walk through every screen of the application, by keyboard alone: whoever looks at the screens sees on the way that the
keyboard reaches them, and that it is where it was when it comes back."""
import os
import subprocess
import zipfile

from bare_desktop import without_applications
from harness import pause, wait_for
from test_preview_documents import portable_document
from test_preview_kinds import NOTES, film, sound
from test_tags import PICTURE

PREVIEWS = {"Film.avi": "Play", "Notes.md": "Show Source Text", "Old.zip": "readme.txt", "Pages.pdf": "1 of 3",
            "Photo.png": "Zoom in", "Sound.wav": "Play", "Thing.bin": "Open With", "Words.txt": "Words.txt"}


def prepare(app):
    """The drive that the walk goes through."""
    without_applications(app)
    app.drive.mkdir(parents=True)
    (app.data / "account.ini").write_text("[Account]\nName=Ada\nToken=ab\nSignedIn=true\n")
    for folder in ("Desktop", "Documents", "Plans"):
        (app.drive / folder).mkdir()
    (app.drive / "Plans" / "Garden.txt").write_text("beds")
    (app.drive / "Film.avi").write_bytes(film())
    (app.drive / "Notes.md").write_text(NOTES)
    with zipfile.ZipFile(app.drive / "Old.zip", "w") as archive:
        archive.writestr("readme.txt", "In an archive")
    (app.drive / "Pages.pdf").write_bytes(portable_document(3))
    subprocess.run(["/usr/bin/python3", "-c", PICTURE, str(app.drive / "Photo.png")], check=True)
    sound(app.drive / "Sound.wav")
    (app.drive / "Thing.bin").write_bytes(bytes(range(256)))
    (app.drive / ".Thesis.pdf.vlopromise").write_text("[Promise]\nName=Thesis.pdf\nSize=48000000\n")
    (app.drive / "Words.txt").write_text("Words and more words\n" * 5)
    os.setxattr(app.drive / "Words.txt", "user.xdg.tags", b"Work,Holiday")


class Keyboard:
    def __init__(self, app):
        self.app = app

    def focused(self):
        return [name for _, name in self.app.accessibility.focused()]

    def is_at(self, name):
        wait_for(f"the keyboard to be at “{name}”; it is at {self.focused()}",
                 lambda: any(focused.startswith(name) for focused in self.focused()))

    def reach(self, name, most=40):
        """By Tab, from wherever it is."""
        way = [self.focused()]
        while not any(focused.startswith(name) for focused in way[-1]):
            if len(way) > most:
                raise AssertionError(f"Tab doesn't come to “{name}” but to {way}")
            self.app.key("Tab")
            way.append(self.next_to(way[-1]))

    def next_to(self, before):
        """Where it is now. Within a text it goes from link to link."""
        for _ in range(10):
            focused = self.focused()
            if focused != before:
                return focused
            pause(0.05)
        return before

    def comes_into(self, name):
        """The content of a page, whose title has the name."""
        wait_for(f"the keyboard to leave the header of “{name}”", lambda: self.focused() not in ([], ["Back"]))

    def press(self, name):
        self.reach(name)
        self.app.key("Return")

    def open_menu(self):
        """The window's: of what it is in, the tree tells no change."""
        self.app.key("F10")
        wait_for("the menu", lambda: any(name in ("View as Grid", "Select All") for name in self.focused()))

    def row(self, name):
        """A row of the list, by the beginning of its name."""
        self.app.type(name[:3].lower())
        self.is_at(name)

    def leave(self, gone, at):
        """By Escape, until what showed is gone and the keyboard is where it was."""
        self.app.key("Escape")
        self.app.wait_gone(gone)
        self.is_at(at)


def every_screen(app):
    """Shows one after another, and yields its name."""
    keys = Keyboard(app)
    keys.is_at("Desktop")
    yield "root"
    yield from folders(app, keys)
    yield from menus_of_an_item(app, keys)
    yield from details(app, keys)
    yield from moving(app, keys)
    yield from selecting(app, keys)
    yield from previews(app, keys)
    yield from window_menu(app, keys)


def folders(app, keys):
    keys.row("Plans")
    app.key("Return")
    app.wait_title("Plans")
    keys.is_at("Garden.txt")
    yield "folder"
    app.key("Escape")
    app.wait_title("Vaelo Drive")
    keys.is_at("Plans")
    app.key("ctrl+f")
    app.wait("Search below this folder")
    app.type("garden")
    app.wait("Garden.txt", "list item")
    yield "search"
    app.key("Tab")
    keys.reach("Garden.txt")
    app.key("Escape")
    keys.is_at("Plans")
    change_view(app, keys, "View as grid")
    yield "grid"
    change_view(app, keys, "View as list")


def change_view(app, keys, button):
    """By the button of a wide window, or in the menu of a narrow one."""
    if app.find(button):
        keys.press(button)
        wait_for("the other view", lambda: not app.find(button))
        return
    keys.open_menu()
    app.key("Return")
    app.wait_gone("View as Grid")


def menus_of_an_item(app, keys):
    keys.reach(("Desktop", "Plans"))
    keys.row("Words.txt")
    app.key("Menu")
    app.wait("Rename…", "menu item")
    yield "item menu"
    keys.leave("Rename…", "Words.txt")
    app.key("F2")
    app.wait("Enter a new name for this item.")
    yield "name prompt"
    keys.leave("Enter a new name for this item.", "Words.txt")
    app.key("Menu")
    app.wait("Tags…", "menu item")
    app.key("t")
    app.wait("Work", "check box")
    yield "tags"
    keys.leave("New tag", "Words.txt")
    app.key("Menu")
    app.wait("Share…", "menu item")
    app.key("s")
    app.wait("Copy Link")
    yield "share sheet"
    keys.leave("Copy Link", "Words.txt")
    app.key("Delete")
    app.wait("Delete from Vaelo Drive", "push button")
    yield "delete sheet"
    keys.leave("Delete from Vaelo Drive", "Words.txt")


def details(app, keys):
    app.key("alt+Return")
    app.wait("Kind", "label")
    yield "details"
    app.key("ctrl+t")
    app.wait("New tag")
    app.key("Escape")
    app.wait_gone("New tag")
    keys.reach("Name")
    app.wait_title("Rename File")
    yield "name in the details"
    app.key("Escape")
    wait_for("the editing to end", lambda: not app.find("Rename File"))
    keys.reach("Share")
    app.key("Escape")
    app.wait_title("Vaelo Drive")
    keys.is_at("Words.txt")


def moving(app, keys):
    app.key("ctrl+m")
    app.wait("The item is in this folder already.")
    yield "folder picker"
    keys.press("New Folder")
    app.wait("Enter a name for this folder.")
    yield "new folder in the picker"
    app.key("Escape")
    app.wait_gone("Enter a name for this folder.")
    keys.leave("The item is in this folder already.", "Words.txt")
    app.key("Home")
    keys.is_at("Desktop")
    app.key("Delete")
    app.wait("This can’t be done with this item.")
    yield "alert"
    app.key("Return")
    app.wait_gone("This can’t be done with this item.")
    keys.is_at("Desktop")


def selecting(app, keys):
    keys.press("Select")
    app.wait_title("Select Items")
    keys.reach("Desktop")
    app.key("Down", "Down", "space", "Down", "space")
    app.wait_title("2 Items Selected")
    yield "select"
    keys.reach("Move")
    keys.reach("Delete")
    keys.press("New Folder")
    app.wait("Enter a name for this folder.")
    yield "new folder"
    app.key("Escape")
    app.wait_gone("Enter a name for this folder.")
    app.key("Escape")
    app.wait_title("Vaelo Drive")


def previews(app, keys):
    keys.is_at("Film.avi")
    for name, shown in PREVIEWS.items():
        keys.row(name)
        app.key("Return")
        app.wait_title(name)
        app.wait(shown)
        keys.comes_into(name)
        yield f"preview of {name}"
        keys.reach("Share")
        app.key("Escape")
        app.wait_title("Vaelo Drive")
        keys.is_at(name)
    keys.row("Thesis.pdf")
    app.key("Return")
    app.wait_title("Thesis.pdf")
    yield "not downloaded"
    app.key("Escape")
    app.wait_title("Vaelo Drive")
    keys.is_at("Thesis.pdf")


def window_menu(app, keys):
    keys.open_menu()
    yield "main menu"
    app.key("Up", "Return")
    app.wait("Legal")
    yield "about"
    app.key("Escape")
    app.wait_gone("Legal")
    app.key("ctrl+question")
    app.wait("Folder Above", "list item")
    yield "keyboard shortcuts"
    app.key("Escape")
    app.wait_gone("Folder Above")
    keys.open_menu()
    app.key("c")
    app.wait("Sign Out: Ada")
    yield "accounts"
    keys.press("Sign Out: Ada")
    app.wait("Vaelo Drive is not available")
    app.key("Escape")
    app.wait_gone("On This Device")
    yield "unavailable"
    keys.press("Accounts…")
    app.wait("Sign In: Ada")
    keys.press("Sign In: Ada")
    app.wait("Desktop", "list item")
    app.key("Escape")
