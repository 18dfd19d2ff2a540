// Any bytes as a request from another process: refused, or taken apart and put together again the same.
#include <MessageEnvelope.h>

#include <cstring>

namespace {

void Require(bool condition) {
    if (!condition)
        __builtin_trap();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::span<const char> request(reinterpret_cast<const char*>(data), size);
    const std::optional<MessageEnvelope> envelope = read_request(request);
    if (!envelope)
        return 0;
    Require(kEnvelopeSize + envelope->message.size() + envelope->previous.size() == size);
    std::vector<char> again = make_request(*envelope, envelope->message.size(), envelope->previous.size());
    Require(again.size() == size && std::memcmp(again.data(), data, kEnvelopeSize) == 0);
    return 0;
}
