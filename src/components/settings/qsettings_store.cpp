#include "components/settings/qsettings_store.h"

namespace {
QString Path(const QString& group, const QString& key) {
    return group + u'/' + key;
}
}  // namespace

QSettingsStore::QSettingsStore()
    : settings_(std::make_unique<QSettings>(QSettings::IniFormat, QSettings::UserScope,
                                            kSettingsApplicationName, kSettingsApplicationName)) {}

QSettingsStore::QSettingsStore(const QString& iniFile)
    : settings_(std::make_unique<QSettings>(iniFile, QSettings::IniFormat)) {}

QString QSettingsStore::value(const QString& group, const QString& key,
                              const QString& fallback) const {
    return settings_->value(Path(group, key), fallback).toString();
}

bool QSettingsStore::contains(const QString& group, const QString& key) const {
    return settings_->contains(Path(group, key));
}

void QSettingsStore::setValue(const QString& group, const QString& key, const QString& text) {
    settings_->setValue(Path(group, key), text);
    settings_->sync();
}
