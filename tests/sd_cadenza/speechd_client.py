#!/usr/bin/python3
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: GPL-3.0-or-later
# A speech-dispatcher client for the tests, on python3-speechd. Prints one JSON object.
#
#   speechd_client.py SOCKET list
#   speechd_client.py SOCKET speak VOICE RATE PITCH TEXT
#   speechd_client.py SOCKET stop VOICE TEXT        (speaks, cancels after the first BEGIN)
# A TEXT of "-" is read from standard input.
import json
import sys
import threading
import time

import speechd

socket_path, command = sys.argv[1], sys.argv[2]
client = speechd.SSIPClient('cadenza-test', socket_path=socket_path)
client.set_output_module('cadenza')
result = {}
if command == 'list':
    result['voices'] = [list(v) for v in client.list_synthesis_voices()]
elif command in ('speak', 'stop'):
    events = []
    begun = threading.Event()
    finished = threading.Event()
    start = time.monotonic()

    def callback(kind, **_):
        events.append([str(kind), round(time.monotonic() - start, 3)])
        if kind == speechd.CallbackType.BEGIN:
            begun.set()
        if kind in (speechd.CallbackType.END, speechd.CallbackType.CANCEL):
            finished.set()

    client.set_synthesis_voice(sys.argv[3])
    if command == 'speak':
        client.set_rate(int(sys.argv[4]))
        client.set_pitch(int(sys.argv[5]))
    text = sys.stdin.read() if sys.argv[-1] == '-' else sys.argv[-1]
    client.speak(text, callback=callback, event_types=(speechd.CallbackType.BEGIN, speechd.CallbackType.END,
                                                     speechd.CallbackType.CANCEL))
    if command == 'stop':
        result['begun'] = begun.wait(60)
        start = time.monotonic()
        client.cancel()
    result['finished'] = finished.wait(60)
    result['events'] = events
client.close()
print(json.dumps(result))
