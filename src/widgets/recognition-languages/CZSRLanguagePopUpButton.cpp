// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSRLanguagePopUpButton.h"

#include "CZSRLanguagePopUpButton_p.h"
#include "core/SpeechNames.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/helpers/DownloadStatusLine.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"
#include "widgets/voice-popup/VoiceMenuModel.h"

#include <QLabel>
#include <QListView>
#include <QProgressBar>
#include <QTimer>

namespace Cadenza {

namespace {
namespace Protocol = InstallerProtocol;
using Item = VoiceMenuModel::Item;

const QString EnUS = QStringLiteral("en_US");
const QString WillStartListeningNotification = QStringLiteral("DictationIMNotificationWillStartListening");
const QString RecognizerDidPreHeatNotification
    = QStringLiteral("DictationIMNotificationRecognizerDidPreHeat");
constexpr int PreHeatWaitMilliseconds = 30000;

// Only the first pop-up of a process follows the notifications.
bool &observerRegistered()
{
    static bool registered = false;
    return registered;
}

const Platform::LocalizationTable &texts()
{
    return Platform::LocalizationTable::shared();
}

QList<CZSpeechItemPtr> asSpeechItems(const QList<CZSRLanguageItemPtr> &items)
{
    return {items.cbegin(), items.cend()};
}

} // namespace

CZSRLanguagePopUpButtonPrivate::CZSRLanguagePopUpButtonPrivate(CZSRLanguagePopUpButton *q)
    : q(q)
    , m_menu(new VoiceMenuModel(q))
{ }

CZSRLanguagePopUpButtonPrivate::~CZSRLanguagePopUpButtonPrivate() = default;

CZSRLanguagePopUpButton::CZSRLanguagePopUpButton(QWidget *parent)
    : Platform::PopUpButton(parent)
    , d(std::make_unique<CZSRLanguagePopUpButtonPrivate>(this))
{
    DownloadStatusLine::Style style;
    style.tagPrefix = Protocol::RecognitionTagPrefix;
    style.join = [](const QString &itemLine, const QString &timeLeft) {
        return QStringLiteral("%1\n%2").arg(itemLine, timeLeft);
    };
    // With a single language on offer the download is the enhanced dictation itself.
    style.itemName = [this](const QVariantList &records, const QVariantMap &first) {
        return records.size() == 1 && count() <= 3 ? texts().text(QStringLiteral("EnhancedDictation"))
                                                   : first.value(Protocol::ItemNameKey).toString();
    };
    // Installed is not usable yet: keep the line until the engine has loaded the language.
    style.installing = [this] {
        delete d->m_preHeatTimer;
        d->m_preHeatTimer = new QTimer(this);
        d->m_preHeatTimer->setInterval(PreHeatWaitMilliseconds);
        connect(d->m_preHeatTimer, &QTimer::timeout, this,
            [this] { d->_clearDownloadStatusFieldAfterPreHeat(); });
        d->m_preHeatTimer->start();
    };
    style.idleLine = [this] {
        if (!d->m_preHeatTimer) {
            return QString();
        }
        return QStringLiteral("%1\n%2").arg(
            texts().format(QStringLiteral("DownloadingStatusStringInstallingItem"),
                {texts().text(QStringLiteral("EnhancedDictation"))}),
            CZSpeechItem::displayStringForTimeRemaining(1.0));
    };
    d->m_statusLine = new DownloadStatusLine(style, this);
    setObjectName(QStringLiteral("srLanguagePopUpButton"));
    setModel(d->m_menu);
    setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
    setMinimumContentsLength(24);
    setEnabled(false); // the client enables it once it has built the menu
    if (!observerRegistered()) {
        observerRegistered() = true;
        connect(&Platform::Services::notifications(),
            &Platform::DistributedNotificationCenter::notificationPosted, this,
            [this](const QString &name, const QString &, const QVariantMap &userInfo) {
                if (name == SpeechNames::DefaultSRLanguageChangedNotification
                    || name == Protocol::StartedInstallationNotification
                    || name == SpeechNames::LanguagePreferencesChangedNotification
                    || name == SpeechNames::NumberPreferencesChangedNotification) {
                    d->_startDelayedPopUpUpdate();
                } else if (name == Protocol::FinishedInstallationNotification) {
                    installationFinished(userInfo.value(Protocol::ObjectIDKey).toString());
                } else if (name == WillStartListeningNotification
                    || name == RecognizerDidPreHeatNotification) {
                    d->_clearDownloadStatusFieldAfterPreHeat();
                }
            });
    }
    connect(this, &QComboBox::activated, this, [this] { (void)sendAction(); });
}

CZSRLanguagePopUpButton::~CZSRLanguagePopUpButton() = default;

QString CZSRLanguagePopUpButton::previouslyChosenLocaleIdentifier() const
{
    return d->m_previouslyChosenLocaleIdentifier;
}

void CZSRLanguagePopUpButton::setPreviouslyChosenLocaleIdentifier(const QString &locale)
{
    d->m_previouslyChosenLocaleIdentifier = locale;
}

std::optional<QStringList> CZSRLanguagePopUpButton::networkBasedLocaleIdentifiers() const
{
    return d->m_network;
}

void CZSRLanguagePopUpButton::setNetworkBasedLocaleIdentifiers(const std::optional<QStringList> &locales)
{
    d->m_network = locales;
}

std::optional<QStringList> CZSRLanguagePopUpButton::offlineBasedLocaleIdentifiers() const
{
    return d->m_offline;
}

void CZSRLanguagePopUpButton::setOfflineBasedLocaleIdentifiers(const std::optional<QStringList> &locales)
{
    d->m_offline = locales;
}

bool CZSRLanguagePopUpButton::languagesAreDownloadable() const
{
    return d->m_languagesAreDownloadable;
}

void CZSRLanguagePopUpButton::setLanguagesAreDownloadable(bool downloadable)
{
    d->m_languagesAreDownloadable = downloadable;
}

void CZSRLanguagePopUpButton::setDownloadStatusTextField(QLabel *textField)
{
    d->m_statusLine->setTextField(textField);
}

void CZSRLanguagePopUpButton::setDownloadStatusProgressIndicator(QProgressBar *indicator)
{
    d->m_statusLine->setProgressIndicator(
        indicator, texts().text(QStringLiteral("LanguageDownloadProgressName")));
}

void CZSRLanguagePopUpButton::buildPopUpButtonAndSelectLocaleIdentifier(
    const QString &requestedLocaleIdentifier,
    const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
    const std::optional<QStringList> &offlineSupportedLocaleIdentifiers)
{
    // A copy: rebuilds pass the remembered locale itself, which is cleared below.
    const QString localeIdentifier = requestedLocaleIdentifier;
    d->m_network = networkSupportedLocaleIdentifiers;
    d->m_offline = offlineSupportedLocaleIdentifiers;
    const QList<CZSRLanguageItemPtr> candidates = d->m_network
        ? CZSRLanguageItem::languageItemsFromLocaleIdentifiers(*d->m_network)
        : CZSRLanguageItem::availableLocalRecognizerLanguageItems();
    QList<CZSRLanguageItemPtr> visible;
    for (const CZSpeechItemPtr &item :
        CZSpeechItem::visibleObjectsFromItems(asSpeechItems(candidates), localeIdentifier, {})) {
        visible.append(std::static_pointer_cast<CZSRLanguageItem>(item));
    }
    const QString system = CZSpeechItem::systemLocaleIdentifier();
    const QStringList known = d->m_network ? *d->m_network : d->m_offline.value_or(QStringList());
    if (visible.isEmpty() && CZSpeechItem::isLocaleIdentifier(system, known)) {
        visible = CZSRLanguageItem::languageItemsFromLocaleIdentifiers({system});
    }
    if (visible.isEmpty()) {
        for (const QString &entry : known) {
            if (CZSpeechItem::isSameLangaugeFromLocaleIdentifier(entry, system)) {
                visible = CZSRLanguageItem::languageItemsFromLocaleIdentifiers({entry});
                break;
            }
        }
    }
    if (visible.isEmpty()) {
        visible = CZSRLanguageItem::languageItemsFromLocaleIdentifiers({EnUS}); // never without a language
    }

    d->m_rows = CZSRLanguageRow::arrangedRowsFromSRLanguageItems(visible, false, false, false);
    QList<Item> items;
    CZSRLanguageRowPtr matchRequested, matchSystem, matchSystemLanguage, matchEnUS;
    const QString downloadingFormat = texts().text(QStringLiteral("DownloadingItemFormat"));
    for (qsizetype i = 0; i < d->m_rows.size(); ++i) {
        const CZSRLanguageRowPtr &row = d->m_rows.at(i);
        const CZSRLanguageItemPtr item = row->srLanguageItem();
        item->setShowCountryInDisplayTitle(true);
        Item entry;
        entry.title = item->displayTitle();
        if (item->downloadStatus() == Protocol::DownloadingStatus) {
            entry.title = Platform::LocalizationTable::fill(downloadingFormat, {entry.title});
            entry.enabled = false;
        }
        items.append(entry);
        row->setTableIndex(i);
        const QString locale = item->localeIdentifier();
        if (!matchRequested && !localeIdentifier.isNull()
            && CZSpeechItem::isSameLocaleIdentifier(locale, localeIdentifier)) {
            matchRequested = row;
        } else if (!matchSystem && item->doesMatchSystemLocale()) {
            matchSystem = row;
        } else if (!matchSystemLanguage && item->isAppropriateForSystemLangauge()) {
            matchSystemLanguage = row;
        } else if (!matchEnUS && CZSpeechItem::isSameLocaleIdentifier(locale, EnUS)) {
            matchEnUS = row;
        }
    }
    d->m_numberOfFixedItemsAtEndOfMenu = 1;
    Item command;
    command.title = texts().text(QStringLiteral("CustomizeMenuItem"));
    if (!d->m_rows.isEmpty()) {
        items.append(Item::makeSeparator());
        d->m_numberOfFixedItemsAtEndOfMenu = 2;
        if (d->m_rows.size() == 1) {
            command.title = texts().text(QStringLiteral("AddLanguageMenuItem"));
        }
    }
    items.append(command);
    d->m_menu->setItems({}, items);

    d->m_previouslyChosenLocaleIdentifier.clear();
    if (matchRequested) {
        setCurrentIndex(int(matchRequested->tableIndex()));
        d->m_previouslyChosenLocaleIdentifier = localeIdentifier;
    } else if (const CZSRLanguageRowPtr fallback
        = matchSystem ? matchSystem : (matchSystemLanguage ? matchSystemLanguage : matchEnUS)) {
        setCurrentIndex(int(fallback->tableIndex()));
    }
    d->_updateDownloadStatusFields();
}

CZSRLanguageItemPtr CZSRLanguagePopUpButton::selectedLanguageItem() const
{
    const int index = currentIndex();
    return index >= 0 && index < d->m_rows.size() ? d->m_rows.at(index)->srLanguageItem() : nullptr;
}

bool CZSRLanguagePopUpButton::sendAction()
{
    const quint32 selected = quint32(currentIndex());
    const quint32 itemCount = quint32(count());
    if (itemCount >= quint32(d->m_numberOfFixedItemsAtEndOfMenu) && selected == itemCount - 1) {
        CZSpeechInstallationManagerSheets::showSRLanguagesSelectionSheetForWindow(
            window(), d->m_network, d->m_previouslyChosenLocaleIdentifier, d->m_languagesAreDownloadable);
        buildPopUpButtonAndSelectLocaleIdentifier(
            d->m_previouslyChosenLocaleIdentifier, d->m_network, d->m_offline);
        return false;
    }
    const CZSRLanguageItemPtr item = selectedLanguageItem();
    d->m_previouslyChosenLocaleIdentifier = item ? item->localeIdentifier() : QString();
    Q_EMIT languageActivated(currentIndex());
    return true;
}

void CZSRLanguagePopUpButton::installationFinished(const QString &objectIdentifier)
{
    const CZSRLanguageItemPtr selected = selectedLanguageItem();
    if (!objectIdentifier.isEmpty() && selected
        && CZSpeechItem::isSameLangaugeFromLocaleIdentifier(selected->localeIdentifier(), objectIdentifier)) {
        d->m_statusLine->stopRefreshing();
    }
    d->_startDelayedPopUpUpdate();
}

void CZSRLanguagePopUpButtonPrivate::_startDelayedPopUpUpdate()
{
    QTimer::singleShot(100, q, [this] { _updateSRLanguageMenu(); });
    QTimer::singleShot(200, q, [this] { _updateDownloadStatusFields(); });
}

void CZSRLanguagePopUpButtonPrivate::_updateSRLanguageMenu()
{
    q->buildPopUpButtonAndSelectLocaleIdentifier(m_previouslyChosenLocaleIdentifier, m_network, m_offline);
}

QString CZSRLanguagePopUpButtonPrivate::_statusStringForActiveDownloads()
{
    return m_statusLine->statusForActiveDownloads();
}

void CZSRLanguagePopUpButtonPrivate::_updateDownloadStatusFields()
{
    m_statusLine->update();
}

bool CZSRLanguagePopUpButtonPrivate::_hasDownloadStatusUpdateTimer() const
{
    return m_statusLine->isRefreshing();
}

void CZSRLanguagePopUpButtonPrivate::_clearDownloadStatusFieldAfterPreHeat()
{
    if (!m_preHeatTimer) {
        return;
    }
    m_preHeatTimer->stop();
    m_preHeatTimer->deleteLater();
    m_preHeatTimer = nullptr;
    _updateDownloadStatusFields();
}

} // namespace Cadenza
