# SPDX-License-Identifier: GPL-3.0-or-later
"""The keys: their list in the application, and where the keyboard is after what was done with it."""
import re
import unittest

from harness import ROOT, App, wait_for
from items_window import ItemsWindow


class ListOfShortcuts(ItemsWindow):
    def shown(self):
        """{what is done: its keys in words}."""
        return {name: keys for role, name, keys, _ in self.app.accessibility.controls() if role == "list item" and keys}

    def test_it_names_every_key_that_the_manual_does(self):
        app = self.app
        app.key("ctrl+question")
        app.wait("Keyboard Shortcuts")
        shown = wait_for("the keys", self.shown)
        self.assertEqual(shown["Folder Above"], "Alt+Up")
        self.assertEqual(shown["Refresh"], "F5, Ctrl+R")
        self.assertEqual(shown["Keyboard Shortcuts"], "Ctrl+?")
        listed = {key for keys in shown.values() for key in keys.split(", ")}
        manual = (ROOT / "README.md").read_text().partition("## Use it")[2].partition("## ")[0]
        named = re.findall(r"\b(?:(?:Ctrl|Alt|Shift)\+\S+?|F\d+|Escape|Delete|Enter|Tab|Menu)(?=[\s,;|.])", manual)
        self.assertIn("Ctrl+?", named)
        self.assertEqual({key.replace("Enter", "Return") for key in named} - listed, set())
        app.key("Escape")
        app.wait_gone("Folder Above")

    def test_the_main_menu_leads_to_it(self):
        app = self.app
        app.key("F10")
        app.wait("Keyboard Shortcuts", "menu item")
        app.key("k")
        wait_for("the first row", lambda: ("list item", "Main Menu") in app.accessibility.focused())


class WaysUp(ItemsWindow):
    def prepare(self, app):
        (app.drive / "Plans" / "Garden.txt").write_text("beds")

    def test_alt_up_goes_to_the_folder_above(self):
        app = self.app
        app.click("Plans", "list item")
        app.wait("Garden.txt")
        app.key("alt+Up")
        app.wait_gone("Garden.txt")
        wait_for("the keyboard at the folder", lambda: any(name.startswith("Plans") for _, name in app.accessibility.focused()))
        app.key("alt+Up")
        self.assertTrue(app.running())


class KeyboardWindow(ItemsWindow):
    def at(self, name):
        wait_for(lambda: f"the keyboard to be at “{name}”; it is at {self.app.accessibility.focused()}",
                 lambda: any(focused.startswith(name) for _, focused in self.app.accessibility.focused()))

    def go_to(self, name):
        self.app.type(name[:3].lower())
        self.at(name)


class AfterChanges(KeyboardWindow):
    def test_a_renamed_item_keeps_the_keyboard_and_so_it_does_when_that_is_taken_back(self):
        app = self.app
        self.go_to("Second.txt")
        app.key("F2")
        app.wait("Enter a new name for this item.")
        app.key("ctrl+a")
        app.type("Zebra.txt")
        app.key("Return")
        app.wait("Zebra.txt", "list item")
        self.at("Zebra.txt")
        app.key("Up")
        self.at("Third.txt")
        app.key("Down")
        self.at("Zebra.txt")
        self.click_message("Undo")
        app.wait("Second.txt", "list item")
        self.at("Second.txt")

    def test_a_folder_made_in_an_empty_one_has_the_keyboard(self):
        app = self.app
        self.go_to("Plans")
        app.key("Return")
        app.wait("This folder is empty")
        app.click("Select", "push button")
        app.click("New Folder", "push button")
        app.wait("Enter a name for this folder.")
        app.type("Beds")
        app.key("Return")
        app.wait("Beds", "list item")
        self.at("Beds")

    def test_back_from_an_empty_folder_it_is_at_the_folder(self):
        app = self.app
        self.go_to("Plans")
        app.key("Return")
        app.wait("This folder is empty")
        app.key("Escape")
        app.wait_gone("This folder is empty")
        self.at("Plans")

    def test_back_from_a_document_that_a_link_opened_it_is_at_the_document(self):
        app = self.app
        app.link(f"vaelodriveapp:{self.drive}/Third.txt?mode=preview")
        app.wait_title("Third.txt")
        app.key("Escape")
        self.at("Third.txt")


class Selecting(KeyboardWindow):
    def test_a_range_with_shift_replaces_the_one_before_by_tap_and_by_key(self):
        app = self.app
        self.choose("Plans")
        app.wait_title("1 Item Selected")
        self.shift_click("Third.txt")
        app.wait_title("4 Items Selected")
        self.shift_click("Report.txt")
        app.wait_title("2 Items Selected")
        app.key("shift+Down")
        app.wait_title("3 Items Selected")
        self.shift_click("Desktop")
        app.wait_title("3 Items Selected")
        app.click("Third.txt", "list item")
        app.wait_title("4 Items Selected")
        self.shift_click("Second.txt")
        app.wait_title("5 Items Selected")

    def test_a_range_by_key_begins_where_the_keyboard_is(self):
        app = self.app
        self.choose("Desktop")
        app.wait_title("1 Item Selected")
        app.key("Down", "Down", "Down")
        self.at("Report.txt")
        app.key("shift+Down", "shift+Down")
        app.wait_title("4 Items Selected")
        app.key("shift+Up", "shift+Up", "shift+Up")
        self.at("Plans")
        app.wait_title("3 Items Selected")
        app.key("Escape")
        app.wait_title("Vaelo Drive")
        app.key("End")
        self.at("Third.txt")
        app.click("Select", "push button")
        app.wait_title("Select Items")
        app.key("shift+Up")
        app.wait_title("2 Items Selected")

    def shift_click(self, name):
        self.app.mouse("keydown", "shift")
        self.app.click(name, "list item")
        self.app.mouse("keyup", "shift")


class WhereScreensBegin(KeyboardWindow):
    size = (360, 720)

    def test_the_details_begin_with_their_content_and_change_nothing(self):
        app = self.app
        self.go_to("Report.txt")
        app.key("alt+Return")
        app.wait("Kind", "label")
        wait_for(lambda: f"the keyboard in the content; it is at {app.accessibility.focused()}",
                 lambda: [role for role, _ in app.accessibility.focused()] == ["scroll pane"])
        app.key("Return")
        app.key("ctrl+t")
        app.wait("New tag")
        app.key("Escape")
        app.wait_gone("New tag")
        wait_for("the content again", lambda: [role for role, _ in app.accessibility.focused()] == ["scroll pane"])
        self.assertIsNone(app.find("Rename File"))

    def test_the_share_sheet_begins_with_its_first_row(self):
        app = self.app
        self.go_to("Report.txt")
        app.key("Menu")
        app.wait("Share…", "menu item")
        app.key("s")
        app.wait("Share Report.txt", "list")

        def is_at_first():
            roles_and_names = [row[:2] for row in app.accessibility.showing()]
            behind = roles_and_names[roles_and_names.index(("list", "Share Report.txt")):]
            first = next((name for role, name in behind if role == "list item"), None)
            return ("list item", first) in app.accessibility.focused()
        wait_for(lambda: f"the first row; the keyboard is at {app.accessibility.focused()}", is_at_first)

    def test_accounts_begin_with_the_first_and_end_with_the_way_back_to_them(self):
        app = self.app
        app.key("F10")
        app.wait("Accounts…", "menu item")
        app.key("c")
        app.wait("Sign Out: x")
        wait_for("the account’s row", lambda: ("list item", "x") in app.accessibility.focused())
        app.key("Tab", "Return")
        app.wait("Sign In: x")
        app.key("Escape")
        app.wait_gone("Sign In: x")
        self.at("Accounts…")


class AfterChangesOnAPhone(KeyboardWindow):
    size = (360, 720)

    def test_after_a_deletion_the_next_item_has_the_keyboard(self):
        app = self.app
        self.go_to("Report.txt")
        app.key("Delete")
        self.delete_for_good()
        self.on_disk("Report.txt", False)
        self.at("Second.txt")
        app.key("Down")
        self.at("Third.txt")
        app.key("Delete")
        self.delete_for_good()
        self.on_disk("Third.txt", False)
        self.at("Second.txt")


if __name__ == "__main__":
    unittest.main()
