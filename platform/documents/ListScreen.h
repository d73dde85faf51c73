#pragma once

#include "platform/documents/DocumentListController.h"
#include "platform/documents/DocumentServices.h"
#include "platform/documents/FolderPage.h"
#include "platform/documents/list/ListClient.h"
#include "platform/documents/list/ListView.h"
#include "platform/documents/list/RowArrivals.h"
#include "platform/documents/list/RowSelection.h"
#include "platform/documents/model/FolderModel.h"

#include <map>
#include <memory>

namespace platform {

struct ListState;
class SearchPill;

/// What a list controller is made of: the folder's model, the list on screen and what is decided
/// between them.
struct DocumentListController::Impl final : ListClient {
    Impl(const Url& folder, const DocumentServices& services);
    ~Impl() override;

    void makeView();
    void willAppear();
    void willDisappear();
    void setEditing(bool value, bool animated);
    void repaint();
    RowSelection& selection();
    void openSearch();
    bool leaveEditing();
    /// The delegate hears of it once a turn of the loop.
    void itemsChanged();
    std::vector<Url> urlsOf(const std::vector<std::size_t>& rows) const;

    void listDidOpenRow(std::size_t index) override;
    unsigned listActions() const override { return actions; }
    void listDidChooseAction(int action, std::size_t index, Rect from,
                             std::function<void()> done) override;
    void listDidAskForActions(std::size_t index, Rect from, std::function<void()> done) override;
    void listSelectionDidChange() override { itemsChanged(); }
    void listDidScroll() override;
    void listDidAskForRefresh(std::function<void()> done) override;
    bool listCanRefresh() const override { return true; }

    DocumentListController* self = nullptr;
    const DocumentServices services;
    const std::shared_ptr<FolderModel> model;
    std::weak_ptr<DocumentListControllerDelegate> delegate;
    std::map<std::string, std::shared_ptr<void>> associated;
    unsigned actions = 0;
    /// None before the view is loaded.
    std::shared_ptr<ListView> list;
    bool editing = false;

private:
    ListState& rows() const;
    void rowsChanged();
    void followArrivals();
    StatusPage::Content emptyPage() const;
    void performAction(int action, const Url& url, Rect from, std::function<void()> done);

    /// What was selected before the view was loaded, which takes it over.
    RowSelection early_;
    RowArrivals arrivals_;
    /// None before the view is loaded.
    std::unique_ptr<FolderPage> page_;
    std::shared_ptr<SearchPill> pill_; // as is this
    bool reportPending_ = false;
    std::shared_ptr<bool> alive_ = std::make_shared<bool>(true);
};

} // namespace platform
