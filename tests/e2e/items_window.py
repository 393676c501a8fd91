# SPDX-License-Identifier: GPL-3.0-or-later
"""A window on a small drive, and what a person does with the items in it."""
import unittest

from harness import App, wait_for


def content(folder):
    """Every file below a folder with its bytes, and every folder."""
    return {str(path.relative_to(folder)): path.read_bytes() if path.is_file() else None for path in folder.rglob("*")}


class ItemsWindow(unittest.TestCase):
    size = (800, 640)
    screen = (1280, 800)

    def prepare(self, app):
        """For what a test puts into the drive beforehand."""

    def setUp(self):
        def prepare(app):
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            for folder in ("Desktop", "Documents", "Plans"):
                (app.drive / folder).mkdir()
            for name in ("Report.txt", "Second.txt", "Third.txt"):
                (app.drive / name).write_text(name)
            self.prepare(app)
        self.app = App(size=self.size, prepare=prepare, screen=self.screen)
        self.addCleanup(self.app.close)
        self.app.wait("Report.txt", "list item")
        self.drive = self.app.drive

    def on_disk(self, path, there=True):
        wait_for(f"{path} {'to be' if there else 'to go'}", lambda: (self.drive / path).exists() == there)

    def menu(self, item, key):
        """Opens the item's menu by the pointer and chooses from it by the letter that stands for the action."""
        self.app.click(item, "list item", button=3)
        self.app.wait("Rename…", "menu item")
        self.app.key(key)

    def press(self, name):
        """A button of the dialog that is in front, whose places are told within its own window."""
        app = self.app
        rows = wait_for(f"“{name}” in the dialog",
                        lambda: [row for row in app.accessibility.showing() if row[1].startswith(name) and row[0] == "push button"])
        geometry = dict(line.split("=") for line in
                        app.desktop.tool("xdotool", "getwindowfocus", "getwindowgeometry", "--shell").splitlines()
                        if "=" in line)
        row = rows[-1]
        app.mouse("mousemove", "--sync", str(int(geometry["X"]) + row[2] + row[4] // 2),
                  str(int(geometry["Y"]) + row[3] + row[5] // 2), "click", "1")

    def choose(self, *items):
        self.app.click("Select", "push button")
        self.app.wait_title("Select Items")
        for item in items:
            self.app.click(item, "list item")

    def click_message(self, name):
        """A message's button, when it has slid to its place."""
        before = [None]

        def rests():
            row = self.app.find(name, "push button")
            before[0], same = row, row is not None and row == before[0]
            return same
        wait_for(f"“{name}” to rest", rests)
        self.app.click(name, "push button")

    def answer(self, *keys):
        """Answers the sheet that shows by keyboard, which begins at Cancel, the last answer."""
        wait_for("the sheet's answers", lambda: self.app.find("Cancel", "push button"))
        self.app.key(*keys)

    def delete_for_good(self):
        self.app.wait("Delete from Vaelo Drive", "push button")
        self.answer("Up", "Return")
