# SPDX-License-Identifier: GPL-3.0-or-later
"""Two devices on one drive, each a window on a display and a bus of its own: what one shows the other can continue."""
import os
import time
import unittest

from bare_desktop import without_applications
from harness import App, wait_for

DOCUMENT = "activity-document-url"


class OtherDevice(App):
    """The application on a data folder of its own, whose mirror is that of the first device."""

    def __init__(self, first, name="Kitchen Slate", **options):
        def share(app):
            without_applications(app)
            app.data.mkdir(parents=True, exist_ok=True)
            (app.data / "mirror").symlink_to(first.data / "mirror")
            (app.data / "device.ini").write_text(f"[Device]\nID={name.replace(' ', '-').lower()}\nName={name}\n")
        super().__init__(prepare=share, **options)


class Continue(unittest.TestCase):
    def setUp(self):
        self.first = App(demo=True, prepare=without_applications)
        self.addCleanup(self.first.close)
        self.first.wait("Documents,", "list item")
        self.other = OtherDevice(self.first)
        self.addCleanup(self.other.close)
        self.other.wait("Documents,", "list item")
        self.activities = self.first.data / "mirror" / ".vaelo" / "activities"

    def show(self, app, document="Minutes 2.txt"):
        app.click("Documents", "list item")
        app.wait_title("Documents")
        app.click(document, "list item")
        app.wait_title(document)

    def test_what_one_device_shows_another_continues(self):
        self.show(self.other)
        self.first.wait("Continue from Kitchen Slate: Minutes 2.txt", "push button")
        self.first.click("Continue from Kitchen Slate: Minutes 2.txt", "push button")
        self.first.wait_title("Minutes 2.txt")
        self.first.wait_log("activity type is com.marrow.kestrel.viewing")
        self.first.wait_log("Baton: Open Document")
        self.first.wait_gone("Continue from")
        self.first.key("Escape")
        self.first.wait_title("Documents")
        self.assertIsNone(self.first.find("Continue from"), "what was continued is not offered once more")

    def test_the_offer_goes_with_the_preview(self):
        self.show(self.other)
        self.first.wait("Continue from Kitchen Slate")
        self.other.key("Escape")
        self.other.wait_title("Documents")
        self.other.click("Minutes 10.txt", "list item")
        self.first.wait("Continue from Kitchen Slate: Minutes 10.txt")
        self.other.process.terminate()
        self.other.process.wait(10)
        for file in self.activities.glob("kitchen-slate.ini"):
            file.unlink()  # a device that is switched off leaves it behind, and the drive removes it one day
        self.first.wait_gone("Continue from")

    def test_a_dismissed_offer_stays_away_until_another_document_is_shown(self):
        self.show(self.other)
        self.first.wait("Continue from Kitchen Slate")
        self.first.click("Dismiss", "push button")
        self.first.wait_gone("Continue from")
        self.other.key("Escape")
        self.other.wait_title("Documents")
        self.other.click("Minutes 10.txt", "list item")
        self.first.wait("Continue from Kitchen Slate: Minutes 10.txt")
        self.first.wait_title("Vaelo Drive")

    def test_the_same_document_is_not_offered(self):
        self.show(self.first)
        self.show(self.other)
        wait_for("both activities", lambda: len(list(self.activities.glob("*.ini"))) == 2)
        self.first.key("Escape")
        self.first.wait("Continue from Kitchen Slate: Minutes 2.txt")
        self.first.click("Minutes 2.txt", "list item")
        self.first.wait_gone("Continue from")


class HostileFiles(unittest.TestCase):
    def test_are_ignored_and_told(self):
        app = App(demo=True, prepare=without_applications)
        self.addCleanup(app.close)
        app.wait("Documents,", "list item")
        folder = app.data / "mirror" / ".vaelo" / "activities"

        def arrives(name, text):
            (folder / ".arriving").write_bytes(text)
            (folder / ".arriving").rename(folder / name)

        def activity(document, since, device="Evil"):
            return (f"[Activity]\nDevice={device}\nType=com.marrow.kestrel.viewing\nSince={since}\n"
                    f"[UserInfo]\n{DOCUMENT}={document}\n").encode()
        now = int(time.time())
        arrives("binary.ini", bytes(range(256)) * 16)
        arrives("huge.ini", activity("vlo1:0:" + "a" * (4 << 20), now))
        arrives("stale.ini", activity("vlo1:0:com~marrow~Kestrel/Documents/Minutes%202.txt", now - 100000))
        os.mkfifo(folder / "pipe.ini")
        (folder / "link.ini").symlink_to("/dev/zero")
        for name in ("binary", "huge", "stale", "pipe", "link"):
            app.wait_log(f"activity {name}.ini ignored")
        # Well formed, but their documents are not in the drive.
        for document in ("vlo1:0:../../../../etc/passwd", "vlo1:0:com~marrow~Kestrel/nothing", "nonsense", "x" * 5000):
            arrives("climbing.ini", activity(document, now))
        arrives("bold.ini", activity("vlo1:0:com~marrow~Kestrel/Documents/Minutes%202.txt", now + 1, "<b>Bold</b> & co"))
        app.wait("Continue from <b>Bold</b> & co: Minutes 2.txt", "push button")
        self.assertTrue(app.running())
        self.assertEqual(app.log().count("activity huge.ini ignored"), 1)


if __name__ == "__main__":
    unittest.main()
