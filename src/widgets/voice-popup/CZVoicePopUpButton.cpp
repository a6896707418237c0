// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZVoicePopUpButton.h"

#include "CZVoicePopUpButton_p.h"
#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/formats/VoiceDescription.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/locale/LocalizationTable.h"
#include "core/rows/VoiceTableRow.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/speech-items/CZSpeechItem.h"
#include "core/voices/DownloadableVoice.h"
#include "core/voices/SpeechSynthesizer.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/helpers/Alert.h"
#include "widgets/helpers/DownloadStatusLine.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"

#include <QDir>
#include <QFileSystemWatcher>
#include <QGuiApplication>
#include <QListView>
#include <QRecursiveMutex>
#include <QTimer>

#include <mutex>

namespace Cadenza {

namespace {
using Item = VoiceMenuModel::Item;
namespace Protocol = InstallerProtocol;

const QString LecternUtilityIdentifier = QStringLiteral("com.vendra.LecternUtility");

/// What every voice pop-up of the process shares.
struct SharedState
{
    QList<QPointer<CZVoicePopUpButton>> popUps;
    QRecursiveMutex menuLock; // taken before rowsLock when both are needed
    QList<Item> menu;
    QRecursiveMutex rowsLock;
    QList<VoiceTableRowPtr> rows;
    QStringList excluded;
    QHash<QString, quint64> required;
    QString fallback;
    QPointer<QFileSystemWatcher> watcher; // owned by the application: gone before static destruction
    QPointer<CZVoicePopUpButton> firstPopUp;
    QMetaObject::Connection preferenceNotifications;
    bool registered = false;
    bool updatingAll = false;
};

SharedState &shared()
{
    static SharedState state;
    return state;
}

const Platform::LocalizationTable &texts()
{
    return Platform::LocalizationTable::shared();
}

// Registers the class for the notifications that change every menu and watches the voice folders.
void registerProcessWideObservers()
{
    SharedState &state = shared();
    state.preferenceNotifications = QObject::connect(&Platform::Services::notifications(),
        &Platform::DistributedNotificationCenter::notificationPosted, qApp, [](const QString &name) {
            if (name == SpeechNames::DefaultVoiceChangedNotification
                || name == SpeechNames::LanguagePreferencesChangedNotification
                || name == SpeechNames::NumberPreferencesChangedNotification) {
                CZVoicePopUpButtonPrivate::_startDelayedForceAllVoicePopupsToUpdate();
            }
        });
    state.watcher = new QFileSystemWatcher(qApp);
    for (const QString &folder : {Platform::Paths::systemVoicesFolder(), Platform::Paths::localVoicesFolder(),
             Platform::Paths::userVoicesFolder()}) {
        if (QDir(folder).exists()) {
            (void)state.watcher->addPath(folder);
        }
    }
    QObject::connect(state.watcher.data(), &QFileSystemWatcher::directoryChanged, qApp, [] {
        // Installers write a bundle in several steps; look once they are likely done.
        QTimer::singleShot(2000, qApp, [] {
            if (CZVoicePopUpButton *first = shared().firstPopUp) {
                CZVoicePopUpButtonPrivate::get(first)->_handleSpeechDataInstallationNotification();
            }
        });
    });
}
} // namespace

CZVoicePopUpButtonPrivate::CZVoicePopUpButtonPrivate(CZVoicePopUpButton *q)
    : q(q)
    , m_menu(new VoiceMenuModel(q))
{ }

CZVoicePopUpButtonPrivate::~CZVoicePopUpButtonPrivate() = default;

CZVoicePopUpButton::CZVoicePopUpButton(QWidget *parent)
    : Platform::PopUpButton(parent)
    , d(std::make_unique<CZVoicePopUpButtonPrivate>(this))
{
    d->m_statusLine = new DownloadStatusLine(
        {Protocol::VoiceTagPrefix,
            [](const QString &itemLine, const QString &timeLeft) {
                return Platform::LocalizationTable::fill(
                    texts().text(QStringLiteral("DownloadingStatusStringsWithEmDash")), {itemLine, timeLeft});
            },
            {}, {}, {}},
        this);
    setObjectName(QStringLiteral("voicePopUpButton"));
    setModel(d->m_menu);
    // Measuring 10,000 titles for the width would cost more than building the menu.
    setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
    setMinimumContentsLength(24);
    if (auto *list = qobject_cast<QListView *>(view())) {
        list->setUniformItemSizes(true);
    }
    setEnabled(false); // the first build enables it
    d->m_showIndividualVoiceQualities = QGuiApplication::desktopFileName() == LecternUtilityIdentifier;
    d->m_systemVoiceLocalizedText = texts().text(QStringLiteral("Use System Voice"));

    SharedState &state = shared();
    if (!state.registered) {
        state.registered = true;
        state.firstPopUp = this;
        registerProcessWideObservers();
    }
    connect(&Platform::Services::notifications(),
        &Platform::DistributedNotificationCenter::notificationPosted, this, [this](const QString &name) {
            if (name == Protocol::StartedInstallationNotification
                || name == Protocol::FinishedInstallationNotification) {
                d->_handleSpeechDataInstallationNotification();
            }
        });
    connect(this, &QComboBox::activated, this, [this] { (void)sendAction(); });
    state.popUps.append(this);
}

CZVoicePopUpButton::~CZVoicePopUpButton()
{
    // The required count held for this pop-up's voice is deliberately not returned.
    shared().popUps.removeAll(this);
}

bool CZVoicePopUpButton::allowSystemVoiceChoice() const
{
    return d->m_allowSystemVoiceChoice;
}

void CZVoicePopUpButton::setAllowSystemVoiceChoice(bool allow)
{
    d->m_allowSystemVoiceChoice = allow;
}

bool CZVoicePopUpButton::showIndividualVoiceQualities() const
{
    return d->m_showIndividualVoiceQualities;
}

void CZVoicePopUpButton::setShowIndividualVoiceQualities(bool show)
{
    d->m_showIndividualVoiceQualities = show;
}

void CZVoicePopUpButton::addExcludedIdentifier(const QString &voiceIdentifier)
{
    addExcludedVoiceIdentifier(voiceIdentifier);
}

void CZVoicePopUpButton::setSystemVoiceLocalizedText(const QString &text, qint64 menuItemTag)
{
    d->m_systemVoiceLocalizedText = text;
    d->m_systemVoiceMenuItemTag = menuItemTag;
}

void CZVoicePopUpButton::setDownloadStatusTextField(QLabel *textField)
{
    d->m_statusLine->setTextField(textField);
}

void CZVoicePopUpButton::setDownloadStatusProgressIndicator(QProgressBar *indicator)
{
    d->m_statusLine->setProgressIndicator(
        indicator, texts().text(QStringLiteral("VoiceDownloadProgressName")));
}

QString CZVoicePopUpButton::displayNameForGender(const QString &gender)
{
    if (gender == Platform::VoiceGender::Male) {
        return texts().text(QStringLiteral("Male"));
    }
    if (gender == Platform::VoiceGender::Female) {
        return texts().text(QStringLiteral("Female"));
    }
    if (gender == Platform::VoiceGender::Neuter) {
        return texts().text(QStringLiteral("Novelty"));
    }
    return {};
}

void CZVoicePopUpButton::buildSharedVoicesMenuShowingLTVoices(bool showingLTVoices)
{
    SharedState &state = shared();
    QMutexLocker menuLocker(&state.menuLock);
    QMutexLocker rowsLocker(&state.rowsLock);
    const QList<DownloadableVoicePtr> downloadables
        = CZSpeechInstallationManager::sharedManager()->downloadableVoices();
    state.menu.clear();
    state.rows.clear();

    QList<CZVoiceObjectPtr> voices = CZVoiceObject::visibleVoicesForLocaleIdentifier(
        CZVoiceObject::systemLocaleIdentifier(), state.required.keys(), showingLTVoices);
    QSet<QString> listed;
    for (const CZVoiceObjectPtr &voice : voices) {
        listed.insert(voice->identifier());
    }
    for (const DownloadableVoicePtr &voice : downloadables) {
        const qint64 status = voice->downloadStatus();
        if ((status != Protocol::DownloadingStatus && status != Protocol::WaitingStatus)
            || voice->identifier() == SpeechNames::OrinIdentifier) {
            continue;
        }
        if (!showingLTVoices) {
            // A premium download whose base voice ("X" or "X.compact") is listed is represented by it.
            const QString identifier = voice->identifier();
            if (Platform::VoiceDescription::qualityOf(identifier) == Platform::VoiceQuality::Premium
                && Platform::VoiceDescription::isBaseVoicePresent(
                    identifier, [&listed](const QString &form) { return listed.contains(form); })) {
                continue;
            }
        }
        voices.append(voice);
    }

    const QList<VoiceTableRowPtr> rows
        = VoiceTableRow::arrangedRowsFromVoiceObjects(voices, false, showingLTVoices, false, false);
    const QString downloadingFormat = texts().text(QStringLiteral("DownloadingItemFormat"));
    const QString pendingFormat = texts().text(QStringLiteral("DownloadPendingItemFormat"));
    state.menu.reserve(rows.size() + 2);
    qsizetype position = 0;
    for (const VoiceTableRowPtr &row : rows) {
        if (row->isGroupRow()) {
            if (!state.menu.isEmpty() && !state.menu.constLast().separator) {
                state.menu.append(Item::makeSeparator());
                ++position;
            }
            Item heading;
            heading.title = row->title();
            heading.enabled = false;
            state.menu.append(heading);
            ++position;
            continue;
        }
        const CZVoiceObjectPtr &voice = row->voiceObject();
        if (shouldExcludeVoiceIdentifier(voice->identifier())) {
            continue;
        }
        Item item;
        item.title = showingLTVoices ? voice->displayName() : voice->displayNameRoot();
        const qint64 status = voice->downloadStatus();
        if (status == Protocol::DownloadingStatus || status == Protocol::WaitingStatus) {
            item.title = Platform::LocalizationTable::fill(
                status == Protocol::DownloadingStatus ? downloadingFormat : pendingFormat, {item.title});
            item.enabled = false;
        }
        state.menu.append(item);
        row->setTableIndex(position);
        ++position;
    }
    state.rows = rows;
    state.menu.append(Item::makeSeparator());
    Item customize;
    customize.title = texts().text(QStringLiteral("CustomizeMenuItem"));
    state.menu.append(customize);
}

void CZVoicePopUpButton::buildPopUpButtonWithSelectVoiceIdentifier(const QString &voiceIdentifier)
{
    SharedState &state = shared();
    const QStringList candidates = d->m_showIndividualVoiceQualities
        ? SpeechSynthesizer::allVoices()
        : SpeechSynthesizer::avaliableMainstreamVoices();
    QString resolved = SpeechSynthesizer::resolveVoiceIdentifier(voiceIdentifier, candidates);
    if (resolved.isNull() && !d->m_allowSystemVoiceChoice) {
        resolved = d->m_showIndividualVoiceQualities ? SpeechSynthesizer::defaultVoiceFromAllVoices()
                                                     : SpeechSynthesizer::defaultVoiceFromMainstreamVoices();
    }

    bool rebuild = false;
    {
        QMutexLocker menuLocker(&state.menuLock);
        if (resolved.isNull()) {
            rebuild = state.menu.size() < 2;
        } else {
            QMutexLocker rowsLocker(&state.rowsLock);
            const bool listed
                = std::any_of(state.rows.cbegin(), state.rows.cend(), [&](const VoiceTableRowPtr &row) {
                      return row->voiceObject() && row->voiceObject()->identifier() == resolved;
                  });
            rebuild = state.menu.size() < 2 || state.rows.isEmpty() || !listed;
        }
    }

    // The voice shown stays listed; the one left stops being held.
    addRequiredVoiceIdentifier(resolved);
    removeRequiredVoiceIdentifier(d->m_previouslyChosenVoiceIdentifier);
    if (rebuild) {
        buildSharedVoicesMenuShowingLTVoices(d->m_showIndividualVoiceQualities);
    }

    QList<Item> leading;
    if (d->m_allowSystemVoiceChoice) {
        Item system;
        system.title = d->m_systemVoiceLocalizedText;
        system.tag = d->m_systemVoiceMenuItemTag;
        leading = {system, Item::makeSeparator()};
    }
    {
        QMutexLocker menuLocker(&state.menuLock);
        d->m_menu->setItems(leading, state.menu);
    }

    std::optional<qsizetype> position;
    bool hasRows = false;
    std::optional<qsizetype> firstVoicePosition;
    {
        QMutexLocker rowsLocker(&state.rowsLock);
        hasRows = !state.rows.isEmpty();
        auto positionOf = [&](const QString &identifier) -> std::optional<qsizetype> {
            for (const VoiceTableRowPtr &row : std::as_const(state.rows)) {
                if (row->voiceObject() && row->voiceObject()->identifier() == identifier) {
                    return row->tableIndex();
                }
            }
            return std::nullopt;
        };
        if (resolved.isNull()) {
            d->m_previouslyChosenVoiceIdentifier.clear();
        } else if (const auto found = positionOf(resolved)) {
            position = found;
            d->m_previouslyChosenVoiceIdentifier = resolved;
        } else if (const auto fallback
            = state.fallback.isNull() ? std::nullopt : positionOf(state.fallback)) {
            position = fallback;
            d->m_previouslyChosenVoiceIdentifier = state.fallback;
        } else if (const auto ordinary = positionOf(Platform::Services::speechSynthesis().defaultVoice())) {
            position = ordinary;
        }
        for (const VoiceTableRowPtr &row : std::as_const(state.rows)) {
            if (!row->isGroupRow()) {
                firstVoicePosition = row->tableIndex();
                break;
            }
        }
    }

    if (!hasRows) {
        setEnabled(d->m_allowSystemVoiceChoice);
        setCurrentIndex(-1);
    } else {
        setEnabled(true);
        int index = -1;
        if (position) {
            index = int(*position) + (d->m_allowSystemVoiceChoice ? 2 : 0);
        } else if (d->m_allowSystemVoiceChoice) {
            index = 0;
        } else if (firstVoicePosition) {
            index = int(*firstVoicePosition);
        }
        setCurrentIndex(index);
    }

    if (rebuild) {
        QTimer::singleShot(0, this, [this] {
            forcePopupsToAdoptCachedMenuExceptPopUp(this);
            d->_updateDownloadStatusFields();
        });
    }
}

std::optional<QVariantMap> CZVoicePopUpButton::selectedVoiceAttributes() const
{
    const quint32 selected = quint32(currentIndex());
    SharedState &state = shared();
    QMutexLocker rowsLocker(&state.rowsLock);
    for (const VoiceTableRowPtr &row : std::as_const(state.rows)) {
        if (quint32(row->tableIndex() + (d->m_allowSystemVoiceChoice ? 2 : 0)) == selected) {
            if (!row->voiceObject()) {
                return std::nullopt;
            }
            return row->voiceObject()->voiceAttributes();
        }
    }
    return std::nullopt;
}

bool CZVoicePopUpButton::isSelectedVoiceAppropriateForCurrentLanguageWithUserConfirmation(
    bool withUserConfirmation, QWidget *parentWindowForSheet)
{
    CZVoiceObjectPtr voice;
    if (d->m_allowSystemVoiceChoice && currentIndex() == 0) {
        voice = CZVoiceObject::initWithVoiceIdentifier(d->m_showIndividualVoiceQualities
                ? SpeechSynthesizer::defaultVoiceFromAllVoices()
                : SpeechSynthesizer::defaultVoiceFromMainstreamVoices());
    } else {
        const quint32 selected = quint32(currentIndex());
        SharedState &state = shared();
        QMutexLocker rowsLocker(&state.rowsLock);
        bool matched = false;
        for (const VoiceTableRowPtr &row : std::as_const(state.rows)) {
            if (quint32(row->tableIndex() + (d->m_allowSystemVoiceChoice ? 2 : 0)) == selected) {
                voice = row->voiceObject();
                matched = true;
                break;
            }
        }
        if (!matched) {
            return true;
        }
    }
    if (voice && voice->isAppropriateForSystemLangauge()) {
        return true;
    }
    Platform::AlertRequest alert;
    alert.message = texts().text(QStringLiteral("LanguageMismatchAlertMessageText"));
    if (!withUserConfirmation) {
        alert.title = texts().text(QStringLiteral("LanguageMismatchAlertTitleText"));
        alert.buttons = {texts().text(QStringLiteral("OK"))};
        if (parentWindowForSheet) {
            Platform::Alert::beginSheet(alert, parentWindowForSheet->window(), [](int) {});
        } else {
            (void)Platform::Alert::runModal(alert, window());
        }
        return false;
    }
    alert.title = texts().text(QStringLiteral("LanguageMismatchAlertTitleTextWithOptions"));
    alert.buttons = {texts().text(QStringLiteral("Use Voice")), texts().text(QStringLiteral("Cancel"))};
    return Platform::Alert::runModal(alert, window()) == 0;
}

bool CZVoicePopUpButton::sendAction()
{
    const quint32 itemCount = quint32(count());
    const quint32 selected = quint32(currentIndex()); // no selection becomes a huge number
    if (itemCount >= 3 && selected >= itemCount - 2) {
        if (selected > itemCount - 1) {
            return false;
        }
        if (selected == itemCount - 1) {
            CZSpeechInstallationManagerSheets::showVoiceSelectionSheetForWindow(
                window(), d->m_showIndividualVoiceQualities);
        } else {
            CZSpeechInstallationManager::sharedManager()->showProgressWindow();
        }
        buildPopUpButtonWithSelectVoiceIdentifier(d->m_previouslyChosenVoiceIdentifier);
        return false;
    }
    if (selected != 0) {
        const QString identifier = selectedVoiceAttributes()
                                       .value_or(QVariantMap())
                                       .value(Platform::VoiceAttribute::Identifier)
                                       .toString();
        addRequiredVoiceIdentifier(identifier);
        removeRequiredVoiceIdentifier(d->m_previouslyChosenVoiceIdentifier);
        d->m_previouslyChosenVoiceIdentifier = identifier;
    } else {
        removeRequiredVoiceIdentifier(d->m_previouslyChosenVoiceIdentifier);
        d->m_previouslyChosenVoiceIdentifier.clear();
    }
    Q_EMIT voiceActivated(currentIndex());
    return true;
}

void CZVoicePopUpButton::forcePopupsToAdoptCachedMenuExceptPopUp(CZVoicePopUpButton *popUp)
{
    const QList<QPointer<CZVoicePopUpButton>> popUps = shared().popUps;
    for (const QPointer<CZVoicePopUpButton> &each : popUps) {
        if (each && each != popUp) {
            each->buildPopUpButtonWithSelectVoiceIdentifier(each->d->m_previouslyChosenVoiceIdentifier);
        }
    }
}

void CZVoicePopUpButton::addExcludedVoiceIdentifier(const QString &voiceIdentifier)
{
    SharedState &state = shared();
    state.excluded.append(voiceIdentifier);
    {
        QMutexLocker menuLocker(&state.menuLock);
        state.menu.clear();
    }
    forcePopupsToAdoptCachedMenuExceptPopUp(nullptr);
}

bool CZVoicePopUpButton::shouldExcludeVoiceIdentifier(const QString &voiceIdentifier)
{
    return shared().excluded.contains(voiceIdentifier);
}

void CZVoicePopUpButton::addRequiredVoiceIdentifier(const QString &voiceIdentifier)
{
    if (voiceIdentifier.isNull()) {
        return;
    }
    ++shared().required[voiceIdentifier];
}

void CZVoicePopUpButton::removeRequiredVoiceIdentifier(const QString &voiceIdentifier)
{
    if (voiceIdentifier.isNull()) {
        return;
    }
    QHash<QString, quint64> &required = shared().required;
    const auto found = required.find(voiceIdentifier);
    if (found == required.end()) {
        return;
    }
    if (*found >= 2) {
        --*found;
    } else {
        required.erase(found);
    }
}

bool CZVoicePopUpButton::isRequiredVoiceIdentifier(const QString &voiceIdentifier)
{
    return shared().required.contains(voiceIdentifier);
}

void CZVoicePopUpButton::setFallbackVoiceIdentifier(const QString &voiceIdentifier)
{
    shared().fallback = voiceIdentifier;
}

void CZVoicePopUpButtonPrivate::_startDelayedForceAllVoicePopupsToUpdate()
{
    QMetaObject::invokeMethod(
        qApp, [] { _forceAllVoicePopupsToUpdate(); }, Qt::QueuedConnection);
}

void CZVoicePopUpButtonPrivate::_forceAllVoicePopupsToUpdate()
{
    SharedState &state = shared();
    if (state.updatingAll) {
        return;
    }
    state.updatingAll = true;
    {
        QMutexLocker menuLocker(&state.menuLock);
        state.menu.clear();
    }
    CZVoicePopUpButton::forcePopupsToAdoptCachedMenuExceptPopUp(nullptr);
    state.updatingAll = false;
}

void CZVoicePopUpButtonPrivate::_forceAllVoicePopupsToUpdateNow()
{
    {
        QMutexLocker menuLocker(&shared().menuLock);
        shared().menu.clear();
    }
    CZVoicePopUpButton::forcePopupsToAdoptCachedMenuExceptPopUp(nullptr);
}

void CZVoicePopUpButtonPrivate::_handleSpeechDataInstallationNotification()
{
    _startDelayedForceAllVoicePopupsToUpdate();
    QTimer::singleShot(200, q, [this] { _updateDownloadStatusFields(); });
}

QString CZVoicePopUpButtonPrivate::_statusStringForActiveDownloads()
{
    return m_statusLine->statusForActiveDownloads();
}

void CZVoicePopUpButtonPrivate::_updateDownloadStatusFields()
{
    m_statusLine->update();
}

bool CZVoicePopUpButtonPrivate::_hasDownloadStatusUpdateTimer() const
{
    return m_statusLine->isRefreshing();
}

namespace VoicePopUpPrivate {

QList<VoiceMenuModel::Item> sharedMenu()
{
    QMutexLocker locker(&shared().menuLock);
    return shared().menu;
}

QList<VoiceTableRowPtr> currentVoiceRows()
{
    QMutexLocker locker(&shared().rowsLock);
    return shared().rows;
}

void resetProcessState()
{
    SharedState &state = shared();
    QObject::disconnect(state.preferenceNotifications);
    delete state.watcher.data();
    state.popUps.clear();
    state.menu.clear();
    state.rows.clear();
    state.excluded.clear();
    state.required.clear();
    state.fallback.clear();
    state.firstPopUp.clear();
    state.registered = false;
    state.updatingAll = false;
}

QStringList watchedFolders()
{
    return shared().watcher ? shared().watcher->directories() : QStringList();
}

} // namespace VoicePopUpPrivate

} // namespace Cadenza
