<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!-- Written by resources/make_pseudo_language; change the English table instead. -->
<!DOCTYPE TS>
<TS version="2.1" language="ar_XB" sourcelanguage="en">
<context>
    <name></name>
    <message id="SERVICE_DISPLAY_NAME_MAIL"><source></source><translation>‏‮Mail‬‏</translation></message>
    <message id="SERVICE_DISPLAY_NAME_CALENDARS"><source></source><translation>‏‮Calendars‬‏</translation></message>
    <message id="SERVICE_DISPLAY_NAME_IM"><source></source><translation>‏‮Chat‬‏</translation></message>
    <message id="SERVICE_DISPLAY_NAME_CONTACTS"><source></source><translation>‏‮Contacts‬‏</translation></message>
    <message id="MAIL_DATA_NAME"><source></source><translation>‏‮Mail‬‏</translation></message>
    <message id="CALENDAR_DATA_NAME"><source></source><translation>‏‮Calendars‬‏</translation></message>
    <message id="PARLEX_DATA_NAME"><source></source><translation>‏‮Messages‬‏</translation></message>
    <message id="CD_DATA_NAME"><source></source><translation>‏‮Contacts‬‏</translation></message>
    <message id="CONFLICTS_WITH_AERWYN"><source></source><translation>‏‮Not‬‏ ‏‮available‬‏ ‏‮with‬‏ ‏‮your‬‏ ‏‮online-service‬‏ ‏‮account‬‏</translation></message>
    <message id="APP_ROW_LABEL_FORMAT"><source></source><translation>%1 (%2)</translation></message>
    <message id="APP_TABLE"><source></source><translation>‏‮Applications‬‏</translation></message>
    <message id="APP_ROW_INFO"><source></source><translation>‏‮Information‬‏ ‏‮about‬‏ %1</translation></message>
    <message id="APP_ROW_PROGRESS"><source></source><translation>‏‮Setting‬‏ ‏‮up‬‏ %1</translation></message>
    <message id="KAVELL_ACCOUNTS"><source></source><translation>‏‮Online‬‏ ‏‮Accounts‬‏</translation></message>
    <message id="CERT_ERROR_TITLE"><source></source><translation>%1 ‏‮can’t‬‏ ‏‮verify‬‏ ‏‮the‬‏ ‏‮identity‬‏ ‏‮of‬‏ ‏‮the‬‏ ‏‮server‬‏ “%2”.</translation></message>
    <message id="CERT_NOT_YET_VALID_ERROR"><source></source><translation>‏‮The‬‏ ‏‮certificate‬‏ ‏‮of‬‏ “%1” ‏‮is‬‏ ‏‮not‬‏ ‏‮valid‬‏ ‏‮yet.‬‏ ‏‮You‬‏ ‏‮might‬‏ ‏‮be‬‏ ‏‮connecting‬‏ ‏‮to‬‏ ‏‮a‬‏ ‏‮server‬‏ ‏‮that‬‏ ‏‮pretends‬‏ ‏‮to‬‏ ‏‮be‬‏ “%1”, ‏‮which‬‏ ‏‮could‬‏ ‏‮put‬‏ ‏‮your‬‏ ‏‮confidential‬‏ ‏‮information‬‏ ‏‮at‬‏ ‏‮risk.‬‏</translation></message>
    <message id="CERT_UNKNOWN_ROOT_ERROR"><source></source><translation>‏‮The‬‏ ‏‮certificate‬‏ ‏‮of‬‏ “%1” ‏‮was‬‏ ‏‮signed‬‏ ‏‮by‬‏ ‏‮an‬‏ ‏‮unknown‬‏ ‏‮authority.‬‏ ‏‮You‬‏ ‏‮might‬‏ ‏‮be‬‏ ‏‮connecting‬‏ ‏‮to‬‏ ‏‮a‬‏ ‏‮server‬‏ ‏‮that‬‏ ‏‮pretends‬‏ ‏‮to‬‏ ‏‮be‬‏ “%1”, ‏‮which‬‏ ‏‮could‬‏ ‏‮put‬‏ ‏‮your‬‏ ‏‮confidential‬‏ ‏‮information‬‏ ‏‮at‬‏ ‏‮risk.‬‏</translation></message>
    <message id="CERT_UNTRUSTED_ERROR"><source></source><translation>‏‮The‬‏ ‏‮certificate‬‏ ‏‮of‬‏ “%1” ‏‮is‬‏ ‏‮not‬‏ ‏‮trusted.‬‏ ‏‮You‬‏ ‏‮might‬‏ ‏‮be‬‏ ‏‮connecting‬‏ ‏‮to‬‏ ‏‮a‬‏ ‏‮server‬‏ ‏‮that‬‏ ‏‮pretends‬‏ ‏‮to‬‏ ‏‮be‬‏ “%1”, ‏‮which‬‏ ‏‮could‬‏ ‏‮put‬‏ ‏‮your‬‏ ‏‮confidential‬‏ ‏‮information‬‏ ‏‮at‬‏ ‏‮risk.‬‏</translation></message>
    <message id="CERT_BAD_DATE_ERROR"><source></source><translation>‏‮The‬‏ ‏‮certificate‬‏ ‏‮of‬‏ “%1” ‏‮has‬‏ ‏‮expired‬‏ ‏‮or‬‏ ‏‮has‬‏ ‏‮a‬‏ ‏‮wrong‬‏ ‏‮date.‬‏ ‏‮You‬‏ ‏‮might‬‏ ‏‮be‬‏ ‏‮connecting‬‏ ‏‮to‬‏ ‏‮a‬‏ ‏‮server‬‏ ‏‮that‬‏ ‏‮pretends‬‏ ‏‮to‬‏ ‏‮be‬‏ “%1”, ‏‮which‬‏ ‏‮could‬‏ ‏‮put‬‏ ‏‮your‬‏ ‏‮confidential‬‏ ‏‮information‬‏ ‏‮at‬‏ ‏‮risk.‬‏</translation></message>
    <message id="CONTINUE"><source></source><translation>‏‮Continue‬‏</translation></message>
    <message id="CANCEL"><source></source><translation>‏‮Cancel‬‏</translation></message>
    <message id="CERT_PANEL_HELP"><source></source><translation>‏‮Help‬‏</translation></message>
    <message id="CERT_PANEL_HELP_TEXT"><source></source><translation>‏‮A‬‏ ‏‮certificate‬‏ ‏‮tells‬‏ ‏‮you‬‏ ‏‮whose‬‏ ‏‮server‬‏ ‏‮this‬‏ ‏‮is.‬‏ ‏‮When‬‏ ‏‮it‬‏ ‏‮cannot‬‏ ‏‮be‬‏ ‏‮verified,‬‏ ‏‮someone‬‏ ‏‮may‬‏ ‏‮be‬‏ ‏‮posing‬‏ ‏‮as‬‏ ‏‮the‬‏ ‏‮server‬‏ ‏‮to‬‏ ‏‮get‬‏ ‏‮at‬‏ ‏‮your‬‏ ‏‮password.‬‏ ‏‮Continue‬‏ ‏‮only‬‏ ‏‮when‬‏ ‏‮you‬‏ ‏‮know‬‏ ‏‮why‬‏ ‏‮the‬‏ ‏‮certificate‬‏ ‏‮cannot‬‏ ‏‮be‬‏ ‏‮verified.‬‏</translation></message>
    <message id="CERT_PANEL_CHAIN"><source></source><translation>‏‮Certificates‬‏ ‏‮of‬‏ ‏‮the‬‏ ‏‮server‬‏</translation></message>
    <message id="CERT_PANEL_DETAILS"><source></source><translation>‏‮Certificate‬‏ ‏‮details‬‏</translation></message>
    <message id="CERT_PANEL_SUBJECT"><source></source><translation>‏‮Issued‬‏ ‏‮to:‬‏</translation></message>
    <message id="CERT_PANEL_ISSUER"><source></source><translation>‏‮Issued‬‏ ‏‮by:‬‏</translation></message>
    <message id="CERT_PANEL_VALID_FROM"><source></source><translation>‏‮Valid‬‏ ‏‮from:‬‏</translation></message>
    <message id="CERT_PANEL_VALID_UNTIL"><source></source><translation>‏‮Valid‬‏ ‏‮until:‬‏</translation></message>
    <message id="CERT_PANEL_NAMES"><source></source><translation>‏‮Names:‬‏</translation></message>
    <message id="CERT_PANEL_FINGERPRINT"><source></source><translation>‏‮SHA-256‬‏ ‏‮fingerprint:‬‏</translation></message>
</context>
</TS>
