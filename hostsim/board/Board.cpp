// The virtual board: loading, the core list of each chain, core status and commands.
#include "hostsim/board/Board.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <stdexcept>

#include "hostsim/board/BoardImpl.h"

namespace OrvSim {

namespace {

constexpr uint32_t SLAVE_COUNT_BIT = 60;
constexpr uint32_t PERIOD_INT_BIT = 68;
constexpr uint32_t PERIOD_FRC_BIT = 78;
constexpr uint32_t DCLK_HAS_RESET_BIT = 88;

// Bytes that hold bitCount bits, without overflow for any bitCount.
size_t bytesFor(uint32_t bitCount) { return size_t(bitCount / 8) + (bitCount % 8 != 0 ? 1 : 0); }

void putField(uint8_t* bits, uint32_t bitCount, uint32_t first, uint32_t width, uint32_t value) {
    for (uint32_t k = 0; k < width && first + k < bitCount; ++k) {
        if ((value >> k) & 1u) {
            const uint32_t b = first + k;
            bits[b / 8] = uint8_t(bits[b / 8] | (1u << (b % 8)));
        }
    }
}

const BoardChain* findChain(const Board::Impl& impl, uint32_t device, uint32_t chain) {
    if (device >= impl.devices.size()) return nullptr;
    const auto& chains = impl.devices[device].chains;
    auto it = chains.find(chain);
    return it == chains.end() ? nullptr : &it->second;
}

const BoardCore* findCore(const Board::Impl& impl, uint32_t device, uint32_t chain, uint32_t core) {
    const BoardChain* c = findChain(impl, device, chain);
    if (c == nullptr || core >= c->cores.size()) return nullptr;
    return &c->cores[core];
}

// The first bus master of a chain, for direct access and inspection.
BusMaster& firstMaster(const Board::Impl& impl, uint32_t device, uint32_t chain) {
    if (device >= impl.devices.size()) {
        throw std::out_of_range("the board has no device " + std::to_string(device));
    }
    if (const BoardChain* c = findChain(impl, device, chain)) {
        for (const BoardCore& core : c->cores) {
            if (core.master) return *core.master;
        }
    }
    throw std::out_of_range("device " + std::to_string(device) + " chain " + std::to_string(chain) +
                            " has no bus master");
}

}  // namespace

Board::Board(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {}

Board::~Board() = default;

std::shared_ptr<Board> Board::loadText(const std::string& json, const std::string& name) {
    return std::shared_ptr<Board>(new Board(readBoard(json, name)));
}

std::shared_ptr<Board> Board::copy() const {
    auto impl = std::make_unique<Impl>();
    std::lock_guard<std::mutex> lock(impl_->mutex);
    impl->devices.reserve(impl_->devices.size());
    for (const BoardDevice& device : impl_->devices) {
        BoardDevice& to = impl->devices.emplace_back();
        to.trellom = device.trellom;
        for (const auto& [number, chain] : device.chains) {
            BoardChain& toChain = to.chains[number];
            toChain.cores.reserve(chain.cores.size());
            for (const BoardCore& core : chain.cores) {
                BoardCore& toCore = toChain.cores.emplace_back();
                toCore.type = core.type;
                toCore.hasRawStatus = core.hasRawStatus;
                toCore.rawStatus = core.rawStatus;
                toCore.failingCommands = core.failingCommands;
                if (core.master) toCore.master = std::make_unique<BusMaster>(*core.master);
            }
        }
    }
    return std::shared_ptr<Board>(new Board(std::move(impl)));
}

std::shared_ptr<Board> Board::loadFile(const std::string& path) {
    // Windows refuses to open a folder, POSIX systems fail at the first read: the same words on
    // both.
    std::error_code notFolder;
    if (std::filesystem::is_directory(path, notFolder)) {
        throw BoardError(path + ": cannot be read: " + std::strerror(EISDIR));
    }
    std::FILE* file = std::fopen(path.c_str(), "rb");
    if (file == nullptr) {
        const int error = errno;
        throw BoardError(path + ": cannot be read: " + std::strerror(error));
    }
    std::string text;
    char chunk[4096];
    size_t got;
    while ((got = std::fread(chunk, 1, sizeof chunk, file)) > 0) text.append(chunk, got);
    const bool failed = std::ferror(file) != 0;
    const int error = errno;
    std::fclose(file);
    if (failed) throw BoardError(path + ": cannot be read: " + std::strerror(error));
    return loadText(text, path);
}

uint32_t Board::deviceCount() const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    return uint32_t(impl_->devices.size());
}

std::vector<uint32_t> Board::chains(uint32_t device) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    std::vector<uint32_t> result;
    if (device >= impl_->devices.size()) return result;
    for (const auto& entry : impl_->devices[device].chains) result.push_back(entry.first);
    return result;
}

bool Board::isTrellom(uint32_t device) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    return device < impl_->devices.size() && impl_->devices[device].trellom;
}

bool Board::coreCount(uint32_t device, uint32_t chain, uint32_t& count) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    if (device >= impl_->devices.size()) return false;
    const BoardChain* c = findChain(*impl_, device, chain);
    count = c == nullptr ? 0 : uint32_t(c->cores.size());
    return true;
}

bool Board::coreStatus(uint32_t device, uint32_t chain, uint32_t core, uint32_t info[5],
                       uint8_t* bits, uint32_t bitCount) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    const BoardCore* c = findCore(*impl_, device, chain, core);
    if (c == nullptr) return false;
    if (info != nullptr) {
        for (int i = 0; i < 5; ++i) info[i] = 0;
        info[1] = c->type;
    }
    if (bits == nullptr) return true;
    const size_t size = bytesFor(bitCount);
    std::memset(bits, 0, size);
    if (c->hasRawStatus) {
        const size_t n = std::min(size, c->rawStatus.size());
        std::memcpy(bits, c->rawStatus.data(), n);
        if (n == size && bitCount % 8 != 0)
            bits[n - 1] = uint8_t(bits[n - 1] & ((1u << (bitCount % 8)) - 1));
        return true;
    }
    if (c->master) {
        const MasterConfig& m = c->master->config();
        putField(bits, bitCount, SLAVE_COUNT_BIT, 8, m.slaveCount);
        putField(bits, bitCount, PERIOD_INT_BIT, 10, m.periodInt);
        putField(bits, bitCount, PERIOD_FRC_BIT, 10, m.periodFrc);
        putField(bits, bitCount, DCLK_HAS_RESET_BIT, 1, m.dclkHasReset ? 1u : 0u);
    }
    return true;
}

bool Board::runCommand(uint32_t device, uint32_t chain, uint32_t core, uint32_t cmd,
                       const uint8_t* dataIn, uint8_t* dataOut, uint32_t bitCount) {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    const BoardCore* c = findCore(*impl_, device, chain, core);
    if (c == nullptr) return false;
    if (dataOut != nullptr) std::memset(dataOut, 0, bytesFor(bitCount));
    if (!c->master) return true;
    if (dataIn != nullptr) {
        c->master->write(cmd, dataIn, bitCount);
    } else if (dataOut != nullptr) {
        c->master->read(cmd, dataOut, bitCount);
    }
    return true;
}

bool Board::commandFails(uint32_t device, uint32_t chain, uint32_t core, uint32_t cmd) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    const BoardCore* c = findCore(*impl_, device, chain, core);
    return c != nullptr && cmd < 32 && ((c->failingCommands >> cmd) & 1u) != 0;
}

bool Board::hasFailingCommands() const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    for (const BoardDevice& device : impl_->devices) {
        for (const auto& chain : device.chains) {
            for (const BoardCore& core : chain.second.cores) {
                if (core.failingCommands != 0) return true;
            }
        }
    }
    return false;
}

uint16_t Board::peek(uint32_t device, uint32_t chain, uint32_t slave, uint32_t address) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    return firstMaster(*impl_, device, chain).peek(slave, address);
}

void Board::poke(uint32_t device, uint32_t chain, uint32_t slave, uint32_t address,
                 uint16_t value) {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    firstMaster(*impl_, device, chain).poke(slave, address, value);
}

uint32_t Board::busErrorBits(uint32_t device, uint32_t chain) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    return firstMaster(*impl_, device, chain).busErrorBits();
}

bool Board::slaveErrorBit(uint32_t device, uint32_t chain, uint32_t slave) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    return firstMaster(*impl_, device, chain).slaveErrorBit(slave);
}

std::vector<uint8_t> Board::lastResetControl(uint32_t device, uint32_t chain) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    return firstMaster(*impl_, device, chain).lastResetControl();
}

uint32_t Board::lastTransferControl(uint32_t device, uint32_t chain) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    return firstMaster(*impl_, device, chain).lastTransferControl();
}

uint32_t Board::lastAddressWord(uint32_t device, uint32_t chain) const {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    return firstMaster(*impl_, device, chain).lastAddressWord();
}

void Board::setBusErrorBits(uint32_t device, uint32_t chain, uint32_t bits) {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    firstMaster(*impl_, device, chain).setBusErrorBits(bits);
}

void Board::setSlaveFaulty(uint32_t device, uint32_t chain, uint32_t slave, bool faulty) {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    firstMaster(*impl_, device, chain).setSlaveFaulty(slave, faulty);
}

void Board::setResetPolls(uint32_t device, uint32_t chain, int32_t polls) {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    firstMaster(*impl_, device, chain).setResetPolls(polls);
}

void Board::setClockPolls(uint32_t device, uint32_t chain, int32_t polls) {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    firstMaster(*impl_, device, chain).setClockPolls(polls);
}

void Board::setClockRunning(uint32_t device, uint32_t chain, bool running) {
    std::lock_guard<std::mutex> lock(impl_->mutex);
    firstMaster(*impl_, device, chain).setClockRunning(running);
}

}  // namespace OrvSim
