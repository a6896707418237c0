// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICEPOPUP_CZVOICEPOPUPBUTTON_H
#define CADENZA_VOICEPOPUP_CZVOICEPOPUPBUTTON_H

#include "cadenza_export.h"

#include "widgets/helpers/PopUpButton.h"
#include <QVariantMap>

#include <memory>
#include <optional>

class QLabel;
class QProgressBar;

namespace Cadenza {

class CZVoicePopUpButtonPrivate;

/**
 * The voice chooser hosts place in their windows, in code or as a promoted widget in Qt Designer.
 *
 * Every voice pop-up of the process lists the same voices in the same order: the voices of one shared
 * menu, grouped under disabled headings by language, country and gender, followed by a separator and
 * "Customize…", which opens the customise voices sheet. Optionally a system voice item and a separator
 * head the menu. The menu rebuilds itself in every pop-up when voices, languages, number preferences
 * or installations change, in this process or another one. Beside the pop-up, an optional text field
 * and busy indicator show the progress of voice downloads.
 *
 * Hosts react to voiceActivated(), which is sent when the user picks a voice or the system item, and
 * never for the customise item (QComboBox's own activated() fires for every pick).
 *
 * @code
 * auto *voices = new Cadenza::CZVoicePopUpButton(window);
 * voices->setAllowSystemVoiceChoice(true);
 * voices->buildPopUpButtonWithSelectVoiceIdentifier(storedIdentifier);
 * connect(voices, &Cadenza::CZVoicePopUpButton::voiceActivated, window, [voices] {
 *     const auto attributes = voices->selectedVoiceAttributes(); // empty: the system voice
 * });
 * @endcode
 */
class CADENZA_EXPORT CZVoicePopUpButton : public Platform::PopUpButton
{
    Q_OBJECT
    Q_PROPERTY(bool allowSystemVoiceChoice READ allowSystemVoiceChoice WRITE setAllowSystemVoiceChoice)
    Q_PROPERTY(bool showIndividualVoiceQualities READ showIndividualVoiceQualities WRITE
            setShowIndividualVoiceQualities)
public:
    explicit CZVoicePopUpButton(QWidget *parent = nullptr);
    ~CZVoicePopUpButton() override;

    /// Adopts the shared menu (rebuilding it when needed) and selects the voice @p voiceIdentifier
    /// stands for; null selects the system item, or the default voice when there is none.
    void buildPopUpButtonWithSelectVoiceIdentifier(const QString &voiceIdentifier);
    /// The attributes of the selected voice; nothing for the system item, a heading or no selection.
    [[nodiscard]] std::optional<QVariantMap> selectedVoiceAttributes() const;
    /**
     * Whether the selected voice suits the user's language. When it does not, warns (as a sheet on
     * @p parentWindowForSheet when given) and answers false; with @p withUserConfirmation, asks
     * instead and answers whether the user chose to use the voice anyway.
     */
    [[nodiscard]] bool isSelectedVoiceAppropriateForCurrentLanguageWithUserConfirmation(
        bool withUserConfirmation, QWidget *parentWindowForSheet);
    /// Handles the user's pick: opens the sheet for "Customize…", otherwise records the voice and
    /// emits voiceActivated(). Returns whether the action was sent.
    bool sendAction();

    [[nodiscard]] bool allowSystemVoiceChoice() const;
    /// Takes effect at the next build.
    void setAllowSystemVoiceChoice(bool allow);
    /// Title and tag of the system voice item; take effect at the next build.
    void setSystemVoiceLocalizedText(const QString &text, qint64 menuItemTag);
    [[nodiscard]] bool showIndividualVoiceQualities() const;
    /// List every quality of a voice under its full name; takes effect at the next build.
    void setShowIndividualVoiceQualities(bool show);
    void addExcludedIdentifier(const QString &voiceIdentifier);

    /// Where the download status line and its busy indicator are shown; either may be null.
    void setDownloadStatusTextField(QLabel *textField);
    void setDownloadStatusProgressIndicator(QProgressBar *indicator);

    /// "Male", "Female" or "Novelty", localised, for the platform's gender values; null otherwise.
    [[nodiscard]] static QString displayNameForGender(const QString &gender);
    /// Rebuilds the shared menu; @p showingLTVoices lists every quality separately.
    static void buildSharedVoicesMenuShowingLTVoices(bool showingLTVoices);
    /// Every pop-up other than @p popUp adopts the shared menu again with its own voice.
    static void forcePopupsToAdoptCachedMenuExceptPopUp(CZVoicePopUpButton *popUp);
    /// Never lists @p voiceIdentifier again, in any pop-up of the process.
    static void addExcludedVoiceIdentifier(const QString &voiceIdentifier);
    [[nodiscard]] static bool shouldExcludeVoiceIdentifier(const QString &voiceIdentifier);
    /// Keeps @p voiceIdentifier listed even when hidden; counted, one release per hold.
    static void addRequiredVoiceIdentifier(const QString &voiceIdentifier);
    static void removeRequiredVoiceIdentifier(const QString &voiceIdentifier);
    [[nodiscard]] static bool isRequiredVoiceIdentifier(const QString &voiceIdentifier);
    /// The voice selected when the asked-for one is not listed.
    static void setFallbackVoiceIdentifier(const QString &voiceIdentifier);

Q_SIGNALS:
    /// The user picked a voice (@p index > 0 or with no system item) or the system item (@p index 0).
    void voiceActivated(int index);

private:
    friend class CZVoicePopUpButtonPrivate;
    std::unique_ptr<CZVoicePopUpButtonPrivate> const d;
};

} // namespace Cadenza

#endif
