<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!DOCTYPE TS>
<TS version="2.1" language="en" sourcelanguage="en">
<context>
    <name></name>
    <message id="AUTO_DISCOVER_DOMAIN"><source></source><translation>discover.example</translation></message>
    <message id="MAIL_DATA_NAME"><source></source><translation>Our Mail</translation></message>
    <message id="CALENDAR_DATA_NAME"><source></source><translation>Our Days</translation></message>
    <message id="PARLEX_DATA_NAME"><source></source><translation>Our Talk</translation></message>
    <message id="CD_DATA_NAME"><source></source><translation>Our People</translation></message>
    <message id="SERVICE_DISPLAY_NAME_MAIL"><source></source><translation>Service Mail</translation></message>
    <message id="SERVICE_DISPLAY_NAME_CALENDARS"><source></source><translation>Service Days</translation></message>
    <message id="SERVICE_DISPLAY_NAME_IM"><source></source><translation>Service Talk</translation></message>
    <message id="SERVICE_DISPLAY_NAME_CONTACTS"><source></source><translation>Service People</translation></message>
</context>
</TS>
