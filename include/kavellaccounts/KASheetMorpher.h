// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Swaps the content of a sheet, resizing the sheet to the new view and, when asked, cross-fading from a picture of the
// old content to one of the new while the frame moves. The sheet's top edge and horizontal middle stay where they were.
// User-interface thread only.

#ifndef KAVELLACCOUNTS_KASHEETMORPHER_H
#define KAVELLACCOUNTS_KASHEETMORPHER_H

#include <memory>

#include <QtWidgets/QWidget>

#include <kavellaccounts/KAExport.h>
#include <kavellaccounts/KAObject.h>

class KASheetWindow;

class KAVELL_ACCOUNTS_EXPORT KASheetMorpher : public KAObject {
public:
    [[nodiscard]] static std::shared_ptr<KASheetMorpher>
    initWithHostSheet(const std::shared_ptr<KASheetWindow> &hostSheet);
    ~KASheetMorpher() override;

    [[nodiscard]] std::shared_ptr<KASheetWindow> hostSheet() const;
    void setHostSheet(std::shared_ptr<KASheetWindow> hostSheet);

    /// Makes `view` the sheet's content; nothing happens when it is so already. With `animate` returns when the
    /// animation has ended (the event loop runs meanwhile), and at once where no event loop can run.
    void setContentView(QWidget *view, bool animate);

    void describeFields(KAFieldList &fields) const override;

private:
    explicit KASheetMorpher(std::shared_ptr<KASheetWindow> hostSheet);
    std::shared_ptr<KASheetWindow> _hostSheet;
    std::unique_ptr<QWidget> _crossFadeImageView;  ///< made on first use and kept
};

#endif
