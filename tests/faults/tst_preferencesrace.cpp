// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Four processes write 1,000 keys each into one preference domain at the same time, each key
// synchronised on its own: no update may be lost, and the file must parse whenever anyone reads it.
#include "TestEnvironment.h"

#include "core/formats/PropertyList.h"
#include "core/services/FilePreferencesStore.h"

#include <QCoreApplication>
#include <QFile>
#include <QProcess>
#include <QTest>

#include <cstring>

using namespace Cadenza::Platform;

namespace {
const QString Domain = QStringLiteral("com.vendra.race");
constexpr int Writers = 4;
constexpr int KeysPerWriter = 1000;

// The child's side: write the keys one by one, each written through at once.
int writeKeys(const QString &folder, int writer)
{
    FilePreferencesStore store(folder);
    for (int key = 0; key < KeysPerWriter; ++key) {
        store.setValue(QStringLiteral("w%1.k%2").arg(writer).arg(key), key, Domain);
        if (!store.synchronize(Domain)) {
            std::fprintf(stderr, "writer %d: key %d could not be written\n", writer, key);
            return 1;
        }
    }
    return 0;
}
} // namespace

class PreferencesRaceTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void fourWritersLoseNothing()
    {
        Cadenza::Testing::TestEnvironment environment;
        const QString folder = environment.path(QStringLiteral("prefs"));
        const QString file = FilePreferencesStore(folder).filePath(Domain);
        QList<QProcess *> writers;
        for (int writer = 0; writer < Writers; ++writer) {
            auto *process = new QProcess(this);
            process->setProcessChannelMode(QProcess::ForwardedErrorChannel);
            process->start(QCoreApplication::applicationFilePath(),
                {QStringLiteral("--writer"), folder, QString::number(writer)});
            QVERIFY(process->waitForStarted(5000));
            writers.append(process);
        }
        // Read the file while they write: every version that exists must parse.
        int reads = 0;
        auto running = [&] {
            return std::any_of(writers.cbegin(), writers.cend(),
                [](QProcess *p) { return p->state() != QProcess::NotRunning; });
        };
        while (running()) {
            QFile current(file);
            if (current.open(QIODevice::ReadOnly)) {
                QString error;
                const QByteArray bytes = current.readAll();
                QVERIFY2(PropertyList::parse(bytes, &error).has_value(), qPrintable(error));
                ++reads;
            }
            for (QProcess *p : writers) {
                p->waitForFinished(5);
            }
        }
        for (QProcess *p : writers) {
            QCOMPARE(p->exitStatus(), QProcess::NormalExit);
            QCOMPARE(p->exitCode(), 0);
        }
        qInfo("the file was read %d times while it was written", reads);
        QVERIFY(reads > 0);

        FilePreferencesStore reader(folder);
        QVERIFY(reader.synchronize(Domain));
        for (int writer = 0; writer < Writers; ++writer) {
            for (int key = 0; key < KeysPerWriter; ++key) {
                const QVariant value = reader.value(QStringLiteral("w%1.k%2").arg(writer).arg(key), Domain);
                QVERIFY2(value.isValid(), qPrintable(QStringLiteral("lost w%1.k%2").arg(writer).arg(key)));
                QCOMPARE(value.toInt(), key);
            }
        }
    }
};

int main(int argc, char *argv[])
{
    if (argc == 4 && std::strcmp(argv[1], "--writer") == 0) {
        QCoreApplication app(argc, argv);
        return writeKeys(QString::fromLocal8Bit(argv[2]), std::atoi(argv[3]));
    }
    QCoreApplication app(argc, argv);
    PreferencesRaceTest test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_preferencesrace.moc"
