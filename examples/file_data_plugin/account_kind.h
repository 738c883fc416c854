// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What differs between the four kinds of data that the example stands in for: which input and result records they have,
// and which keys of KAConstants.h their settings are written in.
//
// What to take from it: use the vocabulary of your kind for the settings that settingsForAccountUID answers. By its keys
// the library finds out which online account an application's account belongs to. Any thread may call.

#ifndef EXAMPLES_FILE_DATA_PLUGIN_ACCOUNT_KIND_H
#define EXAMPLES_FILE_DATA_PLUGIN_ACCOUNT_KIND_H

#include <memory>

#include <QtCore/QString>
#include <QtCore/QStringList>
#include <QtCore/QVariantMap>
#include <QtGui/QColor>

class KAAccountSetupInput;
class KAAccountSetupResult;

/// The codes of the errors that the example reports in the domain kKAErrorDomain, and their texts' keys in its string
/// tables. Your own codes are yours to choose.
enum class SetupProblem {
    None = 0,
    WrongKind = 1,      ///< the input is for another kind of data, or missing
    NoAddress = 2,      ///< nothing says whose account it is
    NoServer = 3,       ///< not fatal: no server can be guessed
    NotVerified = 4,    ///< not fatal: without a password nobody can sign in to see whether it is right
    NotDiscovered = 5,  ///< an account is to be made of nothing that was found
    FileProblem = 6,    ///< the accounts cannot be read or saved
};

/// What a look at the input found.
struct Discovery {
    SetupProblem problem = SetupProblem::None;
    QVariantMap settings{};
    std::shared_ptr<KAAccountSetupResult> result{};
};

struct AccountKind {
    const QString &pluginID;
    const QString &providerType;
    QStringList services;

    /// Two accounts whose settings are alike in these are one.
    QStringList identity;
    QColor color;

    /// Looks for the servers of what was typed. A real plug-in asks the network here, and its answers come later.
    Discovery (*discover)(const KAAccountSetupInput *input);

    [[nodiscard]] bool areSame(const QVariantMap &first, const QVariantMap &second) const;
};

/// The kind of a plug-in identifier; null for one that is none of the four.
[[nodiscard]] const AccountKind *accountKindOf(const QString &pluginID);

/// Says in a result that the application has the account already, where its class can.
void markExisting(KAAccountSetupResult &result);

#endif
