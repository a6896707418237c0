<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<!-- SPDX-FileCopyrightText: 2026 The Cadenza developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<TS version="2.1" language="de_DE">
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
        <translation>Aufruf: cadenza BEFEHL [OPTIONEN]

Befehle:
  voices         die installierten Stimmen auflisten
  say            einen Text sprechen oder in eine WAV-Datei schreiben
  languages      die installierten und ladbaren Diktiersprachen auflisten
  dictate        die in einer WAV-Datei (oder am Mikrofon) gesprochenen Wörter ausgeben
  post           allen Prozessen der Sitzung eine Mitteilung senden
  notify         dasselbe wie post, z. B. cadenza notify DictationIMNotificationRecognizerDidPreHeat
  status         zeigen, was der Installationsdienst gerade installiert
  install        eine Stimme oder Diktiersprache anhand ihres Kennzeichens installieren
  cancel         alle Installationen abbrechen
  downloadables  auflisten, was geladen oder verbessert werden kann
  remove         eine geladene Stimme oder Diktiersprache entfernen
  upgrade        die beste Qualität einer Stimme im Hintergrund laden, wenn erlaubt
  power          sagen, ob dieser Computer am Stromnetz läuft

„cadenza BEFEHL --help“ zeigt die Optionen eines Befehls.</translation>
    </message>
    <message id="CLIExitStatusHelp">
        <source>Exit status: 0 success, 1 the operation failed, 2 bad usage (unknown option, stray operand, bad value), 3 the installer daemon cannot be reached.</source>
        <translation>Rückgabewert: 0 Erfolg, 1 der Vorgang ist fehlgeschlagen, 2 falscher Aufruf (unbekannte Option, überzähliges Argument, ungültiger Wert), 3 der Installationsdienst ist nicht erreichbar.</translation>
    </message>
    <message id="CLIUnknownCommand">
        <source>unknown command '%1'</source>
        <translation>unbekannter Befehl „%1“</translation>
    </message>
    <message id="CLIUnknownOption">
        <source>unknown option '%1'</source>
        <translation>unbekannte Option „%1“</translation>
    </message>
    <message id="CLIUnexpectedArgument">
        <source>unexpected argument '%1'</source>
        <translation>unerwartetes Argument „%1“</translation>
    </message>
    <message id="CLIDaemonNotRunning">
        <source>The installer daemon is not running.</source>
        <translation>Der Installationsdienst läuft nicht.</translation>
    </message>
    <message id="CLIDaemonUnreachable">
        <source>the installer daemon cannot be reached (start quillond)</source>
        <translation>der Installationsdienst ist nicht erreichbar (starten Sie quillond)</translation>
    </message>
    <message id="CLIDaemonStopped">
        <source>the installer daemon stopped</source>
        <translation>der Installationsdienst wurde beendet</translation>
    </message>
    <message id="CLINothingInstalling">
        <source>Nothing is being installed.</source>
        <translation>Es wird nichts installiert.</translation>
    </message>
    <message id="CLIStatusWaiting">
        <source>%1: waiting</source>
        <translation>%1: wartet</translation>
    </message>
    <message id="CLIStatusDownloading">
        <source>%1: downloading, %2 %%, %3 of %4 bytes</source>
        <translation>%1: wird geladen, %2 %%, %3 von %4 Byte</translation>
    </message>
    <message id="CLIStatusSecondsLeft">
        <source>, about %1 s left</source>
        <translation>, noch etwa %1 s</translation>
    </message>
    <message id="CLIStatusInstalling">
        <source>%1: installing</source>
        <translation>%1: wird installiert</translation>
    </message>
    <message id="CLIStatusPreparing">
        <source>%1: preparing</source>
        <translation>%1: wird vorbereitet</translation>
    </message>
    <message id="CLIStatusDescription">
        <source>Shows the installations that the installer daemon is working on.</source>
        <translation>Zeigt die Installationen, an denen der Installationsdienst arbeitet.</translation>
    </message>
    <message id="CLIJsonRecordsOption">
        <source>Print the daemon's records as JSON.</source>
        <translation>Die Einträge des Dienstes als JSON ausgeben.</translation>
    </message>
    <message id="CLIJsonOption">
        <source>Print a JSON array instead of a table.</source>
        <translation>Ein JSON-Feld statt einer Tabelle ausgeben.</translation>
    </message>
    <message id="CLIInstallDescription">
        <source>Asks the installer daemon to install TAG, such as VOICEID:com.vendra.speech.synthesis.voice.tobias.premium or SRCLANGID:de_DE, and waits until it is installed unless --no-wait is given.</source>
        <translation>Bittet den Installationsdienst, TAG zu installieren, etwa VOICEID:com.vendra.speech.synthesis.voice.tobias.premium oder SRCLANGID:de_DE, und wartet bis zum Ende, außer mit --no-wait.</translation>
    </message>
    <message id="CLINoWaitOption">
        <source>Return once the request is sent.</source>
        <translation>Zurückkehren, sobald die Anfrage gesendet ist.</translation>
    </message>
    <message id="CLITagOperand">
        <source>The installer tag of the item.</source>
        <translation>Das Installationskennzeichen des Eintrags.</translation>
    </message>
    <message id="CLIGiveOneTag">
        <source>give exactly one tag</source>
        <translation>geben Sie genau ein Kennzeichen an</translation>
    </message>
    <message id="CLIEmptyTag">
        <source>the tag is empty</source>
        <translation>das Kennzeichen ist leer</translation>
    </message>
    <message id="CLITagTooLong">
        <source>the tag is longer than %1 characters</source>
        <translation>das Kennzeichen ist länger als %1 Zeichen</translation>
    </message>
    <message id="CLIInstalled">
        <source>Installed %1</source>
        <translation>%1 installiert</translation>
    </message>
    <message id="CLIInstallCancelled">
        <source>the installation of %1 was cancelled</source>
        <translation>die Installation von %1 wurde abgebrochen</translation>
    </message>
    <message id="CLIInstallFailed">
        <source>installing %1 failed: %2</source>
        <translation>die Installation von %1 ist fehlgeschlagen: %2</translation>
    </message>
    <message id="CLICancelDescription">
        <source>Cancels every installation of the installer daemon.</source>
        <translation>Bricht alle Installationen des Installationsdienstes ab.</translation>
    </message>
    <message id="CLISayDescription">
        <source>Speaks TEXT (or standard input when no TEXT is given) with the default voice or the one chosen with --voice, on the audio output or into a WAV file.</source>
        <translation>Spricht TEXT (oder die Standardeingabe, wenn kein TEXT angegeben ist) mit der Standardstimme oder der mit --voice gewählten, über die Audioausgabe oder in eine WAV-Datei.</translation>
    </message>
    <message id="CLIVoiceOption">
        <source>Speak with the voice ID (an identifier, or the start of one of 36 characters or more).</source>
        <translation>Mit der Stimme ID sprechen (eine Kennung oder deren Anfang aus 36 oder mehr Zeichen).</translation>
    </message>
    <message id="CLIRateOption">
        <source>Speak at WPM words per minute (80 to 450).</source>
        <translation>Mit WPM Wörtern pro Minute sprechen (80 bis 450).</translation>
    </message>
    <message id="CLIOutputOption">
        <source>Write the speech to FILE.wav (16-bit mono) instead of playing it; a device or FIFO is written in place, a folder is refused.</source>
        <translation>Die Sprache in FILE.wav (16 Bit mono) schreiben statt sie abzuspielen; ein Gerät oder FIFO wird direkt beschrieben, ein Ordner abgelehnt.</translation>
    </message>
    <message id="CLITextOperand">
        <source>What to say.</source>
        <translation>Was gesagt werden soll.</translation>
    </message>
    <message id="CLIRateRange">
        <source>--rate takes words per minute from 80 to 450, not '%1'</source>
        <translation>--rate erwartet Wörter pro Minute von 80 bis 450, nicht „%1“</translation>
    </message>
    <message id="CLICannotReadInput">
        <source>cannot read standard input</source>
        <translation>die Standardeingabe kann nicht gelesen werden</translation>
    </message>
    <message id="CLINothingToSay">
        <source>nothing to say</source>
        <translation>nichts zu sagen</translation>
    </message>
    <message id="CLINoSuchVoice">
        <source>no installed voice '%1' (see 'cadenza voices --all')</source>
        <translation>keine installierte Stimme „%1“ (siehe „cadenza voices --all“)</translation>
    </message>
    <message id="CLINoVoices">
        <source>no voices are installed</source>
        <translation>es sind keine Stimmen installiert</translation>
    </message>
    <message id="CLICannotSpeak">
        <source>could not speak with '%1'</source>
        <translation>mit „%1“ kann nicht gesprochen werden</translation>
    </message>
    <message id="CLISpeakingFailed">
        <source>speaking failed</source>
        <translation>das Sprechen ist fehlgeschlagen</translation>
    </message>
    <message id="CLIDictateDescription">
        <source>Prints the words spoken in FILE.wav (any sample rate, format or number of channels), recognised with the installed recognizer of your preferred dictation language or the one chosen with --language.</source>
        <translation>Gibt die in FILE.wav gesprochenen Wörter aus (jede Abtastrate, jedes Format, jede Kanalzahl), erkannt mit der installierten Erkennung Ihrer bevorzugten Diktiersprache oder der mit --language gewählten.</translation>
    </message>
    <message id="CLILanguageOption">
        <source>Recognise with the recognizer of LOCALE (e.g. en_US).</source>
        <translation>Mit der Erkennung von LOCALE erkennen (z. B. en_US).</translation>
    </message>
    <message id="CLIGrammarOption">
        <source>Recognise only the sentences of the JSGF grammar FILE.gram.</source>
        <translation>Nur die Sätze der JSGF-Grammatik FILE.gram erkennen.</translation>
    </message>
    <message id="CLIMicrophoneOption">
        <source>Listen to the microphone instead of a file: partial results on standard error, the final text when Enter is pressed.</source>
        <translation>Dem Mikrofon statt einer Datei zuhören: Zwischenergebnisse auf der Standardfehlerausgabe, der fertige Text, sobald die Eingabetaste gedrückt wird.</translation>
    </message>
    <message id="CLIRecordingOperand">
        <source>The recording to transcribe.</source>
        <translation>Die Aufnahme, die abgeschrieben werden soll.</translation>
    </message>
    <message id="CLIGiveOneRecording">
        <source>give one sound file or --microphone (see --help)</source>
        <translation>geben Sie eine Tondatei oder --microphone an (siehe --help)</translation>
    </message>
    <message id="CLINoSuchRecording">
        <source>no file %1</source>
        <translation>keine Datei %1</translation>
    </message>
    <message id="CLINoSuchGrammar">
        <source>no grammar file %1</source>
        <translation>keine Grammatikdatei %1</translation>
    </message>
    <message id="CLINoRecognitionLanguage">
        <source>no recognition language is installed (see 'cadenza languages' and 'cadenza install')</source>
        <translation>keine Diktiersprache ist installiert (siehe „cadenza languages“ und „cadenza install“)</translation>
    </message>
    <message id="CLIListening">
        <source>Listening; press Enter to finish.</source>
        <translation>Ich höre zu; zum Beenden die Eingabetaste drücken.</translation>
    </message>
    <message id="CLINoWordsRecognised">
        <source>no words were recognised in %1 (%2 s of sound)</source>
        <translation>in %1 wurden keine Wörter erkannt (%2 s Ton)</translation>
    </message>
    <message id="CLINoWordsHeard">
        <source>no words were recognised</source>
        <translation>es wurden keine Wörter erkannt</translation>
    </message>
    <message id="MicrophoneMissing">
        <source>no microphone is connected (the system lists no audio input)</source>
        <translation>kein Mikrofon ist angeschlossen (das System kennt keinen Toneingang)</translation>
    </message>
    <message id="MicrophoneFormatUnsupported">
        <source>the microphone '%1' cannot record 16-bit mono at %2 Hz</source>
        <translation>das Mikrofon „%1“ kann nicht 16 Bit mono mit %2 Hz aufnehmen</translation>
    </message>
    <message id="MicrophoneCannotOpen">
        <source>the microphone '%1' cannot be opened</source>
        <translation>das Mikrofon „%1“ lässt sich nicht öffnen</translation>
    </message>
    <message id="RecognitionLanguageUnusable">
        <source>the recognition language %1 is unusable: %2</source>
        <translation>die Diktiersprache %1 ist nicht nutzbar: %2</translation>
    </message>
    <message id="CLILanguagesDescription">
        <source>Lists the recognition (dictation) languages: those installed on this computer and those that can be downloaded, with their names in your language and whether you chose to show them (0 hidden, 1 shown, 2 automatic).</source>
        <translation>Listet die Diktiersprachen auf: die auf diesem Computer installierten und die ladbaren, mit ihren Namen in Ihrer Sprache und ob Sie sie anzeigen lassen (0 ausgeblendet, 1 angezeigt, 2 automatisch).</translation>
    </message>
    <message id="CLINoLanguages">
        <source>No recognition languages are installed or offered.</source>
        <translation>Es sind keine Diktiersprachen installiert oder verfügbar.</translation>
    </message>
    <message id="CLIKindInstalled">
        <source>installed</source>
        <translation>installiert</translation>
    </message>
    <message id="CLIKindDownloadable">
        <source>downloadable</source>
        <translation>ladbar</translation>
    </message>
    <message id="CLIVoicesDescription">
        <source>Lists the installed voices: identifier, name, locale, language, country and gender, with names in your language. The default voice is marked with '*'.</source>
        <translation>Listet die installierten Stimmen auf: Kennung, Name, Gebietsschema, Sprache, Land und Geschlecht, mit Namen in Ihrer Sprache. Die Standardstimme ist mit „*“ markiert.</translation>
    </message>
    <message id="CLIAllOption">
        <source>List every voice of every quality, not only the best quality of each voice.</source>
        <translation>Jede Stimme in jeder Qualität auflisten, nicht nur die beste Qualität jeder Stimme.</translation>
    </message>
    <message id="CLINoVoicesInstalled">
        <source>No voices are installed.</source>
        <translation>Es sind keine Stimmen installiert.</translation>
    </message>
    <message id="CLIPostDescription">
        <source>Posts the distributed notification NAME to every process of this session, such as com.vendra.speech.DefaultVoiceChangedNotification, or the dictation engine's DictationIMNotificationRecognizerDidPreHeat and DictationIMNotificationWillStartListening. 'cadenza notify' is the same command.</source>
        <translation>Sendet die Mitteilung NAME an alle Prozesse dieser Sitzung, etwa com.vendra.speech.DefaultVoiceChangedNotification oder die Mitteilungen DictationIMNotificationRecognizerDidPreHeat und DictationIMNotificationWillStartListening des Diktierdienstes. „cadenza notify“ ist derselbe Befehl.</translation>
    </message>
    <message id="CLIObjectOption">
        <source>The notification's object.</source>
        <translation>Das Objekt der Mitteilung.</translation>
    </message>
    <message id="CLIInfoOption">
        <source>Adds KEY with the string VALUE to the user information; may be repeated.</source>
        <translation>Fügt KEY mit dem Text VALUE zu den Zusatzangaben hinzu; mehrfach möglich.</translation>
    </message>
    <message id="CLINameOperand">
        <source>The notification's name.</source>
        <translation>Der Name der Mitteilung.</translation>
    </message>
    <message id="CLIGiveOneName">
        <source>give exactly one notification name</source>
        <translation>geben Sie genau einen Mitteilungsnamen an</translation>
    </message>
    <message id="CLIInfoFormat">
        <source>--info takes KEY=VALUE, not '%1'</source>
        <translation>--info erwartet KEY=VALUE, nicht „%1“</translation>
    </message>
    <message id="CLINoSessionBus">
        <source>no session bus: nobody else can hear the notification</source>
        <translation>kein Sitzungsbus: niemand sonst kann die Mitteilung hören</translation>
    </message>
    <message id="CLIDownloadablesDescription">
        <source>Lists the voices and recognition languages that can be downloaded or upgraded, with their download status (1 upgrade available, 2 not installed, 3 downloading, 4 waiting) and size.</source>
        <translation>Listet die Stimmen und Diktiersprachen auf, die geladen oder verbessert werden können, mit ihrem Ladestatus (1 Verbesserung verfügbar, 2 nicht installiert, 3 wird geladen, 4 wartet) und ihrer Größe.</translation>
    </message>
    <message id="CLIRemoveDescription">
        <source>Removes a downloaded voice (by identifier) or recognition language (by locale, such as de_DE), asking for administrator rights when it is installed for every user, and records the removal.</source>
        <translation>Entfernt eine geladene Stimme (nach Kennung) oder Diktiersprache (nach Gebietsschema, etwa de_DE), fragt nach Administratorrechten, wenn sie für alle Benutzer installiert ist, und vermerkt die Entfernung.</translation>
    </message>
    <message id="CLIRemoveOperand">
        <source>What to remove.</source>
        <translation>Was entfernt werden soll.</translation>
    </message>
    <message id="CLIGiveOneVoiceOrLocale">
        <source>give one voice identifier or locale</source>
        <translation>geben Sie eine Stimmkennung oder ein Gebietsschema an</translation>
    </message>
    <message id="CLINotRemovable">
        <source>'%1' is not a downloaded voice or language that can be removed</source>
        <translation>„%1“ ist keine geladene Stimme oder Sprache, die entfernt werden kann</translation>
    </message>
    <message id="CLINotRemoved">
        <source>%1 was not removed</source>
        <translation>%1 wurde nicht entfernt</translation>
    </message>
    <message id="CLIRemoved">
        <source>Removed %1</source>
        <translation>%1 entfernt</translation>
    </message>
    <message id="CLIUpgradeDescription">
        <source>Starts downloading the best quality of voice ID in the background when the rules allow it: on mains power, not removed or prohibited by the user, within the attempt limits. Prints whether it may go on.</source>
        <translation>Beginnt, die beste Qualität der Stimme ID im Hintergrund zu laden, wenn die Regeln es erlauben: am Stromnetz, nicht vom Benutzer entfernt oder verboten, innerhalb der Versuchsgrenzen. Gibt aus, ob es weitergehen darf.</translation>
    </message>
    <message id="CLIVoiceOperand">
        <source>A voice identifier.</source>
        <translation>Eine Stimmkennung.</translation>
    </message>
    <message id="CLIGiveOneVoice">
        <source>give one voice identifier</source>
        <translation>geben Sie eine Stimmkennung an</translation>
    </message>
    <message id="CLIPowerDescription">
        <source>Says whether this computer runs on mains power ("AC Power").</source>
        <translation>Sagt, ob dieser Computer am Stromnetz läuft („AC Power“).</translation>
    </message>
    <message id="InstallerUnreachableAlertTitleText">
        <source>The download could not be started.</source>
        <translation>Das Laden konnte nicht beginnen.</translation>
    </message>
    <message id="InstallerUnreachableAlertMessageText">
        <source>The installer daemon quillond is not running, so %1 cannot be downloaded. Start quillond and try again.</source>
        <translation>Der Installationsdienst quillond läuft nicht, deshalb kann %1 nicht geladen werden. Starten Sie quillond und versuchen Sie es erneut.</translation>
    </message>
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
        <source>Downloading %1</source>
        <translation>Wird geladen: %1</translation>
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
        <translation>Sprachausgabe</translation>
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
    <message id="SettingsSpeechDispatcherInstall">
        <source>Use Cadenza Voices in Other Apps</source>
        <translation>Cadenza-Stimmen in anderen Apps verwenden</translation>
    </message>
    <message id="SettingsSpeechDispatcherRemove">
        <source>Stop Using Cadenza Voices in Other Apps</source>
        <translation>Cadenza-Stimmen nicht mehr in anderen Apps verwenden</translation>
    </message>
    <message id="SettingsSpeechDispatcherInstalled">
        <source>Cadenza voices are offered to screen readers, browsers and other apps through speech-dispatcher.</source>
        <translation>Cadenza-Stimmen stehen Bildschirmlesern, Browsern und anderen Apps über speech-dispatcher zur Verfügung.</translation>
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
    <message id="SettingsTryDictationPreparing">
        <source>Preparing…</source>
        <translation>Wird vorbereitet …</translation>
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
        <source>rate %1</source>
        <translation>Tempo %1</translation>
    </message>
    <message id="SettingsVolumeFormat">
        <source>volume %1</source>
        <translation>Lautstärke %1</translation>
    </message>
    <message id="DownloadVariantAccessibleFormat">
        <source>Download size for %1</source>
        <translation>Downloadgröße für %1</translation>
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
        <translation>Fortschritt des Stimmen-Downloads</translation>
    </message>
    <message id="LanguageDownloadProgressName">
        <source>Language download progress</source>
        <translation>Fortschritt des Sprachpaket-Downloads</translation>
    </message>
    <message id="SearchClearButtonName">
        <source>Clear search</source>
        <translation>Suche leeren</translation>
    </message>
</context>
</TS>
