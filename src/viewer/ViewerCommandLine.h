#pragma once

#include <QString>
#include <QStringList>

// What the viewer was started with: `AmbrelViewer [/o [<file>]] /id:<item id>`. The navigator
// passes "/o" alone when it will hand the file over on the bus once the window exists; a
// person may name the file right after it. Switches take "/" or "-" and any letter case.
class ViewerCommandLine {
public:
    // Reads the arguments that follow the program's name; IsValid() tells whether they made sense.
    static ViewerCommandLine Parse(const QStringList& arguments);

    bool IsValid() const { return m_problem.isEmpty(); }
    // Why the arguments were refused, one line for the error output.
    QString Problem() const { return m_problem; }

    QString ItemId() const { return m_itemId; }
    // "/o" was given: a document comes, named here or handed over by the navigator.
    bool HasOpenSwitch() const { return m_openSwitch; }
    // The file named after "/o"; empty when none was named.
    QString File() const { return m_file; }

private:
    QString m_itemId;
    QString m_file;
    QString m_problem;
    bool m_openSwitch = false;
};
