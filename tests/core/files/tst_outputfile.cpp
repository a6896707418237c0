// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "core/files/OutputFile.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QProcess>
#include <QTest>

#include <sys/stat.h>

using Cadenza::Platform::OutputFile;
using Cadenza::Testing::TestEnvironment;

class OutputFileTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init() { m_environment = std::make_unique<TestEnvironment>(); }
    void cleanup() { m_environment.reset(); }

    void regularFilesAreReplacedWholeWithTheirPermissions()
    {
        const QString path = m_environment->path(QStringLiteral("file.txt"));
        QCOMPARE(OutputFile::kindOf(path), OutputFile::Kind::Replaceable); // nothing there yet
        QVERIFY(OutputFile::write(path, "first"));
        QVERIFY(QFile::setPermissions(path, QFileDevice::ReadOwner | QFileDevice::WriteOwner));
        QVERIFY(OutputFile::write(path, "second"));
        QFile file(path);
        QVERIFY(file.open(QIODevice::ReadOnly));
        QCOMPARE(file.readAll(), QByteArray("second"));
        QCOMPARE(QFileInfo(path).permissions() & QFileDevice::ReadGroup, QFileDevice::Permissions());
        QCOMPARE(QDir(m_environment->root()).entryList(QDir::Files | QDir::Hidden).size(), 1);
    }

    void devicesAndFifosAreWrittenInPlace()
    {
        QCOMPARE(OutputFile::kindOf(QStringLiteral("/dev/null")), OutputFile::Kind::Stream);
        QVERIFY(OutputFile::write(QStringLiteral("/dev/null"), "nothing"));
        struct stat st
        {
        };
        QCOMPARE(::stat("/dev/null", &st), 0);
        QVERIFY(S_ISCHR(st.st_mode));

        const QString fifo = m_environment->path(QStringLiteral("pipe"));
        QCOMPARE(::mkfifo(QFile::encodeName(fifo).constData(), 0600), 0);
        QString error;
        QVERIFY(!OutputFile::write(fifo, "nobody listens", &error)); // no reader: no wait without end
        QVERIFY2(error.contains(QStringLiteral("nobody reads")), qPrintable(error));
        QProcess reader;
        reader.start(QStringLiteral("cat"), {fifo});
        QVERIFY(reader.waitForStarted());
        // Once the reader has opened its end, the bytes go through.
        bool written = false;
        for (int attempt = 0; attempt < 100 && !written; ++attempt) {
            written = OutputFile::write(fifo, "through the pipe");
            if (!written) {
                QTest::qWait(20);
            }
        }
        QVERIFY(written);
        QVERIFY(reader.waitForFinished(5000));
        QCOMPARE(reader.readAllStandardOutput(), QByteArray("through the pipe"));
        QCOMPARE(::stat(QFile::encodeName(fifo).constData(), &st), 0);
        QVERIFY(S_ISFIFO(st.st_mode));
    }

    void foldersAreRefusedByName()
    {
        const QString folder = m_environment->path(QStringLiteral("folder"));
        QVERIFY(QDir().mkpath(folder + QStringLiteral("/kept")));
        QString error;
        QCOMPARE(OutputFile::kindOf(folder), OutputFile::Kind::Refused);
        QVERIFY(!OutputFile::write(folder, "x", &error));
        QVERIFY2(error.contains(folder + QStringLiteral(" is a folder")), qPrintable(error));
        QVERIFY(QFileInfo(folder + QStringLiteral("/kept")).isDir());
        // Through a symbolic link, too.
        const QString link = m_environment->path(QStringLiteral("link"));
        QVERIFY(QFile::link(folder, link));
        QVERIFY(!OutputFile::write(link, "x"));
        QVERIFY(QFileInfo(link).isSymLink());
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
};

QTEST_GUILESS_MAIN(OutputFileTest)
#include "tst_outputfile.moc"
