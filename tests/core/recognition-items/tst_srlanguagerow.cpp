// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeRecognitionService.h"
#include "TestEnvironment.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "MemoryPreferencesStore.h"
#include "core/recognition-items/CZSRLanguageRow.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "protocol/InstallerProtocol.h"

#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;

namespace {
QStringList titles(const QList<CZSRLanguageRowPtr> &rows)
{
    QStringList out;
    for (const auto &row : rows) {
        out.append(row->isGroupRow() ? QStringLiteral("# ") + row->title() : row->title());
    }
    return out;
}
} // namespace

class SRLanguageRowTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<Testing::TestEnvironment>();
        m_speech = std::make_shared<FakeSpeechSynthesisService>();
        Services::setSpeechSynthesis(m_speech);
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setRecognition(std::make_shared<FakeRecognitionService>());
        SpeechItemPrivate::setInstallationDictionary(QVariantMap());
        SpeechItemPrivate::resetConversionLocale();
        for (const char *locale : {"fr_FR", "en_US", "en_GB", "de_DE"}) {
            m_items.append(CZSRLanguageItem::initWithLocaleIdentifier(QString::fromLatin1(locale)));
        }
    }
    void cleanup()
    {
        m_items.clear();
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
        m_environment.reset();
    }

    void withoutGroupingThereAreNoHeadings()
    {
        QCOMPARE(titles(CZSRLanguageRow::arrangedRowsFromSRLanguageItems(m_items, false, false, true)),
            QStringList({"United Kingdom", "United States", "France", "Germany"}));
        QVERIFY(CZSRLanguageRow::arrangedRowsFromSRLanguageItems({}, true, true, true).isEmpty());
    }

    void theUsersLanguageComesFirst()
    {
        m_speech->setSpeechLanguageLocale(QStringLiteral("en_GB"));
        QCOMPARE(titles(CZSRLanguageRow::arrangedRowsFromSRLanguageItems(m_items, true, true, true)),
            QStringList({"# English", "English", "English", "# French", "French", "# German", "German"}));
        // Titles follow the items' own country flag; with it on they name the country.
        for (const auto &item : m_items) {
            item->setShowCountryInDisplayTitle(true);
        }
        QCOMPARE(titles(CZSRLanguageRow::arrangedRowsFromSRLanguageItems(m_items, true, true, true)).first(3),
            QStringList({"# English", "English (United Kingdom)", "English (United States)"}));
        // The user's language is lifted above the others' name order.
        m_speech->setSpeechLanguageLocale(QStringLiteral("fr_FR"));
        QCOMPARE(titles(CZSRLanguageRow::arrangedRowsFromSRLanguageItems(m_items, true, true, true)).first(),
            QStringLiteral("# French"));
        // A locale no item has: nothing is lifted.
        m_speech->setSpeechLanguageLocale(QStringLiteral("ja_JP"));
        QCOMPARE(titles(CZSRLanguageRow::arrangedRowsFromSRLanguageItems(m_items, true, true, true)).first(),
            QStringLiteral("# English"));
    }

    void ticks()
    {
        const auto item = m_items.first();
        item->setVisibility(0);
        item->setDownloadStatus(InstallerProtocol::WaitingStatus);
        auto row = CZSRLanguageRow::initWithTitle(QStringLiteral("x"), item);
        row->setSelectedUsingLanguageCodeOnlyToSelectItems(false);
        QVERIFY(row->isSelected());
        QCOMPARE(item->visibility(), 1);
        item->setDownloadStatus(InstallerProtocol::InstalledStatus);
        for (const auto &[visibility, expected] :
            {std::pair {2, false}, std::pair {1, true}, std::pair {0, false}}) {
            item->setVisibility(visibility);
            auto fresh = CZSRLanguageRow::initWithTitle(QStringLiteral("x"), item);
            fresh->setSelectedUsingLanguageCodeOnlyToSelectItems(true);
            QCOMPARE(fresh->isSelected(), expected);
        }
        row->setSelected(false);
        QCOMPARE(item->visibility(), 0);
        auto header = CZSRLanguageRow::initWithTitle(QStringLiteral("French"), nullptr);
        header->setGroupRow(true);
        header->setSelectedUsingLanguageCodeOnlyToSelectItems(true);
        QVERIFY(!header->isSelected());
        QCOMPARE(header->description(), QStringLiteral("French"));
    }

private:
    std::unique_ptr<Testing::TestEnvironment> m_environment;
    std::shared_ptr<FakeSpeechSynthesisService> m_speech;
    QList<CZSRLanguageItemPtr> m_items;
};

QTEST_GUILESS_MAIN(SRLanguageRowTest)
#include "tst_srlanguagerow.moc"
