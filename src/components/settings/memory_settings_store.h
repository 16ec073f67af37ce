#pragma once

#include "components/settings/settings_store.h"

#include <QMap>

// Settings held in memory: the test backend, and a way to run without touching the user's own.
class MemorySettingsStore : public SettingsStore {
  public:
    QString value(const QString& group, const QString& key,
                  const QString& fallback = QString()) const override {
        return values_.value(group + u'/' + key, fallback);
    }
    bool contains(const QString& group, const QString& key) const override {
        return values_.contains(group + u'/' + key);
    }
    void setValue(const QString& group, const QString& key, const QString& text) override {
        values_.insert(group + u'/' + key, text);
    }

  private:
    QMap<QString, QString> values_;
};
