#include "platform/documents/preview/OfficeConverter.h"

#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/ChildWork.h"
#include "platform/launch/TypeRegistry.h"

#include <QFile>
#include <QStandardPaths>

#include <algorithm>
#include <mutex>

namespace platform {
namespace {

using namespace std::chrono_literals;

/// A cold start on a slow machine takes 20 seconds, 500 pages of text another 20.
constexpr Duration longestConversion = 90s;
/// A longer document would take longer than anybody waits.
constexpr std::uint64_t mostDocumentBytes = 200'000'000;

constexpr std::string_view officeTypes[] = {
    "application/msword",
    "application/msword-template",
    "application/rtf",
    "application/vnd.ms-excel",
    "application/vnd.ms-excel.sheet.macroenabled.12",
    "application/vnd.ms-powerpoint",
    "application/vnd.ms-powerpoint.presentation.macroenabled.12",
    "application/vnd.ms-word.document.macroenabled.12",
    "application/vnd.oasis.opendocument.graphics",
    "application/vnd.oasis.opendocument.presentation",
    "application/vnd.oasis.opendocument.presentation-template",
    "application/vnd.oasis.opendocument.spreadsheet",
    "application/vnd.oasis.opendocument.spreadsheet-template",
    "application/vnd.oasis.opendocument.text",
    "application/vnd.oasis.opendocument.text-template",
    "application/vnd.openxmlformats-officedocument.presentationml.presentation",
    "application/vnd.openxmlformats-officedocument.presentationml.slideshow",
    "application/vnd.openxmlformats-officedocument.presentationml.template",
    "application/vnd.openxmlformats-officedocument.spreadsheetml.sheet",
    "application/vnd.openxmlformats-officedocument.spreadsheetml.template",
    "application/vnd.openxmlformats-officedocument.wordprocessingml.document",
    "application/vnd.openxmlformats-officedocument.wordprocessingml.template",
};
static_assert(std::is_sorted(std::begin(officeTypes), std::end(officeTypes)));

/// Settings of the profile: no macros, and nothing fetched from elsewhere because a document that
/// somebody only looks at says so.
constexpr std::string_view profileSettings =
    R"(<?xml version="1.0" encoding="UTF-8"?>
<oor:items xmlns:oor="http://openoffice.org/2001/registry" xmlns:xs="http://www.w3.org/2001/XMLSchema" xmlns:xsi="http://www.w3.org/2001/XMLSchema-instance">
<item oor:path="/org.openoffice.Office.Common/Security/Scripting"><prop oor:name="MacroSecurityLevel" oor:op="fuse"><value>3</value></prop></item>
<item oor:path="/org.openoffice.Office.Common/Security/Scripting"><prop oor:name="DisableMacrosExecution" oor:op="fuse"><value>true</value></prop></item>
<item oor:path="/org.openoffice.Office.Common/Security/Scripting"><prop oor:name="DisableActiveContent" oor:op="fuse"><value>true</value></prop></item>
<item oor:path="/org.openoffice.Office.Common/Security/Scripting"><prop oor:name="BlockUntrustedRefererLinks" oor:op="fuse"><value>true</value></prop></item>
<item oor:path="/org.openoffice.Office.Calc/Content/Update"><prop oor:name="Link" oor:op="fuse"><value>1</value></prop></item>
<item oor:path="/org.openoffice.Office.Writer/Content/Update"><prop oor:name="Link" oor:op="fuse"><value>0</value></prop></item>
</oor:items>
)";

/// Memory and the largest file, in the shell's units (KiB and blocks of 512 bytes), end the child
/// and not this machine when a document asks for everything.
constexpr const char* limitedStart =
    R"(ulimit -c 0; ulimit -v 6291456; ulimit -f 1048576; exec "$0" "$@")";

/// Letters and digits alone: the rest of a name means something to somebody.
std::string safeExtension(const Url& document) {
    std::string out;
    for (const char each : document.pathExtension())
        if ((each >= 'a' && each <= 'z') || (each >= 'A' && each <= 'Z') ||
            (each >= '0' && each <= '9'))
            out += each;
    return out;
}

/// One at a time: they share a profile, which is locked while one runs.
std::mutex& conversion() {
    static std::mutex mutex;
    return mutex;
}

void makeProfile(const std::string& folder) {
    const Url settings = Url::file(folder + "/user/registrymodifications.xcu");
    if (FileManager::exists(settings.path()))
        return;
    // Without them it makes the same pages.
    if (!FileManager::createDirectory(Url::file(folder + "/user", true), true))
        (void)FileManager::writeAtomically(settings, profileSettings, 0600);
}

Error cannotBeShown(const Url& document) {
    return makeErrorWithText(
        ErrorCode::readCorrupt,
        localizedFormat("“%1$@” cannot be shown. It may be damaged, or need a password.",
                        displayName(document.lastPathComponent())));
}

} // namespace

bool isOfficeType(std::string_view typeIdentifier) {
    return std::binary_search(std::begin(officeTypes), std::end(officeTypes),
                              TypeRegistry::mimeTypeForIdentifier(typeIdentifier));
}

std::optional<std::string> officeProgram() {
    for (const char* const name : {"soffice", "libreoffice"}) {
        const QString found = QStandardPaths::findExecutable(QLatin1String(name));
        if (!found.isEmpty())
            return QFile::encodeName(found).toStdString();
    }
    return std::nullopt;
}

OfficeConverter::OfficeConverter(std::string program, OfficeCache cache, Clock& clock)
    : program_(std::move(program)), cache_(std::move(cache)), clock_(clock) {
}

Result<std::string> OfficeConverter::convert(const Url& document, const std::string& workFolder,
                                             PreviewToken& token) {
    std::string cached;
    const std::string copy = workFolder + "/document." + safeExtension(document);
    // A copy, so that nobody waits for the office program to be able to change the document.
    const Failure failure = readDocument(document, token, [&](const std::string& path) -> Failure {
        const auto attributes = FileManager::attributes(path, FollowLinks::yes);
        if (!attributes)
            return attributes.error();
        cached = cache_.pathFor(*attributes);
        if (cache_.has(cached))
            return std::nullopt;
        if (attributes->size > mostDocumentBytes)
            return makeErrorWithText(ErrorCode::unsupportedOperation,
                                     localized("This document is too large to be shown here."));
        return FileManager::copyFile(Url::file(path), Url::file(copy));
    });
    if (failure)
        return *failure;
    if (!FileManager::exists(copy))
        return cached;
    Failure fault = makePages(document, copy, workFolder, token);
    (void)FileManager::removeItem(Url::file(copy));
    if (!fault)
        fault = cache_.put(workFolder + "/document.pdf", cached);
    if (fault)
        return *fault;
    return cached;
}

Failure OfficeConverter::makePages(const Url& document, const std::string& copy,
                                   const std::string& workFolder, PreviewToken& token) {
    const std::lock_guard one(conversion());
    const std::string profile = cache_.profileFolder();
    // An office program that was killed may have left a profile that does not work any more.
    for (const bool last : {false, true}) {
        makeProfile(profile);
        ProgramStart start{{"sh", "-c", limitedStart, program_, "--headless", "--norestore",
                            "--nologo", "--nodefault", "--nofirststartwizard",
                            "-env:UserInstallation=" + Url::file(profile).absoluteString(),
                            "--convert-to", "pdf", "--outdir", workFolder, copy},
                           workFolder,
                           {{"SAL_USE_VCLPLUGIN", "svp"}}};
        const ChildEnd end = runChild(std::move(start), token, clock_, longestConversion,
                                      [](std::string_view) { return true; });
        if (end == ChildEnd::cancelled)
            return makeError(ErrorCode::userCancelled);
        if (end == ChildEnd::outOfTime)
            return makeErrorWithText(ErrorCode::timedOut,
                                     localized("It takes too long to show this document here."));
        if (FileManager::exists(workFolder + "/document.pdf"))
            return std::nullopt;
        if (end == ChildEnd::done || last)
            break;
        (void)FileManager::removeItem(Url::file(profile, true));
    }
    return cannotBeShown(document);
}

} // namespace platform
