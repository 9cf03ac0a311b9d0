#include "ui_FindInFilesDlg.h"

#include <QApplication>
#include <QCompleter>
#include <QLineEdit>
#include <QTranslator>
#include <QtTest>

namespace {

// Answers every lookup with a marked text and notes the contexts asked for.
class MarkingTranslator : public QTranslator
{
public:
    QSet<QString> contexts;

    bool isEmpty() const override { return false; }
    QString translate(const char* context, const char* source, const char* = nullptr,
                      int = -1) const override
    {
        const_cast<MarkingTranslator*>(this)->contexts << QString::fromUtf8(context);
        return QStringLiteral("[") + QString::fromUtf8(source) + QStringLiteral("]");
    }
};

// A dialog with the two slots that the form binds by name.
class BindingDialog : public QDialog
{
    Q_OBJECT

public:
    int browseClicks = 0;
    int appendClicks = 0;

public slots:
    void on_browse_clicked() { ++browseClicks; }
    void on_append_clicked() { ++appendClicks; }
};

struct Form
{
    Form() { ui.setupUi(&dialog); }
    BindingDialog dialog;
    Ui::FindInFilesDlgClass ui;
};

QWidget* widgetOf(const Ui::FindInFilesDlgClass& ui, const QString& name)
{
    const QHash<QString, QWidget*> widgets{
        {"label", ui.label}, {"what", ui.what}, {"groupBox_3", ui.groupBox_3},
        {"label_2", ui.label_2}, {"where", ui.where}, {"browse", ui.browse},
        {"includeSubDir", ui.includeSubDir}, {"label_3", ui.label_3}, {"filter", ui.filter},
        {"append", ui.append}, {"groupBox", ui.groupBox}, {"matchCase", ui.matchCase},
        {"groupBox_2", ui.groupBox_2}, {"literal", ui.literal}, {"wildcard", ui.wildcard},
        {"regexp", ui.regexp}, {"matchWord", ui.matchWord}, {"start", ui.start},
        {"stop", ui.stop}, {"cancel", ui.cancel}, {"help", ui.help}};
    return widgets.value(name);
}

QString textOf(QWidget* widget)
{
    if (auto label = qobject_cast<QLabel*>(widget))
        return label->text();
    if (auto button = qobject_cast<QAbstractButton*>(widget))
        return button->text();
    if (auto box = qobject_cast<QGroupBox*>(widget))
        return box->title();
    return QString();
}

// The position of `item` in `layout` as row, column, row span, column span.
QList<int> positionIn(QGridLayout* layout, QLayoutItem* item)
{
    for (int i = 0; i < layout->count(); ++i) {
        if (layout->itemAt(i) == item) {
            int row, column, rowSpan, columnSpan;
            layout->getItemPosition(i, &row, &column, &rowSpan, &columnSpan);
            return {row, column, rowSpan, columnSpan};
        }
    }
    return {};
}

QLayoutItem* itemOf(QLayout* layout, QWidget* widget)
{
    const int index = layout->indexOf(widget);
    return index < 0 ? nullptr : layout->itemAt(index);
}

} // namespace

class tst_FindInFilesDlgClass : public QObject
{
    Q_OBJECT

private slots:
    void dialogGetsItsNameSizeAndTitle()
    {
        Form form;
        QCOMPARE(form.dialog.objectName(), QString("FindInFilesDlgClass"));
        QCOMPARE(form.dialog.size(), QSize(352, 386));
        QCOMPARE(form.dialog.windowTitle(), QString("Find in Files Dialog"));
    }

    void dialogKeepsAnEarlierName()
    {
        BindingDialog dialog;
        dialog.setObjectName("gui-orba-find-in-files-dialog");
        Ui::FindInFilesDlgClass ui;
        ui.setupUi(&dialog);
        QCOMPARE(dialog.objectName(), QString("gui-orba-find-in-files-dialog"));
    }

    void widgets_data()
    {
        QTest::addColumn<QString>("name");
        QTest::addColumn<QString>("className");
        QTest::addColumn<QString>("parentName");
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("toolTip");
        QTest::addColumn<QString>("statusTip");
        const QString dialog = "FindInFilesDlgClass";
        QTest::newRow("label") << "label" << "QLabel" << dialog << "&Find what:" << "" << "";
        QTest::newRow("what") << "what" << "QComboBox" << dialog << "" << "" << "";
        QTest::newRow("groupBox_3") << "groupBox_3" << "QGroupBox" << dialog << "File search options" << "" << "";
        QTest::newRow("label_2") << "label_2" << "QLabel" << "groupBox_3" << "In f&olders:" << "" << "";
        QTest::newRow("where") << "where" << "QComboBox" << "groupBox_3" << "" << "" << "";
        QTest::newRow("browse") << "browse" << "QToolButton" << "groupBox_3" << "..." << "Browse"
                                << "Add a folder to the list of folders to be searched.";
        QTest::newRow("includeSubDir") << "includeSubDir" << "QCheckBox" << "groupBox_3"
                                       << "Look in &sub folders" << ""
                                       << "Check this option to search recursively";
        QTest::newRow("label_3") << "label_3" << "QLabel" << "groupBox_3" << "In file &types:" << "" << "";
        QTest::newRow("filter") << "filter" << "QComboBox" << "groupBox_3" << "" << "" << "";
        QTest::newRow("append") << "append" << "QToolButton" << "groupBox_3" << "+..." << "Append" << "";
        QTest::newRow("groupBox") << "groupBox" << "QGroupBox" << dialog << "Text search options" << "" << "";
        QTest::newRow("matchCase") << "matchCase" << "QCheckBox" << "groupBox" << "Match &case" << "" << "";
        QTest::newRow("groupBox_2") << "groupBox_2" << "QGroupBox" << "groupBox" << "Match Type" << "" << "";
        QTest::newRow("literal") << "literal" << "QRadioButton" << "groupBox_2" << "&Literal" << "" << "";
        QTest::newRow("wildcard") << "wildcard" << "QRadioButton" << "groupBox_2" << "Wil&dcard" << "" << "";
        QTest::newRow("regexp") << "regexp" << "QRadioButton" << "groupBox_2" << "Regular &Expression" << "" << "";
        QTest::newRow("matchWord") << "matchWord" << "QCheckBox" << "groupBox" << "Match &word" << "" << "";
        QTest::newRow("start") << "start" << "QPushButton" << dialog << "Find" << "" << "";
        QTest::newRow("stop") << "stop" << "QPushButton" << dialog << "Stop" << "" << "";
        QTest::newRow("cancel") << "cancel" << "QPushButton" << dialog << "Cancel" << "" << "";
        QTest::newRow("help") << "help" << "QPushButton" << dialog << "Help" << "" << "";
    }

    void widgets()
    {
        QFETCH(QString, name);
        QFETCH(QString, className);
        QFETCH(QString, parentName);
        QFETCH(QString, text);
        QFETCH(QString, toolTip);
        QFETCH(QString, statusTip);
        Form form;
        QWidget* widget = widgetOf(form.ui, name);
        QVERIFY(widget);
        QCOMPARE(widget->objectName(), name);
        QCOMPARE(widget->metaObject()->className(), qPrintable(className));
        QVERIFY(widget->parentWidget());
        QCOMPARE(widget->parentWidget()->objectName(), parentName);
        QCOMPARE(form.dialog.findChildren<QWidget*>(name).size(), 1);
        QCOMPARE(textOf(widget), text);
        QCOMPARE(widget->toolTip(), toolTip);
        QCOMPARE(widget->statusTip(), statusTip);
    }

    void layoutsAndSpacers()
    {
        Form form;
        const Ui::FindInFilesDlgClass& ui = form.ui;
        QCOMPARE(form.dialog.layout(), ui.gridLayout);
        QCOMPARE(ui.groupBox_3->layout(), ui.gridLayout1);
        QCOMPARE(ui.groupBox->layout(), ui.gridLayout2);
        QCOMPARE(ui.groupBox_2->layout(), ui.vboxLayout1);
        const QList<QPair<QLayout*, QString>> names{
            {ui.gridLayout, "gridLayout"}, {ui.gridLayout1, "gridLayout1"},
            {ui.gridLayout2, "gridLayout2"}, {ui.vboxLayout, "vboxLayout"},
            {ui.vboxLayout1, "vboxLayout1"}, {ui.hboxLayout, "hboxLayout"}};
        for (const auto& entry : names) {
            QCOMPARE(entry.first->objectName(), entry.second);
            QCOMPARE(entry.first->spacing(), 6);
        }
        for (QLayout* layout : {static_cast<QLayout*>(ui.gridLayout), static_cast<QLayout*>(ui.gridLayout1),
                                static_cast<QLayout*>(ui.gridLayout2), static_cast<QLayout*>(ui.vboxLayout1)})
            QCOMPARE(layout->contentsMargins(), QMargins(11, 11, 11, 11));

        using Pos = QList<int>;
        QCOMPARE(positionIn(ui.gridLayout, itemOf(ui.gridLayout, ui.label)), Pos({0, 0, 1, 1}));
        QCOMPARE(positionIn(ui.gridLayout, itemOf(ui.gridLayout, ui.what)), Pos({0, 1, 1, 1}));
        QCOMPARE(positionIn(ui.gridLayout, itemOf(ui.gridLayout, ui.groupBox_3)), Pos({1, 0, 1, 2}));
        QCOMPARE(positionIn(ui.gridLayout, itemOf(ui.gridLayout, ui.groupBox)), Pos({2, 0, 1, 2}));
        QCOMPARE(positionIn(ui.gridLayout, ui.spacerItem1), Pos({3, 1, 1, 1}));
        QCOMPARE(positionIn(ui.gridLayout, ui.hboxLayout), Pos({4, 0, 1, 2}));
        QCOMPARE(ui.gridLayout->count(), 6);

        QCOMPARE(positionIn(ui.gridLayout1, itemOf(ui.gridLayout1, ui.label_2)), Pos({1, 0, 1, 1}));
        QCOMPARE(positionIn(ui.gridLayout1, itemOf(ui.gridLayout1, ui.where)), Pos({1, 1, 1, 1}));
        QCOMPARE(positionIn(ui.gridLayout1, itemOf(ui.gridLayout1, ui.browse)), Pos({1, 2, 1, 1}));
        QCOMPARE(positionIn(ui.gridLayout1, itemOf(ui.gridLayout1, ui.includeSubDir)), Pos({4, 0, 1, 3}));
        QCOMPARE(positionIn(ui.gridLayout1, itemOf(ui.gridLayout1, ui.label_3)), Pos({0, 0, 1, 1}));
        QCOMPARE(positionIn(ui.gridLayout1, itemOf(ui.gridLayout1, ui.filter)), Pos({0, 1, 1, 3}));
        QCOMPARE(positionIn(ui.gridLayout1, itemOf(ui.gridLayout1, ui.append)), Pos({1, 3, 1, 1}));
        QCOMPARE(ui.gridLayout1->count(), 7);

        QCOMPARE(positionIn(ui.gridLayout2, ui.vboxLayout), Pos({0, 0, 1, 1}));
        QCOMPARE(positionIn(ui.gridLayout2, itemOf(ui.gridLayout2, ui.groupBox_2)), Pos({0, 1, 3, 1}));
        QCOMPARE(positionIn(ui.gridLayout2, ui.spacerItem), Pos({2, 0, 1, 1}));
        QCOMPARE(positionIn(ui.gridLayout2, itemOf(ui.gridLayout2, ui.matchWord)), Pos({1, 0, 1, 1}));
        QCOMPARE(ui.gridLayout2->count(), 4);

        QCOMPARE(ui.vboxLayout->count(), 1);
        QCOMPARE(ui.vboxLayout->itemAt(0)->widget(), ui.matchCase);
        QCOMPARE(ui.vboxLayout1->count(), 3);
        QCOMPARE(ui.vboxLayout1->itemAt(0)->widget(), ui.literal);
        QCOMPARE(ui.vboxLayout1->itemAt(1)->widget(), ui.wildcard);
        QCOMPARE(ui.vboxLayout1->itemAt(2)->widget(), ui.regexp);
        QCOMPARE(ui.hboxLayout->count(), 5);
        QCOMPARE(ui.hboxLayout->itemAt(0), ui.spacerItem2);
        QCOMPARE(ui.hboxLayout->itemAt(1)->widget(), ui.start);
        QCOMPARE(ui.hboxLayout->itemAt(2)->widget(), ui.stop);
        QCOMPARE(ui.hboxLayout->itemAt(3)->widget(), ui.cancel);
        QCOMPARE(ui.hboxLayout->itemAt(4)->widget(), ui.help);

        QCOMPARE(ui.spacerItem->sizeHint(), QSize(20, 53));
        QCOMPARE(ui.spacerItem->sizePolicy().horizontalPolicy(), QSizePolicy::Minimum);
        QCOMPARE(ui.spacerItem->sizePolicy().verticalPolicy(), QSizePolicy::Expanding);
        QCOMPARE(ui.spacerItem1->sizeHint(), QSize(20, 11));
        QCOMPARE(ui.spacerItem1->sizePolicy().horizontalPolicy(), QSizePolicy::Minimum);
        QCOMPARE(ui.spacerItem1->sizePolicy().verticalPolicy(), QSizePolicy::Expanding);
        QCOMPARE(ui.spacerItem2->sizeHint(), QSize(40, 20));
        QCOMPARE(ui.spacerItem2->sizePolicy().horizontalPolicy(), QSizePolicy::Expanding);
        QCOMPARE(ui.spacerItem2->sizePolicy().verticalPolicy(), QSizePolicy::Minimum);
    }

    void sizePoliciesAndBoxes()
    {
        Form form;
        const Ui::FindInFilesDlgClass& ui = form.ui;
        for (QLabel* label : {ui.label, ui.label_2, ui.label_3}) {
            QCOMPARE(label->sizePolicy().horizontalPolicy(), QSizePolicy::Maximum);
            QCOMPARE(label->sizePolicy().verticalPolicy(), QSizePolicy::Preferred);
            QCOMPARE(label->sizePolicy().horizontalStretch(), 0);
            QCOMPARE(label->sizePolicy().verticalStretch(), 0);
        }
        QCOMPARE(ui.groupBox->sizePolicy().horizontalPolicy(), QSizePolicy::Preferred);
        QCOMPARE(ui.groupBox->sizePolicy().verticalPolicy(), QSizePolicy::Maximum);

        QVERIFY(ui.what->isEditable());
        QCOMPARE(ui.what->insertPolicy(), QComboBox::InsertAtTop);
        QCOMPARE(ui.what->maxCount(), INT_MAX);
        QVERIFY(ui.where->isEditable());
        QCOMPARE(ui.where->maxCount(), 20);
        QCOMPARE(ui.where->insertPolicy(), QComboBox().insertPolicy());
        QVERIFY(!ui.filter->isEditable());
        for (QComboBox* box : {ui.what, ui.where, ui.filter})
            QCOMPARE(box->sizeAdjustPolicy(), QComboBox::AdjustToMinimumContentsLengthWithIcon);
    }

    void initialStates()
    {
        Form form;
        const Ui::FindInFilesDlgClass& ui = form.ui;
        QVERIFY(!ui.stop->isEnabled());
        QVERIFY(ui.start->isEnabled());
        QVERIFY(ui.start->isDefault());
        QVERIFY(!ui.stop->isDefault());
        QVERIFY(ui.literal->isChecked());
        QVERIFY(!ui.wildcard->isChecked());
        QVERIFY(!ui.regexp->isChecked());
        QVERIFY(ui.includeSubDir->isChecked());
        QVERIFY(!ui.matchCase->isChecked());
        QVERIFY(!ui.matchWord->isChecked());
        QVERIFY(!ui.filter->lineEdit());
        QVERIFY(!ui.filter->completer());
    }

    void matchTypesExcludeEachOther()
    {
        Form form;
        const Ui::FindInFilesDlgClass& ui = form.ui;
        ui.wildcard->click();
        QVERIFY(ui.wildcard->isChecked());
        QVERIFY(!ui.literal->isChecked());
        ui.regexp->click();
        QVERIFY(ui.regexp->isChecked());
        QVERIFY(!ui.wildcard->isChecked());
        QVERIFY(!ui.literal->isChecked());
    }

    void buddies()
    {
        Form form;
        QCOMPARE(form.ui.label->buddy(), form.ui.what);
        QCOMPARE(form.ui.label_2->buddy(), form.ui.where);
        QCOMPARE(form.ui.label_3->buddy(), form.ui.filter);
    }

    void tabOrder()
    {
        Form form;
        const QStringList expected{"what", "filter", "where", "includeSubDir", "matchCase",
                                   "matchWord", "literal", "wildcard", "regexp", "start",
                                   "stop", "cancel", "help", "browse"};
        QStringList chain;
        QWidget* widget = form.ui.what;
        do {
            if (expected.contains(widget->objectName()))
                chain << widget->objectName();
            widget = widget->nextInFocusChain();
        } while (widget != form.ui.what);
        QCOMPARE(chain, expected);
    }

    void mnemonics_data()
    {
        QTest::addColumn<int>("key");
        QTest::addColumn<QString>("target");
        QTest::newRow("Alt+O") << int(Qt::Key_O) << "where";
        QTest::newRow("Alt+T") << int(Qt::Key_T) << "filter";
        QTest::newRow("Alt+F") << int(Qt::Key_F) << "what";
    }

    void mnemonics()
    {
        QFETCH(int, key);
        QFETCH(QString, target);
        Form form;
        form.dialog.show();
        QVERIFY(QTest::qWaitForWindowActive(&form.dialog));
        form.ui.help->setFocus();
        QTRY_VERIFY(form.ui.help->hasFocus());
        QTest::keyClick(&form.dialog, Qt::Key(key), Qt::AltModifier);
        QWidget* focus = QApplication::focusWidget();
        QVERIFY(focus);
        // An editable box hands the focus on to its line edit.
        if (qobject_cast<QLineEdit*>(focus) && focus->parentWidget())
            focus = focus->parentWidget();
        QCOMPARE(focus->objectName(), target);
    }

    void slotsAreBoundByName()
    {
        Form form;
        form.ui.browse->click();
        form.ui.append->click();
        form.ui.append->click();
        QCOMPARE(form.dialog.browseClicks, 1);
        QCOMPARE(form.dialog.appendClicks, 2);
    }

    void textsAreTranslatedInTheFormsContext()
    {
        MarkingTranslator translator;
        QVERIFY(QCoreApplication::installTranslator(&translator));
        // Installing asks for the application's own layout direction.
        translator.contexts.clear();
        Form form;
        QCoreApplication::removeTranslator(&translator);
        QCOMPARE(translator.contexts, QSet<QString>{"FindInFilesDlgClass"});
        QCOMPARE(form.dialog.windowTitle(), QString("[Find in Files Dialog]"));
        QCOMPARE(form.ui.browse->statusTip(), QString("[Add a folder to the list of folders to be searched.]"));
        QCOMPARE(form.ui.regexp->text(), QString("[Regular &Expression]"));
        // Translating again without the translator gives the source texts back.
        form.ui.retranslateUi(&form.dialog);
        QCOMPARE(form.ui.regexp->text(), QString("Regular &Expression"));
    }
};

QTEST_MAIN(tst_FindInFilesDlgClass)
#include "tst_findinfilesdlgclass.moc"
