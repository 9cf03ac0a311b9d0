#pragma once // what the widget tests share besides FifTest.h

#include "FifDialog.h"
#include "FifHitsView.h"
#include "FifManager.h"
#include "FifSettings.h"
#include "FifTest.h"

#include <QtTest>
#include <QtWidgets>

using namespace Gui::Orba;

inline QStringList items(const QComboBox* box)
{
    QStringList list;
    for (int i = 0; i < box->count(); ++i) list << box->itemText(i);
    return list;
}

// Keeps the job's search thread at its start, running, until the job is asked to stop.
inline QMetaObject::Connection holdUntilStopped(FifJob* job)
{
    const auto hold = [job] { while (!job->shouldStop()) QThread::msleep(2); };
    return QObject::connect(job, &QThread::started, job, hold, Qt::DirectConnection);
}
