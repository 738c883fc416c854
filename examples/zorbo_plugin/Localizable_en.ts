<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!DOCTYPE TS>
<TS version="2.1" language="en" sourcelanguage="en">
<context>
    <name></name>
    <message id="BRAND_NAME"><source></source><translation>Zorbo</translation></message>
    <message id="SUPPORT_URL"><source></source><translation>https://help.zorbo.example/en/</translation></message>
    <message id="AUTO_DISCOVER_DOMAIN"><source></source><translation>zorbo.example</translation></message>
    <message id="DEFAULT_ACCOUNT_DESCRIPTION"><source></source><translation>Zorbo account</translation></message>
    <message id="USER_NAME_LABEL"><source></source><translation>E-mail address:</translation></message>
    <message id="PASSWORD_LABEL"><source></source><translation>Password:</translation></message>
    <message id="FULL_NAME_LABEL"><source></source><translation>Full name:</translation></message>
    <message id="SERVICE_DISPLAY_NAME_MAIL"><source></source><translation>Zorbo Mail</translation></message>
    <message id="SERVICE_DISPLAY_NAME_CALENDARS"><source></source><translation>Zorbo Calendars</translation></message>
    <message id="SERVICE_DISPLAY_NAME_CONTACTS"><source></source><translation>Zorbo Contacts</translation></message>
    <message id="SERVICE_DISPLAY_NAME_IM"><source></source><translation>Zorbo Talk</translation></message>
    <message id="MAIL_DATA_NAME"><source></source><translation>Mail</translation></message>
    <message id="CALENDAR_DATA_NAME"><source></source><translation>Calendars</translation></message>
    <message id="CD_DATA_NAME"><source></source><translation>Contacts</translation></message>
    <message id="PARLEX_DATA_NAME"><source></source><translation>Messages</translation></message>
    <message id="SIGN_IN_TITLE"><source></source><translation>Add a Zorbo account</translation></message>
    <message id="SIGN_IN_AGAIN_TITLE"><source></source><translation>Sign in to Zorbo again</translation></message>
    <message id="CONTINUE"><source></source><translation>Continue</translation></message>
    <message id="CANCEL"><source></source><translation>Cancel</translation></message>
    <message id="BACK"><source></source><translation>Back</translation></message>
    <message id="ADD_ACCOUNT"><source></source><translation>Add Account</translation></message>
    <message id="OK"><source></source><translation>OK</translation></message>
    <message id="APP_SELECTION_TEXT"><source></source><translation>Use this account with:</translation></message>
    <message id="STATUS_SIGNING_IN"><source></source><translation>Signing in as %1…</translation></message>
    <message id="STATUS_SAVING"><source></source><translation>Saving the account…</translation></message>
    <message id="ERROR_REFUSED"><source></source><translation>Zorbo does not accept this password for %1.</translation></message>
    <message id="ERROR_NO_ANSWER"><source></source><translation>Zorbo has not answered. Check the network connection and try again.</translation></message>
    <message id="ERROR_EXISTS"><source></source><translation>%1 is already among your accounts.</translation></message>
    <message id="ERROR_PASSWORD_NOT_STORED"><source></source><translation>The password could not be stored, so nothing was changed. Unlock your password store and try again.</translation></message>
    <message id="ERROR_NOT_SAVED"><source></source><translation>The account %1 could not be saved.</translation></message>
    <message id="SWITCH_NO_PLUGIN"><source></source><translation>%1 cannot be reached: the plug-in that connects it with your accounts is not installed.</translation></message>
    <message id="SWITCH_ON_FAILED"><source></source><translation>The account could not be turned on in %1. %2</translation></message>
    <message id="SWITCH_OFF_FAILED"><source></source><translation>The account could not be turned off in %1.</translation></message>
    <message id="SWITCH_NO_ANSWER"><source></source><translation>%1 has not answered.</translation></message>
    <message id="SWITCH_STILL_OFF"><source></source><translation>It is still off.</translation></message>
</context>
</TS>
