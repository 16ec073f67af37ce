#pragma once

#include "components/audio/playback/sample_buffer.h"

#include <QDateTime>
#include <QFileInfo>
#include <QHash>

// Decoded sounds by path. A pad hands its file to its channel on every start; the cache makes
// that free while the file on disk is unchanged, and loads it afresh once it changes. It holds
// the sounds weakly: a sound no channel keeps is freed.
class SampleCache {
  public:
    // What tells an unchanged file: its size and time as they were when the decode began.
    struct Stamp {
        qint64 size = -1;
        QDateTime modified;
    };
    static Stamp StampOf(const QFileInfo& info) { return {info.size(), info.lastModified()}; }

    // Decodes here and now unless the cache holds the file unchanged.
    LoadedSamples load(const QString& path);
    // The decoded sound when the file (`info` is its state now) is unchanged since it was decoded
    // and some channel still holds it; else null.
    std::shared_ptr<const SampleBuffer> find(const QString& path, const QFileInfo& info) const;
    // Keeps a sound decoded elsewhere, a worker thread say, under the stamp its file had then.
    void remember(const QString& path, std::shared_ptr<const SampleBuffer> buffer, Stamp stamp);
    void forget(const QString& path) { entries_.remove(path); }
    void clear() { entries_.clear(); }

  private:
    struct Entry {
        std::weak_ptr<const SampleBuffer> buffer;
        Stamp stamp;
    };
    QHash<QString, Entry> entries_;
};
