# SPDX-License-Identifier: GPL-3.0-or-later
"""The window in other languages than English: its texts, its numbers, and which side it begins on."""
import os
import pathlib
import subprocess
import tempfile
import unittest

from PIL import Image

from harness import PROGRAM, App, wait_for


class Languages(unittest.TestCase):
    def open(self, size=(800, 640), letters=1, **environment):
        def prepare(app):
            if letters != 1:
                app.desktop.tool("xprop", "-root", "-f", "RESOURCE_MANAGER", "8s", "-set", "RESOURCE_MANAGER", f"Xft.dpi:\t{letters * 96:.0f}\n")
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            (app.drive / "Plans").mkdir()
            for name in ("Report.txt", "Second.txt", "تقرير"):
                (app.drive / name).write_text("x" * 1250)
            (app.drive / "Big.bin").touch()
            with (app.drive / "Big.bin").open("wb") as big:
                big.truncate(1250000)
        self.app = App(size=size, prepare=prepare, **environment)
        self.addCleanup(self.app.close)
        self.app.wait("Report.txt", "list item")
        return self.app

    def showing(self, text):
        wait_for(lambda: f"“{text}” to show; showing: {self.app.names()[:60]}", lambda: any(text in name for name in self.app.names()))

    def installed(self, name):
        """The environment of a system on which the locale is installed."""
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        language, codeset = name.split(".")
        subprocess.run(["localedef", "-i", language, "-f", codeset, str(pathlib.Path(folder.name) / name)], check=True)
        return {"LOCPATH": folder.name, "LC_ALL": name}

    def side_of(self, item):
        """Where the texts of a row stand, which has its icon at one end and nothing at the other."""
        row = self.app.find(item, "list item")
        picture = Image.open(self.app.screenshot()).convert("L")
        x, y = row[2] + (picture.width - 800) // 2, row[3] + (picture.height - 640) // 2
        name, details = (y + 3, y + row[5] // 2), (y + row[5] // 2 + 2, y + row[5] - 3)
        sides = []
        for top, bottom in (name, details):
            ink = [any(picture.getpixel((at, line)) < 140 for line in range(top, bottom)) for at in range(x + 80, x + 720)]
            sides.append("right" if any(ink[320:]) and not any(ink[:320]) else "left" if any(ink[:320]) and not any(ink[320:]) else ink)
        return sides

    def menu_of(self, item):
        self.app.click(item, "list item", button=3)

    def test_german_where_its_locale_is_installed(self):
        app = self.open(**self.installed("de_DE.UTF-8"))
        for name in ("Auswählen", "Suchen", "Als Raster anzeigen", "Hauptmenü"):
            app.wait(name)
        self.showing("5 Objekte, ")
        self.showing("verfügbar")
        self.showing("1,3\u00a0MB")
        self.showing("0 Objekte")
        for item in ("Report.txt", "تقرير"):
            self.assertEqual(self.side_of(item), ["left", "left"], item)
        app.click("Auswählen", "push button")
        app.wait_title("Auswahl")
        app.click("Report.txt", "list item")
        app.wait_title("1 ausgewählt")
        app.click("Second.txt", "list item")
        app.wait_title("2 ausgewählt")
        app.click("Löschen", "push button")
        app.wait("2 Objekte werden auf allen Ihren Geräten endgültig aus Vaelo Drive gelöscht.")
        app.wait("Aus Vaelo Drive löschen", "push button")
        app.wait("Abbrechen", "push button")

    def test_german_menus_and_prompts(self):
        app = self.open(LANGUAGE="de")
        self.menu_of("Report.txt")
        for name in ("Öffnen", "Teilen …", "Informationen", "Umbenennen …", "Schlagwörter …", "Verschieben …",
                     "Löschen …"):
            app.wait(name, "menu item")
        app.key("u")
        app.wait("Objekt umbenennen")
        app.wait("Geben Sie einen neuen Namen für dieses Objekt ein.")
        app.wait("Fertig", "push button")

    def test_arabic_begins_on_the_right_although_its_locale_is_not_installed(self):
        app = self.open(LC_ALL="ar_EG.UTF-8")
        self.showing("٥ عناصر")
        self.showing("المتاح")
        select, search = app.wait("اختر", "push button"), app.wait("ابحث", "push button")
        self.assertLess(select[2] + select[4], 400, "what ends the header is on the left")
        self.assertLess(search[2] + search[4], 400)
        for item in ("Report.txt", "تقرير"):
            self.assertEqual(self.side_of(item), ["right", "right"], item)
        app.click("Plans", "list item")
        app.wait("هذا المجلد فارغ")
        back = app.wait("ارجع", "push button")
        self.assertGreater(back[2], 700, "the way back is on the right")
        app.click("ارجع", "push button")
        app.wait("Report.txt", "list item")

    def test_a_phone_shows_the_whole_title_in_every_language(self):
        def width(app):
            return wait_for("the title", lambda: [row for row in app.accessibility.showing()
                                                  if row[:2] == ("label", "Vaelo Drive") and row[3] < 46])[0][4]
        for language in ("en", "de", "fr", "ar", "ru", "ja"):
            with self.subTest(language):
                app = self.open(size=(360, 720), LANGUAGE=language)
                geometry = app.desktop.tool("xdotool", "getwindowgeometry", app.window)
                self.assertIn("Geometry: 360x720", geometry)
                narrow = width(app)
                app.resize(800, 640)
                wait_for("the wide window", lambda: app.find("Vaelo Drive", "frame")[4] > 700)
                self.assertEqual(narrow, width(app), "cut where it is narrow")

    def test_a_message_on_a_phone_keeps_its_buttons_in_every_language(self):
        for language, letter, rename, undo, letters in (("en", "r", "Rename Item", "Undo", 1), ("en", "r", "Rename Item", "Undo", 1.5),
                                                        ("de", "u", "Objekt umbenennen", "Rückgängig", 1),
                                                        ("ja", "r", "アイテムの名前を変更", "元に戻す", 1)):
            with self.subTest(language, letters=letters):
                app = self.open(size=(360, 720), letters=letters, LANGUAGE=language)
                self.menu_of("Report.txt")
                wait_for("the menu", lambda: any(row[0] == "menu item" for row in app.accessibility.showing()))
                app.key(letter)
                app.wait(rename)
                app.type(" of our Donaudampfschifffahrtsgesellschaftskapitaenswitwen")
                app.key("Return")

                def close():
                    rows = [row for row in app.accessibility.showing() if row[0] == "push button" and row[3] > 360]
                    return rows[1] if len(rows) == 2 and rows[0][1].startswith(undo) else None
                row = wait_for("what closes the message", close)
                width = app.find("Vaelo Drive", "frame")[4]
                self.assertLessEqual(width, 360)
                self.assertLessEqual(row[2] + row[4], width - 12)

    def test_a_word_of_a_script_without_spaces_is_not_split_where_it_has_room(self):
        app = self.open(size=(360, 720), LANGUAGE="ja")
        app.click("選択", "push button")
        self.assertLess(app.wait("キャンセル", "push button")[5], 30)

    def test_the_first_language_of_several_that_is_there(self):
        app = self.open(LANGUAGE="he:en_GB:de")
        app.wait("Select", "push button")
        self.assertLess(400, app.find("Select", "push button")[2], "and English begins on the left")


class Installed(unittest.TestCase):
    def test_the_translations_are_found_where_they_are_installed(self):
        with tempfile.TemporaryDirectory() as root:
            subprocess.run(["cmake", "--install", str(pathlib.Path(PROGRAM).parent)], check=True, capture_output=True,
                           env={**os.environ, "DESTDIR": root})
            program = next(pathlib.Path(root).rglob("bin/vaelo-drive"))
            said = subprocess.run([program, "--help"], check=True, capture_output=True, text=True,
                                  env={**os.environ, "LC_ALL": "C.UTF-8", "LANGUAGE": "ru"}).stdout
            self.assertIn("Искать на облачном диске", said)
            entry = next(pathlib.Path(root).rglob("com.marrow.VaeloDrive.desktop")).read_text()
            self.assertIn("Name[ja]=最近使ったドキュメント", entry)
            self.assertIn("Name=Recent Document", entry)
            about = next(pathlib.Path(root).rglob("com.marrow.VaeloDrive.metainfo.xml")).read_text()
            self.assertIn('<summary xml:lang="fr">Parcourir et gérer', about)


if __name__ == "__main__":
    unittest.main()
