// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A data plug-in to start from: it stands between the library and an application's own accounts, which this one keeps in
// a file (account_file.h). The same sources make the plug-ins of the mail, calendar, contacts and chat clients; which of
// them an object is, its bundle's identifier says.
//
// What to take from it: a data plug-in is called from any thread. Whoever sets an account up makes itself the delegate,
// calls startAccountSetupWithInput, lets its thread's events run until it is told the end, and then calls
// createAccountForInput. So startAccountSetupWithInput returns at once, every message is sent from the event loop of the
// thread that asked, exactly one of "did finish" and "did fail" ends a set-up, and none comes after it was cancelled.

#ifndef EXAMPLES_FILE_DATA_PLUGIN_FILEDATAPLUGIN_H
#define EXAMPLES_FILE_DATA_PLUGIN_FILEDATAPLUGIN_H

#include <memory>
#include <mutex>
#include <vector>

#include <QtCore/QHash>
#include <QtCore/QPointer>
#include <QtWidgets/QInputDialog>

#include <kavellaccounts/KADataPlugin.h>

#include "account_file.h"
#include "account_kind.h"

class FileDataPlugin : public KADataPlugin {
    Q_OBJECT

public:
    explicit FileDataPlugin(std::shared_ptr<KABundle> bundle);
    ~FileDataPlugin() override;

    void pluginDidLoad() override;

    [[nodiscard]] QStringList accountUIDs() override;
    [[nodiscard]] QVariantMap settingsForAccountUID(const QString &uid) override;
    [[nodiscard]] QImage imageForAccountUID(const QString &uid) override;

    /// Asks for another description, in a window that stays beside all others.
    void configureAccountUID(const QString &uid) override;
    void activateAccountUID(const QString &uid) override;
    void deactivateAccountUID(const QString &uid) override;
    void deleteAccountUID(const QString &uid) override;

    void startAccountSetupWithInput(const std::shared_ptr<KAAccountSetupInput> &input) override;
    void cancelAccountSetupForInput(const std::shared_ptr<KAAccountSetupInput> &input) override;

    /// An account that the application has already is used again rather than made twice; it is active afterwards.
    [[nodiscard]] QString createAccountForInput(const std::shared_ptr<KAAccountSetupInput> &input,
                                                const std::shared_ptr<KAAccountSetupResult> &discoveredResult,
                                                KAError *error) override;

    void nbsAccountStartedMigration(const std::shared_ptr<KAAccount> &account) override;

private:
    struct Setup;
    using Step = void (FileDataPlugin::*)(const std::shared_ptr<Setup> &);

    [[nodiscard]] AccountFile accountFile() const;
    [[nodiscard]] Accounts storedAccounts() const;
    [[nodiscard]] QString text(const char *key) const;

    [[nodiscard]] Discovery discover(const KAAccountSetupInput *input) const;
    [[nodiscard]] KAError setupError(SetupProblem problem) const;
    [[nodiscard]] KAError fileError(const FileProblem &problem) const;

    void continueLater(const std::shared_ptr<Setup> &setup, Step step);
    void tellWhatIsDone(const std::shared_ptr<Setup> &setup);
    void tellOutcome(const std::shared_ptr<Setup> &setup);
    [[nodiscard]] bool isAwaited(const Setup &setup) const;

    bool changeSettings(const QString &uid, const std::function<void(QVariantMap &)> &change);
    void showDescriptionDialog(const QString &uid);

    const AccountKind *const m_kind;  // null for a bundle with an identifier of none of the four

    std::mutex m_setupsMutex;
    std::vector<std::shared_ptr<Setup>> m_setups;  // under way

    QHash<QString, QPointer<QInputDialog>> m_dialogs;  // by UID; user-interface thread
};

#endif
