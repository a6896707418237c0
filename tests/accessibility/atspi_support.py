# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
"""Reading cadenza-settings over AT-SPI and typing into it with xdotool, for the accessibility tests."""
import os
import subprocess
import sys
import time

import pyatspi
from gi.repository import GLib

APP_NAME = "cadenza-settings"
# Roles a user operates: each must have a name.
CONTROL_ROLES = {
    pyatspi.ROLE_PUSH_BUTTON, pyatspi.ROLE_CHECK_BOX, pyatspi.ROLE_COMBO_BOX, pyatspi.ROLE_SLIDER,
    pyatspi.ROLE_SPIN_BUTTON, pyatspi.ROLE_ENTRY, pyatspi.ROLE_TEXT, pyatspi.ROLE_LIST,
    pyatspi.ROLE_TABLE, pyatspi.ROLE_RADIO_BUTTON, pyatspi.ROLE_PROGRESS_BAR,
}
failures = []


def log(message):
    print(message, flush=True)


def check(condition, message):
    if condition:
        log("ok   " + message)
    else:
        log("FAIL " + message)
        failures.append(message)
    return condition


def finish():
    if failures:
        log("%d check(s) failed:" % len(failures))
        for failure in failures:
            log("  - " + failure)
        sys.exit(1)
    log("PASS")


def wait_for(what, timeout=15.0, interval=0.25):
    """Polls what() until it returns something true; returns that, or None at the time limit."""
    deadline = time.monotonic() + timeout
    while True:
        try:
            result = what()
        except Exception:  # a node went away while it was read: try again
            result = None
        if result:
            return result
        if time.monotonic() > deadline:
            return None
        time.sleep(interval)


def application():
    def find():
        desktop = pyatspi.Registry.getDesktop(0)
        for i in range(desktop.childCount):
            candidate = desktop.getChildAtIndex(i)
            if candidate is not None and candidate.name == APP_NAME:
                return candidate
        return None
    app = wait_for(find, timeout=30)
    if app is None:
        log("FAIL cadenza-settings is not on the accessibility bus")
        sys.exit(1)
    return app


def walk(node, depth=0, limit=400):
    """Every node under node, itself included (at most limit children per node)."""
    yield node, depth
    try:
        count = min(node.childCount, limit)
    except Exception:
        return
    for i in range(count):
        try:
            child = node.getChildAtIndex(i)
        except Exception:
            continue
        if child is not None:
            yield from walk(child, depth + 1, limit)


def fresh(node):
    try:
        node.clear_cache()
    except Exception:
        pass
    return node


def states(node):
    return set(node.getState().getStates())


def role(node):
    return node.getRole()


def find(root, predicate, timeout=15.0):
    def look():
        for node, _ in walk(fresh(root)):
            try:
                if predicate(node):
                    return node
            except Exception:
                continue
        return None
    return wait_for(look, timeout)


def find_all(root, predicate):
    found = []
    for node, _ in walk(fresh(root)):
        try:
            if predicate(node):
                found.append(node)
        except Exception:
            continue
    return found


def showing_window(app, title):
    """The shown top-level window (frame, dialog or alert) called title, or None; raises when the
    bus could not answer."""
    fresh(app)
    for i in range(app.childCount):
        child = app.getChildAtIndex(i)
        if child is not None and child.name == title and pyatspi.STATE_SHOWING in states(child):
            return child
    return None


def window(app, title, timeout=15.0):
    return wait_for(lambda: showing_window(app, title), timeout)


def gone(app, title, timeout=15.0):
    """True once no shown window is called title (an unanswered question is not an answer)."""
    def closed():
        try:
            return showing_window(app, title) is None
        except Exception:
            return False
    return wait_for(closed, timeout)


def dump(node, out=sys.stdout):
    for each, depth in walk(fresh(node)):
        try:
            described = each.description
            out.write("%s%s %r%s %s\n" % ("  " * depth, each.getRoleName(), each.name,
                      " (%s)" % described if described else "",
                      sorted(pyatspi.stateToString(s) for s in states(each)
                             if s in (pyatspi.STATE_CHECKED, pyatspi.STATE_FOCUSED, pyatspi.STATE_SELECTED,
                                      pyatspi.STATE_SENSITIVE, pyatspi.STATE_CHECKABLE))))
        except Exception:
            continue


def labels(node):
    """The names of what labels node (its labelled-by relations): how a pop-up is introduced."""
    names = []
    for relation in node.getRelationSet():
        if relation.getRelationType() == pyatspi.RELATION_LABELLED_BY:
            for i in range(relation.getNTargets()):
                names.append(relation.getTarget(i).name.replace("&", ""))
    return names


def unnamed_controls(root):
    """Controls that are shown but have no name, as (role, parent name) pairs."""
    missing = []
    for node, _ in walk(fresh(root)):
        try:
            if role(node) in CONTROL_ROLES and pyatspi.STATE_SHOWING in states(node) and not node.name \
                    and not labels(node) and not node.description:
                parent = node.parent
                missing.append("%s in %s %r" % (node.getRoleName(), parent.getRoleName(), parent.name))
        except Exception:
            continue
    return missing


class EventLog:
    """AT-SPI events of the given types as (type, source name, detail1, source description), in order."""

    def __init__(self, *types):
        self.seen = []
        self.types = types
        pyatspi.Registry.registerEventListener(self._heard, *types)

    def _heard(self, event):
        try:
            self.seen.append((event.type, event.source.name, event.detail1, event.source.description))
        except Exception:
            self.seen.append((event.type, None, event.detail1, None))

    def pump(self, seconds=1.0):
        context = GLib.MainContext.default()
        deadline = time.monotonic() + seconds
        while time.monotonic() < deadline:
            while context.pending():
                context.iteration(False)
            time.sleep(0.05)

    def wait_for(self, predicate, timeout=10.0):
        deadline = time.monotonic() + timeout
        while time.monotonic() < deadline:
            self.pump(0.2)
            for entry in self.seen:
                if predicate(entry):
                    return entry
        return None

    def clear(self):
        self.pump(0.2)
        self.seen = []


def keys(*names):
    """Key presses through the X server, as a keyboard would make them."""
    subprocess.run(["xdotool", "key", "--delay", "120"] + list(names), check=True)
    time.sleep(0.4)


def focus_window(title):
    """Gives the X input focus back to a window, as a window manager would when a sheet closes."""
    found = subprocess.run(["xdotool", "search", "--onlyvisible", "--name", "^%s$" % title],
                           capture_output=True, text=True).stdout.split()
    if found:
        subprocess.run(["xdotool", "windowfocus", "--sync", found[0]], check=False)
        time.sleep(0.5)


def focused_in(root):
    """The innermost focused node under root: a row of a focused table rather than the table."""
    found = None
    for node, _ in walk(fresh(root)):
        try:
            if pyatspi.STATE_FOCUSED in states(node) and role(node) not in (pyatspi.ROLE_FRAME,
                                                                            pyatspi.ROLE_DIALOG):
                found = node
        except Exception:
            continue
    return found


def tab_to(root, predicate, presses=20):
    """Presses Tab until the focus is on a node matching predicate; returns it, or None."""
    for _ in range(presses):
        node = focused_in(root)
        try:
            if node is not None and predicate(node):
                return node
        except Exception:
            pass
        keys("Tab")
    return None


def type_text(text):
    subprocess.run(["xdotool", "type", "--delay", "80", text], check=True)
    time.sleep(0.6)


def screenshot(name):
    folder = os.environ.get("CADENZA_SHOTS")
    if folder:
        subprocess.run(["import", "-window", "root", os.path.join(folder, name + ".png")], check=False)
