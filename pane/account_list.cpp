// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/account_list.h"

#include <QtGui/QPainter>
#include <QtGui/QTextDocument>
#include <QtWidgets/QApplication>
#include <QtWidgets/QStyledItemDelegate>

#include "pane/provider_looks.h"

namespace kavell::pane {

namespace {

enum Role { kNameRole = Qt::UserRole + 1, kSubtitleRole, kSummaryRole };

constexpr int kIconSide = 24;
constexpr int kRowMargin = 6;
constexpr int kIndentation = kIconSide + kRowMargin;  // accounts stand below their provider's name
constexpr qreal kSubtitleShade = 0.7;                 // of the text's own opacity

/// Two lines: what the user calls the account, and its login name.
class TwoLineDelegate : public QStyledItemDelegate {
public:
    using QStyledItemDelegate::QStyledItemDelegate;

    [[nodiscard]] QSize sizeHint(const QStyleOptionViewItem &option, const QModelIndex &index) const override
    {
        const int lines = index.data(kSubtitleRole).toString().isEmpty() ? 1 : 2;
        QSize size = QStyledItemDelegate::sizeHint(option, index);
        size.setHeight(std::max(option.fontMetrics.height() * lines, kIconSide) + 2 * kRowMargin);
        return size;
    }

    void paint(QPainter *painter, const QStyleOptionViewItem &option, const QModelIndex &index) const override
    {
        const QString subtitle = index.data(kSubtitleRole).toString();
        if (subtitle.isEmpty()) {
            QStyledItemDelegate::paint(painter, option, index);
            return;
        }
        QStyleOptionViewItem row = option;
        initStyleOption(&row, index);
        const QStyle *const style = row.widget ? row.widget->style() : QApplication::style();
        const QString title = row.text;
        // As far from the edge as the style draws single lines.
        const int margin = style->pixelMetric(QStyle::PM_FocusFrameHMargin, &row, row.widget) + 1;
        const QRect textArea =
            style->subElementRect(QStyle::SE_ItemViewItemText, &row, row.widget).adjusted(margin, 0, -margin, 0);
        row.text.clear();
        style->drawControl(QStyle::CE_ItemViewItem, &row, painter, row.widget);
        paintLines(painter, row, textArea, title, subtitle);
    }

private:
    static void paintLines(QPainter *painter, const QStyleOptionViewItem &row, const QRect &area, const QString &title,
                           const QString &subtitle)
    {
        const QPalette::ColorGroup group = !(row.state & QStyle::State_Enabled) ? QPalette::Disabled
                                           : (row.state & QStyle::State_Active) ? QPalette::Active
                                                                                : QPalette::Inactive;
        const QColor colour =
            row.palette.color(group, (row.state & QStyle::State_Selected) ? QPalette::HighlightedText : QPalette::Text);
        const int height = row.fontMetrics.height();
        const QRect first(area.left(), area.center().y() - height, area.width(), height);
        const auto draw = [&](const QRect &line, const QString &text, qreal opacity) {
            painter->setOpacity(opacity);
            painter->drawText(line,
                              static_cast<int>(row.displayAlignment & Qt::AlignHorizontal_Mask) | Qt::AlignVCenter,
                              row.fontMetrics.elidedText(text, Qt::ElideRight, line.width()));
        };
        painter->save();
        painter->setFont(row.font);
        painter->setPen(colour);
        draw(first, title, 1);
        draw(first.translated(0, height), subtitle, kSubtitleShade);
        painter->restore();
    }
};

/// Shows a summary in an item; does nothing when the item shows it already.
void describe(QStandardItem &item, const AccountSummary &account)
{
    if (item.data(kSummaryRole).value<AccountSummary>() == account)
        return;
    const bool isNamed = !account.description.isEmpty() && account.description != account.name.loginName;
    const QString title = isNamed ? account.description : account.name.loginName;
    QString subtitle = isNamed ? account.name.loginName : QString();
    if (!account.isEnabled)
        subtitle = isNamed ? qtTrId("DISABLED_ACCOUNT").arg(subtitle) : qtTrId("DISABLED");
    item.setText(title);
    item.setData(subtitle, kSubtitleRole);
    item.setData(subtitle.isEmpty() ? title : qtTrId("ACCESSIBLE_ACCOUNT").arg(title, subtitle),
                 Qt::AccessibleTextRole);
    // What the user typed must not be taken for markup.
    item.setToolTip(Qt::convertFromPlainText(subtitle.isEmpty() ? title : title + u'\n' + subtitle));
    item.setData(QVariant::fromValue(account), kSummaryRole);
}

}  // namespace

AccountList::AccountList(QWidget *parent) : QTreeView(parent)
{
    setModel(&m_model);
    setItemDelegate(new TwoLineDelegate(this));
    setHeaderHidden(true);
    setRootIsDecorated(false);
    setItemsExpandable(false);
    setIndentation(kIndentation);
    setIconSize({kIconSide, kIconSide});
    setUniformRowHeights(false);
    setEditTriggers(NoEditTriggers);
    setSelectionMode(SingleSelection);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setTextElideMode(Qt::ElideRight);
    setAccessibleName(qtTrId("ACCOUNTS"));
}

AccountList::~AccountList() = default;

void AccountList::showAccounts(const QList<AccountGroup> &groups)
{
    const AccountName before = selectedAccount();
    QStandardItem *const root = m_model.invisibleRootItem();
    for (int row = 0; row < groups.size(); ++row) {
        const AccountGroup &group = groups[row];
        while (row < root->rowCount() && root->child(row)->data(kNameRole).toString() != group.providerType &&
               std::none_of(groups.begin(), groups.end(), [&](const AccountGroup &other) {
                   return other.providerType == root->child(row)->data(kNameRole).toString();
               }))
            root->removeRow(row);
        if (row >= root->rowCount() || root->child(row)->data(kNameRole).toString() != group.providerType) {
            auto *const item =
                new QStandardItem(brandIcon(group.plugin), providerTitle(group.providerType, group.plugin));
            item->setData(group.providerType, kNameRole);
            item->setFlags(Qt::ItemIsEnabled);
            QFont font = item->font();
            font.setBold(true);
            item->setFont(font);
            root->insertRow(row, item);
            expand(item->index());
        }
        updateGroup(*root->child(row), group.accounts);
    }
    root->removeRows(static_cast<int>(groups.size()), root->rowCount() - static_cast<int>(groups.size()));
    if (!before.isNull())
        selectAccount(before);
}

void AccountList::updateGroup(QStandardItem &group, const QList<AccountSummary> &accounts)
{
    int row = 0;
    for (const AccountSummary &account : accounts) {
        const auto loginNameAt = [&](int at) {
            return group.child(at)->data(kNameRole).toString();
        };
        // Both are in one order, so what comes before the account's place has gone.
        while (row < group.rowCount() && loginNameAt(row) != account.name.loginName &&
               QString::localeAwareCompare(loginNameAt(row), account.name.loginName) < 0)
            group.removeRow(row);
        if (row >= group.rowCount() || loginNameAt(row) != account.name.loginName) {
            auto *const item = new QStandardItem;
            item->setData(account.name.loginName, kNameRole);
            group.insertRow(row, item);
        }
        describe(*group.child(row), account);
        ++row;
    }
    group.removeRows(row, group.rowCount() - row);
}

AccountName AccountList::selectedAccount() const
{
    const QModelIndexList indexes = selectionModel()->selectedIndexes();
    return indexes.isEmpty() ? AccountName() : indexes.first().data(kSummaryRole).value<AccountSummary>().name;
}

bool AccountList::selectAccount(const AccountName &name)
{
    for (int group = 0; group < m_model.rowCount(); ++group) {
        const QStandardItem *const parent = m_model.item(group);
        if (parent->data(kNameRole).toString() != name.providerType)
            continue;
        for (int row = 0; row < parent->rowCount(); ++row) {
            if (parent->child(row)->data(kNameRole).toString() == name.loginName) {
                setCurrentIndex(parent->child(row)->index());
                return true;
            }
        }
    }
    return false;
}

void AccountList::selectFirst()
{
    if (m_model.rowCount() > 0 && m_model.item(0)->rowCount() > 0)
        setCurrentIndex(m_model.item(0)->child(0)->index());
}

void AccountList::selectionChanged(const QItemSelection &now, const QItemSelection &before)
{
    QTreeView::selectionChanged(now, before);
    const AccountName name = selectedAccount();
    if (name == m_told)
        return;
    m_told = name;
    emit selected(name);
}

}  // namespace kavell::pane
