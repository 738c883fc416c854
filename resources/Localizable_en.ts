<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!DOCTYPE TS>
<TS version="2.1" language="en" sourcelanguage="en">
<context>
    <name></name>
    <message id="SERVICE_DISPLAY_NAME_MAIL">
        <source></source>
        <extracomment>What a provider's mail is called, after its brand name: Zorbo Mail</extracomment>
        <translation>Mail</translation>
    </message>
    <message id="SERVICE_DISPLAY_NAME_CALENDARS">
        <source></source>
        <extracomment>As above, for calendars</extracomment>
        <translation>Calendars</translation>
    </message>
    <message id="SERVICE_DISPLAY_NAME_IM">
        <source></source>
        <extracomment>As above, for instant messages</extracomment>
        <translation>Chat</translation>
    </message>
    <message id="SERVICE_DISPLAY_NAME_CONTACTS">
        <source></source>
        <extracomment>As above, for contacts</extracomment>
        <translation>Contacts</translation>
    </message>
    <message id="MAIL_DATA_NAME">
        <source></source>
        <extracomment>What the mail application keeps</extracomment>
        <translation>Mail</translation>
    </message>
    <message id="CALENDAR_DATA_NAME">
        <source></source>
        <extracomment>What the calendar application keeps</extracomment>
        <translation>Calendars</translation>
    </message>
    <message id="PARLEX_DATA_NAME">
        <source></source>
        <extracomment>What the chat application keeps</extracomment>
        <translation>Messages</translation>
    </message>
    <message id="CD_DATA_NAME">
        <source></source>
        <extracomment>What the contacts application keeps</extracomment>
        <translation>Contacts</translation>
    </message>
    <message id="CONFLICTS_WITH_AERWYN">
        <source></source>
        <extracomment>Why an application cannot be picked for an account</extracomment>
        <translation>Not available with your online-service account</translation>
    </message>
    <message id="APP_ROW_LABEL_FORMAT">
        <source></source>
        <extracomment>A row of the applications: the application's name (%1, which comes first), then the service's</extracomment>
        <translation>%1 (%2)</translation>
    </message>
    <message id="APP_TABLE">
        <source></source>
        <extracomment>The table of the applications that can use an account, for screen readers</extracomment>
        <translation>Applications</translation>
    </message>
    <message id="APP_ROW_INFO">
        <source></source>
        <extracomment>Information button of a row of the applications; %1 is the row's name</extracomment>
        <translation>Information about %1</translation>
    </message>
    <message id="APP_ROW_PROGRESS">
        <source></source>
        <extracomment>In place of a row's check box, for screen readers; %1 is the row's name</extracomment>
        <translation>Setting up %1</translation>
    </message>
    <message id="KAVELL_ACCOUNTS">
        <source></source>
        <extracomment>Title of the certificate panel while an account is set up</extracomment>
        <translation>Online Accounts</translation>
    </message>
    <message id="CERT_ERROR_TITLE">
        <source></source>
        <extracomment>Caller's title (%1), then the host (%2)</extracomment>
        <translation>%1 can’t verify the identity of the server “%2”.</translation>
    </message>
    <message id="CERT_NOT_YET_VALID_ERROR">
        <source></source>
        <extracomment>%1 is the host</extracomment>
        <translation>The certificate of “%1” is not valid yet. You might be connecting to a server that pretends to be “%1”, which could put your confidential information at risk.</translation>
    </message>
    <message id="CERT_UNKNOWN_ROOT_ERROR">
        <source></source>
        <extracomment>%1 is the host</extracomment>
        <translation>The certificate of “%1” was signed by an unknown authority. You might be connecting to a server that pretends to be “%1”, which could put your confidential information at risk.</translation>
    </message>
    <message id="CERT_UNTRUSTED_ERROR">
        <source></source>
        <extracomment>%1 is the host</extracomment>
        <translation>The certificate of “%1” is not trusted. You might be connecting to a server that pretends to be “%1”, which could put your confidential information at risk.</translation>
    </message>
    <message id="CERT_BAD_DATE_ERROR">
        <source></source>
        <extracomment>%1 is the host</extracomment>
        <translation>The certificate of “%1” has expired or has a wrong date. You might be connecting to a server that pretends to be “%1”, which could put your confidential information at risk.</translation>
    </message>
    <message id="CONTINUE">
        <source></source>
        <extracomment>Button: trust the server</extracomment>
        <translation>Continue</translation>
    </message>
    <message id="CANCEL">
        <source></source>
        <extracomment>Button: do not trust the server</extracomment>
        <translation>Cancel</translation>
    </message>
    <message id="CERT_PANEL_HELP">
        <source></source>
        <extracomment>Button of the certificate panel</extracomment>
        <translation>Help</translation>
    </message>
    <message id="CERT_PANEL_HELP_TEXT">
        <source></source>
        <extracomment>What the help button of the certificate panel shows</extracomment>
        <translation>A certificate tells you whose server this is. When it cannot be verified, someone may be posing as the server to get at your password. Continue only when you know why the certificate cannot be verified.</translation>
    </message>
    <message id="CERT_PANEL_CHAIN">
        <source></source>
        <extracomment>The list of certificates, for screen readers</extracomment>
        <translation>Certificates of the server</translation>
    </message>
    <message id="CERT_PANEL_DETAILS">
        <source></source>
        <extracomment>Details of the selected certificate, for screen readers</extracomment>
        <translation>Certificate details</translation>
    </message>
    <message id="CERT_PANEL_SUBJECT">
        <source></source>
        <extracomment>Label in the certificate's details</extracomment>
        <translation>Issued to:</translation>
    </message>
    <message id="CERT_PANEL_ISSUER">
        <source></source>
        <extracomment>Label in the certificate's details</extracomment>
        <translation>Issued by:</translation>
    </message>
    <message id="CERT_PANEL_VALID_FROM">
        <source></source>
        <extracomment>Label in the certificate's details</extracomment>
        <translation>Valid from:</translation>
    </message>
    <message id="CERT_PANEL_VALID_UNTIL">
        <source></source>
        <extracomment>Label in the certificate's details</extracomment>
        <translation>Valid until:</translation>
    </message>
    <message id="CERT_PANEL_NAMES">
        <source></source>
        <extracomment>Label in the certificate's details: host names</extracomment>
        <translation>Names:</translation>
    </message>
    <message id="CERT_PANEL_FINGERPRINT">
        <source></source>
        <extracomment>Label in the certificate's details</extracomment>
        <translation>SHA-256 fingerprint:</translation>
    </message>
</context>
</TS>
