# SPDX-License-Identifier: GPL-3.0-or-later
"""Accounts, what their provider offers, and a drive without libraries."""

NAMES = ("picker", "offer", "upgrade", "accounts", "unavailable")
RECORD = "[Account]\nName={name}\nToken={token}\nSignedIn={signed_in}\nMirror={mirror}\n"
OFFER = "Allowance=50000000\nUpgradePage=https://drive.example/more\nUpgradeAsksFirst=true\n"


def fill(app):
    app.drive.mkdir(parents=True)
    (app.data / "account.ini").write_text(RECORD.format(name="Ada", token="ab", signed_in="true", mirror="mirror") + OFFER)
    others = app.data / "accounts"
    others.mkdir()
    (others / "cd.ini").write_text(RECORD.format(name="Grace", token="cd", signed_in="false", mirror="accounts/cd"))
    for name in ("Desktop", "Documents", "Plans/Garden", "Plans/House", "Travel"):
        (app.drive / name).mkdir(parents=True)
    (app.drive / "Report.txt").write_text("words\n")
    with (app.drive / "Film.bin").open("wb") as film:
        film.truncate(48_500_000)


def play(stage):
    app = stage.start(fill, demo=False)
    app.wait("Report.txt", "list item")
    stage.wait("Storage Almost Full – Upgrade…", "push button")
    stage.shot("offer")
    stage.click("Storage Almost Full – Upgrade…")
    stage.wait("Your storage is almost full")
    stage.shot("upgrade")
    app.key("Escape")
    stage.wait_gone("Your storage is almost full")
    app.click("Report.txt", "list item", button=3)
    stage.choose("_Move…")
    stage.wait("The item is in this folder already.")
    stage.shot("picker")
    app.key("Escape")
    stage.wait_gone("The item is in this folder already.")
    stage.click("Main Menu", None)
    stage.choose("A_ccounts…")
    stage.wait("On This Device")
    app.wait("Grace")
    stage.shot("accounts")
    app.key("Escape")
    stage.wait_gone("On This Device")
    (app.data / "account.new").write_text(RECORD.format(name="Ada", token="ab", signed_in="false", mirror="mirror"))
    (app.data / "account.new").rename(app.data / "account.ini")
    stage.wait("Vaelo Drive is not available")
    stage.shot("unavailable")
