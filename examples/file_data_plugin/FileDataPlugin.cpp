// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "FileDataPlugin.h"

#include <algorithm>

#include <QtCore/QStandardPaths>
#include <QtCore/QThread>
#include <QtCore/QUuid>
#include <QtGui/QPainter>
#include <QtWidgets/QApplication>

#include <kavellaccounts/KAAccountSetupInput.h>
#include <kavellaccounts/KAAccountSetupResult.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KAProvider.h>

namespace {

constexpr int kImageSide = 32;
constexpr qreal kCornerRadius = 6;

// Where discovery leaves for creation what it found.
const QString kContextKey = QStringLiteral("settings");

// All kinds share these words, under other names of the vocabulary.
const QString &kInactiveKey = KAMailInactiveAccountKey;
const QString &kDescriptionKey = KAMailAccountDescriptionKey;

/// The text of each problem in the string tables, and whether the set-up may go on after it.
struct ProblemRow {
    SetupProblem problem;
    const char *textKey;
    bool isFatal;
};

constexpr ProblemRow kProblems[] = {
    {SetupProblem::WrongKind, "ERROR_WRONG_KIND", true},
    {SetupProblem::NoAddress, "ERROR_NO_ADDRESS", true},
    {SetupProblem::NoServer, "ERROR_NO_SERVER", false},
    {SetupProblem::NotVerified, "ERROR_NOT_VERIFIED", false},
    {SetupProblem::NotDiscovered, "ERROR_NOT_DISCOVERED", true},
};

const ProblemRow &rowOf(SetupProblem problem)
{
    return *std::find_if(std::begin(kProblems), std::end(kProblems),
                         [&](const ProblemRow &row) { return row.problem == problem; });
}

const char *textKeyOf(FileProblem::Kind kind)
{
    switch (kind) {
    case FileProblem::Kind::Busy:
        return "ERROR_FILE_BUSY";
    case FileProblem::Kind::Unreadable:
        return "ERROR_FILE_UNREADABLE";
    case FileProblem::Kind::Damaged:
        return "ERROR_FILE_DAMAGED";
    case FileProblem::Kind::NotCopied:
        return "ERROR_FILE_NOT_COPIED";
    case FileProblem::Kind::None:
    case FileProblem::Kind::Unwritable:
        break;
    }
    return "ERROR_FILE_UNWRITABLE";
}

/// The name that the user knows the account by.
QString nameOf(const QVariantMap &settings)
{
    for (const QString &key : {kDescriptionKey, KAMailEmailAddressKey, KAChatLoginNameKey, KAMailUserNameKey}) {
        if (const QString name = settings.value(key).toString(); !name.isEmpty())
            return name;
    }
    return {};
}

}  // namespace

/// One set-up under way. The object `loop` lives on the thread that asked: what is queued for it runs in that thread's
/// events, and goes with it.
struct FileDataPlugin::Setup {
    struct DeleteInItsThread {
        void operator()(QObject *object) const { object->deleteLater(); }
    };

    std::shared_ptr<KAAccountSetupInput> input;
    const QObject *asker = nullptr;  // never looked into: it may be gone
    std::unique_ptr<QObject, DeleteInItsThread> loop{new QObject};
};

FileDataPlugin::FileDataPlugin(std::shared_ptr<KABundle> bundle)
    : KADataPlugin(std::move(bundle)), m_kind(accountKindOf(identifier()))
{
}

FileDataPlugin::~FileDataPlugin()
{
    for (const QPointer<QInputDialog> &dialog : std::as_const(m_dialogs))
        delete dialog;
}

/// The provider says which services the application serves; its type marks accounts that are no account-list account's.
void FileDataPlugin::pluginDidLoad()
{
    if (!m_kind)
        return;
    const auto own = KAProvider::initWithProviderType(m_kind->providerType);
    own->setServiceTypesProvided(m_kind->services);
    setProvider(own);
}

QStringList FileDataPlugin::accountUIDs()
{
    return storedAccounts().keys();
}

QVariantMap FileDataPlugin::settingsForAccountUID(const QString &uid)
{
    return storedAccounts().value(uid);
}

/// A picture in the pixels of the screen, which says its own scale: hosts draw it 32 points wide.
QImage FileDataPlugin::imageForAccountUID(const QString &uid)
{
    const QVariantMap settings = settingsForAccountUID(uid);
    const qreal scale = qGuiApp ? qGuiApp->devicePixelRatio() : 1;
    QImage image(QSize(kImageSide, kImageSide) * scale, QImage::Format_ARGB32_Premultiplied);
    image.setDevicePixelRatio(scale);
    image.fill(Qt::transparent);
    if (!qGuiApp)
        return image;
    const QRectF frame(0, 0, kImageSide, kImageSide);
    const bool isActive = !settings.value(kInactiveKey).toBool();
    QPainter painter(&image);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(m_kind && isActive ? m_kind->color : QColor(Qt::gray));
    painter.drawRoundedRect(frame, kCornerRadius, kCornerRadius);
    QFont font = painter.font();
    font.setPixelSize(kImageSide / 2);
    painter.setFont(font);
    painter.setPen(Qt::white);
    painter.drawText(frame, Qt::AlignCenter, nameOf(settings).left(1).toUpper());
    return image;
}

void FileDataPlugin::activateAccountUID(const QString &uid)
{
    if (changeSettings(uid, [](QVariantMap &settings) { settings.remove(kInactiveKey); }))
        didChangeAccountUID(uid);
}

void FileDataPlugin::deactivateAccountUID(const QString &uid)
{
    if (changeSettings(uid, [](QVariantMap &settings) { settings.insert(kInactiveKey, true); }))
        didChangeAccountUID(uid);
}

void FileDataPlugin::deleteAccountUID(const QString &uid)
{
    bool wasThere = false;
    const FileProblem problem = accountFile().change([&](Accounts &accounts) { wasThere = accounts.remove(uid) > 0; });
    if (problem)
        qWarning("%s", qUtf8Printable(fileError(problem).description()));
    else if (wasThere)
        didDeleteAccountUID(uid);
}

/// Whether the account's settings are other ones now.
bool FileDataPlugin::changeSettings(const QString &uid, const std::function<void(QVariantMap &)> &change)
{
    bool isOther = false;
    const FileProblem problem = accountFile().change([&](Accounts &accounts) {
        const auto account = accounts.find(uid);
        if (account == accounts.end())
            return;
        const QVariantMap before = account.value();
        change(account.value());
        isOther = account.value() != before;
    });
    if (problem)
        qWarning("%s", qUtf8Printable(fileError(problem).description()));
    return isOther && !problem;
}

void FileDataPlugin::configureAccountUID(const QString &uid)
{
    // Any thread may ask for the window; it belongs to the plug-in's own, which is the user interface's.
    if (qobject_cast<QApplication *>(QCoreApplication::instance()))
        QMetaObject::invokeMethod(this, [this, uid] { showDescriptionDialog(uid); });
}

void FileDataPlugin::showDescriptionDialog(const QString &uid)
{
    const Accounts accounts = storedAccounts();
    if (!accounts.contains(uid))
        return;
    QPointer<QInputDialog> &dialog = m_dialogs[uid];
    if (!dialog) {
        dialog = new QInputDialog;
        dialog->setAttribute(Qt::WA_DeleteOnClose);
        dialog->setWindowTitle(text("CONFIGURE_TITLE"));
        dialog->setLabelText(text("CONFIGURE_LABEL").arg(nameOf(accounts.value(uid))));
        dialog->setOkButtonText(text("CONFIGURE_SAVE"));
        dialog->setCancelButtonText(text("CONFIGURE_CANCEL"));
        dialog->setTextValue(accounts.value(uid).value(kDescriptionKey).toString());
        connect(dialog, &QInputDialog::textValueSelected, this, [this, uid](const QString &description) {
            if (changeSettings(uid, [&](QVariantMap &settings) { settings.insert(kDescriptionKey, description); }))
                didChangeAccountUID(uid);
        });
    }
    dialog->show();
    dialog->raise();
    dialog->activateWindow();
}

void FileDataPlugin::startAccountSetupWithInput(const std::shared_ptr<KAAccountSetupInput> &input)
{
    const auto setup = std::make_shared<Setup>();
    setup->input = input;
    setup->asker = delegate();
    {
        const std::lock_guard lock(m_setupsMutex);
        m_setups.push_back(setup);
    }
    continueLater(setup, &FileDataPlugin::tellWhatIsDone);
}

void FileDataPlugin::cancelAccountSetupForInput(const std::shared_ptr<KAAccountSetupInput> &input)
{
    const std::lock_guard lock(m_setupsMutex);
    std::erase_if(m_setups, [&](const std::shared_ptr<Setup> &setup) { return setup->input == input; });
}

/// Runs a step in the events of the thread that asked, unless the set-up was cancelled by then. Here a plug-in with a
/// network waits for an answer of it instead.
void FileDataPlugin::continueLater(const std::shared_ptr<Setup> &setup, Step step)
{
    const auto run = [this, step, waiting = std::weak_ptr(setup)] {
        if (const std::shared_ptr<Setup> underWay = waiting.lock())
            (this->*step)(underWay);
    };
    QMetaObject::invokeMethod(setup->loop.get(), run, Qt::QueuedConnection);
}

void FileDataPlugin::tellWhatIsDone(const std::shared_ptr<Setup> &setup)
{
    if (isAwaited(*setup))
        accountSetupUpdate(setup->input, text("STATUS_LOOKING"));
    continueLater(setup, &FileDataPlugin::tellOutcome);
}

void FileDataPlugin::tellOutcome(const std::shared_ptr<Setup> &setup)
{
    {
        const std::lock_guard lock(m_setupsMutex);
        if (std::erase(m_setups, setup) == 0)
            return;  // cancelled at this very moment
    }
    if (!isAwaited(*setup))
        return;
    const Discovery found = discover(setup->input.get());
    if (found.problem != SetupProblem::None) {
        accountSetupDidFail(setup->input, setupError(found.problem));
        return;
    }
    setup->input->context()->insert(kContextKey, found.settings);
    accountSetupDidFinish(setup->input, found.result);
}

/// Whether the delegate that asked is the delegate still; another one has not asked for this.
bool FileDataPlugin::isAwaited(const Setup &setup) const
{
    return delegate() == setup.asker;
}

/// What is found for an input, with its problem only if that ends the set-up. A problem that is not fatal ends it
/// unless the input says to continue through errors: the asker may then ask the user, and start again with that said.
Discovery FileDataPlugin::discover(const KAAccountSetupInput *input) const
{
    Discovery found = m_kind ? m_kind->discover(input) : Discovery{.problem = SetupProblem::WrongKind};
    // Signing in would be tried here. The made-up servers of an example take every password, but there has to be one.
    if (found.problem == SetupProblem::None && input->password().isEmpty())
        found.problem = SetupProblem::NotVerified;
    if (found.problem != SetupProblem::None && !rowOf(found.problem).isFatal && input->continueThroughError())
        found.problem = SetupProblem::None;
    const Accounts accounts = storedAccounts();
    const bool exists = found.result && std::any_of(accounts.begin(), accounts.end(), [&](const QVariantMap &stored) {
                            return m_kind->areSame(stored, found.settings);
                        });
    if (exists)
        markExisting(*found.result);
    return found;
}

QString FileDataPlugin::createAccountForInput(const std::shared_ptr<KAAccountSetupInput> &input,
                                              const std::shared_ptr<KAAccountSetupResult> &discoveredResult,
                                              KAError *error)
{
    const auto refuse = [&](const KAError &reason) {
        if (error)
            *error = reason;
        return QString();
    };
    const Discovery found = discover(input.get());
    if (found.problem != SetupProblem::None)
        return refuse(setupError(found.problem));
    if (!discoveredResult)
        return refuse(setupError(SetupProblem::NotDiscovered));
    // What discovery left; an asker that brought a result of its own has left nothing.
    const QVariantMap settings = input->context()->value(kContextKey, found.settings).toMap();

    QString uid;
    bool isNew = false;
    const FileProblem problem = accountFile().change([&](Accounts &accounts) {
        const auto same = std::find_if(accounts.begin(), accounts.end(),
                                       [&](const QVariantMap &stored) { return m_kind->areSame(stored, settings); });
        isNew = same == accounts.end();
        uid = isNew ? QUuid::createUuid().toString(QUuid::WithoutBraces).toUpper() : same.key();
        QVariantMap &stored = accounts[uid];
        stored.insert(settings);
        stored.remove(kInactiveKey);
    });
    if (problem)
        return refuse(fileError(problem));
    isNew ? didCreateAccountUID(uid) : didChangeAccountUID(uid);
    return uid;
}

/// Nothing is kept anywhere but here, so that there is nothing to move.
void FileDataPlugin::nbsAccountStartedMigration(const std::shared_ptr<KAAccount> &account)
{
    nbsAccountMigrationFinished(account);
}

AccountFile FileDataPlugin::accountFile() const
{
    return AccountFile(QStringLiteral("%1/kavell-accounts-example/%2.json")
                           .arg(QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation), identifier()));
}

/// Who asks for accounts can be told no error: one line in the log, and there are none.
Accounts FileDataPlugin::storedAccounts() const
{
    Accounts accounts;
    if (const FileProblem problem = accountFile().read(&accounts))
        qWarning("%s", qUtf8Printable(fileError(problem).description()));
    return accounts;
}

QString FileDataPlugin::text(const char *key) const
{
    return bundle()->localizedString(QLatin1String(key));
}

KAError FileDataPlugin::setupError(SetupProblem problem) const
{
    const ProblemRow &row = rowOf(problem);
    QVariantMap information{{KAError::localizedDescriptionKey, text(row.textKey)}};
    if (!row.isFatal) {
        information.insert(kKANonFatalError, true);
        information.insert(kKACanContinueInOnwardenAfterError, true);
    }
    return {kKAErrorDomain, static_cast<qint64>(problem), information};
}

KAError FileDataPlugin::fileError(const FileProblem &problem) const
{
    const QString sentence = text(textKeyOf(problem.kind)).arg(accountFile().path(), problem.detail);
    return {
        kKAErrorDomain, static_cast<qint64>(SetupProblem::FileProblem), {{KAError::localizedDescriptionKey, sentence}}};
}

KA_EXPORT_PLUGIN(FileDataPlugin)
