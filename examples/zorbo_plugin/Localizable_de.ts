<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!DOCTYPE TS>
<TS version="2.1" language="de" sourcelanguage="en">
<context>
    <name></name>
    <message id="BRAND_NAME"><source></source><translation>Zorbo</translation></message>
    <message id="SUPPORT_URL"><source></source><translation>https://help.zorbo.example/de/</translation></message>
    <message id="AUTO_DISCOVER_DOMAIN"><source></source><translation>zorbo.example</translation></message>
    <message id="DEFAULT_ACCOUNT_DESCRIPTION"><source></source><translation>Zorbo-Account</translation></message>
    <message id="USER_NAME_LABEL"><source></source><translation>E-Mail-Adresse:</translation></message>
    <message id="PASSWORD_LABEL"><source></source><translation>Passwort:</translation></message>
    <message id="FULL_NAME_LABEL"><source></source><translation>Vollständiger Name:</translation></message>
    <message id="SERVICE_DISPLAY_NAME_MAIL"><source></source><translation>Zorbo Mail</translation></message>
    <message id="SERVICE_DISPLAY_NAME_CALENDARS"><source></source><translation>Zorbo Kalender</translation></message>
    <message id="SERVICE_DISPLAY_NAME_CONTACTS"><source></source><translation>Zorbo Kontakte</translation></message>
    <message id="SERVICE_DISPLAY_NAME_IM"><source></source><translation>Zorbo Talk</translation></message>
    <message id="MAIL_DATA_NAME"><source></source><translation>E-Mail</translation></message>
    <message id="CALENDAR_DATA_NAME"><source></source><translation>Kalender</translation></message>
    <message id="CD_DATA_NAME"><source></source><translation>Kontakte</translation></message>
    <message id="PARLEX_DATA_NAME"><source></source><translation>Nachrichten</translation></message>
    <message id="SIGN_IN_TITLE"><source></source><translation>Zorbo-Account hinzufügen</translation></message>
    <message id="SIGN_IN_AGAIN_TITLE"><source></source><translation>Neu bei Zorbo anmelden</translation></message>
    <message id="CONTINUE"><source></source><translation>Fortfahren</translation></message>
    <message id="CANCEL"><source></source><translation>Abbrechen</translation></message>
    <message id="BACK"><source></source><translation>Zurück</translation></message>
    <message id="ADD_ACCOUNT"><source></source><translation>Account hinzufügen</translation></message>
    <message id="OK"><source></source><translation>OK</translation></message>
    <message id="APP_SELECTION_TEXT"><source></source><translation>Diesen Account verwenden für:</translation></message>
    <message id="STATUS_SIGNING_IN"><source></source><translation>Anmeldung als %1 …</translation></message>
    <message id="STATUS_SAVING"><source></source><translation>Der Account wird gesichert …</translation></message>
    <message id="ERROR_REFUSED"><source></source><translation>Zorbo nimmt dieses Passwort für %1 nicht an.</translation></message>
    <message id="ERROR_NO_ANSWER"><source></source><translation>Zorbo hat nicht geantwortet. Prüfen Sie die Netzwerkverbindung und versuchen Sie es noch einmal.</translation></message>
    <message id="ERROR_EXISTS"><source></source><translation>%1 gehört bereits zu Ihren Accounts.</translation></message>
    <message id="ERROR_PASSWORD_NOT_STORED"><source></source><translation>Das Passwort konnte nicht abgelegt werden, deshalb wurde nichts geändert. Entsperren Sie Ihren Passwortspeicher und versuchen Sie es noch einmal.</translation></message>
    <message id="ERROR_NOT_SAVED"><source></source><translation>Der Account %1 konnte nicht gesichert werden.</translation></message>
    <message id="SWITCH_NO_PLUGIN"><source></source><translation>%1 ist nicht erreichbar: Das Plug-in, das es mit Ihren Accounts verbindet, ist nicht installiert.</translation></message>
    <message id="SWITCH_ON_FAILED"><source></source><translation>Der Account konnte in %1 nicht eingeschaltet werden. %2</translation></message>
    <message id="SWITCH_OFF_FAILED"><source></source><translation>Der Account konnte in %1 nicht ausgeschaltet werden.</translation></message>
    <message id="SWITCH_NO_ANSWER"><source></source><translation>%1 hat nicht geantwortet.</translation></message>
    <message id="SWITCH_STILL_OFF"><source></source><translation>Er ist immer noch ausgeschaltet.</translation></message>
</context>
</TS>
