#include "common/StringTable.h"

#include <QHash>

namespace {

const QHash<int, QString>& Table() {
    static const QHash<int, QString> table{
        {StringId::ProductName, QStringLiteral("Quillmark Ambrel")},
        {StringId::LinkedDocumentsTitle, QStringLiteral("Linked Documents")},
        {StringId::DeletedItemsTitle, QStringLiteral("Deleted Items")},
        {StringId::NotebookTitle, QStringLiteral("Notebook")},
        {StringId::DeleteBlogAccountQuestion,
         QStringLiteral("Are you sure that you want to delete the account\n settings for blog "
                        "\"%s\"?")},
        {StringId::DeleteBlogAccountCaption, QStringLiteral("Delete Blog Account Settings")},
        {StringId::DefaultStyleName, QStringLiteral("%1 (Default)")},
        {StringId::VisualStyleLanguage, QStringLiteral("EN")},
        {StringId::BrowserMenuText, QStringLiteral("Copy to &Ambrel Note")},
        {StringId::FileTooLarge,
         QStringLiteral("The file %s exceeds 1MB in size.  Only the first 1MB of data has been "
                        "added to your note.")},
        {StringId::FileNotReadable,
         QStringLiteral("Quillmark Ambrel was not able to open the file %s\nThe file may contain "
                        "invalid characters.")},
        {StringId::DefaultBlogAccountSuffix, QStringLiteral(" (Default)")},
        {StringId::SetDefaultBlogAccountTip, QStringLiteral("Set as default blog account")},
        {StringId::ViewBlogTip, QStringLiteral("View blog")},
        {StringId::AddBlogAccountTip, QStringLiteral("Add new blog account")},
        {StringId::RemoveBlogAccountTip, QStringLiteral("Remove blog account")},
        {StringId::EditBlogAccountTip, QStringLiteral("Edit blog account")},
        {StringId::NewNote, QStringLiteral("New Note")},
        {StringId::NewWordProcessorDocument, QStringLiteral("New Word Processor Document")},
        {StringId::SnapshotToNewNote, QStringLiteral("Take Snapshot to New Note")},
        {StringId::SnapshotToClipboard, QStringLiteral("Take Snapshot to Clipboard")},
        {StringId::SnapshotToQm, QStringLiteral("Take Snapshot to Quillmark")},
        {StringId::OpenDocument, QStringLiteral("Open Document")},
        {StringId::Settings, QStringLiteral("Settings")},
        {StringId::HelpTopics, QStringLiteral("Help Topics")},
        {StringId::TellAFriend, QStringLiteral("Tell a Friend")},
        {StringId::Website, QStringLiteral("Quillmark Ambrel Website")},
        {StringId::About, QStringLiteral("About Quillmark Ambrel")},
        {StringId::KeepOnTop, QStringLiteral("Keep on Top")},
        {StringId::ActivityCenter, QStringLiteral("Activity Center")},
        {StringId::ShowFrame, QStringLiteral("Show Frame")},
        {StringId::StartPanel, QStringLiteral("Start Panel")},
        {StringId::FilterNotes, QStringLiteral("Notes")},
        {StringId::FilterQmd, QStringLiteral("QMD")},
        {StringId::FilterDoc, QStringLiteral("DOC")},
        {StringId::FilterPdf, QStringLiteral("PDF")},
        {StringId::FilterAll, QStringLiteral("All")},
        {StringId::FilterOpenedOnly, QStringLiteral("Opened Items Only")},
        {StringId::HideMessageCentre, QStringLiteral("Hide Message Centre")},
        {StringId::NewFolder, QStringLiteral("New Folder")},
        {StringId::CloseAllNotes, QStringLiteral("Close All Notes")},
        {StringId::CloseAllDocuments, QStringLiteral("Close All Documents")},
        {StringId::SendToWordProcessor, QStringLiteral("Send to Word Processor")},
        {StringId::SendToMailRecipient, QStringLiteral("Send to Mail Recipient")},
        {StringId::Print, QStringLiteral("Print")},
        {StringId::Restore, QStringLiteral("Restore")},
        {StringId::Delete, QStringLiteral("Delete")},
        {StringId::Show, QStringLiteral("Show")},
        {StringId::SendTo, QStringLiteral("Send To")},
        {StringId::MessageArchive, QStringLiteral("Message Archive")},
        {StringId::UserGuide, QStringLiteral("User Guide && Tips")},
        {StringId::SaveAs, QStringLiteral("Save As...")},
        // The tree's context menus, by command id.
        {32855, QStringLiteral("New Note")},
        {32856, QStringLiteral("New Folder")},
        {32857, QStringLiteral("Rename")},
        {32858, QStringLiteral("Delete")},
        {32859, QStringLiteral("Send To Word Processor")},
        {32860, QStringLiteral("Close All")},
        {32861, QStringLiteral("Open All")},
        {32871, QStringLiteral("Open...")},
        {32872, QStringLiteral("Close")},
        {32873, QStringLiteral("Delete")},
        {32874, QStringLiteral("Rename")},
        {32875, QStringLiteral("Save to Notebook")},
        {32878, QStringLiteral("Mail Recipient")},
        {32879, QStringLiteral("Word Processor")},
        {32880, QStringLiteral("Print...")},
        {32890, QStringLiteral("Open")},
        {32891, QStringLiteral("Close")},
        {32892, QStringLiteral("Delete")},
        {32893, QStringLiteral("Rename")},
        {32895, QStringLiteral("Mail Recipient")},
        {32896, QStringLiteral("Word Processor")},
        {32897, QStringLiteral("Print...")},
        {32898, QStringLiteral("Save As MS Word")},
        {32900, QStringLiteral("Permanently Delete")},
        {32901, QStringLiteral("Restore")},
        {StringId::PictureFileFilter,
         QStringLiteral("All Picture Files|*.jpg;*.jpeg;*.jpe;*.jfif;*.bmp;*.png;*.gif;|GIF "
                        "(.gif)|*.gif|JPEG (.jpg .jpeg .jpe .jfif)|*.jpg;*.jpeg;*.jpe;*.jfif;|PNG "
                        "(.png)|*.png|Bitmap (.bmp)|*.bmp|")},
        {StringId::SendToBlog, QStringLiteral("Send to Blog")},
        {StringId::CheckForUpdates, QStringLiteral("Check for Updates")},
        {StringId::GeneralPage, QStringLiteral("General")},
        {StringId::NotesPage, QStringLiteral("Notes")},
        {StringId::BloggingPage, QStringLiteral("Blogging")},
        {StringId::SendToPage, QStringLiteral("Send to Word Processor")},
        {StringId::FileNotFound,
         QStringLiteral("\nQuillmark Ambrel cannot find the file:\n\n\"%s\"")},
        {StringId::FileNotFoundCaption, QStringLiteral("File Not Found")},
        {StringId::ActionFailed, QStringLiteral("Quillmark Ambrel could not complete the action.")},
        {StringId::CatalogNotSaved,
         QStringLiteral("Quillmark Ambrel could not save your notebook to the file:\n\n\"%s\"\n\n"
                        "Your changes are kept while the program runs, and saved as soon as the "
                        "file can be written again.")},
        {StringId::SettingsNotSaved,
         QStringLiteral("Quillmark Ambrel could not save its settings to the file:\n\n\"%s\"\n\n"
                        "They are saved as soon as the file can be written again.")},
        {StringId::NoteNotSaved,
         QStringLiteral("Quillmark Ambrel could not write the new note's file:\n\n\"%s\"\n\n"
                        "The note was not added.")},
        {StringId::SaveFailureReason, QStringLiteral("The system reported: %s")},
    };
    return table;
}

} // namespace

QString LoadString(int id) {
    return Table().value(id);
}

QString FormatString(int id, const QString& argument) {
    QString text = LoadString(id);
    const qsizetype at = text.indexOf(QLatin1StringView("%s"));
    if (at >= 0)
        text.replace(at, 2, argument);
    return text;
}
