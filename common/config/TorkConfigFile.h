// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"
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
/// @warning Not every text survives a round trip, and a bad one takes others with it. A value
/// `disk 90%1`, `http://h/a%20b%2Fc` or `%L1`, and a key or section name such as `1st`, `C++`,
/// `a/b`, `naïve` or an empty one, produce a file that the next Load() rejects: everything after
/// it in the file is lost. So encode text from users and other programs with TorkConfigText, which
/// restores any text. Without it, these are safe: for values, spaces and printable ASCII without
/// "%" and "]]>", at least one character; for names, ASCII letters, digits, "_", "-" and ".",
/// starting with a letter or "_", and not the root element's name. TorkConfigText::IsPlainValue()
/// and TorkConfigText::IsPlainName() give the exact answer. What else does not survive:
/// docs/config-file.md.
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
class TORK_EXPORT TorkConfigFile
{
public:
    /// Settings under the root element name "VelocorSettings". Does not touch the disk.
    ///
    /// @param fileName  path of the XML file
    explicit TorkConfigFile(QString const& fileName);

    /// Settings under the given root element name. Does not touch the disk.
    TorkConfigFile(QString const& fileName, QString const& rootElementName);

    /// Deletes all sections. Saves nothing.
    virtual ~TorkConfigFile();

    TorkConfigFile(TorkConfigFile const&) = delete;
    TorkConfigFile& operator=(TorkConfigFile const&) = delete;

    /// Replaces the path of the file; sections and everything else stay.
    void SetFileName(QString const& fileName);

    /// Replaces the name of the root element that Save() writes and that Load() never takes for a
    /// section or key; sections and everything else stay.
    void SetRootElementName(QString const& rootElementName);

    /// Deletes every section in the file. Pointers to them that were handed out become dangling;
    /// sections that were pushed out (see AppendSection()) still belong to their holders.
    void Clear();

    /// Reads the file, replacing all sections.
    ///
    /// Progress and failures are traced to the log if there is one. The text of a failure is left
    /// in m_lastError, and the XML reader's own message goes to the log as a critical entry. Only
    /// regular files and links to them are read: a pipe, a socket or a device counts as a file that
    /// cannot be read and so does not parse.
    ///
    /// @return false if the file name is empty or no such file exists (sections untouched), or if
    ///         the file does not parse (what preceded the error is kept, earlier sections are gone)
    bool Load();

    /// Reads the content of a device, replacing all sections, as Load() reads its file. For text
    /// in memory, and for callers that do not want the load logged: nothing is traced, and
    /// m_lastError is unchanged.
    ///
    ///     QBuffer buffer(&bytes);
    ///     TorkConfigFile settings(QString(), "LogSettings");
    ///     if (settings.LoadFrom(&buffer))
    ///         sections = settings.sectionList();
    ///
    /// @param device  not owned; opened for reading if it is not open yet. The caller ensures that
    ///                reading it neither blocks nor continues forever.
    /// @return false if the content does not parse; what preceded the error is kept
    bool LoadFrom(QIODevice* device);

    /// The same with a custom handler that follows the parse: it gets the content events, the
    /// lexical events and the errors. It must pass the content events to its base class, which
    /// fills this file.
    ///
    /// @param handler  made for this file; used for one load only
    bool LoadFrom(QIODevice* device, TorkConfigFileDocHandler& handler);

    /// Writes all sections to the file, which is truncated first: a program killed in between
    /// leaves a partial or empty file. SaveAtomically() does not.
    ///
    /// Each line is converted to Latin-1, with "?" for what Latin-1 lacks. Nothing is written for a
    /// file name shorter than two characters, nor to a pipe, which counts as a file that cannot be
    /// opened.
    ///
    /// @return always true, for compatibility; only m_lastError shows whether the file could be
    ///         opened, and a successful Save() leaves it unchanged
    bool Save();

    /// Replaces the file atomically with the bytes that Save() would write: whatever happens, the
    /// file is the old one or the new one, never a partial one.
    ///
    /// The bytes are written to a sibling file with ".saving" appended to its name, synced to disk,
    /// and renamed over the old file. Permissions are kept, and so are owner and group if this user
    /// may give files to them; access control lists are not. Symbolic links are followed and kept.
    /// Another hard link keeps the old contents. Processes and threads that save the same file at
    /// the same time wait for each other, for a second at most.
    ///
    /// A program that is killed may leave the ".saving" file, which the next call removes.
    ///
    /// If the folder does not allow the file to be replaced, and for a device, the file is written
    /// in place as Save() does: only then can a partial file be left.
    ///
    /// @return whether the file holds all sections now. If false, m_lastError has the reason and,
    ///         unless it was written in place, the file is untouched; a file that may not be
    ///         written, a folder and a FIFO always are. If true, m_lastError is empty, or says why
    ///         the file was written in place. For a file name shorter than two characters true,
    ///         with nothing written and m_lastError untouched.
    bool SaveAtomically();

    /// The bytes that Save() and SaveAtomically() write, in Latin-1. Does not touch the disk.
    QByteArray ToXml() const;

    /// The names of all sections, in the order in which they are written. Does not change the
    /// current section.
    QStringList sectionList() const;

    /// The section that the last successful lookup found or that WriteItem() or Load() created;
    /// null if there is none. Valid until sections are added or deleted.
    TorkConfigFileSection const* CurrentSection() const { return m_currentSection; }

    /// Whether a section of exactly that name exists; `name` is used unchanged, spaces included.
    bool HasSection(QString const& name);
    bool HasSection(QString& name);

    /// The section of exactly that name, or null. The file keeps ownership until another section
    /// of that name pushes it out: see AppendSection().
    TorkConfigFileSection* FindSection(QString const& name);
    TorkConfigFileSection* FindSection(QString& name);

    /// Adds a section under its own name and takes ownership of it.
    ///
    /// It pushes out a section that already has the name. If FindSection() ever returned that one,
    /// or AppendSection() added it, it leaves the file without being deleted: it belongs to its
    /// holder, who may delete it or append it again, here or to another file. The same applies when
    /// WriteItem() or Load() create a section whose decoded name is taken. A section that nobody
    /// ever got a pointer to is deleted.
    ///
    /// @param section  allocated with `new`, in no other file; null, or a section that is already
    ///                 in the file, changes nothing
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

    /// Stores a text, creating the section if needed. Nothing reaches the disk before Save().
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
    /// @return false if the key is missing or its text is not a number in the int range
    bool ReadInt(QString const& section, QString const& key, int defaultValue, int& value);

    /// Reads an unsigned number, converted as a signed one: the format's rule.
    ///
    /// A stored negative number wraps into the unsigned range, and one above 2147483647 fails, as
    /// does a missing key with such a default.
    ///
    /// @param value  the number, or `defaultValue` if the key is missing; untouched on failure
    /// @return true if the conversion succeeded, also for a missing key
    bool ReadUint(QString const& section, QString const& key, unsigned int defaultValue,
                  unsigned int& value);

    /// Stores "yes" or "no".
    bool WriteBool(QString const& section, QString const& key, bool value);

    /// Reads a boolean: "1", "y", "yes", "t" and "true" in any letter case mean true, every
    /// other text means false.
    ///
    /// @param value  the boolean; `defaultValue` if the key is missing
    /// @return whether the key is present
    bool ReadBool(QString const& section, QString const& key, bool defaultValue, bool& value);

    /// Stores a color as "red,green,blue" in decimal, 0 to 255; alpha is not stored.
    bool WriteColor(QString const& section, QString const& key, QColor& color);

    /// Reads an opaque color, stored as "red,green,blue".
    ///
    /// The text is split at commas and minus signs; a field that is not a number counts as 0.
    ///
    /// @param color  set on success only; numbers outside 0 to 255 make it an invalid color
    /// @return false if the key is missing or the text has not exactly three fields
    bool ReadColor(QString const& section, QString const& key, QColor& color);

    /// Stores a size in pixels as "width,height" in decimal.
    bool WriteSize(QString const& section, QString const& key, QSize& size);

    /// Reads a size in pixels, stored as "width,height".
    ///
    /// The text is split at commas and minus signs; a field that is not a number counts as 0.
    ///
    /// @param size  set on success only
    /// @return false if the key is missing or the text has not exactly two fields
    bool ReadSize(QString const& section, QString const& key, QSize& size);

    /// Stores a font as QFont::toString() formats it.
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
    /// @param position, size  (0, 0) and 0 by 0 if the key is missing or does not have four fields;
    ///                        untouched if a field is not a number or there is no desktop
    /// @return false if the key is missing, a field is not a number, or there is no desktop
    bool ReadScreenMetrics(char const* name, QPoint& position, QSize& size);

    /// Load step: an element starts. Called by the document handler.
    ///
    /// @return always true
    bool StartElement(QString& name);

    /// Load step: an element ends. Called by the document handler.
    ///
    /// @return always true
    bool EndElement(QString& name);

    /// Load step: stores `content` as WriteItem() does, as the value of the item that opened last,
    /// if it has none yet.
    ///
    /// @return always true, even if WriteItem() rejects a null text
    bool ProcessContent(QString& content);

    /// Whether ProcessContent() would store its text as a value: the element that opened last is an
    /// item, or inside one, and has no value yet.
    bool IsExpectingValue() const { return !m_atRoot && m_expectingValue; }

    /// Prepares a value for writing: wrapped in a CDATA section if it holds one of & ' < > ".
    ///
    /// Nothing else is escaped, so a value that holds "]]>" produces a file that does not parse.
    ///
    /// @param out  receives the prepared text; may be the same object as `in`
    // cppcheck-suppress functionStatic ; part of the public interface
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
    QSet<TorkConfigFileSection*> m_knownOutside; // those that a caller may hold
    TorkConfigFileSection* m_currentSection = nullptr;
    TorkConfigFileDocHandler* m_activeHandler = nullptr;
    QString m_currentElement;

public:
    /// The last problem of Load(), Save() or SaveAtomically(); cleared by a Load() that finds its
    /// file, and by SaveAtomically(). Read it directly.
    QString m_lastError;

private:
    QString m_screensSectionName;
};
