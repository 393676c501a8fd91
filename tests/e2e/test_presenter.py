# SPDX-License-Identifier: GPL-3.0-or-later
"""A document is shown while other programs change, move, replace and delete it."""
import os
import shutil
import subprocess
import time
import unittest

from bare_desktop import without_applications
from document_words import words
from harness import App, wait_for


class Shown(unittest.TestCase):
    def setUp(self):
        self.app = App(demo=True, prepare=without_applications)
        self.addCleanup(self.app.close)
        self.app.wait("Documents,", "list item")
        self.folder = self.app.drive / "Documents"
        self.letter = self.folder / "Letter.txt"
        self.letter.write_text("Dear reader, this is how it was.\n")
        os.utime(self.letter, (1770000000, 1770000000))
        self.app.click("Documents", "list item")
        self.app.wait_title("Documents")
        self.show("Letter.txt")
        self.wait_words("this is how it was")

    def show(self, name):
        self.app.click(name, "list item")
        self.app.wait_title(name)

    def wait_words(self, text):
        wait_for(f"the words “{text}”", lambda: text in words(self.app))

    def run_program(self, *command):
        subprocess.run(command, check=True, cwd=self.folder)

    def test_a_change_is_shown(self):
        self.letter.write_text("Dear reader, this is how it is now.\n")
        self.wait_words("this is how it is now")
        self.app.wait_log("presentedItemDidChange: ")

    def test_an_editor_that_saves_by_renaming_keeps_the_preview(self):
        (self.folder / ".Letter.txt.swp").write_text("Saved under another name.\n")
        (self.folder / ".Letter.txt.swp").rename(self.letter)
        self.wait_words("Saved under another name.")
        self.letter.rename(self.folder / "Letter.txt~")
        self.letter.write_text("Saved with a backup.\n")
        self.wait_words("Saved with a backup.")
        self.app.wait_title("Letter.txt")
        self.assertNotIn("Accommodate deletion", self.app.log())
        self.assertNotIn("presentedItemDidMoveToURL", self.app.log())

    def test_the_title_follows_a_move(self):
        self.run_program("mv", "Letter.txt", "Epistle.txt")
        self.app.wait_title("Epistle.txt")
        self.run_program("mv", "Epistle.txt", "../Desktop/Missive.txt")
        self.app.wait_title("Missive.txt")
        (self.app.drive / "Desktop" / "Missive.txt").write_text("Changed where it is now.\n")
        self.wait_words("Changed where it is now.")
        self.run_program("mv", "../Desktop", "../Table")
        self.app.wait_log("Table/Missive.txt")
        self.app.key("Escape")
        self.assertTrue(self.app.running())

    def test_the_preview_goes_when_the_document_is_deleted(self):
        begun = time.monotonic()
        self.run_program("rm", "Letter.txt")
        self.app.wait_log("Accommodate deletion: ")
        self.assertLess(time.monotonic() - begun, 1.5)
        self.app.wait_title("Documents")
        self.app.wait_gone("Letter.txt,")

    def test_the_preview_goes_when_the_document_leaves_the_drive(self):
        self.run_program("mv", "Letter.txt", str(self.app.desktop.scratch))
        self.app.wait_title("Documents")

    def test_the_preview_goes_when_the_document_goes_to_the_trash(self):
        trash = self.app.data / "mirror" / ".Trash"
        trash.mkdir(exist_ok=True)
        self.run_program("mv", "Letter.txt", str(trash))
        self.app.wait_title("Documents")

    def test_the_preview_goes_with_its_folder(self):
        shutil.rmtree(self.folder)
        self.app.wait_title("Vaelo Drive")
        self.assertTrue(self.app.running())

    def test_a_folder_in_its_place_says_so(self):
        self.letter.unlink()
        self.letter.mkdir()
        message = "There is a folder in this document’s place now."
        wait_for("the message", lambda: any(message in name for name in self.app.names()))
        self.app.wait_title("Letter.txt")
        self.letter.rmdir()
        self.app.wait_title("Documents")

    def test_a_document_that_is_deleted_while_it_loads(self):
        self.app.key("Escape")
        self.app.wait_title("Documents")
        large = self.folder / "Large.txt"
        large.write_text("All work and no play.\n" * 3_000_000)
        self.app.wait("Large.txt", "list item")
        self.app.click("Large.txt", "list item")
        large.unlink()
        self.app.wait_gone("Large.txt,")
        self.app.wait_title("Documents")
        self.assertTrue(self.app.running())
        self.show("Letter.txt")

    def test_its_own_menus_and_dialogs_leave_the_application_in_front(self):
        self.app.click("Main Menu")
        self.app.wait("Accounts…", "menu item")
        self.app.key("c")
        self.app.wait("On This Device")
        self.letter.write_text("Changed behind a dialog.\n")
        self.app.wait_log("presentedItemDidChange: ")
        self.app.key("Escape")
        self.app.wait_gone("On This Device")
        self.wait_words("Changed behind a dialog.")
        self.assertNotIn("Resigning active for ", self.app.log())

    def test_what_happened_behind_another_window_is_shown_on_return(self):
        self.app.desktop.start(["xmessage", "another window"], self.app.desktop.environment)
        self.app.wait_log("Resigning active for ")
        self.run_program("mv", "Letter.txt", "Epistle.txt")
        (self.folder / "Epistle.txt").write_text("Behind your back.\n")
        self.app.desktop.tool("xdotool", "windowactivate", "--sync", self.app.window)
        self.app.wait_title("Epistle.txt")
        self.wait_words("Behind your back.")


if __name__ == "__main__":
    unittest.main()
