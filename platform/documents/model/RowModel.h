#pragma once

#include "platform/base/Error.h"
#include "platform/documents/model/DocumentEntry.h"

#include <optional>
#include <vector>

namespace platform {

enum class ModelState {
    /// Nothing is known yet. Not the same as empty.
    loading,
    ready,
    /// See RowModel::error.
    failed
};

/// Hears of a model's changes.
class RowModelObserver {
public:
    virtual ~RowModelObserver() = default;
    /// Rows are about to come, go or move: the last moment to look at the places of rows.
    virtual void rowsWillChange() = 0;
    virtual void rowsDidChange() = 0;
    /// The details of these rows were read, or what they show changed in place.
    virtual void rowContentDidChange(const std::vector<RowId>& rows) = 0;
    virtual void modelStateDidChange() = 0;
};

/// What a list shows, a row at an index. Belongs to the main thread.
class RowModel {
public:
    virtual ~RowModel() = default;

    virtual ModelState state() const = 0;
    /// Of the state `failed`.
    virtual const std::optional<Error>& error() const = 0;

    virtual std::size_t count() const = 0;
    virtual RowId idAt(std::size_t index) const = 0;
    virtual std::optional<std::size_t> indexOf(RowId id) const = 0;
    bool contains(RowId id) const { return indexOf(id).has_value(); }
    virtual const DocumentEntry& entryAt(std::size_t index) const = 0;
    virtual Url urlAt(std::size_t index) const = 0;
    /// None until they were read, which setRowsInView asks for.
    virtual std::shared_ptr<const EntryDetails> detailsAt(std::size_t index) const = 0;
    /// What the second line says besides, such as where a search found the item; "" for nothing.
    virtual std::string placeAt(std::size_t /*index*/) const { return {}; }

    /// The rows from `first` up to `end` are in view (or about to be).
    virtual void setRowsInView(std::size_t first, std::size_t end) = 0;
    void setObserver(RowModelObserver* observer) { observer_ = observer; }

protected:
    RowModelObserver* observer_ = nullptr;
};

} // namespace platform
