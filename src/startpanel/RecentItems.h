#pragma once

#include <QList>
#include <QString>

// One recently used note or document as the start panel offers it.
struct RecentItem {
    QString itemId;
    QString title;
    bool document = false;
};

// The most recently used notes and documents together, newest first, at most `count`; read
// from the lists the product keeps in the user's registry.
QList<RecentItem> RecentItems(int count);
