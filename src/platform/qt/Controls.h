#pragma once
// Small helpers the windows share for making and filling their controls.

#include <QAction>
#include <QComboBox>
#include <QKeySequence>
#include <QMenu>
#include <QPushButton>
#include <QStringList>
#include <string>
#include <vector>

namespace zv {

// A list wide enough for `minimumCharacters`, named for the tests.
inline QComboBox* MakeList(QWidget* parent, const QString& name, int minimumCharacters) {
  auto* list = new QComboBox(parent);
  list->setObjectName(name);
  list->setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
  list->setMinimumContentsLength(minimumCharacters);
  return list;
}

// A named button that Return does not press unless it is the default one.
inline QPushButton* MakeButton(QWidget* parent, const char* name, const QString& text) {
  auto* button = new QPushButton(text, parent);
  button->setObjectName(name);
  button->setAutoDefault(false);
  return button;
}

// Puts the entries into the list, refilling it only when they changed (a
// refill would reset what the user is looking at).
inline void SetItems(QComboBox* box, const std::vector<std::string>& entries) {
  QStringList items;
  for (const auto& item : entries) items << QString::fromStdString(item);
  QStringList shown;
  for (int i = 0; i < box->count(); ++i) shown << box->itemText(i);
  if (shown != items) {
    box->clear();
    box->addItems(items);
  }
}

// A named menu entry calling a member of the receiver.
template <class Receiver, class Slot>
QAction* AddAction(QMenu* menu, Receiver* receiver, const char* name, const QString& text,
                   Slot slot, QKeySequence keys = {}) {
  QAction* action = menu->addAction(text, receiver, slot);
  action->setObjectName(name);
  action->setShortcut(keys);
  return action;
}

}  // namespace zv
