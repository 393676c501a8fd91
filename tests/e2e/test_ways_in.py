# SPDX-License-Identifier: GPL-3.0-or-later
"""The ways into the application from outside: the shell's search, shortcuts, links, and a start by the session bus."""
import ast
import configparser
import pathlib
import subprocess
import unittest
import urllib.parse

from harness import PROGRAM, App, wait_for

NAME = "com.marrow.VaeloDrive"
PATH = "/com/marrow/VaeloDrive"
DATA = pathlib.Path(__file__).resolve().parents[2] / "data"
SEARCH = "org.gnome.Shell.SearchProvider2."


class Ways(unittest.TestCase):
    arguments = ()

    def setUp(self):
        self.app = self.make()
        self.addCleanup(self.app.close)

    def make(self):
        app = App(demo=True, size=(800, 790), prepare=self.prepare, arguments=self.arguments)
        app.wait("Documents,", "list item")
        return app

    def prepare(self, app):
        pass

    def call(self, method, *arguments, path=PATH):
        done = subprocess.run(["gdbus", "call", "--session", "--timeout", "20", "--dest", NAME, "--object-path", path, "--method",
                               method, *arguments], env=self.app.desktop.environment, capture_output=True, text=True)
        self.assertEqual(done.returncode, 0, done.stderr)
        return done.stdout

    def search_call(self, method, *arguments):
        provider = configparser.ConfigParser()
        provider.read(DATA / f"{NAME}.search-provider.ini")
        entry = provider["Shell Search Provider"]
        self.assertEqual(entry["BusName"], NAME)
        self.assertTrue((DATA / entry["DesktopId"]).is_file())
        return self.call(SEARCH + method, *arguments, path=entry["ObjectPath"])

    def results(self, *terms):
        answer = self.search_call("GetInitialResultSet", str(list(terms)))
        return ast.literal_eval(answer.replace("@as ", ""))[0]

    def link_to(self, relative):
        return "vaelodriveapp:" + urllib.parse.quote(urllib.parse.quote(f"{self.app.drive}/{relative}"))


class ShellSearch(Ways):
    def test_finds_items_and_tells_what_they_are(self):
        found = self.results("BUDGET", "csv")
        self.assertEqual(len(found), 1)
        meta = self.search_call("GetResultMetas", str(found))
        self.assertIn("'name': <'Budget 2026.csv'>", meta)
        self.assertIn("Documents'>", meta)
        self.assertIn("'gicon'", meta)
        self.assertIn(f"'id': <'{found[0]}'>", meta)

    def test_narrowing_asks_for_the_new_terms(self):
        wide = self.results("minutes")
        self.assertEqual(len(wide), 3)
        narrow = self.search_call("GetSubsearchResultSet", str(wide), "['minutes', '10']")
        self.assertEqual(len(ast.literal_eval(narrow)[0]), 1)

    def test_a_library_is_found_by_its_name_and_an_item_in_it_by_its_own(self):
        meta = self.search_call("GetResultMetas", str(self.results("sketchbook")))
        self.assertIn("'name': <'Sketchbook'>", meta)
        meta = self.search_call("GetResultMetas", str(self.results("owl")))
        self.assertIn("Sketchbook › Animals › Birds", meta)

    def test_items_not_downloaded_are_found_without_being_opened(self):
        found = self.results("thesis")
        self.assertIn("Thesis.pdf", self.search_call("GetResultMetas", str(found)))

    def test_what_was_thrown_away_or_is_hidden_is_not_found(self):
        self.assertEqual(self.results("thrown"), [])
        self.assertEqual(self.results("vlopromise"), [])
        self.assertEqual(self.results("vaelo-container"), [])

    def test_a_chosen_result_opens(self):
        self.search_call("ActivateResult", self.results("budget")[0], "['budget']", "0")
        self.app.wait_title("Budget 2026.csv")
        self.app.wait_log("================= Quarry: Open Search Result")

    def test_a_search_goes_on_in_the_window(self):
        self.search_call("LaunchSearch", "['minutes', '1']", "0")
        self.app.wait("Minutes 1.txt")
        self.app.wait_log('Quarry Search Continuation: "minutes 1"')

    def test_hostile_terms_and_identifiers_do_no_harm(self):
        for terms in ([], [""], ["\u202e"], ["../../etc/passwd"], ["%s%n%@"], ["x" * 100000], ["a"] * 5000, ["*?[", "\\\\"]):
            self.assertEqual(self.results(*terms), [], terms[:1])
        for identifier in ("", "0", "-1", "999999999999", "99999999999999999999999", "1; drop table", "/etc/passwd", "x" * 50000):
            self.assertNotIn("name", self.search_call("GetResultMetas", str([identifier])))
            self.search_call("ActivateResult", f"'{identifier}'", "['x']", "0")
        self.app.wait("This search result is no longer in the drive.")
        self.search_call("LaunchSearch", str(["y" * 100000]), "0")
        self.search_call("LaunchSearch", "@as []", "0")
        self.assertEqual(len(self.results("budget")), 1)
        self.assertTrue(self.app.running())

    def test_a_result_that_went_meanwhile_is_told(self):
        found = self.results("budget")
        (self.app.drive / "Documents" / "Budget 2026.csv").unlink()
        self.assertNotIn("name", self.search_call("GetResultMetas", str(found)))
        self.search_call("ActivateResult", found[0], "['budget']", "0")
        self.app.wait("This search result is no longer in the drive.")
        self.app.wait_log("Can't get URL for DocumentID:")


class Shortcuts(Ways):
    def test_search_opens_the_search(self):
        self.call("org.freedesktop.Application.ActivateAction", "search", "[]", "{}")
        self.app.wait("Search below this folder")
        self.app.wait_log("Shortcut action: com.marrow.VaeloDrive.shortcut.search")

    def test_the_recent_document_is_the_one_shown_last(self):
        app = self.app
        for name in ("Budget 2026.csv", "Minutes 2.txt"):
            self.assertEqual(app.link(self.link_to("Documents/" + name))[0], 0)
            app.wait_title(name)
            wait_for(f"{name} in the desktop's list", lambda: urllib.parse.quote(name) in self.recent_list())
        app.key("Escape")
        app.wait_title("Documents")
        self.assertEqual(app.link("--recent-document")[0], 0)
        app.wait_title("Minutes 2.txt")
        app.wait_log("Shortcut recent document:")

    def recent_list(self):
        path = self.app.base / "data" / "recently-used.xbel"
        return path.read_text() if path.exists() else ""

    def test_without_recent_documents_it_says_so(self):
        self.call("org.freedesktop.Application.ActivateAction", "recent-document", "[]", "{}")
        self.app.wait("No document of this drive was used recently.")

    def test_the_entry_names_what_the_application_does(self):
        entry = (DATA / f"{NAME}.desktop").read_text()
        known = self.call("org.gtk.Actions.List")
        for action in entry.split("Actions=")[1].splitlines()[0].rstrip(";").split(";"):
            self.assertIn(f"'{action}'", known)
            self.assertIn(f"[Desktop Action {action}]", entry)


class LaunchedByAShortcut(Ways):
    arguments = ("--search",)

    def make(self):
        app = App(demo=True, size=(800, 790), arguments=self.arguments)
        app.wait("Search below this folder")
        return app

    def test_acts_on_it_once(self):
        self.app.wait_log("Launched with shortcut:")
        self.assertEqual(self.app.log().count("Shortcut action:"), 1)


class Links(Ways):
    def test_a_link_over_the_bus_opens_its_document(self):
        self.call("org.freedesktop.Application.Open", str([self.link_to("Documents/Budget 2026.csv")]), "{}")
        self.app.wait_title("Budget 2026.csv")

    def test_a_link_from_a_second_process_opens_its_document(self):
        self.assertEqual(self.app.link(self.link_to("Documents/Contract.pdf"))[0], 0)
        self.app.wait_title("Contract.pdf")

    def test_a_file_of_the_drive_opens_and_others_do_not(self):
        self.assertEqual(self.app.link((self.app.drive / "Documents" / "Budget 2026.csv").as_uri())[0], 0)
        self.app.wait_title("Budget 2026.csv")
        for link in ("file:///etc/passwd", "file:///%zz", f"file://elsewhere{self.app.drive}", self.app.drive.as_uri() + "/gone"):
            self.assertEqual(self.app.link(link)[0], 1, link)

    def test_bad_links_over_the_bus_are_told(self):
        for link in ("vaelodriveapp:%", "vaelodriveapp:/%2500", "vaelodriveapp:/%25ff", "vaelodriveapp:" + "/x" * 20000, "x:"):
            self.call("org.freedesktop.Application.Open", str([link]), "{}")
        self.app.wait("The link leads to nothing in this drive.")
        self.assertTrue(self.app.running())


class Service(App):
    """Started without a window, as the session bus does."""

    def show_window(self, size):
        pass


class BusActivation(Ways):
    arguments = ("--gapplication-service",)

    def prepare(self, app):
        # The first start of all takes note of the account, and shows the root once it has.
        first = app.desktop.start([PROGRAM], app.desktop.environment, log=app.log_file)
        wait_for("the account to be known", lambda: "reinitializing view" in app.log())
        first.terminate()
        first.wait(10)

    def make(self):
        app = Service(demo=True, prepare=self.prepare, arguments=self.arguments)
        self.app = app
        wait_for("the name on the bus", self.is_there)
        return app

    def is_there(self):
        answer = self.bus("NameHasOwner", NAME)
        return "true" in answer

    def bus(self, method, *arguments):
        done = subprocess.run(["gdbus", "call", "--session", "--dest", "org.freedesktop.DBus", "--object-path",
                               "/org/freedesktop/DBus", "--method", "org.freedesktop.DBus." + method, *arguments],
                              env=self.app.desktop.environment, capture_output=True, text=True)
        self.assertEqual(done.returncode, 0, done.stderr)
        return done.stdout

    def has_window(self):
        return subprocess.run(["xdotool", "search", "--onlyvisible", "--name", "Vaelo Drive"], env=self.app.desktop.environment,
                              capture_output=True, text=True).stdout.strip()

    def test_searches_are_answered_without_a_window_and_a_result_opens_one(self):
        found = self.results("budget")
        self.assertEqual(len(found), 1)
        self.assertFalse(self.has_window())
        self.search_call("ActivateResult", found[0], "['budget']", "0")
        App.show_window(self.app, (800, 790))
        self.app.wait_title("Budget 2026.csv")

    def test_the_bus_starts_it_for_a_shortcut(self):
        self.app.process.terminate()
        self.app.process.wait(10)
        services = self.app.desktop.scratch / "run" / "dbus-1" / "services"
        services.mkdir(parents=True, exist_ok=True)
        starter = self.app.base / "start"
        starter.write_text(f'#!/bin/sh\nexec "{PROGRAM}" --gapplication-service > "{self.app.log_file}" 2>&1\n')
        starter.chmod(0o755)
        (services / f"{NAME}.service").write_text(f"[D-BUS Service]\nName={NAME}\nExec={starter}\n")
        passed = {name: value for name, value in self.app.desktop.environment.items()
                  if name.startswith(("XDG_", "DISPLAY", "GDK_", "GSK_", "GTK_", "G_MESSAGES", "GSETTINGS", "LC_"))}
        self.bus("UpdateActivationEnvironment", str(passed))
        self.bus("ReloadConfig")
        self.call("org.freedesktop.Application.ActivateAction", "search", "[]", "{}")
        wait_for("the window", self.has_window)
        self.app.wait("Search below this folder")
        self.assertEqual(self.app.log().count("Shortcut action:"), 1)
        self.call("org.gtk.Actions.Activate", "quit", "[]", "{}")
        wait_for("the application to end", lambda: not self.is_there())


if __name__ == "__main__":
    unittest.main()
