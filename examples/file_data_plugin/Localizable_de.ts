<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!DOCTYPE TS>
<TS version="2.1" language="de" sourcelanguage="en">
<context>
    <name></name>
    <message id="STATUS_LOOKING"><source></source><translation>Die Server des Accounts werden gesucht …</translation></message>
    <message id="ERROR_WRONG_KIND"><source></source><translation>Dieses Programm kann mit einem Account dieser Art nichts anfangen.</translation></message>
    <message id="ERROR_NO_ADDRESS"><source></source><translation>Es ist nicht bekannt, wessen Account das ist: Eine Adresse oder ein Benutzername fehlt.</translation></message>
    <message id="ERROR_NO_SERVER"><source></source><translation>Für den Account wurde kein Server gefunden.</translation></message>
    <message id="ERROR_NOT_VERIFIED"><source></source><translation>Der Account konnte nicht ausprobiert werden, weil es kein Passwort gibt.</translation></message>
    <message id="ERROR_NOT_DISCOVERED"><source></source><translation>Der Account kann erst angelegt werden, wenn seine Server gefunden sind.</translation></message>
    <message id="ERROR_FILE_BUSY"><source></source><translation>Die Accounts in %1 werden gerade von einem anderen Programm geändert. Versuchen Sie es gleich noch einmal.</translation></message>
    <message id="ERROR_FILE_UNREADABLE"><source></source><translation>Die Accounts in %1 können nicht gelesen werden: %2.</translation></message>
    <message id="ERROR_FILE_DAMAGED"><source></source><translation>Die Datei %1 ist beschädigt: %2. Sie wird vor der nächsten Änderung beiseitegelegt.</translation></message>
    <message id="ERROR_FILE_NOT_COPIED"><source></source><translation>Die Datei %1 ist beschädigt und bleibt unangetastet, weil sie nicht kopiert werden kann: %2.</translation></message>
    <message id="ERROR_FILE_UNWRITABLE"><source></source><translation>Die Accounts in %1 können nicht gesichert werden: %2.</translation></message>
    <message id="CONFIGURE_TITLE"><source></source><translation>Account-Einstellungen</translation></message>
    <message id="CONFIGURE_LABEL"><source></source><translation>Beschreibung von %1:</translation></message>
    <message id="CONFIGURE_SAVE"><source></source><translation>Sichern</translation></message>
    <message id="CONFIGURE_CANCEL"><source></source><translation>Abbrechen</translation></message>
</context>
</TS>
