<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<!-- SPDX-FileCopyrightText: 2026 The Cadenza developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<TS version="2.1" language="en_US">
<context>
    <name></name>
    <message id="CLIUsage">
        <source>Usage: cadenza COMMAND [OPTIONS]

Commands:
  voices         list the installed voices
  say            speak a text, or write it to a WAV file
  languages      list the installed and downloadable recognition languages
  dictate        print the words spoken in a WAV file (or at the microphone)
  post           post a notification to every process of the session
  notify         the same as post, e.g. cadenza notify DictationIMNotificationRecognizerDidPreHeat
  status         show what the installer daemon is installing
  install        install a voice or recognition language by its tag
  cancel         cancel every installation
  downloadables  list what can be downloaded or upgraded
  remove         remove a downloaded voice or recognition language
  upgrade        fetch the best quality of a voice in the background, when allowed
  power          say whether this computer runs on mains power

Run 'cadenza COMMAND --help' for the options of a command.</source>
        <translation>Usage: cadenza COMMAND [OPTIONS]

Commands:
  voices         list the installed voices
  say            speak a text, or write it to a WAV file
  languages      list the installed and downloadable recognition languages
  dictate        print the words spoken in a WAV file (or at the microphone)
  post           post a notification to every process of the session
  notify         the same as post, e.g. cadenza notify DictationIMNotificationRecognizerDidPreHeat
  status         show what the installer daemon is installing
  install        install a voice or recognition language by its tag
  cancel         cancel every installation
  downloadables  list what can be downloaded or upgraded
  remove         remove a downloaded voice or recognition language
  upgrade        fetch the best quality of a voice in the background, when allowed
  power          say whether this computer runs on mains power

Run 'cadenza COMMAND --help' for the options of a command.</translation>
    </message>
    <message id="CLIExitStatusHelp">
        <source>Exit status: 0 success, 1 the operation failed, 2 bad usage (unknown option, stray operand, bad value), 3 the installer daemon cannot be reached.</source>
        <translation>Exit status: 0 success, 1 the operation failed, 2 bad usage (unknown option, stray operand, bad value), 3 the installer daemon cannot be reached.</translation>
    </message>
    <message id="CLIUnknownCommand">
        <source>unknown command '%1'</source>
        <translation>unknown command '%1'</translation>
    </message>
    <message id="CLIUnknownOption">
        <source>unknown option '%1'</source>
        <translation>unknown option '%1'</translation>
    </message>
    <message id="CLIUnexpectedArgument">
        <source>unexpected argument '%1'</source>
        <translation>unexpected argument '%1'</translation>
    </message>
    <message id="CLIDaemonNotRunning">
        <source>The installer daemon is not running.</source>
        <translation>The installer daemon is not running.</translation>
    </message>
    <message id="CLIDaemonUnreachable">
        <source>the installer daemon cannot be reached (start quillond)</source>
        <translation>the installer daemon cannot be reached (start quillond)</translation>
    </message>
    <message id="CLIDaemonStopped">
        <source>the installer daemon stopped</source>
        <translation>the installer daemon stopped</translation>
    </message>
    <message id="CLINothingInstalling">
        <source>Nothing is being installed.</source>
        <translation>Nothing is being installed.</translation>
    </message>
    <message id="CLIStatusWaiting">
        <source>%1: waiting</source>
        <translation>%1: waiting</translation>
    </message>
    <message id="CLIStatusDownloading">
        <source>%1: downloading, %2 %%, %3 of %4 bytes</source>
        <translation>%1: downloading, %2 %%, %3 of %4 bytes</translation>
    </message>
    <message id="CLIStatusSecondsLeft">
        <source>, about %1 s left</source>
        <translation>, about %1 s left</translation>
    </message>
    <message id="CLIStatusInstalling">
        <source>%1: installing</source>
        <translation>%1: installing</translation>
    </message>
    <message id="CLIStatusPreparing">
        <source>%1: preparing</source>
        <translation>%1: preparing</translation>
    </message>
    <message id="CLIStatusDescription">
        <source>Shows the installations that the installer daemon is working on.</source>
        <translation>Shows the installations that the installer daemon is working on.</translation>
    </message>
    <message id="CLIJsonRecordsOption">
        <source>Print the daemon's records as JSON.</source>
        <translation>Print the daemon's records as JSON.</translation>
    </message>
    <message id="CLIJsonOption">
        <source>Print a JSON array instead of a table.</source>
        <translation>Print a JSON array instead of a table.</translation>
    </message>
    <message id="CLIInstallDescription">
        <source>Asks the installer daemon to install TAG, such as VOICEID:com.vendra.speech.synthesis.voice.tobias.premium or SRCLANGID:de_DE, and waits until it is installed unless --no-wait is given.</source>
        <translation>Asks the installer daemon to install TAG, such as VOICEID:com.vendra.speech.synthesis.voice.tobias.premium or SRCLANGID:de_DE, and waits until it is installed unless --no-wait is given.</translation>
    </message>
    <message id="CLINoWaitOption">
        <source>Return once the request is sent.</source>
        <translation>Return once the request is sent.</translation>
    </message>
    <message id="CLITagOperand">
        <source>The installer tag of the item.</source>
        <translation>The installer tag of the item.</translation>
    </message>
    <message id="CLIGiveOneTag">
        <source>give exactly one tag</source>
        <translation>give exactly one tag</translation>
    </message>
    <message id="CLIEmptyTag">
        <source>the tag is empty</source>
        <translation>the tag is empty</translation>
    </message>
    <message id="CLITagTooLong">
        <source>the tag is longer than %1 characters</source>
        <translation>the tag is longer than %1 characters</translation>
    </message>
    <message id="CLIInstalled">
        <source>Installed %1</source>
        <translation>Installed %1</translation>
    </message>
    <message id="CLIInstallCancelled">
        <source>the installation of %1 was cancelled</source>
        <translation>the installation of %1 was cancelled</translation>
    </message>
    <message id="CLIInstallFailed">
        <source>installing %1 failed: %2</source>
        <translation>installing %1 failed: %2</translation>
    </message>
    <message id="CLICancelDescription">
        <source>Cancels every installation of the installer daemon.</source>
        <translation>Cancels every installation of the installer daemon.</translation>
    </message>
    <message id="CLISayDescription">
        <source>Speaks TEXT (or standard input when no TEXT is given) with the default voice or the one chosen with --voice, on the audio output or into a WAV file.</source>
        <translation>Speaks TEXT (or standard input when no TEXT is given) with the default voice or the one chosen with --voice, on the audio output or into a WAV file.</translation>
    </message>
    <message id="CLIVoiceOption">
        <source>Speak with the voice ID (an identifier, or the start of one of 36 characters or more).</source>
        <translation>Speak with the voice ID (an identifier, or the start of one of 36 characters or more).</translation>
    </message>
    <message id="CLIRateOption">
        <source>Speak at WPM words per minute (80 to 450).</source>
        <translation>Speak at WPM words per minute (80 to 450).</translation>
    </message>
    <message id="CLIOutputOption">
        <source>Write the speech to FILE.wav (16-bit mono) instead of playing it; a device or FIFO is written in place, a folder is refused.</source>
        <translation>Write the speech to FILE.wav (16-bit mono) instead of playing it; a device or FIFO is written in place, a folder is refused.</translation>
    </message>
    <message id="CLITextOperand">
        <source>What to say.</source>
        <translation>What to say.</translation>
    </message>
    <message id="CLIRateRange">
        <source>--rate takes words per minute from 80 to 450, not '%1'</source>
        <translation>--rate takes words per minute from 80 to 450, not '%1'</translation>
    </message>
    <message id="CLICannotReadInput">
        <source>cannot read standard input</source>
        <translation>cannot read standard input</translation>
    </message>
    <message id="CLINothingToSay">
        <source>nothing to say</source>
        <translation>nothing to say</translation>
    </message>
    <message id="CLINoSuchVoice">
        <source>no installed voice '%1' (see 'cadenza voices --all')</source>
        <translation>no installed voice '%1' (see 'cadenza voices --all')</translation>
    </message>
    <message id="CLINoVoices">
        <source>no voices are installed</source>
        <translation>no voices are installed</translation>
    </message>
    <message id="CLICannotSpeak">
        <source>could not speak with '%1'</source>
        <translation>could not speak with '%1'</translation>
    </message>
    <message id="CLISpeakingFailed">
        <source>speaking failed</source>
        <translation>speaking failed</translation>
    </message>
    <message id="CLIDictateDescription">
        <source>Prints the words spoken in FILE.wav (any sample rate, format or number of channels), recognised with the installed recognizer of your preferred dictation language or the one chosen with --language.</source>
        <translation>Prints the words spoken in FILE.wav (any sample rate, format or number of channels), recognised with the installed recognizer of your preferred dictation language or the one chosen with --language.</translation>
    </message>
    <message id="CLILanguageOption">
        <source>Recognise with the recognizer of LOCALE (e.g. en_US).</source>
        <translation>Recognise with the recognizer of LOCALE (e.g. en_US).</translation>
    </message>
    <message id="CLIGrammarOption">
        <source>Recognise only the sentences of the JSGF grammar FILE.gram.</source>
        <translation>Recognise only the sentences of the JSGF grammar FILE.gram.</translation>
    </message>
    <message id="CLIMicrophoneOption">
        <source>Listen to the microphone instead of a file: partial results on standard error, the final text when Enter is pressed.</source>
        <translation>Listen to the microphone instead of a file: partial results on standard error, the final text when Enter is pressed.</translation>
    </message>
    <message id="CLIRecordingOperand">
        <source>The recording to transcribe.</source>
        <translation>The recording to transcribe.</translation>
    </message>
    <message id="CLIGiveOneRecording">
        <source>give one sound file or --microphone (see --help)</source>
        <translation>give one sound file or --microphone (see --help)</translation>
    </message>
    <message id="CLINoSuchRecording">
        <source>no file %1</source>
        <translation>no file %1</translation>
    </message>
    <message id="CLINoSuchGrammar">
        <source>no grammar file %1</source>
        <translation>no grammar file %1</translation>
    </message>
    <message id="CLINoRecognitionLanguage">
        <source>no recognition language is installed (see 'cadenza languages' and 'cadenza install')</source>
        <translation>no recognition language is installed (see 'cadenza languages' and 'cadenza install')</translation>
    </message>
    <message id="CLIListening">
        <source>Listening; press Enter to finish.</source>
        <translation>Listening; press Enter to finish.</translation>
    </message>
    <message id="CLINoWordsRecognised">
        <source>no words were recognised in %1 (%2 s of sound)</source>
        <translation>no words were recognised in %1 (%2 s of sound)</translation>
    </message>
    <message id="CLINoWordsHeard">
        <source>no words were recognised</source>
        <translation>no words were recognised</translation>
    </message>
    <message id="MicrophoneMissing">
        <source>no microphone is connected (the system lists no audio input)</source>
        <translation>no microphone is connected (the system lists no audio input)</translation>
    </message>
    <message id="MicrophoneFormatUnsupported">
        <source>the microphone '%1' cannot record 16-bit mono at %2 Hz</source>
        <translation>the microphone '%1' cannot record 16-bit mono at %2 Hz</translation>
    </message>
    <message id="MicrophoneCannotOpen">
        <source>the microphone '%1' cannot be opened</source>
        <translation>the microphone '%1' cannot be opened</translation>
    </message>
    <message id="RecognitionLanguageUnusable">
        <source>the recognition language %1 is unusable: %2</source>
        <translation>the recognition language %1 is unusable: %2</translation>
    </message>
    <message id="CLILanguagesDescription">
        <source>Lists the recognition (dictation) languages: those installed on this computer and those that can be downloaded, with their names in your language and whether you chose to show them (0 hidden, 1 shown, 2 automatic).</source>
        <translation>Lists the recognition (dictation) languages: those installed on this computer and those that can be downloaded, with their names in your language and whether you chose to show them (0 hidden, 1 shown, 2 automatic).</translation>
    </message>
    <message id="CLINoLanguages">
        <source>No recognition languages are installed or offered.</source>
        <translation>No recognition languages are installed or offered.</translation>
    </message>
    <message id="CLIKindInstalled">
        <source>installed</source>
        <translation>installed</translation>
    </message>
    <message id="CLIKindDownloadable">
        <source>downloadable</source>
        <translation>downloadable</translation>
    </message>
    <message id="CLIVoicesDescription">
        <source>Lists the installed voices: identifier, name, locale, language, country and gender, with names in your language. The default voice is marked with '*'.</source>
        <translation>Lists the installed voices: identifier, name, locale, language, country and gender, with names in your language. The default voice is marked with '*'.</translation>
    </message>
    <message id="CLIAllOption">
        <source>List every voice of every quality, not only the best quality of each voice.</source>
        <translation>List every voice of every quality, not only the best quality of each voice.</translation>
    </message>
    <message id="CLINoVoicesInstalled">
        <source>No voices are installed.</source>
        <translation>No voices are installed.</translation>
    </message>
    <message id="CLIPostDescription">
        <source>Posts the distributed notification NAME to every process of this session, such as com.vendra.speech.DefaultVoiceChangedNotification, or the dictation engine's DictationIMNotificationRecognizerDidPreHeat and DictationIMNotificationWillStartListening. 'cadenza notify' is the same command.</source>
        <translation>Posts the distributed notification NAME to every process of this session, such as com.vendra.speech.DefaultVoiceChangedNotification, or the dictation engine's DictationIMNotificationRecognizerDidPreHeat and DictationIMNotificationWillStartListening. 'cadenza notify' is the same command.</translation>
    </message>
    <message id="CLIObjectOption">
        <source>The notification's object.</source>
        <translation>The notification's object.</translation>
    </message>
    <message id="CLIInfoOption">
        <source>Adds KEY with the string VALUE to the user information; may be repeated.</source>
        <translation>Adds KEY with the string VALUE to the user information; may be repeated.</translation>
    </message>
    <message id="CLINameOperand">
        <source>The notification's name.</source>
        <translation>The notification's name.</translation>
    </message>
    <message id="CLIGiveOneName">
        <source>give exactly one notification name</source>
        <translation>give exactly one notification name</translation>
    </message>
    <message id="CLIInfoFormat">
        <source>--info takes KEY=VALUE, not '%1'</source>
        <translation>--info takes KEY=VALUE, not '%1'</translation>
    </message>
    <message id="CLINoSessionBus">
        <source>no session bus: nobody else can hear the notification</source>
        <translation>no session bus: nobody else can hear the notification</translation>
    </message>
    <message id="CLIDownloadablesDescription">
        <source>Lists the voices and recognition languages that can be downloaded or upgraded, with their download status (1 upgrade available, 2 not installed, 3 downloading, 4 waiting) and size.</source>
        <translation>Lists the voices and recognition languages that can be downloaded or upgraded, with their download status (1 upgrade available, 2 not installed, 3 downloading, 4 waiting) and size.</translation>
    </message>
    <message id="CLIRemoveDescription">
        <source>Removes a downloaded voice (by identifier) or recognition language (by locale, such as de_DE), asking for administrator rights when it is installed for every user, and records the removal.</source>
        <translation>Removes a downloaded voice (by identifier) or recognition language (by locale, such as de_DE), asking for administrator rights when it is installed for every user, and records the removal.</translation>
    </message>
    <message id="CLIRemoveOperand">
        <source>What to remove.</source>
        <translation>What to remove.</translation>
    </message>
    <message id="CLIGiveOneVoiceOrLocale">
        <source>give one voice identifier or locale</source>
        <translation>give one voice identifier or locale</translation>
    </message>
    <message id="CLINotRemovable">
        <source>'%1' is not a downloaded voice or language that can be removed</source>
        <translation>'%1' is not a downloaded voice or language that can be removed</translation>
    </message>
    <message id="CLINotRemoved">
        <source>%1 was not removed</source>
        <translation>%1 was not removed</translation>
    </message>
    <message id="CLIRemoved">
        <source>Removed %1</source>
        <translation>Removed %1</translation>
    </message>
    <message id="CLIUpgradeDescription">
        <source>Starts downloading the best quality of voice ID in the background when the rules allow it: on mains power, not removed or prohibited by the user, within the attempt limits. Prints whether it may go on.</source>
        <translation>Starts downloading the best quality of voice ID in the background when the rules allow it: on mains power, not removed or prohibited by the user, within the attempt limits. Prints whether it may go on.</translation>
    </message>
    <message id="CLIVoiceOperand">
        <source>A voice identifier.</source>
        <translation>A voice identifier.</translation>
    </message>
    <message id="CLIGiveOneVoice">
        <source>give one voice identifier</source>
        <translation>give one voice identifier</translation>
    </message>
    <message id="CLIPowerDescription">
        <source>Says whether this computer runs on mains power ("AC Power").</source>
        <translation>Says whether this computer runs on mains power ("AC Power").</translation>
    </message>
    <message id="InstallerUnreachableAlertTitleText">
        <source>The download could not be started.</source>
        <translation>The download could not be started.</translation>
    </message>
    <message id="InstallerUnreachableAlertMessageText">
        <source>The installer daemon quillond is not running, so %1 cannot be downloaded. Start quillond and try again.</source>
        <translation>The installer daemon quillond is not running, so %1 cannot be downloaded. Start quillond and try again.</translation>
    </message>
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
        <source>Downloading %1</source>
        <translation>Downloading %1</translation>
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
    <message id="SettingsSpeechDispatcherInstall">
        <source>Use Cadenza Voices in Other Apps</source>
        <translation>Use Cadenza Voices in Other Apps</translation>
    </message>
    <message id="SettingsSpeechDispatcherRemove">
        <source>Stop Using Cadenza Voices in Other Apps</source>
        <translation>Stop Using Cadenza Voices in Other Apps</translation>
    </message>
    <message id="SettingsSpeechDispatcherInstalled">
        <source>Cadenza voices are offered to screen readers, browsers and other apps through speech-dispatcher.</source>
        <translation>Cadenza voices are offered to screen readers, browsers and other apps through speech-dispatcher.</translation>
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
    <message id="SettingsTryDictationPreparing">
        <source>Preparing…</source>
        <translation>Preparing…</translation>
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
        <source>rate %1</source>
        <translation>rate %1</translation>
    </message>
    <message id="SettingsVolumeFormat">
        <source>volume %1</source>
        <translation>volume %1</translation>
    </message>
    <message id="DownloadVariantAccessibleFormat">
        <source>Download size for %1</source>
        <translation>Download size for %1</translation>
    </message>
    <message id="LanguageWithCountryFormat">
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
    <message id="AccessibleRowNameFormat">
        <source>%1, %2</source>
        <translation>%1, %2</translation>
    </message>
    <message id="VoiceDownloadProgressName">
        <source>Voice download progress</source>
        <translation>Voice download progress</translation>
    </message>
    <message id="LanguageDownloadProgressName">
        <source>Language download progress</source>
        <translation>Language download progress</translation>
    </message>
    <message id="SearchClearButtonName">
        <source>Clear search</source>
        <translation>Clear search</translation>
    </message>
</context>
</TS>
