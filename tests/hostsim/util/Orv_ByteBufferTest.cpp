// The host's bit buffer: bit fields across byte boundaries, 64-bit fields, the end of the
// buffer, and the byte order of hex2Bin.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <stdexcept>
#include <string>

#include "host/OrvUtil.h"

using OrvRT::Orv_ByteBuffer;

namespace {

void putText(Orv_ByteBuffer& buffer, const std::string& text) {
    ASSERT_LE(text.size(), buffer.getSize());
    std::memcpy(buffer.ptr(), text.data(), text.size());
}

TEST(Orv_ByteBufferTest, StartsZeroedWithItsSize) {
    Orv_ByteBuffer buffer(154, 10, 10);
    ASSERT_EQ(buffer.getSize(), 154u);
    EXPECT_EQ(static_cast<void*>(buffer.ptr()), static_cast<void*>(buffer.uPtr()));
    for (uint32_t i = 0; i < buffer.getSize(); ++i) EXPECT_EQ(buffer.uPtr()[i], 0u) << i;
    EXPECT_EQ(buffer.getBits(0, 64), 0u);
    Orv_ByteBuffer empty(0, 0, 0);
    EXPECT_EQ(empty.getSize(), 0u);
    EXPECT_EQ(empty.getBits(0, 8), 0u);
}

TEST(Orv_ByteBufferTest, GetBitsReadsFieldsLeastSignificantFirstAcrossBytes) {
    Orv_ByteBuffer buffer(16, 0, 0);
    uint8_t* b = buffer.uPtr();
    b[0] = 0xF0;
    b[1] = 0xA5;
    EXPECT_EQ(buffer.getBits(0, 4), 0x0u);
    EXPECT_EQ(buffer.getBits(4, 4), 0xFu);
    EXPECT_EQ(buffer.getBits(4, 8), 0x5Fu);  // high nibble of byte 0, low nibble of byte 1
    EXPECT_EQ(buffer.getBits(7, 3), 0x3u);   // bit 7 of byte 0, bits 0 and 1 of byte 1
    EXPECT_EQ(buffer.getBits(9, 1), 0x0u);
    EXPECT_EQ(buffer.getBits(15, 1), 0x1u);
    EXPECT_EQ(buffer.getBits(3, 0), 0u);
    // A bus master's status fields: slave count at 60..67, a 10-bit field at 68..77.
    Orv_ByteBuffer status(154, 10, 10);
    status.uPtr()[7] = 0x50;  // bits 60..63 = 0x5
    status.uPtr()[8] = 0xA3;  // bits 64..67 = 0x3, bits 68..71 = 0xA
    status.uPtr()[9] = 0x02;  // bits 72..75 = 0x2
    EXPECT_EQ(status.getBits(60, 8), 0x35u);
    EXPECT_EQ(status.getBits(68, 10), 0x02Au);
}

TEST(Orv_ByteBufferTest, GetBitsReadsWholeSixtyFourBitFieldsAtAnyOffset) {
    Orv_ByteBuffer buffer(16, 0, 0);
    const uint64_t value = 0x8123456789ABCDEFull;
    for (uint32_t first : {0u, 3u, 8u, 61u}) {
        std::memset(buffer.uPtr(), 0, buffer.getSize());
        for (uint32_t k = 0; k < 64; ++k) {
            if ((value >> k) & 1u) {
                const uint32_t bit = first + k;
                buffer.uPtr()[bit / 8] =
                    static_cast<uint8_t>(buffer.uPtr()[bit / 8] | (1u << (bit % 8)));
            }
        }
        EXPECT_EQ(buffer.getBits(first, 64), value) << first;
        EXPECT_EQ(buffer.getBits(first + 60, 4), 0x8u) << first;
    }
}

TEST(Orv_ByteBufferTest, GetBitsReadsZerosPastTheEndAndRefusesMoreThanSixtyFour) {
    Orv_ByteBuffer buffer(2, 0, 0);
    buffer.uPtr()[0] = 0xFF;
    buffer.uPtr()[1] = 0xFF;
    EXPECT_EQ(buffer.getBits(12, 8), 0xFu);  // four bits inside, four past the end
    EXPECT_EQ(buffer.getBits(16, 8), 0u);
    EXPECT_EQ(buffer.getBits(0, 64), 0xFFFFu);
    EXPECT_EQ(buffer.getBits(UINT32_MAX, 64), 0u);  // first + count passes 2^32
    EXPECT_EQ(buffer.getBits(UINT32_MAX - 3, 8), 0u);
    EXPECT_THROW(buffer.getBits(0, 65), std::logic_error);
}

TEST(Orv_ByteBufferTest, Hex2BinPutsTheLastTwoDigitsIntoByteZero) {
    Orv_ByteBuffer buffer(9, 0, 0);
    putText(buffer, "1A2B3c4D");
    EXPECT_EQ(buffer.hex2Bin(0, 7), 4u);
    EXPECT_EQ(buffer.uPtr()[0], 0x4Du);
    EXPECT_EQ(buffer.uPtr()[1], 0x3Cu);
    EXPECT_EQ(buffer.uPtr()[2], 0x2Bu);
    EXPECT_EQ(buffer.uPtr()[3], 0x1Au);

    // An odd number of digits: the first digit alone makes the last byte.
    Orv_ByteBuffer odd(4, 0, 0);
    putText(odd, "ABC");
    EXPECT_EQ(odd.hex2Bin(0, 2), 2u);
    EXPECT_EQ(odd.uPtr()[0], 0xBCu);
    EXPECT_EQ(odd.uPtr()[1], 0x0Au);

    // A range inside the text.
    Orv_ByteBuffer part(8, 0, 0);
    putText(part, "xx1234yy");
    EXPECT_EQ(part.hex2Bin(2, 5), 2u);
    EXPECT_EQ(part.uPtr()[0], 0x34u);
    EXPECT_EQ(part.uPtr()[1], 0x12u);
}

TEST(Orv_ByteBufferTest, Hex2BinPairsBytesIntoTheWordsOfARawWrite) {
    // Two words as the raw write sends them: the word at the address last in the text.
    const uint32_t size = 2;
    Orv_ByteBuffer buffer(4 * size + 1, 0, 0);
    putText(buffer, "00020001");
    buffer.hex2Bin(0, buffer.getSize() - 2);
    const uint8_t* b = buffer.uPtr();
    EXPECT_EQ(b[1] * 256u + b[0], 0x0001u);
    EXPECT_EQ(b[3] * 256u + b[2], 0x0002u);
}

TEST(Orv_ByteBufferTest, Hex2BinRejectsBadDigitsAndRangesOutsideTheBuffer) {
    Orv_ByteBuffer buffer(5, 0, 0);
    putText(buffer, "12G4");
    try {
        buffer.hex2Bin(0, 3);
        ADD_FAILURE() << "no exception";
    } catch (const std::logic_error& e) {
        EXPECT_NE(std::string(e.what()).find("\"12G4\""), std::string::npos) << e.what();
    }
    EXPECT_EQ(buffer.uPtr()[0], '1');  // nothing converted
    EXPECT_THROW(buffer.hex2Bin(0, 5), std::logic_error);
    EXPECT_THROW(buffer.hex2Bin(3, 2), std::logic_error);
    EXPECT_THROW(buffer.hex2Bin(0, UINT32_MAX), std::logic_error);
}

}  // namespace
