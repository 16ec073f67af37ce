#include "components/audio/playback/sample_cache.h"

LoadedSamples SampleCache::load(const QString& path) {
    const QFileInfo info(path);
    if (!info.isFile()) {
        forget(path);
        return {nullptr, QStringLiteral("the file does not exist")};
    }
    if (auto buffer = find(path, info)) return {std::move(buffer), QString()};
    LoadedSamples loaded = LoadSampleFile(path);
    if (loaded.buffer) {
        remember(path, loaded.buffer, StampOf(info));
    } else {
        forget(path);
    }
    return loaded;
}

std::shared_ptr<const SampleBuffer> SampleCache::find(const QString& path,
                                                      const QFileInfo& info) const {
    const auto found = entries_.constFind(path);
    if (found == entries_.cend() || found->stamp.size != info.size() ||
        found->stamp.modified != info.lastModified()) {
        return nullptr;
    }
    return found->buffer.lock();
}

void SampleCache::remember(const QString& path, std::shared_ptr<const SampleBuffer> buffer,
                           Stamp stamp) {
    entries_.insert(path, Entry{std::move(buffer), std::move(stamp)});
}
