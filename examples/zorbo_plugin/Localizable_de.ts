<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!DOCTYPE TS>
<TS version="2.1" language="de" sourcelanguage="en">
<context>
    <name></name>
    <message id="BRAND_NAME"><source></source><translation>Zorbo</translation></message>
    <message id="DEFAULT_ACCOUNT_DESCRIPTION"><source></source><translation>Zorbo-Account</translation></message>
    <message id="USER_NAME_LABEL"><source></source><translation>E-Mail-Adresse:</translation></message>
    <message id="ADD"><source></source><translation>Account hinzufügen</translation></message>
    <message id="CANCEL"><source></source><translation>Abbrechen</translation></message>
</context>
</TS>
