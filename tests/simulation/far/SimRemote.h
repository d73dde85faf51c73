#pragma once

#include "platform/cloud/Remote.h"
#include "tests/simulation/far/FarSide.h"

#include <deque>

namespace simulation {

/// What goes wrong with one call of the remote.
struct FarFault {
    enum class Kind {
        failBefore, // nothing was done
        failAfter,  // it was done, and the answer is lost
        late,       // the answer takes a long while
        cut,        // the connection ends in the middle of a content
        shortList,  // a listing lacks one of its entries
        emptyList   // a listing lacks all of them
    };
    Kind kind = Kind::failBefore;
    platform::ErrorCode error = platform::ErrorCode::serverNotAvailable;
};

/// State of the way to the far side, which outlives the engine that uses it.
struct FarLine {
    /// By the number of the call from now on (0 is the next one).
    std::map<std::uint64_t, FarFault> faults;
    bool away = false;      // nothing can be reached
    bool otherDisk = false; // something else, and empty, lies at the address
    bool muddled = false;   // listings and versions are empty, as of a mount that went away
    /// Virtual time that a call takes.
    std::int64_t latency = 0;
    /// Of a thousand places in a call, how many let others run.
    unsigned pauses = 300;
    Luck luck;

    std::uint64_t calls = 0;
    std::uint64_t changes = 0;
    std::vector<std::string> log; // of changes, kept when `keepsLog`
    bool keepsLog = false;
    /// Contents that the engine was told of, as versions of the far side.
    std::set<std::string> told;
    /// The machine has been switched off: nothing of what still runs there arrives here.
    std::function<bool()> machineIsOff;
};

/// The remote of an account, on a far side that others change as well.
class SimRemote final : public platform::Remote {
public:
    SimRemote(FarSide& far, FarLine& line) : far_(far), line_(line) {}
    static constexpr const char* mark = "the far side";

    platform::Result<std::string> connect(platform::CancelFlag& cancel) override;
    platform::Result<platform::RemoteListing> list(const std::string& path,
                                                   platform::CancelFlag& cancel) override;
    platform::Result<platform::RemoteEntry> entry(const std::string& path,
                                                  platform::CancelFlag& cancel) override;
    platform::Result<platform::RemoteEntry> read(const std::string& path, const Sink& sink,
                                                 platform::CancelFlag& cancel) override;
    platform::Result<platform::RemoteEntry> write(const std::string& path,
                                                  const platform::RemoteUpload& upload,
                                                  const platform::RemoteCondition& condition,
                                                  platform::CancelFlag& cancel) override;
    platform::Result<platform::RemoteEntry> makeFolder(const std::string& path,
                                                       platform::CancelFlag& cancel) override;
    platform::Result<platform::RemoteEntry> move(const std::string& from, const std::string& to,
                                                 const std::string& etag,
                                                 platform::CancelFlag& cancel) override;
    platform::Failure remove(const std::string& path, platform::ItemKind kind,
                             const std::string& etag, platform::CancelFlag& cancel) override;
    platform::Failure sync(platform::CancelFlag& cancel) override;
    platform::Result<std::optional<std::uint64_t>> freeBytes(platform::CancelFlag& cancel) override;

private:
    /// One call: its fault, and the passing of time in it.
    struct Call {
        std::optional<FarFault> fault;
        bool is(FarFault::Kind kind) const { return fault && fault->kind == kind; }
    };
    platform::Failure begin(Call& call, platform::CancelFlag& cancel);
    /// The answer's way back; the error that the engine gets in its place, if any.
    platform::Failure finish(const Call& call, platform::CancelFlag& cancel);
    void pause(platform::CancelFlag& cancel);
    void waitFor(std::int64_t nanoseconds, platform::CancelFlag& cancel);
    platform::RemoteEntry entryOf(const FarItem& item);
    platform::Result<platform::RemoteEntry> answer(const std::string& path, const Call& call,
                                                   std::uint64_t version,
                                                   platform::CancelFlag& cancel);
    platform::Result<std::string> receive(const platform::RemoteUpload& upload, const Call& call,
                                          platform::CancelFlag& cancel);
    platform::Failure check(const std::string& path, const platform::RemoteCondition& condition);
    platform::Failure replaceInSteps(const std::string& path, const std::string& content,
                                     const platform::RemoteUpload& upload,
                                     const platform::RemoteCondition& condition, const Call& call,
                                     platform::CancelFlag& cancel);
    void note(std::string what);

    FarSide& far_;
    FarLine& line_;
};

} // namespace simulation
