<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="en_US">
<context>
    <name></name>
    <message id="Male">
        <source>Male</source>
        <translation>Male</translation>
    </message>
    <message id="Female">
        <source>Female</source>
        <translation>Female</translation>
    </message>
    <message id="Novelty">
        <source>Novelty</source>
        <translation>Novelty</translation>
    </message>
    <message id="Use System Voice">
        <source>Use System Voice</source>
        <translation>Use System Voice</translation>
    </message>
    <message id="CustomizeMenuItem">
        <source>Customize…</source>
        <translation>Customize…</translation>
    </message>
    <message id="AddLanguageMenuItem">
        <source>Add Language…</source>
        <translation>Add Language…</translation>
    </message>
    <message id="DownloadingItemFormat">
        <source>%1 (Downloading)</source>
        <translation>%1 (Downloading)</translation>
    </message>
    <message id="DownloadPendingItemFormat">
        <source>%1 (Waiting)</source>
        <translation>%1 (Waiting)</translation>
    </message>
    <message id="LanguageMismatchAlertTitleText">
        <source>The selected voice does not speak your language.</source>
        <translation>The selected voice does not speak your language.</translation>
    </message>
    <message id="LanguageMismatchAlertTitleTextWithOptions">
        <source>Use a voice that does not speak your language?</source>
        <translation>Use a voice that does not speak your language?</translation>
    </message>
    <message id="LanguageMismatchAlertMessageText">
        <source>Text in your language may not be spoken correctly by this voice.</source>
        <translation>Text in your language may not be spoken correctly by this voice.</translation>
    </message>
    <message id="Use Voice">
        <source>Use Voice</source>
        <translation>Use Voice</translation>
    </message>
    <message id="Cancel">
        <source>Cancel</source>
        <translation>Cancel</translation>
    </message>
    <message id="OK">
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message id="DownloadingStatusStringsWithEmDash">
        <source>%1 — %2</source>
        <translation>%1 — %2</translation>
    </message>
    <message id="DownloadingStatusStringInstallingItem">
        <source>Installing %1</source>
        <translation>Installing %1</translation>
    </message>
    <message id="DownloadingStatusStringDownloadingItem">
        <source>Downloading %1</source>
        <translation>Downloading %1</translation>
    </message>
    <message id="DownloadingStatusStringPreparing">
        <source>Preparing to download…</source>
        <translation>Preparing to download…</translation>
    </message>
    <message id="DownloadingStatusStringWaiting">
        <source>Waiting to download…</source>
        <translation>Waiting to download…</translation>
    </message>
    <message id="PlayButtonName">
        <source>Play</source>
        <translation>Play</translation>
    </message>
    <message id="StopButtonName">
        <source>Stop</source>
        <translation>Stop</translation>
    </message>
    <message id="SelectedDownloadSizeFormat">
        <source>Selected download size: %1</source>
        <translation>Selected download size: %1</translation>
    </message>
    <message id="DownloadStatusTextPendingItemFormat">
        <source>Waiting</source>
        <translation>Waiting</translation>
    </message>
    <message id="DownloadStatusTextInProgressFormat">
        <source>Downloading</source>
        <translation>Downloading</translation>
    </message>
    <message id="DownloadStatusTextInProgressWithPercentCompleteFormat">
        <source>Downloading %1 %</source>
        <translation>Downloading %1 %</translation>
    </message>
    <message id="DownloadStatusTextRequiredItemFormat">
        <source>Required</source>
        <translation>Required</translation>
    </message>
    <message id="DownloadStatusTextOfflineDictationOnly">
        <source>Offline dictation only</source>
        <translation>Offline dictation only</translation>
    </message>
    <message id="DownloadStatusCheckboxTextUpradeItemFormat">
        <source>Update (%1)</source>
        <translation>Update (%1)</translation>
    </message>
    <message id="DeleteDisabledVoiceAlertTitleText">
        <source>Remove the voices you unchecked from this computer?</source>
        <translation>Remove the voices you unchecked from this computer?</translation>
    </message>
    <message id="DeleteDisabledLanguageAlertTitleText">
        <source>Remove the languages you unchecked from this computer?</source>
        <translation>Remove the languages you unchecked from this computer?</translation>
    </message>
    <message id="DeleteDisabledItemAlertDeleteButtonText">
        <source>Remove</source>
        <translation>Remove</translation>
    </message>
    <message id="DeleteDisabledItemAlertKeepButtonText">
        <source>Keep</source>
        <translation>Keep</translation>
    </message>
    <message id="LanguageWithCountryGroupFormat">
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
    <message id="LanguageWithGenderGroupFormat">
        <source>%1 — %2</source>
        <translation>%1 — %2</translation>
    </message>
    <message id="ByteSize">
        <source>%1 bytes</source>
        <translation>%1 bytes</translation>
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
        <translation>Less than a minute remaining</translation>
    </message>
    <message id="DownloadingProgressTimeRemainingNMinutes">
        <source>About %1 minutes remaining</source>
        <translation>About %1 minutes remaining</translation>
    </message>
    <message id="DownloadingProgressTimeRemainingAboutAnHour">
        <source>About an hour remaining</source>
        <translation>About an hour remaining</translation>
    </message>
    <message id="DownloadingProgressTimeRemainingNHours">
        <source>About %1 hours remaining</source>
        <translation>About %1 hours remaining</translation>
    </message>
    <message id="EnhancedDictation">
        <source>Enhanced Dictation</source>
        <translation>Enhanced Dictation</translation>
    </message>
    <message id="DisplayLanguageQualifiedTemplate">
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
    <message id="VoiceSettingsWindowTitle">
        <source>Voice Settings</source>
        <translation>Voice Settings</translation>
    </message>
    <message id="VoiceSettingsVoiceLabel">
        <source>Voice:</source>
        <translation>Voice:</translation>
    </message>
    <message id="VoiceSettingsCustomRateCheckbox">
        <source>Use custom speaking rate</source>
        <translation>Use custom speaking rate</translation>
    </message>
    <message id="VoiceSettingsCustomVolumeCheckbox">
        <source>Use custom volume</source>
        <translation>Use custom volume</translation>
    </message>
    <message id="VoiceSettingsSlowLabel">
        <source>Slow</source>
        <translation>Slow</translation>
    </message>
    <message id="VoiceSettingsFastLabel">
        <source>Fast</source>
        <translation>Fast</translation>
    </message>
    <message id="VoiceSettingsRateSlider">
        <source>Speaking rate</source>
        <translation>Speaking rate</translation>
    </message>
    <message id="VoiceSettingsVolumeSlider">
        <source>Volume</source>
        <translation>Volume</translation>
    </message>
    <message id="VoiceSettingsQuietIcon">
        <source>Quiet</source>
        <translation>Quiet</translation>
    </message>
    <message id="VoiceSettingsLoudIcon">
        <source>Loud</source>
        <translation>Loud</translation>
    </message>
    <message id="VoiceCustomizationTitle">
        <source>Customize Voices</source>
        <translation>Customize Voices</translation>
    </message>
    <message id="VoiceCustomizationExplanation">
        <source>Tick the voices to show in voice menus and the voices to download.</source>
        <translation>Tick the voices to show in voice menus and the voices to download.</translation>
    </message>
    <message id="VoiceCustomizationSearchPlaceholder">
        <source>Search</source>
        <translation>Search</translation>
    </message>
    <message id="VoiceCustomizationNoResults">
        <source>No Results</source>
        <translation>No Results</translation>
    </message>
    <message id="VoiceCustomizationTable">
        <source>Voices</source>
        <translation>Voices</translation>
    </message>
    <message id="DownloadVariantCompactItem">
        <source>Compact</source>
        <translation>Compact</translation>
    </message>
    <message id="DownloadVariantFullSizeItem">
        <source>Full Size</source>
        <translation>Full Size</translation>
    </message>
    <message id="SRLanguageCustomizationTitle">
        <source>Customize Dictation Languages</source>
        <translation>Customize Dictation Languages</translation>
    </message>
    <message id="SRLanguageCustomizationExplanation">
        <source>Tick the dictation languages to list and the languages to download.</source>
        <translation>Tick the dictation languages to list and the languages to download.</translation>
    </message>
    <message id="SRLanguageCustomizationTable">
        <source>Dictation languages</source>
        <translation>Dictation languages</translation>
    </message>
    <message id="SettingsSpeech">
        <source>Speech</source>
        <translation>Speech</translation>
    </message>
    <message id="SettingsSystemVoiceName">
        <source>System voice</source>
        <translation>System voice</translation>
    </message>
    <message id="SettingsSystemVoiceLabel">
        <source>System &amp;voice:</source>
        <translation>System &amp;voice:</translation>
    </message>
    <message id="SettingsVoiceSettingsButton">
        <source>Voice Settings…</source>
        <translation>Voice Settings…</translation>
    </message>
    <message id="SettingsVoiceSettingsSheetButton">
        <source>Voice Settings as Sheet…</source>
        <translation>Voice Settings as Sheet…</translation>
    </message>
    <message id="SettingsDictationLanguageName">
        <source>Dictation language</source>
        <translation>Dictation language</translation>
    </message>
    <message id="SettingsRecognitionServiceName">
        <source>Recognition service</source>
        <translation>Recognition service</translation>
    </message>
    <message id="SettingsInstalledRecognizers">
        <source>Installed recognizers</source>
        <translation>Installed recognizers</translation>
    </message>
    <message id="SettingsNetworkService">
        <source>Network service (English, German, French, Spanish, Japanese)</source>
        <translation>Network service (English, German, French, Spanish, Japanese)</translation>
    </message>
    <message id="SettingsOfflineOnly">
        <source>Offline only (English, German)</source>
        <translation>Offline only (English, German)</translation>
    </message>
    <message id="SettingsLanguageLabel">
        <source>&amp;Language:</source>
        <translation>&amp;Language:</translation>
    </message>
    <message id="SettingsDictation">
        <source>Dictation</source>
        <translation>Dictation</translation>
    </message>
    <message id="SettingsTryDictation">
        <source>Try dictation:</source>
        <translation>Try dictation:</translation>
    </message>
    <message id="SettingsTryDictationRecord">
        <source>Record</source>
        <translation>Record</translation>
    </message>
    <message id="SettingsTryDictationStop">
        <source>Stop</source>
        <translation>Stop</translation>
    </message>
    <message id="SettingsTryDictationHint">
        <source>Press Record, speak, then press Stop.</source>
        <translation>Press Record, speak, then press Stop.</translation>
    </message>
    <message id="SettingsTryDictationListening">
        <source>Listening…</source>
        <translation>Listening…</translation>
    </message>
    <message id="SettingsTryDictationNothing">
        <source>No words were recognised.</source>
        <translation>No words were recognised.</translation>
    </message>
    <message id="SettingsOfferLabel">
        <source>&amp;Offer:</source>
        <translation>&amp;Offer:</translation>
    </message>
    <message id="SettingsReadingVoiceTitle">
        <source>Reading Voice</source>
        <translation>Reading Voice</translation>
    </message>
    <message id="SettingsReadingVoiceFormat">
        <source>Reading voice: %1</source>
        <translation>Reading voice: %1</translation>
    </message>
    <message id="SettingsSystemVoiceText">
        <source>system voice</source>
        <translation>system voice</translation>
    </message>
    <message id="SettingsRateFormat">
        <source>rate %1 %</source>
        <translation>rate %1 %</translation>
    </message>
    <message id="SettingsVolumeFormat">
        <source>volume %1 %</source>
        <translation>volume %1 %</translation>
    </message>
</context>
</TS>
