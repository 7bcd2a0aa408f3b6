// The path table.
#include "runtime/PathTable.h"

#include <new>

namespace wbhost::runtime {

std::string NormalisePath(std::string_view text) {
    std::string result;
    result.reserve(text.size());
    for (const char c : text) {
        if (c == '/' && !result.empty() && result.back() == '/') {
            continue;
        }
        result.push_back(c);
    }
    if (result.size() > 1 && result.back() == '/') {
        result.pop_back();
    }
    return result;
}

PathTable& PathTable::Instance() {
    static PathTable table;
    return table;
}

WBPath PathTable::Create(std::string_view text) {
    try {
        auto record = std::make_unique<WBPathRec>(WBPathRec{NormalisePath(text)});
        WBPath path = record.get();
        const std::lock_guard hold(lock_);
        paths_.emplace(path, std::move(record));
        return path;
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}

bool PathTable::IsLive(WBPath path) const {
    const std::lock_guard hold(lock_);
    return path != nullptr && paths_.count(path) != 0;
}

bool PathTable::Destroy(WBPath path) {
    std::unique_ptr<WBPathRec> released;
    const std::lock_guard hold(lock_);
    const auto found = paths_.find(path);
    if (path == nullptr || found == paths_.end()) {
        return false;
    }
    released = std::move(found->second);
    paths_.erase(found);
    return true;
}

WBErr PathTable::Store(WBPath* out, std::string_view text) {
    if (out == nullptr) {
        return kWBArgErr;
    }
    if (*out == nullptr) {
        *out = Create(text);
        return *out != nullptr ? kWBNoErr : kWBMemFullErr;
    }
    if (!IsLive(*out)) {
        return kWBArgErr;
    }
    try {
        (*out)->text = NormalisePath(text);
        return kWBNoErr;
    } catch (const std::bad_alloc&) {
        return kWBMemFullErr;
    }
}

size_t PathTable::LiveCount() const {
    const std::lock_guard hold(lock_);
    return paths_.size();
}

} // namespace wbhost::runtime
