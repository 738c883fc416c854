// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "ui/certificate_panel.h"

#include <algorithm>
#include <utility>

#include <QtCore/QCryptographicHash>
#include <QtCore/QLocale>
#include <QtCore/QtMath>
#include <QtGui/QTextCursor>
#include <QtGui/QTextDocument>
#include <QtGui/QTextOption>
#include <QtGui/QTextTable>
#include <QtWidgets/QDialogButtonBox>
#include <QtWidgets/QHeaderView>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QTextEdit>
#include <QtWidgets/QTreeWidget>
#include <QtWidgets/QVBoxLayout>
#include <QtWidgets/QWhatsThis>

namespace kavell {

namespace {

constexpr int kPanelWidth = 560;
constexpr int kMargin = 16;
constexpr int kSpacing = 10;
constexpr int kCellPadding = 2;
constexpr float kDimmedOpacity = 0.65F;
constexpr qsizetype kVisibleCertificates = 5;
constexpr int kVisibleDetailLines = 14;
constexpr int kLongestWord = 40;

/// With invisible places to break long words at, since a host name of 250 letters would make the panel as wide.
QString withBreaks(const QString &text)
{
    constexpr QChar zeroWidthSpace(0x200B);
    QString broken;
    int word = 0;
    for (const QChar letter : text) {
        word = letter.isSpace() ? 0 : word + 1;
        broken += letter;
        if (word >= kLongestWord && !letter.isHighSurrogate()) {
            broken += zeroWidthSpace;
            word = 0;
        }
    }
    return broken;
}

QLabel *wrappedLabel(const QString &text)
{
    auto *label = new QLabel(withBreaks(text));
    label->setAccessibleName(text);
    label->setTextFormat(Qt::PlainText);  // host names and titles come from outside
    label->setWordWrap(true);
    return label;
}

QString titleOf(const QSslCertificate &certificate)
{
    const QString name = certificate.subjectDisplayName();
    return name.isEmpty() ? QString::fromLatin1(certificate.serialNumber()) : name;
}

using DetailRow = std::pair<QString, QString>;

/// As high as it must be, instead of the toolkit's fixed guess.
class DetailsView : public QTextEdit {
public:
    [[nodiscard]] QSize sizeHint() const override { return {QTextEdit::sizeHint().width(), minimumHeight()}; }
};

/// Labels in one column, values in the other, beginning at the language's side; a row without a value is left out.
void fillTable(QTextEdit *edit, QList<DetailRow> rows)
{
    rows.removeIf([](const DetailRow &row) { return row.second.isEmpty(); });
    int widest = 0;
    for (const auto &[label, value] : std::as_const(rows))
        widest = std::max(widest, edit->fontMetrics().horizontalAdvance(label));
    QTextTableFormat format;
    format.setBorder(0);
    format.setCellSpacing(0);
    format.setCellPadding(kCellPadding);
    const int labelColumn = edit->isRightToLeft() ? 1 : 0;
    QList<QTextLength> widths(2);
    widths[labelColumn] = QTextLength(QTextLength::FixedLength, widest + kSpacing);
    format.setColumnWidthConstraints(widths);
    QTextTable *table = edit->textCursor().insertTable(static_cast<int>(rows.size()), 2, format);
    QTextCharFormat dimmed;
    QColor colour = edit->palette().color(QPalette::Text);
    colour.setAlphaF(kDimmedOpacity);
    dimmed.setForeground(colour);
    for (int row = 0; row < table->rows(); ++row) {
        table->cellAt(row, labelColumn).firstCursorPosition().insertText(rows[row].first, dimmed);
        const QString &value = rows[row].second;
        QTextBlockFormat direction;
        direction.setLayoutDirection(value.isRightToLeft() ? Qt::RightToLeft : Qt::LeftToRight);
        QTextCursor cursor = table->cellAt(row, 1 - labelColumn).firstCursorPosition();
        cursor.mergeBlockFormat(direction);
        cursor.insertText(value);
    }
}

}  // namespace

CertificatePanel::CertificatePanel(const CertificatePanelTexts &texts, const QList<QSslCertificate> &chain)
    : m_texts(texts), m_chain(chain)
{
    setWindowTitle(texts.message);
    setModal(true);
    auto *column = new QVBoxLayout(this);
    column->setContentsMargins(kMargin, kMargin, kMargin, kMargin);
    column->setSpacing(kSpacing);
    addMessages();
    addChain();
    addDetails();
    addButtons();
    // The texts wrap: how high they are follows from the width.
    resize(kPanelWidth, column->hasHeightForWidth() ? column->totalHeightForWidth(kPanelWidth) : sizeHint().height());
}

CertificatePanel::~CertificatePanel() = default;

void CertificatePanel::addMessages()
{
    QLabel *message = wrappedLabel(m_texts.message);
    QFont bold = message->font();
    bold.setBold(true);
    message->setFont(bold);
    message->setObjectName("message");
    layout()->addWidget(message);
    QLabel *informative = wrappedLabel(m_texts.informative);
    informative->setObjectName("informative");
    informative->setVisible(!m_texts.informative.isEmpty());
    layout()->addWidget(informative);
}

void CertificatePanel::addChain()
{
    m_tree = new QTreeWidget;
    m_tree->setObjectName("chain");
    m_tree->setAccessibleName(m_texts.chainName);
    m_tree->setHeaderHidden(true);
    m_tree->setRootIsDecorated(m_chain.size() > 1);
    m_tree->setUniformRowHeights(true);
    m_tree->setTextElideMode(Qt::ElideMiddle);
    // The server's own certificate comes first; each further one vouches for the one before it and stands above it.
    QTreeWidgetItem *parent = m_tree->invisibleRootItem();
    for (qsizetype index = m_chain.size(); index-- > 0;) {
        auto *item = new QTreeWidgetItem(parent, {titleOf(m_chain[index])});
        item->setData(0, Qt::UserRole, index);
        parent = item;
    }
    m_tree->expandAll();
    const auto rows = static_cast<int>(std::min(m_chain.size(), kVisibleCertificates));
    m_tree->setFixedHeight(rows * m_tree->sizeHintForRow(0) + 2 * m_tree->frameWidth());
    connect(m_tree, &QTreeWidget::currentItemChanged, this, [this](const QTreeWidgetItem *item) {
        if (item && m_details)
            showDetails(m_chain[item->data(0, Qt::UserRole).toLongLong()]);
    });
    m_tree->setCurrentItem(parent);
    layout()->addWidget(m_tree);
}

void CertificatePanel::addDetails()
{
    m_details = new DetailsView;
    m_details->setObjectName("details");
    m_details->setReadOnly(true);
    m_details->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    // All start at the language's side, while each value runs as its own letters do, so that no fingerprint is turned
    // round.
    QTextOption option(Qt::AlignAbsolute | (isRightToLeft() ? Qt::AlignRight : Qt::AlignLeft));
    option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    m_details->document()->setDefaultTextOption(option);
    m_details->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    m_details->setTabChangesFocus(true);
    m_details->setAccessibleName(m_texts.detailsName);
    // As high as the longest of the details, so that nothing moves from one certificate to the next.
    const int frame = 2 * m_details->frameWidth();
    qreal height = 0;
    for (const QSslCertificate &certificate : m_chain) {
        showDetails(certificate);
        m_details->document()->setTextWidth(kPanelWidth - 2 * kMargin - frame);
        height = std::max(height, m_details->document()->size().height());
    }
    showDetails(m_chain.first());
    const qreal most = m_details->fontMetrics().lineSpacing() * kVisibleDetailLines;
    m_details->setMinimumHeight(qCeil(std::min(height, most)) + frame);
    layout()->addWidget(m_details);
}

void CertificatePanel::addButtons()
{
    auto *buttons = new QDialogButtonBox;
    QPushButton *go = buttons->addButton(m_texts.continueButton, QDialogButtonBox::AcceptRole);
    QPushButton *cancel = buttons->addButton(m_texts.cancelButton, QDialogButtonBox::RejectRole);
    QPushButton *help = buttons->addButton(m_texts.helpButton, QDialogButtonBox::HelpRole);
    go->setObjectName("continue");
    cancel->setObjectName("cancel");
    help->setObjectName("help");
    help->setAccessibleDescription(m_texts.help);  // the bubble is out of a screen reader's reach
    go->setDefault(true);
    cancel->setAutoDefault(false);
    help->setAutoDefault(false);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    connect(buttons, &QDialogButtonBox::helpRequested, this,
            [this, help] { QWhatsThis::showText(help->mapToGlobal(QPoint(0, 0)), m_texts.help, help); });
    layout()->addWidget(buttons);
}

void CertificatePanel::showDetails(const QSslCertificate &certificate)
{
    const QLocale locale;
    const auto date = [&](const QDateTime &time) {
        return locale.toString(time.toLocalTime(), QLocale::LongFormat);
    };
    const QString digest = QString::fromLatin1(certificate.digest(QCryptographicHash::Sha256).toHex(':')).toUpper();
    const QList<DetailRow> rows = {
        {m_texts.subject, certificate.subjectDisplayName()},
        {m_texts.issuer, certificate.issuerDisplayName()},
        {m_texts.validFrom, date(certificate.effectiveDate())},
        {m_texts.validUntil, date(certificate.expiryDate())},
        {m_texts.names, certificate.subjectAlternativeNames().values().join(QLatin1String(", "))},
        {m_texts.fingerprint, digest},
    };
    m_details->clear();
    fillTable(m_details, rows);
    m_details->moveCursor(QTextCursor::Start);
}

}  // namespace kavell
