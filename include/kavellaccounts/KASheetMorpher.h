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

namespace kavell {
class CrossFadeView;
}

class KAVELL_ACCOUNTS_EXPORT KASheetMorpher : public KAObject {
public:
    [[nodiscard]] static std::shared_ptr<KASheetMorpher>
    initWithHostSheet(const std::shared_ptr<KASheetWindow> &hostSheet);
    ~KASheetMorpher() override;

    [[nodiscard]] std::shared_ptr<KASheetWindow> hostSheet() const;
    void setHostSheet(std::shared_ptr<KASheetWindow> hostSheet);

    /// Makes `view` the sheet's content; nothing happens when it is so already. With `animate` returns when the
    /// animation has ended (the event loop runs meanwhile), and at once where no event loop can run. The animation
    /// lasts as long as the style's others (200 ms, usually). The view that is taken out is not deleted. A call that
    /// comes meanwhile, from an event, wins.
    void setContentView(QWidget *view, bool animate);

    void describeFields(KAFieldList &fields) const override;

private:
    explicit KASheetMorpher(std::shared_ptr<KASheetWindow> hostSheet);
    std::shared_ptr<KASheetWindow> _hostSheet;
    void swapAnimated(QWidget *view, const QRect &target);
    void prepareCrossFadeView(QWidget *view);

    std::unique_ptr<kavell::CrossFadeView> _crossFadeImageView;  ///< made on first use and kept
    std::shared_ptr<int> m_swap;                                 ///< stands for the latest call
};

#endif
