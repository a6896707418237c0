// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// A speech engine plugin as an earlier version of the library built them: its interface version is
// older than the library's, so the library must refuse it without calling it.
#include <QObject>
#include <QtPlugin>

class OldSpeechEnginePlugin : public QObject
{
    Q_OBJECT
    Q_PLUGIN_METADATA(IID "org.cadenza.SpeechEngine/1" FILE "OldSpeechEnginePlugin.json")
};

#include "OldSpeechEnginePlugin.moc"
