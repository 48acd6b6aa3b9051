#include "ui/common/tab_window.h"

#include "model/codec.h"

namespace kv {

TabWindow::TabWindow(const QString& tabTitle, QWidget* parent)
    : QWidget(parent), tag_(NextTag(true)), tabTitle_(tabTitle) {
    setObjectName(tag_);
}

void TabWindow::setTabTitle(const QString& title) {
    tabTitle_ = title;
    emit tabTitleChanged(tag_, title);
}

}  // namespace kv
