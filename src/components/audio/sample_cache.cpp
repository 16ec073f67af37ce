#include "components/audio/sample_cache.h"

#include <QFileInfo>

LoadedSamples SampleCache::load(const QString& path) {
    const QFileInfo info(path);
    if (!info.isFile()) {
        entries_.remove(path);
        return {nullptr, QStringLiteral("the file does not exist")};
    }
    const auto found = entries_.constFind(path);
    if (found != entries_.cend() && found->size == info.size() &&
        found->modified == info.lastModified()) {
        if (auto buffer = found->buffer.lock()) return {std::move(buffer), QString()};
    }
    LoadedSamples loaded = LoadSampleFile(path);
    if (loaded.buffer) {
        entries_.insert(path, Entry{loaded.buffer, info.size(), info.lastModified()});
    } else {
        entries_.remove(path);
    }
    return loaded;
}
