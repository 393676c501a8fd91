# SPDX-License-Identifier: GPL-3.0-or-later
"""A desktop without applications that open documents, so that a document which is picked is shown by the preview."""


def without_applications(app):
    """For App's `prepare`: what is installed stays but for the applications."""
    shared = app.desktop.scratch / "share"
    if not shared.is_dir():
        shared.mkdir()
        for name in ("mime", "icons", "themes", "glib-2.0", "fonts", "gtksourceview-5", "X11"):
            (shared / name).symlink_to(f"/usr/share/{name}")
    app.desktop.environment["XDG_DATA_DIRS"] = str(shared)
