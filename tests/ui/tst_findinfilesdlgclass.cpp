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

} // namespace

class tst_FindInFilesDlgClass : public QObject
{
    Q_OBJECT

private slots:
    void dialogKeepsAnEarlierName()
    {
        Form form;
        QCOMPARE(form.dialog.objectName(), QString("FindInFilesDlgClass"));
        BindingDialog dialog;
        dialog.setObjectName("gui-orba-find-in-files-dialog");
        Ui::FindInFilesDlgClass ui;
        ui.setupUi(&dialog);
        QCOMPARE(dialog.objectName(), QString("gui-orba-find-in-files-dialog"));
    }

    void initialStates()
    {
        Form form;
        const Ui::FindInFilesDlgClass& ui = form.ui;
        QVERIFY(!ui.stop->isEnabled() && !ui.stop->isDefault());
        QVERIFY(ui.start->isEnabled() && ui.start->isDefault());
        QVERIFY(ui.literal->isChecked() && ui.includeSubDir->isChecked());
        QVERIFY(!ui.matchCase->isChecked() && !ui.matchWord->isChecked());
        QVERIFY(ui.what->isEditable() && ui.where->isEditable() && !ui.filter->isEditable());
        QCOMPARE(ui.where->maxCount(), 20);
        // The match types exclude each other.
        ui.regexp->click();
        QVERIFY(!ui.literal->isChecked() && !ui.wildcard->isChecked());
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

    // Alt + a label's mnemonic moves the focus to its buddy.
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
        QCOMPARE(form.ui.regexp->text(), QString("[Regular &Expression]"));
        // Translating again without the translator gives the source texts back.
        form.ui.retranslateUi(&form.dialog);
        QCOMPARE(form.ui.regexp->text(), QString("Regular &Expression"));
    }
};

QTEST_MAIN(tst_FindInFilesDlgClass)
#include "tst_findinfilesdlgclass.moc"
