#pragma once

#include "tests/webdav/HttpHost.h"

#include <atomic>
#include <mutex>
#include <random>

namespace test {

/// Stands between a client and a server and spoils what passes, from a seed: requests and answers
/// that are cut at any byte, answers that get lost after the server did what was asked, answers in
/// the server's stead, bodies that are shorter than they were and say so, delays.
class FaultProxy {
public:
    FaultProxy(std::string server, unsigned seed);

    std::string url() const { return host_.url(); }
    /// Of a thousand requests so many are spoilt.
    void spoil(int ofThousand) { spoilt_ = ofThousand; }
    int faults() const { return faults_; }

private:
    enum class Fault {
        none,
        cutRequest,
        loseAnswer,
        cutAnswer,
        shortBody,
        refuse,
        busy,
        delay,
        count
    };
    WireReply pass(const WireRequest& request);
    WireReply forward(const WireRequest& request, std::optional<std::size_t> cut);
    Fault choose(std::size_t& where);

    const std::string server_;
    std::mutex mutex_;
    std::mt19937 random_; // guarded by mutex_
    std::atomic<int> spoilt_{0};
    std::atomic<int> faults_{0};
    HttpHost host_;
};

} // namespace test
