<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="de_DE">
<context>
    <name></name>
    <message id="Male">
        <source>Male</source>
        <translation>Männlich</translation>
    </message>
    <message id="Female">
        <source>Female</source>
        <translation>Weiblich</translation>
    </message>
    <message id="Novelty">
        <source>Novelty</source>
        <translation>Neuheit</translation>
    </message>
    <message id="Use System Voice">
        <source>Use System Voice</source>
        <translation>Systemstimme verwenden</translation>
    </message>
    <message id="CustomizeMenuItem">
        <source>Customize…</source>
        <translation>Anpassen …</translation>
    </message>
    <message id="AddLanguageMenuItem">
        <source>Add Language…</source>
        <translation>Sprache hinzufügen …</translation>
    </message>
    <message id="DownloadingItemFormat">
        <source>%1 (Downloading)</source>
        <translation>%1 (wird geladen)</translation>
    </message>
    <message id="DownloadPendingItemFormat">
        <source>%1 (Waiting)</source>
        <translation>%1 (wartet)</translation>
    </message>
    <message id="LanguageMismatchAlertTitleText">
        <source>The selected voice does not speak your language.</source>
        <translation>Die ausgewählte Stimme spricht nicht Ihre Sprache.</translation>
    </message>
    <message id="LanguageMismatchAlertTitleTextWithOptions">
        <source>Use a voice that does not speak your language?</source>
        <translation>Eine Stimme verwenden, die nicht Ihre Sprache spricht?</translation>
    </message>
    <message id="LanguageMismatchAlertMessageText">
        <source>Text in your language may not be spoken correctly by this voice.</source>
        <translation>Text in Ihrer Sprache wird von dieser Stimme eventuell nicht richtig gesprochen.</translation>
    </message>
    <message id="Use Voice">
        <source>Use Voice</source>
        <translation>Stimme verwenden</translation>
    </message>
    <message id="Cancel">
        <source>Cancel</source>
        <translation>Abbrechen</translation>
    </message>
    <message id="OK">
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message id="DownloadingStatusStringsWithEmDash">
        <source>%1 — %2</source>
        <translation>%1 – %2</translation>
    </message>
    <message id="DownloadingStatusStringInstallingItem">
        <source>Installing %1</source>
        <translation>%1 wird installiert</translation>
    </message>
    <message id="DownloadingStatusStringDownloadingItem">
        <source>Downloading %1</source>
        <translation>%1 wird geladen</translation>
    </message>
    <message id="DownloadingStatusStringPreparing">
        <source>Preparing to download…</source>
        <translation>Laden wird vorbereitet …</translation>
    </message>
    <message id="DownloadingStatusStringWaiting">
        <source>Waiting to download…</source>
        <translation>Warten auf Laden …</translation>
    </message>
    <message id="PlayButtonName">
        <source>Play</source>
        <translation>Wiedergeben</translation>
    </message>
    <message id="StopButtonName">
        <source>Stop</source>
        <translation>Stoppen</translation>
    </message>
    <message id="SelectedDownloadSizeFormat">
        <source>Selected download size: %1</source>
        <translation>Ausgewählte Downloadgröße: %1</translation>
    </message>
    <message id="DownloadStatusTextPendingItemFormat">
        <source>Waiting</source>
        <translation>Wartet</translation>
    </message>
    <message id="DownloadStatusTextInProgressFormat">
        <source>Downloading</source>
        <translation>Wird geladen</translation>
    </message>
    <message id="DownloadStatusTextInProgressWithPercentCompleteFormat">
        <source>Downloading %1 %</source>
        <translation>Wird geladen: %1 %</translation>
    </message>
    <message id="DownloadStatusTextRequiredItemFormat">
        <source>Required</source>
        <translation>Erforderlich</translation>
    </message>
    <message id="DownloadStatusTextOfflineDictationOnly">
        <source>Offline dictation only</source>
        <translation>Nur Offline-Diktat</translation>
    </message>
    <message id="DownloadStatusCheckboxTextUpradeItemFormat">
        <source>Update (%1)</source>
        <translation>Aktualisieren (%1)</translation>
    </message>
    <message id="DeleteDisabledVoiceAlertTitleText">
        <source>Remove the voices you unchecked from this computer?</source>
        <translation>Die abgewählten Stimmen von diesem Computer entfernen?</translation>
    </message>
    <message id="DeleteDisabledLanguageAlertTitleText">
        <source>Remove the languages you unchecked from this computer?</source>
        <translation>Die abgewählten Sprachen von diesem Computer entfernen?</translation>
    </message>
    <message id="DeleteDisabledItemAlertDeleteButtonText">
        <source>Remove</source>
        <translation>Entfernen</translation>
    </message>
    <message id="DeleteDisabledItemAlertKeepButtonText">
        <source>Keep</source>
        <translation>Behalten</translation>
    </message>
    <message id="LanguageWithCountryGroupFormat">
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
    <message id="LanguageWithGenderGroupFormat">
        <source>%1 — %2</source>
        <translation>%1 – %2</translation>
    </message>
    <message id="ByteSize">
        <source>%1 bytes</source>
        <translation>%1 Byte</translation>
    </message>
    <message id="KBSize">
        <source>%1 KB</source>
        <translation>%1 KB</translation>
    </message>
    <message id="MBSize">
        <source>%1 MB</source>
        <translation>%1 MB</translation>
    </message>
    <message id="GBSize">
        <source>%1 GB</source>
        <translation>%1 GB</translation>
    </message>
    <message id="DownloadingProgressTimeRemainingLessThanAMinute">
        <source>Less than a minute remaining</source>
        <translation>Weniger als eine Minute verbleibend</translation>
    </message>
    <message id="DownloadingProgressTimeRemainingNMinutes">
        <source>About %1 minutes remaining</source>
        <translation>Noch etwa %1 Minuten</translation>
    </message>
    <message id="DownloadingProgressTimeRemainingAboutAnHour">
        <source>About an hour remaining</source>
        <translation>Noch etwa eine Stunde</translation>
    </message>
    <message id="DownloadingProgressTimeRemainingNHours">
        <source>About %1 hours remaining</source>
        <translation>Noch etwa %1 Stunden</translation>
    </message>
    <message id="EnhancedDictation">
        <source>Enhanced Dictation</source>
        <translation>Erweitertes Diktat</translation>
    </message>
    <message id="DisplayLanguageQualifiedTemplate">
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
    <message id="VoiceSettingsWindowTitle">
        <source>Voice Settings</source>
        <translation>Stimmeinstellungen</translation>
    </message>
    <message id="VoiceSettingsVoiceLabel">
        <source>Voice:</source>
        <translation>Stimme:</translation>
    </message>
    <message id="VoiceSettingsCustomRateCheckbox">
        <source>Use custom speaking rate</source>
        <translation>Eigene Sprechgeschwindigkeit verwenden</translation>
    </message>
    <message id="VoiceSettingsCustomVolumeCheckbox">
        <source>Use custom volume</source>
        <translation>Eigene Lautstärke verwenden</translation>
    </message>
    <message id="VoiceSettingsSlowLabel">
        <source>Slow</source>
        <translation>Langsam</translation>
    </message>
    <message id="VoiceSettingsFastLabel">
        <source>Fast</source>
        <translation>Schnell</translation>
    </message>
    <message id="VoiceSettingsRateSlider">
        <source>Speaking rate</source>
        <translation>Sprechgeschwindigkeit</translation>
    </message>
    <message id="VoiceSettingsVolumeSlider">
        <source>Volume</source>
        <translation>Lautstärke</translation>
    </message>
    <message id="VoiceSettingsQuietIcon">
        <source>Quiet</source>
        <translation>Leise</translation>
    </message>
    <message id="VoiceSettingsLoudIcon">
        <source>Loud</source>
        <translation>Laut</translation>
    </message>
    <message id="VoiceCustomizationTitle">
        <source>Customize Voices</source>
        <translation>Stimmen anpassen</translation>
    </message>
    <message id="VoiceCustomizationExplanation">
        <source>Tick the voices to show in voice menus and the voices to download.</source>
        <translation>Markieren Sie die Stimmen, die in Stimmenmenüs erscheinen sollen, und die Stimmen, die geladen werden sollen.</translation>
    </message>
    <message id="VoiceCustomizationSearchPlaceholder">
        <source>Search</source>
        <translation>Suchen</translation>
    </message>
    <message id="VoiceCustomizationNoResults">
        <source>No Results</source>
        <translation>Keine Treffer</translation>
    </message>
    <message id="VoiceCustomizationTable">
        <source>Voices</source>
        <translation>Stimmen</translation>
    </message>
    <message id="DownloadVariantCompactItem">
        <source>Compact</source>
        <translation>Kompakt</translation>
    </message>
    <message id="DownloadVariantFullSizeItem">
        <source>Full Size</source>
        <translation>Volle Größe</translation>
    </message>
    <message id="SRLanguageCustomizationTitle">
        <source>Customize Dictation Languages</source>
        <translation>Diktiersprachen anpassen</translation>
    </message>
    <message id="SRLanguageCustomizationExplanation">
        <source>Tick the dictation languages to list and the languages to download.</source>
        <translation>Markieren Sie die Diktiersprachen, die aufgeführt werden sollen, und die Sprachen, die geladen werden sollen.</translation>
    </message>
    <message id="SRLanguageCustomizationTable">
        <source>Dictation languages</source>
        <translation>Diktiersprachen</translation>
    </message>
    <message id="SettingsSpeech">
        <source>Speech</source>
        <translation>Sprache</translation>
    </message>
    <message id="SettingsSystemVoiceName">
        <source>System voice</source>
        <translation>Systemstimme</translation>
    </message>
    <message id="SettingsSystemVoiceLabel">
        <source>System &amp;voice:</source>
        <translation>System&amp;stimme:</translation>
    </message>
    <message id="SettingsVoiceSettingsButton">
        <source>Voice Settings…</source>
        <translation>Stimmeinstellungen …</translation>
    </message>
    <message id="SettingsVoiceSettingsSheetButton">
        <source>Voice Settings as Sheet…</source>
        <translation>Stimmeinstellungen als Blatt …</translation>
    </message>
    <message id="SettingsDictationLanguageName">
        <source>Dictation language</source>
        <translation>Diktiersprache</translation>
    </message>
    <message id="SettingsRecognitionServiceName">
        <source>Recognition service</source>
        <translation>Erkennungsdienst</translation>
    </message>
    <message id="SettingsInstalledRecognizers">
        <source>Installed recognizers</source>
        <translation>Installierte Erkenner</translation>
    </message>
    <message id="SettingsNetworkService">
        <source>Network service (English, German, French, Spanish, Japanese)</source>
        <translation>Netzwerkdienst (Englisch, Deutsch, Französisch, Spanisch, Japanisch)</translation>
    </message>
    <message id="SettingsOfflineOnly">
        <source>Offline only (English, German)</source>
        <translation>Nur offline (Englisch, Deutsch)</translation>
    </message>
    <message id="SettingsLanguageLabel">
        <source>&amp;Language:</source>
        <translation>S&amp;prache:</translation>
    </message>
    <message id="SettingsDictation">
        <source>Dictation</source>
        <translation>Diktat</translation>
    </message>
    <message id="SettingsTryDictation">
        <source>Try dictation:</source>
        <translation>Diktat ausprobieren:</translation>
    </message>
    <message id="SettingsTryDictationRecord">
        <source>Record</source>
        <translation>Aufnehmen</translation>
    </message>
    <message id="SettingsTryDictationStop">
        <source>Stop</source>
        <translation>Anhalten</translation>
    </message>
    <message id="SettingsTryDictationHint">
        <source>Press Record, speak, then press Stop.</source>
        <translation>Auf „Aufnehmen“ klicken, sprechen, dann „Anhalten“.</translation>
    </message>
    <message id="SettingsTryDictationListening">
        <source>Listening…</source>
        <translation>Hört zu …</translation>
    </message>
    <message id="SettingsTryDictationNothing">
        <source>No words were recognised.</source>
        <translation>Es wurden keine Wörter erkannt.</translation>
    </message>
    <message id="SettingsOfferLabel">
        <source>&amp;Offer:</source>
        <translation>&amp;Angebot:</translation>
    </message>
    <message id="SettingsReadingVoiceTitle">
        <source>Reading Voice</source>
        <translation>Vorlesestimme</translation>
    </message>
    <message id="SettingsReadingVoiceFormat">
        <source>Reading voice: %1</source>
        <translation>Vorlesestimme: %1</translation>
    </message>
    <message id="SettingsSystemVoiceText">
        <source>system voice</source>
        <translation>Systemstimme</translation>
    </message>
    <message id="SettingsRateFormat">
        <source>rate %1 %</source>
        <translation>Tempo %1 %</translation>
    </message>
    <message id="SettingsVolumeFormat">
        <source>volume %1 %</source>
        <translation>Lautstärke %1 %</translation>
    </message>
</context>
</TS>
