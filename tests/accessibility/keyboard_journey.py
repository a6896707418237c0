#!/usr/bin/python3
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
"""The download journey by keyboard alone: from the main window open the customise voices sheet, search,
tick a downloadable voice, choose its full size, confirm with Return and see it downloading in the voice
pop-up. Only key events go in (xdotool); every result is read over AT-SPI."""
import json
import os
import subprocess
import sys

sys.path.insert(0, os.path.dirname(os.path.abspath(__file__)))
import pyatspi  # noqa: E402
from atspi_support import (EventLog, application, check, find, finish, focused_in, fresh, gone, keys, log, role,  # noqa: E402
                           screenshot, states, type_text, wait_for, window)


def focused(root):
    return wait_for(lambda: focused_in(root), 5)


app = application()
events = EventLog("object:state-changed:focused", "object:property-change:accessible-description")
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
type_text("Tobias")

events.clear()
keys("Tab")
heard = events.wait_for(lambda e: e[0].startswith("object:state-changed:focused") and e[2] == 1
                        and e[1] == "Tobias, English (United Kingdom)")
check(heard is not None, "a screen reader is told the focus moved to Tobias's row: %s"
      % [e[:3] for e in events.seen])
row = focused(sheet)
check(row is not None and row.name == "Tobias, English (United Kingdom)" and role(row) == pyatspi.ROLE_CHECK_BOX,
      "Tab reaches Tobias's row: %r" % (row.name if row else None))
keys("space")
check(row is not None and wait_for(lambda: pyatspi.STATE_CHECKED in states(fresh(row)), 5) is not None,
      "Space ticks him")

keys("Tab")
sizes = focused(sheet)
check(sizes is not None and role(sizes) == pyatspi.ROLE_COMBO_BOX and sizes.description == "Download size for Tobias",
      "Tab reaches his size pop-up: %r" % (sizes.description if sizes else None))
keys("space")
keys("Down", "Return")


def full_size_chosen():
    # A pop-up reads its choice as its name.
    combo = find(sheet, lambda n: role(n) == pyatspi.ROLE_COMBO_BOX and pyatspi.STATE_FOCUSED in states(n), 1)
    if combo is None:
        return None
    return combo.name if combo.name.startswith("Full") else None


chosen = wait_for(full_size_chosen, 5)
check(chosen is not None, "the full size is chosen: %r" % chosen)
screenshot("journey-full-size")

events.clear()
keys("Return")
check(gone(app, "Customize Voices") is not None, "Return is OK: the sheet closes")
heard = events.wait_for(lambda e: e[0].startswith("object:property-change:accessible-description")
                        and "Tobias" in (e[3] or ""), 15)
check(heard is not None, "a screen reader is told the pop-up's status changed: %s" % (heard,))
status = find(main, lambda n: role(n) == pyatspi.ROLE_LABEL and "Tobias" in n.name
              and pyatspi.STATE_SHOWING in states(n), timeout=20)
check(status is not None, "the status beside the pop-up names Tobias: %r" % (status.name if status else None))
check(status is not None and ("Downloading" in status.name or "Waiting" in status.name),
      "it says he is downloading")
popup = fresh(popup)
check("Tobias" in (popup.description or ""), "the pop-up itself describes the download: %r" % popup.description)
screenshot("journey-downloading")

# The daemon got the full size.
records = json.loads(subprocess.run([os.environ["CADENZA_CLI"], "status", "--json"], capture_output=True,
                                    text=True).stdout or "[]")
log("daemon status: %s" % records)
check(any("premium" in json.dumps(r).lower() or "full" in json.dumps(r).lower() for r in records),
      "the daemon is fetching the full size")
finish()
