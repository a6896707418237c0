#!/usr/bin/python3
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
"""What a screen reader finds in every window of cadenza-settings: roles, names and states, in the
customise sheets before and after a tick and during a download with the real daemon."""
import os
import sys
import time

sys.path.insert(0, os.path.dirname(os.path.abspath(__file__)))
import pyatspi  # noqa: E402
from atspi_support import (application, check, dump, find, find_all, finish, focus_window, focused_in,  # noqa: E402
                           fresh, gone, keys, labels, role, screenshot, states, tab_to, type_text,
                           unnamed_controls, wait_for, window)

app = application()
main = window(app, "Speech")
check(main is not None, "the main window is read as 'Speech'")
check(unnamed_controls(main) == [], "every control of the main window has a name: %s" % unnamed_controls(main))
dump(main)
# On Linux a pop-up's name is its choice; its label comes as a labelled-by relation.
voice_popup = find(main, lambda n: role(n) == pyatspi.ROLE_COMBO_BOX and "System voice:" in labels(n))
check(voice_popup is not None, "the voice pop-up is a combo box labelled 'System voice:'")
check(voice_popup is not None and bool(voice_popup.name), "the voice pop-up reads its voice: %r"
      % (voice_popup.name if voice_popup else None))
check(find(main, lambda n: role(n) == pyatspi.ROLE_COMBO_BOX and "Language:" in labels(n)) is not None,
      "the dictation pop-up is a combo box labelled 'Language:'")
check(voice_popup is not None and pyatspi.STATE_FOCUSED in states(voice_popup), "the voice pop-up has the focus")


def open_voices_sheet():
    focus_window("Speech")
    check(tab_to(main, lambda n: role(n) == pyatspi.ROLE_COMBO_BOX and "System voice:" in labels(n)) is not None,
          "Tab reaches the voice pop-up")
    keys("space")
    keys("End", "Return")
    return window(app, "Customize Voices")


def sheet_rows(sheet):
    table = find(sheet, lambda n: role(n) == pyatspi.ROLE_LIST and n.name == "Voices")
    return table, ([table.getChildAtIndex(i) for i in range(table.childCount)] if table else [])


# The customise voices sheet.
sheet = open_voices_sheet()
check(sheet is not None, "the customise voices sheet opens from the keyboard")
screenshot("a11y-voices-sheet")
table, rows = sheet_rows(sheet)
check(table is not None, "the voice table is a list named 'Voices'")
check(unnamed_controls(sheet) == [], "every control of the sheet has a name: %s" % unnamed_controls(sheet))
check(not find_all(sheet, lambda n: n.name == "title"), "nothing is called 'title'")
headings = [r for r in rows if role(r) == pyatspi.ROLE_HEADING]
boxes = [r for r in rows if role(r) == pyatspi.ROLE_CHECK_BOX]
check(len(headings) >= 3 and len(boxes) >= 10, "the table holds headings (%d) and check boxes (%d)"
      % (len(headings), len(boxes)))
check(len(headings) + len(boxes) == len(rows), "every row is a heading or a check box")
check("English (United States)" in [h.name for h in headings], "'English (United States)' is a heading")
check(all(pyatspi.STATE_SELECTABLE not in states(h) for h in headings), "headings cannot be selected")
names = [b.name for b in boxes]
check("Maren, English (United States)" in names, "Maren's row is read 'Maren, English (United States)'")
check(all(", " in name for name in names), "every voice row names its language: %s" % names)
check(any(pyatspi.STATE_CHECKED in states(b) for b in boxes), "some rows read as checked")
tobias = next((b for b in boxes if b.name.startswith("Tobias,")), None)
check(tobias is not None and pyatspi.STATE_CHECKED not in states(tobias), "Tobias's row is there, unchecked")
check(find(sheet, lambda n: role(n) == pyatspi.ROLE_PUSH_BUTTON and n.name == "Play") is not None,
      "Play is a named button")

# The upgrade tick of a row (Orin's better quality) is its child, reached with Tab from the table.
def upgrade_box(row):
    for i in range(row.childCount):
        child = row.getChildAtIndex(i)
        if role(child) == pyatspi.ROLE_CHECK_BOX and child.name.startswith("Update ("):
            return child
    return None


upgradable = next((b for b in boxes if upgrade_box(b) is not None), None)
check(upgradable is not None, "a row offers its upgrade as a named check box child")
if upgradable is not None:
    target = upgradable.name
    keys("Tab")
    for _ in range(len(rows)):
        current = focused_in(sheet)
        if current is not None and current.name == target:
            break
        keys("Down")
    check(current is not None and current.name == target, "Down reaches %r" % target)
    keys("Tab")
    box = focused_in(sheet)
    check(box is not None and box.name.startswith("Update ("), "Tab reaches its upgrade tick: %r"
          % (box.name if box else None))
    if box is not None:
        before = pyatspi.STATE_CHECKED in states(box)
        keys("space")
        check(wait_for(lambda: (pyatspi.STATE_CHECKED in states(fresh(box))) != before, 5) is not None,
              "Space toggles the upgrade tick")
        keys("space")
    keys("shift+Tab")
    back = focused_in(sheet)
    check(back is not None and back.name == target, "Shift+Tab goes back to the row")
    keys("shift+Tab")
    back = focused_in(sheet)
    check(back is not None and back.name == "Search", "Shift+Tab from the table reaches the search field")

# Search, tick from the keyboard: the row reads as checked, with its status and size choice.
type_text("Tobias")
table, rows = sheet_rows(sheet)
check([r.name for r in rows if role(r) == pyatspi.ROLE_CHECK_BOX] == ["Tobias, English (United Kingdom)"],
      "the search narrows the list to Tobias")
keys("Tab")
tobias = wait_for(lambda: next((r for r in sheet_rows(sheet)[1] if pyatspi.STATE_FOCUSED in states(r)), None))
check(tobias is not None and tobias.name == "Tobias, English (United Kingdom)", "Tab into the table focuses Tobias's row")
keys("space")
tobias = wait_for(lambda: next((r for r in sheet_rows(sheet)[1]
                               if r.name.startswith("Tobias") and pyatspi.STATE_CHECKED in states(fresh(r))), None))
check(tobias is not None, "Space ticks Tobias: his row reads as checked")
screenshot("a11y-tobias-ticked")
if tobias is not None:
    parts = [tobias.getChildAtIndex(i) for i in range(tobias.childCount)]
    check(any(role(p) == pyatspi.ROLE_LABEL and p.name == "Required" for p in parts),
          "the row's status 'Required' is a child label")
    check(tobias.description == "Required", "the row's description is its status")
    sizes = next((p for p in parts if role(p) == pyatspi.ROLE_COMBO_BOX), None)
    check(sizes is not None and sizes.name.startswith("Compact") and sizes.description == "Download size for Tobias",
          "the size pop-up is a child reading its choice, described 'Download size for Tobias'")
dump(sheet)

# A search without results says so where the focus is.
keys("shift+Tab")
keys("ctrl+a")
type_text("zzzz")
search = find(sheet, lambda n: n.name == "Search" and role(n) in (pyatspi.ROLE_ENTRY, pyatspi.ROLE_TEXT))
check(search is not None and wait_for(lambda: fresh(search).description == "No Results", 5) is not None,
      "an empty search is described 'No Results' on the search field")
keys("ctrl+a", "BackSpace")

# Return is OK: the download starts and the voice pop-up's status line says so.
keys("Return")
check(gone(app, "Customize Voices") is not None, "Return closes the sheet with OK")
status = find(main, lambda n: role(n) == pyatspi.ROLE_LABEL and ("Tobias" in n.name or "Waiting" in n.name)
              and pyatspi.STATE_SHOWING in states(n), timeout=20)
check(status is not None, "the main window's status line names the download: %r" % (status.name if status else None))
check(voice_popup is not None and wait_for(lambda: fresh(voice_popup).description, 10) is not None,
      "the voice pop-up describes the download: %r" % (voice_popup.description if voice_popup else None))
progress = find(main, lambda n: role(n) == pyatspi.ROLE_PROGRESS_BAR and pyatspi.STATE_SHOWING in states(n))
check(progress is not None and progress.name == "Voice download progress", "the progress bar is named")
screenshot("a11y-downloading")

# While it downloads, the sheet shows Tobias's row disabled with its progress.
sheet = open_voices_sheet()
check(sheet is not None, "the sheet opens again during the download")
if sheet is not None:
    def downloading_row():
        for r in sheet_rows(sheet)[1]:
            if r.name.startswith("Tobias,") and r.description and ("Downloading" in r.description
                                                                  or "Waiting" in r.description):
                return r
        return None
    row = wait_for(downloading_row, 20)
    check(row is not None, "Tobias's row reads its download status: %r" % (row.description if row else None))
    if row is not None:
        check(pyatspi.STATE_SENSITIVE not in states(row) or pyatspi.STATE_ENABLED not in states(row),
              "Tobias's row reads as disabled while it downloads")
    screenshot("a11y-sheet-during-download")
    keys("Escape")
    check(gone(app, "Customize Voices") is not None, "Escape closes the sheet")

# The voice settings dialog, as a window and as a sheet.
for button_name, title_hint in (("Voice Settings…", None), ("Voice Settings as Sheet…", None)):
    button = find(main, lambda n: role(n) == pyatspi.ROLE_PUSH_BUTTON and n.name == button_name, timeout=5)
    check(button is not None, "the main window has a button %r" % button_name)
    if button is None:
        continue
    before = {app.getChildAtIndex(i).name for i in range(fresh(app).childCount)}
    focus_window("Speech")
    check(tab_to(main, lambda n: role(n) == pyatspi.ROLE_PUSH_BUTTON and n.name == button_name) is not None,
          "Tab reaches %r" % button_name)
    keys("space")
    dialog = wait_for(lambda: next((c for c in (fresh(app).getChildAtIndex(i) for i in range(app.childCount))
                                    if role(c) == pyatspi.ROLE_DIALOG and pyatspi.STATE_SHOWING in states(c)),
                                   None), 10)
    check(dialog is not None, "%r opens a dialog" % button_name)
    if dialog is None:
        continue
    check(bool(dialog.name), "the dialog has a title: %r" % dialog.name)
    check(unnamed_controls(dialog) == [], "every control of %r has a name: %s" % (dialog.name, unnamed_controls(dialog)))
    check(find(dialog, lambda n: role(n) == pyatspi.ROLE_SLIDER) is not None, "the dialog has sliders")
    focus_window(dialog.name)
    keys("Escape")
    check(gone(app, dialog.name, 10) is not None, "Escape closes %r" % dialog.name)
    time.sleep(0.5)

# The customise dictation languages sheet, from the dictation pop-up's last item.
languages = find(main, lambda n: role(n) == pyatspi.ROLE_COMBO_BOX and "Language:" in labels(n))
if languages is not None:
    focus_window("Speech")
    check(tab_to(main, lambda n: role(n) == pyatspi.ROLE_COMBO_BOX and "Language:" in labels(n)) is not None,
          "Tab reaches the dictation pop-up")
    keys("space")
    screenshot("a11y-dictation-menu")
    keys("End", "Return")
    dictation = window(app, "Customize Dictation Languages")
    check(dictation is not None, "the dictation languages sheet opens from the keyboard")
    if dictation is not None:
        screenshot("a11y-languages-sheet")
        check(unnamed_controls(dictation) == [], "every control of the languages sheet has a name: %s"
              % unnamed_controls(dictation))
        table = find(dictation, lambda n: role(n) == pyatspi.ROLE_LIST)
        rows = [table.getChildAtIndex(i) for i in range(table.childCount)] if table else []
        names = [r.name for r in rows if role(r) == pyatspi.ROLE_CHECK_BOX]
        # A row names the language and the region, not the region alone.
        check("English (United States)" in names,
              "a dictation row reads 'English (United States)': %s" % names)
        check(any(role(r) == pyatspi.ROLE_HEADING for r in rows), "languages are grouped under headings")
        dump(dictation)
        focus_window("Customize Dictation Languages")
        keys("Escape")
        check(gone(app, "Customize Dictation Languages") is not None, "Escape closes the languages sheet")
finish()
