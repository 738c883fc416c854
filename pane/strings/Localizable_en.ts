<?xml version="1.0" encoding="utf-8"?>
<!-- SPDX-FileCopyrightText: 2026 The Kavell Accounts developers -->
<!-- SPDX-License-Identifier: LGPL-2.1-or-later -->
<!DOCTYPE TS>
<TS version="2.1" language="en" sourcelanguage="en">
<context>
    <name></name>
    <message id="LAYOUT_DIRECTION">
        <source></source>
        <extracomment>Which way the language is written: LTR or RTL</extracomment>
        <translation>LTR</translation>
    </message>
    <message id="PANE_TITLE">
        <source></source>
        <extracomment>The window's title</extracomment>
        <translation>Online Accounts</translation>
    </message>
    <message id="PROGRAM_DESCRIPTION">
        <source></source>
        <extracomment>For --help</extracomment>
        <translation>Shows the online accounts of the desktop, and changes them.</translation>
    </message>
    <message id="OPTION_ACCOUNT">
        <source></source>
        <extracomment>For --help</extracomment>
        <translation>Select the account with this login name.</translation>
    </message>
    <message id="OPTION_PICTURE">
        <source></source>
        <extracomment>For --help</extracomment>
        <translation>Write a picture of the window to this file and end.</translation>
    </message>
    <message id="ACCOUNTS">
        <source></source>
        <extracomment>The list, for screen readers</extracomment>
        <translation>Accounts</translation>
    </message>
    <message id="ACCESSIBLE_ACCOUNT">
        <source></source>
        <extracomment>An account of the list, for screen readers: what the user calls it, then its second line</extracomment>
        <translation>%1, %2</translation>
    </message>
    <message id="DISABLED">
        <source></source>
        <extracomment>Second line of an account that is switched off</extracomment>
        <translation>Off</translation>
    </message>
    <message id="DISABLED_ACCOUNT">
        <source></source>
        <extracomment>As above, with the login name</extracomment>
        <translation>%1 – off</translation>
    </message>
    <message id="ADD_ACCOUNT">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>&amp;Add Account…</translation>
    </message>
    <message id="REMOVE_ACCOUNT">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>&amp;Remove Account…</translation>
    </message>
    <message id="EMPTY_TITLE">
        <source></source>
        <extracomment>Title of the empty pane</extracomment>
        <translation>No accounts yet</translation>
    </message>
    <message id="EMPTY_EXPLANATION">
        <source></source>
        <extracomment>Below the title of the empty pane</extracomment>
        <translation>Add the account of your mail provider, your organisation or another service once. Mail, calendar, contacts and chat programs can then use it.</translation>
    </message>
    <message id="ADD_FIRST_ACCOUNT">
        <source></source>
        <extracomment>Button of the empty pane</extracomment>
        <translation>Add an Account…</translation>
    </message>
    <message id="READING_ACCOUNTS">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Reading the accounts…</translation>
    </message>
    <message id="OPENING_ACCOUNT">
        <source></source>
        <extracomment>Progress; %1 is the login name</extracomment>
        <translation>Opening the account %1…</translation>
    </message>
    <message id="ACCOUNT_NOT_OPENED">
        <source></source>
        <extracomment>Notice; %1 is the login name</extracomment>
        <translation>The account %1 was not opened, because you stopped waiting for it.</translation>
    </message>
    <message id="LOOKING_FOR_PLUGINS">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Looking for the kinds of account that are installed…</translation>
    </message>
    <message id="PROGRESS">
        <source></source>
        <extracomment>The progress bar, for screen readers</extracomment>
        <translation>Progress</translation>
    </message>
    <message id="STOP_WAITING">
        <source></source>
        <extracomment>Button beside the progress bar</extracomment>
        <translation>Stop Waiting</translation>
    </message>
    <message id="LONG_WAIT">
        <source></source>
        <extracomment>Progress that takes long; %1 is the sentence so far</extracomment>
        <translation>%1 Another program may be holding the account’s file. You can wait for it or stop; if it never ends, “kavell-accounts doctor” finds out why.</translation>
    </message>
    <message id="ACCOUNTS_NOT_READ">
        <source></source>
        <extracomment>Notice</extracomment>
        <translation>The accounts were not read, because you stopped waiting for them. What is shown may be out of date.</translation>
    </message>
    <message id="TRY_AGAIN">
        <source></source>
        <extracomment>Button of a notice</extracomment>
        <translation>Try Again</translation>
    </message>
    <message id="CLOSE_NOTICE">
        <source></source>
        <extracomment>Button of a notice, for screen readers and as a tool tip</extracomment>
        <translation>Close this notice</translation>
    </message>
    <message id="ACCOUNT_SUBTITLE">
        <source></source>
        <extracomment>Below an account’s title: its provider, then its login name</extracomment>
        <translation>%1 – %2</translation>
    </message>
    <message id="ACCOUNT_ENABLED">
        <source></source>
        <extracomment>Check box</extracomment>
        <translation>&amp;Use this account</translation>
    </message>
    <message id="SWITCHING_ON">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Switching the account on…</translation>
    </message>
    <message id="SWITCHING_OFF">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Switching the account off…</translation>
    </message>
    <message id="DESCRIPTION">
        <source></source>
        <extracomment>The field, for screen readers</extracomment>
        <translation>Description</translation>
    </message>
    <message id="DESCRIPTION_LABEL">
        <source></source>
        <extracomment>Label of the field for what the user calls the account</extracomment>
        <translation>&amp;Description:</translation>
    </message>
    <message id="SAVING_DESCRIPTION">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Saving the description…</translation>
    </message>
    <message id="NOT_SAVED">
        <source></source>
        <extracomment>Notice</extracomment>
        <translation>The account %1 could not be saved. Look whether your disk is full or your home directory cannot be written to, then try again.</translation>
    </message>
    <message id="ACCOUNT_GONE">
        <source></source>
        <extracomment>Notice</extracomment>
        <translation>The account %1 has been removed by another program.</translation>
    </message>
    <message id="APPLICATIONS">
        <source></source>
        <extracomment>Heading above the applications</extracomment>
        <translation>Use With</translation>
    </message>
    <message id="NO_APPLICATIONS">
        <source></source>
        <extracomment>Instead of the applications</extracomment>
        <translation>No application can use this kind of account.</translation>
    </message>
    <message id="NO_PLUGIN">
        <source></source>
        <extracomment>Instead of the applications</extracomment>
        <translation>The plug-in for this kind of account is not installed, so its applications cannot be chosen here. You can still change its description and password, and remove it.</translation>
    </message>
    <message id="NOT_SWITCHED_ON">
        <source></source>
        <extracomment>Notice; %1 is what the application keeps: Mail, Calendars</extracomment>
        <translation>%1 could not be switched on for this account in time. Try again, or look into the application itself.</translation>
    </message>
    <message id="NOT_SWITCHED_OFF">
        <source></source>
        <extracomment>Notice; %1 as above</extracomment>
        <translation>%1 could not be switched off for this account in time. Try again, or look into the application itself.</translation>
    </message>
    <message id="PLUGIN_FAILED">
        <source></source>
        <extracomment>Notice; %1 is the provider, %2 the reason</extracomment>
        <translation>The plug-in of %1 failed: %2</translation>
    </message>
    <message id="APPLICATION_WITH_ACCOUNT">
        <source></source>
        <extracomment>Application, what it keeps, login name</extracomment>
        <translation>%1 has an account for %2 of %3.</translation>
    </message>
    <message id="APPLICATION_WITHOUT_ACCOUNT">
        <source></source>
        <extracomment>Application, what it keeps</extracomment>
        <translation>%1 has no account for %2 here yet.</translation>
    </message>
    <message id="APPLICATION_NOT_INSTALLED">
        <source></source>
        <extracomment>Application</extracomment>
        <translation>The plug-in of %1 is not installed, so its accounts cannot be looked at here.</translation>
    </message>
    <message id="APPLICATION_SETTINGS">
        <source></source>
        <extracomment>Button: opens the application's own settings of the account</extracomment>
        <translation>Settings…</translation>
    </message>
    <message id="CLOSE">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>Close</translation>
    </message>
    <message id="CANCEL">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>Cancel</translation>
    </message>
    <message id="CONTINUE">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>Continue</translation>
    </message>
    <message id="PASSWORD">
        <source></source>
        <extracomment>Heading above the password's state</extracomment>
        <translation>Password</translation>
    </message>
    <message id="PASSWORD_BEING_ASKED">
        <source></source>
        <extracomment>State of the password</extracomment>
        <translation>Looking for the password…</translation>
    </message>
    <message id="PASSWORD_STORED">
        <source></source>
        <extracomment>State of the password</extracomment>
        <translation>A password is stored.</translation>
    </message>
    <message id="PASSWORD_ABSENT">
        <source></source>
        <extracomment>State of the password</extracomment>
        <translation>No password is stored.</translation>
    </message>
    <message id="PASSWORD_LOCKED">
        <source></source>
        <extracomment>State of the password</extracomment>
        <translation>A password is stored, but the keyring is locked. It is unlocked when you show or set the password.</translation>
    </message>
    <message id="PASSWORD_REFUSED">
        <source></source>
        <extracomment>State of the password</extracomment>
        <translation>A password is stored, but the keyring was not unlocked.</translation>
    </message>
    <message id="PASSWORD_UNREACHABLE">
        <source></source>
        <extracomment>State of the password</extracomment>
        <translation>The keyring does not answer, so it is not known whether a password is stored.</translation>
    </message>
    <message id="PASSWORD_FAILED">
        <source></source>
        <extracomment>State of the password</extracomment>
        <translation>The keyring could not say whether a password is stored.</translation>
    </message>
    <message id="ASKING_FOR_PASSWORD_STATE">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Asking the keyring for the password…</translation>
    </message>
    <message id="READING_PASSWORD">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Reading the password from the keyring…</translation>
    </message>
    <message id="STORING_PASSWORD">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Storing the password in the keyring…</translation>
    </message>
    <message id="PASSWORD_NOT_STORED">
        <source></source>
        <extracomment>Notice</extracomment>
        <translation>The password was not stored: the keyring is locked, refused it or does not answer. Unlock the keyring and try again.</translation>
    </message>
    <message id="PASSWORD_NOT_READ">
        <source></source>
        <extracomment>Notice</extracomment>
        <translation>The password could not be read: the keyring is locked, refused it or does not answer. Unlock the keyring and try again.</translation>
    </message>
    <message id="SET_PASSWORD">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>Set &amp;Password…</translation>
    </message>
    <message id="SHOW_PASSWORD">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>S&amp;how Password</translation>
    </message>
    <message id="HIDE_PASSWORD">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>&amp;Hide Password</translation>
    </message>
    <message id="REMOVE_PASSWORD">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>Remove Pass&amp;word…</translation>
    </message>
    <message id="SET_PASSWORD_TITLE">
        <source></source>
        <extracomment>Title of a dialog; %1 is the login name</extracomment>
        <translation>Password of %1</translation>
    </message>
    <message id="PASSWORD_LABEL">
        <source></source>
        <extracomment>Label of a field</extracomment>
        <translation>&amp;New password:</translation>
    </message>
    <message id="SHOW_TYPED_PASSWORD">
        <source></source>
        <extracomment>Check box</extracomment>
        <translation>&amp;Show what I type</translation>
    </message>
    <message id="SAVE_PASSWORD">
        <source></source>
        <extracomment>Button</extracomment>
        <translation>Save Password</translation>
    </message>
    <message id="REMOVE_PASSWORD_QUESTION">
        <source></source>
        <extracomment>Question; %1 is the login name</extracomment>
        <translation>Remove the password of %1 from the keyring?</translation>
    </message>
    <message id="REMOVE_PASSWORD_DETAILS">
        <source></source>
        <extracomment>Below the question</extracomment>
        <translation>Applications that use the account will ask you for it. It cannot be brought back.</translation>
    </message>
    <message id="REMOVE_PASSWORD_NOW">
        <source></source>
        <extracomment>Button that agrees</extracomment>
        <translation>Remove Password</translation>
    </message>
    <message id="DETAILS">
        <source></source>
        <extracomment>Heading above what else is known of an account</extracomment>
        <translation>Details</translation>
    </message>
    <message id="LOGIN_NAME_LABEL">
        <source></source>
        <extracomment>Label</extracomment>
        <translation>Login name:</translation>
    </message>
    <message id="FULL_NAME_LABEL">
        <source></source>
        <extracomment>Label</extracomment>
        <translation>Full name:</translation>
    </message>
    <message id="EMAIL_ADDRESS_LABEL">
        <source></source>
        <extracomment>Label</extracomment>
        <translation>E-mail address:</translation>
    </message>
    <message id="PROVIDER_LABEL">
        <source></source>
        <extracomment>Label</extracomment>
        <translation>Provider:</translation>
    </message>
    <message id="SERVICES_LABEL">
        <source></source>
        <extracomment>Label</extracomment>
        <translation>Services:</translation>
    </message>
    <message id="UID_LABEL">
        <source></source>
        <extracomment>Label</extracomment>
        <translation>Identifier:</translation>
    </message>
    <message id="ADD_ACCOUNT_TITLE">
        <source></source>
        <extracomment>Title of a dialog</extracomment>
        <translation>Add an Account</translation>
    </message>
    <message id="CHOOSE_KIND">
        <source></source>
        <extracomment>Above the kinds of account</extracomment>
        <translation>Which kind of account do you want to add?</translation>
    </message>
    <message id="KINDS_OF_ACCOUNT">
        <source></source>
        <extracomment>The list, for screen readers</extracomment>
        <translation>Kinds of account</translation>
    </message>
    <message id="NO_KINDS_OF_ACCOUNT">
        <source></source>
        <extracomment>Instead of the kinds of account</extracomment>
        <translation>No kind of account is installed. Each provider comes as a plug-in: install the plug-in of your provider, then add your account here. “kavell-accounts plugins” says where plug-ins are looked for.</translation>
    </message>
    <message id="SAVING_ACCOUNT">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Saving the account %1…</translation>
    </message>
    <message id="NOT_ADDED">
        <source></source>
        <extracomment>Notice</extracomment>
        <translation>The account %1 was not saved, because you stopped waiting for it. You can add it again.</translation>
    </message>
    <message id="NAME_NOT_POSSIBLE">
        <source></source>
        <extracomment>Notice; %1 is the login name</extracomment>
        <translation>The account was not saved, because no account can have the login name %1 on this computer. A name is not empty, “.” or “..”, has no “/” and no control character, and at most 249 bytes. Add the account under another name.</translation>
    </message>
    <message id="ACCOUNT_WAS_THERE">
        <source></source>
        <extracomment>Notice</extracomment>
        <translation>You already had the account %1. It has been brought up to date.</translation>
    </message>
    <message id="LIKELY_DUPLICATE">
        <source></source>
        <extracomment>Notice; login names and a provider</extracomment>
        <translation>%1 looks like the account %2 at %3, which you already have. Keep both, or remove the one that you do not need.</translation>
    </message>
    <message id="SHOW_OTHER_ACCOUNT">
        <source></source>
        <extracomment>Button of that notice</extracomment>
        <translation>Show the Other Account</translation>
    </message>
    <message id="REMOVE_QUESTION">
        <source></source>
        <extracomment>Question</extracomment>
        <translation>Remove the account %1 from this computer?</translation>
    </message>
    <message id="REMOVE_DETAILS">
        <source></source>
        <extracomment>Below the question</extracomment>
        <translation>Its settings and its password are removed for all applications. What is kept on the provider’s servers stays there.</translation>
    </message>
    <message id="REMOVE_DETAILS_APPLICATIONS">
        <source></source>
        <extracomment>Below the question; %1 lists applications</extracomment>
        <translation>It is switched off in %1 first; then its settings and its password are removed for all applications. What is kept on the provider’s servers stays there.</translation>
    </message>
    <message id="REMOVE_NOW">
        <source></source>
        <extracomment>Button that agrees</extracomment>
        <translation>Remove Account</translation>
    </message>
    <message id="SWITCHING_APPLICATIONS_OFF">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Switching the account off in its applications…</translation>
    </message>
    <message id="REMOVE_ANYWAY_QUESTION">
        <source></source>
        <extracomment>Question</extracomment>
        <translation>Remove the account %1 all the same?</translation>
    </message>
    <message id="REMOVE_ANYWAY_DETAILS">
        <source></source>
        <extracomment>Below the question; %1 lists applications</extracomment>
        <translation>It could not be switched off in %1, which may go on using it.</translation>
    </message>
    <message id="REMOVE_ANYWAY">
        <source></source>
        <extracomment>Button that agrees</extracomment>
        <translation>Remove Anyway</translation>
    </message>
    <message id="REMOVING_ACCOUNT">
        <source></source>
        <extracomment>Progress</extracomment>
        <translation>Removing the account %1…</translation>
    </message>
    <message id="NOT_REMOVED">
        <source></source>
        <extracomment>Notice</extracomment>
        <translation>The account %1 could not be removed. Look whether your home directory can be written to, then try again.</translation>
    </message>
    <message id="PASSWORD_LEFT">
        <source></source>
        <extracomment>Notice</extracomment>
        <translation>The account %1 is removed, but its password could not be deleted from the keyring. “kavell-accounts doctor” finds it.</translation>
    </message>
    <message id="PROVIDER_YAHOO">
        <source></source>
        <extracomment>Provider whose plug-in is not installed</extracomment>
        <translation>Yahoo</translation>
    </message>
    <message id="PROVIDER_GOOGLE">
        <source></source>
        <extracomment>As above</extracomment>
        <translation>Google</translation>
    </message>
    <message id="PROVIDER_NIMBREL">
        <source></source>
        <extracomment>As above</extracomment>
        <translation>Nimbrel</translation>
    </message>
    <message id="PROVIDER_QUILLANE">
        <source></source>
        <extracomment>As above</extracomment>
        <translation>Quillane</translation>
    </message>
    <message id="PROVIDER_FACEBOOK">
        <source></source>
        <extracomment>As above</extracomment>
        <translation>Facebook</translation>
    </message>
    <message id="PROVIDER_EXCHANGE">
        <source></source>
        <extracomment>As above</extracomment>
        <translation>Exchange</translation>
    </message>
    <message id="PROVIDER_AOL">
        <source></source>
        <extracomment>As above</extracomment>
        <translation>AOL</translation>
    </message>
    <message id="PROVIDER_MAIL">
        <source></source>
        <extracomment>As above: accounts of the mail program</extracomment>
        <translation>Mail</translation>
    </message>
    <message id="PROVIDER_CARDELL">
        <source></source>
        <extracomment>As above: of the contacts program</extracomment>
        <translation>Contacts</translation>
    </message>
    <message id="PROVIDER_PARLEX">
        <source></source>
        <extracomment>As above: of the chat program</extracomment>
        <translation>Chat</translation>
    </message>
    <message id="PROVIDER_TIDEWELL">
        <source></source>
        <extracomment>As above: of the calendar program</extracomment>
        <translation>Calendar</translation>
    </message>
    <message id="PROVIDER_HALDEN_SERVER">
        <source></source>
        <extracomment>As above</extracomment>
        <translation>Halden Server</translation>
    </message>
    <message id="PROVIDER_TEST">
        <source></source>
        <extracomment>As above</extracomment>
        <translation>Test accounts</translation>
    </message>
</context>
</TS>
