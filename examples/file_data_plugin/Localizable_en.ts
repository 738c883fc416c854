<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!DOCTYPE TS>
<TS version="2.1" language="en" sourcelanguage="en">
<context>
    <name></name>
    <message id="STATUS_LOOKING"><source></source><translation>Looking for the account’s servers…</translation></message>
    <message id="ERROR_WRONG_KIND"><source></source><translation>This application cannot use an account of that kind.</translation></message>
    <message id="ERROR_NO_ADDRESS"><source></source><translation>It is not known whose account this is: an address or a user name is missing.</translation></message>
    <message id="ERROR_NO_SERVER"><source></source><translation>No server could be found for the account.</translation></message>
    <message id="ERROR_NOT_VERIFIED"><source></source><translation>The account could not be tried, because there is no password.</translation></message>
    <message id="ERROR_NOT_DISCOVERED"><source></source><translation>The account cannot be made before its servers have been found.</translation></message>
    <message id="ERROR_FILE_BUSY"><source></source><translation>The accounts in %1 are being changed by another program. Try again in a moment.</translation></message>
    <message id="ERROR_FILE_UNREADABLE"><source></source><translation>The accounts in %1 cannot be read: %2.</translation></message>
    <message id="ERROR_FILE_DAMAGED"><source></source><translation>The file %1 is damaged: %2. It is put aside before the next change.</translation></message>
    <message id="ERROR_FILE_NOT_COPIED"><source></source><translation>The file %1 is damaged, and it is left alone because no copy of it can be made: %2.</translation></message>
    <message id="ERROR_FILE_UNWRITABLE"><source></source><translation>The accounts in %1 cannot be saved: %2.</translation></message>
    <message id="CONFIGURE_TITLE"><source></source><translation>Account Settings</translation></message>
    <message id="CONFIGURE_LABEL"><source></source><translation>Description of %1:</translation></message>
    <message id="CONFIGURE_SAVE"><source></source><translation>Save</translation></message>
    <message id="CONFIGURE_CANCEL"><source></source><translation>Cancel</translation></message>
</context>
</TS>
