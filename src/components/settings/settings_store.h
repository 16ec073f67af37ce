#pragma once

#include <QString>

// The per-user settings: one group per section ("Defaults", "MIDI", ...), every value text.
class SettingsStore {
  public:
    virtual ~SettingsStore() = default;
    // The stored text, or fallback when the key has never been written.
    virtual QString value(const QString& group, const QString& key,
                          const QString& fallback = QString()) const = 0;
    virtual bool contains(const QString& group, const QString& key) const = 0;
    virtual void setValue(const QString& group, const QString& key, const QString& text) = 0;
};

inline const QString kSettingsApplicationName = QStringLiteral("Tarvik Radio Orvelle Quindara");
