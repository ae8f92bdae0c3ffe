#include "platform/qt/QtSettings.h"

#include <QSettings>

#include "Version.h"

namespace zv {

namespace {

QSettings Store() {
  return QSettings(QSettings::IniFormat, QSettings::UserScope, "VORN", kAppTitle);
}

QString Key(const std::string& section, const std::string& key) {
  return QString::fromStdString(section) + '/' + QString::fromStdString(key);
}

}  // namespace

std::string QtSettings::get(const std::string& section, const std::string& key,
                            const std::string& defaultValue) const {
  const QVariant value = Store().value(Key(section, key));
  return value.isValid() ? value.toString().toStdString() : defaultValue;
}

void QtSettings::save(const std::string& section, const std::string& key,
                      const std::string& value) {
  QSettings store = Store();
  store.setValue(Key(section, key), QString::fromStdString(value));
  store.sync();
}

}  // namespace zv
