// Searches a folder through the installed library and prints what it found.
#include "FifHitsModel.h"
#include "FifJob.h"
#include "FifManager.h"

#include <QCoreApplication>
#include <QTextStream>

int main(int argc, char** argv)
{
    QCoreApplication app(argc, argv);
    if (argc != 3)
        return 2;
    Gui::Orba::FifManager manager;
    Gui::Orba::FifJob* job = manager.getJob(0);
    Gui::Orba::FifInput request;
    request.what = QString::fromLocal8Bit(argv[1]);
    request.where = QString::fromLocal8Bit(argv[2]);
    QObject::connect(job, &QThread::finished, &app, &QCoreApplication::quit, Qt::QueuedConnection);
    if (!job->start(request))
        return 3;
    app.exec();
    QTextStream out(stdout);
    Gui::Orba::FifHitsModel* model = job->getHitsModel();
    for (int row = 0; row < model->rowCount(); ++row)
        out << model->data(model->index(row, 0), Qt::DisplayRole).toString() << '\n';
    return model->rowCount() > 0 ? 0 : 1;
}
