#pragma once

#include <QStringList>
#include <QTreeWidget>
#include <QtTest>

namespace cv::test {

// A tree control used as the user uses it.

// The item at a path of texts from the top; nullptr when there is none.
inline QTreeWidgetItem* ItemAt(QTreeWidget* tree, const QStringList& path) {
    QTreeWidgetItem* found = nullptr;
    for (const QString& text : path) {
        const int count = found == nullptr ? tree->topLevelItemCount() : found->childCount();
        QTreeWidgetItem* next = nullptr;
        for (int i = 0; i < count && next == nullptr; ++i) {
            QTreeWidgetItem* item = found == nullptr ? tree->topLevelItem(i) : found->child(i);
            next = item->text(0) == text ? item : nullptr;
        }
        if (next == nullptr) {
            return nullptr;
        }
        found = next;
    }
    return found;
}

inline QStringList ChildTexts(const QTreeWidgetItem* item) {
    QStringList texts;
    for (int i = 0; item != nullptr && i < item->childCount(); ++i) {
        texts << item->child(i)->text(0);
    }
    return texts;
}

inline QPoint CentreOf(QTreeWidget* tree, QTreeWidgetItem* item) {
    tree->scrollToItem(item);
    return tree->visualItemRect(item).center();
}

inline void Click(QTreeWidget* tree, QTreeWidgetItem* item) {
    QTest::mouseClick(tree->viewport(), Qt::LeftButton, {}, CentreOf(tree, item));
}

inline void DoubleClick(QTreeWidget* tree, QTreeWidgetItem* item) {
    const QPoint at = CentreOf(tree, item);
    QTest::mouseClick(tree->viewport(), Qt::LeftButton, {}, at);
    QTest::mouseDClick(tree->viewport(), Qt::LeftButton, {}, at);
}

// Opens a branch as its arrow does.
inline void Open(QTreeWidget* tree, const QStringList& path) {
    QTreeWidgetItem* item = ItemAt(tree, path);
    QVERIFY2(item != nullptr, qPrintable(path.join(" > ")));
    tree->expandItem(item);
}

}  // namespace cv::test
