// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <cstddef>
#include <cstdint>
#include <random>
#include <string>
#include <vector>

extern "C" size_t LLVMFuzzerMutate(uint8_t* data, size_t size, size_t maxSize);

/// Mutates XML documents by their structure: changed bytes alone almost never leave an element that
/// ends, or an entity that is both declared and used.
///
/// Every other mutation is one of the fuzzer's own, so malformed documents stay as frequent.
class XmlMutator
{
public:
    /// @param seed  of this mutation, from the fuzzer
    /// @param words  names of elements and values of attributes to insert among others
    explicit XmlMutator(unsigned int seed, std::vector<std::string> words = {});

    /// A mutation of a document, not longer than `maximum`.
    std::string Mutate(std::string document, size_t maximum);

    /// A random number below `limit`, which is not 0.
    size_t Below(size_t limit) { return m_random() % limit; }

private:
    using Texts = std::vector<std::string>;

    struct Range
    {
        size_t start;
        size_t end;
    };

    std::string const& pick(Texts const& texts) { return texts[Below(texts.size())]; }
    std::string name();
    std::string text(int depth);
    std::string attribute();
    std::string entityValue();
    std::string piece(int depth);
    std::string declaration();

    size_t boundary(std::string const& document);
    Range element(std::string const& document);

    void insertPiece(std::string& document);
    void duplicate(std::string& document);
    void remove(std::string& document);
    void wrap(std::string& document);
    void rename(std::string& document);
    void declare(std::string& document);
    void addAttribute(std::string& document);
    void refer(std::string& document);

    std::mt19937 m_random;
    Texts m_words;
};

/// Mutates a fuzzer's input that is nothing but a document.
inline size_t MutateDocument(uint8_t* data, size_t size, size_t maximum, unsigned int seed,
                             std::vector<std::string> const& words = {})
{
    auto* bytes = reinterpret_cast<char*>(data);
    const std::string mutated = XmlMutator(seed, words).Mutate(std::string(bytes, size), maximum);
    return mutated.copy(bytes, maximum);
}
