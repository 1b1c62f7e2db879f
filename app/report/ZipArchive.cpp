// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/report/ZipArchive.h"

namespace Velocor {

namespace {

constexpr quint32 FileSignature = 0x04034b50;
constexpr quint32 DirectorySignature = 0x02014b50;
constexpr quint32 EndSignature = 0x06054b50;
constexpr quint16 Version = 20;            // that knows folders and this compression
constexpr quint16 Utf8Names = 1 << 11;     // flag
constexpr quint16 Deflated = 8;            // method
constexpr quint16 FirstDay = (1 << 5) + 1; // January 1, 1980

// What qCompress() adds to the compressed data: its length and a header, and a checksum.
constexpr int BeforeData = 6;
constexpr int AfterData = 4;

constexpr char NoData[] = "\x03"; // a last block without anything in it, with the NUL

QByteArray Compressed(QByteArray const& content)
{
    if (content.isEmpty()) // for which qCompress() makes no block
        return QByteArray(NoData, sizeof NoData);
    const QByteArray compressed = qCompress(content);
    return compressed.mid(BeforeData, compressed.size() - BeforeData - AfterData);
}

void Add16(QByteArray& bytes, quint32 number)
{
    bytes += static_cast<char>(number & 0xff);
    bytes += static_cast<char>(number >> 8 & 0xff);
}

void Add32(QByteArray& bytes, quint32 number)
{
    Add16(bytes, number & 0xffff);
    Add16(bytes, number >> 16);
}

quint32 Crc32(QByteArray const& bytes)
{
    quint32 crc = 0xffffffff;
    for (char byte : bytes) {
        crc ^= static_cast<quint8>(byte);
        for (int bit = 0; bit < 8; ++bit)
            crc = (crc & 1) != 0 ? crc >> 1 ^ 0xedb88320 : crc >> 1;
    }
    return ~crc;
}

quint32 SizeOf(QByteArray const& bytes)
{
    return static_cast<quint32>(bytes.size());
}

} // namespace

void ZipArchive::Add(QString const& name, QByteArray const& content)
{
    const QByteArray data = Compressed(content);
    const QByteArray nameBytes = name.toUtf8();
    const quint32 start = SizeOf(m_files);

    QByteArray common; // to both headers
    Add16(common, Version);
    Add16(common, Utf8Names);
    Add16(common, Deflated);
    Add16(common, 0); // time
    Add16(common, FirstDay);
    Add32(common, Crc32(content));
    Add32(common, SizeOf(data));
    Add32(common, SizeOf(content));
    Add16(common, SizeOf(nameBytes));
    Add16(common, 0); // extra field

    Add32(m_files, FileSignature);
    m_files += common + nameBytes + data;

    Add32(m_directory, DirectorySignature);
    Add16(m_directory, Version);
    m_directory += common;
    Add16(m_directory, 0); // comment
    Add16(m_directory, 0); // disk
    Add16(m_directory, 0); // attributes
    Add32(m_directory, 0);
    Add32(m_directory, start);
    m_directory += nameBytes;
    ++m_count;
}

QByteArray ZipArchive::Bytes() const
{
    QByteArray bytes = m_files + m_directory;
    Add32(bytes, EndSignature);
    Add32(bytes, 0); // disks
    Add16(bytes, static_cast<quint32>(m_count));
    Add16(bytes, static_cast<quint32>(m_count));
    Add32(bytes, SizeOf(m_directory));
    Add32(bytes, SizeOf(m_files));
    Add16(bytes, 0); // comment
    return bytes;
}

} // namespace Velocor
