#include "platform/documents/preview/AddressOpener.h"

#include "platform/base/Text.h"
#include "platform/documents/preview/CleanHtml.h"
#include "platform/launch/Alerts.h"
#include "platform/launch/ApplicationDatabase.h"
#include "platform/launch/ApplicationStart.h"

namespace platform {

void openAddress(const std::string& address) {
    const QString text = QString::fromStdString(address);
    if (!isOpenableAddress(text))
        return;
    const std::string title = localizedFormat("“%1$@” could not be opened", address);
    const auto tell = [title](const Error& error) { showFailure(title, error); };
    const std::string scheme = text.left(text.indexOf(u':')).toLower().toStdString();
    const ApplicationDatabase::Entry handler =
        ApplicationDatabase::shared().handlerOfScheme(scheme);
    if (!handler) {
        tell(makeErrorWithText(ErrorCode::unsupportedOperation,
                               localized("There is no application for it on this device.")));
        return;
    }
    if (const Failure failure = ApplicationStart::open(*handler, ExecTarget(address), tell))
        tell(*failure);
}

} // namespace platform
