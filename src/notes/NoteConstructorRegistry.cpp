#include "notes/NoteConstructorRegistry.h"

#include "notes/CImageFileNoteConstructor.h"
#include "notes/CTextFileNoteConstructor.h"

#include <QFileInfo>
#include <QHash>

#include <new>

namespace {

using Factory = CBasicNoteConstructor* (*)(const QString& source);

template <class Constructor> CBasicNoteConstructor* Make(const QString& source) {
    return new (std::nothrow) Constructor(source);
}

// Extensions, lower case with their dot, and the constructors that take them; the process
// keeps it once it is made.
const QHash<QString, Factory>& Registry() {
    static const QHash<QString, Factory> registry{
        {QStringLiteral(".txt"), &Make<CTextFileNoteConstructor>},
        {QStringLiteral(".tmp"), &Make<CTextFileNoteConstructor>},
        {QStringLiteral(".jpg"), &Make<CImageFileNoteConstructor>},
        {QStringLiteral(".gif"), &Make<CImageFileNoteConstructor>},
        {QStringLiteral(".bmp"), &Make<CImageFileNoteConstructor>},
        {QStringLiteral(".png"), &Make<CImageFileNoteConstructor>},
    };
    return registry;
}

} // namespace

CBasicNoteConstructor* CreateNoteConstructor(const QString& source) {
    const QString fileName = QFileInfo(source).fileName();
    const qsizetype dot = fileName.lastIndexOf(u'.');
    if (dot < 0)
        return nullptr;
    const Factory factory = Registry().value(fileName.sliced(dot).toLower());
    if (factory == nullptr)
        return nullptr;
    ReleasePtr<CBasicNoteConstructor> constructor(factory(source));
    if (!constructor || constructor->Initialize() != 1)
        return nullptr;
    return constructor.release();
}
