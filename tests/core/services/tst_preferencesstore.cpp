// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "MemoryPreferencesStore.h"
#include "core/SpeechNames.h"
#include "core/services/FilePreferencesStore.h"

#include <QDir>
#include <QFile>
#include <QTest>

using namespace Cadenza::Platform;

namespace {
const QString Domain = Cadenza::SpeechNames::VoicePreferencesDomain;
}

/**
 * The contract every preferences store keeps. Two stores over one backing stand for two processes.
 */
class PreferencesStoreContract : public QObject
{
    Q_OBJECT
public:
    using Factory
        = std::function<std::pair<std::shared_ptr<PreferencesStore>, std::shared_ptr<PreferencesStore>>(
            const QString &folder)>;
    PreferencesStoreContract(QString name, Factory factory)
        : m_name(std::move(name))
        , m_factory(std::move(factory))
    {
        setObjectName(m_name);
    }

private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<Cadenza::Testing::TestEnvironment>();
        std::tie(m_first, m_second) = m_factory(m_environment->path(QStringLiteral("prefs")));
    }
    void cleanup()
    {
        m_first.reset();
        m_second.reset();
        m_environment.reset();
    }

    void writesAreSeenAtOnceByTheWriter()
    {
        m_first->setValue(QStringLiteral("key"), 7, Domain);
        QCOMPARE(m_first->value(QStringLiteral("key"), Domain).toInt(), 7);
        QVERIFY(!m_first->value(QStringLiteral("other"), Domain).isValid());
    }

    void synchronizeCarriesWritesToOtherProcesses()
    {
        m_first->setValue(
            QStringLiteral("VisibleIdentifiers"), QVariantMap {{QStringLiteral("a"), 1}}, Domain);
        QVERIFY(m_first->synchronize(Domain));
        QVERIFY(m_second->synchronize(Domain));
        QCOMPARE(m_second->value(QStringLiteral("VisibleIdentifiers"), Domain)
                     .toMap()
                     .value(QStringLiteral("a"))
                     .toInt(),
            1);
    }

    void removalReachesOtherProcesses()
    {
        m_first->setValue(QStringLiteral("gone"), QStringLiteral("x"), Domain);
        QVERIFY(m_first->synchronize(Domain));
        m_first->setValue(QStringLiteral("gone"), QVariant(), Domain);
        QVERIFY(!m_first->value(QStringLiteral("gone"), Domain).isValid());
        QVERIFY(m_first->synchronize(Domain));
        QVERIFY(m_second->synchronize(Domain));
        QVERIFY(!m_second->value(QStringLiteral("gone"), Domain).isValid());
    }

    void concurrentWritersLoseNoKeys()
    {
        m_first->setValue(QStringLiteral("fromFirst"), 1, Domain);
        m_second->setValue(QStringLiteral("fromSecond"), 2, Domain);
        QVERIFY(m_first->synchronize(Domain));
        QVERIFY(m_second->synchronize(Domain));
        QVERIFY(m_first->synchronize(Domain));
        for (const auto &store : {m_first, m_second}) {
            QCOMPARE(store->value(QStringLiteral("fromFirst"), Domain).toInt(), 1);
            QCOMPARE(store->value(QStringLiteral("fromSecond"), Domain).toInt(), 2);
        }
    }

    void domainsAreSeparate()
    {
        m_first->setValue(QStringLiteral("key"), 1, Domain);
        QVERIFY(m_first->synchronize(Domain));
        QVERIFY(!m_first->value(QStringLiteral("key"), QStringLiteral("com.vendra.other")).isValid());
    }

    void refusesDomainNamesThatAreNotNames_data()
    {
        QTest::addColumn<QString>("domain");
        QTest::newRow("traversal") << QStringLiteral("../../etc/passwd");
        QTest::newRow("slash") << QStringLiteral("a/b");
        QTest::newRow("hidden") << QStringLiteral(".hidden");
        QTest::newRow("empty") << QString();
        QTest::newRow("dots") << QStringLiteral("a..b");
    }
    void refusesDomainNamesThatAreNotNames()
    {
        QFETCH(QString, domain);
        m_first->setValue(QStringLiteral("key"), 1, domain);
        QVERIFY(!m_first->value(QStringLiteral("key"), domain).isValid());
        QVERIFY(!m_first->synchronize(domain));
    }

private:
    QString m_name;
    Factory m_factory;
    std::unique_ptr<Cadenza::Testing::TestEnvironment> m_environment;
    std::shared_ptr<PreferencesStore> m_first;
    std::shared_ptr<PreferencesStore> m_second;
};

/// What only the file store can show: the files themselves.
class FilePreferencesStoreTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void corruptFileIsKeptAsideAndReadsAsEmpty()
    {
        Cadenza::Testing::TestEnvironment environment;
        FilePreferencesStore store(environment.path(QStringLiteral("prefs")));
        QDir().mkpath(environment.path(QStringLiteral("prefs")));
        QFile file(store.filePath(Domain));
        QVERIFY(file.open(QIODevice::WriteOnly));
        file.write("<plist><dict><key>VisibleIdentifiers</key>garbage");
        file.close();

        QTest::ignoreMessage(
            QtWarningMsg, QRegularExpression(QStringLiteral("damaged.*kept aside as .*corrupt-")));
        QVERIFY(!store.value(QStringLiteral("VisibleIdentifiers"), Domain).isValid());
        const QStringList aside = QDir(environment.path(QStringLiteral("prefs")))
                                      .entryList({QStringLiteral("*.corrupt-*")}, QDir::Files);
        QCOMPARE(aside.size(), 1);
        QFile kept(environment.path(QStringLiteral("prefs/")) + aside.first());
        QVERIFY(kept.open(QIODevice::ReadOnly));
        QVERIFY(kept.readAll().contains("garbage"));

        // Writing afterwards makes a fresh, valid file and leaves the damaged one alone.
        store.setValue(QStringLiteral("key"), 1, Domain);
        QVERIFY(store.synchronize(Domain));
        FilePreferencesStore other(environment.path(QStringLiteral("prefs")));
        QCOMPARE(other.value(QStringLiteral("key"), Domain).toInt(), 1);
        QVERIFY(QFile::exists(kept.fileName()));
    }

    void writeLeavesNoTemporaryFiles()
    {
        Cadenza::Testing::TestEnvironment environment;
        FilePreferencesStore store(environment.path(QStringLiteral("prefs")));
        for (int i = 0; i < 20; ++i) {
            store.setValue(QStringLiteral("k%1").arg(i), i, Domain);
            QVERIFY(store.synchronize(Domain));
        }
        // The domain's file and its lock file (which stays, empty, for the next writer); nothing else.
        const QStringList files = QDir(environment.path(QStringLiteral("prefs")))
                                      .entryList(QDir::Files | QDir::Hidden, QDir::Name);
        QCOMPARE(files,
            QStringList({QStringLiteral(".") + Domain + QStringLiteral(".plist.lock"),
                Domain + QStringLiteral(".plist")}));
    }

    void externalChangeIsSeenWithoutSynchronize()
    {
        Cadenza::Testing::TestEnvironment environment;
        FilePreferencesStore reader(environment.path(QStringLiteral("prefs")));
        QVERIFY(!reader.value(QStringLiteral("key"), Domain).isValid());
        FilePreferencesStore writer(environment.path(QStringLiteral("prefs")));
        writer.setValue(QStringLiteral("key"), QStringLiteral("new"), Domain);
        QVERIFY(writer.synchronize(Domain));
        QCOMPARE(reader.value(QStringLiteral("key"), Domain).toString(), QStringLiteral("new"));
    }

    void unwritableFolderFailsTheSynchronize()
    {
        Cadenza::Testing::TestEnvironment environment;
        QFile blocker(environment.path(QStringLiteral("blocker")));
        QVERIFY(blocker.open(QIODevice::WriteOnly));
        blocker.close();
        // A file where the folder should be: nothing can be written below it.
        FilePreferencesStore store(environment.path(QStringLiteral("blocker/prefs")));
        store.setValue(QStringLiteral("key"), 1, Domain);
        QTest::ignoreMessage(
            QtWarningMsg, QRegularExpression(QStringLiteral("Cannot create the preferences folder")));
        QVERIFY(!store.synchronize(Domain));
        QCOMPARE(store.value(QStringLiteral("key"), Domain).toInt(), 1); // nothing lost in this process
    }
};

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    int status = 0;
    PreferencesStoreContract memory(QStringLiteral("memory"), [](const QString &) {
        auto backing = std::make_shared<MemoryPreferencesStore::Backing>();
        return std::pair<std::shared_ptr<PreferencesStore>, std::shared_ptr<PreferencesStore>>(
            std::make_shared<MemoryPreferencesStore>(backing),
            std::make_shared<MemoryPreferencesStore>(backing));
    });
    PreferencesStoreContract file(QStringLiteral("file"), [](const QString &folder) {
        return std::pair<std::shared_ptr<PreferencesStore>, std::shared_ptr<PreferencesStore>>(
            std::make_shared<FilePreferencesStore>(folder), std::make_shared<FilePreferencesStore>(folder));
    });
    FilePreferencesStoreTest fileOnly;
    status |= QTest::qExec(&memory, argc, argv);
    status |= QTest::qExec(&file, argc, argv);
    status |= QTest::qExec(&fileOnly, argc, argv);
    return status;
}

#include "tst_preferencesstore.moc"
