<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!DOCTYPE TS>
<TS version="2.1" language="en" sourcelanguage="en">
<context>
    <name></name>
    <message id="BRAND_NAME"><source></source><translation>Zorbo</translation></message>
    <message id="SUPPORT_URL"><source></source><translation>https://support.example.com/</translation></message>
    <message id="DEFAULT_ACCOUNT_DESCRIPTION"><source></source><translation>Zorbo account</translation></message>
    <message id="USER_NAME_LABEL"><source></source><translation>Zorbo name</translation></message>
    <message id="SERVICE_DISPLAY_NAME_IM"><source></source><translation>Zorbo Talk</translation></message>
    <message id="CALENDAR_DATA_NAME"><source></source><translation>Zorbo Days</translation></message>
</context>
</TS>
