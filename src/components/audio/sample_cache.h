#pragma once

#include "components/audio/sample_buffer.h"

#include <QDateTime>
#include <QHash>

// Decoded sounds by path. A pad hands its file to its channel on every start; the cache makes
// that free while the file on disk is unchanged, and loads it afresh once it changes. It holds
// the sounds weakly: a sound no channel keeps is freed.
class SampleCache {
  public:
    LoadedSamples load(const QString& path);
    void clear() { entries_.clear(); }

  private:
    struct Entry {
        std::weak_ptr<const SampleBuffer> buffer;
        qint64 size = -1;
        QDateTime modified;
    };
    QHash<QString, Entry> entries_;
};
