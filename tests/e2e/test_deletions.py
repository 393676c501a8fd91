# SPDX-License-Identifier: GPL-3.0-or-later
"""Deletions in a real window, their question, and how they are called off; each seen on the disk."""
import shutil
import unittest

from harness import PROGRAM, pause, wait_for
from items_window import ItemsWindow, content


class Deletions(ItemsWindow):
    def prepare(self, app):
        library = app.data / "mirror" / "org~example~Notes"
        (library / "Documents" / "Folder").mkdir(parents=True)
        (library / ".vaelo-container").write_text("[Container]\nName=Notes\n")
        (library / "Documents" / "Note.txt").write_text("note")
        (library / "Documents" / "Folder" / "Deep.txt").write_text("deep")
        for i in range(1500):
            (app.drive / "Plans" / str(i)).write_text(str(i))

    def held(self):
        place = self.app.data / "mirror" / ".vaelo" / "removing"
        return [path for path in place.rglob("*") if path.is_file()] if place.is_dir() else []

    def test_a_library_is_emptied(self):
        self.menu("Notes", "d")
        self.app.wait("The Notes app library, and all its documents, will be permanently deleted")
        self.delete_for_good()
        library = self.app.data / "mirror" / "org~example~Notes"
        wait_for("the library to be empty",
                 lambda: sorted(content(library)) == [".vaelo-container", "Documents"])
        wait_for("the disk to be free of it", lambda: not self.held())
        self.app.wait("Notes, 0 items", "list item")

    def test_an_empty_drive_tells_how_things_come_into_it(self):
        app = self.app
        shutil.rmtree(app.data / "mirror" / "org~example~Notes")
        for item in self.drive.iterdir():
            shutil.rmtree(item) if item.is_dir() else item.unlink()
        app.wait("This folder is empty")
        app.wait(f"Press “Select” to make a folder. Files that you put into “{self.drive}” appear here.")

    def test_a_library_and_a_document_are_not_deleted_together(self):
        app = self.app
        self.choose("Notes", "Report.txt")
        app.wait_title("2 Items Selected")
        delete = app.wait("Delete", "push button")
        self.assertFalse(delete[6], "the button is off")
        self.assertFalse(app.wait("Move", "push button")[6])

    def test_special_folders_turn_the_buttons_off(self):
        app = self.app
        self.choose("Report.txt")
        app.wait_title("1 Item Selected")
        self.assertTrue(app.wait("Delete", "push button")[6])
        app.click("Desktop", "list item")
        app.wait_title("2 Items Selected")
        wait_for("the button to be off", lambda: not app.wait("Delete", "push button")[6])

    def test_all_of_a_folder_are_deleted(self):
        app = self.app
        app.click("Plans", "list item")
        app.wait("0,", "list item")
        app.click("Select", "push button")
        app.wait_title("Select Items")
        app.click("0,", "list item")
        app.wait_title("1 Item Selected")
        app.key("ctrl+a")
        app.wait_title("1,500 Items Selected")
        app.click("Delete", "push button")
        app.wait("1,500 items will be permanently deleted")
        self.delete_for_good()
        wait_for("the folder to be empty", lambda: not list((self.drive / "Plans").iterdir()))
        app.wait("This folder is empty")
        self.on_disk("Report.txt")

    def test_a_range_by_shift(self):
        app = self.app
        self.choose("Report.txt")
        app.mouse("keydown", "Shift_L")
        try:
            app.click("Third.txt", "list item")
        finally:
            app.mouse("keyup", "Shift_L")
        app.wait_title("3 Items Selected")
        app.click("Delete", "push button")
        app.wait("3 items will be permanently deleted")
        self.delete_for_good()
        for name in ("Report.txt", "Second.txt", "Third.txt"):
            self.on_disk(name, False)
        self.on_disk("Plans")

    def test_a_large_folder_is_had_back(self):
        app = self.app
        before = content(self.drive)
        self.menu("Plans", "d")
        app.wait("Delete from Vaelo Drive")
        self.delete_for_good()
        self.on_disk("Plans", False)
        app.wait("Deleting “Plans” and its 1,500 items…")
        self.click_message("Cancel")
        app.wait("“Plans” is back, with everything in it.")
        self.assertEqual(content(self.drive), before)
        app.wait("Plans", "list item")
        self.menu("Plans", "d")
        app.wait("Delete from Vaelo Drive")
        self.delete_for_good()
        app.wait("Deleting “Plans”")
        app.wait_gone("“Plans” is back")
        wait_for("nothing of it to be left", lambda: not self.held())
        app.wait_gone("Deleting “Plans”")
        pause(0.5)  # in which the next message would come
        self.assertIsNone(app.find("“Plans” is back"), "of the time before")

    def test_a_large_folder_goes_though_the_program_ends(self):
        app = self.app
        self.menu("Plans", "d")
        app.wait("Delete from Vaelo Drive")
        self.delete_for_good()
        app.wait("Deleting “Plans” and its 1,500 items…")
        app.process.kill()
        app.process.wait()
        self.on_disk("Plans", False)
        self.assertEqual(len(self.held()), 1500)
        app.process = app.desktop.start([PROGRAM], app.desktop.environment, log=app.log_file)
        app.show_window(self.size)
        wait_for("what was left to be removed", lambda: not self.held())
        self.on_disk("Report.txt")


class Narrow(ItemsWindow):
    size = (400, 640)

    def test_a_tap_beside_the_sheet_and_escape_delete_nothing(self):
        app = self.app
        self.menu("Report.txt", "d")
        app.wait("Delete from Vaelo Drive")
        x, y = app.place(app.wait("Desktop", "list item"))
        app.mouse("mousemove", "--sync", str(x), str(y), "click", "1")
        app.wait_gone("Delete from Vaelo Drive")
        app.wait_log("Delete: Cancel pressed")
        app.wait_title("Vaelo Drive")
        self.menu("Report.txt", "d")
        app.wait("Delete from Vaelo Drive")
        app.key("Escape")
        app.wait_gone("Delete from Vaelo Drive")
        self.on_disk("Report.txt")
        self.menu("Report.txt", "d")
        self.delete_for_good()
        self.on_disk("Report.txt", False)


if __name__ == "__main__":
    unittest.main()
