# SPDX-License-Identifier: GPL-3.0-or-later
"""What a drive and its user's other programs may do wrong: each gets a clear message or a line in the log, the window goes
on answering, and nothing is lost."""
import os
import pathlib
import shutil
import subprocess
import time
import unittest
import urllib.parse

from harness import PATIENCE, PROGRAM, App, Desktop, wait_for

ANSWERS_WITHIN = 10  # seconds for a look at the whole window, which itself takes most of them on a busy machine
WITHOUT_READING_ALL = ["setpriv", "--bounding-set", "-dac_override,-dac_read_search"]


class OrdinaryDesktop(Desktop):
    """Starts the application without root's right to read and write everything."""

    def start(self, command, environment, descriptors=(), log=None):
        ordinary = command[0] == PROGRAM and os.getuid() == 0
        return super().start([*WITHOUT_READING_ALL, *command] if ordinary else command, environment, descriptors, log)


class OrdinaryApp(App):
    desktop_type = OrdinaryDesktop


def content(folder):
    """All that a user could miss: each path below the folder with its bytes or its target."""
    found = {}
    for place, folders, files in os.walk(os.fsencode(folder)):
        for name in [*folders, *files]:
            path = os.path.join(place, name)
            if os.path.islink(path):
                found[path] = os.readlink(path)
            elif os.path.isdir(path):
                found[path] = None
            else:
                # What is looked at gets an identifier, which an item that is not downloaded carries in its promise.
                with open(path, "rb") as file:
                    found[path] = [line for line in file if not line.startswith(b"DocumentID=")]
    return found


def small_drive(app):
    """A signed-in drive with a document, a folder and a library, and no applications that take its documents away."""
    shared = app.base / "shared"
    shared.mkdir()
    for entry in pathlib.Path("/usr/share").iterdir():
        if entry.name != "applications":
            (shared / entry.name).symlink_to(entry)
    app.desktop.environment["XDG_DATA_DIRS"] = str(shared)
    (app.drive / "Folder").mkdir(parents=True)
    (app.drive / "Keep.txt").write_text("kept\n")
    (app.drive / "Folder" / "Inside.txt").write_text("inside\n")
    library = app.data / "mirror" / "org~example~Notes"
    (library / "Documents").mkdir(parents=True)
    (library / "Documents" / "Note.txt").write_text("note\n")
    (library / ".vaelo-container").write_text("[Container]\nName=Notes\n")
    (app.data / "mirror" / ".Trash").mkdir()
    (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")


class BadInput(unittest.TestCase):
    def start(self, prepare=None, app_type=App, **options):
        """The application on a small drive that `prepare` spoils."""
        def spoil(app):
            self.app = app
            small_drive(app)
            if prepare:
                prepare(app)
        app = app_type(prepare=spoil, **options)
        self.addCleanup(app.close)
        return app

    def assert_answers(self, app):
        begin = time.monotonic()
        self.assertTrue(app.accessibility.showing(), "the window shows nothing")
        self.assertLess(time.monotonic() - begin, ANSWERS_WITHIN)
        self.assertTrue(app.running())
        # The toolkit's own list of recent documents finds no room on a full disk either.
        log = "".join(line for line in app.log().splitlines() if "recently-used.xbel" not in line)
        for complaint in ("CRITICAL", "Pango-WARNING", "Gtk-WARNING"):
            self.assertNotIn(complaint, log)

    def count_of(self, app, text):
        return app.log().count(text)

    def press(self, app, name):
        """Clicks a row once the window rests: a page that comes in takes no clicks yet."""
        app.wait(name, "list item")
        seen = []

        def rests():
            seen.append(app.accessibility.showing())
            return len(seen) > 2 and seen[-1] == seen[-2] == seen[-3]
        wait_for("the window to rest", rests)
        app.click(name, "list item")

    def open_folder(self, app, name):
        self.press(app, name)
        app.wait_title(name)

    def leave(self, app, title="Vaelo Drive"):
        """Until the page that shows is gone, too: the pages below it are in the accessibility tree all the time."""
        def titles():
            return [row[1] for row in app.accessibility.showing() if row[0] == "label" and row[3] < 46]
        before = titles()
        app.key("Escape")
        wait_for(f"“{title}” to come back", lambda: titles() != before and title in titles())


class Links(BadInput):
    def test_each_bad_link_is_refused_with_its_reason_and_nothing_else_happens(self):
        def spoil(app):
            trash = app.data / "mirror" / ".Trash"
            (trash / "Thrown away.txt").write_text("x")
            outside = app.base / "outside"
            outside.mkdir()
            (outside / "Secret.txt").write_text("x")
            (app.data / "mirror-evil").mkdir()
            (app.data / "mirror-evil" / "Secret.txt").write_text("x")
            (app.drive / "Out").symlink_to(outside)
            (app.drive / "Bin").symlink_to(trash)
            (app.drive / "Round").symlink_to("Around")
            (app.drive / "Around").symlink_to("Round")
        app = self.start(spoil)
        app.wait("Keep.txt", "list item")
        before = content(app.data / "mirror")
        no_link = "openURL: refused, not a link of this application"
        no_path = "openURL: refused, no absolute path"
        outside = "Preview URL is not in the Mobile Documents dir: "
        trash = "Preview URL is in Trash: "
        gone = "warpToNewURL failed: "
        for link, reason in (
                ("other:/x", no_link), ("https://example.invalid/x", no_link), ("javascript:alert(1)", no_link),
                (f"VAELODRIVEAPP:{app.drive}", no_link), ("", no_link), ("no link", no_link), ("::", no_link),
                ("vaelodriveapp:/%zz", no_link), ("vaelodriveapp:/%", no_link), ("vaelodriveapp:/%25zz", no_path),
                ("vaelodriveapp:/%25ff%25fe", no_path), (b"vaelodriveapp:/\xff\xfe", no_link),
                ("vaelodriveapp:relative", no_path), ("vaelodriveapp:", no_path),
                ("vaelodriveapp:../Keep.txt", no_path), ("vaelodriveapp:?mode=info", no_path),
                ("vaelodriveapp:/etc/passwd", outside + "file:///etc/passwd"), ("vaelodriveapp:/", outside),
                (f"vaelodriveapp:{app.drive}/../../../../../../../../etc/passwd", outside),
                (f"vaelodriveapp:{app.data}/mirror-evil/Secret.txt", outside),
                (f"vaelodriveapp:{app.drive}/Out/Secret.txt", outside),
                (f"vaelodriveapp:{app.data}/mirror/.Trash/Thrown%2520away.txt", trash),
                (f"vaelodriveapp:{app.data}/mirror/.Trash", trash),
                (f"vaelodriveapp:{app.drive}/Bin/Thrown%2520away.txt", trash),
                (f"vaelodriveapp:{app.drive}/gone", gone), (f"vaelodriveapp:{app.drive}/Round/x", gone),
                (f"vaelodriveapp:{app.drive}/Keep.txt%2500.png", ""),
                ("vaelodriveapp:/" + "x/" * 20000, outside)):
            with self.subTest(link=link[:80]):
                known = self.count_of(app, reason) if reason else 0
                status, said = app.link(link)
                self.assertEqual(status, 1, said)
                self.assertIn("” leads to nothing in the drive.", said)
                if reason:
                    wait_for(f"“{reason}” once more in the log", lambda: self.count_of(app, reason) > known)
        app.wait("The link leads to nothing in this drive.")
        app.wait_title("Vaelo Drive")
        self.assert_answers(app)
        self.assertEqual(content(app.data / "mirror"), before)

    def test_a_bad_link_at_the_start_shows_the_drive_and_says_so(self):
        app = self.start(arguments=("vaelodriveapp:/etc/passwd",))
        app.wait("The link leads to nothing in this drive.")
        app.wait("Keep.txt", "list item")
        self.assert_answers(app)


class Names(BadInput):
    odd = b"not \xff\xfe text"

    def spoil(self, app):
        base = os.fsencode(app.drive)
        os.mkdir(base + b"/" + self.odd)
        with open(base + b"/" + self.odd + b"/deep \xf0\x28 name.txt", "wb") as file:
            file.write(b"bytes under an odd name\n")
        with open(base + b"/.away \xe9.pdf.vlopromise", "wb") as file:
            file.write(b"[Promise]\nName=away \xe9.pdf\nSize=1000\n")
        os.makedirs(os.fsencode(app.data / "mirror") + b"/lib \xfc/Documents")

    def test_they_are_shown_opened_searched_and_reopened(self):
        app = self.start(self.spoil)
        before = content(app.data / "mirror")
        app.wait("away \ufffd.pdf", "list item")
        app.wait("lib \ufffd", "list item")
        self.open_folder(app, "not \ufffd\ufffd text")
        self.open_folder(app, "deep \ufffd( name.txt")
        self.leave(app, "not \ufffd\ufffd text")
        self.leave(app)
        self.open_folder(app, "away \ufffd.pdf")
        app.wait("away \ufffd.pdf")
        self.leave(app)
        app.click("Search", "push button")
        app.type("deep")
        app.wait("deep \ufffd( name.txt", "list item")
        app.key("Escape")
        self.assert_answers(app)
        self.assertEqual(content(app.data / "mirror"), before)

    def test_another_program_renames_and_removes_them(self):
        app = self.start(self.spoil)
        self.open_folder(app, "not \ufffd\ufffd text")
        folder = os.fsencode(app.drive) + b"/" + self.odd
        os.rename(folder + b"/deep \xf0\x28 name.txt", folder + b"/again \xc0.txt")
        app.wait("again \ufffd.txt", "list item")
        app.wait_gone("deep")
        shutil.rmtree(folder)
        app.wait_title("Vaelo Drive")
        self.assert_answers(app)


class Unreadable(BadInput):
    def test_a_folder_says_why_and_shows_its_items_once_it_may(self):
        app = self.start(lambda app: (app.drive / "Folder").chmod(0), OrdinaryApp)
        self.addCleanup(lambda: (app.drive / "Folder").exists() and (app.drive / "Folder").chmod(0o700))
        self.open_folder(app, "Folder")
        app.wait("This folder can’t be read")
        app.wait("You don’t have permission to see its items.")
        app.click("Try Again", "push button")
        app.wait("This folder can’t be read")
        (app.drive / "Folder").chmod(0o700)
        app.click("Try Again", "push button")
        app.wait("Inside.txt", "list item")
        (app.drive / "Folder" / "Later.txt").write_text("x")
        app.wait("Later.txt", "list item")
        app.key("Escape")
        app.wait_title("Vaelo Drive")
        self.assert_answers(app)

    def test_so_does_the_drives_own_folder(self):
        app = self.start(lambda app: app.drive.chmod(0), OrdinaryApp)
        self.addCleanup(lambda: app.drive.exists() and app.drive.chmod(0o700))
        app.wait("This folder can’t be read")
        app.wait("You don’t have permission to see its items.")
        app.drive.chmod(0o700)
        app.wait("Keep.txt", "list item")
        (app.drive / "Later.txt").write_text("x")
        app.wait("Later.txt", "list item")
        self.assert_answers(app)

    def test_a_search_passes_it_and_finds_the_rest(self):
        def spoil(app):
            (app.drive / "Folder").chmod(0)
            (app.drive / "Other").mkdir()
            (app.drive / "Other" / "Inside too.txt").write_text("x")
        app = self.start(spoil, OrdinaryApp)
        self.addCleanup(lambda: (app.drive / "Folder").exists() and (app.drive / "Folder").chmod(0o700))
        app.click("Search", "push button")
        app.type("inside")
        app.wait("Inside too.txt", "list item")
        app.wait_log(f"search: can't read {app.drive}/Folder: Permission denied")
        self.assert_answers(app)

    def test_a_document_says_so_in_its_preview(self):
        app = self.start(lambda app: (app.drive / "Keep.txt").chmod(0), OrdinaryApp)
        self.open_folder(app, "Keep.txt")
        wait_for(lambda: f"a reason; showing {app.names()}",
                 lambda: any("permission" in name.lower() for name in app.names()))
        app.key("Escape")
        app.wait_title("Vaelo Drive")
        self.assert_answers(app)


class Circles(BadInput):
    def spoil(self, app):
        links = self.links = app.drive / "Links"
        links.mkdir()
        for name, target in (("Self", "Self"), ("Round", "Around"), ("Around", "Round"), ("Here", "."), ("Up", ".."),
                             ("Deep", "Deep/x")):
            (links / name).symlink_to(target)
        for name, other in (("One", "Two"), ("Two", "One"), ("Alone", "Alone")):
            target = urllib.parse.quote(str(links / f"{other}.desktop"))
            (links / f"{name}.desktop").write_text(f"[Desktop Entry]\nType=Link\nName={name}\nURL=file://{target}\n")
        for name, other in (("Mark A", "Mark B"), ("Mark B", "Mark A"), ("Mark C", "Mark C")):
            target = urllib.parse.quote(str(links / f"{other}.vaelobookmark"))
            (links / f"{name}.vaelobookmark").write_text(f"[Bookmark]\nURL=file://{target}\n")

    def test_none_keeps_the_application_busy(self):
        app = self.start(self.spoil, size=(800, 790))
        before = content(app.data / "mirror")
        self.open_folder(app, "Links")
        refusal = "DLC Selection is symlink that didn't resolve to valid target: "
        for name in ("Self", "Round", "Around", "Deep"):
            with self.subTest(name=name):
                known = self.count_of(app, refusal)
                self.press(app, name)
                wait_for("a refusal in the log", lambda: self.count_of(app, refusal) > known)
                app.wait_title("Links")
        self.press(app, "Here")
        app.wait_title("Links")
        self.press(app, "Up")
        app.wait_title("Vaelo Drive")
        self.assert_answers(app)
        self.assertEqual(content(app.data / "mirror"), before)

    def test_aliases_and_bookmarks_in_a_circle_are_shown_as_what_they_are(self):
        app = self.start(self.spoil, size=(800, 790))
        self.open_folder(app, "Links")
        for name, shown in (("One", "Two"), ("Mark A", "Mark B"), ("Mark C", "Mark C")):
            self.press(app, name)
            app.wait_title(shown)
            self.assert_answers(app)
            self.leave(app, "Links")
        self.press(app, "Alone")
        app.wait_log(f"DLC Selection is symlink that didn't resolve to valid target: file://{self.links}/Alone.desktop")
        app.wait_title("Links")

    def test_a_search_ends(self):
        app = self.start(self.spoil)
        app.click("Search", "push button")
        app.type("inside")
        app.wait("Inside.txt", "list item")
        self.assertEqual(sum(name.startswith("Inside.txt") for name in app.names()), 1)
        self.assert_answers(app)


class Manifests(BadInput):
    def test_each_broken_one_costs_its_library_the_name_alone(self):
        good = b"[Container]\nName=Good\n"
        broken = {"Text": b"[[[", "Empty": b"", "Zeros": b"\0" * 4000, "Large": b"#" * 70000, "Other": b"[Other]\nName=x\n"}

        def spoil(app):
            mirror = app.data / "mirror"
            for name, text in {**broken, "Folder": None, "Pipe": None, "Device": None}.items():
                library = mirror / f"org~broken~{name}"
                (library / "Documents").mkdir(parents=True)
                (library / "Documents" / f"In {name}.txt").write_text("x")
                manifest = library / ".vaelo-container"
                if text is not None:
                    manifest.write_bytes(text)
            (mirror / "org~broken~Folder" / ".vaelo-container").mkdir()
            os.mkfifo(mirror / "org~broken~Pipe" / ".vaelo-container")
            (mirror / "org~broken~Device" / ".vaelo-container").symlink_to("/dev/zero")
        app = self.start(spoil)
        names = [*broken, "Folder", "Pipe", "Device"]
        for name in names:
            app.wait(f"org~broken~{name}", "list item")
            app.wait_log(f"drive: the manifest of org~broken~{name} is broken: ")
        app.wait("Notes", "list item")
        self.open_folder(app, "org~broken~Zeros")
        app.wait("In Zeros.txt", "list item")
        self.leave(app)
        app.wait("Notes", "list item")
        (app.data / "mirror" / "org~broken~Text" / ".vaelo-container").write_bytes(good)
        app.key("F5")
        app.wait("Good", "list item")
        self.assert_answers(app)


class FullDisk(BadInput):
    def fill(self, app, size="2m"):
        """The application's folders on a disk of their own."""
        place = app.base / "small"
        place.mkdir(parents=True)
        done = subprocess.run(["mount", "-t", "tmpfs", "-o", f"size={size},nr_inodes=400", "none", str(place)],
                              capture_output=True, text=True)
        if done.returncode:
            app.close()
            self.skipTest(f"a disk of its own can't be mounted: {done.stderr.strip()}")
        self.addCleanup(subprocess.run, ["umount", "-l", str(place)])
        for name in ("data", "config", "state", "cache"):
            (place / name).mkdir()
            app.desktop.environment[f"XDG_{name.upper()}_HOME"] = str(place / name)
        app.data = place / "data" / "vaelo-drive"
        app.drive = app.data / "mirror" / "com~marrow~Kestrel"

    def exhaust(self, app):
        with open(app.base / "small" / "filler", "ab", buffering=0) as file:
            try:
                while True:
                    file.write(b"x" * 4096)
            except OSError:
                pass

    def make_room(self, app):
        (app.base / "small" / "filler").unlink()

    def test_a_first_start_says_that_the_disk_is_full_and_goes_well_later(self):
        def spoil(app):
            self.fill(app)
            self.exhaust(app)
        app = App(prepare=spoil)
        self.addCleanup(app.close)
        app.wait("Vaelo Drive is not available")
        app.wait_log("drive: can't make the local account: ")
        app.wait("There is no space left on the disk to set up your drive. Make room, then start Vaelo Drive again.")
        self.assert_answers(app)
        self.make_room(app)
        app.key("ctrl+q")
        wait_for("the end", lambda: not app.running())
        app.process = app.desktop.start([PROGRAM], app.desktop.environment, log=app.log_file)
        app.show_window((800, 640))
        app.wait("Welcome to Vaelo Drive.md", "list item")

    def test_a_drive_is_walked_and_left_and_keeps_everything(self):
        def spoil(app):
            self.fill(app)
            small_drive(app)
        app = App(prepare=spoil)
        self.addCleanup(app.close)
        app.wait("Keep.txt", "list item")
        before = content(app.drive)
        self.open_folder(app, "Folder")
        self.exhaust(app)
        self.open_folder(app, "Inside.txt")
        self.leave(app, "Folder")
        self.assert_answers(app)
        app.key("ctrl+q")
        wait_for("the end", lambda: not app.running())
        self.assertEqual(app.process.returncode, 0)
        self.assertIn("No space left on device", app.log())
        self.assertEqual(content(app.drive), before)
        app.process = app.desktop.start([PROGRAM], app.desktop.environment, log=app.log_file)
        app.show_window((800, 640))
        wait_for("a list", lambda: app.find("Keep.txt", "list item") or app.find("Inside.txt", "list item"))
        self.assert_answers(app)
        self.assertEqual(content(app.drive), before)


class Index(BadInput):
    def test_a_damaged_one_is_rebuilt_said_so_and_kept(self):
        damaged = b"this is no database" * 500
        def spoil(app):
            (app.data / "index.sqlite").write_bytes(damaged)
            try:
                os.setxattr(app.drive / "Keep.txt", "user.vaelo.docid", b"4711")
            except OSError:
                self.skipTest("this file system keeps no attributes")
        app = self.start(spoil)
        app.wait("Keep.txt", "list item")
        app.wait("The drive’s index was damaged. It has been rebuilt, and the old one kept.")
        aside = app.data / "index.sqlite.damaged-1"
        app.wait_log(f"drive: the document index is damaged; moved aside to {aside} and rebuilt from the mirror")
        self.assertEqual(aside.read_bytes(), damaged)
        import sqlite3
        rows = sqlite3.connect(app.data / "index.sqlite").execute("SELECT id, path FROM documents").fetchall()
        self.assertEqual(rows, [(4711, os.fsencode(app.drive / "Keep.txt"))])
        self.assert_answers(app)

    def test_one_that_cannot_be_opened_is_logged_and_the_drive_shown(self):
        app = self.start(lambda app: (app.data / "index.sqlite").mkdir())
        app.wait("Keep.txt", "list item")
        app.wait_log("drive: can't open the document index: ")
        self.assertTrue((app.data / "index.sqlite").is_dir())
        self.assert_answers(app)


if __name__ == "__main__":
    unittest.main()
