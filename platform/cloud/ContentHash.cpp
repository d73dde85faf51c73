#include "platform/cloud/ContentHash.h"

#include <openssl/evp.h>

namespace platform {

struct ContentHash::State {
    std::unique_ptr<EVP_MD_CTX, decltype(&EVP_MD_CTX_free)> context{EVP_MD_CTX_new(),
                                                                    &EVP_MD_CTX_free};
};

ContentHash::ContentHash() : state_(std::make_unique<State>()) {
    EVP_DigestInit_ex(state_->context.get(), EVP_sha256(), nullptr);
}
ContentHash::~ContentHash() = default;

void ContentHash::add(std::span<const std::byte> piece) {
    EVP_DigestUpdate(state_->context.get(), piece.data(), piece.size());
}

Bytes ContentHash::finish() {
    Bytes result(32);
    unsigned length = 0;
    EVP_DigestFinal_ex(state_->context.get(), reinterpret_cast<unsigned char*>(result.data()),
                       &length);
    return result;
}

Bytes ContentHash::of(std::string_view content) {
    ContentHash hash;
    hash.add(std::as_bytes(std::span(content)));
    return hash.finish();
}

} // namespace platform
