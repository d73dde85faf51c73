#pragma once

#include "platform/base/Url.h"
#include "platform/ui/ViewController.h"

#include <memory>
#include <string>

namespace platform {

class FolderModel;
class ListView;
class MovedItems;

/// What the screens of a chooser ask of it.
class TargetChooser {
public:
    virtual ~TargetChooser() = default;
    virtual const MovedItems& items() const = 0;
    virtual void openFolder(const Url& folder) = 0;
    /// The items are to go there.
    virtual void choose(const Url& folder) = 0;
    virtual void cancel() = 0;
};

/// One folder in the chooser: what is in it, of which only folders can be opened, whether the items
/// may go there, and a way to make a new folder in it.
class TargetScreen : public ViewController {
public:
    /// The chooser outlives its screens.
    static std::shared_ptr<TargetScreen> create(const Url& folder, TargetChooser& chooser);
    ~TargetScreen() override;

    const Url& folder() const;
    const FolderModel& model() const;
    ListView& list() const;
    /// Why the items cannot go there; "" when they can or when it is not known yet.
    const std::string& reason() const;

    void loadView() override;
    void viewWillAppear(bool animated) override;
    void viewDidAppear(bool animated) override;
    bool performKeyCommand(KeyCommand command) override;

    struct Impl;

private:
    explicit TargetScreen(std::unique_ptr<Impl> impl);
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
