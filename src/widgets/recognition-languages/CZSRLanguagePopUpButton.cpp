#include "CZSRLanguagePopUpButton.h"

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

CZSRLanguagePopUpButton::CZSRLanguagePopUpButton(QWidget *parent)
    : Platform::PopUpButton(parent)
    , m_menu(new VoiceMenuModel(this))
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
        delete m_preHeatTimer;
        m_preHeatTimer = new QTimer(this);
        m_preHeatTimer->setInterval(PreHeatWaitMilliseconds);
        connect(m_preHeatTimer, &QTimer::timeout, this,
            &CZSRLanguagePopUpButton::_clearDownloadStatusFieldAfterPreHeat);
        m_preHeatTimer->start();
    };
    style.idleLine = [this] {
        if (!m_preHeatTimer) {
            return QString();
        }
        return QStringLiteral("%1\n%2").arg(
            texts().format(QStringLiteral("DownloadingStatusStringInstallingItem"),
                {texts().text(QStringLiteral("EnhancedDictation"))}),
            CZSpeechItem::displayStringForTimeRemaining(1.0));
    };
    m_statusLine = new DownloadStatusLine(style, this);
    setObjectName(QStringLiteral("srLanguagePopUpButton"));
    setModel(m_menu);
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
                    _startDelayedPopUpUpdate();
                } else if (name == Protocol::FinishedInstallationNotification) {
                    installationFinished(userInfo.value(Protocol::ObjectIDKey).toString());
                } else if (name == WillStartListeningNotification
                    || name == RecognizerDidPreHeatNotification) {
                    _clearDownloadStatusFieldAfterPreHeat();
                }
            });
    }
    connect(this, &QComboBox::activated, this, [this] { (void)sendAction(); });
}

CZSRLanguagePopUpButton::~CZSRLanguagePopUpButton() = default;

void CZSRLanguagePopUpButton::setDownloadStatusTextField(QLabel *textField)
{
    m_statusLine->setTextField(textField);
}

void CZSRLanguagePopUpButton::setDownloadStatusProgressIndicator(QProgressBar *indicator)
{
    m_statusLine->setProgressIndicator(
        indicator, texts().text(QStringLiteral("LanguageDownloadProgressName")));
}

void CZSRLanguagePopUpButton::buildPopUpButtonAndSelectLocaleIdentifier(
    const QString &requestedLocaleIdentifier,
    const std::optional<QStringList> &networkSupportedLocaleIdentifiers,
    const std::optional<QStringList> &offlineSupportedLocaleIdentifiers)
{
    // A copy: rebuilds pass the remembered locale itself, which is cleared below.
    const QString localeIdentifier = requestedLocaleIdentifier;
    m_network = networkSupportedLocaleIdentifiers;
    m_offline = offlineSupportedLocaleIdentifiers;
    const QList<CZSRLanguageItemPtr> candidates = m_network
        ? CZSRLanguageItem::languageItemsFromLocaleIdentifiers(*m_network)
        : CZSRLanguageItem::availableLocalRecognizerLanguageItems();
    QList<CZSRLanguageItemPtr> visible;
    for (const CZSpeechItemPtr &item :
        CZSpeechItem::visibleObjectsFromItems(asSpeechItems(candidates), localeIdentifier, {})) {
        visible.append(std::static_pointer_cast<CZSRLanguageItem>(item));
    }
    const QString system = CZSpeechItem::systemLocaleIdentifier();
    const QStringList known = m_network ? *m_network : m_offline.value_or(QStringList());
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

    m_rows = CZSRLanguageRow::arrangedRowsFromSRLanguageItems(visible, false, false, false);
    QList<Item> items;
    CZSRLanguageRowPtr matchRequested, matchSystem, matchSystemLanguage, matchEnUS;
    const QString downloadingFormat = texts().text(QStringLiteral("DownloadingItemFormat"));
    for (qsizetype i = 0; i < m_rows.size(); ++i) {
        const CZSRLanguageRowPtr &row = m_rows.at(i);
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
    m_numberOfFixedItemsAtEndOfMenu = 1;
    Item command;
    command.title = texts().text(QStringLiteral("CustomizeMenuItem"));
    if (!m_rows.isEmpty()) {
        items.append(Item::makeSeparator());
        m_numberOfFixedItemsAtEndOfMenu = 2;
        if (m_rows.size() == 1) {
            command.title = texts().text(QStringLiteral("AddLanguageMenuItem"));
        }
    }
    items.append(command);
    m_menu->setItems({}, items);

    m_previouslyChosenLocaleIdentifier.clear();
    if (matchRequested) {
        setCurrentIndex(int(matchRequested->tableIndex()));
        m_previouslyChosenLocaleIdentifier = localeIdentifier;
    } else if (const CZSRLanguageRowPtr fallback
        = matchSystem ? matchSystem : (matchSystemLanguage ? matchSystemLanguage : matchEnUS)) {
        setCurrentIndex(int(fallback->tableIndex()));
    }
    _updateDownloadStatusFields();
}

CZSRLanguageItemPtr CZSRLanguagePopUpButton::selectedLanguageItem() const
{
    const int index = currentIndex();
    return index >= 0 && index < m_rows.size() ? m_rows.at(index)->srLanguageItem() : nullptr;
}

bool CZSRLanguagePopUpButton::sendAction()
{
    const quint32 selected = quint32(currentIndex());
    const quint32 itemCount = quint32(count());
    if (itemCount >= quint32(m_numberOfFixedItemsAtEndOfMenu) && selected == itemCount - 1) {
        CZSpeechInstallationManagerSheets::showSRLanguagesSelectionSheetForWindow(
            window(), m_network, m_previouslyChosenLocaleIdentifier, m_languagesAreDownloadable);
        buildPopUpButtonAndSelectLocaleIdentifier(m_previouslyChosenLocaleIdentifier, m_network, m_offline);
        return false;
    }
    const CZSRLanguageItemPtr item = selectedLanguageItem();
    m_previouslyChosenLocaleIdentifier = item ? item->localeIdentifier() : QString();
    Q_EMIT languageActivated(currentIndex());
    return true;
}

void CZSRLanguagePopUpButton::installationFinished(const QString &objectIdentifier)
{
    const CZSRLanguageItemPtr selected = selectedLanguageItem();
    if (!objectIdentifier.isEmpty() && selected
        && CZSpeechItem::isSameLangaugeFromLocaleIdentifier(selected->localeIdentifier(), objectIdentifier)) {
        m_statusLine->stopRefreshing();
    }
    _startDelayedPopUpUpdate();
}

void CZSRLanguagePopUpButton::_startDelayedPopUpUpdate()
{
    QTimer::singleShot(100, this, &CZSRLanguagePopUpButton::_updateSRLanguageMenu);
    QTimer::singleShot(200, this, &CZSRLanguagePopUpButton::_updateDownloadStatusFields);
}

void CZSRLanguagePopUpButton::_updateSRLanguageMenu()
{
    buildPopUpButtonAndSelectLocaleIdentifier(m_previouslyChosenLocaleIdentifier, m_network, m_offline);
}

QString CZSRLanguagePopUpButton::_statusStringForActiveDownloads()
{
    return m_statusLine->statusForActiveDownloads();
}

void CZSRLanguagePopUpButton::_updateDownloadStatusFields()
{
    m_statusLine->update();
}

bool CZSRLanguagePopUpButton::_hasDownloadStatusUpdateTimer() const
{
    return m_statusLine->isRefreshing();
}

void CZSRLanguagePopUpButton::_clearDownloadStatusFieldAfterPreHeat()
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
