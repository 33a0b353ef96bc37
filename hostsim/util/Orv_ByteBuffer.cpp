// The host's bit buffer: a zeroed byte array read as bits, least significant first.
#include <stdexcept>
#include <string>

#include "host/OrvUtil.h"

namespace OrvRT {

namespace {
int hexDigit(char c) {
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    return -1;
}
}  // namespace

Orv_ByteBuffer::Orv_ByteBuffer(uint32_t size, uint32_t /*growBy*/, uint32_t /*reserve*/)
    : bytes_(size, 0) {}

Orv_ByteBuffer::~Orv_ByteBuffer() = default;

uint64_t Orv_ByteBuffer::getBits(uint32_t first, uint32_t count) const {
    if (count > 64) {
        throw std::logic_error("Orv_ByteBuffer::getBits: " + std::to_string(count) +
                               " bits requested, at most 64 fit a value.");
    }
    // 64-bit positions: first + count may pass 2^32.
    const uint64_t totalBits = static_cast<uint64_t>(bytes_.size()) * 8u;
    uint64_t value = 0;
    uint32_t done = 0;
    while (done < count) {
        const uint64_t bit = static_cast<uint64_t>(first) + done;
        if (bit >= totalBits) break;  // bits past the end read 0
        const uint32_t shift = static_cast<uint32_t>(bit % 8u);
        uint32_t take = 8u - shift;
        if (take > count - done) take = count - done;
        const uint64_t piece =
            (static_cast<uint64_t>(bytes_[static_cast<size_t>(bit / 8u)]) >> shift) &
            ((1u << take) - 1u);
        value |= piece << done;
        done += take;
    }
    return value;
}

uint32_t Orv_ByteBuffer::getSize() const { return static_cast<uint32_t>(bytes_.size()); }

char* Orv_ByteBuffer::ptr() { return reinterpret_cast<char*>(bytes_.data()); }

uint8_t* Orv_ByteBuffer::uPtr() { return bytes_.data(); }

uint32_t Orv_ByteBuffer::hex2Bin(uint32_t first, uint32_t last) {
    if (first > last || last >= bytes_.size()) {
        throw std::logic_error("Orv_ByteBuffer::hex2Bin: characters " + std::to_string(first) +
                               " to " + std::to_string(last) + " are outside the buffer of " +
                               std::to_string(bytes_.size()) + " bytes.");
    }
    // The bytes land where the text starts, so read the text out first.
    const std::string text(bytes_.begin() + first, bytes_.begin() + last + 1);
    for (char c : text) {
        if (hexDigit(c) < 0) {
            throw std::logic_error("Invalid hexadecimal number \"" + text + "\".");
        }
    }
    const size_t digits = text.size();
    const size_t produced = (digits + 1) / 2;
    for (size_t j = 0; j < produced; ++j) {
        // Byte j holds the digits at digits-2j-2 (high) and digits-2j-1 (low).
        const size_t lowPos = digits - 2 * j - 1;
        int byte = hexDigit(text[lowPos]);
        if (lowPos > 0) byte |= hexDigit(text[lowPos - 1]) << 4;
        bytes_[j] = static_cast<uint8_t>(byte);
    }
    return static_cast<uint32_t>(produced);
}

}  // namespace OrvRT
