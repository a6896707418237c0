// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeRecognitionService.h"
#include "RecognizerFixture.h"
#include "TestEnvironment.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "protocol/InstallerProtocol.h"

#include <QDir>
#include <QFile>
#include <QSignalSpy>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;

namespace {
QVariantMap language(const QString &locale, const QString &tag, const QString &fallback = QString())
{
    QVariantMap entry {{QStringLiteral("LocaleIdentifier"), locale},
        {QStringLiteral("ByteSize"), qint64(1000)}, {QStringLiteral("Version"), QStringLiteral("1.0")}};
    if (!tag.isNull()) {
        entry.insert(QStringLiteral("Tag"), tag);
    }
    if (!fallback.isNull()) {
        entry.insert(QStringLiteral("FallbackLocaleIdentifier"), fallback);
    }
    return entry;
}

QStringList locales(const QList<CZSRLanguageItemPtr> &items)
{
    QStringList out;
    for (const auto &i : items) {
        out.append(i->localeIdentifier());
    }
    return out;
}
} // namespace

class SRLanguageItemTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<Testing::TestEnvironment>();
        m_recognition = std::make_shared<FakeRecognitionService>();
        m_speech = std::make_shared<FakeSpeechSynthesisService>();
        m_notifications = std::make_shared<InProcessNotificationCenter>();
        Services::setRecognition(m_recognition);
        Services::setSpeechSynthesis(m_speech);
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setNotifications(m_notifications);
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        SpeechItemPrivate::setInstallationDictionary(QVariantMap {{QStringLiteral("DownloadableSRLanguages"),
            QVariantMap {{QStringLiteral("b.de"),
                             language(QStringLiteral("de_DE"), QStringLiteral("SRCLANGID:de_DE"))},
                {QStringLiteral("b.enin"),
                    language(
                        QStringLiteral("en_IN"), QStringLiteral("SRCLANGID:en_IN"), QStringLiteral("en-US"))},
                {QStringLiteral("b.fr"),
                    language(QStringLiteral("fr_FR"), QStringLiteral("SRCLANGID:fr_FR"))},
                {QStringLiteral("b.junk"), QStringLiteral("not a dictionary")}}}});
    }
    void cleanup()
    {
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
        m_environment.reset();
    }

    void installedLanguagesAndTheirExtensions()
    {
        m_recognition->setInstalledLanguages(QStringList {
            QStringLiteral("en_US"), QStringLiteral("fr"), QStringLiteral("ar"), QStringLiteral("de-DE")});
        const auto items = CZSRLanguageItem::availableLocalRecognizerLanguageItems();
        QCOMPARE(locales(items),
            QStringList({QStringLiteral("en_US"), QStringLiteral("en_IN"), QStringLiteral("ar"),
                QStringLiteral("de_DE")}));
        // The extension is a fresh item: it carries its fallback, not the download's properties.
        QCOMPARE(items.at(1)->fallbackLocaleIdentifier(), QStringLiteral("en-US"));
        QCOMPARE(items.at(1)->byteSize(), 0u);
        QVERIFY(items.at(1)->bundleIdentifier().isNull());
        QCOMPARE(items.at(1)->tagName(), QStringLiteral("SRCLANGID:en_IN"));
        QCOMPARE(items.at(3)->tagName(), QStringLiteral("SRCLANGID:de_DE"));
        QVERIFY(items.at(2)->tagName().isNull());
        m_recognition->setInstalledLanguages(std::nullopt);
        QVERIFY(CZSRLanguageItem::availableLocalRecognizerLanguageItems().isEmpty());
    }

    void downloadableLanguagesSkipRefusedEntries()
    {
        const auto items = CZSRLanguageItem::downloadableLocalSRLanguageItems();
        QCOMPARE(locales(items),
            QStringList({QStringLiteral("de_DE"), QStringLiteral("en_IN"), QStringLiteral("fr_FR")}));
        QCOMPARE(items.first()->bundleIdentifier(), QStringLiteral("b.de"));
        SpeechItemPrivate::setInstallationDictionary(
            QVariantMap {{QStringLiteral("DownloadableSRLanguages"), 12}});
        QVERIFY(CZSRLanguageItem::downloadableLocalSRLanguageItems().isEmpty());
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
        QVERIFY(CZSRLanguageItem::downloadableLocalSRLanguageItems().isEmpty());
    }

    void entriesWithoutATagDoNotLoopForEver()
    {
        SpeechItemPrivate::setInstallationDictionary(QVariantMap {{QStringLiteral("DownloadableSRLanguages"),
            QVariantMap {{QStringLiteral("b.untagged"), language(QStringLiteral("it_IT"), QString())},
                {QStringLiteral("a.tagged"),
                    language(QStringLiteral("it_IT"), QStringLiteral("SRCLANGID:it_IT"))},
                {QStringLiteral("c.lonely"), language(QStringLiteral("nl_NL"), QString())}}}});
        const auto items = CZSRLanguageItem::downloadableLocalSRLanguageItems();
        QCOMPARE(items.size(), 3);
        QCOMPARE(items.at(1)->bundleIdentifier(), QStringLiteral("b.untagged"));
        QCOMPARE(items.at(1)->tagName(),
            QStringLiteral("SRCLANGID:it_IT")); // borrowed from the first entry of its locale
        QVERIFY(items.at(2)->tagName().isEmpty());
    }

    void itemsFromIdentifiersPreferDownloads()
    {
        const auto items = CZSRLanguageItem::languageItemsFromLocaleIdentifiers(
            {QStringLiteral("fr-FR"), QStringLiteral("ja_JP"), QStringLiteral("fr_fr")});
        QCOMPARE(items.size(), 3);
        QCOMPARE(items.at(0)->bundleIdentifier(), QStringLiteral("b.fr"));
        QCOMPARE(items.at(0), items.at(2)); // the same downloadable item, twice
        QVERIFY(items.at(1)->bundleIdentifier().isNull());
    }

    void bestIndex_data()
    {
        QTest::addColumn<QStringList>("items");
        QTest::addColumn<QString>("wanted");
        QTest::addColumn<qsizetype>("index");
        QTest::newRow("English prefers en_US")
            << QStringList {"en_AU", "fr_FR", "en_US"} << "en_GB" << qsizetype(2);
        QTest::newRow("same language") << QStringList {"en_US", "fr_FR"} << "fr_CA" << qsizetype(1);
        QTest::newRow("en_US stands in") << QStringList {"fr_FR", "en_US"} << "ja_JP" << qsizetype(1);
        QTest::newRow("nothing") << QStringList {"fr_FR"} << "ja_JP" << qsizetype(-1);
        QTest::newRow("exact beats earlier") << QStringList {"de_AT", "de_DE"} << "de_DE" << qsizetype(1);
        QTest::newRow("empty") << QStringList {} << "de_DE" << qsizetype(-1);
        QTest::newRow("English without en_US") << QStringList {"en_AU", "en_GB"} << "en_IE" << qsizetype(0);
    }
    void bestIndex()
    {
        QFETCH(QStringList, items);
        QFETCH(QString, wanted);
        QFETCH(qsizetype, index);
        QList<CZSRLanguageItemPtr> list;
        for (const QString &locale : items) {
            list.append(CZSRLanguageItem::initWithLocaleIdentifier(locale));
        }
        QCOMPARE(CZSRLanguageItem::bestIndexFromLanguageItems(list, wanted), index);
    }

    void preferredDictationLocale()
    {
        QCOMPARE(CZSRLanguageItem::preferredDictationLocaleIdentifierFromAvaiableLocaleIdentifiers(
                     {}, QStringLiteral("xx_YY")),
            QStringLiteral("xx_YY"));
        QCOMPARE(CZSRLanguageItem::preferredDictationLocaleIdentifierFromAvaiableLocaleIdentifiers(
                     {QStringLiteral("en-US"), QStringLiteral("fr-fr")}, QStringLiteral("fr_CA")),
            QStringLiteral("fr_FR")); // the downloadable spelling
        m_speech->setSpeechLanguageLocale(QStringLiteral("en_GB"));
        QCOMPARE(CZSRLanguageItem::preferredDictationLocaleIdentifierFromAvaiableLocaleIdentifiers(
                     {QStringLiteral("de-DE"), QStringLiteral("en-US")}, QString()),
            QStringLiteral("en_US"));
    }

    void visibilityTable()
    {
        bool exists = false;
        QCOMPARE(CZSRLanguageItem::visibiltyValueForLocaleIdentifier(QStringLiteral("en_US"), &exists), 2);
        QVERIFY(!exists);
        QSignalSpy posted(m_notifications.get(), &DistributedNotificationCenter::notificationPosted);
        CZSRLanguageItem::setVisibleSRLanguageItemsTable(
            {{QStringLiteral("en_US"), 0}, {QStringLiteral("de"), QStringLiteral("1")}});
        CZSRLanguageItem::setVisibilityValue(1, QStringLiteral("en-US"));
        auto table = CZSRLanguageItem::visibleSRLanguageItemsTable().value_or(QVariantMap());
        QCOMPARE(table.keys(), QStringList({QStringLiteral("de"), QStringLiteral("en_US")}));
        QCOMPARE(table.value(QStringLiteral("en_US")).toInt(), 1);
        CZSRLanguageItem::setVisibilityValue(0, QStringLiteral("fr-CA"));
        table = CZSRLanguageItem::visibleSRLanguageItemsTable().value_or(QVariantMap());
        QCOMPARE(table.value(QStringLiteral("fr_CA")).toInt(), 0);
        QCOMPARE(CZSRLanguageItem::visibiltyValueForLocaleIdentifier(QStringLiteral("EN_us"), &exists), 1);
        QVERIFY(exists);
        // A key whose value is no number is passed over.
        exists = false;
        QCOMPARE(CZSRLanguageItem::visibiltyValueForLocaleIdentifier(QStringLiteral("de"), &exists), 2);
        QVERIFY(!exists);
        QTRY_COMPARE(posted.size(), 3); // every write announces, changed or not
        QCOMPARE(posted.first().at(0).toString(), Cadenza::SpeechNames::DefaultSRLanguageChangedNotification);
        QCOMPARE(CZSRLanguageItem::initWithLocaleIdentifier(QStringLiteral("fr_CA"))->visibility(), 0);
    }

    void description()
    {
        const auto item = CZSRLanguageItem::initWithLocaleIdentifier(QStringLiteral("de-DE"));
        item->setDownloadStatus(InstallerProtocol::DownloadingStatus);
        item->setDownloadPercentComplete(12.5);
        QCOMPARE(item->description(),
            QStringLiteral(
                "Locale: de_DE, Language: German, Country: Germany, Visible: 2, Download: 3 (12.500000)"));
    }

    void recognizerBundlesOnDisk()
    {
        Services::setRecognition(nullptr); // the bundle service, in this test's private world
        // Listed only with a model their engine accepts: the fixtures carry small plausible model files.
        Testing::RecognizerFixture::writeTinyBundle(Paths::userRecognizersFolder(), QStringLiteral("de_DE"),
            QStringLiteral("de_DE.SpeechRecognition"));
        Testing::RecognizerFixture::writeTinyBundle(Paths::systemRecognizersFolder(), QStringLiteral("en-US"),
            QStringLiteral("en_US.SpeechRecognition"));
        Testing::RecognizerFixture::writeTinyBundle(Paths::systemRecognizersFolder(), QStringLiteral("de_DE"),
            QStringLiteral("de_DE.SpeechRecognition"));
        Testing::RecognizerFixture::writeBareBundle(Paths::systemRecognizersFolder(),
            QStringLiteral("odd.SpeechRecognition"), {{QStringLiteral("LocaleIdentifier"), 5}});
        // A bundle without a model is not a language.
        Testing::RecognizerFixture::writeBareBundle(Paths::systemRecognizersFolder(),
            QStringLiteral("fr_FR.SpeechRecognition"),
            {{QStringLiteral("LocaleIdentifier"), QStringLiteral("fr_FR")}});
        QTest::ignoreMessage(QtWarningMsg,
            QRegularExpression(
                QStringLiteral("Skipping recognizer bundle .*fr_FR.*names no recognition engine")));
        // Locales that name no language are left out, each with one line naming its bundle, even when
        // the bundle carries a model.
        const QStringList nameless {QStringLiteral("_"), QStringLiteral("__"), QStringLiteral("_DE"),
            QStringLiteral("1234"), QStringLiteral("@calendar=x"), QStringLiteral("x"),
            QStringLiteral("\u00e9\u00e9")};
        for (int i = 0; i < nameless.size(); ++i) {
            Testing::RecognizerFixture::writeTinyBundle(Paths::userRecognizersFolder(), nameless.at(i),
                QStringLiteral("nameless%1.SpeechRecognition").arg(i));
        }
        QTest::ignoreMessage(
            QtWarningMsg, QRegularExpression(QStringLiteral("Skipping recognizer bundle .*odd")));
        for (int i = 0; i < nameless.size(); ++i) {
            QTest::ignoreMessage(QtWarningMsg,
                QRegularExpression(
                    QStringLiteral("Skipping recognizer bundle .*nameless%1.*names no language").arg(i)));
        }
        QCOMPARE(Services::recognition().installedLanguages().value_or(QStringList()),
            QStringList({QStringLiteral("de_DE"), QStringLiteral("en-US")}));
        QCOMPARE(locales(CZSRLanguageItem::availableLocalRecognizerLanguageItems()),
            QStringList({QStringLiteral("de_DE"), QStringLiteral("en_US"), QStringLiteral("en_IN")}));
        // Every listed language has a title.
        for (const auto &item : CZSRLanguageItem::availableLocalRecognizerLanguageItems()) {
            QVERIFY(!item->displayTitle().isEmpty());
        }
    }

private:
    std::unique_ptr<Testing::TestEnvironment> m_environment;
    std::shared_ptr<FakeRecognitionService> m_recognition;
    std::shared_ptr<FakeSpeechSynthesisService> m_speech;
    std::shared_ptr<InProcessNotificationCenter> m_notifications;
};

QTEST_GUILESS_MAIN(SRLanguageItemTest)
#include "tst_srlanguageitem.moc"
