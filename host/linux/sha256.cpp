#include "host/linux/sha256.h"

#include <openssl/evp.h>

namespace host {

Result<Sha256> sha256(std::span<const std::byte> data) {
    Sha256 hash = {};
    unsigned size = 0;
    if (EVP_Digest(data.data(), data.size(), reinterpret_cast<unsigned char*>(hash.data()), &size,
                   EVP_sha256(), nullptr) != 1 ||
        size != hash.size())
        return Status(ENOTSUP);
    return hash;
}

std::string to_hexadecimal(const Sha256& hash) {
    constexpr char digits[] = "0123456789abcdef";
    std::string text;
    text.reserve(2 * hash.size());
    for (const std::byte byte : hash) {
        text += digits[std::to_integer<unsigned>(byte) >> 4];
        text += digits[std::to_integer<unsigned>(byte) & 15];
    }
    return text;
}

} // namespace host
