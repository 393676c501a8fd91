# SPDX-License-Identifier: GPL-3.0-or-later
"""Walking through a drive in a real window."""
import os
import shutil
import unittest

from PIL import Image

from harness import App, Desktop, wait_for


class FirstStart(unittest.TestCase):
    def test_makes_a_drive_with_a_welcome_document(self):
        app = App()
        self.addCleanup(app.close)
        app.wait("Welcome to Vaelo Drive.md", "list item")
        self.assertTrue((app.data / "account.ini").is_file())

    def test_signed_out_shows_the_unavailable_page(self):
        def sign_out(app):
            app.data.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=false\n")
        app = App(prepare=sign_out)
        self.addCleanup(app.close)
        app.wait("Vaelo Drive is not available")
        app.wait_log("(VLO)[WARNING]")
        self.assertIn("Vaelo is not enabled", app.log())


class Browse(unittest.TestCase):
    def setUp(self):
        self.app = App(demo=True)
        self.addCleanup(self.app.close)
        self.app.wait("Documents,", "list item")

    def open(self, name, title=None):
        self.app.click(name, "list item")
        self.app.wait_title(title or name)

    def test_walks_down_by_pointer_and_back_by_every_road(self):
        app = self.app
        for back in (lambda: app.click("Back"), lambda: app.key("Escape"), lambda: app.key("alt+Left"),
                     lambda: app.mouse("click", "8")):
            self.open("Documents")
            app.wait("Minutes 2.txt", "list item")
            back()
            app.wait_title("Vaelo Drive")
            app.wait("Documents,", "list item")

    def test_walks_down_by_keyboard_and_libraries_have_their_names(self):
        app = self.app
        app.desktop.tool("xdotool", "windowsize", "--sync", app.window, "800", "790")
        self.open("Sketchbook")
        app.wait("Animals", "list item")
        app.click("Animals", "list item")
        app.wait_title("Animals")
        app.wait("Birds", "list item")

    def test_rows_stand_as_people_count(self):
        self.open("Documents")
        self.app.wait("Minutes 10.txt", "list item")
        names = [name.split(",")[0] for role, name, *_ in self.app.accessibility.showing() if role == "list item"]
        self.assertEqual([name for name in names if name.startswith("Minutes")],
                         ["Minutes 1.txt", "Minutes 2.txt", "Minutes 10.txt"])
        self.assertIn("Projects", names[0])

    def test_items_not_downloaded_say_so(self):
        self.open("Documents")
        row = self.app.wait("Thesis.pdf", "list item")
        self.assertIn("not downloaded", row[1].lower())

    def test_follows_what_other_programs_do(self):
        app = self.app
        self.open("Desktop")
        app.wait("Screenshot.png", "list item")
        folder = app.drive / "Desktop"
        (folder / "Appeared.txt").write_text("x")
        app.wait("Appeared.txt", "list item")
        (folder / "Appeared.txt").rename(folder / "Renamed.txt")
        app.wait("Renamed.txt", "list item")
        app.wait_gone("Appeared.txt")
        (folder / "Renamed.txt").unlink()
        app.wait_gone("Renamed.txt")
        shutil.rmtree(folder)
        app.wait_title("Vaelo Drive")

    def test_survives_hundreds_of_changes_a_second(self):
        app = self.app
        self.open("Desktop")
        folder = app.drive / "Desktop"
        for i in range(1500):
            (folder / f"Storm {i}.txt").write_text("x")
        for i in range(1, 1500):
            (folder / f"Storm {i}.txt").unlink()
        app.wait("Storm 0.txt", "list item")
        app.wait("2 items")
        self.assertTrue(app.running())

    def test_shows_a_document_and_comes_back(self):
        app = self.app
        self.open("Documents")
        app.click("Contract.pdf", "list item")
        app.wait_title("Contract.pdf")
        app.key("Escape")
        app.wait_title("Documents")

    def test_searches_below_the_folder(self):
        app = self.app
        app.click("Search", "push button")
        app.wait("Search below this folder")
        app.type("owl")
        # With where it lies: a library, and the folders in it.
        app.wait("Owl.png, \u2068Sketchbook\u2069 ▸ \u2068Animals\u2069 ▸ \u2068Birds\u2069", "list item")
        app.key("Escape")
        app.wait("Documents,", "list item")

    def test_a_folder_that_was_found_opens_where_it_lies(self):
        # The lists below it are made anew while the window still holds the one that the pointer is over.
        app = self.app
        app.key("ctrl+f")
        app.wait("Search below this folder")
        app.type("projec")
        app.click("Projects,", "list item")
        app.wait_title("Projects")
        app.key("alt+Left")
        app.wait("Contract.pdf", "list item")
        self.assertTrue(app.running())

    def test_about_shows_the_applications_own_picture(self):
        app = self.app

        def greenish():
            path = app.desktop.scratch / "screen.png"
            app.desktop.tool("import", "-silent", "-window", "root", str(path))
            return sum(g - r > 60 and abs(g - b) < 40 for r, g, b in Image.open(path).convert("RGB").getdata())
        before = greenish()
        app.key("F10")
        wait_for("the menu", lambda: any(name == "Select All" for _, name in app.accessibility.focused()))
        app.key("Up", "Return")
        app.wait("Legal")
        wait_for("the picture", lambda: greenish() > before + 1000)

    def test_shows_an_icon_grid_and_the_list_again(self):
        app = self.app
        app.click("View as grid", "push button")
        app.click("View as list", "push button")
        app.wait("Documents,", "list item")

    def test_refreshes_by_key(self):
        self.app.key("F5")
        self.app.wait("Documents,", "list item")

    def test_links_in_the_drive_lead_on_and_others_nowhere(self):
        app = self.app
        self.open("Links")
        for name, refusal in (("Nowhere", "DLC Selection is symlink that didn't resolve to valid target:"),
                              ("Circle A", "mirror/com~marrow~Kestrel/Links/Circle%20A"),
                              ("Out of the drive", "DLC Selection is symlink to outside target:")):
            app.click(name, "list item")
            app.wait_log(refusal)
            app.wait_title("Links")
        self.assertTrue(app.running())
        app.click("To a folder", "list item")
        app.wait_title("Projects")

    def test_every_odd_name_is_there(self):
        self.app.desktop.tool("xdotool", "windowsize", "--sync", self.app.window, "800", "790")
        self.open("Names")
        self.app.wait("16 items")
        self.app.wait("Café.txt", "list item")


class Narrow(unittest.TestCase):
    """On a phone the title keeps the room that buttons would take; they are in the menu as long as the window is narrow."""

    def setUp(self):
        def prepare(app):
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            for name in ("One.txt", "Two.txt", "A photograph.png"):  # no other application opens pictures
                (app.drive / name).touch()
        self.app = App(size=(360, 720), prepare=prepare)
        self.addCleanup(self.app.close)
        self.app.wait("Two.txt")

    def are_side_by_side(self):
        one, two = self.app.find("One.txt"), self.app.find("Two.txt")
        return one and two and one[3] == two[3]

    def test_the_grid_is_chosen_from_the_menu(self):
        app = self.app
        self.assertIsNone(app.find("View as grid"))
        self.assertFalse(self.are_side_by_side())
        app.click("Main Menu")
        app.wait("View as Grid", "menu item")
        app.key("g")
        wait_for("the icons", self.are_side_by_side)
        app.resize(800, 640)
        app.wait("View as list", "push button")
        app.click("View as list", "push button")
        wait_for("the rows", lambda: app.find("One.txt") and not self.are_side_by_side())
        app.click("Main Menu")
        app.wait("Refresh", "menu item")
        self.assertIsNone(app.find("View as Grid"), "the header bar has it")
        app.key("Escape")
        app.wait_gone("Refresh")
        app.resize(360, 720)
        app.wait_gone("View as grid")
        app.key("F10")
        app.wait("View as Grid", "menu item")
        app.key("g")
        wait_for("the icons again", self.are_side_by_side)

    def test_a_preview_has_its_buttons_below_and_its_whole_name_above(self):
        def title():
            return next(row for row in app.accessibility.showing() if row[:2] == ("label", "A photograph.png") and row[3] < 46)
        app = self.app
        app.click("A photograph.png", "list item")
        app.wait_title("A photograph.png")
        for name in ("Share", "Delete", "Move"):
            self.assertGreater(app.wait(name, "push button")[3], 600)
        narrow = title()[4]
        app.resize(800, 640)
        wait_for("the buttons above", lambda: all(app.wait(name, "push button")[3] < 46 for name in ("Share", "Delete", "Move")))
        self.assertEqual(narrow, title()[4], "cut where it is narrow")

    def test_selecting_is_an_icon_with_a_name(self):
        app = self.app
        self.assertIsNone(app.find("Select", "label"))
        app.click("Select", "push button")
        app.wait_title("Select Items")
        self.assertIsNone(app.find("Search", "push button"), "the count of what is selected has the room")
        app.click("Two.txt")
        app.wait_title("1 Item Selected")
        app.click("Cancel", "push button")
        app.wait("Search", "push button")
        app.resize(800, 640)
        app.wait("Select", "label")


class MaximizingDesktop(Desktop):
    """Its windows take the whole screen, and leave it, by F12."""

    def start_window_manager(self):
        settings = self.scratch / "openbox.xml"
        settings.write_text('<openbox_config xmlns="http://openbox.org/3.4/rc"><keyboard><keybind key="F12">'
                            '<action name="ToggleMaximize"/></keybind></keyboard></openbox_config>')
        self.start(["openbox", "--sm-disable", "--config-file", str(settings)], self.environment)


class MaximizingApp(App):
    desktop_type = MaximizingDesktop


class Maximized(unittest.TestCase):
    def test_a_narrow_window_is_wide_when_it_takes_the_whole_screen(self):
        app = MaximizingApp(size=(360, 720), demo=True)
        self.addCleanup(app.close)
        app.wait("Documents,", "list item")
        self.assertIsNone(app.find("Select", "label"))
        app.key("F12")
        wait_for("the whole screen", lambda: app.find("Vaelo Drive", "frame")[4] > 1200)
        app.wait("Select", "label")
        app.key("F12")
        wait_for("the narrow window", lambda: app.find("Vaelo Drive", "frame")[4] < 400)
        wait_for("the icon", lambda: not app.find("Select", "label"))


class Links(unittest.TestCase):
    def setUp(self):
        self.app = App(demo=True)
        self.addCleanup(self.app.close)
        self.app.wait("Documents,", "list item")

    def test_a_link_from_a_second_process_jumps_in_the_running_window(self):
        app = self.app
        status, said = app.link(f"vaelodriveapp:{app.drive}/Documents/Projects/Garden")
        self.assertEqual(status, 0, said)
        app.wait_title("Garden")
        app.key("Escape")
        app.wait_title("Projects")

    def test_links_that_come_while_the_window_still_slides_are_shown(self):
        app = self.app
        for _ in range(3):
            for document, mode in (("Pictures/Photo%25203.jpg", "details"), ("Pictures/Photo%25202.jpg", "preview")):
                status, said = app.link(f"vaelodriveapp:{app.drive}/{document}?mode={mode}")
                self.assertEqual(status, 0, said)
            app.wait_title("Photo 2.jpg")
        self.assertNotIn("CRITICAL", app.log())

    def test_bad_links_are_refused_and_nothing_else_happens(self):
        app = self.app
        trash = app.data / "mirror" / ".Trash" / "Thrown away.txt"
        for link in ("other:/x", "VAELODRIVEAPP:" + str(app.drive), "vaelodriveapp:relative", "vaelodriveapp:/%zz", "vaelodriveapp:/%25zz",
                     "vaelodriveapp:/etc/passwd", f"vaelodriveapp:{str(trash).replace(' ', '%2520')}",
                     f"vaelodriveapp:{app.drive}/../../../../../../etc/passwd", f"vaelodriveapp:{app.drive}/gone"):
            status, said = app.link(link)
            self.assertEqual(status, 1, link)
            self.assertIn("leads to nothing in the drive", said)
        self.assertTrue(app.running())
        app.wait_log("Preview URL is in Trash:")
        app.wait_log("Preview URL is not in the Mobile Documents dir:")
        app.wait_title("Vaelo Drive")


class Damage(unittest.TestCase):
    def test_a_damaged_index_is_rebuilt_and_said_so(self):
        def damage(app):
            (app.data / "index.sqlite").write_bytes(b"this is no database" * 500)
        app = App(demo=True, prepare=damage)
        self.addCleanup(app.close)
        app.wait("Documents,", "list item")
        app.wait("The drive’s index was damaged")
        wait_for("the damaged index to be kept", lambda: list(app.data.glob("index.sqlite.damaged*")))

    def test_a_broken_manifest_leaves_the_library_listed(self):
        def damage(app):
            (app.data / "mirror" / "org~example~Notes" / ".vaelo-container").write_text("[[[")
        app = App(demo=True, prepare=damage)
        self.addCleanup(app.close)
        app.wait("org~example~Notes", "list item")

    @unittest.skipIf(os.getuid() == 0, "root reads everything")
    def test_a_folder_that_cannot_be_read_says_so(self):
        app = App(demo=True)
        self.addCleanup(app.close)
        (app.drive / "Desktop").chmod(0)
        app.click("Desktop", "list item")
        app.wait("This folder can’t be read")


if __name__ == "__main__":
    unittest.main()
