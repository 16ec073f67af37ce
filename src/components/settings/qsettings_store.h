#pragma once

#include "components/settings/settings_store.h"

#include <QSettings>

#include <memory>

// Settings kept by QSettings in the user's scope under the application's own name.
class QSettingsStore : public SettingsStore {
  public:
    QSettingsStore();
    // A store in the given INI file, so a test can start the program twice on the same settings.
    explicit QSettingsStore(const QString& iniFile);

    QString value(const QString& group, const QString& key,
                  const QString& fallback = QString()) const override;
    bool contains(const QString& group, const QString& key) const override;
    void setValue(const QString& group, const QString& key, const QString& text) override;

  private:
    std::unique_ptr<QSettings> settings_;
};
