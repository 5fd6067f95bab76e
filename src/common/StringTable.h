#pragma once

#include <QString>

// The program's string resources, by the numbers the rest of the product knows them by.
namespace StringId {
enum : int {
    ProductName = 127,
    LinkedDocumentsTitle = 129,
    DeletedItemsTitle = 130,
    NotebookTitle = 131,
    DeleteBlogAccountQuestion = 133,
    DeleteBlogAccountCaption = 135,
    DefaultStyleName = 136,
    VisualStyleLanguage = 159,
    BrowserMenuText = 162,
    FileTooLarge = 173,
    FileNotReadable = 180,
    DefaultBlogAccountSuffix = 212,
    SetDefaultBlogAccountTip = 213,
    ViewBlogTip = 214,
    AddBlogAccountTip = 215,
    RemoveBlogAccountTip = 216,
    EditBlogAccountTip = 217,
    NewNote = 32769,
    NewWordProcessorDocument = 32770,
    SnapshotToNewNote = 32771,
    SnapshotToClipboard = 32772,
    SnapshotToQm = 32773,
    OpenDocument = 32774,
    Settings = 32775,
    HelpTopics = 32776,
    TellAFriend = 32778,
    Website = 32781,
    About = 32782,
    KeepOnTop = 32783,
    ActivityCenter = 32784,
    ShowFrame = 32785,
    StartPanel = 32793,
    FilterNotes = 32794,
    FilterQmd = 32795,
    FilterDoc = 32796,
    FilterPdf = 32797,
    FilterAll = 32798,
    FilterOpenedOnly = 32799,
    HideMessageCentre = 32800,
    NewFolder = 32824,
    CloseAllNotes = 32825,
    CloseAllDocuments = 32826,
    SendToWordProcessor = 32827,
    SendToMailRecipient = 32828,
    Print = 32829,
    Restore = 32830,
    Delete = 32831,
    Show = 32833,
    SendTo = 32834,
    MessageArchive = 32851,
    UserGuide = 32862,
    SaveAs = 32876,
    PictureFileFilter = 32920,
    SendToBlog = 32923,
    CheckForUpdates = 32924,
    GeneralPage = 32978,
    NotesPage = 32979,
    BloggingPage = 32980,
    SendToPage = 32981,
    FileNotFound = 32982,
    FileNotFoundCaption = 32983,
    ActionFailed = 32984,
};
}

// The text of a string resource; a null QString for an id the table does not hold.
QString LoadString(int id);

// A string resource with its "%s" filled in, as the product's message boxes show them.
QString FormatString(int id, const QString& argument);
