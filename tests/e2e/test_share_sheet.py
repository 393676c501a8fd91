# SPDX-License-Identifier: GPL-3.0-or-later
"""Sharing a document from a real window."""
import os
import pathlib
import stat
import subprocess
import unittest
import urllib.parse

from harness import App, wait_for

CLIPBOARD_READER = """
import sys
import gi
gi.require_version("Gdk", "4.0")
gi.require_version("Gtk", "4.0")
from gi.repository import Gdk, Gio, GLib, Gtk
Gtk.init()
loop = GLib.MainLoop()
def read(stream, result):
    sys.stdout.write(stream.read_bytes_finish(result).get_data().decode())
    loop.quit()
def came(clipboard, result):
    stream, mime = clipboard.read_finish(result)
    stream.read_bytes_async(1 << 16, GLib.PRIORITY_DEFAULT, None, read)
Gdk.Display.get_default().get_clipboard().read_async([sys.argv[1]], GLib.PRIORITY_DEFAULT, None, came)
GLib.timeout_add_seconds(10, loop.quit)
loop.run()
"""


def install_application(app, identifier, name, types, more=""):
    """An application that writes down what it was started with; answers the file that it writes to."""
    applications = app.base / "data" / "applications"
    applications.mkdir(parents=True, exist_ok=True)
    record = app.base / f"{identifier}.record"
    program = app.base / f"{identifier}.sh"
    program.write_text(f'#!/bin/sh\nfor a in "$@"; do printf "%s\\n" "$a"; done > "{record}.new"\nmv "{record}.new" "{record}"\n')
    program.chmod(program.stat().st_mode | stat.S_IXUSR)
    (applications / f"{identifier}.desktop").write_text(
        f"[Desktop Entry]\nType=Application\nName={name}\nExec={program} %u\nMimeType={types}\n{more}")
    return record


PROMISE = "[Promise]\nName=Rates.csv\nSize=4\nModified=1770000000\nPackage=false\n"


def install_applications(app):
    install_application(app, "org.example.Table", "Table", "text/csv;")
    install_application(app, "org.example.Post", "Post", "x-scheme-handler/mailto;")
    install_application(app, "org.example.Lines", "Lines", "text/csv;", "Terminal=true\n")
    programs = app.base / "bin"
    programs.mkdir()
    sender = programs / "bluetooth-sendto"
    sender.write_text(f'#!/bin/sh\nprintf "%s" "$1" > "{app.base}/sent.new"\nmv "{app.base}/sent.new" "{app.base}/sent"\n')
    sender.chmod(0o755)
    app.desktop.environment["PATH"] = f"{programs}:{os.environ['PATH']}"
    applications = app.base / "data" / "applications"
    (applications / "mimeinfo.cache").write_text(
        "[MIME Cache]\ntext/csv=org.example.Lines.desktop;org.example.Table.desktop;\nx-scheme-handler/mailto=org.example.Post.desktop;\n")


class Share(unittest.TestCase):
    size = (800, 640)
    environment = {}

    def setUp(self):
        self.app = App(size=self.size, demo=True, prepare=self.prepare, **self.environment)
        self.addCleanup(self.app.close)
        self.app.wait("Documents,", "list item")
        self.document = self.app.drive / "Documents" / "Budget 2026.csv"

    def prepare(self, app):
        install_applications(app)

    def open(self, relative):
        status, said = self.app.link("vaelodriveapp:" + urllib.parse.quote(urllib.parse.quote(f"{self.app.drive}/{relative}")))
        self.assertEqual(status, 0, said)
        self.app.wait_title(pathlib.PurePath(relative).name)

    def share(self, relative="Documents/Budget 2026.csv"):
        self.open(relative)
        self.press_share()

    def press_share(self):
        self.app.mouse("mousemove", "300", "300")  # a pointer that is where it is sent is waited for in vain
        self.app.click("Share", "push button")
        self.app.wait("Copy Link")

    def rows(self):
        """The sheet's rows as they stand; in lists of documents the names of rows have more to tell."""
        list_at = next(i for i, row in enumerate(self.app.accessibility.showing()) if row[0] == "list" and row[1].startswith("Share "))
        return [row for row in self.app.accessibility.showing()[list_at:] if row[0] == "list item"]

    def choose(self, name):
        """By keyboard, which finds the first row focused."""
        names = [row[1] for row in self.rows() if row[6]]
        at = next(i for i, shown in enumerate(names) if shown.startswith(name))
        self.app.key(*["Down"] * at, "Return")

    def record(self, identifier):
        path = self.app.base / f"{identifier}.record"
        wait_for(f"{identifier} to be started", path.is_file)
        return path.read_text().splitlines()

    def clipboard(self, kind):
        return subprocess.run(["/usr/bin/python3", "-c", CLIPBOARD_READER, kind], env=self.app.desktop.environment, check=True,
                              capture_output=True, text=True, timeout=30).stdout


class Wide(Share):
    def test_opens_in_an_application_in_place_and_says_so(self):
        self.share()
        self.choose("Open in “Table”")
        self.app.wait("Opening “Budget 2026.csv” in Table…")
        self.assertEqual(self.record("org.example.Table"), [str(self.document)])
        self.app.wait_gone("Copy Link")

    def test_a_program_for_a_terminal_is_none_of_the_first(self):
        self.share()
        self.assertTrue(self.rows()[0][1].startswith("Open in “Table”"), self.rows()[0])
        self.assertIsNone(self.app.find("Open in “Lines”"))

    def test_an_application_that_is_gone_is_told(self):
        self.share()
        (self.app.base / "org.example.Table.sh").unlink()
        self.choose("Open in “Table”")
        self.app.wait("“Table” Could Not Be Started")
        self.assertTrue(self.app.running())

    def test_any_application_can_be_chosen(self):
        self.share()
        self.choose("Open With Another Application…")
        self.choose_application("Post")
        self.assertEqual(self.record("org.example.Post"), [str(self.document)])

    def choose_application(self, name):
        self.app.wait(name, "list item")
        wait_for("the window of applications to have the focus", lambda: "Open With" in subprocess.run(
            ["xdotool", "getwindowfocus", "getwindowname"], env=self.app.desktop.environment, capture_output=True, text=True).stdout)
        names = [row[1] for row in self.app.accessibility.showing() if row[0] == "list item"]
        self.app.key(*["Down"] * names.index(name), "Return")

    def test_a_document_that_is_not_shown_opens_in_any_application(self):
        document = self.app.drive / "Documents" / "Data.bin"
        document.write_bytes(bytes(range(256)))
        self.open("Documents/Data.bin")
        self.app.click("Open With Another Application", "push button")
        self.choose_application("Post")
        self.assertEqual(self.record("org.example.Post"), [str(document)])
        self.app.wait("Opening “Data.bin” in Post…")

    def test_attaches_to_a_message(self):
        self.share()
        self.choose("Send by E-Mail")
        self.app.wait("Attaching “Budget 2026.csv” to a message…")
        self.assertEqual(self.record("org.example.Post"),
                         ["mailto:?subject=Budget%202026.csv&attach=" + urllib.parse.quote(str(self.document))])

    def test_sends_by_bluetooth(self):
        self.share()
        self.choose("Send by Bluetooth")
        sent = self.app.base / "sent"
        wait_for("the file to be sent", sent.is_file)
        self.assertEqual(sent.read_text(), str(self.document))

    def test_copies_the_file_for_file_managers_and_others(self):
        self.share()
        self.choose("Copy File")
        self.app.wait("“Budget 2026.csv” copied")
        self.assertEqual(self.clipboard("x-special/gnome-copied-files"), "copy\n" + self.document.as_uri())
        self.assertEqual(self.clipboard("text/uri-list").strip(), self.document.as_uri())

    def test_a_copied_link_leads_back_to_the_document(self):
        self.share("Documents/Projects/Garden/Sketch.svg")
        self.app.key(*["Escape"])
        self.app.wait_gone("Copy Link")
        self.app.wait_title("Sketch.svg")
        self.app.key("Escape")
        self.app.wait_title("Garden")
        self.share()
        self.choose("Copy Link")
        self.app.wait("Link copied")
        link = self.clipboard("text/plain;charset=utf-8")
        self.assertTrue(link.startswith("vaelodriveapp:/"), link)
        self.app.click("Back", "push button")
        self.app.wait_title("Documents")
        self.assertEqual(self.app.link(link)[0], 0)
        self.app.wait_title("Budget 2026.csv")

    def test_the_link_for_others_is_hidden_until_the_account_gave_one(self):
        self.share()
        self.assertIsNone(self.app.find("Copy Link for Others"))
        self.app.key("Escape")
        self.app.wait_gone("Copy Link")
        os.setxattr(self.document, "user.vaelo.sharelink", b"https://drive.example/s/abc")
        self.press_share()
        self.app.wait("Copy Link for Others")
        self.choose("Copy Link for Others")
        self.app.wait("Link for others copied")
        self.assertEqual(self.clipboard("text/plain;charset=utf-8"), "https://drive.example/s/abc")

    def save_as(self, target):
        self.share()
        self.choose("Save a Copy…")
        chooser = wait_for("the file chooser", lambda: subprocess.run(
            ["xdotool", "search", "--onlyvisible", "--name", "Save a Copy"], env=self.app.desktop.environment, capture_output=True,
            text=True).stdout.split())[0]
        self.app.desktop.tool("xdotool", "windowfocus", "--sync", chooser)
        self.app.wait("_Save", "push button")
        self.app.key("ctrl+a")
        self.app.type(str(target))
        self.app.key("Return")

    def test_saves_a_copy_elsewhere(self):
        target = self.app.base / "copy.csv"
        self.save_as(target)
        self.app.wait("Saved a copy of “Budget 2026.csv”.")
        self.assertEqual(target.read_bytes(), self.document.read_bytes())
        self.assertEqual([p.name for p in self.app.base.iterdir() if p.name.startswith(".vaelo")], [])

    def test_asks_before_a_copy_replaces_a_document(self):
        target = self.app.base / "copy.csv"
        target.write_text("precious")
        self.save_as(target)
        self.app.wait("A file named “copy.csv” already exists.")
        self.assertEqual(target.read_text(), "precious")
        self.app.key("alt+r")
        self.app.wait("Saved a copy of “Budget 2026.csv”.")
        self.assertEqual(target.read_bytes(), self.document.read_bytes())

    def test_what_is_not_downloaded_shares_its_link_alone(self):
        self.share("Documents/Thesis.pdf")
        self.app.wait("This item is not downloaded.")
        self.assertEqual([row[1] for row in self.rows() if row[6]], ["Copy Link"])

    def test_what_has_come_meanwhile_is_opened(self):
        app = self.app
        document = app.drive / "Documents" / "Rates.csv"
        promise = document.with_name(".Rates.csv.vlopromise")
        promise.write_text(PROMISE)
        self.share("Documents/Rates.csv")
        app.wait("This item is not downloaded.")
        self.assertEqual([row[1] for row in self.rows() if row[6]], ["Copy Link"])
        app.key("Escape")
        app.wait_gone("Copy Link")
        arriving = app.desktop.scratch / "arriving"
        arriving.write_text("a,b\n")
        arriving.rename(document)
        promise.unlink()
        wait_for("the document", lambda: not any("Not downloaded" in name for name in app.names()))
        self.press_share()
        self.choose("Open in “Table”")
        self.assertEqual(self.record("org.example.Table"), [str(document)])

    def test_what_is_not_downloaded_is_shown_and_not_handed_over(self):
        app = self.app
        (app.drive / "Documents" / ".Rates.csv.vlopromise").write_text(PROMISE)
        app.click("Documents", "list item")
        app.wait_title("Documents")
        app.click("Rates.csv", "list item")
        app.wait_title("Rates.csv")
        wait_for("the notice", lambda: any("It opens here as soon as" in name for name in app.names()))
        self.assertIn("openInDefaultApp returned NO, showing preview", app.log())
        self.assertFalse((app.base / "org.example.Table.record").exists())

    def test_a_row_of_a_list_is_shared_from_its_menu(self):
        app = self.app
        app.click("Documents", "list item")
        app.wait_title("Documents")
        app.click("Budget 2026.csv", "list item", button=3)
        app.wait("Share…", "menu item")
        app.key("s")
        app.wait("Copy Link")
        app.wait_log("DLC Action Share")
        self.choose("Open in “Table”")
        self.assertEqual(self.record("org.example.Table"), [str(self.document)])
        app.wait_gone("Copy Link")
        app.wait_title("Documents")

    def test_the_sheet_goes_with_its_document(self):
        self.share()
        self.document.unlink()
        self.app.wait_gone("Copy Link")
        self.app.wait_title("Documents")
        self.app.key("alt+Left")
        self.app.wait_title("Vaelo Drive")


class Phone(Share):
    size = (360, 720)

    def test_the_sheet_goes_with_its_document(self):
        self.share()
        self.open("Documents/Minutes 1.txt")
        self.app.wait_gone("Copy Link")
        self.press_share()
        self.assertEqual([row[1] for row in self.app.accessibility.showing() if row[0] == "list" and row[1].startswith("Share ")],
                         ["Share Minutes 1.txt"])
        (self.app.drive / "Documents" / "Minutes 1.txt").unlink()
        self.app.wait_gone("Copy Link")
        self.app.wait("Minutes 2.txt", "list item")

    def test_rises_from_the_bottom_and_is_left_by_every_road(self):
        app = self.app
        for leave in (lambda: app.click("Close", "push button"), lambda: app.key("Escape"),
                      lambda: app.mouse("mousemove", "180", "120", "click", "1")):
            self.share()
            last = wait_for("the sheet at the bottom edge", lambda: next(
                (row for row in app.accessibility.showing() if row[1] == "Save a Copy…" and row[3] > 600), None))
            self.assertGreaterEqual(last[5], 44)
            leave()
            app.wait_gone("Copy Link")
            app.wait_title("Budget 2026.csv")
        # That it can't rise before it has a size is told by the toolkit, often.
        self.assertNotIn("gtk_widget_size_allocate", app.log())

    def test_the_button_of_what_is_not_downloaded_says_so(self):
        app = self.app
        (app.drive / "Documents" / ".Rates.csv.vlopromise").write_text(PROMISE)
        link = urllib.parse.quote(urllib.parse.quote(f"{app.drive}/Documents/Rates.csv"))
        self.assertEqual(app.link(f"vaelodriveapp:{link}?mode=info")[0], 0)
        seen = []

        def rests():
            seen.append(app.find("Open in “Table”", "push button"))
            return seen[-1] and len(seen) > 1 and seen[-1] == seen[-2]
        wait_for("the page to rest", rests)
        app.click("Open in “Table”", "push button")
        app.wait("“Rates.csv” is not downloaded yet.")
        self.assertFalse((app.base / "org.example.Table.record").exists())

    def test_rows_do_their_work_by_tap(self):
        self.share()
        wait_for("the sheet to have risen", lambda: self.app.find("Save a Copy…")[3] > 600)
        self.app.click("Open in “Table”", "list item")
        said = "Opening “Budget 2026.csv” in Table…"
        self.app.wait(said)
        bar = self.app.wait("Share", "push button")
        wait_for("the message above the bar", lambda: sum(self.app.find(said)[i] for i in (3, 5)) < bar[3])
        self.assertEqual(self.record("org.example.Table"), [str(self.document)])


if __name__ == "__main__":
    unittest.main()
