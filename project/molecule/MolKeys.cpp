#include "molecule/MolKeys.h"

#include <cstdint>
#include <cstdio>
#include <mutex>
#include <random>
#include <unordered_set>

namespace {

struct CKeyRegistry {
    CKeyRegistry() {
        // Start each run somewhere else, so keys of different runs rarely meet in one file.
        std::random_device device;
        next = ((std::uint64_t{device()} << 32) | device()) & 0xFFFFFFFFFFull;
        next |= 0x10000000000ull;
    }
    std::mutex mutex;
    std::unordered_set<std::string> used;
    std::uint64_t next;
};

CKeyRegistry& Registry() {
    static CKeyRegistry registry;
    return registry;
}

std::string Hex(std::uint64_t value) {
    char text[20];
    std::snprintf(text, sizeof text, "%llX", static_cast<unsigned long long>(value));
    return text;
}

}  // namespace

std::string NewMoleculeKey() {
    CKeyRegistry& registry = Registry();
    std::lock_guard lock(registry.mutex);
    std::string key;
    do {
        key = Hex(registry.next++);
    } while (registry.used.count(key) != 0);
    registry.used.insert(key);
    return key;
}

void NoteLoadedMoleculeKey(const std::string& key) {
    CKeyRegistry& registry = Registry();
    std::lock_guard lock(registry.mutex);
    registry.used.insert(key);
}
