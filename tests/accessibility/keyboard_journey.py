#!/usr/bin/python3
"""The download journey by keyboard alone: from the main window open the customise voices sheet, search,
tick a downloadable voice, choose its full size, confirm with Return and see it downloading in the voice
pop-up. Only key events go in (xdotool); every result is read over AT-SPI."""
import json
import os
import subprocess
import sys

sys.path.insert(0, os.path.dirname(os.path.abspath(__file__)))
import pyatspi  # noqa: E402
from atspi_support import (application, check, dump, find, finish, fresh, gone, keys, log, role,  # noqa: E402
                           screenshot, states, type_text, wait_for, window)


def focused(root):
    return find(root, lambda n: pyatspi.STATE_FOCUSED in states(n), timeout=5)


app = application()
main = window(app, "Speech")
check(main is not None, "the main window is there")
popup = focused(main)
check(popup is not None and role(popup) == pyatspi.ROLE_COMBO_BOX, "the focus starts on the voice pop-up")

# Space opens the pop-up's menu; End and Return choose "Customize…".
keys("space")
keys("End", "Return")
sheet = window(app, "Customize Voices")
check(sheet is not None, "the customise voices sheet is open")
if sheet is None:
    finish()
search = focused(sheet)
check(search is not None and search.name == "Search", "the focus is in the search field")
type_text("Femke")

keys("Tab")
row = focused(sheet)
check(row is not None and row.name == "Femke, Dutch (Netherlands)" and role(row) == pyatspi.ROLE_CHECK_BOX,
      "Tab reaches Femke's row: %r" % (row.name if row else None))
keys("space")
check(row is not None and wait_for(lambda: pyatspi.STATE_CHECKED in states(fresh(row)), 5) is not None,
      "Space ticks her")

keys("Tab")
sizes = focused(sheet)
check(sizes is not None and role(sizes) == pyatspi.ROLE_COMBO_BOX and sizes.name == "Download size for Femke",
      "Tab reaches her size pop-up: %r" % (sizes.name if sizes else None))
keys("space")
keys("Down", "Return")


def full_size_chosen():
    combo = focused(sheet)
    if combo is None or role(combo) != pyatspi.ROLE_COMBO_BOX:
        return None
    for node in [combo] + [combo.getChildAtIndex(i) for i in range(combo.childCount)]:
        for i in range(node.childCount):
            item = node.getChildAtIndex(i)
            if item is not None and pyatspi.STATE_SELECTED in states(item) and item.name.startswith("Full"):
                return item.name
    try:
        text = combo.queryText()
        value = text.getText(0, text.characterCount)
        return value if value.startswith("Full") else None
    except NotImplementedError:
        return None


chosen = wait_for(full_size_chosen, 5)
if chosen is None:
    dump(sheet)
check(chosen is not None, "the full size is chosen: %r" % chosen)
screenshot("journey-full-size")

keys("Return")
check(gone(app, "Customize Voices") is not None, "Return is OK: the sheet closes")
status = find(main, lambda n: role(n) == pyatspi.ROLE_LABEL and "Femke" in n.name
              and pyatspi.STATE_SHOWING in states(n), timeout=20)
check(status is not None, "the status beside the pop-up names Femke: %r" % (status.name if status else None))
check(status is not None and ("Downloading" in status.name or "Waiting" in status.name),
      "it says she is downloading")
popup = fresh(popup)
check("Femke" in (popup.description or ""), "the pop-up itself describes the download: %r" % popup.description)
screenshot("journey-downloading")

# The daemon got the full size.
records = json.loads(subprocess.run([os.environ["CADENZA_CLI"], "status", "--json"], capture_output=True,
                                    text=True).stdout or "[]")
log("daemon status: %s" % records)
check(any("premium" in json.dumps(r).lower() or "full" in json.dumps(r).lower() for r in records),
      "the daemon is fetching the full size")
finish()
