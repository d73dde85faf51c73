#include "platform/base/ByteCount.h"
#include "platform/base/Text.h"
#include "platform/documents/DocumentServices.h"
#include "platform/documents/preview/ContentsRenderer.h"
#include "platform/documents/preview/PackageFolder.h"
#include "platform/documents/preview/PreviewKinds.h"
#include "platform/launch/TypeRegistry.h"

namespace platform {
namespace {

class PackageRenderer final : public ContentsRenderer {
public:
    PackageRenderer(MainQueue& main, PreviewReports reports)
        : ContentsRenderer(main, std::move(reports)) {}

    void reload() override {
        worker_.cancel();
        worker_.run([this, file = file_, &documents = DocumentServices::current().documents](
                        PreviewToken& token) -> Job {
            const auto contents = std::make_shared<PackageContents>();
            const Failure failure = readDocument(
                file, token,
                [&](const std::string& path) {
                    auto listed = listPackage(Url::file(path, true), documents, token.flag());
                    if (!listed)
                        return Failure(listed.error());
                    *contents = std::move(*listed);
                    return Failure();
                },
                DocumentForm::package);
            return [this, contents, failure] { take(*contents, failure); };
        });
    }

private:
    void take(const PackageContents& contents, const Failure& failure) {
        const ContentsTree& tree = *contents.tree;
        if (failure || tree.count() == 0) {
            reports_.failed(
                failure ? *failure
                        : makeErrorWithText(ErrorCode::readCorrupt,
                                            localized("There is nothing in this document.")));
            return;
        }
        const std::string items =
            localizedPlural(".DICT.ITEMS.%d", static_cast<long long>(tree.fileCount()));
        std::vector<ContentsPage::Remark> remarks{
            {localized("This document consists of several files. A program that knows its kind "
                       "shows them as one."),
             false}};
        if (contents.cut)
            remarks.push_back({localized("There is more in this document than is listed here.")});
        page_->set(contents.tree,
                   localizedFormat("%1$@, %2$@", items,
                                   byteCountText(tree.totalSize(), ByteCountStyle::file)),
                   remarks);
        reports_.shown();
    }
};

} // namespace

const PreviewKind packagePreview{
    [](std::string_view identifier) {
        return TypeRegistry::conformsTo(identifier, types::package);
    },
    [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<PackageRenderer>(main, std::move(reports));
    }};

} // namespace platform
