# SPDX-License-Identifier: GPL-3.0-or-later
"""Changes in a real window that meet what other programs do in between, disks that refuse, and a second instance: each ends with
every byte accounted for."""
import os
import shutil
import subprocess
import unittest

from harness import App, wait_for
from items_window import ItemsWindow, content


def mounted(test, place, *options):
    """Mounts something at a place for the length of a test; skips it where that is not allowed."""
    done = subprocess.run(["mount", *options, str(place)], capture_output=True, text=True)
    if done.returncode:
        test.skipTest(f"nothing can be mounted here: {done.stderr.strip()}")
    test.addCleanup(subprocess.run, ["umount", "-l", str(place)])


class Between(ItemsWindow):
    """What happens between the question and the answer."""

    def test_an_item_that_is_gone_is_not_looked_for_elsewhere(self):
        app = self.app
        before = content(self.drive)
        self.menu("Report.txt", "d")
        app.wait("Delete from Vaelo Drive")
        os.replace(self.drive / "Report.txt", self.drive / "Plans" / "Report.txt")
        self.delete_for_good()
        wait_for("an alert", lambda: app.find("OK", "push button"))
        app.key("Return")
        after = content(self.drive)
        self.assertEqual(after.pop("Plans/Report.txt"), before.pop("Report.txt"))
        self.assertEqual(after, before)

    def test_items_that_are_gone_are_told_and_the_others_move(self):
        app = self.app
        self.choose("Second.txt", "Third.txt")
        app.click("Move", "push button")
        app.wait("The items are in this folder already.")
        app.key("Down", "Down", "Return")
        wait_for("the way into the folder", lambda: not app.find("The items are in this folder already."))
        os.replace(self.drive / "Second.txt", self.drive.parent / "taken away")
        self.press("Move")
        self.on_disk("Plans/Third.txt")
        app.wait("The file “Second.txt” doesn’t exist any more.")
        self.assertEqual((self.drive.parent / "taken away").read_text(), "Second.txt")

    def test_an_item_that_became_a_folder_is_renamed_with_all_in_it(self):
        app = self.app
        self.menu("Report.txt", "r")
        app.wait("Enter a new name for this item.")
        (self.drive / "Report.txt").unlink()
        (self.drive / "Report.txt").mkdir()
        (self.drive / "Report.txt" / "new").write_text("new")
        app.key("ctrl+a")
        app.type("Summary")
        app.key("Return")
        self.on_disk("Summary.txt/new")
        self.assertEqual((self.drive / "Summary.txt" / "new").read_text(), "new")

    def test_the_target_that_is_gone_is_told_and_nothing_moves(self):
        app = self.app
        self.choose("Second.txt", "Third.txt")
        app.click("Move", "push button")
        app.wait("The items are in this folder already.")
        app.key("Down", "Down", "Return")
        wait_for("the way into the folder", lambda: not app.find("The items are in this folder already."))
        (self.drive / "Plans").rmdir()
        self.press("Move")
        wait_for("an alert", lambda: app.find("OK", "push button"))
        self.assertEqual((self.drive / "Second.txt").read_text(), "Second.txt")
        self.assertEqual((self.drive / "Third.txt").read_text(), "Third.txt")

    def test_a_menu_goes_with_its_folder_and_the_window_goes_on(self):
        app = self.app
        (self.drive / "Plans" / "Inside.txt").write_text("inside")
        app.click("Plans", "list item")
        app.wait("Inside.txt", "list item")
        app.click("Inside.txt", "list item", button=3)
        app.wait("Rename…", "menu item")
        shutil.rmtree(self.drive / "Plans")
        app.wait("Report.txt", "list item")
        app.wait_gone("Inside.txt")
        app.click("Main Menu")
        app.wait("Accounts…", "menu item")
        app.link("vaelodriveapp:" + str(self.drive / "Documents"))
        app.wait_title("Documents")
        app.click("Main Menu")
        app.wait("Accounts…", "menu item")


class Disks(ItemsWindow):
    def prepare(self, app):
        (app.drive / "Plans" / "Inside.txt").write_text("inside")

    def test_a_folder_that_can_only_be_read_says_so_and_keeps_all(self):
        app = self.app
        before = content(self.drive)
        mounted(self, self.drive / "Plans", "--bind", str(self.drive / "Plans"))
        subprocess.run(["mount", "-o", "remount,bind,ro", str(self.drive / "Plans")], check=True)
        app.click("Plans", "list item")
        self.menu("Inside.txt", "r")
        app.wait("Enter a new name for this item.")
        app.type("x")
        app.key("Return")
        app.wait("“Inside.txt” is on a disk that can only be read.")
        app.key("Escape")
        app.wait_gone("Enter a new name for this item.")
        self.menu("Inside.txt", "d")
        self.delete_for_good()
        app.wait("“Inside.txt” is on a disk that can only be read.")
        app.key("Return")
        app.click("Select", "push button")
        app.click("New Folder", "push button")
        app.wait("Enter a name for this folder.")
        app.type("Letters")
        app.key("Return")
        app.wait("“Letters” is on a disk that can only be read.")
        self.assertEqual(content(self.drive), before)

    def test_a_full_disk_says_so_and_keeps_all(self):
        app = self.app
        (self.drive / "Large.bin").write_bytes(b"x" * 100000)
        mounted(self, self.drive / "Plans", "-t", "tmpfs", "-o", "size=64k,nr_inodes=20", "none")
        (self.drive / "Plans" / "Here.txt").write_text("here")
        before = content(self.drive)
        app.key("F5")
        self.choose("Large.bin")
        app.click("Move", "push button")
        app.wait("The item is in this folder already.")
        app.key("Down", "Down", "Return")
        wait_for("the way into the folder", lambda: not app.find("The item is in this folder already."))
        self.press("Move")
        app.wait("There is not enough space for “Large.bin”. Delete something and try again.")
        self.assertEqual(content(self.drive), before)


class Two(ItemsWindow):
    """A second instance, on a session of its own, has the same drive open."""

    def prepare(self, app):
        (app.drive / "Zoo").mkdir()
        for i in range(200):
            (app.drive / f"Zz {i}").write_text(str(i))

    def begin_move(self, app, *way):
        app.click("Select", "push button")
        app.wait_title("Select Items")
        app.click("Report.txt", "list item")
        app.wait_title("1 Item Selected")
        app.key("ctrl+a")
        app.wait_title("207 Items Selected")
        for folder in ("Desktop", "Documents", "Plans", "Zoo"):
            app.click(folder, "list item")
        app.wait_title("203 Items Selected")
        app.click("Move", "push button")
        app.wait("The items are in this folder already.")
        app.key(*way, "Return")
        wait_for("the way into the folder", lambda: not app.find("The items are in this folder already."))

    def test_both_move_the_same_items_at_once(self):
        one = self.app
        environment = {f"XDG_{name}_HOME": str(one.base / name.lower()) for name in ("DATA", "CONFIG", "CACHE")}
        two = App(size=self.size, **environment)
        self.addCleanup(two.close)
        two.wait("Report.txt", "list item")
        before = {path.name: path.read_bytes() for path in self.drive.iterdir() if path.is_file()}
        self.begin_move(one, "Down", "Down")
        self.begin_move(two, "Down", "Down", "Down")
        places = [self.button(app, "Move") for app in (one, two)]
        presses = [subprocess.Popen(["xdotool", "mousemove", "--sync", str(x), str(y), "click", "1"],
                                    env=app.desktop.environment) for app, (x, y) in zip((one, two), places)]
        for press in presses:
            self.assertEqual(press.wait(), 0)
        wait_for("all to be moved", lambda: not [path for path in self.drive.iterdir()
                                                 if path.is_file() and not path.name.startswith(".")])
        after = {}
        for folder in ("Plans", "Zoo"):
            for path in (self.drive / folder).iterdir():
                self.assertNotIn(path.name, after, "in one place")
                after[path.name] = path.read_bytes()
        for path in self.drive.iterdir():
            if path.is_file():
                after[path.name] = path.read_bytes()
        self.assertEqual(after, before)
        self.assertTrue(one.running() and two.running())

    @staticmethod
    def button(app, name):
        """The place of a button of the dialog in front, on the display."""
        rows = wait_for(f"“{name}” in the dialog", lambda: [
            row for row in app.accessibility.showing() if row[1].startswith(name) and row[0] == "push button"])
        geometry = dict(line.split("=") for line in
                        app.desktop.tool("xdotool", "getwindowfocus", "getwindowgeometry", "--shell").splitlines()
                        if "=" in line)
        row = rows[-1]
        return int(geometry["X"]) + row[2] + row[4] // 2, int(geometry["Y"]) + row[3] + row[5] // 2


if __name__ == "__main__":
    unittest.main()
