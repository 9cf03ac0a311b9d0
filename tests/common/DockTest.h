#pragma once

// Helpers for tests of the result docks.

#include "FifHitsView.h"

#include <QDockWidget>

inline Gui::Orba::FifHitsView* viewOf(QDockWidget* dock)
{
    return qobject_cast<Gui::Orba::FifHitsView*>(dock->widget());
}

// Qt keeps a dock behind another tab "visible", moved out of sight.
inline bool inFront(QDockWidget* dock)
{
    return dock->isVisible() && !dock->visibleRegion().isEmpty();
}
