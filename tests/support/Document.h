// The lists of docs/*.md, which are made from the code: each stands between two comments, "<!-- name -->" and "<!-- end
// -->". With ZV_WRITE_DOCUMENTS set in the environment a document is brought up to date instead of compared.
#pragma once

#include <initializer_list>
#include <string>

/// A file of the repository, by its path in it.
std::string SourceFile(const std::string& path);
std::string SourceText(const std::string& path);

/// What the block of that name in the document is.
std::string BlockOf(const std::string& document, const std::string& name);
/// Expects the block of that name in the document to be `content`.
void ExpectBlock(const std::string& document, const std::string& name, const std::string& content);

/// One line of a table, with its end.
std::string Row(std::initializer_list<std::string> cells);
/// A table's first two lines.
std::string Head(std::initializer_list<std::string> cells);
/// In the type of code.
std::string Code(const std::string& text);
