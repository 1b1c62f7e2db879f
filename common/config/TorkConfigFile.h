// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFileSection.h"

#include <QScopedPointer>
#include <QSet>
#include <QString>
#include <QStringList>

class QColor;
class QFont;
class QIODevice;
class QPoint;
class QSize;
class QXmlErrorHandler;
class QXmlLexicalHandler;
class TorkConfigFileDocHandler;
template <class Value>
class TorkOrderedHash;

/// The settings of one component: named sections of key/value texts in one small XML file.
///
/// Only Load(), Save() and SaveAtomically() touch the disk; everything else works on the sections
/// in memory. The file has three levels: a root element, one element per section, one element per
/// key with the value as its text. File format: docs/config-file.md.
///
/// In every operation that takes a section and a key, all space characters are removed from both
/// before use ("Main Window" and "MainWindow" are the same section); lookups are then exact and
/// case-sensitive. No reader ever stores a default: a missing key stays missing until it is
/// written. A successful section lookup makes that section the current one.
///
/// @warning Not every text comes back, and a wrong one takes others along. A value `disk 90%1`,
/// `http://h/a%20b%2Fc` or `%L1`, and a key or section name such as `1st`, `C++`, `a/b`, `naïve` or
/// an empty one, make a file that the next Load() refuses: all that follows in it is lost. So pass
/// text of users and other programs through TorkConfigText, which brings every text back. Without
/// it these are safe: for values, a space and printable ASCII without "%" and "]]>", at least one
/// character; for names, ASCII letters, digits, "_", "-" and ".", a letter or "_" first, and not
/// the root element's name. TorkConfigText::IsPlainValue() and TorkConfigText::IsPlainName() tell
/// exactly. What else does not come back: docs/config-file.md.
///
/// One thread at a time. No operation throws.
///
///     TorkConfigFile settings(dataPath + "viewer.cfg");
///     settings.Load(); // no file yet: the defaults below hold
///     int columns = 0;
///     settings.ReadInt("Main Window", "columns", 3, columns);
///     settings.WriteItem("Main Window", "columns", columns + 1);
///     if (!settings.SaveAtomically())
///         WarningMessage(window, settings.m_lastError, true);
class TorkConfigFile
{
public:
    /// Settings under the root element name "VelocorSettings". Does not touch the disk.
    ///
    /// @param fileName  path of the XML file
    explicit TorkConfigFile(QString const& fileName);

    /// Settings under a root element name of the caller's choice. Does not touch the disk.
    TorkConfigFile(QString const& fileName, QString const& rootElementName);

    /// Deletes all sections. Saves nothing.
    virtual ~TorkConfigFile();

    TorkConfigFile(TorkConfigFile const&) = delete;
    TorkConfigFile& operator=(TorkConfigFile const&) = delete;

    /// Replaces the path of the file; sections and everything else stay.
    void SetFileName(QString const& fileName);

    /// Replaces the name of the root element that Save() writes and that Load() takes for no
    /// section or key; sections and everything else stay.
    void SetRootElementName(QString const& rootElementName);

    /// Deletes every section in the file. Pointers to them that were handed out are invalid
    /// afterwards; sections that were pushed out (see AppendSection()) stay their holders'.
    void Clear();

    /// Reads the file, replacing all sections.
    ///
    /// Progress and failures are traced to the log when there is one. The text of a failure is
    /// left in m_lastError, and the XML reader's own message goes to the log as a critical entry.
    /// Only regular files and links to them are read: a pipe, a socket or a device is taken for a
    /// file that cannot be read, and so does not parse.
    ///
    /// @return false if the file name is empty or no such file exists (sections untouched), or if
    ///         the file does not parse (what preceded the error is kept, earlier sections are gone)
    bool Load();

    /// Reads the content of a device, replacing all sections, as Load() reads its file. For text
    /// that is in memory, and for callers that keep the reading out of the log: nothing is traced,
    /// and m_lastError stays as it was.
    ///
    ///     QBuffer buffer(&bytes);
    ///     TorkConfigFile settings(QString(), "LogSettings");
    ///     if (settings.LoadFrom(&buffer))
    ///         sections = settings.sectionList();
    ///
    /// @param device  not owned; opened for reading if it is not open yet. The caller sees to it
    ///                that reading it neither waits nor goes on forever.
    /// @return false if the content does not parse; what preceded the error is kept
    bool LoadFrom(QIODevice* device);

    /// The same with a handler of the caller's own, which follows the parse: it gets the events of
    /// the content, the lexical events and the errors. It hands the events of the content on to its
    /// base class, which fills this file.
    ///
    /// @param handler  made for this file; used for one load only
    bool LoadFrom(QIODevice* device, TorkConfigFileDocHandler& handler);

    /// Writes all sections over the file, which is emptied first: a program killed in between
    /// leaves a part of it or nothing. SaveAtomically() does not.
    ///
    /// Each line is converted to Latin-1, with "?" for what Latin-1 lacks. Nothing is written for a
    /// file name shorter than two characters, nor into a pipe, which counts as one that does not
    /// open.
    ///
    /// @return always true, for historical callers; whether the file could be opened shows only in
    ///         m_lastError, which a successful Save() leaves as it was
    bool Save();

    /// Replaces the file by the bytes that Save() would write, in one step: whatever happens, the
    /// file is the old one or the new one, never a part.
    ///
    /// The bytes are written to a file beside it, of the same name with ".saving" at its end, which
    /// takes the old one's place when it is on the disk. Permissions are kept, and so are owner and
    /// group where this user may give files to them; access lists are not. Symbolic links are
    /// followed and stay. A further hard link keeps the old contents. Processes and threads that
    /// save the same file at once wait for each other, for a second at most.
    ///
    /// A program that is killed may leave the ".saving" file behind, which the next call removes.
    ///
    /// Where the folder does not let files be replaced, and for a device, the file is written in
    /// place as Save() does it: only then can a part be left.
    ///
    /// @return whether the file holds all sections now. If false, m_lastError has the reason and,
    ///         unless it was written in place, the file is untouched; a file that may not be
    ///         written, a folder and a FIFO always are. If true, m_lastError is empty, or tells
    ///         that and why the file was written in place. For a file name shorter than two
    ///         characters true, with nothing written and m_lastError untouched.
    bool SaveAtomically();

    /// The bytes that Save() and SaveAtomically() write, in Latin-1. Nothing touches the disk.
    QByteArray ToXml() const;

    /// The names of all sections, in the order in which they are written. The current section stays
    /// the current one.
    QStringList sectionList() const;

    /// The section that the last successful lookup found or WriteItem() or Load() made; null if
    /// there is none. It is valid until sections are added or deleted.
    TorkConfigFileSection const* CurrentSection() const { return m_currentSection; }

    /// Whether a section of exactly that name exists; `name` is used as it stands, blanks included.
    bool HasSection(QString const& name);
    bool HasSection(QString& name);

    /// The section of exactly that name, or null. It stays the file's, until another of that name
    /// pushes it out: see AppendSection().
    TorkConfigFileSection* FindSection(QString const& name);
    TorkConfigFileSection* FindSection(QString& name);

    /// Adds a section under its own name and takes ownership of it.
    ///
    /// It pushes out a section that already has the name. If FindSection() ever gave that one out,
    /// or AppendSection() took it, it leaves the file without being deleted: it belongs to whoever
    /// holds it, who may delete it or append it again, here or to another file. The same holds when
    /// WriteItem() or Load() make a section whose decoded name is taken. What nobody ever got a
    /// pointer to is deleted.
    ///
    /// @param section  made by `new`, in no other file; null and one that is already in the file
    ///                 change nothing
    /// @return always true
    bool AppendSection(TorkConfigFileSection* section);

    /// Removes all values of a section, which stays under its name; nothing if it does not exist.
    void ClearSection(QString const& name);

    /// The keys of a section in no promised order; empty if the section does not exist.
    QStringList keyList(QString const& section);

    /// Reads a text.
    ///
    /// @param value  the stored text; on failure `defaultValue`, or an empty text where that is
    ///               empty. May be the same object as `defaultValue`.
    /// @return whether section and key exist
    bool ReadItem(QString const& section, QString const& key, QString& defaultValue,
                  QString& value);

    /// Stores a text, making the section if need be. Nothing reaches the disk before Save().
    ///
    /// A new section takes its name from the Latin-1 bytes of `section` read as UTF-8, so only
    /// ASCII names are found again under the name they were written with.
    ///
    /// @return false, with nothing stored, if `key` or `value` is a null text
    bool WriteItem(QString const& section, QString const& key, QString const& value);

    /// Stores a number in decimal. Result as for texts.
    bool WriteItem(QString const& section, QString const& key, int value);
    bool WriteItem(QString const& section, QString const& key, unsigned int value);

    /// Reads a signed number in decimal.
    ///
    /// @param value  the number; `defaultValue` on failure
    /// @return false if the key is missing or its text is no number in the int range
    bool ReadInt(QString const& section, QString const& key, int defaultValue, int& value);

    /// Reads an unsigned number, converted as a signed one: the format's rule.
    ///
    /// A stored negative number arrives wrapped into the unsigned range, and one above 2147483647
    /// fails, as does a missing key with such a default.
    ///
    /// @param value  the number, or `defaultValue` if the key is missing; untouched on failure
    /// @return true if the conversion succeeded, also for a missing key
    bool ReadUint(QString const& section, QString const& key, unsigned int defaultValue,
                  unsigned int& value);

    /// Stores "yes" or "no".
    bool WriteBool(QString const& section, QString const& key, bool value);

    /// Reads a truth value: "1", "y", "yes", "t" and "true" in any letter case mean true, every
    /// other text means false.
    ///
    /// @param value  the truth value; `defaultValue` if the key is missing
    /// @return whether the key is present
    bool ReadBool(QString const& section, QString const& key, bool defaultValue, bool& value);

    /// Stores a colour as "red,green,blue" in decimal, 0 to 255; alpha is not stored.
    bool WriteColor(QString const& section, QString const& key, QColor& colour);

    /// Reads an opaque colour, stored as "red,green,blue".
    ///
    /// The text is split at commas and minus signs; a field that is no number counts as 0.
    ///
    /// @param colour  set on success only; numbers outside 0 to 255 make it an invalid colour
    /// @return false if the key is missing or the text has not exactly three fields
    bool ReadColor(QString const& section, QString const& key, QColor& colour);

    /// Stores a size in pixels as "width,height" in decimal.
    bool WriteSize(QString const& section, QString const& key, QSize& size);

    /// Reads a size in pixels, stored as "width,height".
    ///
    /// The text is split at commas and minus signs; a field that is no number counts as 0.
    ///
    /// @param size  set on success only
    /// @return false if the key is missing or the text has not exactly two fields
    bool ReadSize(QString const& section, QString const& key, QSize& size);

    /// Stores a font as QFont::toString() words it.
    bool WriteFont(QString const& section, QString const& key, QFont& font);

    /// Reads a font as QFont::fromString() understands it.
    ///
    /// @param font  untouched if the key is missing
    /// @return whether the key is present
    bool ReadFont(QString const& section, QString const& key, QFont& font);

    /// Stores a window's rectangle as "x,y,width,height" in pixels in the screens section.
    ///
    /// @param name  the window's key, zero-terminated ASCII
    bool WriteScreenMetrics(char const* name, QPoint& position, QSize& size);

    /// Reads a window's rectangle and fits it to the desktop: at least 320 by 200 pixels, inside
    /// the desktop's extent. Needs the GUI thread.
    ///
    /// @param position, size  (0, 0) and 0 by 0 if the key is missing or has not four fields;
    ///                        untouched if a field is no number or there is no desktop
    /// @return false if the key is missing, a field is no number, or there is no desktop
    bool ReadScreenMetrics(char const* name, QPoint& position, QSize& size);

    /// Load step: an element opened. Called by the document handler.
    ///
    /// @return always true
    bool StartElement(QString& name);

    /// Load step: an element ended. Called by the document handler.
    ///
    /// @return always true
    bool EndElement(QString& name);

    /// Load step: stores `content` as WriteItem() does, as the value of the item that opened last,
    /// if it has none yet.
    ///
    /// @return always true, also where WriteItem() refuses a null text
    bool ProcessContent(QString& content);

    /// Whether ProcessContent() would take its text for a value: the element that opened last is an
    /// item, or inside one, and has no value yet.
    bool IsExpectingValue() const { return !m_atRoot && m_expectingValue; }

    /// Prepares a value for writing: wrapped in a CDATA section if it holds one of & ' < > ".
    ///
    /// Nothing else is escaped, so a value that holds "]]>" gives a file that does not parse.
    ///
    /// @param out  receives the prepared text; may be the same object as `in`
    // cppcheck-suppress functionStatic ; the interface stands
    void FilterContent(QString& in, QString& out);

private:
    TorkConfigFileSection* lookUp(QString const& name);
    TorkConfigFileSection* createSection(QString const& name);
    TorkConfigFileSection* handOut(QString const& name);
    void put(TorkConfigFileSection* section);
    QString const* findValue(QString const& section, QString const& key);
    QString const* findCleaned(QString const& section, QString const& key);
    bool parseFile();
    bool parse(QIODevice* device, TorkConfigFileDocHandler& handler, QXmlErrorHandler& errorHandler,
               QXmlLexicalHandler* lexicalHandler);
    void fail(QString const& message);

    QString m_fileName;
    QString m_rootElementName;
    bool m_atRoot = false;
    bool m_expectingValue = false;
    QScopedPointer<TorkOrderedHash<TorkConfigFileSection*>> m_sections; // never null, owning
    QSet<TorkConfigFileSection*> m_knownOutside; // those of them that somebody may hold
    TorkConfigFileSection* m_currentSection = nullptr;
    TorkConfigFileDocHandler* m_activeHandler = nullptr;
    QString m_currentElement;

public:
    /// What the last Load(), Save() or SaveAtomically() had to complain about; emptied by a Load()
    /// that finds its file, and by SaveAtomically(). Read it directly.
    QString m_lastError;

private:
    QString m_screensSectionName;
};
