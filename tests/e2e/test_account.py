# SPDX-License-Identifier: GPL-3.0-or-later
"""The account: its free space in the status line, signing out and in while browsing, offers of its provider."""
import http.server
import threading
import unittest

from harness import App, wait_for


def account(token="ab", name="Ada", signed_in=True, more=""):
    return f"[Account]\nName={name}\nToken={token}\nSignedIn={'true' if signed_in else 'false'}\n{more}"


class Account(unittest.TestCase):
    def start(self, more="", prepare=None, **options):
        def make(app):
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text(account(more=more))
            (app.drive / "Plans").mkdir()
            (app.drive / "Plans" / "Garden.txt").write_text("beds")
            (app.drive / "Report.txt").write_text("x" * 1000)
            if prepare:
                prepare(app)
        self.app = App(prepare=make, **options)
        self.addCleanup(self.app.close)
        self.app.wait("Report.txt", "list item")

    def write_account(self, text):
        """As another process does it."""
        new = self.app.data / "account.new"
        new.write_text(text)
        new.rename(self.app.data / "account.ini")

    def press(self, name, role="push button"):
        """A button of the dialog that is in front, whose places are told within its own window."""
        app = self.app
        rows = wait_for(lambda: f"“{name}” in the dialog; showing: {app.names()[:40]}",
                        lambda: [row for row in app.accessibility.showing() if row[1].startswith(name) and row[0] == role])
        geometry = dict(line.split("=") for line in
                        app.desktop.tool("xdotool", "getwindowfocus", "getwindowgeometry", "--shell").splitlines()
                        if "=" in line)
        row = rows[-1]
        app.mouse("mousemove", "--sync", str(int(geometry["X"]) + row[2] + row[4] // 2),
                  str(int(geometry["Y"]) + row[3] + row[5] // 2), "click", "1")

    def open_accounts(self):
        self.app.click("Main Menu")
        self.app.wait("Accounts…", "menu item")
        self.app.key("c")
        self.app.wait("On This Device")

    def test_the_line_tells_the_items_and_then_the_free_space(self):
        def much_to_count(app):
            trash = app.data / "mirror" / ".Trash" / "old"
            trash.mkdir(parents=True)
            for number in range(20000):
                (trash / f".{number}.vlopromise").write_text("[Promise]\nSize=10\n")
        self.start(more="Allowance=1048776000\n", prepare=much_to_count)
        self.app.wait("2 items, 1")  # 1,000 MB and 200 kB, without what is in it
        log = self.app.log()
        self.assertLess(log.index("DLC items changed, count is 2"), log.index("updated quota at"))
        self.app.click("Plans", "list item")
        self.app.wait("1 item, ")

    def test_signing_out_and_in_while_browsing(self):
        self.start()
        app = self.app
        app.click("Plans", "list item")
        app.wait("Garden.txt", "list item")
        self.open_accounts()
        self.press("Sign Out: Ada")
        app.wait("Vaelo Drive is not available")
        self.assertIn("SignedIn=false", (app.data / "account.ini").read_text())
        app.key("Escape")
        app.wait_gone("Sign In: Ada")
        app.click("Accounts…", "push button")  # of the page that says so
        self.press("Sign In: Ada")
        app.wait("Report.txt", "list item")
        app.wait_gone("Vaelo Drive is not available")

    def test_another_account_has_documents_of_its_own(self):
        self.start()
        app = self.app
        self.open_accounts()
        app.wait("Another Account")
        app.wait("Sign Out: Ada")
        self.press("Name", "text")
        app.type("Grace")
        app.key("Return")
        app.wait("Sign Out: Grace")
        app.key("Escape")
        app.wait("Welcome to Vaelo Drive.md", "list item")
        self.assertIsNone(app.find("Report.txt"))
        self.write_account(account())
        app.wait("Report.txt", "list item")
        self.assertIsNone(app.find("Welcome to Vaelo Drive.md"))

    def test_a_damaged_account_file_is_said_and_the_drive_opens(self):
        def damage(app):
            (app.data / "account.ini").write_text("garbage")
        self.start(prepare=damage)
        self.app.wait("The file of your account was damaged.")
        self.assertEqual((self.app.data / "account.ini.damaged-1").read_text(), "garbage")

    def start_with_browser(self, more):
        """With a browser that asks for the page and ends; answers the pages that it asked for."""
        asked = []

        class Page(http.server.BaseHTTPRequestHandler):
            def do_GET(self):
                asked.append(self.path)
                self.send_response(200)
                self.end_headers()

            def log_message(self, *_):
                pass

        server = http.server.HTTPServer(("127.0.0.1", 0), Page)
        threading.Thread(target=server.serve_forever, daemon=True).start()
        self.addCleanup(server.server_close)
        self.addCleanup(server.shutdown)

        def install(app):
            browser = app.desktop.scratch / "browser"
            browser.write_text("#!/usr/bin/python3\nimport sys, urllib.request\nurllib.request.urlopen(sys.argv[1])\n")
            browser.chmod(0o755)
            folder = app.base / "data" / "applications"
            folder.mkdir(parents=True)
            (folder / "browser.desktop").write_text(
                f"[Desktop Entry]\nType=Application\nName=Browser\nExec={browser} %u\nMimeType=x-scheme-handler/http;\n")
            (folder / "mimeapps.list").write_text("[Default Applications]\nx-scheme-handler/http=browser.desktop\n")

        page = f"UpgradePage=http://127.0.0.1:{server.server_port}/more\n"
        self.start(more=page + more, prepare=install)
        return asked, page

    def test_an_offer_opens_the_providers_page_by_itself(self):
        asked, page = self.start_with_browser("Allowance=1100\n")
        self.app.click("Storage Almost Full", "push button")
        wait_for("the provider's page", lambda: asked == ["/more"])
        self.app.wait_log("UpgradeStorage button pressed, link.action=1")
        self.app.wait_log("launched default action")
        # Bought: the provider's account allows more.
        self.write_account(account(more=page + "Allowance=900000\n"))
        self.app.wait_log("Quota Offer Changed, offer level is not set")
        self.app.wait_gone("Storage Almost Full")

    def test_a_provider_that_wants_to_be_asked_for_first(self):
        asked, _ = self.start_with_browser("Allowance=1000\nUpgradeAsksFirst=true\n")
        self.app.wait("Storage Full", "push button")
        # A finger that comes down beside the small button means it too.
        self.app.click("2 items, ")
        self.app.wait("Your storage is full")
        self.press("Not Now")
        self.app.wait_gone("Your storage is full")
        self.app.click("Storage Full", "push button")
        self.app.wait("Your storage is full")
        self.assertEqual(asked, [])
        self.press("See Offers")
        wait_for("the provider's page", lambda: asked == ["/more"])
        self.app.wait_gone("Your storage is full")
        self.app.wait_log("UpgradeStorage: presenting view controller")

    def test_a_phone_on_its_side_has_room_for_what_is_to_be_pressed(self):
        high = 360
        self.start(more="Allowance=1000\nUpgradePage=http://127.0.0.1:1/\nUpgradeAsksFirst=true\n", size=(720, high))
        app = self.app

        def is_whole(name):
            row = app.wait(name, "push button")
            self.assertLessEqual(row[3] + row[5], high, name)
        app.click("Storage Full", "push button")
        is_whole("Not Now")
        app.key("Escape")
        app.wait_gone("Not Now")
        self.open_accounts()
        is_whole("Sign Out: Ada")
        dialog = next(row for row in app.accessibility.showing() if row[1] == "Accounts" and row[0] in ("dialog", "frame"))
        self.assertLessEqual(dialog[5], high)
        self.press("Sign Out: Ada")
        app.wait("Vaelo Drive is not available")
        app.key("Escape")
        app.wait_gone("Sign In: Ada")
        is_whole("Accounts…")

    def test_without_a_provider_there_is_no_offer(self):
        self.start(more="Allowance=1000\n")
        self.app.wait("2 items, ")
        self.assertIsNone(self.app.find("Storage", "push button"))
        self.assertNotIn("Quota Offer Changed", self.app.log())


if __name__ == "__main__":
    unittest.main()
