#!/usr/bin/python3
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
"""Serves a bundle repository on 127.0.0.1, slowly, so a download stays in progress long enough to be
read over the accessibility bus. Prints the port on stdout once listening.

Usage: slow_repository.py FOLDER SECONDS_PER_BUNDLE
"""
import http.server
import os
import sys
import time

folder = os.path.realpath(sys.argv[1])
seconds = float(sys.argv[2])


class Handler(http.server.BaseHTTPRequestHandler):
    def do_GET(self):
        path = os.path.realpath(os.path.join(folder, self.path.split("?")[0].lstrip("/")))
        if not path.startswith(folder + os.sep) or not os.path.isfile(path):
            self.send_error(404)
            return
        with open(path, "rb") as f:
            body = f.read()
        self.send_response(200)
        self.send_header("Content-Type", "application/octet-stream")
        self.send_header("Content-Length", str(len(body)))
        self.end_headers()
        steps = 20
        chunk = max(1, len(body) // steps)
        for start in range(0, len(body), chunk):
            self.wfile.write(body[start:start + chunk])
            self.wfile.flush()
            time.sleep(seconds / steps)

    def log_message(self, *args):
        pass


server = http.server.ThreadingHTTPServer(("127.0.0.1", 0), Handler)
print(server.server_address[1], flush=True)
server.serve_forever()
