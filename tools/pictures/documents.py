# SPDX-License-Identifier: GPL-3.0-or-later
"""Documents: their previews and their details."""
import harness

from .stage import furnish

PREVIEWS = {"preview-picture": "Pictures/Photo 3.jpg", "preview-document": "Documents/Contract.pdf",
            "preview-text": "Documents/Minutes 10.txt", "preview-markdown": "Welcome.md",
            "preview-source": "Documents/Projects/Boat/main.cpp", "preview-archive": "Archives/Old.zip",
            "preview-sound": "Media/Tone.wav", "preview-film": "Media/Clip.avi", "preview-unknown": "Archives/Disk.img",
            "preview-damaged": "Pictures/Torn.jpg"}
NAMES = (*PREVIEWS, "preview-note", "preview-mark", "preview-not-downloaded", "preview-downloading", "details", "details-rename", "details-tags")


def add_documents(app):
    furnish(app)
    with (app.drive / "Archives" / "Disk.img").open("wb") as disk:
        disk.truncate(1440 * 1024)
    whole = (app.drive / "Pictures" / "Photo 3.jpg").read_bytes()
    (app.drive / "Pictures" / "Torn.jpg").write_bytes(whole[:100])


def mark(stage):
    """A note on the first page, and what can be done with it."""
    app = stage.app
    stage.show("Documents/Contract.pdf")
    if stage.narrow:
        stage.click("Find and Markup", None)
        stage.choose("_Markup")
    else:
        stage.click("Markup", None)
    stage.settle()
    stage.click("Note", None)
    place = (str(stage.size[0] * 2 // 5), str(stage.size[1] * 2 // 5))
    app.mouse("mousemove", "--sync", *place, "click", "1")
    stage.wait("Add Note")
    app.type("Mind the bridge")
    stage.shot("preview-note")
    app.key("ctrl+Return")
    stage.wait("Saved")
    stage.click("Note", None)
    app.mouse("mousemove", "--sync", *place, "click", "1")
    stage.wait("Edit Note")
    stage.shot("preview-mark")
    app.key("Escape", "Escape", "Escape")
    app.wait_title("Documents")


def play(stage):
    app = stage.start(add_documents)
    app.wait("Documents", "list item")
    for name, document in PREVIEWS.items():
        if name in stage.wanted:
            stage.show(document)
            stage.shot(name)
    if stage.wanted & {"preview-note", "preview-mark"}:
        mark(stage)
    stage.show("Documents/Thesis.pdf")
    stage.wait("Thesis.pdf", "label")
    stage.shot("preview-not-downloaded")
    with (app.drive / "Documents" / ".Thesis.pdf.vlopartial").open("wb") as partial:
        partial.truncate(17_000_000)
    stage.wait("Downloading… %s%%")
    stage.shot("preview-downloading")
    app.key("Escape")
    app.wait_title("Documents")
    # Its thumbnail is made when it is looked at first, and shown from then on.
    thumbnails = app.base / "cache" / "thumbnails"
    stage.show("Pictures/Photo 3.jpg", "details")
    harness.wait_for("the thumbnail", lambda: list(thumbnails.rglob("*.png")))
    stage.show("Pictures/Photo 2.jpg")
    stage.show("Pictures/Photo 3.jpg", "details")
    stage.wait("Kind", "label")
    stage.shot("details")
    app.key("ctrl+t")
    stage.wait("New tag")
    stage.shot("details-tags")
    app.key("Escape")
    stage.wait_gone("New tag")
    stage.click("Name", "text")
    app.wait_title(stage.text("Rename File"))
    stage.shot("details-rename")
