#pragma once

#include "data/package.h"

#include <QVector>

class FormScrollWidget;
class PhotoItem;
class QWidget;

// Lays the records of a page into the cells of the focus grid and asks for their thumbnails. The
// cells are made once and belong to the grid's content.
class CellFiller
{
public:
    // The backdrop is the widget that paints what lies behind the cells.
    CellFiller(FormScrollWidget *content, QWidget *backdrop);

    // Shows the records from `first` on, one a cell, and hides the cells that are left over.
    // Returns the number of cells shown. Below the slide show no thumbnail is asked for: who comes
    // back from it has the page laid out anew.
    int fill(const Package &package, int first);

    // No cell waits for a thumbnail any longer.
    static void cancelThumbnails();

private:
    struct Face
    {
        QString caption;
        QString thumbnail; // URL
    };

    static Face faceOf(const Package &package, int index, const PhotoItem &cell);
    static void show(PhotoItem *cell, const Face &face);
    static void showThumbnail(PhotoItem *cell, QString url);

    QVector<PhotoItem *> mCells;
    int mDisplayType = -1;
};
